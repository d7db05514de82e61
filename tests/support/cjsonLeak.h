#pragma once

// To be included by one source of a test program that lets the interpreter run out of memory: its
// JSON module, a library of the system, then loses its buffer of some hundred bytes in the middle
// of a decode. The leak sanitizer reads this.
extern "C" __attribute__((visibility("default"))) const char* __lsan_default_suppressions() {
    return "leak:strbuf_new\n";
}
