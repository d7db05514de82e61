#pragma once

#include "embedded/EmbeddedFiles.h"

struct lua_State;

// Registers the embedded Lua scripts as modules of a Lua state, so that `require` finds them
// without a search path.

// Compiles every Lua file in the order of the table and stores it in package.preload under its name
// without the extension. For a file that cannot be compiled it writes one line to standard error
// and continues. Returns 0, or 1 if any file failed. Leaves the stack unchanged. Raises a Lua error
// if memory runs out, so it must run in a protected call.
int addEmbeddedFilesToPreload(lua_State* L);

// The same for a given table of files.
int addFilesToPreload(lua_State* L, EmbeddedFiles files);

// Whether the extension of a file is ".lua" (script) or ".luac" (compiled chunk).
bool isLuaFile(const EmbeddedFile& file);

// The length of a file's name up to its last dot.
unsigned moduleNameLength(const EmbeddedFile& file);

// Writes the line for a file that cannot be compiled to standard error.
void reportLoadFailure(const char* fileName, const char* message);
