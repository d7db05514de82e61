#include <algorithm>
#include <atomic>
#include <functional>
#include <random>
#include <set>
#include <thread>

#include "ServiceTest.h"

namespace {

using Handle = ModelledSessions::Handle;

constexpr int threadCount = 8;

void onAllThreads(const std::function<void(int thread)>& work) {
    std::vector<std::thread> threads;
    for (int thread = 0; thread < threadCount; ++thread) {
        threads.emplace_back(work, thread);
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}

// The handle of the session in a response to an opening request.
Handle openedIn(const std::string& text) {
    const std::string start = "\"session_id\":\"_session";
    const std::size_t at = text.find(start);
    return at == text.npos ? 0 : static_cast<Handle>(std::stoul(text.substr(at + start.size())));
}

class LoadTest : public ServiceTest {
  protected:
    Handle openSession(const std::string& params = "{}") {
        const Lines done = post(call("initializeSession", params));
        EXPECT_EQ(outcomesOf(done), Outcomes{0});
        return openedIn(done.back());
    }
};

// A client with sessions of its own, which sends requests of all kinds in a random order.
class Client {
  public:
    using Outcomes = std::vector<std::int32_t>;
    using Post = std::function<Outcomes(const std::string& body, std::string& response)>;

    Client(int seed, Post post) : random(static_cast<unsigned>(seed)), post(std::move(post)) {}

    void sendRequests(int count) {
        for (int sent = 0; sent < count; ++sent) {
            (this->*actions[random() % std::size(actions)])();
            // All clients together stay below the limit of the service.
            if (open.size() > 8) {
                closeOne();
            }
        }
    }
    const std::set<Handle>& sessions() const { return open; }

  private:
    std::string request(const std::string& method, const std::string& params) {
        return R"({"jsonrpc":"2.0","id":)" + std::to_string(++lastId) + R"(,"method":")" + method +
               R"(","params":)" + params + "}";
    }
    std::string requestFor(const std::string& method, Handle session) {
        return request(method, R"({"session_id":"_session)" + std::to_string(session) + "\"}");
    }

    // Sends and expects the id of the last request in the response.
    Outcomes send(const std::string& body) {
        const Outcomes outcomes = post(body, response);
        EXPECT_NE(response.find("\"id\":" + std::to_string(lastId) + ","), response.npos);
        return outcomes;
    }
    void noteOpened() { EXPECT_TRUE(open.insert(openedIn(response)).second) << "issued twice"; }
    Handle anyOpen() const { return open.empty() ? 0 : *open.begin(); }
    std::int32_t orUnknown() const { return open.empty() ? -250833 : 0; }

    void openOne() {
        EXPECT_EQ(send(request("initializeSession", "{}")), Outcomes{0});
        noteOpened();
    }
    void openContested() {
        const Outcomes outcomes =
            send(request("initializeSession", R"({"devices":"contested","access":"ReadWrite"})"));
        if (outcomes == Outcomes{0}) {
            noteOpened();
        } else {
            EXPECT_EQ(outcomes, Outcomes{ModelledSessions::deviceReserved});
        }
    }
    void abortOne() {
        EXPECT_EQ(send(requestFor("abortSession", anyOpen())), Outcomes{orUnknown()});
    }
    void closeOne() {
        EXPECT_EQ(send(requestFor("closeSession", anyOpen())), Outcomes{orUnknown()});
        open.erase(anyOpen());
    }
    // In a batch, requests after the one that closes the session fail and do not reach the driver.
    void closeInBatch() {
        const Handle session = anyOpen();
        const std::string body = "[" + requestFor("abortSession", session) + "," +
                                 requestFor("closeSession", session) + "," +
                                 requestFor("abortSession", session) + "," +
                                 requestFor("abortSession", session) + "]";
        EXPECT_EQ(send(body), open.empty() ? (Outcomes{-250833, -32001, -32001, -32001})
                                           : (Outcomes{0, 0, -250833, -32001}));
        open.erase(session);
    }
    void openInBatch() {
        const std::string body = "[" + request("initializeSession", "{}") + "," +
                                 request("noSuchMethod", "{}") + "," +
                                 request("initializeSession", "{}") + "]";
        EXPECT_EQ(send(body), (Outcomes{0, -32601, -32001}));
        noteOpened();
    }
    void sendFaults() {
        EXPECT_EQ(send(request("closeSession", R"({"session_id":7})")), Outcomes{-32602});
        EXPECT_EQ(send(request("closeSession", "[]")), Outcomes{-32600});
        EXPECT_EQ(post("{", response), Outcomes{-32700});
        EXPECT_EQ(post("[]", response), Outcomes{-32600});
    }

    static constexpr void (Client::*actions[])() = {
        &Client::openOne,      &Client::openContested, &Client::abortOne,  &Client::closeOne,
        &Client::closeInBatch, &Client::openInBatch,   &Client::sendFaults};

    std::mt19937 random;
    const Post post;
    int lastId = 0;
    std::string response;
    std::set<Handle> open;
};

