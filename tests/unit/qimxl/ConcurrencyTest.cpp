#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <vector>

#include "StatusTexts.h"
#include "qierr/Writer.h"
#include "qixlator/json1.h"
#include "qixlator/qixlator.h"
#include "support/TestRoot.h"

namespace {

// A program of its own, so that the first translations of the process run at the same time.
TEST(ConcurrencyTest, SessionsOfDifferentThreadsAreIndependent) {
    TestRoot root;
    root.write("/usr/local/qinstal/share/errors/English/a.txt",
               "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\nText.\n"
               "</qierror>\n</qidocument>\n");
    constexpr int threadCount = 8;
    std::vector<std::string> results(threadCount);
    std::vector<std::thread> threads;
    for (int number = 0; number < threadCount; ++number) {
        threads.emplace_back([number, &result = results[number]] {
            const std::string value = "\"thread " + std::to_string(number) + "\"";
            const std::string json =
                statusTexts::withEntries(statusTexts::usage("kUsageTypeName", value, "\"string\""));
            for (int round = 0; round < 20; ++round) {
                qierr::Status source;
                qierr_Status_setCode(&source, -1);
                qierr_Status_setJson(&source, json.c_str());
                qierr::Status failure;
                qihtl::String text;
                qixlator::Session* session = qixlator_createSession(&failure);
                qixlator::json1::translateErrStatusToRawText(session, &source, 0x200, 11, &text,
                                                             &failure);
                qixlator_destroySession(session);
                result = text.c_str();
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (int number = 0; number < threadCount; ++number) {
        EXPECT_EQ(results[number], "Text.\n\nName: thread " + std::to_string(number));
    }
}

}  // namespace
