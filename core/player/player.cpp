#include "core/player/player.h"

#include <cstdio>

namespace {

constexpr S32 kCursorInterval = 400; // milliseconds between two looks at the cursor
constexpr S32 kTimerShare = 10;      // timer periods in a frame

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
    scene.soundMix = theSoundMix;
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
    if (!sharedTimer)
        StopTimer();
    running = 0;
    SilenceThreads();
}

void SPlayer::ClearScript()
{
    Suspend();
    FreeLayers();
    RectSetEmpty(&zoomRect);
    loaded = 0;
    if (hostCamera)
        return;
    SetCamera(2);
}

void SPlayer::SetVersionVariable(ScriptPlayer* movie)
{
    char text[32];
    std::snprintf(text, sizeof text, "%s %s", "BeOS", "4.1013");
    movie->SetVariable("$version", text, 0);
}
