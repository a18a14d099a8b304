// StreamReader: the streaming sound of one timeline, read ahead of the picture.
#pragma once

#include "core/stream/sounds_ahead.h"

class MovieData;

// Made by the player's thread at a timeline's first block and held by the stream's channel, whose
// refill it is: with the mixer's lock held it goes through the tags from that block on by a cursor
// of its own, a frame at a time, brings the channel each block, and starts the event sounds that it
// meets, so that these keep time with the stream. It knows the movie's bytes and how many there
// are, and never touches the timeline or the dictionary.
//
// When the data ends it waits, in silence that does not count as heard, until the movie has a lead
// of some seconds or nothing more can come. What it may read in a go is limited by the sound that
// it brings: past 64 K tags without any it goes on in the next buffer, in such silence too.
class StreamReader final : public CSoundHolder {
public:
    // From the timeline's current tag, its block, on.
    StreamReader(CSoundMix* mix, const ScriptThread& timeline);

    void AddRef() override { references.fetch_add(1, std::memory_order_relaxed); }
    void Release() override;

    // Once a tick, on the player's thread: makes event sounds ready, sets how much lead a waiting
    // stream needs and whether sounds are started. Returns what that was worth, in tags.
    U32 Tend(const ScriptThread& timeline);

    // The channel's refill; `context` is the reader.
    static bool ScriptStreamProc(CSoundChannel* channel, void* context);

private:
    enum Step { kGoOn, kFrameDone, kNoData, kNoBudget, kStreamEnd };

    ~StreamReader();

    bool DoSoundFrame(CSoundChannel* channel);
    Step NextTag(CSoundChannel* channel);
    Step ReadTag(CSoundChannel* channel);
    Step ShowFrame();
    Step ReadBlock(CSoundChannel* channel);
    void AdjustMp3Streaming(CSoundChannel* channel);
    bool MayResume() const;
    bool NothingMore() const;
    void EarnBudget(const CSoundChannel& channel);

    CSoundMix* const mixer;
    MovieData* const data;
    const S32 spriteLen; // bytes of a sprite's tags, which are all there; -1: a movie's root
    const S32 leadIn;    // MPEG: frames that the decoder needs before the first is heard
    SoundsAhead ahead;
    std::atomic<S32> lead{0}; // frames
    std::atomic<bool> soundOn{true};
    std::atomic<S32> references{1};

    // The audio thread's:
    STagWalker tags;
    S32 frame;            // of the stream, counted as the timeline counts
    S32 budget;           // tags, or samples of a lead-in, that may be read at once
    bool waiting = false; // for data
    bool brought = false; // this call has a block
    bool frameHadBlock = false;
    S32 toDrop; // of the lead-in
};
