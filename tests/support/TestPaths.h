#pragma once

// Paths in the source and build folders. Each is defined in the programs for which
// qitrmc_test_paths names it.
extern const char* const corpusFolder;
extern const char* const embeddedSources;
extern const char* const explanationFiles;
extern const char* const localesFolder;
extern const char* const pluginFile;

// Commands of the shell.
extern const char* const chanceProbe;
extern const char* const openProbe;

// Stand-ins for optional libraries.
extern const char* const completeManager;
extern const char* const failingManager;
extern const char* const lackingManager;
extern const char* const completeRelocations;
extern const char* const lackingRelocations;
extern const char* const unresolvedRelocations;
extern const char* const sharedSymbols;
