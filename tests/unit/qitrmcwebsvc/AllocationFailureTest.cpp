#include <gtest/gtest.h>

#include <new>
#include <string>

#include "embedded/EmbeddedFiles.h"
#include "requests.h"
#include "support/allocationFaults.h"
#include "support/sanitizers.h"

#if defined(QITRMC_ADDRESS_SANITIZER)
#include <sanitizer/lsan_interface.h>
#endif

namespace nQITRMCWEBSVC100 {
namespace {

class EachExtent : public testing::TestWithParam<AllocationFault::Extent> {};

INSTANTIATE_TEST_SUITE_P(Faults, EachExtent,
                         testing::Values(AllocationFault::Extent::One,
                                         AllocationFault::Extent::AllFromThere));

enum class Outcome { Done, Refused, OutOfMemory };

// Runs `action` with a fault at its first allocation, then at its second and so on, until all its
// allocations have failed once. `check` gets each outcome.
template <typename Action, typename Check>
void withFaultAtEachAllocation(AllocationFault::Extent extent, Action action, Check check) {
    constexpr int limit = 20000;
    for (int successes = 0; successes < limit; ++successes) {
        Outcome outcome = Outcome::Done;
        bool struck = false;
        {
            AllocationFault fault(successes, extent);
            try {
                action();
            } catch (const std::bad_alloc&) {
                outcome = Outcome::OutOfMemory;
            } catch (const qierr::ExceptionBase& error) {
                outcome = Outcome::Refused;
            }
            struck = fault.hasStruck();
        }
        check(outcome, struck);
        if (!struck) {
            return;
        }
    }
    FAIL() << "still allocating after " << limit << " allocations";
}

class ValidationUnderFaults : public EachExtent {
  protected:
    void expectCleanFailures(const char* schema, const std::string& text, Outcome expected) {
        SchemaValidator validator(embeddedText(schema));
        const ParsedRequest request(text);
        const auto undisturbed = refusalOf([&] { validator.validate(*request); });
        withFaultAtEachAllocation(
            GetParam(), [&] { validator.validate(*request); },
            [&](Outcome outcome, bool struck) {
                EXPECT_TRUE(outcome == expected || (struck && outcome == Outcome::OutOfMemory));
                EXPECT_EQ(refusalOf([&] { validator.validate(*request); }), undisturbed);
            });
    }
};

INSTANTIATE_TEST_SUITE_P(Faults, ValidationUnderFaults,
                         testing::Values(AllocationFault::Extent::One,
                                         AllocationFault::Extent::AllFromThere));

TEST_P(ValidationUnderFaults, AConformingRequestPassesOrRunsOutOfMemory) {
    expectCleanFailures(
        "procedure_initialize_session.json",
        requestText("initializeSession",
                    R"({"devices":["a","b"],"access":"ReadOnly","reservation_timeout":1.5})"),
        Outcome::Done);
}

TEST_P(ValidationUnderFaults, ARequestIsRefusedOrRunsOutOfMemory) {
    expectCleanFailures(
        "procedure_set_property.json",
        requestText("setProperty", R"({"session_id":"_session1","property":"p","value":[1,true]})"),
        Outcome::Refused);
    expectCleanFailures(
        "procedure_read_register.json",
        requestText("readRegister", R"({"session_id":"_session1","address":0,"size":9})"),
        Outcome::Refused);
    expectCleanFailures("procedure_close_session.json",
                        requestText("closeSession", "{\"" + std::string(3000, '/') + "\":1}"),
                        Outcome::Refused);
}

TEST_P(EachExtent, ASingleRequestIsTakenOverCompletelyOrNotAtAll) {
    JsonDocument document;
    document.Parse(R"({"jsonrpc":"2.0","id":1,"method":"aMethodWithANameBeyondAShortString"})");
    withFaultAtEachAllocation(
        GetParam(), [&] { SingleRequest request(document); },
        [&](Outcome outcome, bool struck) {
            EXPECT_EQ(struck ? Outcome::OutOfMemory : Outcome::Done, outcome);
            EXPECT_EQ(struck, document.IsObject());
        });
}

TEST_P(EachExtent, JsonTextsAreParsedCopiedAndWrittenOrRunOutOfMemory) {
    const std::string text = R"({"id":[[[1,"two"],{"three":[]}],)" + std::string(5000, ' ') + "\"" +
                             std::string(70000, 'x') + "\"]}";
    withFaultAtEachAllocation(
        GetParam(),
        [&] {
            JsonDocument document;
            document.Parse(text.data(), text.size());
            const JsonValue copy(document["id"], document.GetAllocator());
            JsonBuffer buffer;
            JsonWriter writer(buffer);
            copy.Accept(writer);
        },
        [](Outcome outcome, bool struck) {
            EXPECT_EQ(struck ? Outcome::OutOfMemory : Outcome::Done, outcome);
        });
}

// The JSON library leaks what it has compiled so far when memory for the rest runs out. That can
// only happen at the start of the service, which then fails.
TEST_P(EachExtent, AValidatorIsBuiltOrRunsOutOfMemory) {
#if defined(QITRMC_ADDRESS_SANITIZER)
    __lsan::ScopedDisabler expected;
#endif
    withFaultAtEachAllocation(
        GetParam(), [&] { SchemaValidator validator(embeddedText("procedure_set_property.json")); },
        [](Outcome outcome, bool struck) {
            EXPECT_EQ(struck ? Outcome::OutOfMemory : Outcome::Done, outcome);
        });
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
