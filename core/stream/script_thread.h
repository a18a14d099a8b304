// ScriptThread: one running timeline, that of a movie or of one sprite instance.
#pragma once

#include "core/geom/types.h"
#include "core/sound/sound.h"
#include "core/stream/parser.h"

class CSoundChannel;
class CSoundMix;
class DisplayList;
struct PlaceInfo;
class SPlayer;
class ScriptPlayer;
class StreamReader;
struct SCharacter;
struct SObject;

// A variable of a timeline; both strings owned, the value may be null.
struct SVariable {
    SVariable* next;
    char* name;
    char* value;
    SVariable* nextInBucket; // of the name index
    U32 hash;                // of the folded name
};

// Results of the operations that run tags; negative values are the loader's error.
enum SDrawResult : S32 { kDrawn = 0, kNeedsData = 1, kAtEnd = 2, kDrawFailed = -2 };

// Marks the sounds of one owner; never the same twice.
U64 NewSoundTag();

// Executes a timeline's tags frame by frame: places, moves and removes display objects through the
// display list and keeps the timeline's variables. Frames count from 0; a frame is the run of tags
// up to and including its ShowFrame. A sprite's thread is created with its display object and
// destroyed with it; a movie's is the ScriptPlayer itself. Player thread only.
class ScriptThread : public SParser {
public:
    ScriptPlayer* player = nullptr;     // the movie whose dictionary this timeline uses
    ScriptThread* nextThread = nullptr; // links of the display list's threads
    ScriptThread* prevThread = nullptr;
    SPlayer* splayer = nullptr; // the player
    S32 startPos = 0;           // first tag
    S32 len = 0;                // tags may be read up to here
    bool atEnd = false;         // the End tag has run
    S32 curFrame = -1;          // last frame whose ShowFrame has run
    bool seeking = false;       // tags run only to rebuild state: no actions, no sounds
    bool soundResync = true;    // set by Play and by every seek: a stream then fades in
    bool playing = true;        // advances on each tick
    bool loop = true;           // goes back to frame 0 at the end
    S32 numFrames = 0;
    S32 scriptErr = 0;              // 0, or the loader's error: -1 bad header, -2 out of memory
    U16 layerDepth = 0;             // depth of rootObject in its parent
    S32 layerNum = 0;               // level number of a movie's thread; 0 for sprites
    const char* label = nullptr;    // last FrameLabel seen, in the movie buffer
    DisplayList* display = nullptr; // where the timeline's objects are
    SObject* rootObject = nullptr;  // parent of everything that this timeline places
    U32 actionsQueued = 0;          // blocks of actions that wait for it, in all ActionLists
    bool streamStart = true;        // a block may start the streaming sound
    U8 streamFormat = 11;           // first byte of the stream head; kept, not used
    CSound streamSound;             // what the stream head says
    CSoundChannel* streamChannel = nullptr; // of the streaming sound, counted; null: none
    const U64 soundTag;                     // of this timeline's sounds; never used again
    SVariable* vars = nullptr;              // in order of creation
    SVariable* varsTail = nullptr;

    ScriptThread();
    // Leaves the display list and frees the variables. The root object no longer knows this thread.
    virtual ~ScriptThread();
    ScriptThread(const ScriptThread&) = delete;
    ScriptThread& operator=(const ScriptThread&) = delete;

    // Executes one tag: kAtEnd when the timeline had ended, kNeedsData when the next tag is not all
    // there or the budget is spent (nothing is consumed), else scriptErr.
    S32 DoTag();
    // DoTag while curFrame < frame and all goes well; the last result, 0 if nothing ran. The limits
    // on tags end it with kNeedsData, perhaps in the middle of a frame; the next call goes on
    // there.
    S32 DoTags(S32 frame);
    // Brings the timeline to `frame`. With `seek` the frames passed over run silently, and a frame
    // already passed is reached by replaying from the start; without it the tags just run on.
    S32 DrawFrame(S32 frame, bool seek);
    // One tick: advances by `advance` frames, waits for data, loops or stops at the end. `rebuild`
    // rebuilds the current frame from the start instead.
    void DoFrame(S32 advance, bool rebuild);
    // Stops and shows `frame` (negative counts as 0).
    void Seek(S32 frame);
    void StopPlay();
    // Plays on; with `rewind` a timeline that stands on its last frame without loop starts anew.
    void Play(bool rewind);
    // The frame that carries the label, or -1 when it is not there (yet). The search takes from the
    // tick's budget of tags and finds nothing when that is used up.
    S32 FindLabel(const char* name);

