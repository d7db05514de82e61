#pragma once

#include <string>
#include <string_view>
#include <unordered_map>

#include "ini/IniFile.h"

namespace ini {

// Puts lines into a file object, whose settings it follows.
class Parser {
  public:
    explicit Parser(IniFile& file) : file(file) {}

    void addLine(std::string_view line);

    // Joins the values that are split over the keys "name Line1", "name Line2" and so on.
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
    // Where the section of a folded name stands, and the entry of a section's number and a folded
    // key: a file of many names is read in linear time.
    std::unordered_map<std::string, std::size_t> sectionIndex;
    std::unordered_map<std::string, std::size_t> entryIndex;
};

}  // namespace ini
