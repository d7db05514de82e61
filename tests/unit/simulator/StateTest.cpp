#include <sys/stat.h>

#include "StateFolder.h"

using namespace drivertest;

namespace {

constexpr const char* description = R"({
    "driver_properties": {
        "device": {"Dev.Hours": {"type": "UInt64", "lasting": true, "value": 7}}
    },
    "devices": [
        {"name": "Größe", "category": 2,
         "properties": {
             "P.Real": {"type": "Double", "access": "ReadWrite", "lasting": true, "value": 1},
             "P.Labels": {"type": "StringArray", "access": "ReadWrite", "lasting": true,
                          "value": ["none"]},
             "P.Flags": {"type": "BoolArray", "access": "ReadWrite", "lasting": true, "value": []},
             "P.Committed": {"type": "Int32", "access": "ReadWrite", "lasting": true,
                             "needs_commit": true, "value": 1},
             "P.Fleeting": {"type": "Int32", "access": "ReadWrite", "value": 1}},
         "commands": {
             "Work": {"adds": {"Dev.Hours": 5, "P.Fleeting": 1}},
             "Name": {"sets": {"Dev.Comment": "worked"}},
             "Defaults": {"resets": true}},
         "channels": {"prefix": "ch", "count": 2},
         "nvmem_areas": [{"name": "user", "size": 4, "bytes": "aabb"}, {"name": "more", "size": 2}]},
        {"name": "Second", "category": 2, "nvmem_areas": [{"name": "user", "size": 4}]}
    ]
})";

class StateTest : public testing::Test {
  protected:
    StateTest() { state.chassis = file.path; }

    // Runs body with a session on all devices in a process of its own.
    void run(const std::function<void(Session&)>& body) const {
        EXPECT_EQ(state.run([&] {
            Session session("Größe,Second");
            body(session);
        }),
                  "");
    }

    const ChassisFile file{description};
    StateFolder state;
};

Outcome execute(Handle session, const char* command) {
    Status status;
    nQITRMCAPI100_executeGenericCommand(session, "Größe", command, 1.0, &status);
    return {status.code, status.text()};
}

TEST_F(StateTest, CommittedBytesSurviveARestart) {
    run([](Session& session) {
        EXPECT_EQ(writeArea(session, "Größe/user", {0, 1, 255}).code, 0);
        EXPECT_EQ(writeArea(session, "Second/user", {9}).code, 0);
        EXPECT_EQ(commitNvmem(session, "Größe,Second/user").code, 0);
    });
    EXPECT_EQ(state.files().size(), 1u);
    run([](Session& session) {
        EXPECT_EQ(readArea(session, "Größe/user", 4), (Bytes{0, 1, 255, 0}));
        EXPECT_EQ(readArea(session, "Second/user", 4), (Bytes{9, 0, 0, 0}));
        EXPECT_EQ(readArea(session, "Größe/more", 2), (Bytes{0, 0}));
        EXPECT_EQ(get(getBool, session, "Größe/user", "NVMEMArea.PendingChanges"), std::uint8_t{0});
    });
}

mode_t modeOf(const std::string& path) {
    struct stat facts = {};
    EXPECT_EQ(stat(path.c_str(), &facts), 0) << path;
    return facts.st_mode & 07777;
}

TEST_F(StateTest, TheUmaskDeterminesTheFilePermissions) {
    for (const mode_t mask : {0000, 0027}) {
        const std::string parent = state.file("parent" + std::to_string(mask));
        const std::string folder = parent + "/folder";
        EXPECT_EQ(state.run([&] {
            umask(mask);
            setenv("QITRMC_SIM_STATE", folder.c_str(), 1);
            Session session("Größe");
            EXPECT_EQ(execute(session, "Name").code, 0);
        }),
                  "");
        EXPECT_EQ(modeOf(parent), 0777 & ~mask);
        EXPECT_EQ(modeOf(folder), 0777 & ~mask);
        EXPECT_EQ(modeOf(folder + "/lock"), 0666 & ~mask);
        EXPECT_EQ(modeOf(folder + "/change-1"), 0666 & ~mask);
    }
}

TEST_F(StateTest, BytesThatWereNotCommittedAreLost) {
    run([](Session& session) {
        EXPECT_EQ(writeArea(session, "Größe/user", {1}).code, 0);
        EXPECT_EQ(commitNvmem(session, "Größe/more").code, 0);
    });
    EXPECT_EQ(state.files().size(), 0u);
    run([](Session& session) {
        EXPECT_EQ(readArea(session, "Größe/user", 4), (Bytes{0xAA, 0xBB, 0, 0}));
    });
}

