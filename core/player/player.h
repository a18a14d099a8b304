// SPlayer: the player. It owns the root movie (it is itself the movie of level 0), the further
// levels, the display list and the screen pixels, and advances them by the clock.
#pragma once

#include "core/display/display_list.h"
#include "core/player/drag.h"
#include "core/player/focus.h"
#include "core/player/menu_status.h"
#include "core/player/save_focus.h"
#include "core/player/trace.h"
#include "core/player/values.h"
#include "core/raster/bit_buffer.h"
#include "core/stream/script_player.h"

struct LoadInfo;
struct StreamData;

// The platform's microsecond clock: any origin, never goes backwards. Supplied by the shell.
S64 real_time_clock_usecs();

// Milliseconds of that clock in 27 bits, and the time from one such value to a later one.
S32 PlayerClock();
constexpr S32 ClockElapsed(S32 now, S32 then)
{
    return (now - then) & 0x7FFFFFF;
}

// A shell subclasses this as NativePlayerWnd and calls everything from one thread. Virtual
// operations are what the core asks of the shell; none may call back into the player unless its
// contract says so. The shell's destructor calls ClearScript, while its operations still exist.
class SPlayer : public ScriptPlayer {
public:
    // Added to a scale mode: Control100 shows the movie's top left corner, by a zoom.
    static constexpr S32 kScaleTopLeft100 = 0x1000;
    static constexpr S32 kFontLayer = 16000; // layer number of fontPlayer
    static constexpr S32 kLastLayer = 65535; // a level's number is the depth at which it lies
    // Factors of ZoomF.
    static constexpr S32 kZoomIn = 0x8000;
    static constexpr S32 kZoomOut = 0x20000;
    enum FontState { kFontsUntried = 0, kFontsLoaded = 1, kFontsUnavailable = 2 };

    DisplayList scene;              // the display list; `display` of every thread points here
    ScriptPlayer* layers = nullptr; // levels 1 and up, through nextLayer, newest first
    CBitBuffer bits;                // the screen bitmap ...
    CScreenFormat screenFormat;     // ... and how it is made; see SetScreenFormat
    int highQuality = 1;            // anti-aliased drawing
    int autoQuality = 0;            // DoPlay may switch the quality by measured speed
    int qualityHold = 1000;         // ticks since the last automatic switch
    int bestQuality = 0;            // bitmaps stay smoothed in animated movies
    int slowTicks = 0;              // this and the next two: measured since the movie was opened
    int fastTicks = 0;
    int sampledTicks = 0;
    S32 scaleMode = 0;       // SScaleMode bits and kScaleTopLeft100
    SRECT zoomRect;          // twips shown when zoomed; empty when not
    ScriptPlayer fontPlayer; // the movie of the built-in fonts, in no list of levels
    FontState fontState = kFontsUntried;
    int actionDepth = 0;             // above 0 while actions run
    bool actionsAborted = false;     // a script ran away: no action runs until the movie goes
    bool cameraWaits = false;        // a script has changed the quality: shown after the run
    ValueStack stack;                // of the scripts; what is on it stays from run to run
    ScriptTracer tracer;             // told of every record before it is executed
    S32 nextFrameTime = 0;           // clock value at which the next frame is due
    int loaded = 0;                  // the first frame can be shown
    int running = 0;                 // the shell's timer runs
    int suspended = 0;               // Suspend was called and Run not since then
    int mouseState = -1;             // of the last mouse event: 0 up, 1 down; -1: not known
    SPOINT mousePt = {};             // where it was, in pixels
    S32 startTime = 0;               // clock value at construction
    int firstLoad = 0;               // the next stream that opens is the movie of ControlOpen
    char* baseURL = nullptr;         // owned; what relative URLs are resolved against
    ScriptPlayer* loaders = nullptr; // of variables that are still arriving, through nextLayer
    U32 session = 0;                 // counts ControlOpen and ControlClose: requests made before
                                     // the last of them are nobody's
    ObjectRef focusText{&scene};     // the text field that has the keyboard focus
    SButton buttonFocus{&scene};     // the button that has it
    SButton savedFocus{&scene};      // what had it last: Tab restores it
    SaveFocus focus{this};           // keeps both over a rebuild
    ButtonOrder buttonOrder{&scene}; // the nearest buttons, by direction
    GrowBuffer<ButtonWeight> tabMap; // all focusable buttons, while they are looked at
    int panning = 0;                 // a press on a zoomed view drags it
    SPOINT panStart = {};            // where the pointer was at the last step, in pixels
    SDrag drag{&scene};              // the object that scripts let the pointer drag
    SRECT screenDirty;               // pixels that are to be copied to the screen
    MenuStatus menuMask = kAllMenus; // what the host allows; see SetMenuState

