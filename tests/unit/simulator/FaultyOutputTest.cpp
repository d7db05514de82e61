// The outputs of calls under faults.

#include "FaultsInForce.h"
#include "Values.h"

using namespace drivertest;

namespace {

std::string output(const std::string& members) {
    return oneFault("\"function\":\"get*\",\"output\":{" + members + "}");
}

template <typename Item>
struct Lent {
    std::int32_t code = 0;
    Item* array = nullptr;
    std::uint32_t count = 0;
};

template <typename Item>
Lent<Item> lend(ArrayGetter<Item> getter, Handle session, const char* property,
                const char* device = "Mod1") {
    Lent<Item> lent;
    Status status;
    getter(session, device, property, &lent.array, &lent.count, &status);
    lent.code = status.code;
    return lent;
}

class FaultyOutputTest : public BenchTest {
  protected:
    template <typename Item>
    void expectNull(ArrayGetter<Item> getter, const char* property, std::uint32_t count) {
        const Lent<Item> lent = lend(getter, session, property);
        EXPECT_EQ(lent.code, 0);
        EXPECT_EQ(lent.array, nullptr);
        EXPECT_EQ(lent.count, count);
    }
    void expectNullArrays(std::uint32_t count) {
        expectNull(getBools, "DMM.InputsInUse", count);
        expectNull(getDoubles, "DMM.Readings", count);
        expectNull(getInt32s, "DMM.Trims", count);
        expectNull(getInt64s, "DMM.Timestamps", count);
        expectNull(getUInt32s, "DMM.Histogram", count);
        expectNull(getUInt64s, "DMM.Totals", count);
        expectNull<char*>(nQITRMCAPI100_getGenericPropertyStringArray, "DMM.Labels", count);
    }
    Names labels() { return getTexts(session, "Mod1", "DMM.Labels").value; }
};

TEST_F(FaultyOutputTest, TextsBecomeNull) {
    const FaultsInForce faults(output("\"null\":true"));
    Status status;
    char* text = nullptr;
    nQITRMCAPI100_getGenericPropertyString(session, "Mod1", "Dev.ProductName", &text, &status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(text, nullptr);
}

TEST_F(FaultyOutputTest, ArraysOfAllTypesBecomeNull) {
    const FaultsInForce faults(output("\"null\":true"));
    expectNullArrays(0);
}

TEST_F(FaultyOutputTest, NullArraysMayHaveACount) {
    FaultsInForce faults(output("\"null\":true,\"count\":3"));
    expectNullArrays(3);
    faults.replace(output("\"null\":true,\"count\":4294967295"));
    expectNullArrays(4294967295u);
}

TEST_F(FaultyOutputTest, NumbersStayAsTheyAre) {
    const FaultsInForce faults(output("\"null\":true,\"count\":5"));
    EXPECT_EQ(get(getDouble, session, "Mod1", "DMM.Range"), 10.0);
    EXPECT_EQ(get(getUInt32, session, "Mod1/user", "NVMEMArea.Size"), 256u);
    std::uint8_t bytes[4] = {};
    Status status;
    nQITRMCAPI100_getNvmemBytes(session, "Mod1/calibration", 0, bytes, 4, &status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(bytes[3], 3);
}

TEST_F(FaultyOutputTest, TextsInArraysBecomeNull) {
    FaultsInForce faults(output("\"null_items\":true"));
    const auto lent =
        lend<char*>(nQITRMCAPI100_getGenericPropertyStringArray, session, "DMM.Labels");
    ASSERT_EQ(lent.count, 4u);
    EXPECT_EQ(std::vector<char*>(lent.array, lent.array + 4), std::vector<char*>(4, nullptr));
    nQITRMCAPI100_freeStringArray(lent.array, lent.count);
    EXPECT_EQ(getText(session, "Mod2", "Dev.ProductName"), std::string("Power supply"));
    EXPECT_EQ(getArray(getInt32s, session, "Mod1", "DMM.Trims"),
              (std::vector<std::int32_t>{0, -1, 2, -3}));
}

TEST_F(FaultyOutputTest, TextsBecomeLong) {
    FaultsInForce faults(output("\"text_size\":100000"));
    EXPECT_EQ(getText(session, "Mod1", "Dev.ProductName").value.size(), 100000u);
    EXPECT_EQ(labels(), Names(4, std::string(100000, 'x')));
    faults.replace(output("\"text_size\":0"));
    EXPECT_EQ(getText(session, "Mod1", "Dev.ProductName"), std::string());
    EXPECT_EQ(labels(), Names(4, ""));
}

TEST_F(FaultyOutputTest, ArraysOfAllTypesGetTheCountOfTheFault) {
    const FaultsInForce faults(output("\"count\":6"));
    EXPECT_EQ(getArray(getBools, session, "Mod1", "DMM.InputsInUse"),
              (std::vector<std::uint8_t>{1, 1, 0, 0, 1, 1}));
    EXPECT_EQ(getArray(getDoubles, session, "Mod1", "DMM.Readings"),
              (std::vector<double>{0.5, -0.25, 1.75, 0.5, -0.25, 1.75}));
    EXPECT_EQ(getArray(getInt32s, session, "Mod1", "DMM.Trims"),
              (std::vector<std::int32_t>{0, -1, 2, -3, 0, -1}));
    EXPECT_EQ(getArray(getInt64s, session, "Mod1", "DMM.Timestamps"),
              (std::vector<std::int64_t>{-1, 0, INT64_MAX, -1, 0, INT64_MAX}));
    EXPECT_EQ(getArray(getUInt32s, session, "Mod1", "DMM.Histogram"),
              (std::vector<std::uint32_t>{0, 1, UINT32_MAX, 0, 1, UINT32_MAX}));
    EXPECT_EQ(getArray(getUInt64s, session, "Mod1", "DMM.Totals"),
              (std::vector<std::uint64_t>{0, UINT64_MAX, 0, UINT64_MAX, 0, UINT64_MAX}));
    EXPECT_EQ(labels(), (Names{"A", "B", "C", "D", "A", "B"}));
    EXPECT_EQ(getTexts(session, "Mod5", "SW.Routes"), Names(6, ""));
}

TEST_F(FaultyOutputTest, ArraysBecomeShorterAndEmpty) {
    FaultsInForce faults(output("\"count\":1"));
    EXPECT_EQ(labels(), Names{"A"});
    EXPECT_EQ(getArray(getInt32s, session, "Mod1", "DMM.Trims"), std::vector<std::int32_t>{0});
    faults.replace(output("\"count\":0"));
    expectNullArrays(0);
}

TEST_F(FaultyOutputTest, ArraysOfManyLongTextsAreMade) {
    FaultsInForce faults(output("\"text_size\":1000,\"count\":1000"));
    EXPECT_EQ(labels(), Names(1000, std::string(1000, 'x')));
}

TEST_F(FaultyOutputTest, ManyElementsAreMade) {
    FaultsInForce faults(output("\"count\":16777216"));
    const auto lent = lend(getDoubles, session, "DMM.Readings");
    ASSERT_EQ(lent.count, 16777216u);
    EXPECT_EQ(lent.array[16777215], 0.5);
    nQITRMCAPI100_freeArray(lent.array);
}

TEST_F(FaultyOutputTest, MoreThanAGibibyteOfTextsIsOutOfMemory) {
    const FaultsInForce faults(output("\"text_size\":300000000"));
    const auto lent =
        lend<char*>(nQITRMCAPI100_getGenericPropertyStringArray, session, "DMM.Labels");
    EXPECT_EQ(lent.code, -250950);
    EXPECT_EQ(lent.array, nullptr);
    EXPECT_EQ(lent.count, 0u);
}

TEST_F(FaultyOutputTest, AWarningMayComeWithOddOutputs) {
    const FaultsInForce faults(oneFault("\"output\":{\"text_size\":3},\"status\":{\"code\":77}"));
    const auto name = getText(session, "Mod1", "Dev.ProductName");
    EXPECT_EQ(name.code, 77);
    EXPECT_EQ(name.value, "xxx");
}

}  // namespace
