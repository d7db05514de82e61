#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "explain/Question.h"
#include "qixlator/qixlator.h"

namespace explain {

struct Translation {
    std::int32_t failure = 0;  // the status code if there is no text, or 0
    std::string text;
};

// Produces the texts of statuses in one language.
class Translator {
  public:
    // Throws std::bad_alloc.
    explicit Translator(std::uint32_t language);

    // The text of a status with all its details. Labels are marked in a formatted text; `debug`
    // adds the items for maintainers.
    Translation translate(const Question& question, bool formatted, bool debug);

    // The text of a code alone; empty if no explanation file has it.
    std::string explanation(std::int32_t code);

  private:
    struct EndSession {
        void operator()(qixlator::Session* session) const { qixlator_destroySession(session); }
    };

    std::unique_ptr<qixlator::Session, EndSession> session;
    std::uint32_t language;
};

}  // namespace explain
