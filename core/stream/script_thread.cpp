#include "core/stream/script_thread.h"

#include <algorithm>
#include <atomic>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/stream/script_player.h"
#include "core/stream/str.h"
#include "core/stream/tags.h"

namespace {
// Units of work that count as one tag: a byte of a string that is measured or compared is one, a
// tag that is only passed over is several.
constexpr U32 kWorkPerTag = 64;
constexpr int kWorkPerHeader = 4;

std::atomic<U64> lastSoundTag{0};
} // namespace

U64 NewSoundTag()
{
    return ++lastSoundTag;
}

ScriptThread::ScriptThread() : soundTag(NewSoundTag())
{
    ClearState();
}

ScriptThread::~ScriptThread()
{
    StopStream();
    if (display) {
        if (rootObject && rootObject->thread == this)
            rootObject->thread = nullptr;
        display->RemoveThread(this);
    }
    ClearVariables();
}

void ScriptThread::ClearState()
{
    StopStream();
    streamStart = true;
    streamFormat = 11;
    streamSound.Init();
    Attach(nullptr, 0);
    len = 0;
    curFrame = -1;
    label = nullptr;
    atEnd = false;
    seeking = false;
    numFrames = 0;
    scriptErr = 0;
    playing = true;
    loop = true;
}

// Safe while a tag of this very timeline is being executed: what it reads from here on is zeros.
void ScriptThread::LoseMovie()
{
    ClearState();
    player = nullptr;
    playing = false;
}

bool ScriptThread::IsRoot() const
{
    return player == this;
}

S32 ScriptThread::DoTag()
{
    if (atEnd)
        return kAtEnd;
    if (!HasBudget() || GetTag(len) < 0)
        return kNeedsData;
    ChargeTags(1);
    Dispatch();
    pos = tagEnd;
    return scriptErr;
}

// All timelines draw on the tick's budget; its last share is for the oldest one.
bool ScriptThread::HasBudget() const
{
    if (!display)
        return true;
    const U32 kept = nextThread ? std::min(gLimits.tagsPerTimeline, gLimits.tagsPerDraw / 2) : 0;
    return display->tagsLeft > kept;
}

// Takes work off the tick's budget of tags.
void ScriptThread::ChargeWork(int units)
{
    workDone += static_cast<U32>(units);
    ChargeTags(workDone / kWorkPerTag);
    workDone %= kWorkPerTag;
}

void ScriptThread::ChargeTags(U32 tags)
{
    frameTags += tags;
    if (display)
        display->tagsLeft -= std::min(display->tagsLeft, tags);
}

void ScriptThread::Dispatch()
{
    switch (tagCode) {
    case kTagEnd:
        atEnd = true;
        break;
    case kTagShowFrame:
        if (curFrame < kS32Max)
            curFrame++;
        frameTags = 0;
        break;
    case kTagFrameLabel:
        label = PeekString();
        break;
    case kTagSetBackgroundColor:
        SetBackgroundColor();
        break;
    case kTagPlaceObject:
        PlaceObject();
        break;
    case kTagPlaceObject2:
        PlaceObject2();
        break;
    case kTagRemoveObject:
    case kTagRemoveObject2:
        RemoveObject();
        break;
    case kTagDoAction:
        DoAction();
        break;
    case kTagStartSound:
        StartSound();
        break;
    case kTagSoundStreamHead:
    case kTagSoundStreamHead2:
        SoundStreamHead();
        break;
    case kTagSoundStreamBlock:
        SoundStreamBlock();
        break;
    default:
        DispatchDefinition();
        break;
    }
}

// The tag's body is queued as one block; it runs when the tick has drawn its frames.
void ScriptThread::DoAction()
{
    if (seeking || !display || !player)
        return;
    const U8* body = script + pos;
    display->actions.PushAction(body, body, script + tagEnd, player->sharedScript, this);
}

S32 ScriptThread::DoTags(S32 frame)
{
    S32 result = kDrawn;
    frameTags = 0;
    while (curFrame < frame && result == kDrawn)
        result = frameTags < gLimits.tagsPerTimeline ? DoTag() : S32(kNeedsData);
    return result;
}

