#pragma once

struct lua_State;

// Closing of a state whose memory is released, or written over, as a whole. lua_close runs the
// finalizers and then frees each object, which takes longer than the scripts of a translation; here
// only the finalizers run.
namespace qixlatorlua {

// Creates the userdata that closeWithoutFreeing needs. Must be called before any other userdata is
// created. Raises a Lua error if memory runs out.
int prepareClosing(lua_State* L);

// Runs the finalizers of all userdata, as lua_close does. The state, which must have an arena, is
// invalid afterwards; its blocks are only released with the arena.
void closeWithoutFreeing(lua_State* L);

}  // namespace qixlatorlua
