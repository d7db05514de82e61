#pragma once

namespace host {

// The texts of --help and --version, each ending in a newline.
extern const char* const kHelpText;
extern const char* const kVersionText;

}  // namespace host
