// The sound's part in the tick: a timeline with a streaming sound waits for what is heard, or
// catches up with it.
#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/sound/sound_channel.h"

#include <algorithm>

namespace {

// The streaming sound of a timeline, while it goes on and its samples count; null when there is
// none. Timelines have none yet.
const CSoundChannel* ActiveStream(const ScriptThread*)
{
    return nullptr;
}

} // namespace

// The newest timeline with a stream decides, whichever movie it belongs to.
SPlayer::SoundPace SPlayer::PaceOfSound() const
{
    for (const ScriptThread* thread = scene.threads; thread; thread = thread->nextThread) {
        const CSoundChannel* sound = ActiveStream(thread);
        if (sound == nullptr)
            continue;
        const S64 ahead = static_cast<S64>(sound->ElapsedFrames()) - thread->curFrame;
        return {thread, static_cast<S32>(std::min<S64>(ahead, gLimits.framesPerTick))};
    }
    return {nullptr, 1};
}

// A timeline that does not set the pace waits while it is ahead of its own sound.
bool SPlayer::WaitsForSound(const ScriptThread* thread) const
{
    const CSoundChannel* sound = ActiveStream(thread);
    return sound != nullptr && !sound->StreamEnded() && sound->ElapsedFrames() < thread->curFrame;
}

// The place where every timeline's stream ends and its sounds are taken from the mixer.
void SPlayer::SilenceThreads() {}
