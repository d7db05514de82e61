#pragma once

#include <map>
#include <string>
#include <string_view>

namespace host {

struct StaticFile {
    std::string type;
    std::string content;
    std::string tag;         // of the content, as the header "ETag" has it
    bool isLasting = false;  // another content would have another name
};

// The files of a web page. They are read once, when the host starts, and a request can name
// nothing else: no name reaches the file system.
class StaticFiles {
  public:
    // No files.
    StaticFiles() = default;

    // Reads the regular files in a folder and the folders in it. Links and names that begin with a
    // dot are left out. Throws Failure when a file cannot be read or there is far more than a page
    // has.
    explicit StaticFiles(const std::string& folder);

    // The file that a path names, escapes and all; null when there is none. A path that ends in a
    // slash names the "index.html" there.
    const StaticFile* find(std::string_view path) const;

  private:
    std::map<std::string, StaticFile, std::less<>> files;  // by path, which begins with a slash
};

// Where the page lies when the command line does not say: beside a build or an installation. Empty
// when it lies nowhere.
std::string findPage();

}  // namespace host
