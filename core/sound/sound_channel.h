// CSoundChannel: one playing instance of a sound.
#pragma once

#include <atomic>
#include <memory>

#include "core/sound/convert.h"
#include "core/sound/decomp.h"

class CSoundChannel;
class CSoundMix;

constexpr S32 kSoundBufferFrames = 2048; // of 44100 Hz in a buffer, whatever the output's rate is
constexpr S32 kMostSoundBuffers = 32;
constexpr S32 kMostEnvelopePoints = 255;
constexpr U32 kSoundToEnd = 0xFFFFFFFF; // an out point that is none

enum SSoundSync : U8 {
    kSyncNoMultiple = 0x01, // not started while the same sound plays
    kSyncStop = 0x02,       // not started: stops the sound instead
};

// Whatever keeps the bytes of a sound, or the reader behind a stream, alive. A channel counts once
// and lets go in its destructor, on the player's thread.
class CSoundHolder {
public:
    virtual void AddRef() = 0;
    virtual void Release() = 0;

protected:
    ~CSoundHolder() = default;
};

// Brings the next block of a stream: sets blockLeft, and the decoder upon its data through `block`;
// or, when a frame has none, leaves blockLeft 0 and may set silenceCount. False: the stream has
// ended, now or before. Runs on the audio thread with the mixer's lock held: it must not allocate,
// free, remove channels or wait, and adds sounds by AddSoundLocked only.
using CSoundRefill = bool (*)(CSoundChannel* channel, void* context);

// Made by new(std::nothrow) on the player's thread with a count of 1, filled in, handed to
// CSoundMix::AddSound, which counts once more while it plays, and let go by Release. Only the
// player's thread drops references, so the audio thread never destroys one.
class CSoundChannel {
public:
    CSoundChannel() = default;

    // --- set by its maker before it is added, the same from then on ---
    U64 tag = 0;  // whose it is, for RemoveTagged
    CSound sound; // what plays; of a stream: its format and, as numSamples, frames per picture
    bool doNotCount = false; // a stream whose samples do not pace the picture
    U8 syncFlags = 0;        // SSoundSync; event sounds
    S32 loops = 1;           // how often it is heard; less than 1 counts as 1
    U32 inPoint = 0;         // in samples at 44100 Hz
    U32 outPoint = kSoundToEnd;
    S32 numPoints = 0; // 0: no envelope
    SEnvelopePoint points[kMostEnvelopePoints];
    CSoundRefill refill = nullptr; // null: an event sound
    void* refillContext = nullptr;

    // Takes a reference; once, before it is added.
    void SetHolder(CSoundHolder* holder);
    // Makes the decoder and brings an event sound to its in point, or as near as that may take, on
    // the player's thread. AddSound does this, but a channel for AddSoundLocked must be prepared
    // before. False: the sound cannot be played, or nothing lies between its points.
    bool Prepare();
    // What starting it was worth, in tags of a tick's budget; more if it was prepared.
    U32 StartCost() const { return startCost; }
    // Where a stream starts in the count of samples heard, at the sound's rate.
    void SetSamplesPlayed(S64 samples) { Publish(samples, 0); }

    // --- the refill's ---
    std::unique_ptr<CSoundDecomp> decomp; // owned; set up by the mixer for event sounds
    CSound block;                         // storage for what the decoder of a stream reads now
    S32 blockLeft = 0;                    // frames left in the block
    S16 silenceCount = 0; // frames of silence due before the next block; the sign is the reader's
    bool fadeIn = false;  // the next buffer rises from silence
    // Whether the stream waits for what it is to bring: its silence then does not count as heard.
    void SetWaiting(bool on) { waiting.store(on, std::memory_order_release); }

    // --- any thread ---
    void AddRef() { references.fetch_add(1, std::memory_order_relaxed); }
    // On the player's thread only.
    void Release();
    // Marks it: not mixed any more, and unlinked by the next purge.
    void Stop() { removed.store(true, std::memory_order_relaxed); }
    bool Removed() const { return removed.load(std::memory_order_relaxed); }
    bool StreamEnded() const { return ended.load(std::memory_order_acquire); }
    bool Waiting() const { return waiting.load(std::memory_order_acquire); }
    // How many of the stream's picture frames have been heard: rounded, so a frame counts from its
    // middle on, and carried on by the clock for up to 63 ms after a buffer was completed, unless
    // the stream waits.
    S32 ElapsedFrames() const;
    // Milliseconds since a buffer of it was completed, or since it was added.
    S32 SinceHeard() const;

private:
    friend class CSoundMix;

    ~CSoundChannel();
    CSoundChannel(const CSoundChannel&) = delete;
    CSoundChannel& operator=(const CSoundChannel&) = delete;

    // Whether anything would be heard; an event sound then stands at its beginning.
    bool Start();
    // A stream's counts start at that time.
    void StartCounting(S32 milliseconds);
    bool MakeDecomp();
    // The next buffer's worth in the output's format into `out`, which holds 4096 samples; null:
    // not heard, goes on all the same. `budget`: what passing over samples may still cost.
    void Render(S16* out, U8 outFormat, S32 index, S32* budget);
    // Counts the buffer as heard at that time.
    void Complete(S32 index, S32 milliseconds);

    void FillStream(U8* out, S32 frames, S32 index);
    void FillEvent(U8* out, S32 frames, S32* budget);
    void NextBlock();
    bool Restart(S32* budget);
    bool PassOver(S32* budget);
    void Decode(U8* out, S32 frames);
    void Silence(U8* out, S32 frames) const;
    void FadeIn(U8* out, S32 frames);
    void Output(S16* out, U8 outFormat, S32 frames);
    void Publish(S64 samples, S32 milliseconds);

    std::atomic<S32> references{1};
    std::atomic<bool> removed{false};
    std::atomic<bool> ended{false};   // the stream brings nothing more
    std::atomic<bool> waiting{false}; // the stream brings nothing for now
    std::atomic<U64> published{0};    // samples heard << 27 | time of the last completed buffer, ms
    CSoundHolder* owner = nullptr;    // of the bytes
    CSoundMix* mixer = nullptr;       // set while it plays and after
    CSoundChannel* next = nullptr;    // in the mixer's list, then in that of the purged
    S32 counts[kMostSoundBuffers]{};  // frames that each output buffer will count when complete
    bool silent = false;              // the stream's block is silence
    U64 envelopePosition = 0;         // samples at 44100 Hz
    S32 position = 0;                 // frames at the sound's rate, like the next four
    S32 start = 0;
    S32 end = 0;
    S32 passLeft = 0;  // still to be passed over before the first frame is heard
    S32 loopsLeft = 0; // this one included
    bool prepared = false;
    U32 startCost = 16;
    bool havePrevious = false;
    S16 previous[2]{}; // the last frame of the block before, in the sound's format
};
