#pragma once

#include <qitrmcapi.h>

#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <variant>
#include <vector>

// A driver that does nothing but write down how it is called and answer as a test tells it.
//
// Linked in place of the real driver. A call is written down as its name without prefix and its
// arguments, statuses and out arguments left out: `reserveDevices(7, "Mod1", 3, "", 0.5)`. Calls
// that give something back are written down too: `freeStringArray(2)`.
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
        // The count that is told where an array is asked for and `value` is none.
        std::uint32_t countOfNoArray = 0;
        // Works the reply out from the text of the call, in place of all of the above.
        std::function<Reply(const std::string& call)> workedOut = {};
    };

    static RecordingDriver& instance();

    // Forgets everything. Called by the fixture before each test.
    void reset();

    // Answers calls whose text, or whose name alone, is `call`. The text wins over the name.
    void reply(const std::string& call, Reply reply);
    // The same for one value, or for a failure.
    void give(const std::string& call, Value value) { reply(call, {std::move(value)}); }
    void fail(const std::string& call, std::int32_t code, std::string json = {}) {
        reply(call, {{}, code, std::move(json)});
    }

    std::vector<std::string> calls() const;
    // The calls since the last time this was asked.
    std::vector<std::string> takeCalls();
    // Texts, arrays and arrays of texts that were lent and not given back.
    int outstanding() const;

    // For the driver's functions. Whatever memory is needed for writing down and for lending is
    // there, also while allocations fail.
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
