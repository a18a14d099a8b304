// CSound: the data of one sound, and what its format byte says.
#pragma once

#include "core/geom/types.h"

// Bits of a format byte.
enum SSoundFormat : U8 {
    kSoundStereo = 0x01,      // else mono
    kSound16Bit = 0x02,       // signed 16-bit samples; else unsigned 8-bit, silence 128
    kSoundRateMask = 0x0C,    // 5512, 11025, 22050 or 44100 Hz
    kSoundCompression = 0xF0, // how the data is coded
};

// Values of the compression bits.
enum SSoundCompression : U8 {
    kSoundPlain = 0x00,
    kSoundAdpcm = 0x10,
    kSoundMpeg = 0x20,
    kSoundPlainLittle = 0x30,
};

// The format that decoders of this format put out: compressed sounds are 16-bit whatever their bit
// says, and a decoded block has no compression.
constexpr U8 DecodedFormat(U8 format)
{
    const U8 compression = format & kSoundCompression;
    const bool wide = compression == kSoundAdpcm || compression == kSoundMpeg;
    return U8((format & 0x0F) | (wide ? kSound16Bit : 0));
}

// Samples at 44100 Hz >> this are samples at the format's rate.
constexpr int SoundRateShift(U8 format)
{
    return 3 - ((format & kSoundRateMask) >> 2);
}

constexpr S32 SoundRate(U8 format)
{
    constexpr S32 rates[] = {5512, 11025, 22050, 44100};
    return rates[(format & kSoundRateMask) >> 2];
}

constexpr S32 SoundChannels(U8 format)
{
    return format & kSoundStereo ? 2 : 1;
}

// Bytes of one sample frame (a sample for each channel) once decoded.
constexpr S32 SoundFrameBytes(U8 format)
{
    return SoundChannels(format) * (DecodedFormat(format) & kSound16Bit ? 2 : 1);
}

// A sound's data, not owned: a sound definition's, or what a stream head describes. Whoever plays
// it sees to it that the bytes stay.
struct CSound {
    U8 format = 0;            // SSoundFormat bits
    S32 numSamples = 0;       // frames; of a stream: frames of sound in a picture frame
    const U8* data = nullptr; // null: none
    S32 dataLen = 0;          // bytes
    S32 start = 0;            // MPEG: frames to pass over at the beginning
    U64 movie = 0;            // whose definition it is; see SameSound

    // Back to no sound.
    void Init() { *this = CSound(); }
};

// Both come from one definition: its place in the data, in one movie's dictionary. Copies of a
// movie share their data, and still each has sounds of its own.
inline bool SameSound(const CSound& a, const CSound& b)
{
    return a.data == b.data && a.movie == b.movie;
}
