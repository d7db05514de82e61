#include "Starvation.h"
#include "StateFolder.h"

using namespace drivertest;

namespace {

constexpr const char* description = R"({"devices": [
    {"name": "A", "category": 2,
     "properties": {"P": {"type": "Int32", "access": "ReadWrite", "lasting": true,
                          "needs_commit": true, "value": 0}},
     "commands": {"Note": {"sets": {"Dev.Comment": "a text that is longer than a short one"}}},
     "nvmem_areas": [{"name": "user", "size": 64}]}
]})";

class StateMemoryTest : public testing::Test {
  protected:
    StateMemoryTest() { state.chassis = file.path; }

    // Expects that a call that runs out of memory leaves the files unchanged, and that one that
    // succeeds writes one.
    void starveWriting(const std::function<void(Session&, qierr_Status*)>& call) const {
        state.run([&] {
            Session session("A");
            EXPECT_GT(starve(0,
                             [&](qierr_Status* status) {
                                 const long rest = allowed.exchange(-1);
                                 const auto before = state.files();
                                 allowed = rest;
                                 call(session, status);
                                 allowed = -1;
                                 EXPECT_EQ(state.files() == before, status->code != 0);
                             }),
                      0);
        });
    }

    const ChassisFile file{description};
    StateFolder state;
};

TEST_F(StateMemoryTest, Starting) {
    state.run([] {
        Session session("A");
        EXPECT_EQ(renameDevice(session, "A", "a name that is longer than usual").code, 0);
        EXPECT_EQ(set(setText, session, "$DefaultDevices", "Dev.Comment", "x").code, 0);
    });
    state.run([] {
        EXPECT_GT(starve(0,
                         [](qierr_Status* status) {
                             Handle handle = 0;
                             nQITRMCAPI100_initializeSessionWithoutResources(&handle, status);
                         }),
                  0);
        Session session("A NAME THAT IS LONGER THAN USUAL");
        EXPECT_EQ(getText(session, "$DefaultDevices", "Dev.Comment"), std::string("x"));
    });
}

TEST_F(StateMemoryTest, CommittingNvmem) {
    starveWriting([](Session& session, qierr_Status* status) {
        const long rest = allowed.exchange(-1);
        EXPECT_EQ(writeArea(session, "A/user", {1}).code, 0);
        allowed = rest;
        nQITRMCAPI100_commitNvmemGeneric(session, "A", status);
        allowed = -1;
        EXPECT_EQ(get(getBool, session, "A/user", "NVMEMArea.PendingChanges"),
                  std::uint8_t{status->code != 0});
    });
}

TEST_F(StateMemoryTest, CommittingProperties) {
    starveWriting([](Session& session, qierr_Status* status) {
        const long rest = allowed.exchange(-1);
        EXPECT_EQ(set(setInt32, session, "A", "P", 5).code, 0);
        allowed = rest;
        nQITRMCAPI100_commitPropertiesGeneric(session, "A", status);
        allowed = -1;
        EXPECT_EQ(get(getInt32, session, "A", "P"), status->code == 0 ? 5 : 0);
    });
}

TEST_F(StateMemoryTest, WritingAPersistentProperty) {
    starveWriting([](Session& session, qierr_Status* status) {
        nQITRMCAPI100_setGenericPropertyString(session, "A", "Dev.Comment",
                                               "a text that is longer than a short one", status);
        allowed = -1;
        EXPECT_EQ(getText(session, "A", "Dev.Comment").value.empty(), status->code != 0);
    });
}

TEST_F(StateMemoryTest, ACommandThatChangesAPersistentProperty) {
    starveWriting([](Session& session, qierr_Status* status) {
        nQITRMCAPI100_executeGenericCommand(session, "A", "Note", 1.0, status);
        allowed = -1;
        EXPECT_EQ(getText(session, "A", "Dev.Comment").value.empty(), status->code != 0);
    });
}

TEST_F(StateMemoryTest, Renaming) {
    starveWriting([](Session& session, qierr_Status* status) {
        nQITRMCAPI100_renameDevice(session, "A", "a name that is longer than usual", status);
        allowed = -1;
        EXPECT_EQ(session.systemList("Sys.Devices").front() == "A", status->code != 0);
    });
}

}  // namespace
