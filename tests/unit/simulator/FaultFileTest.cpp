// The faults file, named by the environment before the library is used, while it changes.

#include <sys/stat.h>

#include <filesystem>

#include "ChassisFile.h"
#include "FaultsInForce.h"
#include "Values.h"

using namespace drivertest;

namespace {

// In a folder of its own. At first the file does not exist.
class FaultFile {
  public:
    FaultFile() {
        std::string pattern = "/tmp/faultsXXXXXX";
        folder = mkdtemp(pattern.data());
        path = folder / "faults.json";
        setenv("QITRMC_SIM_FAULTS", path.c_str(), 1);
    }
    FaultFile(const FaultFile&) = delete;
    FaultFile& operator=(const FaultFile&) = delete;
    ~FaultFile() { std::filesystem::remove_all(folder); }

    void replace(const std::string& text) const {
        const auto fresh = folder / "fresh";
        std::ofstream(fresh, std::ios::binary) << text;
        std::filesystem::rename(fresh, path);
    }
    void overwrite(const std::string& text) const { std::ofstream(path, std::ios::binary) << text; }
    void remove() const { std::filesystem::remove_all(path); }

    std::filesystem::path folder;
    std::filesystem::path path;
};

const FaultFile file;

std::string failingWith(int code) {
    return oneFault("\"function\":\"abortSession\",\"status\":{\"code\":" + std::to_string(code) +
                    "}");
}

// Captures what is written to standard error in its scope.
class Errors {
  public:
    Errors() { testing::internal::CaptureStderr(); }
    std::string take() { return testing::internal::GetCapturedStderr(); }
};

class FaultFileTest : public testing::Test {
  protected:
    ~FaultFileTest() override { file.remove(); }
    Session session;
};

TEST_F(FaultFileTest, AMissingFileMeansNoFaults) {
    EXPECT_EQ(session.abort(), 0);
}

TEST_F(FaultFileTest, AFileMayBeCreatedChangedAndRemoved) {
    file.replace(failingWith(-71));
    EXPECT_EQ(session.abort(), -71);
    file.replace(failingWith(-72));
    EXPECT_EQ(session.abort(), -72);
    file.overwrite(failingWith(-730));
    EXPECT_EQ(session.abort(), -730);
    file.remove();
    EXPECT_EQ(session.abort(), 0);
    file.replace(failingWith(-74));
    EXPECT_EQ(session.abort(), -74);
}

TEST_F(FaultFileTest, AChangedFileOfTheSameSizeIsReadAgain) {
    file.replace(failingWith(-71));
    EXPECT_EQ(session.abort(), -71);
    file.replace(failingWith(-72));
    EXPECT_EQ(session.abort(), -72);
}

TEST_F(FaultFileTest, AnUnchangedFileIsNotReadAgain) {
    file.replace(
        oneFault("\"function\":\"abortSession\",\"calls\":{\"first\":2,\"count\":1},"
                 "\"status\":{\"code\":-71}"));
    EXPECT_EQ(session.abort(), 0);
    EXPECT_EQ(session.abort(), -71);
    EXPECT_EQ(session.abort(), 0);
}

TEST_F(FaultFileTest, ABrokenFileKeepsThePreviousFaultsAndIsReportedOnce) {
    file.replace(failingWith(-71));
    EXPECT_EQ(session.abort(), -71);
    Errors errors;
    file.replace("{\"faults\":[{\"delay\":\"long\"}]}");
    EXPECT_EQ(session.abort(), -71);
    EXPECT_EQ(session.abort(), -71);
    EXPECT_EQ(errors.take(), "qitrmcapi: " + file.path.string() +
                                 ": /faults/0/delay is the text \"long\"; must be a time in "
                                 "seconds, from 0 to a day; the former faults stay\n");
    Errors again;
    file.replace("{");
    EXPECT_EQ(session.abort(), -71);
    EXPECT_NE(again.take().find("is not JSON at line 1, column 2"), std::string::npos);
    file.replace("{}");
    EXPECT_EQ(session.abort(), 0);
}

TEST_F(FaultFileTest, AFolderIsNotAFile) {
    Errors errors;
    std::filesystem::create_directory(file.path);
    EXPECT_EQ(session.abort(), 0);
    EXPECT_EQ(errors.take(), "qitrmcapi: " + file.path.string() +
                                 ": cannot be read: Is a directory; QITRMC_SIM_FAULTS must name a "
                                 "readable file; the former faults stay\n");
}

TEST_F(FaultFileTest, APipeDoesNotBlock) {
    file.replace(failingWith(-71));
    EXPECT_EQ(session.abort(), -71);
    Errors errors;
    file.remove();
    ASSERT_EQ(mkfifo(file.path.c_str(), 0600), 0);
    EXPECT_EQ(session.abort(), -71);
    EXPECT_EQ(errors.take(), "qitrmcapi: " + file.path.string() +
                                 ": is a pipe, which is read but once; QITRMC_SIM_FAULTS must name "
                                 "a file on a disk; the former faults stay\n");
}

TEST_F(FaultFileTest, AnInaccessibleFileKeepsThePreviousFaults) {
    file.replace(failingWith(-71));
    EXPECT_EQ(session.abort(), -71);
    Errors errors;
    file.remove();
    std::filesystem::create_symlink(file.path, file.path);
    EXPECT_EQ(session.abort(), -71);
    EXPECT_NE(errors.take().find("cannot be read: Too many levels of symbolic links"),
              std::string::npos);
}

TEST_F(FaultFileTest, FaultsThatTheProgramSetsLastUntilTheFileChanges) {
    file.replace(failingWith(-71));
    EXPECT_EQ(session.abort(), -71);
    EXPECT_EQ(setFaults(failingWith(-81)).code, 0);
    EXPECT_EQ(session.abort(), -81);
    EXPECT_EQ(session.abort(), -81);
    file.replace(failingWith(-72));
    EXPECT_EQ(session.abort(), -72);
}

TEST_F(FaultFileTest, EventsOfTheFileAreUsedToo) {
    file.replace("{\"events\":[{\"device\":\"Mod2\",\"event\":\"pulled\"}]}");
    EXPECT_EQ(session.systemList("Sys.Devices"), (Names{"Bench", "Mod1", "Mod4", "Mod5"}));
    file.remove();
    EXPECT_EQ(session.systemList("Sys.Devices").size(), 5u);
}

}  // namespace
