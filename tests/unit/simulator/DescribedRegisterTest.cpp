#include <atomic>
#include <future>
#include <thread>

#include "Registers.h"

using namespace drivertest;

namespace {

// Restores the device to its state after power-on.
class DescribedRegisterTest : public testing::Test {
  protected:
    ~DescribedRegisterTest() override { EXPECT_EQ(resetDevices(session, "Unit"), 0); }

    std::uint64_t at(std::uint32_t address, std::uint32_t bits) {
        switch (bits) {
            case 8:
                return checked(read(read8, session, "Unit", address));
            case 16:
                return checked(read(read16, session, "Unit", address));
            case 32:
                return checked(read(read32, session, "Unit", address));
            default:
                return checked(read(read64, session, "Unit", address));
        }
    }
    Outcome put(std::uint32_t address, std::uint32_t value) {
        return tryWrite(write32, session, "Unit", address, value);
    }
    std::uint32_t runs() { return get(getUInt32, session, "Unit", "Runs").value; }

    Session session{"Unit"};

  private:
    template <typename Number>
    static std::uint64_t checked(const Answer<Number>& answer) {
        EXPECT_EQ(answer.code, 0) << answer.text;
        return answer.value;
    }
};

std::string aboutProperty(const char* name, const std::string& more = "") {
    return usage("PropertyName", "\"" + std::string(name) + "\"") + "," +
           usage("ResourceName", "\"Unit\"") + (more.empty() ? "" : ",") + more;
}

TEST_F(DescribedRegisterTest, BytesAreClearedAfterTheyAreRead) {
    EXPECT_EQ(at(2, 16), 0x0403u);
    EXPECT_EQ(at(0, 64), 0x0807060500000201u);
    EXPECT_EQ(at(0, 64), 0u);
    EXPECT_EQ(at(8, 8), 0x09u);
    EXPECT_EQ(at(8, 32), 0x0c0b0a00u);
    EXPECT_EQ(at(12, 32), 0x100f0e0du);
    EXPECT_EQ(write(write8, session, "Unit", 3, std::uint8_t{7}), 0);
    EXPECT_EQ(at(0, 32), 0x07000000u);
    EXPECT_EQ(at(0, 32), 0u);
}

TEST_F(DescribedRegisterTest, OneOfManyReadersGetsABitThatReadingClears) {
    EXPECT_EQ(at(0, 64), 0x0807060504030201u);
    constexpr std::uint32_t writes = 100;
    std::atomic<std::uint32_t> seen{0};
    std::atomic<bool> stopped{false};
    std::vector<std::thread> readers;
    for (int i = 0; i < 3; ++i) {
        readers.emplace_back([&] {
            while (!stopped) {
                seen += static_cast<std::uint32_t>(at(0, 8));
            }
        });
    }
    for (std::uint32_t i = 0; i < writes; ++i) {
        EXPECT_EQ(write(write8, session, "Unit", 0, std::uint8_t{1}), 0);
        while (seen <= i) {
            std::this_thread::yield();
        }
    }
    stopped = true;
    for (std::thread& reader : readers) {
        reader.join();
    }
    EXPECT_EQ(seen, writes);
}

TEST_F(DescribedRegisterTest, APartialWriteDoesNotStoreTheNoiseOfTheOtherBytes) {
    for (int i = 0; i < 20; ++i) {
        EXPECT_EQ(write(write32, session, "Unit", 640, std::uint32_t{0x100}), 0);
        EXPECT_EQ(write(write8, session, "Unit", 640, std::uint8_t{0x50}), 0);
        // The value read has noise with a standard deviation of 6, limited to six times that.
        EXPECT_NEAR(static_cast<double>(at(640, 32)), 0x150, 36.0);
    }
}

TEST_F(DescribedRegisterTest, WritingOnesClearsTheirBits) {
    EXPECT_EQ(write(write8, session, "Unit", 16, std::uint8_t{0x0f}), 0);
    EXPECT_EQ(write(write16, session, "Unit", 18, std::uint16_t{0x8001}), 0);
    EXPECT_EQ(at(16, 64), 0xffffffff7ffefff0u);
    EXPECT_EQ(write(write64, session, "Unit", 16, std::uint64_t{0}), 0);
    EXPECT_EQ(at(16, 64), 0xffffffff7ffefff0u);
    EXPECT_EQ(write(write64, session, "Unit", 16, ~std::uint64_t{0}), 0);
    EXPECT_EQ(at(16, 64), 0u);
    EXPECT_EQ(resetDevices(session, "Unit"), 0);
    EXPECT_EQ(at(16, 64), ~std::uint64_t{0});
}

TEST_F(DescribedRegisterTest, AWriteOnlyRegisterIsNotRead) {
    EXPECT_EQ(write(write64, session, "Unit", 24, std::uint64_t{1}), 0);
    const auto answer = read(read16, session, "Unit", 26);
    EXPECT_EQ(answer.code, -250935);
    EXPECT_EQ(answer.text, detailsOf("writeOnlyRegister", atRegister(26)));
    EXPECT_EQ(answer.value, 0u);
}

TEST_F(DescribedRegisterTest, OnlyTheWidthOfTheBlockIsAllowed) {
    EXPECT_EQ(at(32, 8), 0u);
    EXPECT_EQ(at(34, 16), 0u);
    EXPECT_EQ(at(36, 32), 0u);
    EXPECT_EQ(at(40, 64), 0u);
    const auto narrow = read(read32, session, "Unit", 40);
    EXPECT_EQ(narrow.code, -250978);
    EXPECT_EQ(narrow.text, detailsOf("unmappedRegister", where(40, 32)));
    EXPECT_EQ(read(read8, session, "Unit", 34).code, -250978);
    EXPECT_EQ(read(read16, session, "Unit", 36).code, -250978);
    EXPECT_EQ(write(write32, session, "Unit", 44, std::uint32_t{1}), -250978);
    EXPECT_EQ(write(write8, session, "Unit", 40, std::uint8_t{1}), -250978);
    EXPECT_EQ(at(40, 64), 0u);
}

TEST_F(DescribedRegisterTest, GapsBetweenBlocksAreNotMapped) {
    EXPECT_EQ(read(read8, session, "Unit", 33).code, -250978);
    EXPECT_EQ(read(read8, session, "Unit", 127).code, -250978);
    EXPECT_EQ(read(read8, session, "Unit", 520).code, -250978);
    // An access must be within one block.
    EXPECT_EQ(read(read64, session, "Unit", 136).code, -250978);
}

TEST_F(DescribedRegisterTest, ValuesAreStoredLowestByteFirst) {
    // Wide is 0x0102030405060708, and Count 0xffeeddcc.
    EXPECT_EQ(at(128, 64), 0x0102030405060708u);
    EXPECT_EQ(at(128, 32), 0x05060708u);
    EXPECT_EQ(at(134, 16), 0x0102u);
    EXPECT_EQ(at(129, 8), 0x07u);
    EXPECT_EQ(at(136, 32), 0xffeeddccu);
    EXPECT_EQ(at(138, 16), 0xffeeu);
}

TEST_F(DescribedRegisterTest, NegativeNumbersAreTwosComplement) {
    EXPECT_EQ(at(140, 32), 0xfffffffeu);
    EXPECT_EQ(at(144, 16), 0xfffeu);
    EXPECT_EQ(at(146, 8), 0xfeu);
    EXPECT_EQ(at(180, 16), 0xfffeu);
    EXPECT_EQ(at(184, 64), 0xfffffffffffffffeu);
}

TEST_F(DescribedRegisterTest, RealNumbersAreBinaryFloatingPoint) {
    EXPECT_EQ(at(152, 64), 0x3ff8000000000000u);
    EXPECT_EQ(at(160, 32), 0x3fc00000u);
    EXPECT_EQ(set(setDouble, session, "Unit", "Free", 1e300).code, 0);
    EXPECT_EQ(at(192, 32), 0x7f800000u);
    EXPECT_EQ(set(setDouble, session, "Unit", "Free", -1e300).code, 0);
    EXPECT_EQ(at(192, 32), 0xff800000u);
    EXPECT_EQ(set(setDouble, session, "Unit", "Free", -0.0).code, 0);
    EXPECT_EQ(at(200, 64), 0x8000000000000000u);
}

TEST_F(DescribedRegisterTest, BooleansAreOneOrZero) {
    EXPECT_EQ(at(147, 8), 1u);
    EXPECT_EQ(at(148, 32), 1u);
    EXPECT_EQ(write(write8, session, "Unit", 147, std::uint8_t{0}), 0);
    EXPECT_EQ(at(148, 32), 0u);
    EXPECT_EQ(put(148, 0x100).code, 0);
    EXPECT_EQ(get(getBool, session, "Unit", "Flag"), std::uint8_t{1});
    EXPECT_EQ(at(148, 32), 1u);
}

TEST_F(DescribedRegisterTest, WritingARegisterWritesItsProperty) {
    EXPECT_EQ(write(write64, session, "Unit", 152, std::uint64_t{0xc059000000000000}), 0);
    EXPECT_EQ(get(getDouble, session, "Unit", "Gain"), -100.0);
    EXPECT_EQ(put(160, 0x42c80000).code, 0);
    EXPECT_EQ(get(getDouble, session, "Unit", "Gain"), 100.0);
    EXPECT_EQ(put(140, 0x80000000).code, 0);
    EXPECT_EQ(get(getInt32, session, "Unit", "Signed"), -2147483647 - 1);
    EXPECT_EQ(write(write16, session, "Unit", 144, std::uint16_t{0x8000}), 0);
    EXPECT_EQ(get(getInt32, session, "Unit", "Signed"), -32768);
    EXPECT_EQ(write(write16, session, "Unit", 144, std::uint16_t{0x7fff}), 0);
    EXPECT_EQ(get(getInt32, session, "Unit", "Signed"), 32767);
    EXPECT_EQ(write(write8, session, "Unit", 146, std::uint8_t{0xff}), 0);
    EXPECT_EQ(get(getInt32, session, "Unit", "Signed"), -1);
    EXPECT_EQ(write(write16, session, "Unit", 180, std::uint16_t{0xff00}), 0);
    EXPECT_EQ(get(getInt64, session, "Unit", "Long"), std::int64_t{-256});
}

TEST_F(DescribedRegisterTest, WritingAPartOfAValueKeepsTheRest) {
    EXPECT_EQ(write(write8, session, "Unit", 129, std::uint8_t{0xff}), 0);
    EXPECT_EQ(get(getUInt64, session, "Unit", "Wide"), std::uint64_t{0x010203040506ff08});
    EXPECT_EQ(write(write16, session, "Unit", 134, std::uint16_t{0xabcd}), 0);
    EXPECT_EQ(get(getUInt64, session, "Unit", "Wide"), std::uint64_t{0xabcd03040506ff08});
}

TEST_F(DescribedRegisterTest, ARegisterShowsAPropertyOfAChannel) {
    EXPECT_EQ(write(write64, session, "Unit", 512, std::uint64_t{0x4014000000000000}), 0);
    EXPECT_EQ(getArray(getDoubles, session, "Unit/ch0:1", "Level"),
              (std::vector<double>{0.0, 5.0}));
    EXPECT_EQ(resetDevices(session, "Unit"), 0);
    EXPECT_EQ(at(512, 64), 0u);
}

TEST_F(DescribedRegisterTest, AWriteFollowsTheRulesOfTheProperty) {
    const Outcome range = put(160, 0x42c80001);
    EXPECT_EQ(range.code, -250971);
    EXPECT_EQ(range.text,
              detailsOf("valueOutOfRange",
                        aboutProperty("Gain", usage("RequestedValue", "\"100.00000762939453\"") +
                                                  "," + usage("MinimumValue", "\"-100\"") + "," +
                                                  usage("MaximumValue", "\"100\""))));
    EXPECT_EQ(put(160, 0x7fc00000).code, -250971);
    const Outcome item = put(164, 3);
    EXPECT_EQ(item.code, -250970);
    EXPECT_EQ(item.text,
              detailsOf("valueNotEnumerated",
                        aboutProperty("Phase",
                                      "{\"type\":\"usage\",\"usage\":\"kUsageTypeRequestedValue\","
                                      "\"value\":3,\"value_type\":{\"type\":\"enum\","
                                      "\"id\":4096}}," +
                                          usage("AllowedValues", "[\"Idle (0)\",\"Busy (7)\"]"))));
    EXPECT_EQ(put(164, 7).code, 0);
    const Outcome access = put(136, 0);
    EXPECT_EQ(access.code, -250968);
    EXPECT_EQ(access.text, detailsOf("readOnlyProperty", aboutProperty("Count")));
    EXPECT_EQ(get(getDouble, session, "Unit", "Gain"), 1.5);
}

TEST_F(DescribedRegisterTest, TheAccessOfTheBlockIsCheckedFirst) {
    EXPECT_EQ(put(176, 5).code, -250980);
    EXPECT_EQ(put(172, 5).code, 0);
    EXPECT_EQ(read(read32, session, "Unit", 172).code, -250935);
}

TEST_F(DescribedRegisterTest, APendingValueIsShownAfterItsCommit) {
    EXPECT_EQ(write(write8, session, "Unit", 168, std::uint8_t{0x11}), 0);
    EXPECT_EQ(write(write8, session, "Unit", 169, std::uint8_t{0x22}), 0);
    EXPECT_EQ(at(168, 32), 1u);
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, "Unit", &status);
    EXPECT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(at(168, 32), 0x2211u);
    EXPECT_EQ(at(176, 32), 0x2211u);
}

