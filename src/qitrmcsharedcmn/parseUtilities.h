#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

// Comma-separated lists of resource names, with ranges at the end of a name: "Mod1/ch0:2,Mod2/ch7"
// stands for Mod1/ch0, Mod1/ch1, Mod1/ch2 and Mod2/ch7.
//
// A name that breaks the rules raises BasicError with code invalidResourceName and the name as a
// detail; if the name is not valid UTF-8, it is the BasicError of checkUtf8 instead. Any thread may
// call these.
namespace nQITRMCSHAREDCMN100 {

enum class NameKind : std::int32_t {
    // Holds no slash; a number may stand at its end.
    Plain = 0,
    // May hold a slash, and only then a number may stand at its end. Without one it is left as it
    // is.
    Path = 1,
};

struct ParsedName {
    std::string prefix;
    std::uint32_t start;  // start and end are equal for a single number, 0 without a number
    std::uint32_t end;
    bool hasNumber;
};

// Takes one name apart. A range holds 1024 names at most and does not run backwards.
ParsedName parseName(const std::string& name, NameKind kind);

// How many names a list may hold when a range adds to it. A short text can ask for a thousand names
// many times over; this keeps a request from filling the controller's memory with them.
constexpr std::size_t maxNamesWithRanges = 65536;

// The names of a list in order, ranges written out. Numbers lose leading zeros, single ones too.
// Empty parts are kept: an empty text is a list of one empty name.
std::vector<std::string> expandNames(const std::string& names, NameKind kind);
// The same, behind the names that `list` holds already.
void appendExpanded(std::vector<std::string>& list, const std::string& names, NameKind kind);

// The shortest list of single names: each run of consecutive numbers becomes a range. A name that
// is a range itself and continues a run adds one to it only.
std::string compressNames(const std::vector<std::string>& names, NameKind kind);

// Returns `name`; raises BasicError with code invalidUtf8 and no details if it is not valid UTF-8.
const std::string& checkUtf8(const std::string& name);

}  // namespace nQITRMCSHAREDCMN100
