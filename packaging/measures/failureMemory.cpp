// Prints the bytes that the text of a failure needs beyond what the process keeps, and the bytes
// that it keeps after two failures at the same time. Counts the requested sizes of the allocations
// of the translation layers, Lua states included. It uses the installed explanation files.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <string>

#include "qierr/Writer.h"
#include "qihtl/Allocator.h"
#include "qitrmcwebsvc/describeStatus.h"
#include "qixlator/Registration.h"
#include "qixlatorlua/LuaXlator.h"

namespace {

constexpr const char* xlatorName = "mxlator_qitrmc";

std::size_t liveBytes = 0;
std::size_t peakBytes = 0;

// Constructed at the first allocation, which may be that of a static object.
std::map<void*, std::size_t>& sizes() {
    static auto* const map = new std::map<void*, std::size_t>();
    return *map;
}

// Does nothing for null.
void remove(void* block) {
    const auto found = sizes().find(block);
    if (found != sizes().end()) {
        liveBytes -= found->second;
        sizes().erase(found);
    }
}

void add(void* block, std::size_t size) {
    sizes()[block] = size;
    liveBytes += size;
    peakBytes = std::max(peakBytes, liveBytes);
}

}  // namespace

// Replaces the allocation function of the translation layers.
void* qihtl_realloc(void* block, std::size_t size) {
    remove(block);
    if (size == 0) {
        std::free(block);
        return nullptr;
    }
    void* const moved = std::realloc(block, size);
    if (moved == nullptr) {
        std::abort();
    }
    add(moved, size);
    return moved;
}

namespace {

void describe() {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, qierr::codes::unknownSession, QITRMC_HERE);
    addUsageString(qierr_orderedData(xlatorName, &status), "kUsageTypeSessionId", "_session7");
    if (nQITRMCWEBSVC100::describeStatus(status).find("_session7") == std::string::npos) {
        std::abort();
    }
}

// Two translators at the same time, of which both states are kept afterwards.
void translateTwice() {
    const char* info = qixlator::localRegistrations().find(xlatorName)->registrationInfo;
    qierr::Status status;
    XlatorInterface* xlators[2];
    for (XlatorInterface*& xlator : xlators) {
        xlator = qixlatorlua::createLuaXlator(xlatorName, info, qixlatorlua::LuaRuntime::Prepared,
                                              &status);
        if (xlator == nullptr) {
            std::abort();
        }
    }
    for (XlatorInterface* xlator : xlators) {
        xlator->destroy(xlator);
    }
}

}  // namespace

int main() {
    const std::size_t before = liveBytes;
    describe();
    translateTwice();
    describe();
    const std::size_t kept = liveBytes;
    peakBytes = kept;
    describe();
    std::printf("%zu %zu\n", peakBytes - kept, kept - before);
}
