#pragma once

// The prefix of every absolute path that the program reads: "" on a controller, the root of a
// staged tree in development builds. Test programs link their own definition instead of the library
// `qisysq_root`. Never null, and constant while the process runs.
const char* qisysq_installRoot();
