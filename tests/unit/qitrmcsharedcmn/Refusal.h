#pragma once

#include <gtest/gtest.h>

#include <string>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcsharedcmn/parseUtilities.h"

namespace shared_test {

constexpr auto plain = nQITRMCSHAREDCMN100::NameKind::Plain;
constexpr auto path = nQITRMCSHAREDCMN100::NameKind::Path;

// Runs `call` and expects a name to be refused: code -250828 and the one detail.
template <typename Call>
void expectRefused(const std::string& escapedName, Call call) {
    SCOPED_TRACE(escapedName);
    try {
        call();
        ADD_FAILURE() << "not refused";
    } catch (const nQITRMCSHAREDCMN100::BasicError& error) {
        EXPECT_EQ(error.status()->code, -250828);
        const std::string text = error.what();
        const std::string details =
            "\"component\":\"qitrmcsvc\",\"translator\":\"mxlator_qitrmc\",\"translator_info\":"
            "{\"ordered_data\":[{\"type\":\"usage\",\"usage\":\"kUsageTypeRequestedValue\","
            "\"value\":\"" +
            escapedName + "\",\"value_type\":\"string\"}]}}";
        ASSERT_GE(text.size(), details.size());
        EXPECT_EQ(text.substr(text.size() - details.size()), details);
    }
}

}  // namespace shared_test
