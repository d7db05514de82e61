#include "trace/TraceMemory.h"

#include <algorithm>

namespace simulator {

namespace {

constexpr std::size_t mostLines = 2000;
constexpr std::chrono::seconds patience(10);

}  // namespace

void TraceMemory::keep(const std::string& line) {
    const std::lock_guard<std::mutex> lock(mutex);
    if (!isOn()) {
        return;
    }
    if (Clock::now() - lastRead > patience) {
        on = false;
        first += kept.size();
        kept.clear();
        return;
    }
    kept.push_back(line);
    if (kept.size() > mostLines) {
        kept.pop_front();
        ++first;
    }
}

TraceMemory::Lines TraceMemory::read(std::uint64_t from) {
    const std::lock_guard<std::mutex> lock(mutex);
    lastRead = Clock::now();
    on = true;
    Lines result;
    result.next = first + kept.size();
    const std::uint64_t begin = from < first || from > result.next ? first : from;
    result.lines.assign(kept.begin() + static_cast<std::ptrdiff_t>(begin - first), kept.end());
    return result;
}

}  // namespace simulator
