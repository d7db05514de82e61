#pragma once

#include "embedded/EmbeddedFiles.h"

struct lua_State;

// Offers the embedded Lua scripts to a Lua state as modules, so that `require` finds them without a
// search path.

// Compiles every Lua file in table order and stores it in package.preload under its name without
// the extension. A file that cannot be compiled gives one line on standard error and does not
// hinder the others. Returns 0, or 1 if any file failed. Leaves the stack as it was. Raises a Lua
// error when memory runs out: call it in a protected call.
int addEmbeddedFilesToPreload(lua_State* L);

// The same for a given table of files.
int addFilesToPreload(lua_State* L, EmbeddedFiles files);

// Whether a file is a Lua script or chunk, by its extension ".lua" or ".luac".
bool isLuaFile(const EmbeddedFile& file);

// Bytes of a file's name before its last dot.
unsigned moduleNameLength(const EmbeddedFile& file);

// The line on standard error for a file that cannot be compiled.
void reportLoadFailure(const char* fileName, const char* message);
