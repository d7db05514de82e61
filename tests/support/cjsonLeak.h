#pragma once

// To be included by one source of a test program that makes the interpreter run out of memory. The
// interpreter's JSON module, a library of the system, leaks its buffer of some hundred bytes when
// a decode fails in the middle. The leak sanitizer reads the suppression below.
extern "C" __attribute__((visibility("default"))) const char* __lsan_default_suppressions() {
    return "leak:strbuf_new\n";
}
