#pragma once

#include <optional>
#include <string>

#include "explain/Question.h"

namespace explain {

// Whether the text is an object or array with nothing but white space around it.
bool isContainer(const std::string& text);

// The status in a JSON text for which isContainer is true: of a response or an error object the
// innermost code, of details their code with the details, of an array the status of the first
// element that has one. Empty if there is no code other than 0.
std::optional<Question> findQuestion(const std::string& json);

}  // namespace explain
