// DisplayList: the scene of one player: the object tree, the camera, the background and the dirty
// rectangles that the raster repaints.
#pragma once

#include "core/display/action_list.h"
#include "core/display/edit_text.h"
#include "core/display/object_ref.h"
#include "core/display/place_info.h"
#include "core/display/sobject.h"
#include "core/geom/chunk_alloc.h"
#include "core/geom/rect.h"
#include "core/raster/bit_buffer.h"
#include "core/raster/raster.h"

class CSoundMix;
class SPlayer;
struct SButtonRecord;
class ScriptPlayer;
class ScriptThread;

// Low four bits and alignment bits of a scale mode.
enum SScaleMode : S32 {
    kScaleShowAll = 0, // the whole movie, bars at the sides
    kScaleFill = 1,    // the whole area, movie cropped
    kScaleStretch = 2, // both; also every value up to 15 not named here
    kScaleFixed = 3,   // one pixel per 20 twips
    kScaleMask = 0x0F,
    kAlignLeft = 0x10,
    kAlignRight = 0x20,
    kAlignTop = 0x40,
    kAlignBottom = 0x80,
};

// Where a tracked button stood before a seek, so that its rebuilt self goes on.
struct SButtonIdentity {
    SObject* parent;
    U32 parentSerial;
    SCharacter* character;
    U16 depth;
    U16 ratio;
};

// Rewrites two overlapping rectangles as two that cover the same union without overlapping.
void DecomposeRect(SRECT* a, SRECT* b);
// The interiors overlap: touching sides do not count.
bool RectTestOverlap(const SRECT* a, const SRECT* b);
S32 RectArea(const SRECT* r);

// Exactly one per player. Everything runs on the player's thread, one call at a time. Device
// coordinates are pixels, or quarter pixels while `antialias` is on.
class DisplayList {
public:
    static constexpr int kMaxDirty = 4;
    // Objects above this depth were made by scripts and survive a seek.
    static constexpr U16 kMaxTimelineDepth = 16383;

    MATRIX camera;               // twips to device; set only by SetCamera
    ColorTransform cameraCxform; // of the whole scene; stays the identity
    SObject root;                // not from the pool
    SRGB backgroundColor;        // painted under everything; all four bytes 0: nothing is
    int backgroundPriority = 0;  // of the last accepted background colour
    CBitBuffer* bits = nullptr;  // drawn into, not owned
    int antialias = 0;
    int animatedMovie = 0;  // more than one frame and not best quality: plainer smoothing
    int smoothing = 0;      // bitmaps are smoothed
    int supersampling = 1;  // 2 when anti-aliased
    int needCalcUpdate = 0; // some object was modified
    SRECT devViewRect;      // the whole device area
    SRECT bitsDirty;        // pixels painted since the player last took it
    SRECT devDirtyRgn;      // union of what is pending
    int nDirty = 0;
    S32 dirtyArea[kMaxDirty];
    SRECT dirtyList[kMaxDirty];
    CRaster raster;
    SObject* holdList = nullptr;     // during a hold: the held parent's previous children
    SObject* holdParent = nullptr;   // during a hold: whose children are being rebuilt
    SObject* objects = nullptr;      // all alive but the root, in the tree or on their way out
    ScriptThread* threads = nullptr; // every live timeline, newest first
    ScriptThread* threadCursor =
        nullptr;                // next thread of the tick's walk; kept valid by RemoveThread
    SPlayer* splayer = nullptr; // whose list it is; null: no player
    ActionList actions;         // blocks that wait for DoActions
    SCallTable calls;           // what is running them
    SObject* button = nullptr;  // the button that the pointer tracks
    int buttonState = 1;        // of that button: 1 idle, 2 over, 3 down, 4 down outside
    int textUnderMouse = 0;     // the pointer is over a text field that can be selected in
    const U64 soundTag;         // of the sounds that buttons start; never used again
    SRECT tabFocusRect;         // of the keyboard focus highlight; empty when none
    int useFocusRect = 1;       // the highlight is drawn
    bool hitOnly = false;       // shapes are built for a hit test and never painted
    SButtonIdentity buttonIdentity = {};
    S32 instanceCount = 0;         // unnamed sprites placed so far
    CSoundMix* soundMix = nullptr; // takes all sounds; null: there are none
    int editTextFlag = 0;          // some text field draws with a device font; for shells
    EditText::List fields;         // the text fields of all objects
    SCharacter* pending = nullptr; // retained for a placement that waits for a removal
    U64 pixelsLeft = 0;            // of images that may be decoded for this repaint or hit test
    bool colorsLost = false;       // an object that is being built has got fewer than it needs
    U32 recordsLeft = 0;  // shape records and styles that this repaint or hit test may read
    U32 clonedMovies = 0; // loaded movies alive that play another loader's bytes
    U32 tagsLeft = 0;     // tags that may still run in this tick; see ResetBudget
    U64 work = 0;         // what walks have cost since ever, in the units of SLimits::workPerRun

