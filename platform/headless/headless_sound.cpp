#include "platform/headless/headless_sound.h"

#include "core/player/player.h"

namespace {

constexpr S64 kRate = 44100;
constexpr S64 kSecond = 1000000; // microseconds
constexpr S64 kLongestJump = 3600 * kSecond;
const S16 kSilence[2 * kSoundBufferFrames] = {};

void AppendTo(void* context, const S16* samples, S32 frames)
{
    GrowBuffer<S16>* recording = static_cast<GrowBuffer<S16>*>(context);
    const size_t before = recording->size();
    const size_t count = size_t(frames) * 2;
    if (recording->Resize(before + count))
        std::memcpy(recording->data() + before, samples, count * sizeof(S16));
}

} // namespace

NativeSoundMix::NativeSoundMix()
{
    Construct();
    Anchor();
}

NativeSoundMix::~NativeSoundMix()
{
    Destruct();
}

void NativeSoundMix::Listen(Writer writer, void* context)
{
    write = writer;
    writeContext = context;
    Anchor();
}

void NativeSoundMix::Record()
{
    recording.Clear();
    Listen(AppendTo, &recording);
}

void NativeSoundMix::Anchor()
{
    origin = real_time_clock_usecs();
    played = 0;
}

// Rounded up, so that a buffer is never mixed before it has passed.
S64 NativeSoundMix::EndOf(S64 buffer) const
{
    return origin + ((buffer + 1) * kSoundBufferFrames * kSecond + kRate - 1) / kRate;
}

void NativeSoundMix::Pump()
{
    const S64 now = real_time_clock_usecs();
    const S64 ahead = now - EndOf(played - 1);
    if (ahead < -1 || ahead > kLongestJump)
        Anchor();
    for (; EndOf(played) <= now; played++)
        Play(played);
}

void NativeSoundMix::Play(S64 buffer)
{
    pumpTime = EndOf(buffer);
    const S16* samples = open ? PlayBuffer(0) : nullptr;
    pumpTime = -1;
    if (write)
        write(writeContext, samples ? samples : kSilence, kSoundBufferFrames);
}

void NativeSoundMix::BuildAndWrite(CSoundHeader* header, bool silent)
{
    if (silent)
        SilenceBuffer(header->index);
    else
        BuildBuffer(header->index);
}

void NativeSoundMix::GetNativeSoundCap(U8* format)
{
    *format = 15;
}

bool NativeSoundMix::OpenNativeDevice(CSound*)
{
    open = !refuseDevice;
    return open;
}

S32 NativeSoundMix::Clock()
{
    if (pumpTime < 0)
        return PlayerClock();
    return static_cast<S32>((pumpTime / 1000) & 0x7FFFFFF);
}
