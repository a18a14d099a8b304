// CSoundDecomp: sound data into samples.
#pragma once

#include "core/sound/sound.h"

// One decoder of one playing sound; owned by its channel, used by one thread at a time. Samples
// come out in the sound's decoded format: frames of one or two channels, 16-bit samples native.
class CSoundDecomp {
public:
    virtual ~CSoundDecomp() = default;

    // Goes to the beginning of `sound`, which must stay until the next Setup. With `reset` nothing
    // of an earlier sound is remembered; without, an MPEG decoder goes on across the blocks of a
    // stream. Allocates nothing, unless the format is not the one that it was created for.
    virtual void Setup(const CSound* sound, bool reset) = 0;
    // The next `count` frames into `out`, or passed over when it is null. Returns how many there
    // were: fewer than asked for at the end of the data, never more. Allocates nothing.
    virtual S32 Decompress(void* out, S32 count) = 0;

protected:
    CSoundDecomp() = default;
    CSoundDecomp(const CSoundDecomp&) = delete;
    CSoundDecomp& operator=(const CSoundDecomp&) = delete;
};

// A decoder for a format's compression, made by new; null for an unknown compression and for one
// that this build leaves out: the sound is not played. The other bits tell an MPEG decoder for what
// it allocates.
CSoundDecomp* CreateDecompressor(U8 format);