    ChunkAlloc edgeAlloc;
    ChunkAlloc objectAlloc;
    ChunkAlloc colorAlloc;
    ChunkAlloc threadAlloc; // timelines of sprites

    DisplayList();
    ~DisplayList();
    DisplayList(const DisplayList&) = delete;
    DisplayList& operator=(const DisplayList&) = delete;

    // Places a new object under `parent`. A sprite gets its timeline and shows its first frame at
    // once. Null, and nothing placed, when a limit or memory forbids it, or when the character
    // already stands among the parents.
    SObject* PlaceObject(SObject* parent, const PlaceInfo* info);
    // Changes the object at the depth as the flags say; null when there is none or a script has it.
    SObject* MoveObject(SObject* parent, const PlaceInfo* info);
    void RemoveObject(SObject* parent, U16 depth);
    // Removes the object that *link points at.
    void DoRemove(SObject** link);
    // Removes that very object, wherever it is; null is allowed.
    void RemoveThisObject(SObject* obj);
    // The child at a depth, or null. Long searches use up tags.
    SObject* FindChild(SObject* parent, U16 depth);

    // Bracket around a timeline's rebuild from its first frame: objects that exist before and after
    // stay, with their own timelines and state. A hold that is still open is finished first.
    void BeginHold(SObject* parent);
    void FinishHold();

    // Marks device area `r`, grown by two pixels, as to be repainted.
    void InvalidateRect(const SRECT* r);
    // `r` with what rounding and hairlines may put beside it; empty stays empty.
    void Grow(const SRECT* r, SRECT* dst) const;
    // One merge of the cheapest pair of dirty rectangles, if it pays or is forced. True when
    // merged.
    bool MergeDirtyList(bool forced);
    // Merges what pays and makes the rest disjoint.
    void DecomposeDirtyList();
    // Shows `frame` (twips) in `client` (pixels); true when the camera changed.
    bool SetCamera(const SRECT* frame, const SRECT* client, int antialias, S32 scaleMode);
    // Everything is to be recalculated and repainted.
    void ModifyCamera();
    void UpdateDevViewRect();
    void SetBits(CBitBuffer* buffer);
    // Accepted when `priority` is above the current one.
    void SetBackgroundColor(SRGB color, int priority);
    // Forgets a background colour of a priority below 2.
    void Reset();
    // Recalculates what was modified.
    void CalcUpdate();
    // Repaints all dirty areas; the dirt is gone afterwards even when there is nothing to paint
    // into.
    void Update();
    // Paints one rectangle of pixels, half-open.
    void UpdateRect(const SRECT* r);
    // Device rectangle to pixels, each bound divided toward zero.
    void CalcBitsDirty(const SRECT* dev, SRECT* pix) const;

    void AddThread(ScriptThread* thread);
    void RemoveThread(ScriptThread* thread);
    // For a movie whose dictionary or bytes are about to go: objects that show a character of it
    // show nothing from now on, timelines that run its tags stand still, and `pending` becomes
    // GoneCharacter. Nothing leaves the list, so that this is safe in the middle of a placement, a
    // removal or a hold.
    void ForgetMovie(const ScriptPlayer* movie);
    // Drops all cached edges and colours, and empty pool blocks.
    void FreeCache();

