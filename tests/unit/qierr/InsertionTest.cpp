#include <random>

#include "Records.h"
#include "jsonz/jsonz.h"

using qierr_test::expectBuffer;
using qierr_test::textOf;

namespace {

// The text after inserting the member "n":1, or the element 1, at `offset`.
std::string inserted(const char* text, std::size_t offset, const char* key) {
    qierr::Status status;
    qierr_Status_setJson(&status, text);
    const qierr_Writer writer{status.json + offset, qierr_Status_growJson, &status};
    EXPECT_NE(qierr_Writer_addInt(writer, key, 1).pos, nullptr);
    return textOf(status);
}

}  // namespace

TEST(Insertion, EmptyContainerNeedsNoComma) {
    EXPECT_EQ(inserted("{}", 0, "n"), "{\"n\":1}");
    EXPECT_EQ(inserted("{}", 1, "n"), "{\"n\":1}");
    EXPECT_EQ(inserted("[]", 0, nullptr), "[1]");
    EXPECT_EQ(inserted("[]", 1, nullptr), "[1]");
}

TEST(Insertion, BlanksBetweenTheBracketsDoNotCount) {
    EXPECT_EQ(inserted("{ \n}", 0, "n"), "{\"n\":1 \n}");
    EXPECT_EQ(inserted("{\t\r}", 3, "n"), "{\t\r\"n\":1}");
    EXPECT_EQ(inserted("[ ]", 0, nullptr), "[1 ]");
    EXPECT_EQ(inserted("[ ]", 2, nullptr), "[ 1]");
}

TEST(Insertion, CommaFollowsAtTheStart) {
    EXPECT_EQ(inserted("{\"a\":2}", 0, "n"), "{\"n\":1,\"a\":2}");
    EXPECT_EQ(inserted("[ 2]", 0, nullptr), "[1, 2]");
    EXPECT_EQ(inserted("[[]]", 0, nullptr), "[1,[]]");
}

TEST(Insertion, CommaPrecedesAtTheEnd) {
    EXPECT_EQ(inserted("{\"a\":2}", 6, "n"), "{\"a\":2,\"n\":1}");
    EXPECT_EQ(inserted("[2 ]", 3, nullptr), "[2 ,1]");
    EXPECT_EQ(inserted("[[]]", 3, nullptr), "[[],1]");
    EXPECT_EQ(inserted("{\"a\":[]}", 7, "n"), "{\"a\":[],\"n\":1}");
    EXPECT_EQ(inserted("{\"a\":\"{\"}", 8, "n"), "{\"a\":\"{\",\"n\":1}");
}

TEST(Insertion, ContinuesAfterAMemberInsertedAtTheStart) {
    qierr::Status status;
    qierr_Status_setJson(&status, "{\"z\":0}");
    qierr_Writer writer{status.json, qierr_Status_growJson, &status};
    writer = qierr_Writer_addInt(writer, "a", 1);
    writer = qierr_Writer_beginObject(writer, "b");
    writer = qierr_Writer_addInt(writer, "x", 2);
    writer = qierr_Writer_endObject(writer);
    writer = qierr_Writer_addInt(writer, "c", 3);
    expectBuffer(status, 512, "{\"a\":1,\"b\":{\"x\":2},\"c\":3,\"z\":0}");
}

TEST(Insertion, RandomEditsGiveTheSameTextAsAppendingToAString) {
    std::mt19937 random(77);
    for (int round = 0; round < 300; ++round) {
        qierr::Status status;
        qierr_Writer writer = qierr_Status_writerAtEnd(&status);
        std::string model = "{";
        std::string closers = "}";
        bool first = true;
        for (unsigned step = random() % 60; step > 0; --step) {
            const bool inArray = closers.back() == ']';
            const char* key = inArray ? nullptr : "k";
            const std::string lead = std::string(first ? "" : ",") + (inArray ? "" : "\"k\":");
            const unsigned choice = random() % 6;
            if (choice == 0) {
                writer = qierr_Writer_beginObject(writer, key);
                model += lead + "{";
                closers += '}';
                first = true;
            } else if (choice == 1) {
                writer = qierr_Writer_beginArray(writer, key);
                model += lead + "[";
                closers += ']';
                first = true;
            } else if (choice == 2 && closers.size() > 1) {
                writer = inArray ? qierr_Writer_endArray(writer) : qierr_Writer_endObject(writer);
                model += closers.back();
                closers.pop_back();
                first = false;
            } else {
                const std::string value(random() % 40, "v\n\x05"[random() % 3]);
                writer = qierr_Writer_addString(writer, key, value.c_str());
                model += lead + '"';
                for (char c : value) {
                    model += c == '\n' ? "\\n" : c == '\x05' ? "\\u0005" : "v";
                }
                model += '"';
                first = false;
            }
        }
        ASSERT_NE(writer.pos, nullptr);
        EXPECT_EQ(static_cast<std::size_t>(writer.pos - status.json), model.size());
        model.append(closers.rbegin(), closers.rend());
        expectBuffer(status, status.capacity, model);
        EXPECT_EQ(jsonz_readValue(status.json, nullptr), status.json + model.size());
    }
}
