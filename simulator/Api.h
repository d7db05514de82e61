#pragma once

// The functions of these headers are what this library shows to the world; all else in it is
// hidden.
#pragma GCC visibility push(default)
#include "qitrmcapi.h"
#include "qitrmcsim.h"
#pragma GCC visibility pop
