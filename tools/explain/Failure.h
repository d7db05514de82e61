#pragma once

#include <stdexcept>

namespace explain {

// There is no text for the request. Exit status 1.
struct Failure : std::runtime_error {
    using std::runtime_error::runtime_error;
};

// The command line is wrong. Exit status 2.
struct UsageError : std::runtime_error {
    using std::runtime_error::runtime_error;
};

}  // namespace explain
