#pragma once

#include <chrono>
#include <condition_variable>
#include <cstddef>
#include <mutex>

#include "qihtl/String.h"
#include "qixlatorlua/KeptTexts.h"
#include "qixlatorlua/LuaMemory.h"

struct lua_State;

namespace qixlatorlua {

// Keeps states that are set up as translators, so that a translation need not set one up. A state
// is copied before its first use, and before each further use the copy is written back over its
// memory: no translation can find out what an earlier one has done. Several threads may use states
// at the same time; no lock is held meanwhile.
//
// Kept are only states that have searched no directories for their scripts, since those in the
// directories may change.
class PreparedStates {
  public:
    // The states of this process.
    static PreparedStates& ofProcess();

    PreparedStates() = default;
    // Releases the states that are not in use.
    ~PreparedStates();
    PreparedStates(const PreparedStates&) = delete;
    PreparedStates& operator=(const PreparedStates&) = delete;

    // A state that is as it was when it was added, for this name and registration text, to be given
    // back with `close`. If all states are in use, waits a moment for one, since the threads that
    // use them need the processor too. Null if there is none: the caller sets one up then.
    lua_State* take(const char* name, const char* registrationInfo);

    // Adds a state that has just been set up, which is in use from then on. Loads the modules that
    // nearly every translation needs. If the state cannot be kept, it can be used all the same, and
    // is closed like any other.
    void add(lua_State* L, const char* name, const char* registrationInfo);

    // The descriptions of codes by a state that is in use; null if nothing is known of them, since
    // the state is not kept or may have been changed by something else than its translator.
    KeptTexts* textsOf(lua_State* L);

    // Closes a state with an arena, whether it was added or not, and releases the arena unless it
    // is kept.
    void close(lua_State* L, LuaArena* arena);

    // Releases the states that are not in use.
    void clear();

    // The memory of the states that are not in use and of their copies, in bytes.
    std::size_t size();

  private:
    static constexpr int maximumCount = 2;
    // The largest state that is kept, in bytes. Its memory and its copy each have this size.
    static constexpr std::size_t maximumSize = 216 * 1024;
    // About as long as setting up a state takes on a slow processor.
    static constexpr std::chrono::milliseconds patience{2};

    struct Slot {
        LuaArena* arena = nullptr;
        lua_State* L = nullptr;
        bool isUsed = false;
        qihtl::String name;
        qihtl::String registrationInfo;
        KeptTexts texts;
    };

    Slot* findIdle(const char* name, const char* registrationInfo);
    bool areAllUsed() const;
    static bool keep(lua_State* L, LuaArena* arena);
    // An empty slot that is in use from now on, if need be that of another registration; null if
    // all slots are in use.
    Slot* reserve();
    static void empty(Slot* slot);

    std::mutex mutex;
    std::condition_variable givenBack;
    Slot slots[maximumCount];
};

}  // namespace qixlatorlua
