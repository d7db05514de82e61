#include "trace/Trace.h"

#include <fcntl.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <new>

#include "description/ErrorReport.h"
#include "trace/CallText.h"

namespace simulator {

namespace {

using Clock = std::chrono::steady_clock;

constexpr long long million = 1000000;
constexpr const char* variable = "QITRMC_SIM_TRACE";

int openTrace() {
    const char* path = std::getenv(variable);
    if (path == nullptr || *path == '\0') {
        return -1;
    }
    const int file = std::strcmp(path, "-") == 0
                         ? fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, 0)
                         : open(path, O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC, 0666);
    if (file < 0) {
        refuseStart(path, {"", std::string("cannot be written: ") + std::strerror(errno),
                           std::string(variable) + " must name a file that can be written"});
    }
    return file;
}

// Threads are numbered in the order of their first calls.
unsigned threadNumber() noexcept {
    static std::atomic<unsigned> last{0};
    thread_local const unsigned number = ++last;
    return number;
}

long long microseconds(Trace::Time from, Trace::Time to) noexcept {
    return std::chrono::duration_cast<std::chrono::microseconds>(to - from).count();
}

}  // namespace

Trace::Trace() : start(Clock::now()), file(openTrace()) {}

Trace::~Trace() {
    if (file >= 0) {
        close(file);
    }
}

void Trace::writeLine(const std::string& line) const {
    // A failure to write the trace cannot be reported anywhere.
    [[maybe_unused]] const ssize_t written = write(file, line.data(), line.size());
}

void Trace::note(const Call& call, const qierr_Status& status, Time begin) noexcept {
    const Time end = Clock::now();
    try {
        const long long now = microseconds(start, end);
        char head[48];
        std::snprintf(head, sizeof head, "%lld.%06lld t%u ", now / million, now % million,
                      threadNumber());
        char tail[48];
        std::snprintf(tail, sizeof tail, " [%lld us]", microseconds(begin, end));
        const std::string line = head + callText(call, status) + tail;
        latest.keep(line);
        if (file >= 0) {
            writeLine(line + "\n");
        }
    } catch (const std::bad_alloc&) {
    }
}

}  // namespace simulator
