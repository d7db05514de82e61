#include <gtest/gtest.h>
#include <sys/mman.h>
#include <ws_runtime.h>

#include <cstdint>
#include <utility>
#include <vector>

#include "qitrmcwebsvc/httpRequest.h"

using nQITRMCWEBSVC100::writeOutput;

// A runtime that notes where each piece of the response is, without looking at it.
struct ws_Request {
    std::vector<std::pair<const void*, std::uint32_t>> pieces;
};

extern "C" {

void WriteOutput_C_REST_QI_QVWS_(ws_Request* request, const char* data, std::uint32_t length) {
    request->pieces.emplace_back(data, length);
}

int ReadRequestVariable_C_REST_QI_QVWS_(ws_Request*, const char*, char*, std::uint32_t*) {
    return 1;
}

int ReadPostData_C_REST_QI_QVWS_(ws_Request*, char*, std::uint32_t*) {
    return 1;
}

}  // extern "C"

namespace {

using Pieces = std::vector<std::pair<const void*, std::uint32_t>>;

TEST(HttpOutput, AResponseOf4GiBAndMoreIsNotCut) {
    if (sizeof(std::size_t) < 8) {
        GTEST_SKIP() << "sizes have 32 bits here";
    }
    std::size_t size = UINT32_MAX;
    size += 6;
    // Addresses without memory behind them.
    void* const place =
        mmap(nullptr, size, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
    ASSERT_NE(place, MAP_FAILED);
    const char* const begin = static_cast<const char*>(place);
    ws_Request request;
    writeOutput(&request, {begin, size});
    EXPECT_EQ(request.pieces, (Pieces{{begin, 4294967295u}, {begin + 4294967295u, 6u}}));
    munmap(place, size);
}

TEST(HttpOutput, AnyOtherResponseIsOnePiece) {
    ws_Request request;
    const char* const text = "text";
    writeOutput(&request, text);
    writeOutput(&request, {text, 0});
    EXPECT_EQ(request.pieces, (Pieces{{text, 4}, {text, 0}}));
}

}  // namespace
