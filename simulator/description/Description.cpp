#include "description/Description.h"

#include <rapidjson/error/en.h>

#include <algorithm>

#include "model/Values.h"

namespace simulator {

namespace {

constexpr size_t mostExponentDigits = 4;

std::string lineAndColumn(std::string_view text, size_t offset) {
    const std::string_view before = text.substr(0, std::min(offset, text.size()));
    const auto line = 1 + std::count(before.begin(), before.end(), '\n');
    const size_t lastBreak = before.rfind('\n');
    const size_t column =
        lastBreak == std::string_view::npos ? before.size() + 1 : before.size() - lastBreak;
    return "line " + std::to_string(line) + ", column " + std::to_string(column);
}

// The JSON library overflows its own arithmetic on numbers with huge exponents.
void refuseHugeExponents(std::string_view text) {
    bool inString = false;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\\' && inString) {
            ++i;
        } else if (text[i] == '"') {
            inString = !inString;
        } else if (!inString && (text[i] == 'e' || text[i] == 'E')) {
            const size_t digits = text.find_first_not_of("+-", i + 1);
            const size_t end = text.find_first_not_of("0123456789", digits);
            if (digits != std::string_view::npos &&
                std::min(end, text.size()) - digits > mostExponentDigits) {
                throw DescriptionFault{"",
                                       "holds a number out of range at " + lineAndColumn(text, i),
                                       "exponents have at most 4 digits"};
            }
        }
    }
}

}  // namespace

void parseDescription(std::string_view text, JsonDocument& document, const char* right) {
    refuseHugeExponents(text);
    constexpr unsigned flags = rapidjson::kParseIterativeFlag |
                               rapidjson::kParseValidateEncodingFlag |
                               rapidjson::kParseFullPrecisionFlag;
    document.Parse<flags>(text.data(), text.size());
    if (document.HasParseError()) {
        throw DescriptionFault{"",
                               "is not JSON at " + lineAndColumn(text, document.GetErrorOffset()) +
                                   ": " + rapidjson::GetParseError_En(document.GetParseError()),
                               right};
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

void Node::fail(std::string wrong, std::string right) const {
    throw DescriptionFault{pointer, std::move(wrong), std::move(right)};
}

void Node::expect(bool condition, const char* right) const {
    if (!condition) {
        fail("has the wrong type or range", std::string("must be ") + right);
    }
}

void Node::expectMembers(std::initializer_list<std::string_view> allowed) const {
    std::string known;
    for (const std::string_view name : allowed) {
        known += known.empty() ? "" : ", ";
        known += name;
    }
    forEachMember([&](const std::string& name, const Node& member) {
        if (std::find(allowed.begin(), allowed.end(), name) == allowed.end()) {
            member.fail("is not a known member", "the members here are " + known);
        }
    });
}

bool Node::has(const char* member) const {
    return value->HasMember(member);
}

Node Node::member(const char* name, const char* right) const {
    const auto found = value->FindMember(name);
    if (found == value->MemberEnd()) {
        throw DescriptionFault{childPointer(name), "is missing", std::string("must be ") + right};
    }
    return Node(found->value, childPointer(name));
}

std::string Node::text() const {
    expect(value->IsString(), "a text");
    if (std::string_view(value->GetString(), value->GetStringLength()).find('\0') !=
        std::string_view::npos) {
        fail("holds a NUL character", "texts must not hold one");
    }
    return std::string(value->GetString(), value->GetStringLength());
}

uint32_t Node::unsignedNumber(uint32_t least, uint32_t most) const {
    const std::string right =
        "must be a whole number from " + std::to_string(least) + " to " + std::to_string(most);
    if (!value->IsUint() || value->GetUint() < least || value->GetUint() > most) {
        fail("has the wrong type or range", right);
    }
    return value->GetUint();
}

int32_t Node::signedNumber() const {
    expect(value->IsInt(), "a whole number of 32 bits");
    return value->GetInt();
}

double Node::number(double least, double most) const {
    if (!value->IsNumber() || value->GetDouble() < least || value->GetDouble() > most) {
        fail("has the wrong type or range",
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
