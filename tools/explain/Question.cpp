#include "explain/Question.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <iostream>
#include <iterator>
#include <optional>

#include "explain/Catalogue.h"
#include "explain/Failure.h"
#include "explain/Listing.h"
#include "explain/pastedJson.h"

namespace explain {
namespace {

std::string withoutBlanks(const std::string& text) {
    constexpr const char* blanks = " \t\r\n";
    const std::size_t start = text.find_first_not_of(blanks);
    if (start == std::string::npos) {
        return {};
    }
    return text.substr(start, text.find_last_not_of(blanks) + 1 - start);
}

std::string readOperand(const std::string& operand) {
    if (operand != "-") {
        return withoutBlanks(operand);
    }
    return withoutBlanks({std::istreambuf_iterator<char>(std::cin), {}});
}

bool isNumber(const std::string& text) {
    const std::size_t digits = text.rfind('-', 0) == 0 ? 1 : 0;
    return text.size() > digits &&
           text.find_first_not_of("0123456789", digits) == std::string::npos;
}

// The limit of a name's length; all statuses have shorter names.
constexpr std::size_t longestName = 100;

bool isName(const std::string& text) {
    const auto isWordCharacter = [](unsigned char c) { return c == '_' || std::isalnum(c) != 0; };
    return !text.empty() && text.size() <= longestName &&
           std::isalpha(static_cast<unsigned char>(text.front())) != 0 &&
           std::all_of(text.begin(), text.end(), isWordCharacter);
}

// Few codes are positive, so any other positive number is taken as a code without its minus sign.
std::int32_t codeOfNumber(const std::string& text) {
    std::int32_t number = 0;
    const char* const end = text.data() + text.size();
    if (std::from_chars(text.data(), end, number).ec != std::errc()) {
        throw UsageError(text + " is no code: a code has 32 bits.");
    }
    if (number == 0) {
        throw UsageError("The code 0 is no failure.");
    }
    return number > 0 && findCode(number) == nullptr ? -number : number;
}

std::int32_t codeOfName(const std::string& name, Translator& translator) {
    const Entry* const entry = findName(name);
    if (entry != nullptr) {
        return entry->code;
    }
    const std::vector<Entry> similar = similarNames(name);
    if (similar.empty()) {
        throw Failure("No status has the name " + name + ". --list shows all that are known.");
    }
    throw Failure("No status has the name " + name +
                  ". Perhaps one of these is meant:" + suggestions(similar, translator));
}

Question questionOfJson(const std::string& json) {
    if (!isContainer(json)) {
        throw UsageError("The text is no code, no name and no JSON object or array.");
    }
    if (const auto question = findQuestion(json)) {
        return *question;
    }
    throw UsageError("There is no code in the text, or it is 0, which is no failure.");
}

std::string readDetails(const std::string& operand) {
    if (operand.empty()) {
        return {};
    }
    const std::string details = readOperand(operand);
    if (!isContainer(details) || details.front() != '{') {
        throw UsageError("The text is not a JSON object. Give the details of a status, {...}.");
    }
    return details;
}

}  // namespace

Question readQuestion(const Options& options, Translator& translator) {
    const std::string status = readOperand(options.status);
    if (isNumber(status)) {
        return {codeOfNumber(status), readDetails(options.details)};
    }
    if (isName(status)) {
        return {codeOfName(status, translator), readDetails(options.details)};
    }
    if (!options.details.empty()) {
        throw UsageError("Details go with a code or a name, not with a JSON text.");
    }
    return questionOfJson(status);
}

}  // namespace explain
