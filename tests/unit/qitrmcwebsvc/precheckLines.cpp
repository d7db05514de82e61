// Answers each line "<schema file>\t<request>" of the standard input with one line: "not JSON", or
// the verdict of the precheck and that of the JSON library.

#include <iostream>
#include <map>
#include <memory>
#include <string>

#include "embedded/EmbeddedFiles.h"
#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/SchemaPrecheck.h"
#include "qitrmcwebsvc/SchemaRun.h"
#include "qitrmcwebsvc/requestText.h"

namespace {

using namespace nQITRMCWEBSVC100;

class Checks {
  public:
    explicit Checks(const std::string& file) {
        schema.Parse(embeddedText(file.c_str()));
        definitions.Parse(embeddedText("definitions.json"));
        schema.AddMember("definitions", definitions["definitions"], schema.GetAllocator());
        precheck = std::make_unique<SchemaPrecheck>(schema);
        compiled = std::make_unique<JsonSchemaDocument>(schema);
    }

    std::string verdictsOn(const JsonValue& request) const {
        const char* const names[] = {"valid", "invalid", "undecided"};
        const auto verdict = static_cast<std::size_t>(precheck->verdictOn(request));
        return std::string(names[verdict]) +
               (SchemaRun(*compiled).accepts(request) ? " accepted" : " refused");
    }

  private:
    JsonDocument schema;
    JsonDocument definitions;
    std::unique_ptr<SchemaPrecheck> precheck;
    std::unique_ptr<JsonSchemaDocument> compiled;
};

std::string answer(const std::string& line) {
    static std::map<std::string, Checks> checks;
    const std::size_t tab = line.find('\t');
    const std::string file = line.substr(0, tab);
    JsonDocument request;
    try {
        parseRequestText(line.substr(tab + 1), request);
    } catch (const nQITRMCSHAREDCMN100::BasicError&) {
        return "not JSON";
    }
    return checks.try_emplace(file, file).first->second.verdictsOn(request);
}

}  // namespace

int main() {
    std::string line;
    while (std::getline(std::cin, line)) {
        std::cout << answer(line) << "\n";
    }
}
