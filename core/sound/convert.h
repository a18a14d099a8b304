// Blocks of decoded samples from one format into another, and envelopes on them. All in place:
// nothing here allocates, and a block needs room for the larger of its two formats.
#pragma once

#include "core/sound/sound.h"

// A corner of an envelope.
struct SEnvelopePoint {
    U32 position = 0; // samples at 44100 Hz
    U16 left = 0;     // 32768 is full
    U16 right = 0;
};

constexpr S32 kFullLevel = 32768;

// A piece of an envelope: levels go straight from one corner to the other. Corners at one position
// are a level that stays: the first one's.
struct SSoundRamp {
    SEnvelopePoint from, to;
    U32 offset; // the first frame's distance from `from`, in samples at 44100 Hz
    U32 step;   // from one frame to the next, in the same
};

// Turns `frames` frames at `block` from one format into another; compression bits do not matter.
// The rate comes first, then the size of the samples, then mono or stereo. `previous`: the frame
// before the block, in the format `from`, aligned like the block. Returns how many frames came out.
S32 ConvertSound(void* block, U8 from, U8 to, S32 frames, const void* previous);

// Twice the rate: before each frame comes its average with the one before it, which for the first
// one is `previous`. Averages are (a + b) >> 1.
void Cvt8RateMul2(U8* samples, S32 frames, S32 channels, const U8* previous);
void Cvt16RateMul2(S16* samples, S32 frames, S32 channels, const S16* previous);
// Half the rate: the averages of pairs; an odd frame at the end goes.
void Cvt8RateDiv2(U8* samples, S32 frames, S32 channels);
void Cvt16RateDiv2(S16* samples, S32 frames, S32 channels);

// Scales `frames` frames of a decoded format by the levels of an envelope, whose corners should be
// in the order of their positions; `position`: that of the first frame, in samples at 44100 Hz.
// Before the first corner its level holds, after the last one that one's. A mono sound gets the
// average of both levels. A sample becomes sample * level >> 15 (8-bit ones about 128), clipped.
void ApplyEnvelope(void* block, U8 format, S32 frames, const SEnvelopePoint* points, S32 numPoints,
                   U64 position);
// The same on a run that lies between two corners. Levels are rounded toward the first one.
void ApplyRamp8(U8* samples, S32 frames, S32 channels, const SSoundRamp& ramp);
void ApplyRamp16(S16* samples, S32 frames, S32 channels, const SSoundRamp& ramp);