TEST_F(StateTest, ObsoleteFilesAreRemoved) {
    run([](Session& session) {
        for (std::uint8_t i = 0; i < 5; ++i) {
            EXPECT_EQ(writeArea(session, "Größe/user", {i}).code, 0);
            EXPECT_EQ(writeArea(session, "Second/user", {i}).code, 0);
            EXPECT_EQ(commitNvmem(session, i < 3 ? "Größe/user,Second/user" : "Größe/user").code,
                      0);
        }
    });
    const auto files = state.files();
    EXPECT_EQ(files.size(), 2u);
    EXPECT_EQ(files.count("change-3"), 1u);
    EXPECT_EQ(files.count("change-5"), 1u);
    run([](Session& session) {
        EXPECT_EQ(readArea(session, "Größe/user", 1), Bytes{4});
        EXPECT_EQ(readArea(session, "Second/user", 1), Bytes{2});
        EXPECT_EQ(writeArea(session, "Second/user", {7}).code, 0);
        EXPECT_EQ(commitNvmem(session, "Second/user").code, 0);
    });
    EXPECT_EQ(state.files().count("change-3"), 0u);
    EXPECT_EQ(state.files().count("change-6"), 1u);
}

TEST_F(StateTest, ObsoleteFilesOfAnEarlierProcessAreRemoved) {
    run([](Session& session) { EXPECT_EQ(execute(session, "Name").code, 0); });
    const std::string old = contentOf(state.file("change-1"));
    run([](Session& session) { EXPECT_EQ(execute(session, "Name").code, 0); });
    state.put("change-1", old);
    state.put("unfinished", "a part of a file");
    run([](Session&) {});
    EXPECT_EQ(state.files().count("change-1"), 0u);
    EXPECT_EQ(state.files().count("change-2"), 1u);
    EXPECT_FALSE(std::filesystem::exists(state.file("unfinished")));
}

TEST_F(StateTest, NamesAndTheirChangesSurviveARestart) {
    run([](Session& session) {
        EXPECT_EQ(renameDevice(session, "Größe", "x").code, 0);
        EXPECT_EQ(renameDevice(session, "Second", "Größe").code, 0);
        EXPECT_EQ(renameDevice(session, "x", "Second").code, 0);
        EXPECT_EQ(writeArea(session, "Second/more", {3}).code, 0);
        EXPECT_EQ(commitNvmem(session, "Second/more").code, 0);
    });
    EXPECT_EQ(state.run([] {
        Session session;
        EXPECT_EQ(session.systemList("Sys.Devices"), (Names{"Second", "Größe"}));
        EXPECT_EQ(changeCount(session), 3u);
        EXPECT_EQ(readArea(session, "second/more", 1), Bytes{3});
        EXPECT_EQ(renameDevice(session, "Second", "SECOND").code, 0);
    }),
              "");
    EXPECT_EQ(state.run([] {
        Session session;
        EXPECT_EQ(session.systemList("Sys.Devices"), (Names{"SECOND", "Größe"}));
        EXPECT_EQ(changeCount(session), 4u);
    }),
              "");
}

TEST_F(StateTest, OnlyPersistentPropertiesSurviveARestart) {
    run([](Session& session) {
        EXPECT_EQ(set(setText, session, "Größe", "Dev.Comment", "für später").code, 0);
        EXPECT_EQ(setArray(setTexts, session, "Größe/ch0:1", "PhysChan.Comment", {"a", ""}).code,
                  0);
        EXPECT_EQ(set(setDouble, session, "Größe", "P.Real", -0.1).code, 0);
        EXPECT_EQ(setArray(setTexts, session, "Größe", "P.Labels", {"x", "", "ü"}).code, 0);
        EXPECT_EQ(setArray(setBools, session, "Größe", "P.Flags", {1, 0}).code, 0);
        EXPECT_EQ(set(setInt32, session, "Größe", "P.Fleeting", 5).code, 0);
        Status status;
        nQITRMCAPI100_setSystemPropertyBool(session, "Sys.DiscoveryEnabled", 0, &status);
        nQITRMCAPI100_setSystemPropertyDouble(session, "Sys.DiscoveryInterval", 1.5, &status);
        EXPECT_EQ(status.code, 0) << status.text();
    });
    run([](Session& session) {
        EXPECT_EQ(getText(session, "Größe", "Dev.Comment"), std::string("für später"));
        EXPECT_EQ(getTexts(session, "Größe/ch0:1", "PhysChan.Comment"), (Names{"a", ""}));
        EXPECT_EQ(get(getDouble, session, "Größe", "P.Real"), -0.1);
        EXPECT_EQ(getTexts(session, "Größe", "P.Labels"), (Names{"x", "", "ü"}));
        EXPECT_EQ(getArray(getBools, session, "Größe", "P.Flags"),
                  (std::vector<std::uint8_t>{1, 0}));
        EXPECT_EQ(get(getInt32, session, "Größe", "P.Fleeting"), 1);
        Status status;
        std::uint8_t enabled = 1;
        double interval = 0;
        nQITRMCAPI100_getSystemPropertyBool(session, "Sys.DiscoveryEnabled", &enabled, &status);
        nQITRMCAPI100_getSystemPropertyDouble(session, "Sys.DiscoveryInterval", &interval, &status);
        EXPECT_EQ(enabled, 0);
        EXPECT_EQ(interval, 1.5);
    });
}

