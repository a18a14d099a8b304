// What a stream from the platform and the player know of each other.
#pragma once

#include <cstdint>

#include "core/geom/types.h"

class ScriptPlayer;

// The notify data of a request: where its data belongs. Made by the player and handed through the
// platform, which gives it back to StreamInNew or to StreamFailed, either of which frees it.
struct LoadInfo {
    S32 layer;    // level that receives the data; -1 with a target
    char* target; // owned; path of the sprite that receives it; null: the level does
    S32 loadVars; // the stream carries variables, not a movie
    U32 session;  // of the player when it was made: see SPlayer::session
};

// Notify data of a stream that is not for the player.
inline void* const kNotForPlayer = reinterpret_cast<void*>(~static_cast<uintptr_t>(0));

// One open stream. Owned by the platform; it must stay until the callback that is running, if any,
// has returned, even when CloseStream is called in it.
struct StreamData {
    char* url = nullptr; // owned by the player's side, from StreamInNew to StreamInDestroy
    ScriptPlayer* player = nullptr; // what the stream feeds; null: nothing (any more)
    S32 reportSize = 0;             // the movie's size is still to be offered to the platform
};
