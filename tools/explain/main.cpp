// qitrmc-explain: prints the text of the service's translator for a status.

#include <CLI/CLI.hpp>
#include <cstdio>
#include <string>

#include "explain/Catalogue.h"
#include "explain/Failure.h"
#include "explain/Language.h"
#include "explain/Listing.h"
#include "explain/Options.h"
#include "explain/Question.h"
#include "explain/Translator.h"

namespace {

using namespace explain;

// The message for a code that no explanation file has.
std::string messageWithoutText(std::int32_t code, Translator& translator) {
    const std::string number = std::to_string(code);
    if (const Entry* const entry = findCode(code)) {
        return "The explanation files have no text for " + number + " (" +
               std::string(entry->name) + "). Look whether they are installed.";
    }
    return "The code " + number +
           " is unknown here. A driver has codes of its own, which its documentation explains.\n"
           "The nearest known codes are:" +
           suggestions(nearestCodes(code), translator);
}

// The message in addition to a translation or in place of it; empty on success.
std::string warningAbout(const Question& question, const Translation& translation,
                         Translator& translator) {
    if (translator.explanation(question.code).empty()) {
        return messageWithoutText(question.code, translator);
    }
    if (translation.failure != 0) {
        return "The details cannot be put into words (code " + std::to_string(translation.failure) +
               "). Give the code alone to see what it means.";
    }
    return {};
}

void complain(const std::string& text) {
    std::fprintf(stderr, "qitrmc-explain: %s\n", text.c_str());
}

void explainStatus(const Options& options, Translator& translator) {
    const Question question = readQuestion(options, translator);
    const Translation translation =
        translator.translate(question, options.formatted, options.debug);
    const std::string warning = warningAbout(question, translation, translator);
    if (translation.failure != 0) {
        throw Failure(warning);
    }
    std::printf("%s\n", translation.text.c_str());
    if (!warning.empty()) {
        complain(warning);
    }
}

void run(const Options& options) {
    checkOptions(options);
    Translator translator(options.language.empty() ? languageOfEnvironment()
                                                   : languageOfWord(options.language));
    if (options.list) {
        std::fputs(listAll(translator).c_str(), stdout);
    } else if (options.search) {
        std::fputs(listMatches(options.word, translator).c_str(), stdout);
    } else {
        explainStatus(options, translator);
    }
}

int refuse(const std::string& text) {
    complain(text + "\nTry qitrmc-explain --help.");
    return 2;
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App app;
    Options options;
    try {
        addOptions(app, options);
        app.parse(argc, argv);
        run(options);
        return 0;
    } catch (const CLI::Success& helpOrVersion) {
        return app.exit(helpOrVersion);
    } catch (const CLI::ParseError& error) {
        return refuse(error.what());
    } catch (const UsageError& error) {
        return refuse(error.what());
    } catch (const std::exception& error) {
        complain(error.what());
        return 1;
    }
}