TEST_F(DescribedRegisterTest, WritingAPropertyNeedsWriteAccessToTheDevice) {
    Session other;
    EXPECT_EQ(write(write32, other, "Unit", 140, std::uint32_t{1}), -250811);
    EXPECT_EQ(write(write32, other, "Unit", 48, std::uint32_t{1}), -250811);
    EXPECT_EQ(read(read32, other, "Unit", 140), 0xfffffffeu);
    EXPECT_EQ(runs(), 0u);
}

TEST_F(DescribedRegisterTest, AWriteRunsACommand) {
    EXPECT_EQ(put(48, 0x01020304).code, 0);
    EXPECT_EQ(runs(), 1u);
    EXPECT_EQ(at(48, 32), 0x01020304u);
    EXPECT_EQ(write(write8, session, "Unit", 51, std::uint8_t{0}), 0);
    EXPECT_EQ(runs(), 2u);
    EXPECT_EQ(at(48, 32), 0x00020304u);
    EXPECT_EQ(runs(), 2u);
}

TEST_F(DescribedRegisterTest, AWriteDoesNotWaitForTheDurationOfItsCommand) {
    EXPECT_EQ(put(52, 1).code, 0);
    EXPECT_EQ(runs(), 1u);
}

TEST_F(DescribedRegisterTest, AFailureOfTheCommandFailsTheWrite) {
    const Outcome outcome = put(56, 1);
    EXPECT_EQ(outcome.code, -1);
    EXPECT_EQ(outcome.text,
              "{\"error_constant\":\"broken\",\"component\":\"qitrmcapi\",\"translator\":"
              "\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":[]}}");
    EXPECT_EQ(at(56, 32), 0u);
    EXPECT_EQ(runs(), 0u);
}

