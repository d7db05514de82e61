// qitrmc-explain: prints what the translator of the service says for a status.

#include <array>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <iterator>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "jsonz/jsonz.h"
#include "qierr/Status.h"
#include "qierr/Writer.h"
#include "qihtl/String.h"
#include "qixlator/json1.h"
#include "qixlator/qixlator.h"

namespace {

constexpr const char* usage =
    R"(Usage: qitrmc-explain [OPTION]... CODE [JSON]
       qitrmc-explain [OPTION]... JSON

Prints what the service's translator says for a status: for a code alone, or for a code with the JSON
text of its details. A JSON text by itself must hold the code in its member "code". "-" in place of
the JSON text reads it from standard input.

  --language LANG  eng (the default), fra, deu, jpn, kor or chs
  --formatted      mark labels with <B> and </B>
  --debug          show the items for maintainers too
  --help           show this text

Exit status: 0 after a text was printed, 1 when the translation fails, 2 for a wrong command line.
)";

struct UsageError : std::runtime_error {
    using std::runtime_error::runtime_error;
};

struct Options {
    std::uint32_t language = 0;
    bool formatted = false;
    bool debug = false;
    bool help = false;
    std::vector<std::string> operands;
};

std::uint32_t languageNumber(const std::string& word) {
    constexpr std::array<const char*, 6> words = {"eng", "fra", "deu", "jpn", "kor", "chs"};
    for (std::uint32_t number = 0; number < words.size(); ++number)
        if (word == words[number])
            return number;
    throw UsageError("There is no language \"" + word +
                     "\". Use eng, fra, deu, jpn, kor or chs with --language.");
}

Options parseOptions(const std::vector<std::string>& arguments) {
    Options options;
    for (auto argument = arguments.begin(); argument != arguments.end(); ++argument) {
        if (*argument == "--language" && std::next(argument) != arguments.end())
            options.language = languageNumber(*++argument);
        else if (*argument == "--formatted")
            options.formatted = true;
        else if (*argument == "--debug")
            options.debug = true;
        else if (*argument == "--help")
            options.help = true;
        else if (argument->rfind("--", 0) == 0)
            throw UsageError("The option " + *argument + " is unknown or lacks its value.");
        else
            options.operands.push_back(*argument);
    }
    return options;
}

bool isCode(const std::string& text, std::int32_t* code) {
    char* end = nullptr;
    const long long number = std::strtoll(text.c_str(), &end, 10);
    *code = static_cast<std::int32_t>(number);
    return !text.empty() && *end == '\0' && number == *code;
}

std::string readJson(const std::string& operand) {
    if (operand != "-")
        return operand;
    return {std::istreambuf_iterator<char>(std::cin), std::istreambuf_iterator<char>()};
}

// An object, with nothing but blanks behind it.
void checkJson(const std::string& json) {
    const char* const end = jsonz_readValue(json.c_str(), nullptr);
    const std::size_t start = json.find_first_not_of(" \t\r\n");
    if (end == nullptr || json[start] != '{' ||
        json[std::strspn(end, " \t\r\n") + (end - json.c_str())])
        throw UsageError("The text is not a JSON object. Give the details of a status, {...}.");
}

// Fills the status from the operands.
void readStatus(const std::vector<std::string>& operands, qierr_Status* status) {
    std::int32_t code = 0;
    const bool hasCode = !operands.empty() && isCode(operands.front(), &code);
    const std::size_t jsonPlace = hasCode ? 1 : 0;
    if (operands.empty() || operands.size() > jsonPlace + 1)
        throw UsageError("Give a code, a JSON text, or both.");
    std::string json;
    if (operands.size() > jsonPlace) {
        json = readJson(operands[jsonPlace]);
        checkJson(json);
        if (!hasCode)
            code = jsonz_getInt(jsonz_findMember(json.c_str(), "code"), 0, nullptr);
    }
    if (code == 0)
        throw UsageError("There is no code, or it is 0, which is no failure.");
    qierr_Status_setCode(status, code);
    if (!json.empty() && qierr_Status_setJson(status, json.c_str()) == nullptr)
        throw std::bad_alloc();
}

struct EndSession {
    void operator()(qixlator::Session* session) const { qixlator_destroySession(session); }
};

void translate(const Options& options, const qierr_Status& status, qihtl::String* text,
               qierr_Status* failure) {
    using namespace qixlator::json1;
    const std::unique_ptr<qixlator::Session, EndSession> session(qixlator_createSession(failure));
    const std::uint32_t flags =
        includeStatic | includeDynamic | includeNested | (options.debug ? includeDebug : 0);
    const auto layOut =
        options.formatted ? translateErrStatusToFormattedText : translateErrStatusToRawText;
    layOut(session.get(), &status, options.language, flags, text, failure);
}

int explain(const Options& options) {
    qierr::Status status;
    readStatus(options.operands, &status);
    qierr::Status failure;
    qihtl::String text;
    translate(options, status, &text, &failure);
    if (failure.code < 0) {
        std::fprintf(stderr,
                     "qitrmc-explain: The translation fails with code %d: %s\n"
                     "Look whether the explanation files are installed.\n",
                     static_cast<int>(failure.code), failure.json != nullptr ? failure.json : "");
        return 1;
    }
    std::printf("%s\n", text.c_str());
    return 0;
}

}  // namespace

int main(int argc, char** argv) {
    try {
        const Options options = parseOptions({argv + 1, argv + argc});
        if (options.help) {
            std::fputs(usage, stdout);
            return 0;
        }
        return explain(options);
    } catch (const UsageError& error) {
        std::fprintf(stderr, "qitrmc-explain: %s\nTry qitrmc-explain --help.\n", error.what());
        return 2;
    } catch (const std::exception& error) {
        std::fprintf(stderr, "qitrmc-explain: %s\n", error.what());
        return 1;
    }
}
