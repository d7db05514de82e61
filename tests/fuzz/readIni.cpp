#include <sys/mman.h>
#include <unistd.h>

#include <memory>
#include <string>

#include "harnesses.h"
#include "ini/IniFile.h"

namespace {

// A file in memory.
class MemoryFile {
  public:
    explicit MemoryFile(std::string_view content) : descriptor(::memfd_create("ini", 0)) {
        fuzz::require(descriptor >= 0 && ::write(descriptor, content.data(), content.size()) ==
                                             static_cast<ssize_t>(content.size()),
                      "no file for the input");
    }
    ~MemoryFile() { ::close(descriptor); }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;

    std::string path() const { return "/proc/self/fd/" + std::to_string(descriptor); }

  private:
    const int descriptor;
};

struct Destroy {
    void operator()(IniFile* file) const { IniFile_destroy(file); }
};

void requireSoundLines(const IniFile& file) {
    fuzz::require(file.firstBadLine == -1 || file.firstBadLine > 0, "a line without a number");
    for (const IniSection& section : file.sections) {
        for (const IniEntry& entry : section.entries) {
            fuzz::require(entry.line > 0 && !entry.key.empty(), "an entry from nowhere");
        }
    }
}

void requireSoundNumbers(const IniFile& file) {
    for (const IniSection& section : file.sections) {
        for (const IniEntry& entry : section.entries) {
            constexpr std::uint32_t untouched = 12345678;
            std::uint32_t number = untouched;
            const std::int32_t result =
                IniFile_getInt(&file, section.name.c_str(), entry.key.c_str(), &number);
            fuzz::require(result == 1 || result == 0 || result == ini_errorNoInteger,
                          "an unknown result");
            fuzz::require(result == 1 || number == untouched, "a number without success");
        }
    }
}

}  // namespace

void fuzz::readIni(std::string_view input) {
    if (input.empty()) {
        return;
    }
    const MemoryFile content(input.substr(1));
    const std::unique_ptr<IniFile, Destroy> file(IniFile_create());
    const auto settings = static_cast<unsigned char>(input[0]);
    file->flags = settings & 15u;
    file->mergeRepeated = (settings & 16u) != 0;
    file->ignoreCase = (settings & 32u) != 0;

    const std::int32_t result = IniFile_load(file.get(), content.path().c_str());
    require(result == 0 || result == ini_errorUnsupportedEncoding, "a file cannot be read");
    require(result == 0 || file->sections.empty(), "an error left something behind");
    requireSoundLines(*file);
    requireSoundNumbers(*file);
    std::uint32_t enable = 0;
    IniFile_getInt(file.get(), "WebService", "Enable", &enable);
}