    // Places a copy of the sprite that `src` drives at `depth` under this timeline's root object.
    void CloneSprite(ScriptThread* src, const char* name, S32 depth);
    // Removes the sprite's object; with `keep` an empty sprite takes its place, transform and name.
    void RemoveSprite(ScriptThread* sprite, bool keep);
    // Removes an object that has a parent and shows `fresh` there, with its transform, name, mask
    // and puppet flag. The new object, null when it cannot be placed or `fresh` is null.
    static SObject* ReplaceObject(SObject* old, SCharacter* fresh);

    // Makes sure that the pixels of a bitmap exist, decoding its tag in the movie that owns it;
    // false when there are none: no bitmap, no image in the tag, no room for it. That is remembered
    // until the movie's FreeCache.
    static bool BuildBits(SCharacter* ch);

    // Back to a timeline without data that has not started.
    void ClearState();
    // The movie is going, but not this timeline of it: it stands still for good, without data.
    void LoseMovie();

    // Sets or appends; the name and the value are copied, a null value is stored as null. `flag` is
    // passed on to the text fields that show the variable.
    void SetVariable(const char* name, const char* value, int flag);
    // The first variable of that name under ASCII case folding, or null.
    SVariable* FindVariable(const char* name);
    void ClearVariables();

    // Takes the streaming sound away; when it returns nothing reads for it any more.
    void StopStream();
    // The same, with all that the timeline has started.
    void Silence();
    // Once a tick: makes ready what the streaming sound is going to need.
    void TendStream();
    // A streaming sound goes on that this timeline keeps time with: not ended, counted, and a
    // device plays it.
    bool StreamPlays() const;

    // This thread is its movie's root timeline.
    bool IsRoot() const;

protected:
    // Back to the first tag; what has been placed stays.
    void Rewind();
    // The mixer; null: none, no sound.
    CSoundMix* Mixer() const;

private:
    bool HasBudget() const;
    void ChargeWork(int units);
    void ChargeTags(U32 tags);
    bool IsLabel(const char* text, const char* name);
    void Dispatch();
    void DispatchDefinition();
    bool MakeRootObject();
    S32 RunTo(S32 frame, bool seek);
    S32 SeekBack(S32 frame);
    void RunSilently(S32 frame);
    void StopSound();
    CSoundMix* PlayingMixer() const;
    bool StartStream(CSoundMix* mix);
    StreamReader* NewReader(CSoundMix* mix);

    // tag handlers
    void PlaceObject();
    void PlaceObject2();
    void PlaceOrMove(const PlaceInfo& info);
    void RemoveObject();
    void DoAction();
    void SetBackgroundColor();
    void DefineShape();
    void DefineMorphShape();
    void DefineBits();
    void DefineJPEGTables();
    void DefineButton();
    void DefineFont();
    void DefineFont2();
    void DefineText();
    void DefineEditText();
    void DefineSound();
    void DefineSprite();
    void DefineFontInfo();
    void DefineButtonExtra();
    void FreeCharacter();
    void StartSound();
    void SoundStreamHead();
    void SoundStreamBlock();
    // Reads the id and enters a character of that type; null (and the tag is ignored) when the id
    // is taken or reserved.
    SCharacter* NewCharacter(U8 type);
    // The body of `ch` continues at `pos`.
    void KeepBody(SCharacter* ch);
    SCharacter* PlacedCharacter(U16 id);
    SCharacter* DefinedCharacter(U8 type);
    SCharacter* CopyMovieCharacter(const SCharacter* source);

    SVariable* NewVariable(const char* name);
    void IndexVariable(SVariable* var);
    void AddToBucket(SVariable* var);
    bool GrowIndex();

    StreamReader* streamReader = nullptr; // lives with streamChannel
    U32 frameTags = 0;                    // tags executed of this frame in this go
    U32 workDone = 0;                     // units of work not yet charged, less than a tag
    SVariable** buckets = nullptr; // name index, grown with the list; null while the list is short
    U32 bucketCount = 0;
    U32 variableCount = 0;
};
