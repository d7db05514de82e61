#include <sys/resource.h>

#include "support/ProcedureFixture.h"
#include "support/sanitizers.h"

namespace {

using Bytes = std::vector<std::uint64_t>;

class NvmemTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        openSession(R"("nvmem_areas":"Mod1/user")");
    }
};

// ---- Reading ------------------------------------------------------------------------------------

TEST_F(NvmemTest, ReadingReturnsTheBytesBeforeTheNextAddress) {
    give("getNvmemBytes", Bytes{0, 1, 127, 128, 255});
    EXPECT_EQ(ask("getNvmemBytes", R"("nvmem_area":"Mod1/user","address":100,"size":5)"),
              R"({"data":[0,1,127,128,255],"next_address":101})");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"getGenericPropertyStringArray(7, \"Mod1\", \"Dev.NVMEM.Areas\")",
                     "freeStringArray(1)", "getNvmemBytes(7, \"Mod1/user\", 100, 5)"}));
}

TEST_F(NvmemTest, ReadingSixteenBytesStepsTheAddressByOne) {
    EXPECT_EQ(ask("getNvmemBytes", R"("address":100,"size":16)"),
              R"({"data":[0,0,0,0,0,0,0,0,0,0,0,0,0,0,0,0],"next_address":101})");
    EXPECT_EQ(driver.takeCalls(), Calls{"getNvmemBytes(7, \"$DefaultNVMEMAreas\", 100, 16)"});
}

TEST_F(NvmemTest, ReadingNoBytesStillCallsTheDriver) {
    EXPECT_EQ(ask("getNvmemBytes", R"("address":3,"size":0)"), R"({"data":[],"next_address":4})");
    EXPECT_EQ(driver.takeCalls(), Calls{"getNvmemBytes(7, \"$DefaultNVMEMAreas\", 3, null, 0)"});
}

TEST_F(NvmemTest, TheNextAddressWrapsAround) {
    EXPECT_EQ(ask("getNvmemBytes", R"("address":4294967295,"size":1)"),
              R"({"data":[0],"next_address":0})");
    EXPECT_EQ(ask("setNvmemBytes", R"("address":4294967295,"data":[1])"), R"({"next_address":0})");
}

TEST_F(NvmemTest, ReadingFailsWithTheDriversError) {
    fail("getNvmemBytes", -250999, R"({"from":"driver"})");
    EXPECT_EQ(ask("getNvmemBytes", R"("address":0,"size":8)"), "-250999");
    EXPECT_EQ(statusText, R"({"from":"driver"})");
}

#if !defined(QITRMC_ADDRESS_SANITIZER) && !defined(QITRMC_THREAD_SANITIZER)
TEST_F(NvmemTest, ARequestForTooManyBytesUsesNoMemoryBeforeTheDriverRefusesIt) {
    fail("getNvmemBytes", -250999);
    rusage before{};
    getrusage(RUSAGE_SELF, &before);
    const std::string refused = ask("getNvmemBytes", R"("address":0,"size":4294967295)");
    rusage after{};
    getrusage(RUSAGE_SELF, &after);
    // A system with less address space refuses by itself.
    EXPECT_TRUE(refused == "-250999" || refused == "-250801") << refused;
    EXPECT_LT(after.ru_maxrss - before.ru_maxrss, 16 * 1024) << "KiB";
}
#endif

TEST_F(NvmemTest, SizesAboveTheRangeAreRefusedByTheSchema) {
    EXPECT_EQ(ask("getNvmemBytes", R"("address":0,"size":4294967296)"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params/size",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails","value":"The )"
              R"(number must be less than or equal to 4294967295","value_type":"string"}])");
}

// ---- Writing ------------------------------------------------------------------------------------

TEST_F(NvmemTest, WritingWithoutSerialNumberAndPasswordPassesTwoEmptyTexts) {
    EXPECT_EQ(ask("setNvmemBytes", R"("nvmem_area":"Mod1/user","address":100,"data":[0,255,7])"),
              R"({"next_address":101})");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"getGenericPropertyStringArray(7, \"Mod1\", \"Dev.NVMEM.Areas\")",
                     "freeStringArray(1)",
                     "setNvmemBytes(7, \"Mod1/user\", 100, [0,255,7], \"\", \"\")"}));
}

TEST_F(NvmemTest, WritingForwardsSerialNumberAndPassword) {
    EXPECT_EQ(
        ask("setNvmemBytes", R"("address":0,"data":[1],"serial_number":"0a1B","password":" p\"w")"),
        R"({"next_address":1})");
    EXPECT_EQ(driver.takeCalls(),
              Calls{"setNvmemBytes(7, \"$DefaultNVMEMAreas\", 0, [1], \"0a1B\", \" p\"w\")"});
}

TEST_F(NvmemTest, WritingNothingIsRefusedByTheSchema) {
    EXPECT_EQ(ask("setNvmemBytes", R"("address":0,"data":[])"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params/data",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"The parameter must not be empty array.","value_type":"string"}])");
}

TEST_F(NvmemTest, WritingWhatIsNotAByteIsRefusedByTheSchema) {
    for (const char* data : {"[256]", "[-1]", "[1.0]", "[\"1\"]"}) {
        EXPECT_EQ(ask("setNvmemBytes", R"("address":0,"data":)" + std::string(data)).substr(0, 6),
                  "-32602");
    }
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(NvmemTest, WritingFailsWithTheDriversError) {
    fail("setNvmemBytes", -250999);
    EXPECT_EQ(ask("setNvmemBytes", R"("address":0,"data":[1])"), "-250999");
}

TEST_F(NvmemTest, WritingDoesNotCommit) {
    EXPECT_EQ(ask("setNvmemBytes", R"("address":0,"data":[1])"), R"({"next_address":1})");
    EXPECT_EQ(driver.takeCalls().size(), 1u);
}

// ---- Commit -------------------------------------------------------------------------------------

TEST_F(NvmemTest, CommitUsesAreasOrDevicesOrTheDefaultResources) {
    EXPECT_EQ(ask("commitNvmemAreas", R"("nvmem_areas":["Mod1/user"])"), "{}");
    EXPECT_EQ(driver.calls().back(), "commitNvmemGeneric(7, \"Mod1/user\")");
    EXPECT_EQ(ask("commitNvmemAreas", R"("devices":"Mod1,Mod2")"), "{}");
    EXPECT_EQ(driver.calls().back(), "commitNvmemGeneric(7, \"Mod1,Mod2\")");
    EXPECT_EQ(ask("commitNvmemAreas"), "{}");
    EXPECT_EQ(driver.calls().back(), "commitNvmemGeneric(7, \"$DefaultNVMEMAreas\")");
}

TEST_F(NvmemTest, CommitFailsWithTheDriversError) {
    fail("commitNvmemGeneric", -250999);
    EXPECT_EQ(ask("commitNvmemAreas"), "-250999");
}

TEST_F(NvmemTest, CommitAcceptsAreasOrDevicesButNotBoth) {
    EXPECT_EQ(ask("commitNvmemAreas", R"("nvmem_areas":"Mod1/user","devices":"Mod1")"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"You must specify none or only one of the following parameters: devices, )"
              R"(nvmem_areas.","value_type":"string"}])");
}

}  // namespace
