#include "explain/Translator.h"

#include <new>

#include "qierr/Status.h"
#include "qierr/Writer.h"
#include "qihtl/String.h"
#include "qixlator/json1.h"

namespace explain {
namespace {

void fill(const Question& question, qierr_Status* status) {
    qierr_Status_setCode(status, question.code);
    if (!question.details.empty() &&
        qierr_Status_setJson(status, question.details.c_str()) == nullptr) {
        throw std::bad_alloc();
    }
}

}  // namespace

Translator::Translator(std::uint32_t language) : language(language) {
    qierr::Status failure;
    session.reset(qixlator_createSession(&failure));
    if (session == nullptr) {
        throw std::bad_alloc();
    }
}

Translation Translator::translate(const Question& question, bool formatted, bool debug) {
    using namespace qixlator::json1;
    qierr::Status status;
    fill(question, &status);
    const std::uint32_t flags =
        includeStatic | includeDynamic | includeNested | (debug ? includeDebug : 0);
    const auto layOut = formatted ? translateErrStatusToFormattedText : translateErrStatusToRawText;
    qierr::Status failure;
    qihtl::String text;
    layOut(session.get(), &status, language, flags, &text, &failure);
    if (failure.code < 0) {
        return {failure.code, {}};
    }
    return {0, {text.c_str(), text.length()}};
}

std::string Translator::explanation(std::int32_t code) {
    return translate({code, {}}, false, false).text;
}

}  // namespace explain
