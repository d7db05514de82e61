#pragma once

struct lua_State;

// Opens the Lua module `stdint`: 64-bit integers, which a Lua 5.1 number cannot hold.
//
// Its functions i64 and u64 make values from a number (truncated towards zero, clamped to the range
// of the type), from a text, or 0 from anything but one argument. Arithmetic wraps in 64 bits and
// mixes with plain numbers; the two types do not mix with each other. Division truncates; by zero
// it is a Lua error. A value prints as decimal text, and value:hexstring() gives its hexadecimal
// text.
//
// Leaves the module's table on the stack. Failures are Lua errors.
extern "C" int luaopen_stdint(lua_State* L);
