// The behaviour for a state folder that others use, that is damaged, or that cannot be written.

#include <fcntl.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include "StateFolder.h"
#include "support/series.h"

using namespace drivertest;

namespace {

constexpr const char* lockedRemedy =
    "; end that process, or name another folder in QITRMC_SIM_STATE";
constexpr const char* fileRemedy =
    "; put a copy of the file back, or remove it to lose the values in it";

// The bytes in a file for a number of this size.
std::string number(std::uint64_t value, std::size_t bytes) {
    std::string text;
    for (std::size_t i = 0; i < bytes; ++i) {
        text += static_cast<char>(value >> (8 * i) & 0xFF);
    }
    return text;
}

std::string text(const std::string& content) {
    return number(content.size(), 4) + content;
}

std::string entry(const std::string& resource, const std::string& item, std::uint8_t type,
                  std::uint32_t count, const std::string& elements) {
    return text(resource) + text(item) + number(type, 1) + number(count, 4) + elements;
}

std::string withChecksum(const std::string& content) {
    std::uint64_t sum = 14695981039346656037u;
    for (const char c : content) {
        sum = (sum ^ static_cast<unsigned char>(c)) * 1099511628211u;
    }
    return content + number(sum, 8);
}

std::string fileOf(std::uint64_t change, const std::string& entries) {
    return withChecksum("qitrmc-state 1\n" + number(change, 8) + number(entries.size(), 8) +
                        entries);
}

class StateFaultTest : public testing::Test {
  protected:
    // Expects that the driver refuses the folder with this message about a file or the folder.
    void expectRefusal(const std::string& path, const std::string& words) const {
        const std::string errors = state.run([&] {
            const Outcome outcome = openSession();
            EXPECT_EQ(outcome.code, -250930);
            EXPECT_EQ(outcome.text,
                      detailsOf("stateNotUsable", usage("FileName", "\"" + path + "\"") + "," +
                                                      usage("Details", "\"" + words + "\"")));
            EXPECT_EQ(openSession().code, -250930);
        });
        EXPECT_EQ(errors, "qitrmcapi: " + path + ": " + words + "\n");
    }
    void expectBroken(const std::string& name, const std::string& wrong) const {
        expectRefusal(state.file(name), wrong + fileRemedy);
    }
    // Expects that the driver starts with one message on standard error, and what body expects.
    void expectComplaint(const std::string& about, const std::string& reason,
                         const std::function<void()>& body) const {
        EXPECT_EQ(state.run(body), "qitrmcapi: " + state.path + ": what is kept of " + about +
                                       " is not used: " + reason + "\n");
    }
    // Commits a byte to an area in a process of its own.
    void commitByte(std::uint8_t byte) const {
        EXPECT_EQ(state.run([&] {
            Session session("Mod1");
            EXPECT_EQ(writeArea(session, "Mod1/user", {byte}).code, 0);
            EXPECT_EQ(commitNvmem(session, "Mod1/user").code, 0);
        }),
                  "");
    }
    void expectByte(std::uint8_t byte) const {
        EXPECT_EQ(state.run([&] {
            Session session("Mod1");
            EXPECT_EQ(readArea(session, "Mod1/user", 1), Bytes{byte});
        }),
                  "");
    }

    StateFolder state;
};

// A process that holds the folder until it is killed.
class Holder {
  public:
    explicit Holder(const StateFolder& state) {
        int ready[2];
        EXPECT_EQ(pipe(ready), 0);
        id = state.start([&] {
            EXPECT_EQ(openSession().code, 0);
            EXPECT_EQ(::write(ready[1], "!", 1), 1);
            pause();
        });
        close(ready[1]);
        char mark = 0;
        EXPECT_EQ(::read(ready[0], &mark, 1), 1);
        close(ready[0]);
    }
    Holder(const Holder&) = delete;
    Holder& operator=(const Holder&) = delete;
    ~Holder() {
        kill(id, SIGKILL);
        waitpid(id, nullptr, 0);
    }