TEST_F(LoadTest, EveryClientSeesOnlyItsOwnSessions) {
    std::vector<std::set<Handle>> known(threadCount);
    onAllThreads([&](int thread) {
        Client client(thread, [&](const std::string& body, std::string& response) {
            const Lines done = post(body);
            response = done.back();
            return outcomesOf(done);
        });
        client.sendRequests(300);
        known[static_cast<std::size_t>(thread)] = client.sessions();
    });
    std::vector<Handle> all;
    for (const std::set<Handle>& each : known) {
        all.insert(all.end(), each.begin(), each.end());
    }
    std::sort(all.begin(), all.end());
    EXPECT_EQ(sessions.open(), all);
    expectSoundService();
}

TEST_F(LoadTest, ASessionIsClosedOnceHoweverManyTry) {
    std::vector<Handle> handles(100);
    std::generate(handles.begin(), handles.end(), [&] { return openSession(); });
    std::atomic<int> closed{0};
    onAllThreads([&](int thread) {
        for (const Handle handle : handles) {
            std::string body = callFor("closeSession", handle);
            if (thread % 2 != 0) {
                body = "[" + body + "]";
            }
            const Outcomes outcomes = outcomesOfPost(body);
            closed += outcomes == Outcomes{0} ? 1 : 0;
            EXPECT_TRUE(outcomes == Outcomes{0} || outcomes == Outcomes{-250833});
        }
    });
    EXPECT_EQ(closed, 100);
    EXPECT_EQ(sessions.open(), std::vector<Handle>{});
}

TEST_F(LoadTest, ADeviceThatAllClientsForceEndsUpWithOneSession) {
    onAllThreads([&](int) {
        for (int i = 0; i < 50; ++i) {
            openSession(R"({"devices":"contested","force_reserve":true})");
        }
    });
    EXPECT_EQ(sessions.opened(), Handle{threadCount * 50});
    EXPECT_EQ(sessions.open().size(), 1u);
}

TEST_F(LoadTest, ConcurrentBatchesDoNotInterleave) {
    constexpr int elements = 5;
    std::vector<Handle> handles(threadCount);
    std::generate(handles.begin(), handles.end(), [&] { return openSession(); });
    driver.takeCalls();
    onAllThreads([&](int thread) {
        const std::string abort =
            callFor("abortSession", handles[static_cast<std::size_t>(thread)]);
        const std::string batch =
            "[" + abort + "," + abort + "," + abort + "," + abort + "," + abort + "]";
        for (int i = 0; i < 50; ++i) {
            EXPECT_EQ(outcomesOfPost(batch), Outcomes(elements, 0));
        }
    });
    const Calls calls = driver.takeCalls();
    ASSERT_EQ(calls.size(), std::size_t{threadCount * 50 * elements});
    for (std::size_t first = 0; first < calls.size(); first += elements) {
        for (std::size_t i = 1; i < elements; ++i) {
            ASSERT_EQ(calls[first + i], calls[first]);
        }
    }
}

}  // namespace
