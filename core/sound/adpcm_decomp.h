// CAdpcmDecomp: 2 to 5 bits a sample, as differences in steps that adapt.
#pragma once

#include "core/sound/decomp.h"

// The data is one string of bits, most significant first: 2 bits with the code size minus 2, then
// blocks of 4096 frames. The first frame of a block is stored whole, with the index of its step, a
// channel after the other; each further one is a code for each channel. The steps are those of the
// published IMA ADPCM table. A frame whose bits are not all there is left out.
class CAdpcmDecomp : public CSoundDecomp {
public:
    // Every block of a stream is a string of its own: `reset` makes no difference.
    void Setup(const CSound* sound, bool reset) override;
    S32 Decompress(void* out, S32 count) override;

private:
    struct SVoice {
        S32 sample = 0;
        S32 index = 0; // of the step, 0..88
    };

    S64 BitsLeft() const { return S64(end - next) * 8 + spareCount; }
    U32 ReadBits(S32 n);
    void PassBits(S64 n);
    S32 PassBlocks(S32 frames);
    S32 ReadHeader(S16* out);
    S32 ReadCodes(S16* out, S32 count);
    void ApplyCode(SVoice* voice, S32 code) const;

    const U8* next = nullptr; // first byte not yet fetched
    const U8* end = nullptr;
    U32 spare = 0;      // its low spareCount bits are fetched and unread
    S32 spareCount = 0; // 0..7 between reads
    S32 channels = 1;
    S32 codeSize = 2;  // bits of a code, 2..5
    S32 blockLeft = 0; // frames of the current block yet to come; 0: a header is next
    SVoice voices[2];
};
