#include "core/sound/adpcm_decomp.h"

static constexpr S32 kBlockFrames = 4096;
static constexpr S32 kHeaderBits = 16 + 6; // a channel's sample and step index
static constexpr S32 kLastStep = 88;

static constexpr S16 kSteps[kLastStep + 1] = {
    7,     8,     9,     10,    11,    12,    13,    14,    16,    17,    19,   21,    23,
    25,    28,    31,    34,    37,    41,    45,    50,    55,    60,    66,   73,    80,
    88,    97,    107,   118,   130,   143,   157,   173,   190,   209,   230,  253,   279,
    307,   337,   371,   408,   449,   494,   544,   598,   658,   724,   796,  876,   963,
    1060,  1166,  1282,  1411,  1552,  1707,  1878,  2066,  2272,  2499,  2749, 3024,  3327,
    3660,  4026,  4428,  4871,  5358,  5894,  6484,  7132,  7845,  8630,  9493, 10442, 11487,
    12635, 13899, 15289, 16818, 18500, 20350, 22385, 24623, 27086, 29794, 32767};

// How the step moves after a code: a row for each code size from 2, by the code's magnitude.
static constexpr S8 kIndexMoves[4][16] = {
    {-1, 2},
    {-1, -1, 2, 4},
    {-1, -1, -1, -1, 2, 4, 6, 8},
    {-1, -1, -1, -1, -1, -1, -1, -1, 1, 2, 4, 6, 8, 10, 13, 16}};

static S32 Clamp(S32 value, S32 low, S32 high)
{
    return value < low ? low : value > high ? high : value;
}

void CAdpcmDecomp::Setup(const CSound* sound, bool)
{
    const bool any = sound->data && sound->dataLen > 0;
    next = sound->data;
    end = any ? next + sound->dataLen : next;
    spare = 0;
    spareCount = 0;
    blockLeft = 0;
    channels = SoundChannels(sound->format);
    codeSize = any ? static_cast<S32>(ReadBits(2)) + 2 : 2;
}

// A field of up to 16 bits that are known to be there.
U32 CAdpcmDecomp::ReadBits(S32 n)
{
    for (; spareCount < n; spareCount += 8)
        spare = spare << 8 | *next++;
    spareCount -= n;
    return spare >> spareCount & ((1u << n) - 1);
}

// Moves over bits that are known to be there.
void CAdpcmDecomp::PassBits(S64 n)
{
    n -= spareCount;
    next += n >> 3;
    spareCount = 0;
    ReadBits(static_cast<S32>(n & 7));
}

// Moves over blocks that lie whole within so many frames and within the data; the next block's
// header brings everything that is needed to go on. Returns the frames passed.
S32 CAdpcmDecomp::PassBlocks(S32 frames)
{
    const S64 blockBits = channels * (kHeaderBits + (kBlockFrames - 1) * codeSize);
    const S64 there = BitsLeft() / blockBits;
    const S64 wanted = frames / kBlockFrames;
    const S64 blocks = there < wanted ? there : wanted;
    if (blocks > 0)
        PassBits(blocks * blockBits);
    return static_cast<S32>(blocks) * kBlockFrames;
}

// The first frame of a block. Returns 1, or 0 at the end of the data.
S32 CAdpcmDecomp::ReadHeader(S16* out)
{
    if (BitsLeft() < channels * kHeaderBits)
        return 0;
    for (S32 c = 0; c < channels; ++c) {
        voices[c].sample = static_cast<S16>(ReadBits(16));
        voices[c].index = static_cast<S32>(ReadBits(6));
        if (out)
            out[c] = static_cast<S16>(voices[c].sample);
    }
    blockLeft = kBlockFrames - 1;
    return 1;
}

void CAdpcmDecomp::ApplyCode(SVoice* voice, S32 code) const
{
    const S32 sign = 1 << (codeSize - 1);
    const S32 magnitude = code & (sign - 1);
    S32 step = kSteps[voice->index];
    S32 delta = 0;
    for (S32 bit = sign >> 1; bit > 0; bit >>= 1) {
        if (magnitude & bit)
            delta += step;
        step >>= 1;
    }
    delta += step;
    const S32 sample = code & sign ? voice->sample - delta : voice->sample + delta;
    voice->sample = Clamp(sample, -32768, 32767);
    voice->index = Clamp(voice->index + kIndexMoves[codeSize - 2][magnitude], 0, kLastStep);
}

// Up to `count` frames of the current block after its first. Returns how many: 0 at the end of the
// data.
S32 CAdpcmDecomp::ReadCodes(S16* out, S32 count)
{
    const S64 there = BitsLeft() / (channels * codeSize);
    S32 frames = count < blockLeft ? count : blockLeft;
    frames = there < frames ? static_cast<S32>(there) : frames;
    for (S32 i = 0; i < frames; ++i) {
        for (S32 c = 0; c < channels; ++c) {
            ApplyCode(&voices[c], static_cast<S32>(ReadBits(codeSize)));
            if (out)
                *out++ = static_cast<S16>(voices[c].sample);
        }
    }
    blockLeft -= frames;
    return frames;
}

S32 CAdpcmDecomp::Decompress(void* out, S32 count)
{
    S16* to = static_cast<S16*>(out);
    S32 done = 0;
    while (done < count) {
        if (!out && blockLeft == 0)
            done += PassBlocks(count - done);
        if (done == count)
            break;
        S16* at = out ? to + S64(done) * channels : nullptr;
        const S32 frames = blockLeft == 0 ? ReadHeader(at) : ReadCodes(at, count - done);
        if (frames == 0)
            break;
        done += frames;
    }
    return done;
}
