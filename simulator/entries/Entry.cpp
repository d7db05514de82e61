#include "entries/Entry.h"

namespace simulator {

std::string_view required(const char* text, const char* argument) {
    if (text == nullptr) {
        throw Refusal(code::missingArgument).usage(tag::argument, argument);
    }
    return text;
}

}  // namespace simulator
