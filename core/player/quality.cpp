// Quality: as asked for, or by the speed that the player measures.
#include "core/player/player.h"

namespace {

// Samples before the automatic quality decides at all, and ticks between two of its switches.
constexpr int kLeastSamples = 5;
constexpr int kLeastHold = 11;

} // namespace

void SPlayer::SetQuality(int level)
{
    highQuality = level > 0;
    bestQuality = level >= 2;
    autoQuality = 0;
    ShowQuality();
}

// A change of quality concerns every object and the shell: one that a script makes waits for the
// end of the run, however often it is made.
void SPlayer::ShowQuality()
{
    if (actionDepth > 0)
        cameraWaits = true;
    else
        SetCamera(2);
}

// The three counts are not set back by a switch: the rule works on all ticks since the movie was
// opened.
void SPlayer::AdjustQuality(S32 elapsed, S32 framesPlayed)
{
    if (elapsed > frameDelay || framesPlayed >= 2)
        slowTicks++;
    else if (elapsed < frameDelay / 4)
        fastTicks++;
    sampledTicks++;
    if (sampledTicks >= kLeastSamples && qualityHold >= kLeastHold) {
        const S64 ticks = highQuality ? slowTicks : fastTicks;
        if (3 * ticks > sampledTicks) {
            highQuality = !highQuality;
            qualityHold = 0;
            SetCamera(2);
        }
    }
    qualityHold++;
}
