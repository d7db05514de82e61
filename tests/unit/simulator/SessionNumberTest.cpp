// Numbers of sessions, which go on where the last start ended when there is a state folder.

#include <sys/resource.h>

#include <csignal>

#include "StateFolder.h"

using namespace drivertest;

namespace {

std::string oneDevice(const std::string& members = "") {
    return "{" + members + "\"devices\": [{\"name\": \"A\", \"category\": 2}]}";
}

class SessionNumberTest : public testing::Test {
  protected:
    SessionNumberTest() { state.chassis = file.path; }

    // Starts on the folder and opens one session.
    void expectNumber(Handle number) const {
        EXPECT_EQ(state.run([&] { EXPECT_EQ(Session().handle, number); }), "");
    }
    std::string content() const { return contentOf(state.file("sessions")); }

    const ChassisFile file{oneDevice()};
    StateFolder state;
};

TEST_F(SessionNumberTest, AnOldNumberIsNobodyElsesAfterARestart) {
    EXPECT_EQ(state.run([] {
        EXPECT_EQ(Session("A").handle, 1u);
        EXPECT_EQ(Session("A").handle, 2u);
    }),
              "");
    EXPECT_EQ(state.run([] {
        const Session session("A");
        EXPECT_EQ(session.handle, 101u);
        Status status;
        nQITRMCAPI100_closeSession(1, &status);
        EXPECT_EQ(status.code, -250955);
    }),
              "");
    expectNumber(201);
}

TEST_F(SessionNumberTest, AKilledProcessLeavesItsNumbersUsed) {
    const pid_t child = state.start([] {
        const Session session("A");
        EXPECT_EQ(session.handle, 1u);
        kill(getpid(), SIGKILL);
    });
    int result = 0;
    EXPECT_EQ(waitpid(child, &result, 0), child);
    EXPECT_TRUE(WIFSIGNALED(result));
    expectNumber(101);
}

TEST_F(SessionNumberTest, TheFileIsWrittenOnceForAHundredSessions) {
    EXPECT_EQ(state.run([&] {
        EXPECT_EQ(Session().handle, 1u);
        const std::string first = content();
        EXPECT_EQ(std::filesystem::remove(state.file("sessions")), true);
        for (Handle number = 2; number <= 100; ++number) {
            EXPECT_EQ(Session().handle, number);
        }
        EXPECT_FALSE(std::filesystem::exists(state.file("sessions")));
        EXPECT_EQ(Session().handle, 101u);
        EXPECT_NE(content(), first);
    }),
              "");
    expectNumber(201);
}

TEST_F(SessionNumberTest, AStartWithoutSessionsUsesNoNumbers) {
    EXPECT_EQ(state.run([] {
        Status status;
        nQITRMCAPI100_closeSession(1, &status);
        EXPECT_EQ(status.code, -250955);
    }),
              "");
    EXPECT_FALSE(std::filesystem::exists(state.file("sessions")));
    expectNumber(1);
}

TEST_F(SessionNumberTest, NumbersGoRoundAtTheirEnd) {
    const std::map<std::string, std::array<Handle, 3>> numbers{
        // The first two of a start, and the first of the next.
        {"2147483647", {2147483647u, 2147483648u, 2147483747u}},
        {"4294967195", {4294967195u, 4294967196u, 4294967295u}},
        {"4294967196", {4294967196u, 4294967197u, 1u}},
        {"4294967295", {4294967295u, 1u, 99u}}};
    for (const auto& [first, expected] : numbers) {
        StateFolder own;
        const ChassisFile description(oneDevice("\"first_session_handle\": " + first + ","));
        own.chassis = description.path;
        EXPECT_EQ(own.run([&, wanted = expected] {
            EXPECT_EQ(Session().handle, wanted[0]);
            EXPECT_EQ(Session().handle, wanted[1]);
        }),
                  "");
        EXPECT_EQ(own.run([&, wanted = expected] { EXPECT_EQ(Session().handle, wanted[2]); }), "");
    }
}

TEST_F(SessionNumberTest, AFolderWithoutTheFileBeginsAsTheChassisFileSays) {
    EXPECT_EQ(state.run([] {
        const Session session("A");
        EXPECT_EQ(renameDevice(session, "A", "B").code, 0);
    }),
              "");
    EXPECT_TRUE(std::filesystem::remove(state.file("sessions")));
    EXPECT_EQ(state.run([] { EXPECT_EQ(Session("B").handle, 1u); }), "");
}

TEST_F(SessionNumberTest, ADamagedFileIsRefused) {
    expectNumber(1);
    const std::string whole = content();
    const std::string remedy =
        "; put a copy of the file back, or remove it to lose the values in it\n";
    const auto expectRefused = [&](const std::string& text, const std::string& wrong) {
        state.put("sessions", text);
        EXPECT_EQ(state.run([] { EXPECT_EQ(openSession().code, -250930); }),
                  "qitrmcapi: " + state.file("sessions") + ": " + wrong + remedy);
    };
    expectRefused("", "is no state file of this version");
    std::string changed = whole;
    changed[changed.size() - 9] = '\x7f';
    expectRefused(changed, "does not match its checksum");
    expectRefused(whole.substr(0, whole.size() - 1), "has " + std::to_string(whole.size() - 1) +
                                                         " bytes, but says that it has " +
                                                         std::to_string(whole.size()));
    state.put("sessions", whole);
    expectNumber(101);
}

TEST_F(SessionNumberTest, NoSessionOpensUnderANumberThatCannotBeKept) {
    expectNumber(1);
    const std::string before = content();
    EXPECT_EQ(state.run([&] {
        signal(SIGXFSZ, SIG_IGN);
        rlimit limit = {};
        EXPECT_EQ(getrlimit(RLIMIT_FSIZE, &limit), 0);
        const rlim_t room = limit.rlim_cur;
        limit.rlim_cur = 10;
        EXPECT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
        Status status;
        Handle handle = 5;
        nQITRMCAPI100_initializeSessionWithDevices(&handle, "A", 1.0, 3, "", 0.0, &status);
        EXPECT_EQ(status.code, -250931);
        EXPECT_EQ(status.text(), detailsOf("stateNotWritten",
                                           usage("FileName", "\"" + state.file("sessions") + "\"") +
                                               "," + usage("Details", "\"File too large\"")));
        EXPECT_EQ(handle, 0u);
        EXPECT_EQ(content(), before);
        limit.rlim_cur = room;
        EXPECT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
        EXPECT_EQ(Session("A").handle, 101u);
    }),
              "");
}

TEST_F(SessionNumberTest, NothingIsKeptWithoutAFolder) {
    const std::string folder = state.path;
    state.path.clear();
    expectNumber(1);
    expectNumber(1);
    state.path = folder;
    EXPECT_FALSE(std::filesystem::exists(state.file("sessions")));
}

}  // namespace
