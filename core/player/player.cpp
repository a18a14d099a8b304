#include "core/player/player.h"
#include "core/stream/tags.h"

#include <cstdio>

namespace {

constexpr S32 kCursorInterval = 400; // milliseconds between two looks at the cursor
constexpr S32 kTimerShare = 10;      // timer periods in a frame

// Whether a tag other than the end's is there to be run next.
bool CanAdvance(const ScriptThread& timeline)
{
    STagWalker next(timeline, timeline.pos);
    return !timeline.atEnd && next.GetTag(timeline.len) > kTagEnd;
}

} // namespace

S32 PlayerClock()
{
    return static_cast<S32>((real_time_clock_usecs() / 1000) & 0x7FFFFFF);
}

SPlayer::SPlayer()
{
    splayer = this;
    display = &scene;
    RectSetEmpty(&zoomRect);
    RectSetEmpty(&screenDirty);
    scene.AddThread(this);
    scene.SetBits(&bits);
    startTime = PlayerClock();
    SetVersionVariable(this);
}

// The shell's part of the object is gone by now, so nothing here may call one of its operations: a
// shell clears the movie and closes its streams in its own destructor.
SPlayer::~SPlayer()
{
    running = 0;
    stream = nullptr;
    for (ScriptPlayer* movie = layers; movie != nullptr; movie = movie->nextLayer)
        movie->stream = nullptr;
    FreeLayers();
    scene.SetBits(nullptr);
    splayer = nullptr;
}

void SPlayer::Run()
{
    if (running)
        return;
    // Only a negative quotient is corrected: very fast movies ask for an interval of 0.
    const S32 interval = frameDelay / kTimerShare;
    if (!StartTimer(interval < 0 ? 1 : interval, kCursorInterval))
        return;
    running = 1;
    nextFrameTime = PlayerClock();
}

void SPlayer::Suspend()
{
    if (!running)
        return;
    StopTimer();
    running = 0;
}

void SPlayer::ClearScript()
{
    Suspend();
    FreeLayers();
    RectSetEmpty(&zoomRect);
    loaded = 0;
    ChooseCamera();
    CheckUpdate();
}

void SPlayer::SetVersionVariable(ScriptPlayer* movie)
{
    char text[32];
    std::snprintf(text, sizeof text, "%s %s", "BeOS", "4.1013");
    movie->SetVariable("$version", text, 0);
}

void SPlayer::GotoFrame(S32 target)
{
    if (actionDepth > 0) {
        Seek(target);
        return;
    }
    scene.ResetBudget();
    Seek(target);
    DoActions();
    CheckUpdate();
}

void SPlayer::GetMenuState(MenuStatus* status)
{
    const S32 movieLoaded = gotHeader && scriptErr == 0;
    const S32 several = numFrames > 1;
    const S32 beyondFirst = curFrame != 0;
    const S32 zoomed = !RectIsEmpty(&zoomRect);
    const S32 fixedScale = scaleMode == kScaleFixed;
    *status = {};
    status->canViewAll = status->canZoomIn = status->canZoomOut = movieLoaded;
    status->zoomed = zoomed;
    status->canPlay = status->canLoop = several;
    status->canRewind = status->canBack = beyondFirst;
    status->canForward = CanAdvance(*this);
    status->view100 = fixedScale;
    status->viewAll = !zoomed && !fixedScale;
    status->highQuality = highQuality;
    status->looping = loop;
    status->playing = playing;
}
