#include "Records.h"

using qierr_test::expectBuffer;
using qierr_test::MeteredStatus;
using qierr_test::textOf;

namespace {

// A status with the given text, and a writer at its end.
struct Edited {
    explicit Edited(const char* text = nullptr) {
        qierr_Status_setJson(&status, text);
        writer = qierr_Status_writerAtEnd(&status);
    }

    long offset() const { return writer.pos != nullptr ? writer.pos - status.json : -1; }

    qierr::Status status;
    qierr_Writer writer;
};

std::string written(const char* key, const char* value) {
    Edited edited;
    qierr_Writer_addString(edited.writer, key, value);
    return textOf(edited.status);
}

}  // namespace

TEST(Writer, WritesMembersOfEachKind) {
    Edited e;
    e.writer = qierr_Writer_addString(e.writer, "s", "text");
    e.writer = qierr_Writer_addInt(e.writer, "i", -2147483647 - 1);
    e.writer = qierr_Writer_addUInt(e.writer, "u", 4294967295u);
    e.writer = qierr_Writer_beginObject(e.writer, "o");
    e.writer = qierr_Writer_addInt(e.writer, "x", 0);
    e.writer = qierr_Writer_endObject(e.writer);
    e.writer = qierr_Writer_beginArray(e.writer, "a");
    e.writer = qierr_Writer_addString(e.writer, nullptr, "");
    e.writer = qierr_Writer_addUInt(e.writer, nullptr, 7);
    e.writer = qierr_Writer_beginObject(e.writer, nullptr);
    e.writer = qierr_Writer_endObject(e.writer);
    e.writer = qierr_Writer_beginArray(e.writer, nullptr);
    e.writer = qierr_Writer_endArray(e.writer);
    e.writer = qierr_Writer_endArray(e.writer);
    e.writer = qierr_Writer_addInt(e.writer, "z", 1);
    const std::string expected =
        "{\"s\":\"text\",\"i\":-2147483648,\"u\":4294967295,\"o\":{\"x\":0},"
        "\"a\":[\"\",7,{},[]],\"z\":1}";
    expectBuffer(e.status, 512, expected);
    EXPECT_EQ(e.offset(), static_cast<long>(expected.size()) - 1);
}

TEST(Writer, ContinuesInsideTheContainerItBegins) {
    Edited e;
    e.writer = qierr_Writer_beginObject(e.writer, "k");
    EXPECT_EQ(textOf(e.status), "{\"k\":{}}");
    EXPECT_EQ(e.offset(), 6);
    e.writer = qierr_Writer_endObject(e.writer);
    EXPECT_EQ(e.offset(), 7);
}

TEST(Writer, EscapesValuesAndKeys) {
    EXPECT_EQ(written("k", "\b\t\n\f\r\"\\"), R"({"k":"\b\t\n\f\r\"\\"})");
    EXPECT_EQ(written("k", "\x01\x1f\x7f\x80\xc3\xff/'"),
              "{\"k\":\"\\u0001\\u001f\\u007f\x80\xc3\xff/'\"}");
    EXPECT_EQ(written("a\"\n\x02", "v"), R"({"a\"\n\u0002":"v"})");
    EXPECT_EQ(written("", ""), R"({"":""})");
}

TEST(Writer, WritesAnAbsentValueAsEmpty) {
    EXPECT_EQ(written("k", nullptr), R"({"k":""})");
}

TEST(Writer, DoesNothingOnceItsPositionIsNull) {
    Edited e;
    qierr_Writer lost{nullptr, qierr_Status_growJson, &e.status};
    EXPECT_EQ(qierr_Writer_addString(lost, "k", "v").pos, nullptr);
    EXPECT_EQ(qierr_Writer_addInt(lost, "k", 1).pos, nullptr);
    EXPECT_EQ(qierr_Writer_addUInt(lost, "k", 1).pos, nullptr);
    EXPECT_EQ(qierr_Writer_beginObject(lost, "k").pos, nullptr);
    EXPECT_EQ(qierr_Writer_endObject(lost).pos, nullptr);
    EXPECT_EQ(qierr_Writer_beginArray(lost, "k").pos, nullptr);
    EXPECT_EQ(qierr_Writer_endArray(lost).pos, nullptr);
    expectBuffer(e.status, 512, "{}");
}

