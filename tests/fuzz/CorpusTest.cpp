#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <string>
#include <vector>

#include "harnesses.h"
#include "support/TestPaths.h"

namespace {

namespace files = std::filesystem;

const std::map<std::string, void (*)(std::string_view)> harnesses = {
    {"handleRequest", fuzz::handleRequest},
    {"validateSchema", fuzz::validateSchema},
    {"parseNames", fuzz::parseNames},
    {"editStatus", fuzz::editStatus},
    {"readIni", fuzz::readIni},
    {"parseChassis", fuzz::parseChassis},
};

// The inputs of all harnesses, each as "<harness>/<file>".
std::vector<std::string> inputs() {
    std::vector<std::string> all;
    for (const auto& entry : files::recursive_directory_iterator(corpusFolder)) {
        if (entry.is_regular_file()) {
            all.push_back(files::relative(entry.path(), corpusFolder).string());
        }
    }
    std::sort(all.begin(), all.end());
    return all;
}

std::string contentOf(const std::string& input) {
    std::ifstream stream(files::path(corpusFolder) / input, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
}

class CorpusTest : public testing::TestWithParam<std::string> {};

TEST_P(CorpusTest, PassesItsHarness) {
    const std::string harness = GetParam().substr(0, GetParam().find('/'));
    ASSERT_EQ(harnesses.count(harness), 1u) << "no such harness: " << harness;
    const std::string content = contentOf(GetParam());
    // Twice, because the first run must leave no state behind.
    for (int run = 0; run < 2; ++run) {
        EXPECT_NO_THROW(harnesses.at(harness)(content));
    }
}

INSTANTIATE_TEST_SUITE_P(Hostile, CorpusTest, testing::ValuesIn(inputs()), [](const auto& info) {
    std::string name = info.param;
    std::replace_if(
        name.begin(), name.end(), [](unsigned char c) { return std::isalnum(c) == 0; }, '_');
    return name;
});

TEST(CorpusFilesTest, EveryHarnessHasInputs) {
    const std::vector<std::string> all = inputs();
    for (const auto& harness : harnesses) {
        const std::string folder = harness.first + "/";
        const auto count = std::count_if(all.begin(), all.end(), [&](const std::string& input) {
            return input.compare(0, folder.size(), folder) == 0;
        });
        EXPECT_GE(count, 5) << folder;
    }
}

}  // namespace
