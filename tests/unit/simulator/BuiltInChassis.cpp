// Ends a test program at once when the built-in chassis does not load: every test would fail, some
// of them only after long loops.

#include <gtest/gtest.h>

#include "qitrmcapi.h"
#include "qitrmcsim.h"

namespace {

class BuiltInChassis : public testing::Environment {
  public:
    void SetUp() override {
        char* summary = nullptr;
        ASSERT_EQ(qitrmcsim_start(&summary), 0) << "the built-in chassis does not load";
        nQITRMCAPI100_freeString(summary);
    }
};

const testing::Environment* const environment =
    testing::AddGlobalTestEnvironment(new BuiltInChassis);

}  // namespace
