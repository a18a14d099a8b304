// The headless shell: the smallest complete one. A hand-cranked clock, a drawing area of a given
// size, movies fed by the caller, and pictures read straight from the player's bits. The command
// line and the tests run on it.
#pragma once

#include "core/player/player.h"
#include "core/player/stream_data.h"
#include "platform/headless/host_requests.h"

#include <string>
#include <vector>

class NativeSoundMix;

// The hand-cranked clock behind real_time_clock_usecs(): one for the process, starts at 0.
void SetHeadlessClock(S64 usecs);
void AdvanceHeadlessClock(S64 usecs);

class NativePlayerWnd : public SPlayer {
public:
    // A drawing area of width x height pixels; 0 x 0 takes the movie's own size when its header
    // arrives.
    NativePlayerWnd(S32 width, S32 height);
    ~NativePlayerWnd() override;

    // Bytes of the root movie, in any portions; then the end of the stream. Bytes of a movie that
    // has been unloaded meanwhile are ignored.
    void Feed(const U8* data, size_t n);
    void EndOfData();

    // The file that Feed's bytes are from: what the movie names is looked for around it, and it may
    // read what lies there. Before any data; without it the movie reaches nothing.
    void SetMovieFile(const std::string& path);
    // Wider permission for movies: the network, and the files of a folder; false when it is none.
    void AllowNet() { requests.policy.AllowNet(); }
    bool AllowDir(const std::string& dir) { return requests.policy.AllowDir(dir); }
    // Brings what movies have asked for. Tick begins with it; without ticks, as after ControlOpen,
    // the caller does it.
    void Deliver();
    // The movie that was fed last has unloaded itself while it was: what comes now is another's.
    bool FedMovieLeft() const { return fedLeft; }
    // What movies have asked for, in order: all of it, refused or not.
    const std::vector<HostRequest>& Requests() const { return requests.All(); }

    // Picture 1 is on the screen: frame 0 has been shown.
    bool Started() const { return loaded != 0; }
    // The next tick can show what it should: the root timeline has the data of its next frame, or
    // needs none, or its data is not Feed's. A movie that has unloaded itself may be ticked.
    bool CanTick() const;
    // Delivers, advances the clock by one frame delay, has the mixer play as far as that, and plays
    // one tick.
    void Tick();
    // Its sounds go to that mixer, which must outlive it; before any data.
    void PlayThrough(NativeSoundMix* mix);
    // A timeline has a streaming sound, which wants to read ahead of the picture.
    bool HasStream() const;
    // From now on nothing is painted, and Picture has nothing to give: for those who only listen.
    void StopPainting();
    // The pixels as the last tick left them; brings the screen up to date first. Null without
    // pixels.
    const CBitBuffer* Picture();
    // A background colour that no movie overrides; alpha 0 makes the picture transparent.
    void OverrideBackground(SRGB color);

    S32 Width() const { return width; }
    S32 Height() const { return height; }
    bool TimerRuns() const { return timerRuns; }
    S32 TimerInterval() const { return timerInterval; }

    bool StartTimer(S32 interval, S32 cursorInterval) override;
    void StopTimer() override;
    void InvalidateScreenArea(const SRECT* r) override;
    void ClientRect(SRECT* r) override;
    void AdjustWindow(S32 width, S32 height) override;
    void BltToScreen(const SRECT* r) override;
    void ClearScreen() override;
    void StreamPostURLNotify(const char* url, const char* target, U32 length, const char* data,
                             void* notifyData) override;
    void StreamGetURLNotify(const char* url, const char* target, void* notifyData) override;
    void CloseStream(StreamData* stream) override;
    void ProcessFSCommand(const char* command, const char* args) override;
    void EnableMenus(const MenuStatus& status) override;
    void UpdateCursor() override;
    void GetUnixFontData(U8** data, S32* size) override;

    SRECT blitted;     // union of what BltToScreen was asked to show since the caller emptied it
    SRECT invalidated; // the same for InvalidateScreenArea

private:
    void StartFeeding();

    S32 width;
    S32 height;
    bool ownSize; // the area follows the movie
    bool sizeReported = false;
    bool startedOnce = false; // the movie that was fed, or one in its place
    bool feeding = false;     // a movie is being fed, wanted or not
    bool fedLeft = false;     // its own actions have unloaded it
    StreamData fed;
    std::string movieURL;
    HostRequests requests{this};
    bool paints = true;
    NativeSoundMix* mixer = nullptr; // not owned; null: Tick has none to pump
    bool timerRuns = false;
    S32 timerInterval = 0;
};
