#include "qisysq/stdpath_util.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstring>
#include <string>

#include "contains.h"
#include "support/FaultyAllocator.h"
#include "support/TestRoot.h"

namespace {

// While it exists, the C library has this text for every error.
class ErrnoText {
  public:
    explicit ErrnoText(const char* text) {
        replaced = true;
        replacement = text;
    }
    ErrnoText(const ErrnoText&) = delete;
    ErrnoText& operator=(const ErrnoText&) = delete;
    ~ErrnoText() { replaced = false; }

    static inline bool replaced = false;
    static inline const char* replacement = nullptr;
};

class ReadFileToBufferTest : public testing::Test {
  protected:
    void read(const std::string& path) {
        qisysq::readFileToBuffer(root.locate(path).c_str(), &buffer, &status);
    }

    TestRoot root;
    qihtl::String buffer;
    qierr::Status status;
};

TEST_F(ReadFileToBufferTest, ReturnsTheWholeFileAndANul) {
    const std::string content("a\0b\n", 4);
    root.write("/file", content);
    read("/file");
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(std::string(buffer.c_str(), buffer.length()), content);
    EXPECT_EQ(buffer.c_str()[4], '\0');
}

TEST_F(ReadFileToBufferTest, ReplacesTheContentOfTheBuffer) {
    root.write("/file", "new");
    buffer.assign("what was there before", &status);
    read("/file");
    EXPECT_STREQ(buffer.c_str(), "new");
}

TEST_F(ReadFileToBufferTest, AMissingFileIsReportedWithTheErrno) {
    read("/missing");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(contains(status, "\"error_constant\":\"qiapalerr_resourceNotFound\""));
    EXPECT_TRUE(contains(
        status, "\"internal_error\":{\"api\":\"errno\",\"code\":" + std::to_string(ENOENT) +
                    ",\"string\":\"" + std::strerror(ENOENT) +
                    "\"},\"qisysq_debug\":{\"desc\":\"error opening file\","
                    "\"filename\":\"" +
                    root.locate("/missing") + "\"}"))
        << status.json;
}

TEST_F(ReadFileToBufferTest, AnErrnoWithoutATextIsReportedWithoutText) {
    for (const char* text : {"", static_cast<const char*>(nullptr)}) {
        qierr::Status failure;
        {
            const ErrnoText replaced(text);
            qisysq::readFileToBuffer(root.locate("/missing").c_str(), &buffer, &failure);
        }
        EXPECT_EQ(failure.code, -52006);
        EXPECT_TRUE(contains(failure, "\"internal_error\":{\"api\":\"errno\",\"code\":" +
                                          std::to_string(ENOENT) + "},\"qisysq_debug\":{"))
            << failure.json;
    }
}

TEST_F(ReadFileToBufferTest, AFileThatCannotBeReadToItsEndIsReported) {
    root.makeDirectory("/folder");
    read("/folder");
    EXPECT_EQ(status.code, -52008);
    EXPECT_TRUE(contains(status, "\"error_constant\":\"qiapalerr_osFault\""));
    EXPECT_TRUE(contains(status, "\"internal_error\":{\"api\":\"errno\",\"code\":"));
    EXPECT_TRUE(contains(status,
                         "\"qisysq_debug\":{\"desc\":\"didn't read full content of file\","
                         "\"fileSize\":"))
        << status.json;
    EXPECT_TRUE(
        contains(status, ",\"fread_return\":0,\"filename\":\"" + root.locate("/folder") + "\"}"));
}

TEST_F(ReadFileToBufferTest, LackOfMemoryIsReported) {
    root.write("/file", "content");
    FaultyAllocator::failAt(0);
    read("/file");
    FaultyAllocator::succeed();
    EXPECT_EQ(status.code, -52000);
}

TEST_F(ReadFileToBufferTest, NothingIsDoneWhenTheStatusIsNegative) {
    status.code = -1;
    read("/missing");
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(status.json, nullptr);
}

}  // namespace

extern "C" {
char* __real_strerror_r(int error, char* buffer, std::size_t size);

char* __wrap_strerror_r(int error, char* buffer, std::size_t size) {
    return ErrnoText::replaced ? const_cast<char*>(ErrnoText::replacement)
                               : __real_strerror_r(error, buffer, size);
}
}
