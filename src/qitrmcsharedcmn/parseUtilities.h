#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

// Comma-separated lists of resource names, with ranges at the end of a name: "Mod1/ch0:2,Mod2/ch7"
// means Mod1/ch0, Mod1/ch1, Mod1/ch2 and Mod2/ch7.
//
// For an invalid name a function throws BasicError with code invalidResourceName and the name as a
// detail, or the BasicError of checkUtf8 if the name is not valid UTF-8. Any thread may call these
// functions.
namespace nQITRMCSHAREDCMN100 {

enum class NameKind : std::int32_t {
    // Contains no slash. May end in a number or range.
    Plain = 0,
    // May contain a slash. May end in a number or range only if it does; otherwise the digits are
    // part of the name.
    Path = 1,
};

struct ParsedName {
    std::string prefix;
    std::uint32_t start;  // start and end are equal for a single number, 0 without a number
    std::uint32_t end;
    bool hasNumber;
};

// Parses one name. A range has at most 1024 names and must not be descending.
ParsedName parseName(const std::string& name, NameKind kind);

// The maximum number of names in a list with ranges. Each short range can add a thousand names, so
// without a limit a single request could exhaust the controller's memory.
constexpr std::size_t maxNamesWithRanges = 65536;

// The names of a list in order, with ranges expanded. Leading zeros of numbers are removed, also
// without a range. Empty parts are kept: an empty text is a list of one empty name.
std::vector<std::string> expandNames(const std::string& names, NameKind kind);
// The same, appended to `list`.
void appendExpanded(std::vector<std::string>& list, const std::string& names, NameKind kind);

// Joins names to a list in which each run of consecutive numbers is a range. A name that is already
// a range and continues a run counts as one name.
std::string compressNames(const std::vector<std::string>& names, NameKind kind);

// Returns `name`; throws BasicError with code invalidUtf8 and no details if it is not valid UTF-8.
const std::string& checkUtf8(const std::string& name);

}  // namespace nQITRMCSHAREDCMN100
