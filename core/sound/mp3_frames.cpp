#include "core/sound/mp3_frames.h"

#include <algorithm>
#include <cstring>

static constexpr S32 kHeaderSize = 4;
// Bits of a header's second and third byte that stay the same in a stream: the version, the layer
// and the rate.
static constexpr U8 kKindBits[2] = {0x1E, 0x0C};
static constexpr U8 kLayer3 = 0x02;

// The size of the frame with this header in bytes; 0 when it is none, or not of layer III, or does
// not tell its size.
static S32 FrameSize(const U8* header)
{
    static constexpr S32 fullRates[4] = {44100, 48000, 32000, 0};
    static constexpr S16 kilobits[2][16] = {
        {0, 8, 16, 24, 32, 40, 48, 56, 64, 80, 96, 112, 128, 144, 160, 0},
        {0, 32, 40, 48, 56, 64, 80, 96, 112, 128, 160, 192, 224, 256, 320, 0}};
    const S32 version = header[1] >> 3 & 3; // 0: a quarter of the full rates, 2: a half, 3: full
    if (header[0] != 0xFF || header[1] < 0xE0 || version == 1 || (header[1] & 0x06) != kLayer3)
        return 0;
    const bool full = version == 3;
    const S32 rate = fullRates[header[2] >> 2 & 3] >> (full ? 0 : version == 2 ? 1 : 2);
    const S32 bits = kilobits[full][header[2] >> 4] * 1000;
    if (rate == 0 || bits == 0)
        return 0;
    return (full ? 144 : 72) * bits / rate + (header[2] >> 1 & 1);
}

static bool SameKind(const U8* a, const U8* b)
{
    return ((a[0] ^ b[0]) & kKindBits[0]) == 0 && ((a[1] ^ b[1]) & kKindBits[1]) == 0;
}

static bool IsFull(const U8* header)
{
    return (header[1] & 0x18) == 0x18;
}

void CMp3Frames::Reset(bool full)
{
    begin = 0;
    end = 0;
    junkLeft = kMostJunk;
    expectFull = full;
    fresh = true;
    inStep = false;
    kind[0] = 0;
}

S32 CMp3Frames::Add(const U8* data, S32 size)
{
    const S32 room = Room();
    const S32 count = size < room ? size : room;
    if (count <= 0)
        return 0;
    std::memmove(input, input + begin, static_cast<size_t>(end - begin));
    end -= begin;
    begin = 0;
    std::memcpy(input + end, data, static_cast<size_t>(count));
    end += count;
    return count;
}

bool CMp3Frames::Fits(const U8* header) const
{
    return IsFull(header) == expectFull && (kind[0] == 0 || SameKind(header + 1, kind));
}

// Whether what looks like a frame is one, as far as what follows it tells. Sets `*wait` when that
// is still to come.
bool CMp3Frames::Trusted(const U8* header, S32 length, bool* wait) const
{
    const S32 waiting = end - begin;
    *wait = waiting < length || (!inStep && !fresh && waiting < length + kHeaderSize);
    if (*wait || inStep || waiting < length + kHeaderSize)
        return !*wait;
    const U8* following = header + length;
    return FrameSize(following) > 0 && SameKind(header + 1, following + 1);
}

const U8* CMp3Frames::Next(S32* size)
{
    for (; end - begin >= kHeaderSize && !Spent(); ++begin, --junkLeft) {
        const U8* header = input + begin;
        const S32 length = FrameSize(header);
        bool wait = false;
        if (length > 0 && Fits(header) && Trusted(header, length, &wait)) {
            std::memcpy(kind, header + 1, sizeof kind);
            begin += length;
            junkLeft = std::min(junkLeft + length * kJunkPerByte, kMostJunk);
            fresh = false;
            inStep = true;
            *size = length;
            return header;
        }
        if (wait)
            return nullptr;
        fresh = false;
        inStep = false;
    }
    return nullptr;
}
