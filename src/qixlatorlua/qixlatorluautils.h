#pragma once

struct lua_State;

// Opens the Lua module `qixlatorluautils`, which gives the translator's scripts access to the paths
// and the explanation files of the system. On failure a function raises a Lua error whose value is
// the JSON text of the status.
//
//   mbsToUtf8(language, text)                          the text, unchanged: all files are UTF-8
//   lookupVariable(translator, name)                   the variable's value, or ""
//   expandPath(translator, path)                       the path with its variables replaced
//   convertLangToDir(language)                         the name of the language's directory
//   findErrorDescriptionFromErrorsDir(directory, code, language)   the text, or nil
//   findErrorDescriptionFromDir(directory, code)       the text, or nil
//   findErrorDescriptionFromFile(directory, code)      the same search of a directory
//
// Leaves the module's table on the stack.
extern "C" int luaopen_qixlatorluautils(lua_State* L);
