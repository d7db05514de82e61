#pragma once

#include <stdexcept>

namespace host {

// Why the host cannot start or go on, in one line that says what happened and what to do.
struct Failure : std::runtime_error {
    using std::runtime_error::runtime_error;
};

// A command line that the host does not understand.
struct UsageError : Failure {
    using Failure::Failure;
};

}  // namespace host
