// Folder stdint: 64-bit integers for Lua scripts.
#pragma once

struct lua_State;

// Opens the Lua module `stdint`: 64-bit integers, which a Lua 5.1 number cannot hold.
//
// Its functions i64 and u64 make a value from a number (truncated towards zero, clamped to the
// range of the type) or from a text; without an argument, or with several, the value is 0.
// Arithmetic wraps in 64 bits. An operand may be a plain number, but i64 and u64 cannot be
// combined. Division truncates; division by zero is a Lua error. A value prints as decimal text,
// and value:hexstring() returns its hexadecimal text.
//
// Leaves the module's table on the stack. Failures are Lua errors.
extern "C" int luaopen_stdint(lua_State* L);
