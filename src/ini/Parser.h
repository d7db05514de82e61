#pragma once

#include <string>
#include <string_view>
#include <unordered_map>

#include "ini/IniFile.h"

namespace ini {

// Parses lines into a file object, according to the settings of that object.
class Parser {
  public:
    explicit Parser(IniFile& file) : file(file) {}

    void addLine(std::string_view line);

    // Joins values that are split over several keys "name Line1", "name Line2" and so on.
    void joinSplitValues();

  private:
    struct KeyLine {
        std::string_view key;
        std::string_view value;
    };

    bool accepts(IniFlag flag) const { return (file.flags & flag) != 0; }
    bool parseSection(std::string_view line);
    bool parseKey(std::string_view line);
    bool split(std::string_view line, KeyLine& parts) const;
    void openSection(std::string_view name);
    void store(const KeyLine& parts);
    char quoteAround(std::string_view value) const;

    static constexpr std::size_t none = static_cast<std::size_t>(-1);

    IniFile& file;
    std::int32_t lineNumber = 0;
    std::size_t current = none;
    // Indexes into the file object, so that a file with many names is parsed in linear time:
    // sections by folded name, entries by section number and folded key.
    std::unordered_map<std::string, std::size_t> sectionIndex;
    std::unordered_map<std::string, std::size_t> entryIndex;
};

}  // namespace ini