    // Takes tags off the tick's budget.
    void ChargeTags(U32 tags);
    // A text of so many bytes and lines has been handled: work, and tags.
    void ChargeText(U32 bytes, U32 lines = 0);

    // Pixels in device coordinates, as far as those reach.
    SPOINT ToDevice(const SPOINT& pixels) const;
    // The topmost object of any kind under `pt` (pixels), or null. Objects lie where the last
    // update saw them.
    SObject* HitTest(const SPOINT* pt);
    // The topmost button or selectable text field under `pt` (pixels), or null; null outside the
    // view.
    SObject* HitButton(const SPOINT* pt);

    // Shows the images of a button's new state. Nothing for what is no button or is in that state.
    void UpdateButton(SObject* obj, int newState);
    // The pointer is over button `hit` (null: over none), pressed or not: all transitions that
    // follow, their actions queued. True when there was one.
    bool SetButton(SObject* hit, int mouseDown);
    // Forces transition `code` (0 to 8) on a button.
    void DoButtonStateTransition(SObject* obj, int code);
    // Queues the actions and starts the sound of a transition.
    void DoButtonAction(SObject* obj, int code);
    // Queues a block of actions in a button's data, for the button's timeline.
    void QueueButtonBlock(const SObject* obj, const U8* block);

    // Whole lists, or null, back into the pools.
    void FreeEdges(REdge* edges);
    void FreeColors(RColor* colors);

    // Allows the next tick its full number of tags.
    void ResetBudget();

    // The raster that built colours are for; null when they are not painted. They then need no
    // ramps and no images.
    CRaster* PaintedRaster() { return !hitOnly && bits && bits->HasBits() ? &raster : nullptr; }

    // Pool records, zeroed; null when a limit or memory forbids it.
    REdge* NewEdge() { return static_cast<REdge*>(edgeAlloc.Alloc()); }
    RColor* NewColor()
    {
        auto* color = static_cast<RColor*>(colorAlloc.Alloc());
        colorsLost = colorsLost || !color;
        return color;
    }

private:
    friend struct SObject;
    friend class ObjectRef;

    bool MayPlace(const SObject* parent, const SCharacter* character) const;
    SObject** FindLink(SObject* parent, U16 depth);
    SObject** FindLink(SObject** list, const SObject* obj);
    void SetPlacement(SObject* obj, SObject* parent, const PlaceInfo* info);
    void NameObject(SObject* obj, const PlaceInfo* info);
    void StartObject(SObject* obj, const PlaceInfo* info);
    void StartSprite(SObject* obj);
    void StartLoadedMovie(SObject* obj, const PlaceInfo* info);
    void StartButton(SObject* obj);
    void EndTimeline(ScriptThread* thread);
    void AttachTimeline(SObject* obj, ScriptThread* thread);
    ScriptPlayer* CloneMovie(const SCharacter* character);
    void NoteMask(const SObject* mask);
    void Empty(SObject* obj);
    void PlaceButtonChild(SObject* obj, const SButtonRecord& record);
    bool StepButton(SObject* under, bool down);
    void ChangeButton(SObject* obj, int code);
    void TrackButton(SObject* obj);
    void ForgetIdentity();
    void QueueClick(const SObject* obj);
    void StartButtonSound(SObject* obj, int slot);
    void BeginHitTest();
    void UnlinkThread(ScriptThread* thread);
    void DropActions(ScriptThread* thread);
    void ClearRefs(const SObject* obj);
    SObject* Unlink(SObject** link);
    void Discard(SObject* obj);
    bool KeepsOld(const SObject* old, const SObject* fresh) const;
    void TakeTransform(SObject* old, const SObject* fresh);
    void KeepOld(SObject** freshLink);
    SObject** MergeHeld(SObject** link);
    void DropHeld();
    void MakeDisjoint();
    void PaintBackground(RColor* color, REdge edges[2]);
    void PaintFocus(RColor* color, REdge** edges);
    void PrepareField(const SCharacter* character);

    ObjectRef* refs = nullptr; // all that point at objects of this list
    U32 nextSerial = 1;
    U32 holdSerial = 0; // objects of this serial and above were placed during the hold
    S32 openMasks = 0;  // masks whose range is being drawn now
};