TEST(Writer, FailsOnTheWrongBracket) {
    Edited e;
    EXPECT_EQ(qierr_Writer_endArray(e.writer).pos, nullptr);
    const qierr_Writer outside = qierr_Writer_endObject(e.writer);
    ASSERT_NE(outside.pos, nullptr);
    EXPECT_EQ(qierr_Writer_endObject(outside).pos, nullptr);
    EXPECT_EQ(qierr_Writer_addInt(outside, "k", 1).pos, nullptr);
    EXPECT_EQ(textOf(e.status), "{}");
}

TEST(Writer, CopiesItsFields) {
    Edited e;
    e.writer = qierr_Writer_addInt(e.writer, "k", 1);
    EXPECT_EQ(e.writer.grow, qierr_Status_growJson);
    EXPECT_EQ(e.writer.context, &e.status);
}

TEST(WriterGrowth, FillsTheBufferToTheLastByteBeforeGrowing) {
    // Next to a member, the text has 512 - 9 bytes left before the NUL and the marker are reached;
    // a comma, two quotes and four bytes of overhead for key and value are taken from these.
    Edited e("{\"a\":1}");
    const std::string fits(503 - 7, 'v');
    e.writer = qierr_Writer_addString(e.writer, "k", fits.c_str());
    expectBuffer(e.status, 512, "{\"a\":1,\"k\":\"" + fits + "\"}");
    EXPECT_EQ(e.offset(), 509);

    e.writer = qierr_Writer_addInt(e.writer, "n", 2);
    expectBuffer(e.status, 1024, "{\"a\":1,\"k\":\"" + fits + "\",\"n\":2}");
    EXPECT_EQ(e.offset(), 515);
}

TEST(WriterGrowth, ReservesRoomForACommaEvenWhenItNeedsNone) {
    // An empty object leaves 508 zero bytes. A member of 507 bytes and an unneeded comma fill them;
    // one byte more makes the buffer grow.
    Edited fits;
    const std::string value(507 - 6, 'v');
    qierr_Writer_addString(fits.writer, "k", value.c_str());
    expectBuffer(fits.status, 512, "{\"k\":\"" + value + "\"}");

    Edited grows;
    qierr_Writer_addString(grows.writer, "k", (value + "v").c_str());
    expectBuffer(grows.status, 1024, "{\"k\":\"" + value + "v\"}");
}

TEST(WriterGrowth, GrowsAsOftenAsAMemberNeeds) {
    Edited e;
    const std::string value(100000, '\x01');
    e.writer = qierr_Writer_addString(e.writer, "k", value.c_str());
    std::string escaped;
    for (std::size_t i = 0; i < value.size(); ++i) {
        escaped += "\\u0001";
    }
    expectBuffer(e.status, 1048576, "{\"k\":\"" + escaped + "\"}");
    ASSERT_NE(e.writer.pos, nullptr);
    EXPECT_STREQ(e.writer.pos, "}");
}

TEST(WriterGrowth, ContinuesAtTheSameOffsetInTheNewBuffer) {
    Edited e("{\"list\":[],\"rest\":true}");
    e.writer.pos = e.status.json + 9;
    std::string elements;
    for (int i = 0; i < 1000; ++i) {
        e.writer = qierr_Writer_addInt(e.writer, nullptr, i);
        elements += (i == 0 ? "" : ",") + std::to_string(i);
    }
    expectBuffer(e.status, 4096, "{\"list\":[" + elements + "],\"rest\":true}");
}

TEST(WriterGrowth, FailureStopsWritingAndKeepsWhatWasWritten) {
    MeteredStatus status(1);
    status.code = -5;
    qierr_Writer writer = qierr_Status_writerAtEnd(&status);
    writer = qierr_Writer_addInt(writer, "a", 1);
    writer = qierr_Writer_addString(writer, "b", std::string(600, 'x').c_str());
    EXPECT_EQ(writer.pos, nullptr);
    writer = qierr_Writer_addInt(writer, "c", 1);
    EXPECT_EQ(writer.pos, nullptr);
    EXPECT_EQ(status.code, -5);
    expectBuffer(status, 512, "{\"a\":1}");
}
