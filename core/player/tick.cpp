// The tick: what happens when the shell's timer fires.
#include "core/player/player.h"

namespace {

// Half of the clock's range: what lies less than that behind is due, the rest is yet to come.
constexpr S32 kClockHalf = 0x4000000;

// Samples before the automatic quality decides at all, and ticks between two of its switches.
constexpr int kLeastSamples = 5;
constexpr int kLeastHold = 11;

} // namespace

void SPlayer::DoPlay(int checkTime)
{
    if (!loaded || actionDepth > 0)
        return;
    const S32 now = PlayerClock();
    if (checkTime && ClockElapsed(now, nextFrameTime) >= kClockHalf)
        return;
    nextFrameTime = now + frameDelay;
    scene.ResetBudget();
    AdvanceThreads();
    DoActions();
    UpdateScreen();
    if (autoQuality)
        AdjustQuality(ClockElapsed(PlayerClock(), now), 1);
}

// Newest first: sprites come before their parents. A timeline that starts during the walk goes to
// the front of the list, behind the cursor, and waits for the next tick.
void SPlayer::AdvanceThreads()
{
    scene.threadCursor = scene.threads;
    while (scene.threadCursor != nullptr) {
        ScriptThread* thread = scene.threadCursor;
        scene.threadCursor = thread->nextThread;
        thread->DoFrame(1, false);
    }
}

// The place where the queue of actions will be run; movies have none yet.
void SPlayer::DoActions() {}

// The counters are never reset: the rule works on all ticks since the movie was opened.
void SPlayer::AdjustQuality(S32 elapsed, S32 framesPlayed)
{
    if (elapsed > frameDelay || framesPlayed >= 2)
        slowTicks++;
    else if (elapsed < frameDelay / 4)
        fastTicks++;
    sampledTicks++;
    if (sampledTicks >= kLeastSamples && qualityHold >= kLeastHold) {
        const int ticks = highQuality ? slowTicks : fastTicks;
        if (3 * ticks > sampledTicks) {
            highQuality = !highQuality;
            qualityHold = 0;
            SetCamera(2);
        }
    }
    qualityHold++;
}
