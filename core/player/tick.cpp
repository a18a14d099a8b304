// The tick: what happens when the shell's timer fires.
#include "core/player/limits.h"
#include "core/player/player.h"

// When a stream sets the pace, the picture waits for it or catches up, and the clock has no say.
void SPlayer::DoPlay(int checkTime)
{
    if (!loaded || actionDepth > 0)
        return;
    const S32 now = PlayerClock();
    TendSounds();
    const SoundPace pace = PaceOfSound();
    if (pace.frames < 1)
        return;
    if (pace.thread == nullptr && checkTime && !FrameIsDue(now))
        return;
    nextFrameTime = now + frameDelay;
    scene.ResetBudget();
    U64 spent = 0; // by the runs of all these frames; the frames left come in the next tick
    for (S32 i = 0; i < pace.frames && spent <= gLimits.workPerRun; i++) {
        AdvanceThreads(pace.thread);
        const U64 before = scene.work;
        DoActions();
        spent += scene.work - before;
    }
    RetestButtons();
    FollowFocus();
    UpdateScreen();
    if (autoQuality)
        AdjustQuality(ClockElapsed(PlayerClock(), now), pace.frames);
}

// Only a time that lies ahead by no more than a frame is to be waited for. Any other has passed,
// however long ago: the clock goes around once in 37 hours.
bool SPlayer::FrameIsDue(S32 now) const
{
    const S32 left = ClockElapsed(nextFrameTime, now);
    return left == 0 || left > frameDelay;
}

// Newest first: sprites come before their parents. A timeline that starts during the walk goes to
// the front of the list, behind the cursor, and waits for the next frame. `pace` is only compared:
// it may be gone by now.
void SPlayer::AdvanceThreads(const ScriptThread* pace)
{
    scene.threadCursor = scene.threads;
    while (scene.threadCursor != nullptr) {
        ScriptThread* thread = scene.threadCursor;
        scene.threadCursor = thread->nextThread;
        if (thread == pace || !WaitsForSound(thread))
            thread->DoFrame(1, false);
    }
}
