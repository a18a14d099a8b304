#include "core/player/player.h"
#include "core/stream/str.h"

#include <cstdio>

#include "core/player/action_runner.h"

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
    scene.splayer = this;
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
    for (ScriptThread* thread = scene.threads; thread != nullptr; thread = thread->nextThread)
        if (thread->IsRoot())
            thread->player->stream = nullptr;
    FreeLayers();
    for (ScriptPlayer* loader = loaders; loader != nullptr; loader = loader->nextLayer)
        loader->stream = nullptr;
    ForgetRequests();
    FreeStr(baseURL);
    scene.SetBits(nullptr);
    scene.splayer = nullptr;
    splayer = nullptr;
}

void SPlayer::Run()
{
    suspended = 0;
    StartTicks();
}

// Before the first frame is there nobody knows how fast to tick: the loader calls this then.
void SPlayer::StartTicks()
{
    if (suspended)
        SilenceThreads(); // the first frame may have started sounds
    if (running || suspended || !loaded)
        return;
    // Only a negative quotient is corrected: very fast movies ask for an interval of 0.
    const S32 interval = frameDelay / kTimerShare;
    nextFrameTime = PlayerClock();
    running = StartTimer(interval < 0 ? 1 : interval, kCursorInterval);
}

void SPlayer::Suspend()
{
    suspended = 1;
    StopTicks();
}

// Sounds may play without ticks too: those of the first frame, and of one that was gone to.
void SPlayer::StopTicks()
{
    if (running && !sharedTimer)
        StopTimer();
    running = 0;
    SilenceThreads();
}

void SPlayer::ClearScript()
{
    StopTicks();
    FreeLayers();
    EndCalls(&scene.calls);
    scene.actions.Clear();
    actionsAborted = false;
    cameraWaits = false;
    ForgetInput();
    RectSetEmpty(&zoomRect);
    loaded = 0;
    slowTicks = fastTicks = sampledTicks = 0;
    refusedSize = {}; // there is memory again
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