S32 ScriptThread::DrawFrame(S32 frame, bool seek)
{
    if (scriptErr != kErrNone)
        return scriptErr;
    if (!player || !player->gotHeader)
        return kNeedsData;
    if (!rootObject && !MakeRootObject())
        return kDrawFailed;
    SPlayer* keeper = splayer;
    if (!keeper)
        return RunTo(frame, seek);
    keeper->focus.Save();
    const S32 result = RunTo(frame, seek);
    keeper->focus.Clear();
    return result;
}

S32 ScriptThread::RunTo(S32 frame, bool seek)
{
    if (seek && curFrame > frame)
        return SeekBack(frame);
    if (seek)
        RunSilently(frame);
    return DoTags(frame);
}

// A movie hangs from an object of its own, instantiated from a character that no tag can define.
bool ScriptThread::MakeRootObject()
{
    if (!display)
        return false;
    SCharacter* character = player->FindCharacter(kIdMovieRoot);
    if (!character)
        character = player->CreateCharacter(kIdMovieRoot);
    if (!character)
        return false;
    character->type = kCharMovieRoot;

    PlaceInfo info;
    info.Clear();
    info.flags = PlaceInfo::kCharacter;
    info.character = character;
    info.depth = layerDepth;
    rootObject = display->PlaceObject(&display->root, &info);
    if (!rootObject)
        return false;
    rootObject->thread = this;
    return true;
}

void ScriptThread::Rewind()
{
    pos = startPos;
    curFrame = -1;
    label = nullptr;
    atEnd = false;
}

// There is no store of frames: whatever lies behind is rebuilt from the first tag, while the hold
// keeps the objects that are there before and after.
S32 ScriptThread::SeekBack(S32 frame)
{
    Rewind();
    if (display)
        display->BeginHold(rootObject);
    RunSilently(frame);
    const S32 result = DoTags(frame);
    if (display)
        display->FinishHold();
    return result;
}

// Runs the frames before `frame` without actions and sounds; whatever stops it stops the loud run
// of `frame` too, so its result is not needed.
void ScriptThread::RunSilently(S32 frame)
{
    seeking = true;
    soundResync = true;
    if (frame > 0)
        DoTags(frame - 1);
    seeking = false;
}

void ScriptThread::DoFrame(S32 advance, bool rebuild)
{
    if (!playing && !rebuild)
        return;
    S32 target = Saturate32(static_cast<S64>(curFrame) + advance);
    if (IsRoot() && !player->FrameAvailable(target))
        target = player->numFramesComplete;
    if (rebuild) {
        // Standing one frame too far makes the current frame one to go back to.
        target = curFrame;
        curFrame = Saturate32(static_cast<S64>(curFrame) + 1);
    }
    const S32 result = DrawFrame(target, rebuild);
    if (result == kDrawn || result == kNeedsData)
        return;
    StopSound();
    // A timeline of one frame has nothing to loop through, so it stops.
    if (result == kAtEnd && loop && curFrame != 0)
        DrawFrame(0, true);
    else
        playing = false;
}

void ScriptThread::Seek(S32 frame)
{
    StopPlay();
    DrawFrame(frame < 0 ? 0 : frame, true);
}

void ScriptThread::StopPlay()
{
    playing = false;
    StopSound();
}

void ScriptThread::Play(bool rewind)
{
    soundResync = true;
    if (rewind && !loop && curFrame >= numFrames - 1)
        Seek(0);
    playing = true;
}

S32 ScriptThread::FindLabel(const char* name)
{
    STagWalker walker(*this, startPos);
    S32 frame = 0;
    if (!name)
        return -1;
    // The End tag does not stop the search, only the end of the data does.
    for (S32 code; HasBudget() && (code = walker.GetTag(len)) >= 0; walker.pos = walker.tagEnd) {
        ChargeWork(kWorkPerHeader);
        if (code == kTagShowFrame)
            frame++;
        else if (code == kTagFrameLabel && IsLabel(walker.PeekString(), name))
            return frame;
    }
    return -1;
}

bool ScriptThread::IsLabel(const char* text, const char* name)
{
    const int common = StrCommon(text, name);
    ChargeWork(common);
    return text[common] == 0 && name[common] == 0;
}