    // --- set by a shell ---
    // The mixer of the process, made before its first player and gone after its last; null: no
    // sound, and the clock alone paces.
    static CSoundMix* theSoundMix;
    int soundOn = 1;         // sounds are started
    S32 soundBufferTime = 5; // seconds of lead that a streaming sound wants when data runs out
    // The timer serves others too: Suspend leaves it running, and its owner ticks only those
    // players whose `running` is on.
    int sharedTimer = 0;
    int hostCamera = 0; // the host sets the camera: ClearScript leaves it alone

    SPlayer();
    ~SPlayer() override;

    // --- what the shell supplies ---
    // Starts calling DoPlay(1) every `interval` ms (0: as often as every millisecond) and
    // CursorTick every `cursorInterval` ms, never nested in another player call. False when no
    // timer can be had: the player is not `running` then and stands still, until Run is called
    // again or the shell ticks it by itself; a frame is due at once.
    virtual bool StartTimer(S32 interval, S32 cursorInterval) = 0;
    virtual void StopTimer() = 0;
    // Has pixel rectangle `r` of the screen redrawn later, through OnDraw or Repaint.
    virtual void InvalidateScreenArea(const SRECT* r) = 0;
    // The drawing area in pixels: {0, width, 0, height}, half-open, where a side of 0 shows nothing
    // and one above CBitBuffer::kMaxSide cannot be shown. From any other rectangle the player takes
    // the size only.
    virtual void ClientRect(SRECT* r) = 0;
    // Offers a window size in pixels for a movie that has just been opened.
    virtual void AdjustWindow(S32 width, S32 height) = 0;
    // Starts a POST or a GET request, by an absolute URL if there is a base; its data arrives
    // later, through StreamInNew, StreamInWrite and StreamInDestroy, never inside the call.
    // `target` names a browser window, and then there is no `notifyData`; without it the data comes
    // back here with `notifyData`. A request that is refused or fails before its stream opens ends
    // with StreamFailed, later as well. The strings do not outlive the call; `length` counts the
    // zero byte at the end of `data`, which begins with two header lines and a blank one.
    virtual void StreamPostURLNotify(const char* url, const char* target, U32 length,
                                     const char* data, void* notifyData) = 0;
    virtual void StreamGetURLNotify(const char* url, const char* target, void* notifyData) = 0;
    // Aborts a stream; nothing of it arrives afterwards, but StreamInDestroy still comes, from the
    // event loop. It may be the very stream whose data is being delivered.
    virtual void CloseStream(StreamData* stream) = 0;
    // Passes a command to whatever contains the player. Neither string outlives the call.
    virtual void ProcessFSCommand(const char* command, const char* args) = 0;
    // Brings menus up to date; after each control.
    virtual void EnableMenus(const MenuStatus& status) = 0;
    // Shows the pointer as GetCursorType says; CursorTick calls it too.
    virtual void UpdateCursor() = 0;
    // Copies pixel rectangle `r` of the player's bits to the screen.
    virtual void BltToScreen(const SRECT* r) = 0;
    // Clears the screen: there are no bits to show.
    virtual void ClearScreen() = 0;
    // The movie with the built-in fonts, allocated by malloc, which the core frees, and its length;
    // 0 when there is none. Asked for once.
    virtual void GetUnixFontData(U8** data, S32* size) = 0;

    // --- the tick ---
    // Advances every timeline by one frame if one is due (always, when `checkTime` is off), or by
    // as many as a streaming sound asks for, and repaints.
    void DoPlay(int checkTime);
    // Suspend stops the ticks and silences the player, Run starts the ticks. Before the first frame
    // can be shown both are remembered: the ticks start with that frame, unless the player is
    // suspended. A suspension outlasts the movie.
    void Run();
    void Suspend();
    // For the loader, when the first frame is there: the ticks start unless it is suspended.
    void StartTicks();
    // Runs the queued actions, then sends off the requests that they made. Nothing inside itself.
    void DoActions();

    // --- values of scripts; strings returned are the caller's, freed with FreeStr ---
    void Push(const char* text);
    void PushNum(double value);
    // The empty string from an empty stack; null only when memory is exhausted.
    char* Pop();
    double PopNum();