TEST_F(StateTest, APropertyThatNeedsACommitIsPersistentAsCommitted) {
    run([](Session& session) {
        EXPECT_EQ(set(setInt32, session, "Größe", "P.Committed", 2).code, 0);
        EXPECT_EQ(commitProperties(session, "Größe").code, 0);
        EXPECT_EQ(set(setInt32, session, "Größe", "P.Committed", 3).code, 0);
    });
    run([](Session& session) { EXPECT_EQ(get(getInt32, session, "Größe", "P.Committed"), 2); });
}

TEST_F(StateTest, ChangesOfPersistentPropertiesByCommandsSurviveARestart) {
    run([](Session& session) {
        EXPECT_EQ(execute(session, "Work").code, 0);
        EXPECT_EQ(execute(session, "Work").code, 0);
        EXPECT_EQ(execute(session, "Name").code, 0);
    });
    run([](Session& session) {
        EXPECT_EQ(get(getUInt64, session, "Größe", "Dev.Hours"), std::uint64_t{17});
        EXPECT_EQ(get(getInt32, session, "Größe", "P.Fleeting"), 1);
        EXPECT_EQ(getText(session, "Größe", "Dev.Comment"), std::string("worked"));
    });
}

TEST_F(StateTest, AResetKeepsPersistentState) {
    run([](Session& session) {
        EXPECT_EQ(set(setDouble, session, "Größe", "P.Real", 2.0).code, 0);
        EXPECT_EQ(set(setInt32, session, "Größe", "P.Committed", 2).code, 0);
        EXPECT_EQ(set(setInt32, session, "Größe", "P.Fleeting", 2).code, 0);
        EXPECT_EQ(execute(session, "Defaults").code, 0);
        EXPECT_EQ(get(getInt32, session, "Größe", "P.Fleeting"), 1);
        EXPECT_EQ(set(setInt32, session, "Größe", "P.Fleeting", 2).code, 0);
        EXPECT_EQ(resetDevices(session, "Größe"), 0);
        EXPECT_EQ(commitProperties(session, "Größe").code, 0);
        EXPECT_EQ(get(getDouble, session, "Größe", "P.Real"), 2.0);
        EXPECT_EQ(get(getInt32, session, "Größe", "P.Committed"), 1);
        EXPECT_EQ(get(getInt32, session, "Größe", "P.Fleeting"), 1);
    });
    run([](Session& session) { EXPECT_EQ(get(getDouble, session, "Größe", "P.Real"), 2.0); });
}

TEST_F(StateTest, StateOfDevicesThatAnotherChassisLacksIsKept) {
    run([](Session& session) {
        EXPECT_EQ(writeArea(session, "Größe/user", {1}).code, 0);
        EXPECT_EQ(commitNvmem(session, "Größe/user").code, 0);
        EXPECT_EQ(renameDevice(session, "Größe", "Mod9").code, 0);
    });
    state.chassis = "";
    EXPECT_EQ(state.run([] {
        Session session("Mod1");
        EXPECT_EQ(session.systemList("Sys.Devices"),
                  (Names{"Bench", "Mod1", "Mod2", "Mod4", "Mod5"}));
        EXPECT_EQ(set(setText, session, "Mod1", "Dev.Comment", "x").code, 0);
    }),
              "");
    state.chassis = file.path;
    EXPECT_EQ(state.run([] {
        Session session("Mod9");
        EXPECT_EQ(readArea(session, "Mod9/user", 1), Bytes{1});
        EXPECT_EQ(getText(session, "Mod9", "Dev.Comment"), std::string(""));
    }),
              "");
}

TEST_F(StateTest, MissingFoldersAreCreated) {
    state.path += "/a/b";
    run([](Session& session) { EXPECT_EQ(execute(session, "Name").code, 0); });
    EXPECT_EQ(state.files().size(), 1u);
    state.path.resize(state.path.size() - 4);
}

TEST_F(StateTest, WithoutAFolderNothingIsWritten) {
    const std::string path = state.path;
    state.path = "";
    run([&](Session& session) {
        EXPECT_EQ(chdir(path.c_str()), 0);
        EXPECT_EQ(execute(session, "Name").code, 0);
        EXPECT_EQ(writeArea(session, "Größe/user", {1}).code, 0);
        EXPECT_EQ(commitNvmem(session, "Größe").code, 0);
    });
    state.path = path;
    EXPECT_TRUE(std::filesystem::is_empty(path));
}

TEST_F(StateTest, ARelativeFolderIsNotAffectedByChangingTheWorkingDirectory) {
    const std::string path = state.path;
    state.path = "kept";
    run([&](Session&) {});
    std::filesystem::remove_all("kept");
    EXPECT_EQ(chdir(path.c_str()), 0);
    run([&](Session& session) {
        EXPECT_EQ(chdir("/"), 0);
        EXPECT_EQ(execute(session, "Name").code, 0);
    });
    state.path = path + "/kept";
    EXPECT_EQ(state.files().size(), 1u);
    state.path = path;
}

}  // namespace
