// The sound's part in the tick: what the mixer needs done, and timelines with a streaming sound,
// which wait for what is heard, or catch up with it.
#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/sound/sound_mix.h"

#include <algorithm>

namespace {
constexpr S32 kMostIdle = 43; // buffers without a sound after which the device is closed: 2 s
}

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

// The newest timeline with a stream decides, whichever movie it belongs to. A stream that waits for
// data decides nothing: the others must not wait with it.
SPlayer::SoundPace SPlayer::PaceOfSound() const
{
    for (const ScriptThread* thread = scene.threads; thread; thread = thread->nextThread) {
        if (!thread->StreamPlays() || thread->streamChannel->Waiting())
            continue;
        const S64 ahead =
            static_cast<S64>(thread->streamChannel->ElapsedFrames()) - thread->curFrame;
        return {thread, static_cast<S32>(std::min<S64>(ahead, gLimits.framesPerTick))};
    }
    return {nullptr, 1};
}

// A timeline that does not set the pace waits while it is ahead of its own sound.
bool SPlayer::WaitsForSound(const ScriptThread* thread) const
{
    return thread->StreamPlays() && thread->streamChannel->ElapsedFrames() < thread->curFrame;
}

void SPlayer::SilenceThreads()
{
    for (ScriptThread* thread = scene.threads; thread; thread = thread->nextThread)
        thread->Silence();
}
