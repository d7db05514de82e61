#include "host/StaticFiles.h"

#include <gtest/gtest.h>
#include <stdlib.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "host/Failure.h"
#include "host/Page.h"

namespace {

namespace fs = std::filesystem;

using host::Page;
using host::SiteRequest;
using host::SiteResponse;
using host::StaticFile;
using host::StaticFiles;

class StaticFilesTest : public testing::Test {
  protected:
    StaticFilesTest() {
        char name[] = "/tmp/qitrmc-page-XXXXXX";
        top = mkdtemp(name);
        folder = top / "page";
        fs::create_directories(folder / "assets");
        write(top / "secret.txt", "secret");
        write(folder / "index.html", "<title>");
        write(folder / "a b.txt", "space");
        write(folder / "assets/app-1234.js", "run()");
    }

    ~StaticFilesTest() override { fs::remove_all(top); }

    static void write(const fs::path& path, const std::string& content) {
        std::ofstream(path, std::ios::binary) << content;
    }

    std::string contentAt(const std::string& path) const {
        const StaticFiles files(folder);
        const StaticFile* file = files.find(path);
        return file == nullptr ? "(none)" : file->content;
    }

    SiteResponse answer(const SiteRequest& request) const {
        return Page(StaticFiles(folder)).answer(request);
    }

    fs::path top;
    fs::path folder;
};

TEST_F(StaticFilesTest, FindsFilesByTheirDecodedPaths) {
    EXPECT_EQ(contentAt("/index.html"), "<title>");
    EXPECT_EQ(contentAt("/assets/app-1234.js"), "run()");
    EXPECT_EQ(contentAt("/a%20b.txt"), "space");
    EXPECT_EQ(contentAt("/%61ssets/app-1234.js"), "run()");
}

TEST_F(StaticFilesTest, FindsTheIndexOfAFolderAndListsNone) {
    EXPECT_EQ(contentAt("/"), "<title>");
    EXPECT_EQ(contentAt("/assets/"), "(none)");
    EXPECT_EQ(contentAt("/assets"), "(none)");
    EXPECT_EQ(contentAt(""), "(none)");
}

TEST_F(StaticFilesTest, ReachesNothingOutsideTheFolder) {
    for (const char* path :
         {"/../secret.txt", "/%2e%2e/secret.txt", "/..%2fsecret.txt", "/%2e%2e%2fsecret.txt",
          "/assets/../../secret.txt", "/..\\secret.txt", "/..%5csecret.txt", "//../secret.txt",
          "/./../secret.txt", "/%252e%252e/secret.txt", "../secret.txt", "secret.txt",
          "/index.html%00.txt", "/index.html%00", "/..;/secret.txt", "/%c0%ae%c0%ae/secret.txt"}) {
        EXPECT_EQ(contentAt(path), "(none)") << path;
    }
    EXPECT_EQ(contentAt(top.string() + "/secret.txt"), "(none)");
    EXPECT_EQ(contentAt("/" + top.string() + "/secret.txt"), "(none)");
    EXPECT_EQ(contentAt("/" + std::string(1000000, 'a')), "(none)");
}

TEST_F(StaticFilesTest, FollowsNoLinks) {
    fs::create_symlink(top / "secret.txt", folder / "link.txt");
    fs::create_directory_symlink(top, folder / "up");
    EXPECT_EQ(contentAt("/link.txt"), "(none)");
    EXPECT_EQ(contentAt("/up/secret.txt"), "(none)");
}

TEST_F(StaticFilesTest, LeavesOutHiddenFilesAndFolders) {
    write(folder / ".htpasswd", "secret");
    fs::create_directory(folder / ".git");
    write(folder / ".git/config", "secret");
    EXPECT_EQ(contentAt("/.htpasswd"), "(none)");
    EXPECT_EQ(contentAt("/.git/config"), "(none)");
}

TEST_F(StaticFilesTest, RefusesAFolderThatIsNotThereInWords) {
    try {
        const StaticFiles files((top / "nowhere").string());
        FAIL() << "no failure";
    } catch (const host::Failure& failure) {
        EXPECT_EQ(failure.what(), "The folder " + (top / "nowhere").string() +
                                      " of the page cannot be read: No such file or directory. "
                                      "Name a readable folder with --web.");
    }
}

TEST_F(StaticFilesTest, RefusesAFolderThatIsFarTooLarge) {
    write(folder / "big.bin", "");
    fs::resize_file(folder / "big.bin", 64 * 1024 * 1024 + 1);
    EXPECT_THROW(StaticFiles(folder.string()), host::Failure);
}

TEST_F(StaticFilesTest, TellsTheTypeByTheEnding) {
    write(folder / "style.css", "");
    write(folder / "odd.exe", "");
    const StaticFiles files(folder);
    EXPECT_EQ(files.find("/")->type, "text/html; charset=utf-8");
    EXPECT_EQ(files.find("/assets/app-1234.js")->type, "text/javascript; charset=utf-8");
    EXPECT_EQ(files.find("/style.css")->type, "text/css; charset=utf-8");
    EXPECT_EQ(files.find("/odd.exe")->type, "application/octet-stream");
}

// The 64-bit FNV-1a of "a" as its authors publish it.
TEST_F(StaticFilesTest, TagsAContentByItsHash) {
    write(folder / "letter.txt", "a");
    EXPECT_EQ(StaticFiles(folder).find("/letter.txt")->tag, "\"af63dc4c8601ec8c\"");
}

TEST_F(StaticFilesTest, SendsNoBodyToWhomKnowsTheContent) {
    write(folder / "letter.txt", "a");
    for (const char* known : {"\"af63dc4c8601ec8c\"", "\"x\", W/\"af63dc4c8601ec8c\"", "*"}) {
        const SiteResponse response = answer({"GET", "/letter.txt", known});
        EXPECT_EQ(response.code, 304) << known;
        EXPECT_EQ(response.body, "");
    }
    EXPECT_EQ(answer({"GET", "/letter.txt", "\"af63dc4c8601ec8d\""}).body, "a");
}

TEST_F(StaticFilesTest, RefusesToBeWritten) {
    for (const char* method : {"POST", "PUT", "DELETE", "OPTIONS"}) {
        const SiteResponse response = answer({method, "/index.html", ""});
        EXPECT_EQ(response.code, 405) << method;
        EXPECT_EQ(response.body, "This can only be read, with GET.\n");
    }
}

}  // namespace
