// CMp3Frames: the frames in a string of bytes that ought to be MPEG audio, layer III.
#pragma once

#include "core/geom/types.h"

// Holds the input that waits to be decoded and cuts it at the frames' headers, so that a decoder
// only ever sees whole frames of one kind. The first bytes may be a frame alone; later ones, and
// those after junk, count when another follows. A frame of another length in samples than expected,
// or of another version or rate than the first, is junk. So much junk may come, a store that frames
// fill up again; beyond that there is nothing any more. Allocates nothing.
class CMp3Frames {
public:
    // Forgets all input and the kind of frame. `full`: frames are of 1152 samples, else of 576.
    void Reset(bool full);
    // How many bytes Add takes now: 0 while enough is waiting.
    S32 Room() const { return end - begin < kEnough ? kAddSize : 0; }
    // Copies up to Room() bytes in. Returns how many.
    S32 Add(const U8* data, S32 size);
    // The next frame, in place until the next Add, with its size in bytes; null when there is none
    // until more is added.
    const U8* Next(S32* size);
    // There was too much junk.
    bool Spent() const { return junkLeft <= 0; }

private:
    bool Fits(const U8* header) const;
    bool Trusted(const U8* header, S32 length, bool* wait) const;

    static constexpr S32 kAddSize = 2048;
    static constexpr S32 kEnough = 4096; // more than two of the largest frames, 1441 bytes
    static constexpr S32 kMostJunk = 128 * 1024;
    static constexpr S32 kJunkPerByte = 4; // what a byte of a frame brings

    S32 begin = 0; // the bytes waiting are input[begin..end)
    S32 end = 0;
    S32 junkLeft = 0; // bytes that may still be junk
    bool expectFull = false;
    bool fresh = true;   // nothing was passed over or found yet
    bool inStep = false; // a frame ended where the next byte is
    U8 kind[2] = {};     // the bits of a header that all frames share; 0: none found yet
    U8 input[kEnough + kAddSize];
};
