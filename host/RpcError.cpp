#include "host/RpcError.h"

#include <rapidjson/reader.h>

#include <string_view>

namespace host {

namespace {

// Ends the parse at the first member that decides.
class ErrorFinder : public rapidjson::BaseReaderHandler<rapidjson::UTF8<>, ErrorFinder> {
  public:
    bool StartArray() {
        isBatch = isBatch || depth == 0;
        ++depth;
        return true;
    }
    bool EndArray(rapidjson::SizeType) { return leave(); }
    bool StartObject() {
        ++depth;
        return true;
    }
    bool EndObject(rapidjson::SizeType) { return leave(); }

    bool Key(const char* text, rapidjson::SizeType length, bool) {
        if (depth != (isBatch ? 2 : 1)) {
            return true;
        }
        const std::string_view name(text, length);
        found = name == "error";
        return !found && (isBatch || name != "result");
    }

    bool hasFound() const { return found; }

  private:
    bool leave() {
        --depth;
        return true;
    }

    int depth = 0;
    bool isBatch = false;
    bool found = false;
};

// Iterative, so that no nesting in a response can exhaust the stack.
constexpr unsigned flags = rapidjson::kParseIterativeFlag | rapidjson::kParseNumbersAsStringsFlag;

// Far more than stands before the result in most responses.
constexpr std::size_t mostBeforeResult = 128;

// Whether a response is a single one with a result, as far as that shows without a parse. A quote
// within a text has a backslash before it, so the name of the member cannot stand in a text.
bool beginsWithResult(std::string_view response) {
    const std::string_view head = response.substr(0, mostBeforeResult);
    const std::size_t result = head.find("\"result\":");
    const std::string_view before = head.substr(0, result);
    return result != head.npos && before.rfind('{') == 0 && before.find('[') == before.npos &&
           before.find("\"error\":") == before.npos;
}

}  // namespace

bool hasRpcError(const std::string& response) {
    if (beginsWithResult(response)) {
        return false;
    }
    ErrorFinder finder;
    rapidjson::Reader reader;
    rapidjson::StringStream stream(response.c_str());
    reader.Parse<flags>(stream, finder);
    return finder.hasFound();
}

}  // namespace host
