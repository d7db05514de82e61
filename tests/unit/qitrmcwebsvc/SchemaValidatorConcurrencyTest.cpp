#include <gtest/gtest.h>
#include <pthread.h>

#include <atomic>
#include <functional>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include "embedded/EmbeddedFiles.h"
#include "requests.h"

namespace {

thread_local int locksOfThread = 0;

}  // namespace

// The program is linked so that its own calls of pthread_mutex_lock come here.
extern "C" int __real_pthread_mutex_lock(pthread_mutex_t* mutex);
extern "C" int __wrap_pthread_mutex_lock(pthread_mutex_t* mutex) {
    ++locksOfThread;
    return __real_pthread_mutex_lock(mutex);
}

namespace nQITRMCWEBSVC100 {
namespace {

struct Case {
    std::string params;
    std::optional<Refusal> expected;
};

const std::vector<Case>& cases() {
    static const std::vector<Case> all = {
        {R"({"session_id":"_session1","address":1,"size":8})", std::nullopt},
        {R"({"session_id":"session1","address":1,"size":8})",
         invalidParameter("#/params/session_id",
                          "Wrong session ID format. The format of a session ID must be "
                          "_session<number>. For example, a session ID can be _session1.")},
        {R"({"session_id":"_session123456789","address":1,"size":8})", std::nullopt},
        {R"({"session_id":"_session2","address":1})",
         invalidParameter("#/params",
                          "The following parameter(s) is required: session_id, address, size.")},
    };
    return all;
}

TEST(SchemaValidator, HasTheSameResultsOnSeveralThreadsAsOnOne) {
    constexpr int threadCount = 4;
    constexpr int rounds = 500;
    SchemaValidator validator(embeddedText("procedure_read_register.json"));
    std::atomic<int> waiting{threadCount};
    std::atomic<int> wrong{0};

    const auto work = [&](int offset) {
        std::vector<ParsedRequest> requests;
        for (const Case& one : cases()) {
            requests.emplace_back(requestText("readRegister", one.params));
        }
        --waiting;
        while (waiting > 0) {
            std::this_thread::yield();
        }
        for (int i = 0; i < rounds; ++i) {
            const std::size_t index = static_cast<std::size_t>(i + offset) % cases().size();
            const auto refusal = refusalOf([&] { validator.validate(*requests[index]); });
            if (!(refusal == cases()[index].expected)) {
                ++wrong;
            }
        }
    };

    std::vector<std::thread> threads;
    for (int i = 0; i < threadCount; ++i) {
        threads.emplace_back(work, i);
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(wrong, 0);
}

TEST(SchemaValidator, LocksItsMutexOnlyWhereTheLibraryMustDecide) {
    SchemaValidator validator(embeddedText("procedure_read_register.json"));
    const auto locksFor = [&](const std::string& members) {
        const ParsedRequest request(
            requestText("readRegister", R"({"session_id":"_session1","address":1,)" + members));
        const int before = locksOfThread;
        EXPECT_EQ(refusalOf([&] { validator.validate(*request); }), std::nullopt);
        return locksOfThread - before;
    };
    EXPECT_EQ(locksFor(R"("size":8})"), 0);
    EXPECT_EQ(locksFor(R"("size":8.0})"), 1);
}

TEST(SchemaValidator, OfSeveralMethodsWorkConcurrently) {
    SchemaValidator first(embeddedText("procedure_close_session.json"));
    SchemaValidator second(embeddedText("procedure_abort_session.json"));
    std::atomic<int> wrong{0};
    const auto work = [&wrong](SchemaValidator& validator, const char* method) {
        const ParsedRequest good(requestText(method, R"({"session_id":"_session1"})"));
        const ParsedRequest bad(requestText(method, R"({"session_id":"_sessionX"})"));
        for (int i = 0; i < 500; ++i) {
            wrong += refusalOf([&] { validator.validate(*good); }).has_value();
            wrong += !refusalOf([&] { validator.validate(*bad); }).has_value();
        }
    };
    std::thread other(work, std::ref(first), "closeSession");
    work(second, "abortSession");
    other.join();
    EXPECT_EQ(wrong, 0);
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
