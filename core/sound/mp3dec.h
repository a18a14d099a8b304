// mp3dec: one MPEG audio decoder (layer III) behind a few operations, so that another library can
// take its place. A build may have none: then mp3decPresent is false and mp3decOpen gives null.
#pragma once

#include "core/geom/types.h"

// What mp3decDecode says.
enum SMp3Status : U32 {
    kMp3Ok = 0,
    kMp3NewFormat = 0x41010000,  // the stream has told its format; nothing came out yet
    kMp3LastNotice = 0x41010002, // numbers up to here are no reason to stop
    kMp3NeedInput = 0x81010001,  // nothing more comes out until mp3decFill
    kMp3Ended = 0x81010004,      // the same, and mp3decSetInputEof was called
    kMp3Failed = 0x8101FFFF,     // it cannot go on; also after 128 KiB of junk, less between frames
};

// A decoder, used by one thread at a time.
struct SMp3Decoder;

bool mp3decPresent();
// A new decoder, closed by the caller; null when there is none. To be reset before anything else.
SMp3Decoder* mp3decOpen();
// Back to the beginning of a stream: input and all that is remembered of earlier frames is
// forgotten. The output is 16-bit native, of 1 or 2 channels, whatever the stream has; its rate is
// the stream's. `rate` is what is expected of that, in Hz: frames of the size that goes with it
// are decoded, others are junk. Memory for them is allocated by the first reset that names such a
// rate, and by nothing else. False: it cannot go on.
bool mp3decReset(SMp3Decoder* decoder, S32 channels, S32 rate);
// Decodes up to `size` bytes, a multiple of 4, into `out`, and stores how many in `*got`.
U32 mp3decDecode(SMp3Decoder* decoder, void* out, S32 size, S32* got);
// How many bytes of input can be taken now: 0 while enough is waiting to be decoded.
S32 mp3decGetInputFree(const SMp3Decoder* decoder);
// Copies input, up to what is free, and takes back the end of input. Returns how many bytes.
S32 mp3decFill(SMp3Decoder* decoder, const U8* data, S32 size);
// No more input comes for now.
void mp3decSetInputEof(SMp3Decoder* decoder);
// Frees it; null is allowed.
void mp3decClose(SMp3Decoder* decoder);