    // --- names in scripts ---
    // The timeline at a path of names separated by "/", from an object or, with null or a leading
    // "/", from a root; null when there is none.
    ScriptThread* FindTarget(SObject* from, const char* path);
    // The same for the first `length` characters of a path.
    ScriptThread* FindTarget(SObject* from, const char* path, int length);
    // The path of an object as scripts write it; null when memory is exhausted, or when it would be
    // longer than a string may be.
    char* GetTargetPath(SObject* obj);
    // Splits "target:name": the timeline before the colon, null when there is none of that path;
    // without a colon `thread`, or the player for null. *rest is what follows.
    ScriptThread* ResolveVariable(const char* path, ScriptThread* thread, const char** rest);
    // "target:frame" with a number from 1 or a label: the timeline and its frame from 0; null when
    // either is not there.
    ScriptThread* ResolveFrameNum(const char* frameName, ScriptThread* thread, S32* frame);
    // The value of a variable by its path, or of a text field's scroll position; null when absent.
    char* GetVariable(ScriptThread* thread, const char* path);
    // The same as a value for the stack; false, and empty, when absent.
    bool GetVariable(ScriptThread* thread, const char* path, ScriptValue* value);
    using ScriptThread::SetVariable;
    void SetVariable(ScriptThread* thread, const char* path, const char* value, int updateFields);
    // Properties by index (0 x position to 18 sound buffer time); 0 and "" for those that are not.
    double GetProperty(ScriptThread* thread, int index);
    void SetProperty(ScriptThread* thread, int index, double value);
    char* GetPropertyStr(ScriptThread* thread, int index);
    void SetPropertyStr(ScriptThread* thread, int index, const char* value);
    // Runs the actions of a frame of the timeline at once.
    void CallFrame(ScriptThread* thread, S32 frame);
    // Has the pointer drag the object of a timeline. `bounds` (twips, of its parent) keeps it
    // inside, unless empty.
    void StartDrag(ScriptThread* thread, bool lockCenter, const SRECT* bounds);
    // Notes in the dragged object where it was dropped, and lets it go.
    void EndDrag();
    void UpdateDragObject(const SPOINT* pt);
    void UpdateDropTarget();

    // --- mouse and keyboard; pixels; ignored until the first frame is there ---
    // A shell announces a press at a new position by a MouseMove there, else a button under it
    // does not notice.
    void MouseDown(S32 x, S32 y);
    void MouseMove(S32 x, S32 y, int buttonDown);
    void MouseUp(S32 x, S32 y);
    // The mouse is lost to others; with `release` as if it were let go outside.
    void CancelCapture(int release);
    // Key codes: 1 left, 2 right, 13 Enter, 14 up, 15 down, 18 Tab, 32 Space; 3 Home, 4 End, 6 page
    // up, 7 page down, 8 Backspace, 27 Escape, 127 Delete; 33 to 126 and 160 to 255 characters.
    // Modifiers: 0x01 Shift, 0x02 Ctrl or Command, 0x04 Alt. 1 when the key was consumed.
    int HandleKeyDown(int key, int modifiers);
    int HandleKeyUp(int key, int modifiers);
    // 0 arrow, 1 open hand (zoomed), 2 hand (button), 3 I-beam.
    int GetCursorType() const;
    void DoButton(const SPOINT* pt, int mouseDown, int updateScreen);
    void DoButton(SObject* obj, int mouseDown, int updateScreen);
    // Shows or hides the keyboard focus on a button.
    void ButtonFocusSet(SObject* obj);
    void ButtonFocusRemove();
    int TabKeyDown(int key, int modifiers);
    void ButtonTabNext();
    void ButtonTabPrevious();
    void ButtonGoDirection(int direction);
    void ButtonEnter();
    // The entry of the tab map for an object; false when it is no focusable button.
    bool ButtonFind(SObject* obj, SRECT* bounds);
    void BuildButtonTabMap();
    int NumButtons() const;
    void AddButton(SObject* obj, const SRECT* bounds);
    void RemoveAllButtons();
    // Gives the keyboard focus to a text field, which takes it from a button too, or with null
    // takes it from the field that has it. That one loses its selection.
    void SetFocusText(SObject* obj);
    // In the text field that has it: 0 selects all, 1 deletes what is selected, others do nothing.
    // Like a key it sets the bound variable when that differs, and calls the frame that hears of
    // it.
    void EditCommand(int command);
    // What is selected there, freed with FreeStr; null when that is nothing or a password.
    void EditCopy(char** text);
    // Puts a text, as bytes of Latin-1, in place of what is selected there, like a key. Breaks
    // become carriage returns, or cut the text where there is one line; other codes below 32 are
    // left out; what exceeds the field's greatest length is cut. Null does nothing.
    void EditPaste(const char* text);
    // Asks the shell for the pointer's shape anew and has the caret blink. A shell that never calls
    // it shows the caret all the time.
    void CursorTick();
    // An object is about to be removed: lets go of it wherever that is seen.
    void BeforeRemoval(SObject* obj);

