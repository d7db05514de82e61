#include "host/StaticFiles.h"

#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "host/Failure.h"
#include "host/RequestTarget.h"

namespace host {

namespace {

namespace fs = std::filesystem;

// A page has a hundredth of this; somebody's home folder has more.
constexpr std::size_t mostBytes = 64 * 1024 * 1024;

// The build gives the files here names that hold a hash of their content.
constexpr std::string_view lastingFolder = "/assets/";

constexpr const char* folders[] = {"share/web", "share/qitrmc/web"};

struct TypeOfEnding {
    const char* ending;
    const char* type;
};

constexpr TypeOfEnding types[] = {
    {".css", "text/css; charset=utf-8"},
    {".html", "text/html; charset=utf-8"},
    {".ico", "image/x-icon"},
    {".js", "text/javascript; charset=utf-8"},
    {".json", "application/json"},
    {".png", "image/png"},
    {".svg", "image/svg+xml"},
    {".txt", "text/plain; charset=utf-8"},
    {".woff2", "font/woff2"},
};

std::string typeOf(const fs::path& path) {
    for (const TypeOfEnding& known : types) {
        if (path.extension() == known.ending) {
            return known.type;
        }
    }
    return "application/octet-stream";
}

// FNV-1a over 64 bits: it tells contents apart, it protects nothing.
std::string tagOf(const std::string& content) {
    std::uint64_t hash = 14695981039346656037u;
    for (const char c : content) {
        hash = (hash ^ static_cast<unsigned char>(c)) * 1099511628211u;
    }
    char text[19];
    std::snprintf(text, sizeof text, "\"%016llx\"", static_cast<unsigned long long>(hash));
    return text;
}

std::string contentOf(const fs::path& path) {
    errno = 0;
    std::ifstream file(path, std::ios::binary);
    std::string content((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
    if (!file.good() && !file.eof()) {
        throw Failure("The file " + path.string() +
                      " of the page cannot be read: " + std::strerror(errno) +
                      ". Make it readable, or name another folder with --web.");
    }
    return content;
}

bool isHidden(const fs::path& path) {
    return path.filename().string().front() == '.';
}

// What the iterator goes on to from here.
bool isServed(fs::recursive_directory_iterator& entry) {
    const bool hidden = isHidden(entry->path());
    if (hidden && entry->is_directory()) {
        entry.disable_recursion_pending();
    }
    return !hidden && fs::is_regular_file(entry->symlink_status());
}

}  // namespace

StaticFiles::StaticFiles(const std::string& folder) {
    std::size_t bytes = 0;
    try {
        for (fs::recursive_directory_iterator entry(folder), end; entry != end; ++entry) {
            if (!isServed(entry)) {
                continue;
            }
            StaticFile file;
            bytes += entry->file_size();
            if (bytes > mostBytes) {
                throw Failure("The folder " + folder +
                              " has more than 64 MiB. Name the folder of a web page with --web.");
            }
            file.type = typeOf(entry->path());
            file.content = contentOf(entry->path());
            file.tag = tagOf(file.content);
            const std::string name =
                "/" + entry->path().lexically_relative(folder).generic_string();
            file.isLasting = name.rfind(lastingFolder, 0) == 0;
            files.emplace(name, std::move(file));
        }
    } catch (const fs::filesystem_error& error) {
        throw Failure("The folder " + folder + " of the page cannot be read: " +
                      error.code().message() + ". Name a readable folder with --web.");
    }
}

const StaticFile* StaticFiles::find(std::string_view path) const {
    std::string name = percentDecoded(path);
    if (!name.empty() && name.back() == '/') {
        name += "index.html";
    }
    const auto found = files.find(name);
    return found == files.end() ? nullptr : &found->second;
}

std::string findPage() {
    std::error_code error;
    const fs::path program = fs::read_symlink("/proc/self/exe", error);
    for (const char* folder : folders) {
        const fs::path path = program.parent_path().parent_path() / folder;
        if (fs::is_directory(path, error)) {
            return path.string();
        }
    }
    return "";
}

}  // namespace host
