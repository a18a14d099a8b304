// SoundsAhead: the event sounds that a streaming timeline is going to start, made ready before the
// reader of its stream meets them.
#pragma once

#include "core/geom/grow_buffer.h"
#include "core/sound/sound_channel.h"
#include "core/stream/parser.h"

class CSoundMix;
class ScriptThread;

// The audio thread may not make channels or open decoders. So the player's thread goes through the
// tags ahead of the stream, when it starts and then once a tick, and makes a channel for each
// StartSound, up to 16 that wait; the reader takes them by the place of the tag. The order of the
// tags decides what an id means: sounds defined ahead of the picture are known here alone until the
// timeline defines them too. A start that the reader meets and finds nothing for is dropped: more
// than 16 between two ticks, or a sound beyond the thousands of tags looked at in one, or of
// definitions ahead.
class SoundsAhead {
public:
    static constexpr U32 kMostReady = 16;

    // Begins at the timeline's current tag.
    explicit SoundsAhead(const ScriptThread& timeline);
    ~SoundsAhead();
    SoundsAhead(const SoundsAhead&) = delete;
    SoundsAhead& operator=(const SoundsAhead&) = delete;

    // Goes on as far as the data and the room allow, and lets go of what was taken. Returns what
    // that was worth, in tags. The player's thread.
    U32 Prepare(const ScriptThread& timeline);
    // Starts the sound whose tag begins there; places come in rising order. The audio thread, with
    // the mixer's lock held.
    void StartAt(S32 place, CSoundMix* mix);

private:
    static constexpr U32 kMostChanges = 4096;
    static constexpr U32 kChains = 256;
    static constexpr U16 kNone = 0xFFFF;
    static constexpr U32 kTagsPerGo = 4096;

    struct SReady {
        S32 place; // of the tag
        CSoundChannel* channel;
    };
    // What a tag ahead of the picture has done to an id.
    struct SChange {
        S32 place;
        U16 id;
        bool defined; // else freed
        U16 next;     // change of the same chain, kNone at its end
        CSound sound;
    };

    bool ReadTag(const ScriptThread& timeline);
    bool Define(const ScriptThread& timeline, U16 id);
    bool Free(const ScriptThread& timeline, U16 id);
    bool Start(const ScriptThread& timeline, U16 id);
    bool Find(const ScriptThread& timeline, U16 id, CSound* sound) const;
    bool Change(U16 id, bool defined, const CSound& sound);
    SChange* FindChange(U16 id);
    const SChange* FindChange(U16 id) const;
    void Chain(U16 change);
    void ForgetChanges(S32 before);
    void ReleaseTaken();

    STagWalker tags;
    GrowBuffer<SChange> changes;
    U16 chains[kChains];       // by the low byte of the id: the first change, or kNone
    U32 work = 0;              // of this go, in tags
    SReady ready[kMostReady];  // a ring; these count for ever
    std::atomic<U32> made{0};  // written by the player's thread
    std::atomic<U32> taken{0}; // written by the audio thread
    U32 released = 0;          // the player's thread's
};
