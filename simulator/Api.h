#pragma once

// The library exports the functions of these headers; all other symbols are hidden.
#pragma GCC visibility push(default)
#include "qitrmcapi.h"
#include "qitrmcsim.h"
#pragma GCC visibility pop
