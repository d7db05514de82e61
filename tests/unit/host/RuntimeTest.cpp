// The functions that the runtime library exports.

#include <gtest/gtest.h>

#include "host/Request.h"

namespace {

class Runtime : public testing::Test {
  protected:
    // The first `size` bytes of a buffer belong to the caller; "#" shows what is not written.
    int readVariable(const char* name, std::uint32_t available) {
        buffer.assign(300, '#');
        size = available;
        return ReadRequestVariable_C_REST_QI_QVWS_(&request, name, &buffer[0], &size);
    }

    int readBody(std::uint32_t available) {
        buffer.assign(300, '#');
        size = available;
        return ReadPostData_C_REST_QI_QVWS_(&request, &buffer[0], &size);
    }

    std::string start(std::size_t length) const { return buffer.substr(0, length); }

    ws_Request request;
    std::string buffer;
    std::uint32_t size = 0;
};

TEST_F(Runtime, ReadsAVariableAsTextWithItsNul) {
    request.transport = "http";
    request.method = "POST";
    EXPECT_EQ(readVariable("REQUEST_TRANSPORT", 32), 0);
    EXPECT_EQ(start(6), std::string("http\0#", 6));
    EXPECT_EQ(size, 32u);
    EXPECT_EQ(readVariable("REQUEST_METHOD", 32), 0);
    EXPECT_EQ(start(6), std::string("POST\0#", 6));
}

TEST_F(Runtime, FillsABufferOfExactlyTheVariablesSize) {
    request.method = "POST";
    EXPECT_EQ(readVariable("REQUEST_METHOD", 5), 0);
    EXPECT_EQ(start(6), std::string("POST\0#", 6));
}

TEST_F(Runtime, RequiresRoomForAVariableAndItsNul) {
    request.method = "POST";
    EXPECT_NE(readVariable("REQUEST_METHOD", 4), 0);
    EXPECT_EQ(size, 5u);
    EXPECT_EQ(start(1), "#");
    EXPECT_NE(readVariable("REQUEST_METHOD", 0), 0);
    EXPECT_EQ(size, 5u);
}

TEST_F(Runtime, KnowsNoOtherVariable) {
    for (const char* name : {"", "REQUEST_URI", "request_method", "REQUEST_METHOD "}) {
        EXPECT_NE(readVariable(name, 32), 0) << name;
        EXPECT_EQ(size, 0u) << name;
    }
}

TEST_F(Runtime, ReadsABodyWithANulAfterItWhereThereIsRoom) {
    request.body = "abc";
    EXPECT_EQ(readBody(256), 0);
    EXPECT_EQ(start(5), std::string("abc\0#", 5));
    EXPECT_EQ(size, 256u);
    EXPECT_EQ(readBody(4), 0);
    EXPECT_EQ(start(5), std::string("abc\0#", 5));
}

TEST_F(Runtime, FillsABufferOfExactlyTheBodysSizeWithoutANul) {
    request.body = std::string(256, 'b');
    EXPECT_EQ(readBody(256), 0);
    EXPECT_EQ(start(257), std::string(256, 'b') + "#");
    EXPECT_EQ(size, 256u);
}

TEST_F(Runtime, RequiresRoomForExactlyTheBody) {
    request.body = std::string(257, 'b');
    EXPECT_NE(readBody(256), 0);
    EXPECT_EQ(size, 257u);
    EXPECT_EQ(start(1), "#");
    EXPECT_EQ(readBody(257), 0);
    EXPECT_EQ(start(258), std::string(257, 'b') + "#");
}

TEST_F(Runtime, ReadsAnEmptyBodyAsEmptyText) {
    EXPECT_EQ(readBody(256), 0);
    EXPECT_EQ(start(2), std::string("\0#", 2));
    EXPECT_EQ(readBody(0), 0);
    EXPECT_EQ(start(1), "#");
    EXPECT_EQ(size, 0u);
}

TEST_F(Runtime, ReadsABodyWithNulsCompletely) {
    request.body = std::string("a\0b", 3);
    EXPECT_EQ(readBody(256), 0);
    EXPECT_EQ(start(5), std::string("a\0b\0#", 5));
}

TEST_F(Runtime, RespondsWith200AndPlainTextByDefault) {
    EXPECT_EQ(request.code, 200);
    EXPECT_EQ(request.type, "text/plain");
    EXPECT_EQ(request.output, "");
}

TEST_F(Runtime, KeepsTheLastCodeAndACopyOfTheLastType) {
    SetHTTPResponseCode_QI_QVWS_(&request, 400);
    SetHTTPResponseCode_QI_QVWS_(&request, 404);
    char type[] = "a/b";
    SetHTTPResponseMimeType_C_REST_QI_QVWS_(&request, type);
    type[0] = 'x';
    EXPECT_EQ(request.code, 404);
    EXPECT_EQ(request.type, "a/b");
}

TEST_F(Runtime, AppendsEachOutputByLength) {
    WriteOutput_C_REST_QI_QVWS_(&request, "abc", 2);
    WriteOutput_C_REST_QI_QVWS_(&request, nullptr, 0);
    WriteOutput_C_REST_QI_QVWS_(&request, "\0d", 2);
    EXPECT_EQ(request.output, std::string("ab\0d", 4));
    EXPECT_FALSE(request.incomplete);
}

}  // namespace