    pid_t id;
};

TEST_F(StateFaultTest, OnlyOneProcessMayUseTheFolderAtATime) {
    {
        const Holder holder(state);
        expectRefusal(state.path,
                      "is in use by process " + std::to_string(holder.id) + lockedRemedy);
    }
    commitByte(1);
    expectByte(1);
}

TEST_F(StateFaultTest, AForkedProcessDoesNotWriteForItsParent) {
    EXPECT_EQ(state.run([&] {
        Session session("Mod1");
        const pid_t parent = getpid();
        std::fflush(nullptr);
        const pid_t child = fork();
        if (child == 0) {
            const Outcome outcome = renameDevice(session, "Mod1", "Other");
            EXPECT_EQ(outcome.code, -250931);
            EXPECT_EQ(outcome.text,
                      detailsOf("stateNotWritten",
                                usage("FileName", "\"" + state.file("change-1") + "\"") + "," +
                                    usage("Details", "\"the folder belongs to process " +
                                                         std::to_string(parent) + "\"")));
            _exit(HasFailure() ? 1 : 0);
        }
        int result = -1;
        EXPECT_EQ(waitpid(child, &result, 0), child);
        EXPECT_EQ(result, 0);
        EXPECT_EQ(renameDevice(session, "Mod1", "Mine").code, 0);
    }),
              "");
}

TEST_F(StateFaultTest, WhatIsNotAFolderIsRefused) {
    const std::string path = state.path;
    state.path = "/dev/null";
    expectRefusal("/dev/null",
                  "cannot be used: Not a directory; QITRMC_SIM_STATE must name a "
                  "folder that can be written");
    state.path = "/dev/null/state";
    expectRefusal("/dev/null/state",
                  "cannot be used: Not a directory; QITRMC_SIM_STATE must name "
                  "a folder that can be written");
    state.path = path;
}

TEST_F(StateFaultTest, AFolderThatMayNotBeWrittenIsRefused) {
    EXPECT_EQ(chmod(state.path.c_str(), 0555), 0);
    const std::string errors = state.run([] {
        if (geteuid() == 0) {
            EXPECT_EQ(seteuid(65534), 0);
        }
        EXPECT_EQ(openSession().code, -250930);
    });
    EXPECT_EQ(errors, "qitrmcapi: " + state.path +
                          ": cannot be used: Permission denied; QITRMC_SIM_STATE must name a "
                          "folder that can be written\n");
}

TEST_F(StateFaultTest, AFileIsReadInItsDocumentedFormat) {
    state.put(
        "change-7",
        fileOf(7, entry("Mod1", "Dev.Comment", 5, 1, text("by hand")) +
                      entry("mod1/USER", "", 8, 256, "\x01\xFF" + std::string(254, '\0')) +
                      entry("", "Sys.DiscoveryInterval", 2, 1, number(0x4000000000000000u, 8)) +
                      entry("", "Sys.ConfigChangeCount", 7, 1, number(600, 8)) +
                      entry("Mod2", "Dev.Name", 5, 1, text("Supply"))));
    EXPECT_EQ(state.run([] {
        Session session("Mod1");
        EXPECT_EQ(getText(session, "Mod1", "Dev.Comment"), std::string("by hand"));
        EXPECT_EQ(readArea(session, "Mod1/user", 3), (Bytes{1, 255, 0}));
        EXPECT_EQ(changeCount(session), 600u);
        EXPECT_EQ(getText(session, "Supply", "Dev.Name"), std::string("Supply"));
        Status status;
        double interval = 0;
        nQITRMCAPI100_getSystemPropertyDouble(session, "Sys.DiscoveryInterval", &interval, &status);
        EXPECT_EQ(interval, 2.0);
    }),
              "");
}

TEST_F(StateFaultTest, AFileIsWrittenInItsDocumentedFormat) {
    EXPECT_EQ(state.run([] {
        Session session("Mod1");
        EXPECT_EQ(set(setText, session, "Mod1", "Dev.Comment", "é").code, 0);
    }),
              "");
    EXPECT_EQ(contentOf(state.file("change-1")),
              fileOf(1, entry("Mod1", "Dev.Comment", 5, 1, text("é"))));
    EXPECT_EQ(contentOf(state.file("sessions")),
              fileOf(0, entry("", "Sys.NextSession", 6, 1, number(101, 4))));
}

TEST_F(StateFaultTest, AFileTruncatedAnywhereIsRefused) {
    commitByte(1);
    const std::string whole = contentOf(state.file("change-1"));
    for (std::size_t size = 0; size < whole.size(); size += failureStep) {
        state.put("change-1", whole.substr(0, size));
        const std::string errors = state.run([] { EXPECT_EQ(openSession().code, -250930); });
        EXPECT_NE(errors.find("change-1: "), std::string::npos) << "at " << size;
    }
    state.put("change-1", whole);
    expectByte(1);
}

TEST_F(StateFaultTest, AFileWithAnyByteChangedIsRefused) {
    commitByte(1);
    const std::string whole = contentOf(state.file("change-1"));
    unsigned change = 1;
    for (std::size_t place = 0; place < whole.size(); place += failureStep) {
        std::string edited = whole;
        edited[place] = static_cast<char>(edited[place] ^ static_cast<char>(change));
        change = change % 255 + 1;
        state.put("change-1", edited);
        state.run([] { EXPECT_EQ(openSession().code, -250930); });
    }
    EXPECT_EQ(contentOf(state.file("change-1")).size(), whole.size());
}

TEST_F(StateFaultTest, ABrokenFileIsReportedWithWhatIsWrong) {
    const std::string good = fileOf(3, entry("Mod1", "Dev.Comment", 5, 1, text("x")));
    state.put("change-3", "");
    expectBroken("change-3", "is no state file of this version");
    state.put("change-3", "qitrmc-state 2\n" + good.substr(15));
    expectBroken("change-3", "is no state file of this version");
    state.put("change-3", good.substr(0, 20));
    expectBroken("change-3", "is cut off");
    state.put("change-3", good.substr(0, good.size() - 9));
    expectBroken("change-3", "has " + std::to_string(good.size() - 9) +
                                 " bytes, but says that it has " + std::to_string(good.size()));
    state.put("change-3", good + "\n");
    expectBroken("change-3", "has " + std::to_string(good.size() + 1) +
                                 " bytes, but says that it has " + std::to_string(good.size()));
    std::string edited = good;
    edited[edited.find("Comment")] = 'c';
    state.put("change-3", edited);
    expectBroken("change-3", "does not match its checksum");
    state.put("change-3", fileOf(2, ""));
    expectBroken("change-3", "was made as the file of change 2");
}

TEST_F(StateFaultTest, AFileWithInvalidContentIsReadSafely) {
    state.put("change-1", fileOf(1, "\x03"));
    expectBroken("change-1", "breaks off within a value");
    state.put("change-1", fileOf(1, entry("Mod1", "Dev.Comment", 5, 1, number(4294967295u, 4))));
    expectBroken("change-1", "breaks off within a value");
    state.put("change-1", fileOf(1, entry("Mod1", "DMM.Totals", 14, 4294967295u, "")));
    expectBroken("change-1", "breaks off within a value");
    state.put("change-1", fileOf(1, entry("Mod1", "Dev.Comment", 0, 0, "")));
    expectBroken("change-1", "holds a value of no known type");
    state.put("change-1", fileOf(1, entry("Mod1", "Dev.Comment", 15, 0, "")));
    expectBroken("change-1", "holds a value of no known type");
}

TEST_F(StateFaultTest, OneBrokenFileAmongGoodOnesIsRefusedAndNothingIsLost) {
    commitByte(1);
    state.put("change-2", "torn");
    const auto before = state.files();
    expectBroken("change-2", "is no state file of this version");
    EXPECT_EQ(state.files(), before);
}

TEST_F(StateFaultTest, AFolderInPlaceOfAFileIsRefused) {
    std::filesystem::create_directory(state.file("change-1"));
    expectRefusal(state.file("change-1"),
                  "cannot be read: Is a directory; must be a readable file");
}

TEST_F(StateFaultTest, OtherFilesAreNotChanged) {
    for (const char* name : {"change-", "change-01", "change-1.old", "change-0", "notes"}) {
        state.put(name, "mine");
    }
    commitByte(1);
    EXPECT_EQ(contentOf(state.file("change-01")), "mine");
    EXPECT_EQ(contentOf(state.file("notes")), "mine");
}

TEST_F(StateFaultTest, ContentThatDoesNotFitIsReportedAndNotUsed) {
    const auto expectDefaults = [] {
        Session session("Mod1");
        EXPECT_EQ(getText(session, "Mod1", "Dev.Comment"), std::string(""));
        EXPECT_EQ(readArea(session, "Mod1/user", 1), Bytes{0});
        EXPECT_EQ(getText(session, "Mod1", "Dev.Name"), std::string("Mod1"));
        Status status;
        double interval = 0;
        nQITRMCAPI100_getSystemPropertyDouble(session, "Sys.DiscoveryInterval", &interval, &status);
        EXPECT_EQ(interval, 30.0);
    };
    const auto expectMisfit = [&](const std::string& kept, const std::string& about,
                                  const std::string& reason) {
        state.put("change-1", fileOf(1, kept));
        expectComplaint(about, reason, expectDefaults);
    };
    const std::string one = number(1, 4);
    expectMisfit(entry("Mod1", "Dev.Comment", 6, 1, one), "Mod1 Dev.Comment",
                 "the property has another type");
    expectMisfit(entry("Mod1", "Dev.Comment", 12, 1, text("x")), "Mod1 Dev.Comment",
                 "the property has another type");
    expectMisfit(entry("Mod1", "Dev.Comment", 5, 2, text("x") + text("y")), "Mod1 Dev.Comment",
                 "the property has another type");
    expectMisfit(entry("", "Sys.DiscoveryInterval", 2, 1, number(0, 8)), "Sys.DiscoveryInterval",
                 "the property cannot have this value");
    expectMisfit(entry("Mod1/user", "", 8, 255, std::string(255, 'x')), "Mod1/user",
                 "the area has another size");
    expectMisfit(entry("Mod1", "Dev.Name", 5, 1, text("a,b")), "Mod1 Dev.Name", "it is no name");
    expectMisfit(entry("Mod1", "Dev.Name", 5, 1, text("MOD2")), "Mod1 Dev.Name",
                 "another device has this name");
}

TEST_F(StateFaultTest, NamesThatConflictAreNotUsedUntilTheyNoLongerConflict) {
    state.put("change-1", fileOf(1, entry("Mod1", "Dev.Name", 5, 1, text("Bench")) +
                                        entry("Mod2", "Dev.Name", 5, 1, text("Mod1")) +
                                        entry("Mod4", "Dev.Name", 5, 1, text("Mod2"))));
    const std::string errors = state.run([] {
        Session session;
        EXPECT_EQ(session.systemList("Sys.Devices"),
                  (Names{"Bench", "Mod1", "Mod2", "Mod4", "Mod5"}));
    });
    EXPECT_EQ(std::count(errors.begin(), errors.end(), '\n'), 3);
}

void expectNotWritten(const Outcome& outcome, const std::string& path, const std::string& reason) {
    EXPECT_EQ(outcome.code, -250931);
    EXPECT_EQ(outcome.text,
              detailsOf("stateNotWritten", usage("FileName", "\"" + path + "\"") + "," +
                                               usage("Details", "\"" + reason + "\"")));
}

void limitFileSize(rlim_t bytes) {
    signal(SIGXFSZ, SIG_IGN);
    rlimit limit = {};
    EXPECT_EQ(getrlimit(RLIMIT_FSIZE, &limit), 0);
    limit.rlim_cur = bytes;
    EXPECT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
}

TEST_F(StateFaultTest, AFullDiskAtAnyByteKeepsTheOldContent) {
    commitByte(1);
    const auto before = state.files();
    const std::size_t size = before.at("change-1").size();
    EXPECT_EQ(state.run([&] {
        Session session("Mod1");
        EXPECT_EQ(writeArea(session, "Mod1/user", {2}).code, 0);
        for (std::size_t room = 0; room < size; ++room) {
            limitFileSize(room);
            expectNotWritten(commitNvmem(session, "Mod1/user"), state.file("change-2"),
                             "File too large");
            EXPECT_EQ(state.files(), before) << "room for " << room;
            EXPECT_FALSE(std::filesystem::exists(state.file("unfinished")));
            EXPECT_EQ(get(getBool, session, "Mod1/user", "NVMEMArea.PendingChanges"),
                      std::uint8_t{1});
        }
        EXPECT_EQ(readArea(session, "Mod1/user", 1), Bytes{2});
        EXPECT_EQ(resetDevices(session, "Mod1"), 0);
        EXPECT_EQ(readArea(session, "Mod1/user", 1), Bytes{1});
    }),
              "");
    expectByte(1);
}

TEST_F(StateFaultTest, ACommitSucceedsOnceThereIsRoom) {
    EXPECT_EQ(state.run([&] {
        Session session("Mod1");
        EXPECT_EQ(writeArea(session, "Mod1/user", {2}).code, 0);
        limitFileSize(10);
        EXPECT_EQ(commitNvmem(session, "Mod1/user").code, -250931);
        limitFileSize(100000);
        EXPECT_EQ(commitNvmem(session, "Mod1/user").code, 0);
    }),
              "");
    expectByte(2);
}

TEST_F(StateFaultTest, AChangeThatCannotBeWrittenHasNoEffect) {
    const std::string path = state.file("change-1");
    const std::string reason = "Is a directory";
    EXPECT_EQ(state.run([&] {
        Session session("Mod1,Mod2");
        std::filesystem::create_directory(state.file("unfinished"));
        expectNotWritten(renameDevice(session, "Mod1", "Other"), path, reason);
        EXPECT_EQ(session.systemList("Sys.Devices")[1], "Mod1");
        EXPECT_EQ(get(getUInt32, session, "Other", "Dev.SlotNum").code, -250956);
        EXPECT_EQ(changeCount(session), 0u);
        expectNotWritten(set(setText, session, "Mod1", "Dev.Comment", "x"), path, reason);
        Status status;
        nQITRMCAPI100_executeGenericCommand(session, "Mod1", "DMM.SelfTest", 10.0, &status);
        expectNotWritten({status.code, status.text()}, path, reason);
        EXPECT_EQ(getText(session, "Mod1", "Dev.Comment"), std::string(""));
        EXPECT_EQ(writeArea(session, "Mod1/user", {2}).code, 0);
        expectNotWritten(commitNvmem(session, "Mod1/user"), path, reason);
        EXPECT_EQ(set(setDouble, session, "Mod1", "DMM.Range", 1.0).code, 0);
        EXPECT_EQ(rmdir(state.file("unfinished").c_str()), 0);
        EXPECT_EQ(renameDevice(session, "Mod1", "Other").code, 0);
        EXPECT_EQ(changeCount(session), 1u);
    }),
              "");
}

TEST_F(StateFaultTest, AFileThatCannotBeRenamedChangesNothing) {
    EXPECT_EQ(state.run([&] {
        Session session("Mod1");
        std::filesystem::create_directory(state.file("change-1"));
        expectNotWritten(renameDevice(session, "Mod1", "Other"), state.file("change-1"),
                         "Is a directory");
        EXPECT_FALSE(std::filesystem::exists(state.file("unfinished")));
        EXPECT_EQ(rmdir(state.file("change-1").c_str()), 0);
    }),
              "");
    EXPECT_EQ(state.files().size(), 0u);
}

TEST_F(StateFaultTest, AFolderThatIsNoLongerWritableChangesNothing) {
    EXPECT_EQ(state.run([&] {
        Session session("Mod1");
        EXPECT_EQ(chmod(state.path.c_str(), 0555), 0);
        if (geteuid() == 0) {
            EXPECT_EQ(seteuid(65534), 0);
        }
        expectNotWritten(renameDevice(session, "Mod1", "Other"), state.file("change-1"),
                         "Permission denied");
    }),
              "");
}

TEST_F(StateFaultTest, ARemovedFolderChangesNothing) {
    EXPECT_EQ(state.run([&] {
        Session session("Mod1");
        std::filesystem::remove_all(state.path);
        expectNotWritten(renameDevice(session, "Mod1", "Other"), state.file("change-1"),
                         "No such file or directory");
    }),
              "");
}

}  // namespace
