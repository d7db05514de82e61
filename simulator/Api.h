#pragma once

// The driver's functions are what this library shows to the world; all else in it is hidden.
#pragma GCC visibility push(default)
#include "qitrmcapi.h"
#pragma GCC visibility pop
