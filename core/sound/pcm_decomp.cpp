#include "core/sound/pcm_decomp.h"

#include <cstring>

void CPCMDecomp::Setup(const CSound* sound, bool)
{
    frameBytes = SoundFrameBytes(sound->format);
    sampleBytes = frameBytes / SoundChannels(sound->format);
    next = sound->data;
    framesLeft = sound->data && sound->dataLen > 0 ? sound->dataLen / frameBytes : 0;
}

static void CopyLittle16(S16* out, const U8* in, S32 samples)
{
    for (S32 i = 0; i < samples; ++i)
        out[i] = static_cast<S16>(in[2 * i] | in[2 * i + 1] << 8);
}

S32 CPCMDecomp::Decompress(void* out, S32 count)
{
    const S32 frames = count < framesLeft ? count : framesLeft;
    if (frames <= 0)
        return 0;
    const S32 bytes = frames * frameBytes;
    if (out && sampleBytes == 2)
        CopyLittle16(static_cast<S16*>(out), next, bytes / 2);
    else if (out)
        std::memcpy(out, next, static_cast<size_t>(bytes));
    next += bytes;
    framesLeft -= frames;
    return frames;
}
