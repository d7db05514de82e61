#pragma once

#include <optional>
#include <string>

#include "explain/Question.h"

namespace explain {

// True for an object or array with nothing but blanks around it.
bool isContainer(const std::string& text);

// The status in a JSON text that isContainer: the innermost code of a response or an error object,
// the code of details together with them, and in an array the status of the first element that has
// one. Empty when there is none but 0, which is no failure.
std::optional<Question> findQuestion(const std::string& json);

}  // namespace explain
