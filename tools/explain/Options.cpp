#include "explain/Options.h"

#include <CLI/CLI.hpp>

#include "explain/Failure.h"
#include "explain/Language.h"

namespace explain {
namespace {

constexpr const char* description =
    "Prints what the service's translator says for a status code.\n";

constexpr const char* footer = R"(Examples:
  qitrmc-explain -250811
  qitrmc-explain --language deu devicereserved
  qitrmc-explain '{"jsonrpc":"2.0","id":1,"error":{"code":-32601,"message":"..."}}'
  curl -s ... | qitrmc-explain -
  qitrmc-explain --search nvmem

Of a response the innermost code is explained, and of a batch that of the first request that
failed. The language is that of LC_ALL, LC_MESSAGES or LANG unless --language names one.

Exit status: 0 after a text was printed, 1 when there is none, because the code or name is unknown,
no entry matches or the explanation files are missing, and 2 for a wrong command line.)";

}  // namespace

void addOptions(CLI::App& app, Options& options) {
    app.name("qitrmc-explain");
    app.description(description);
    app.footer(footer);
    app.get_formatter()->column_width(24);
    app.set_help_flag("-h,--help", "show this text");
    app.set_version_flag("--version", "qitrmc-explain " QITRMC_VERSION, "show the version");

    app.add_option("STATUS", options.status,
                   "a code, with or without its minus sign; a name, in any letter case;\n"
                   "or a JSON text: a response, a batch of them, an error object, or\n"
                   "details with a member \"code\"; \"-\" reads it from standard input")
        ->option_text(" ");
    app.add_option("DETAILS", options.details,
                   "the JSON text of the details that belong to a code or name; \"-\" reads\n"
                   "it from standard input")
        ->option_text(" ");
    app.add_option("--language", options.language, languageWords())->option_text("LANG");
    app.add_flag("--formatted", options.formatted, "mark labels with <B> and </B>");
    app.add_flag("--debug", options.debug, "show the items for maintainers too");
    app.add_flag("--list", options.list, "list all codes with name and first sentence");
    app.add_option_function<std::string>(
           "--search",
           [&options](const std::string& word) {
               options.search = true;
               options.word = word;
           },
           "list the codes whose name or text contains WORD, in any letter case")
        ->option_text("WORD");
}

void checkOptions(const Options& options) {
    const bool listing = options.list || options.search;
    if (options.list && options.search) {
        throw UsageError("--list and --search do not go together.");
    }
    if (listing && !options.status.empty()) {
        throw UsageError("--list and --search go with no code, name or JSON text.");
    }
    if (!listing && options.status.empty()) {
        throw UsageError("Give a code, a name or a JSON text.");
    }
}

}  // namespace explain
