// CPCMDecomp: samples that lie in the data as they are.
#pragma once

#include "core/sound/decomp.h"

// 8-bit samples unsigned, 16-bit ones little-endian whatever the machine. Passing over costs
// nothing. An incomplete frame at the end of the data is left out.
class CPCMDecomp : public CSoundDecomp {
public:
    void Setup(const CSound* sound, bool reset) override;
    S32 Decompress(void* out, S32 count) override;

private:
    const U8* next = nullptr; // first byte of the next frame
    S32 framesLeft = 0;       // whole frames from there on
    S32 frameBytes = 1;       // bytes of one, in the data as in the output
    S32 sampleBytes = 1;      // 1 or 2
};
