// What records do with timelines and display objects.
#include "core/player/action_runner.h"

#include <algorithm>

#include "core/geom/fixed.h"
#include "core/player/numbers.h"
#include "core/sound/sound_mix.h"
#include "core/stream/str.h"

namespace {

constexpr S32 kMaxDepth = 0xFFFF;
constexpr double kTwips = 20; // in a pixel

enum SProperty : S32 {
    kPropTargetPath = 11,
    kPropName = 13,
    kPropDropTarget = 14,
    kPropURL = 15,
    kPropCount = 19,
};

bool IsTextProperty(S32 index)
{
    return index == kPropTargetPath || (index >= kPropName && index <= kPropURL);
}

bool IsProperty(S32 index)
{
    return index >= 0 && index < kPropCount;
}

// Corners may come in any order. One that lies as far left as can be makes no empty rectangle.
SRECT RectOfCorners(const S32 x[2], const S32 y[2])
{
    return {std::max(std::min(x[0], x[1]), kRectEmpty + 1), std::max(x[0], x[1]),
            std::min(y[0], y[1]), std::max(y[0], y[1])};
}

} // namespace

void ActionRunner::SeekTo(ScriptThread* thread, S64 frame)
{
    if (!thread)
        return;
    TagCharge charge(player);
    thread->Seek(Saturate32(frame));
}

void ActionRunner::SeekLabel(ScriptThread* thread, const SActionRecord& record)
{
    if (!thread)
        return;
    S32 size = 0;
    const char* text = record.String(0, &size);
    ScriptValue label;
    label.SetText(text, size);
    ChargeText(size);
    TagCharge charge(player);
    const S32 frame = thread->FindLabel(label.Text());
    if (frame >= 0)
        thread->Seek(frame);
}

ScriptThread* ActionRunner::PopFrame(ScriptThread* thread, S32* frame)
{
    ScriptValue name = stack.Pop();
    const char* text = name.Text();
    ChargeText(name.Length());
    TagCharge charge(player);
    return player->ResolveFrameNum(text, thread, frame);
}

void ActionRunner::SeekNamed(ScriptThread* thread, bool play)
{
    S32 frame = 0;
    ScriptThread* target = PopFrame(thread, &frame);
    if (!target)
        return;
    SeekTo(target, frame);
    if (play)
        target->Play(false);
}

int ActionRunner::RecordsToSkip(ScriptThread* thread, S32 frame, U8 count) const
{
    return thread && thread->player && !thread->player->FrameAvailable(frame) ? count : 0;
}

int ActionRunner::RecordsToSkipNamed(ScriptThread* thread, U8 count)
{
    S32 frame = 0;
    ScriptThread* target = PopFrame(thread, &frame);
    return RecordsToSkip(target, frame, count);
}

ScriptThread* ActionRunner::FindFrom(const ScriptThread* thread, const char* path) const
{
    return player->FindTarget(thread ? thread->rootObject : nullptr, path);
}

// Found from the block's own timeline, never from the target before. One that is not there counts
// as chosen: records that need a timeline then do nothing.
void ActionRunner::SetTarget(const char* path)
{
    const ScriptThread* own = RunningBlock().thread;
    SCallLevel& level = calls.levels[calls.level];
    level.targetSet = *path != 0;
    level.target = level.targetSet && own && own->rootObject ? FindFrom(own, path) : nullptr;
}

void ActionRunner::SetTargetText(const SActionRecord& record)
{
    S32 size = 0;
    const char* text = record.String(0, &size);
    ScriptValue path;
    path.SetText(text, size);
    SetTarget(path.Text());
}

ScriptThread* ActionRunner::PopTarget(ScriptThread* thread)
{
    ScriptValue path = stack.Pop();
    const char* text = path.Text();
    return *text == 0 ? thread : FindFrom(thread, text);
}

void ActionRunner::PushVariable(ScriptThread* thread)
{
    ScriptValue path = stack.Pop();
    ScriptValue* value = stack.Push();
    if (!value)
        return;
    const char* name = path.Text();
    player->GetVariable(thread, name, value);
    ChargeText(static_cast<S64>(path.Length()) + value->Length());
}

void ActionRunner::StoreVariable(ScriptThread* thread)
{
    ScriptValue value = stack.Pop();
    ScriptValue path = stack.Pop();
    const char* name = path.Text();
    const char* text = value.Text();
    ChargeText(static_cast<S64>(path.Length()) + value.Length());
    player->SetVariable(thread, name, text, 1);
}

void ActionRunner::PushProperty(ScriptThread* thread)
{
    const S32 index = PopInt();
    ScriptThread* target = PopTarget(thread);
    if (!target || !IsProperty(index)) {
        PushText("", 0);
    } else if (IsTextProperty(index)) {
        char* text = player->GetPropertyStr(target, index);
        PushText(text ? text : "", text ? StrLength(text) : 0);
        FreeStr(text);
    } else {
        PushNumber(player->GetProperty(target, index));
    }
}

void ActionRunner::StoreProperty(ScriptThread* thread)
{
    ScriptValue value = stack.Pop();
    const S32 index = PopInt();
    ScriptThread* target = PopTarget(thread);
    double number = 0;
    if (!target || !IsProperty(index))
        return;
    const bool named = index == kPropName;
    if (named)
        ChargeText(value.Length());
    else
        ChargeNumber(value);
    if (named)
        player->SetPropertyStr(target, index, value.Text());
    else if (!IsTextProperty(index) && value.GetNumber(&number))
        player->SetProperty(target, index, number);
}

void ActionRunner::CloneSprite(ScriptThread* thread)
{
    const S32 depth = PopInt();
    ScriptValue name = stack.Pop();
    ChargeText(name.HeapLength());
    ScriptThread* source = PopTarget(thread);
    const SObject* obj = source ? source->rootObject : nullptr;
    if (!obj || obj->parent == &player->scene.root || depth < 0 || depth > kMaxDepth)
        return;
    TagCharge charge(player);
    if (ScriptThread* parent = obj->parent->thread)
        parent->CloneSprite(source, name.Text(), depth);
}

// Only what scripts have made; a level's object has the level's number for its depth.
void ActionRunner::RemoveSprite(ScriptThread* thread)
{
    ScriptThread* target = PopTarget(thread);
    const SObject* obj = target ? target->rootObject : nullptr;
    if (!obj || obj->depth <= DisplayList::kMaxTimelineDepth)
        return;
    if (obj->parent == &player->scene.root)
        player->ClearLayer(target->layerNum);
    else if (ScriptThread* parent = obj->parent->thread)
        parent->RemoveSprite(target, false);
}

void ActionRunner::StartDrag(ScriptThread* thread)
{
    ScriptThread* target = PopTarget(thread);
    const bool lockCenter = PopInt() == 1;
    SRECT bounds;
    RectSetEmpty(&bounds);
    if (PopInt() == 1) {
        S32 x[2], y[2];
        for (int i = 1; i >= 0; i--) {
            y[i] = TruncateToInt(PopNumber() * kTwips);
            x[i] = TruncateToInt(PopNumber() * kTwips);
        }
        bounds = RectOfCorners(x, y);
    }
    if (target)
        player->StartDrag(target, lockCenter, &bounds);
}

void ActionRunner::StopSounds()
{
    if (CSoundMix* mix = player->scene.soundMix)
        mix->RemoveAll();
}
