#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

#include "StatusTexts.h"
#include "qierr/Status.h"
#include "qixlator/Registration.h"
#include "qixlator/qixlator.h"
#include "qixlatorlua/LuaXlator.h"
#include "support/TestRoot.h"
#include "support/series.h"

namespace {

using qixlatorlua::LuaRuntime;

// Compares the faster ways of running the translator with the plain one: texts, statuses,
// tracebacks and lines on standard error must be the same.
class RuntimesTest : public testing::Test {
  protected:
    RuntimesTest() {
        root.write("/usr/local/qinstal/share/errors/English/a.txt",
                   "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\nOne.\n"
                   "</qierror>\n</qidocument>\n");
        root.write("/usr/local/qinstal/share/mierrors/qitrmc/German/a.txt",
                   "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-2\">\nZwei.\n"
                   "</qierror>\n</qidocument>\n");
    }

    // Everything observable about a new translator that is used once.
    static std::string observe(LuaRuntime runtime, std::int32_t code, const char* json,
                               std::uint32_t attributes, const char* format) {
        testing::internal::CaptureStderr();
        qierr::Status status;
        XlatorInterface* xlator = qixlatorlua::createLuaXlator(
            "mxlator_qitrmc", qixlator::localRegistrations().next->registrationInfo, runtime,
            &status);
        char* text = json == nullptr ? xlator->getStaticDesc(xlator, code, attributes,
                                                             qixlator_realloc, nullptr, &status)
                                     : xlator->getDynamicDesc(xlator, json, attributes, format,
                                                              qixlator_realloc, nullptr, &status);
        const std::string seen = std::to_string(status.code) + "\n" +
                                 (status.json == nullptr ? "(null)" : status.json) + "\n" +
                                 (text == nullptr ? "(null)" : text) + "\n";
        qixlator_realloc(text, 0, nullptr, nullptr);
        xlator->destroy(xlator);
        return seen + testing::internal::GetCapturedStderr();
    }

    static void compare(std::int32_t code, const char* json, std::uint32_t attributes,
                        const char* format = "json1") {
        const std::string plain = observe(LuaRuntime::Plain, code, json, attributes, format);
        for (const LuaRuntime runtime : {LuaRuntime::Fast, LuaRuntime::Prepared}) {
            EXPECT_EQ(plain, observe(runtime, code, json, attributes, format))
                << "code " << code << ", attributes " << attributes << ", json "
                << (json == nullptr ? "(null)" : json);
        }
    }

    TestRoot root;
};

TEST_F(RuntimesTest, GiveTheSameDescriptionsOfCodes) {
    for (const std::uint32_t attributes : {0x200u, 1u, 2u, 0x309u}) {
        for (const std::int32_t code : {-1, -2, -3, 0, 5}) {
            compare(code, nullptr, attributes);
        }
    }
}

TEST_F(RuntimesTest, GiveTheSameDetailsInEveryLanguage) {
    int number = 0;
    for (const std::string& json : statusTexts::ofEveryKind()) {
        for (const std::uint32_t attributes : {0x200u, 1u, 2u, 3u, 4u, 5u, 9u, 0xF00u}) {
            if (number++ % failureStep == 0) {
                compare(0, json.c_str(), attributes);
            }
        }
    }
    compare(0, "{}", 0, "json2");
}

// A JSON value of some depth, made of valid and invalid parts of statuses.
std::string randomValue(std::mt19937& random, int depth) {
    static const std::vector<std::string> leaves = {"null",
                                                    "true",
                                                    "-1",
                                                    "3.25",
                                                    "1e300",
                                                    "\"\"",
                                                    "\"text\"",
                                                    "\"\\u0001\\ud83d\\ude00\"",
                                                    "\"kUsageTypeName\"",
                                                    "\"usage\"",
                                                    "4294967295",
                                                    "[]",
                                                    "{}"};
    static const std::vector<std::string> names = {
        "type",         "usage", "value", "value_type", "id",           "translator_info",
        "ordered_data", "line",  "file",  "component",  "nested_error", "other"};
    if (depth == 0 || random() % 3 == 0) {
        return leaves[random() % leaves.size()];
    }
    const bool isObject = random() % 3 != 0;
    std::string text;
    for (std::size_t count = random() % 5; count != 0; --count) {
        text += text.empty() ? "" : ",";
        text += isObject ? "\"" + names[random() % names.size()] + "\":" : "";
        text += randomValue(random, depth - 1);
    }
    return isObject ? "{" + text + "}" : "[" + text + "]";
}

TEST_F(RuntimesTest, GiveTheSameDetailsOfRandomStatuses) {
    std::mt19937 random(7);
    for (int count = 0; count < 200; count += failureStep) {
        const std::string entries = randomValue(random, 2) + "," + randomValue(random, 3);
        compare(0, statusTexts::withEntries(entries).c_str(), 0x200);
        compare(0, randomValue(random, 4).c_str(), 0x201);
    }
}

}  // namespace
