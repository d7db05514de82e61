#include "description/Description.h"

#include <algorithm>
#include <charconv>
#include <system_error>

#include "description/Nearest.h"
#include "description/SyntaxError.h"
#include "model/Values.h"

namespace simulator {

namespace {

constexpr std::size_t mostExponentDigits = 4;
constexpr std::size_t mostDigitsOfZero = 20;

// The JSON library overflows its own arithmetic on numbers with huge exponents.
bool hasHugeExponent(std::string_view number) {
    const std::size_t exponent = number.find_first_of("eE");
    const std::size_t digits = number.find_first_not_of("+-", exponent + 1);
    return exponent != std::string_view::npos && digits != std::string_view::npos &&
           number.size() - digits > mostExponentDigits;
}

// It also takes the logarithm of a zero that is not written plainly.
bool isLongZero(std::string_view number) {
    const std::string_view digits = number.substr(0, number.find_first_of("eE"));
    return digits.find_first_of("123456789") == std::string_view::npos &&
           (digits.size() < number.size() || digits.size() > mostDigitsOfZero);
}

// And it reads outside its tables for what is about too small for a double.
bool isOutOfRange(std::string_view number) {
    constexpr double leastRead = 1e-300;
    double value = 0;
    const std::errc failure =
        std::from_chars(number.data(), number.data() + number.size(), value).ec;
    return failure == std::errc::result_out_of_range || (value > 0 && value < leastRead);
}

void refuseOddNumber(std::string_view text, std::size_t place, std::string_view number) {
    if (hasHugeExponent(number)) {
        throw DescriptionError{"", "holds a number out of range at " + lineAndColumn(text, place),
                               "exponents have at most 4 digits"};
    }
    if (isOutOfRange(number)) {
        throw DescriptionError{"", "holds a number out of range at " + lineAndColumn(text, place),
                               "numbers are 0 or have an amount from 1e-300 to 1.79e308"};
    }
    if (isLongZero(number)) {
        throw DescriptionError{"", "holds a zero of many signs at " + lineAndColumn(text, place),
                               "must be written as 0"};
    }
}

void refuseOddNumbers(std::string_view text) {
    bool inString = false;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\\' && inString) {
            ++i;
        } else if (text[i] == '"') {
            inString = !inString;
        } else if (!inString && text[i] >= '0' && text[i] <= '9') {
            const std::size_t end = text.find_first_not_of("0123456789.eE+-", i);
            const std::string_view number = text.substr(i, end - i);
            refuseOddNumber(text, i, number);
            i += number.size() - 1;
        }
    }
}

// The beginning of a text, cut between characters.
std::string beginning(std::string_view text) {
    constexpr std::size_t most = 40;
    std::size_t end = std::min(most, text.size());
    while (end < text.size() && end > 0 &&
           (static_cast<unsigned char>(text[end]) & 0xC0u) == 0x80u) {
        --end;
    }
    return "\"" + oneLine(text.substr(0, end)) + (end < text.size() ? "...\"" : "\"");
}

std::string shownNumber(const JsonValue& number) {
    if (number.IsInt64()) {
        return std::to_string(number.GetInt64());
    }
    if (number.IsUint64()) {
        return std::to_string(number.GetUint64());
    }
    const std::string digits = numberText(number.GetDouble());
    const bool looksWhole = digits.find_first_not_of("-0123456789") == std::string::npos;
    return looksWhole ? digits + ".0" : digits;
}

}  // namespace

std::string oneLine(std::string_view text) {
    std::string line(text);
    std::replace_if(
        line.begin(), line.end(), [](unsigned char c) { return c < 0x20 || c == 0x7F; }, '?');
    return line;
}

std::string listed(const std::vector<std::string>& names) {
    std::string all;
    for (const std::string& name : names) {
        all += all.empty() ? "" : ", ";
        all += name;
    }
    return all;
}

void parseDescription(std::string_view text, JsonDocument& document, const char* what) {
    refuseOddNumbers(text);
    constexpr unsigned flags = rapidjson::kParseIterativeFlag |
                               rapidjson::kParseValidateEncodingFlag |
                               rapidjson::kParseFullPrecisionFlag;
    document.Parse<flags>(text.data(), text.size());
    if (document.HasParseError()) {
        throw syntaxError(text, document.GetErrorOffset(), document.GetParseError(), what);
    }
}

std::string Node::childPointer(std::string_view name) const {
    std::string child = pointer + "/";
    for (const char c : name) {
        if (c == '~') {
            child += "~0";
        } else if (c == '/') {
            child += "~1";
        } else {
            child += c;
        }
    }
    return child;
}

std::string Node::shown() const {
    if (value->IsString()) {
        return "the text " + beginning({value->GetString(), value->GetStringLength()});
    }
    if (value->IsNumber()) {
        return shownNumber(*value);
    }
    if (value->IsBool()) {
        return value->GetBool() ? "true" : "false";
    }
    if (value->IsNull()) {
        return "null";
    }
    return value->IsArray() ? "an array" : "an object";
}

void Node::fail(std::string wrong, std::string right) const {
    throw DescriptionError{pointer, std::move(wrong), std::move(right)};
}

void Node::expect(bool condition, const char* right) const {
    if (!condition) {
        fail("is " + shown(), std::string("must be ") + right);
    }
}

void Node::expectMembers(const std::string_view* allowed, std::size_t count) const {
    forEachMember([&](const std::string& name, const Node& member) {
        if (std::find(allowed, allowed + count, name) == allowed + count) {
            const std::vector<std::string> known(allowed, allowed + count);
            member.fail("is not a known member",
                        perhapsMeant(name, known) + "the members here are " + listed(known));
        }
    });
}

bool Node::has(const char* member) const {
    return value->HasMember(member);
}

Node Node::member(const char* name, const char* right) const {
    const auto found = value->FindMember(name);
    if (found == value->MemberEnd()) {
        throw DescriptionError{childPointer(name), "is missing", std::string("must be ") + right};
    }
    return Node(found->value, childPointer(name));
}

Node Node::element(std::size_t index) const {
    return Node((*value)[static_cast<rapidjson::SizeType>(index)],
                pointer + "/" + std::to_string(index));
}

std::string Node::text() const {
    expect(value->IsString(), "a text");
    if (std::string_view(value->GetString(), value->GetStringLength()).find('\0') !=
        std::string_view::npos) {
        fail("holds a NUL character", "texts must not hold one");
    }
    return std::string(value->GetString(), value->GetStringLength());
}

std::uint32_t Node::unsignedNumber(std::uint32_t least, std::uint32_t most) const {
    const std::string right =
        "must be a whole number from " + std::to_string(least) + " to " + std::to_string(most);
    if (!value->IsUint() || value->GetUint() < least || value->GetUint() > most) {
        fail("is " + shown(), right);
    }
    return value->GetUint();
}

std::int32_t Node::signedNumber() const {
    expect(value->IsInt(), "a whole number of 32 bits");
    return value->GetInt();
}

double Node::number(double least, double most) const {
    if (!value->IsNumber() || value->GetDouble() < least || value->GetDouble() > most) {
        fail("is " + shown(),
             "must be a number from " + numberText(least) + " to " + numberText(most));
    }
    return value->GetDouble();
}

double Node::seconds() const {
    constexpr double day = 24.0 * 60.0 * 60.0;
    expect(value->IsNumber() && value->GetDouble() >= 0.0 && value->GetDouble() <= day,
           "a time in seconds, from 0 to a day");
    return value->GetDouble();
}

bool Node::flag() const {
    expect(value->IsBool(), "true or false");
    return value->GetBool();
}

}  // namespace simulator
