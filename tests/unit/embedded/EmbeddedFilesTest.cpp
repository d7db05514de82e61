#include "embedded/EmbeddedFiles.h"

#include <gmock/gmock.h>

#include <cctype>
#include <cstring>
#include <fstream>
#include <iterator>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

#include "support/TestPaths.h"

namespace {

// In byte order of the method names, except that names in lower case come first.
bool comesBefore(const std::string& one, const std::string& other) {
    const bool oneIsLower = std::islower(static_cast<unsigned char>(one.front())) != 0;
    const bool otherIsLower = std::islower(static_cast<unsigned char>(other.front())) != 0;
    return oneIsLower != otherIsLower ? oneIsLower : one < other;
}

// The definitions, and the schema of each method.
std::vector<std::string> schemaNames() {
    std::map<std::string, std::string, decltype(&comesBefore)> byMethod(comesBefore);
#define QITRMC_METHOD(name, Class, schema) byMethod[name] = schema;
#include "qitrmcwebsvc/methods.def"
    std::vector<std::string> names = {"definitions.json"};
    for (const auto& [method, schema] : byMethod) {
        names.push_back(schema);
    }
    return names;
}

bool isJson(const std::string& name) {
    const std::string extension = ".json";
    return name.size() > extension.size() &&
           name.compare(name.size() - extension.size(), extension.size(), extension) == 0;
}

std::string contentOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

TEST(EmbeddedFiles, BeginWithTheSchemasInTableOrder) {
    std::vector<std::string> names;
    for (const EmbeddedFile& file : embeddedFiles()) {
        names.push_back(file.name);
    }
    const std::vector<std::string> expected = schemaNames();
    ASSERT_GE(names.size(), expected.size());
    names.resize(expected.size());
    EXPECT_EQ(names, expected);
}

TEST(EmbeddedFiles, HoldEachSchemaExactlyAsInItsSourceFile) {
    for (const EmbeddedFile& file : embeddedFiles()) {
        if (!isJson(file.name)) {
            continue;
        }
        const std::string source =
            contentOf(std::string(embeddedSources) + "/schemas/" + file.name);
        ASSERT_FALSE(source.empty()) << file.name;
        EXPECT_EQ(std::string(file.data, file.size), source) << file.name;
    }
}

TEST(EmbeddedFiles, AreReadableAsCTexts) {
    for (const EmbeddedFile& file : embeddedFiles()) {
        EXPECT_EQ(file.size, std::strlen(file.data)) << file.name;
    }
}

TEST(EmbeddedText, FindsAFileByItsExactName) {
    const EmbeddedFile& second = embeddedFiles().begin()[1];
    EXPECT_EQ(second.data, embeddedText("procedure_abort_session.json"));
}

TEST(EmbeddedText, ThrowsForANameThatIsNotInTheTable) {
    EXPECT_THROW(embeddedText("procedure_abort_session"), std::out_of_range);
    EXPECT_THROW(embeddedText("Definitions.json"), std::out_of_range);
    EXPECT_THROW(embeddedText(""), std::out_of_range);
}

}  // namespace
