#include "qitrmcwebsvc/describeStatus.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "qierr/Writer.h"
#include "qitrmcsharedcmn/Exceptions.h"
#include "support/FaultyAllocator.h"
#include "support/TestRoot.h"
#include "unit/qixlator/TestXlator.h"

namespace {

using nQITRMCWEBSVC100::describeStatus;

// The texts for clients, made by the translators of the service.
class DescribeStatusTest : public testing::Test {
  protected:
    ~DescribeStatusTest() override { FaultyAllocator::succeed(); }

    void explain(const std::string& text) const {
        root.write("/usr/local/qinstal/share/errors/English/a.txt",
                   "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\n" + text +
                       "\n</qierror>\n</qidocument>\n");
    }

    static std::string describe(std::int32_t code, const char* json = nullptr) {
        qierr::Status status;
        qierr_Status_setCode(&status, code);
        if (json != nullptr) {
            qierr_Status_setJson(&status, json);
        }
        return describeStatus(status);
    }

    TestRoot root;
};

TEST_F(DescribeStatusTest, ASuccessHasNoText) {
    EXPECT_EQ(describe(0), "");
}

TEST_F(DescribeStatusTest, EachLineFeedBecomesABlank) {
    explain("One.\n\nTwo.");
    EXPECT_EQ(describe(-1), "One.  Two.");
    EXPECT_EQ(describe(-1, "{\"nested_error\":{\"code\":-1,\"nested_error\":[]}}"),
              "One.  Two.     One.        Two.");
}

TEST_F(DescribeStatusTest, DetailsAndNestedErrorsAreShownAndTheDebugSectionIsNot) {
    explain("Text.");
    EXPECT_EQ(describe(-1,
                       "{\"file\":\"secret.cpp\",\"line\":12,\"translator\":\"mxlator_qitrmc\","
                       "\"translator_info\":{\"ordered_data\":[{\"type\":\"usage\",\"usage\":"
                       "\"kUsageTypeName\",\"value\":[\"a\",\"b\"],\"value_type\":\"string\"}]},"
                       "\"nested_error\":[{\"code\":-1,\"translator\":\"mxlator_qitrmc\","
                       "\"translator_info\":{\"ordered_data\":[{\"type\":\"usage\",\"usage\":"
                       "\"kUsageTypeLineNumber\",\"value\":7,\"value_type\":\"uint32_t\"}]}}]}"),
              "Text.  Name: a, b     Text.        Line Number: 7");
}

TEST_F(DescribeStatusTest, EveryTranslatorGetsEnglishAndTheSecondEnvironment) {
    TestXlator xlator("watched");
    xlator.descriptions[-1] = "Watched text.";
    EXPECT_EQ(describe(-1, "{\"translator\":\"watched\"}"), "Watched text.");
    EXPECT_THAT(xlator.calls, testing::Contains("static -1 512"));
}

TEST_F(DescribeStatusTest, EachByteThatIsNotUtf8BecomesTheReplacementCharacter) {
    explain("a\xFF\xC3(\xE2\x82 \xED\xA0\x80 caf\xC3\xA9");
    const std::string bad = "\xEF\xBF\xBD";
    EXPECT_EQ(describe(-1),
              "a" + bad + bad + "(" + bad + bad + " " + bad + bad + bad + " caf\xC3\xA9");
}

TEST_F(DescribeStatusTest, AFailedTranslationIsThrownWithItsStatus) {
    try {
        describe(-1);
        FAIL() << "there are no explanation files";
    } catch (const qierr::Exception& error) {
        EXPECT_EQ(error.status()->code, -52006);
        EXPECT_NE(std::string::npos, std::string(error.what()).find("open dir failed"));
    }
}

TEST_F(DescribeStatusTest, AFailureToCreateASessionIsThrown) {
    FaultyAllocator::failAt(0);
    try {
        describe(-1);
        FAIL() << "there is no session";
    } catch (const qierr::Exception& error) {
        EXPECT_EQ(error.status()->code, -52000);
    }
}

// Describes a status while an exception is in flight.
struct DescribesAtItsEnd {
    const qierr_Status& status;
    std::string* text;

    ~DescribesAtItsEnd() { *text = describeStatus(status); }
};

std::string describeInFlight(const qierr_Status& status) {
    std::string text = "never described";
    try {
        const DescribesAtItsEnd end{status, &text};
        throw 1;
    } catch (int) {
    }
    return text;
}

TEST_F(DescribeStatusTest, WhileAnExceptionIsInFlightAFailureIsDroppedAndTheTextIsUnchanged) {
    qierr::Status status;
    qierr_Status_setCode(&status, -1);
    EXPECT_EQ(describeInFlight(status), "");
    explain("Text.");
    qierr_Status_setJson(&status, "{\"nested_error\":5}");
    EXPECT_EQ(describeInFlight(status), "Text.");
}

TEST_F(DescribeStatusTest, WhileAnExceptionIsInFlightAFailureToCreateASessionIsDropped) {
    explain("Text.");
    qierr::Status status;
    qierr_Status_setCode(&status, -1);
    FaultyAllocator::failAt(0);
    EXPECT_EQ(describeInFlight(status), "");
}

}  // namespace
