#pragma once

struct lua_State;

// Opens the Lua module `qixlatorluautils`, by which the translator's scripts reach the paths and
// the explanation files of the system. Each function raises a Lua error whose value is the JSON
// text of the failure's status.
//
//   mbsToUtf8(language, text)                          the text; files are UTF-8 here
//   lookupVariable(translator, name)                   the variable's value, or ""
//   expandPath(translator, path)                       the path, its variables replaced
//   convertLangToDir(language)                         the name of the language's directory
//   findErrorDescriptionFromErrorsDir(directory, code, language)   the text, or nil
//   findErrorDescriptionFromDir(directory, code)       the text, or nil
//   findErrorDescriptionFromFile(directory, code)      the same search of a directory
//
// Leaves the module's table on the stack.
extern "C" int luaopen_qixlatorluautils(lua_State* L);
