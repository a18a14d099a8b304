#include "core/sound/mp3_decomp.h"

#include <cstring>

CMp3Decomp::CMp3Decomp(U8 format) : decoder(mp3decOpen())
{
    usable = decoder != nullptr;
    Reset(format);
}

CMp3Decomp::~CMp3Decomp()
{
    mp3decClose(decoder);
}

void CMp3Decomp::Reset(U8 format)
{
    usable = usable && mp3decReset(decoder, SoundChannels(format), SoundRate(format));
    frameBytes = SoundFrameBytes(format);
    filled = 0;
    readAt = 0;
}

void CMp3Decomp::Setup(const CSound* sound, bool reset)
{
    if (reset || SoundFrameBytes(sound->format) != frameBytes)
        Reset(sound->format);
    input = sound->data;
    inputLeft = sound->data && sound->dataLen > 0 ? sound->dataLen : 0;
    ended = false;
    if (sound->start > 0)
        Decompress(nullptr, sound->start);
}

// Moves up to so many bytes out of the buffer, to nowhere when `out` is null. Returns how many.
S64 CMp3Decomp::Serve(U8* out, S64 bytes)
{
    const S64 there = filled - readAt;
    const S64 count = bytes < there ? bytes : there;
    if (out && count > 0)
        std::memcpy(out, buffer + readAt, static_cast<size_t>(count));
    readAt += static_cast<S32>(count);
    return count;
}

// Hands the decoder more of the sound's data, or tells it that there is none. False when it takes
// none.
bool CMp3Decomp::Feed()
{
    if (inputLeft == 0) {
        mp3decSetInputEof(decoder);
        return true;
    }
    const S32 room = mp3decGetInputFree(decoder);
    const S32 size = room < inputLeft ? room : inputLeft;
    const S32 taken = size > 0 ? mp3decFill(decoder, input, size) : 0;
    input += taken;
    inputLeft -= taken;
    return taken > 0;
}

// Fills the empty buffer again. False when nothing comes any more.
bool CMp3Decomp::DecodeMore()
{
    filled = 0;
    readAt = 0;
    // Two rounds in a row without a byte in or out end it: a decoder that only gives notices
    // must not hold the caller for ever.
    for (S32 idle = 0; usable && !ended && filled == 0 && idle < 2;) {
        const U32 status = mp3decDecode(decoder, buffer, kBufferSize, &filled);
        bool moved = filled > 0;
        // The end of the last block is not that of a stream: new data goes in all the same.
        if (status == kMp3NeedInput || (status == kMp3Ended && inputLeft > 0))
            moved = Feed();
        else if (status == kMp3Ended)
            ended = true;
        else if (status != kMp3Ok && (status < kMp3NewFormat || status > kMp3LastNotice))
            usable = false; // freed with this object: memory is not given back while playing
        idle = moved ? 0 : idle + 1;
    }
    return filled > 0;
}

S32 CMp3Decomp::Decompress(void* out, S32 count)
{
    if (count <= 0)
        return 0;
    U8* to = static_cast<U8*>(out);
    const S64 want = S64(count) * frameBytes;
    S64 done = Serve(to, want);
    while (done < want && DecodeMore())
        done += Serve(to ? to + done : nullptr, want - done);
    if (to && done < want)
        std::memset(to + done, 0, static_cast<size_t>(want - done));
    return static_cast<S32>(done / frameBytes);
}

S32 CMp3Decomp::GetBufferedData(void* out, S32 count)
{
    if (count <= 0)
        return 0;
    return static_cast<S32>(Serve(static_cast<U8*>(out), S64(count) * frameBytes) / frameBytes);
}
