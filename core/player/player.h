// SPlayer: the player. It owns the root movie (it is itself the movie of level 0), the further
// levels, the display list and the screen pixels, and advances them by the clock.
#pragma once

#include "core/display/display_list.h"
#include "core/raster/bit_buffer.h"
#include "core/stream/script_player.h"

struct StreamData;

// The platform's microsecond clock: any origin, never goes backwards. Supplied by the shell.
S64 real_time_clock_usecs();

// Milliseconds of that clock in 27 bits, and the time from one such value to a later one.
S32 PlayerClock();
constexpr S32 ClockElapsed(S32 now, S32 then)
{
    return (now - then) & 0x7FFFFFF;
}

// What a shell's menus show; each 0 or 1.
struct MenuStatus {
    S32 canViewAll, canZoomIn, canZoomOut; // a movie is loaded
    S32 zoomed;
    S32 canPlay;    // more than one frame
    S32 canRewind;  // not at the first frame
    S32 canForward; // the root timeline can advance
    S32 canBack;    // not at the first frame
    S32 canLoop;    // more than one frame
    S32 view100;
    S32 viewAll;
    S32 highQuality;
    S32 looping;
    S32 playing;
};

// A shell subclasses this as NativePlayerWnd and calls everything from one thread. Virtual
// operations are what the core asks of the shell; none may call back into the player unless its
// contract says so. The shell's destructor calls ClearScript, while its operations still exist.
class SPlayer : public ScriptPlayer {
public:
    DisplayList scene;              // the display list; `display` of every thread points here
    ScriptPlayer* layers = nullptr; // levels 1 and up, through nextLayer, newest first
    CBitBuffer bits;                // the screen bitmap ...
    CScreenFormat screenFormat;     // ... and how it is made; see SetScreenFormat
    int highQuality = 1;            // anti-aliased drawing
    int autoQuality = 0;            // DoPlay may switch the quality by measured speed
    int qualityHold = 1000;         // ticks since the last automatic switch
    int bestQuality = 0;            // bitmaps stay smoothed in animated movies
    int slowTicks = 0;
    int fastTicks = 0;
    int sampledTicks = 0;
    S32 scaleMode = 0;     // SScaleMode bits; 0x1000 selects the top-left view of Control100
    SRECT zoomRect;        // twips shown when zoomed; empty when not
    int actionDepth = 0;   // above 0 while actions run
    S32 nextFrameTime = 0; // clock value at which the next frame is due
    int loaded = 0;        // the first frame can be shown
    int running = 0;       // the shell's timer runs
    S32 startTime = 0;     // clock value at construction
    SRECT screenDirty;     // pixels that are to be copied to the screen

    SPlayer();
    ~SPlayer() override;

    // --- what the shell supplies ---
    // Starts calling DoPlay(1) every `interval` ms (0: as often as every millisecond) and
    // UpdateCursor every `cursorInterval` ms, never nested in another player call. False when no
    // timer can be had.
    virtual bool StartTimer(S32 interval, S32 cursorInterval) = 0;
    virtual void StopTimer() = 0;
    // Has pixel rectangle `r` of the screen redrawn later, through OnDraw or Repaint.
    virtual void InvalidateScreenArea(const SRECT* r) = 0;
    // The drawing area in pixels, half-open.
    virtual void ClientRect(SRECT* r) = 0;
    // Offers a window size in pixels for a movie that has just been opened.
    virtual void AdjustWindow(S32 width, S32 height) = 0;
    // Starts a POST or a GET request; its data arrives later, never inside the call.
    virtual void StreamPostURLNotify(const char* url, const char* target, U32 length,
                                     const char* data, void* notifyData) = 0;
    virtual void StreamGetURLNotify(const char* url, const char* target, void* notifyData) = 0;
    // Aborts a stream; nothing of it arrives afterwards.
    virtual void CloseStream(StreamData* stream) = 0;
    // Passes a command to whatever contains the player.
    virtual void ProcessFSCommand(const char* command, const char* args) = 0;
    virtual void EnableMenus(const MenuStatus& status) = 0;
    virtual void UpdateCursor() = 0;
    // Copies pixel rectangle `r` of the player's bits to the screen.
    virtual void BltToScreen(const SRECT* r) = 0;
    // Clears the screen: there are no bits to show.
    virtual void ClearScreen() = 0;

    // --- the tick ---
    // Advances every timeline by one frame if one is due (always, when `checkTime` is off) and
    // repaints.
    void DoPlay(int checkTime);
    void Run();
    void Suspend();
    // Runs the queued actions.
    void DoActions();

    // --- levels ---
    // The movie of a level, made when absent; cleared first unless `keep`. Null when it cannot be
    // had.
    ScriptPlayer* OpenLayer(S32 layer, int keep);
    void ClearLayer(S32 layer);
    void FreeLayers();
    // Unloads everything.
    void ClearScript();
    void SetVersionVariable(ScriptPlayer* movie);

    // --- screen ---
    // Makes sure the screen bitmap exists; with `paint` brings it up to date. False when it cannot
    // exist.
    bool UpdateBuffer(int paint);
    // Paints what changed and copies it to the screen.
    void UpdateScreen();
    // Asks the shell to redraw what changed, instead of painting at once.
    void CheckUpdate();
    // Repaints pixel rectangle `r`, with all else that changed.
    void Repaint(const SRECT* r);
    // The shell's redraw.
    void OnDraw();
    // Frees the screen bitmap, which the next paint makes anew.
    void FreeBuffer();
    // The same with other pixels from then on. A palette must live until the next call.
    void SetScreenFormat(const CScreenFormat& format);

    // --- view ---
    void GotoFrame(S32 frame);
    // Recomputes the camera; then 1: UpdateScreen, 2: CheckUpdate, 0: nothing.
    void SetCamera(int update);
    void Home();
    void SetZoomRect(S32 xmin, S32 ymin, S32 xmax, S32 ymax);
    // Quality as scripts and command lines count it: 0 low, 1 high, 2 best.
    void SetQuality(int level);
    void GetMenuState(MenuStatus* status);

private:
    void AdvanceThreads();
    void AdjustQuality(S32 elapsed, S32 framesPlayed);
    ScriptPlayer* NewLayer(S32 layer);
    bool CreateBits(const SRECT* client);
    void TakeDirty();
    void BlitPending();
    void ChooseCamera();
};

// The level of that number among `first` and those linked behind it, or null.
ScriptPlayer* FindLayer(ScriptPlayer* first, S32 layer);
// The level number in a name like "_level3"; -1 when it is no such name.
S32 LayerNum(const char* name);
