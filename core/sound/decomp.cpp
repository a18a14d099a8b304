#include "core/sound/decomp.h"

#include <new>

#include "core/sound/adpcm_decomp.h"
#include "core/sound/mp3_decomp.h"
#include "core/sound/pcm_decomp.h"

CSoundDecomp* CreateDecompressor(U8 format)
{
    switch (format & kSoundCompression) {
    case kSoundPlain:
    case kSoundPlainLittle:
        return new (std::nothrow) CPCMDecomp;
    case kSoundAdpcm:
        return new (std::nothrow) CAdpcmDecomp;
    case kSoundMpeg:
        return mp3decPresent() ? new (std::nothrow) CMp3Decomp(format) : nullptr;
    default:
        return nullptr;
    }
}
