// The sound's part in the tick: what the mixer needs done, and timelines with a streaming sound,
// which wait for what is heard, or catch up with it.
#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/sound/sound_mix.h"

#include <algorithm>

namespace {
constexpr S32 kMostIdle = 43;     // buffers without a sound after which the device is closed: 2 s
constexpr S32 kDeviceDead = 1000; // ms without a buffer after which a device paces nothing
} // namespace

CSoundMix* SPlayer::theSoundMix = nullptr;

// Also in ticks that hold the picture: what is made ready here is heard meanwhile.
void SPlayer::TendSounds()
{
    if (!scene.soundMix)
        return;
    for (ScriptThread* thread = scene.threads; thread; thread = thread->nextThread)
        thread->TendStream();
    scene.soundMix->PurgeList();
    if (scene.soundMix->IdleCount() > kMostIdle)
        scene.soundMix->CloseDevice();
}

// A device that is open may stop asking for buffers, or never ask at all. The picture goes on by
// the clock then, and waits for the sound again once that goes on.
bool SPlayer::KeepsTime(const ScriptThread* thread)
{
    return thread->StreamPlays() && thread->streamChannel->SinceHeard() <= kDeviceDead;
}

// The newest timeline with a stream decides, whichever movie it belongs to. A stream that waits for
// data decides nothing: the others must not wait with it.
SPlayer::SoundPace SPlayer::PaceOfSound() const
{
    for (const ScriptThread* thread = scene.threads; thread; thread = thread->nextThread) {
        if (!KeepsTime(thread) || thread->streamChannel->Waiting())
            continue;
        const S64 ahead =
            static_cast<S64>(thread->streamChannel->ElapsedFrames()) - thread->curFrame;
        return {thread, static_cast<S32>(std::min<S64>(ahead, std::max(gLimits.framesPerTick, 1)))};
    }
    return {nullptr, 1};
}

// A timeline that does not set the pace waits while it is ahead of its own sound.
bool SPlayer::WaitsForSound(const ScriptThread* thread) const
{
    return KeepsTime(thread) && thread->streamChannel->ElapsedFrames() < thread->curFrame;
}

void SPlayer::SilenceThreads()
{
    for (ScriptThread* thread = scene.threads; thread; thread = thread->nextThread)
        thread->Silence();
    if (scene.soundMix)
        scene.soundMix->RemoveTagged(scene.soundTag);
}
