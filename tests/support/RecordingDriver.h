#pragma once

#include <qitrmcapi.h>

#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <variant>
#include <vector>

// A driver that only records its calls and returns what a test has set.
//
// Linked in place of the real driver. A call is recorded as its name without prefix and its
// arguments, without statuses and out arguments: `reserveDevices(7, "Mod1", 3, "", 0.5)`. Calls
// that free something are recorded too: `freeStringArray(2)`.
class RecordingDriver {
  public:
    using Value = std::variant<std::monostate, double, std::int64_t, std::uint64_t, std::string,
                               std::vector<double>, std::vector<std::int64_t>,
                               std::vector<std::uint64_t>, std::vector<std::string>>;

    struct Reply {
        Value value = {};
        std::int32_t code = 0;
        std::string json = {};
        std::function<void()> during = {};  // runs inside the call
        // The count that is returned for an array when `value` holds none.
        std::uint32_t countOfNoArray = 0;
        // Computes the reply from the text of the call, in place of all of the above.
        std::function<Reply(const std::string& call)> workedOut = {};
    };

    static RecordingDriver& instance();

    // Forgets everything. Called by the fixture before each test.
    void reset();

    // Sets the reply to calls whose text, or whose name alone, is `call`. The text has priority.
    void reply(const std::string& call, Reply reply);
    // The same for one value, or for a failure.
    void give(const std::string& call, Value value) { reply(call, {std::move(value)}); }
    void fail(const std::string& call, std::int32_t code, std::string json = {}) {
        reply(call, {{}, code, std::move(json)});
    }

    std::vector<std::string> calls() const;
    // The calls since the previous call of this function.
    std::vector<std::string> takeCalls();
    // Strings, arrays and arrays of strings that were lent and not given back.
    int outstanding() const;

    // For the driver's functions. Memory for recording and for lending is available even while
    // allocations fail.
    Reply record(const std::string& name, const std::string& arguments);
    void lend() { count(+1); }
    void takeBack(const void* lent) { count(lent != nullptr ? -1 : 0); }

  private:
    void count(int change);

    mutable std::mutex mutex;
    std::vector<std::string> recorded;
    std::map<std::string, Reply> replies;
    int lentCount = 0;
};
