#include "description/SyntaxError.h"

#include <rapidjson/error/en.h>

#include <algorithm>

#include "common/digits.h"

namespace simulator {

using common::isDigit;

namespace {

struct Words {
    std::string wrong;
    std::string right;
};

// Where parsing stopped: what is there, and the last byte before it that is not a blank.
struct Place {
    std::string_view rest;
    char last;

    char first() const { return rest.empty() ? '\0' : rest.front(); }
    bool beginsWith(std::string_view start) const { return rest.substr(0, start.size()) == start; }
};

bool isLetter(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}

std::string wordAt(std::string_view rest) {
    const auto isPart = [](char c) { return isLetter(c) || isDigit(c); };
    const auto end = std::find_if_not(rest.begin(), rest.end(), isPart);
    return std::string(rest.begin(), end).substr(0, 20);
}

// What the JSON library says, as a part of a sentence.
std::string reason(rapidjson::ParseErrorCode code) {
    std::string words = rapidjson::GetParseError_En(code);
    if (!words.empty() && words.back() == '.') {
        words.pop_back();
    }
    return words;
}

Words textWords(const Place& place, rapidjson::ParseErrorCode code) {
    const bool inText = code == rapidjson::kParseErrorStringMissQuotationMark ||
                        code == rapidjson::kParseErrorStringInvalidEncoding ||
                        code == rapidjson::kParseErrorStringEscapeInvalid;
    const char c = place.first();
    if (inText && (c == '\n' || c == '\r')) {
        return {"A text goes on in the next line",
                "a text must end in its line; \\n stands for a line break"};
    }
    if (inText && c == '\t') {
        return {"There is a tabulator inside of a text", "it must be written as \\t"};
    }
    if (code == rapidjson::kParseErrorStringInvalidEncoding) {
        return {"There are bytes that are not UTF-8", "the file must be saved as UTF-8"};
    }
    if (code == rapidjson::kParseErrorStringEscapeInvalid) {
        return {reason(code), "a backslash in a text must be written as \\\\"};
    }
    return {};
}

Words bracketWords(const Place& place, rapidjson::ParseErrorCode code) {
    const bool isOpen = code == rapidjson::kParseErrorObjectMissCommaOrCurlyBracket ||
                        code == rapidjson::kParseErrorArrayMissCommaOrSquareBracket;
    if (isOpen && place.rest.empty()) {
        return {"The text ends too early", "every bracket must be closed"};
    }
    if (isOpen) {
        return {reason(code), "elements must have a comma between them"};
    }
    if (code == rapidjson::kParseErrorDocumentRootNotSingular) {
        return {reason(code), "there must be nothing behind the last closing bracket"};
    }
    return {};
}

Words wordWords(const Place& place, rapidjson::ParseErrorCode code) {
    if (place.first() == '.' || place.first() == '+') {
        return {"A number begins with a point or a plus",
                "numbers must begin with a digit or a minus"};
    }
    if (place.last == '0' && (place.first() == 'x' || isDigit(place.first()))) {
        return {"A number begins with 0",
                "numbers must be decimal, without 0x and without zeros in front"};
    }
    if (code == rapidjson::kParseErrorObjectMissName && isLetter(place.first())) {
        return {"The name " + wordAt(place.rest) + " has no quotes",
                "names must stand in double quotes"};
    }
    if (code == rapidjson::kParseErrorValueInvalid && isLetter(place.first())) {
        return {"The word " + wordAt(place.rest) + " is no value",
                "texts must stand in double quotes, and the words are true and false"};
    }
    return {};
}

Words markWords(const Place& place) {
    const char c = place.first();
    if (place.beginsWith("//") || place.beginsWith("/*") || c == '#') {
        return {"There is a comment", "JSON must have no comments"};
    }
    if (c == '\'') {
        return {"There is a single quote", "texts must stand in double quotes"};
    }
    if ((c == '}' || c == ']') && place.last == ',') {
        return {"There is a comma behind the last element",
                "commas must stand between elements alone"};
    }
    return {};
}

bool isUtf16(std::string_view text) {
    const std::string_view mark = text.substr(0, 2);
    return mark == "\xFF\xFE" || mark == "\xFE\xFF";
}

Words wordsAt(const Place& place, rapidjson::ParseErrorCode code, const char* what) {
    for (const Words& words : {textWords(place, code), wordWords(place, code), markWords(place),
                               bracketWords(place, code)}) {
        if (!words.wrong.empty()) {
            return words;
        }
    }
    return {reason(code), std::string(what) + " is one JSON object"};
}

}  // namespace

std::string lineAndColumn(std::string_view text, std::size_t offset) {
    const std::string_view before = text.substr(0, std::min(offset, text.size()));
    const auto line = 1 + std::count(before.begin(), before.end(), '\n');
    const std::size_t lastBreak = before.rfind('\n');
    const std::string_view ofLine =
        lastBreak == std::string_view::npos ? before : before.substr(lastBreak + 1);
    const auto column = 1 + std::count_if(ofLine.begin(), ofLine.end(), [](char c) {
                            return (static_cast<unsigned char>(c) & 0xC0u) != 0x80u;
                        });
    return "line " + std::to_string(line) + ", column " + std::to_string(column);
}

DescriptionError syntaxError(std::string_view text, std::size_t offset,
                             rapidjson::ParseErrorCode code, const char* what) {
    if (isUtf16(text)) {
        return {"", "is UTF-16 text", "the file must be saved as UTF-8"};
    }
    const std::string_view before = text.substr(0, std::min(offset, text.size()));
    const std::size_t last = before.find_last_not_of(" \t\r\n");
    const Place place{text.substr(before.size()),
                      last == std::string_view::npos ? '\0' : before[last]};
    const Words words = wordsAt(place, code, what);
    return {"", "is not JSON at " + lineAndColumn(text, offset) + ": " + words.wrong, words.right};
}

}  // namespace simulator
