#pragma once

// The emulator for ARM takes ten times as long as this machine. What is tried there is the same
// code, built for another processor, so of long series of alike cases it gets one in eight; the
// other builds get all.
#if defined(__arm__)
constexpr bool isEmulated = true;
#else
constexpr bool isEmulated = false;
#endif

// By how many allocations, or other places to fail, a test moves on that lets one after another
// fail.
constexpr int failureStep = isEmulated ? 8 : 1;
