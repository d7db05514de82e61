#pragma once

// The prefix of every absolute path of the target's file system that the program reads: "" on a
// controller, the root of a staged tree in development builds. Test programs link their own
// definition instead of the library `qisysq_root`. Never null; constant for the life of the
// process.
const char* qisysq_installRoot();