TEST_F(DescribedRegisterTest, AWarningOfTheCommandComesWithTheWrite) {
    EXPECT_EQ(put(60, 1).code, 5);
    EXPECT_EQ(at(60, 32), 1u);
    EXPECT_EQ(runs(), 1u);
}

TEST_F(DescribedRegisterTest, SideEffectsAddUp) {
    EXPECT_EQ(put(64, 0x0f).code, 0);
    EXPECT_EQ(runs(), 1u);
    EXPECT_EQ(at(64, 32), 0xfffffff0u);
    EXPECT_EQ(at(64, 32), 0u);
    EXPECT_EQ(runs(), 1u);
}

TEST_F(DescribedRegisterTest, ABusyDeviceRunsNoOtherCommand) {
    auto slow = std::async(std::launch::async,
                           [&] { return execute(session, "Unit", "Slow", 86400.0).code; });
    Outcome outcome{0, ""};
    while (outcome.code == 0) {
        outcome = put(48, 1);
        std::this_thread::yield();
    }
    EXPECT_EQ(outcome.code, -250977);
    EXPECT_EQ(outcome.text, detailsOf("resourceBusy", usage("ResourceName", "\"Unit\"")));
    session.abort();
    EXPECT_EQ(slow.get(), -250963);
}

}  // namespace
