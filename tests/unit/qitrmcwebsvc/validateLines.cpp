// Answers each line "<schema file>\t<request>" of the standard input with one line: "accepted", or
// the code of the refusal and its details.

#include <iostream>
#include <map>
#include <memory>
#include <string>

#include "embedded/EmbeddedFiles.h"
#include "requests.h"

namespace {

using namespace nQITRMCWEBSVC100;

SchemaValidator& validatorOf(const std::string& file) {
    static std::map<std::string, std::unique_ptr<SchemaValidator>> validators;
    std::unique_ptr<SchemaValidator>& validator = validators[file];
    if (!validator) {
        validator = std::make_unique<SchemaValidator>(embeddedText(file.c_str()));
    }
    return *validator;
}

}  // namespace

int main() {
    std::string line;
    while (std::getline(std::cin, line)) {
        const std::size_t tab = line.find('\t');
        SchemaValidator& validator = validatorOf(line.substr(0, tab));
        const ParsedRequest request(line.substr(tab + 1));
        if (const auto refusal = refusalOf([&] { validator.validate(*request); })) {
            std::cout << *refusal << "\n";
        } else {
            std::cout << "accepted\n";
        }
    }
}