    // --- URLs ---
    // Routes one request: a host command, a browser window, a level or a sprite. Flags: 0x40 the
    // window is a target path, 0x80 variables instead of a movie.
    void GetURL(const char* url, const char* window, const char* postData, int flags);
    void LoadLayer(const char* url, S32 layer, const char* postData, const char* target, int flags);
    // `info` goes to the platform.
    void NetscapeDoURL(const char* url, const char* window, const char* postData, LoadInfo* info);
    // `url` against a base: a new string, freed with FreeStr, or `url` itself when nothing is to be
    // done; null on failure.
    char* BuildRelative(const char* base, char* url);
    // A movie in the place of a sprite; null when there can be none.
    ScriptPlayer* OpenSprite(ScriptThread* sprite);
    // The platform's answers, from its event loop. Bytes consumed; -1 when nobody wants them.
    void StreamInNew(StreamData* stream, const char* url, void* notifyData);
    S32 StreamInWrite(StreamData* stream, const void* data, S32 length);
    void StreamInDestroy(StreamData* stream);
    // Nothing will come for this request.
    void StreamFailed(void* notifyData);
    // For a loader of variables whose stream has ended: hands them to their timeline, if it is
    // still there, and destroys the loader.
    void DeliverVariables(ScriptPlayer* loader);

    // --- levels ---
    // The movie of a level, made when absent; cleared first unless `keep`. Null when it cannot be
    // had: no memory, too many levels, or a number that is none from 0 to kLastLayer.
    ScriptPlayer* OpenLayer(S32 layer, int keep);
    void ClearLayer(S32 layer);
    void FreeLayers();
    // Unloads everything.
    void ClearScript();
    void SetVersionVariable(ScriptPlayer* movie);

    // --- screen ---
    // Makes sure the screen bitmap exists; with `paint` brings it up to date. False when it cannot
    // exist, which is remembered for that size until FreeBuffer or ClearScript.
    bool UpdateBuffer(int paint);
    // Paints what changed and copies it to the screen.
    void UpdateScreen();
    // Asks the shell to redraw what changed, instead of painting at once.
    void CheckUpdate();
    // Repaints pixel rectangle `r`, with all else that changed.
    void Repaint(const SRECT* r);
    // The shell's redraw: copies what the screen lacks, and pixel rectangle `exposed` in any case.
    void OnDraw(const SRECT* exposed = nullptr);
    // Frees the screen bitmap, which the next paint makes anew.
    void FreeBuffer();
    // The same with other pixels from then on. A palette must live until the next call.
    void SetScreenFormat(const CScreenFormat& format);

    // --- view ---
    // Stops the root timeline at a frame (from 0) and has it shown; from within an action it only
    // seeks.
    void GotoFrame(S32 frame);
    // Recomputes the camera; then 1: UpdateScreen, 2: CheckUpdate, 0: nothing.
    void SetCamera(int update);
    // No zoom.
    void Home();
    // Shows a rectangle of the movie (twips); without width or height, the whole movie again.
    void SetZoomRect(S32 xmin, S32 ymin, S32 xmax, S32 ymax);
    // Shows `factor` (16.16) times the width and height shown now, around pixel `devicePoint`, or
    // around the present middle when that is null. Stays within the frame; from the whole frame on
    // it is Home.
    void ZoomF(S32 factor, const SPOINT* devicePoint);
    // The same by the size and the middle of what is to be shown, in twips.
    void Zoom(SPOINT size, SPOINT centre);
    // Magnifies the present view by that many percent; 100 and nonsense are Home.
    void ZoomScale(S32 percent);
    // Moves a zoomed view over the movie by so many pixels, up to the frame's sides.
    void Pan(S32 dx, S32 dy);
    bool IsZoomed() const { return !RectIsEmpty(&zoomRect); }
    // Quality as scripts and command lines count it: 0 low, 1 high, 2 best.
    void SetQuality(int level);

    // --- controls; each brings the menus up to date ---
    // Unloads everything and asks for the movie at `url`, which is not the unloaded movie's own
    // string. Nothing for an empty one.
    void ControlOpen(const char* url);
    void ControlClose();
    // Stops or plays on.
    void ControlPlay();
    void ControlRewind();
    void ControlForward();
    void ControlBack();
    void ControlLoop();
    void ControlHighQuality();
    void ControlViewAll();
    void Control100();
    void ControlZoomIn();
    void ControlZoomOut();
    // Zooms in around a pixel.
    void ControlZoomContext(S32 x, S32 y);

    // --- menus ---
    void GetMenuState(MenuStatus* status);
    void GetPopupMenuState(MenuStatus* status);
    // What can be done in the text field that has the focus: canViewAll stands for cut (EditCopy,
    // then EditCommand(1)), canZoomIn for copy, canZoomOut for paste, zoomed for delete and canPlay
    // for select all; the others are 0.
    void GetEditMenuState(MenuStatus* status);
    // From now on GetMenuState gives only what is allowed here too.
    void SetMenuState(const MenuStatus& mask);

    // --- fonts ---
    // Has the built-in fonts defined in fontPlayer; false when there are none. Tried once. Runs
    // tags, which place and remove objects: whoever walks the scene must have asked before; inside
    // a paint nothing is tried.
    bool LoadBuiltInFonts();

private:
    // How many frames a tick plays, and which timeline's sound says so; null: the clock does.
    struct SoundPace {
        const ScriptThread* thread;
        S32 frames;
    };

    SoundPace PaceOfSound() const;
    static bool KeepsTime(const ScriptThread* thread);
    bool WaitsForSound(const ScriptThread* thread) const;
    void StopTicks();
    bool FrameIsDue(S32 now) const;
    void SilenceThreads();
    void TendSounds();
    void AdvanceThreads(const ScriptThread* pace);
    void RetestButtons();
    void AdjustQuality(S32 elapsed, S32 framesPlayed);
    ScriptPlayer* NewLayer(S32 layer);
    bool CreateBits(S32 width, S32 height);
    bool AllocateBits(S32 width, S32 height);
    void TakeDirty();
    void BlitPending();
    void ChooseCamera();
    void ShowQuality();
    void EndRun();
    SRECT ClientArea();
    void PixelCamera(MATRIX* mat) const;
    void LeaveFixedScale();
    void TopLeftView(SRECT* r);
    bool ShowsAt100();
    char* ResolveURL(const char* url);
    void UnloadTarget(ScriptThread* target);
    bool PrepareLoad(const char* url, S32 layer, const char* target, int flags);
    bool IsLevel(const ScriptThread* thread) const;
    U32 CountMovies() const;
    LoadInfo* NewLoadInfo(S32 layer, const char* target, bool loadVars);
    void ForgetRequests();
    ScriptPlayer* OpenReceiver(LoadInfo* info);
    ScriptPlayer* NewLoader(LoadInfo* info);
    ScriptPlayer* NewMovie();
    void FreeLoader(ScriptPlayer* loader);
    void LinkStream(StreamData* stream, ScriptPlayer* receiver);
    bool BeginInput();
    SObject* PointAtText(SObject* hit, const SPOINT* pt, int mouseDown, bool* changed);
    bool SelectsText() const;
    bool PressesButton() const;
    void DragSelection(const SPOINT* pt, int mouseDown);
    int TextKeyDown(int key, int modifiers);
    void FinishEdit(U32 editsBefore);
    void FinishButton(int updateScreen);
    void NotePointer(const SPOINT* pt, int mouseDown);
    const char* FindValue(ScriptThread* thread, const char* path, char* digits);
    double ObjectProperty(SObject* obj, int index);
    void SetObjectProperty(SObject* obj, int index, double value);
    SPOINT DragPoint(const SPOINT* pt) const;
    void PanTo(const SPOINT* pt);
    void ShowFocus(const SRECT* r);
    void HideFocus();
    void FollowFocus();
    void ForgetInput();
    bool MouseIsHeld() const;
    void OfferWindow();
    void RefreshMenus();
    void RunFontMovie(const U8* data, S32 size);

    SPOINT refusedSize = {}; // of a screen bitmap that cannot be had; 0 by 0: none is known
    bool painting = false;
};

// The level of that number among `first` and those linked behind it, or null.
ScriptPlayer* FindLayer(ScriptPlayer* first, S32 layer);
// The level number in a name like "_level3"; -1 when it is no such name.
S32 LayerNum(const char* name);
