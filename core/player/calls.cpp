// Calls: the actions of some frame run in the middle of a block, on a level of their own.
#include <new>

#include "core/player/action_runner.h"
#include "core/stream/tags.h"

namespace {

constexpr int kKeptLevels = 8;

U32 SkipFrames(STagWalker* walker, S32 len, S32 frames)
{
    U32 seen = 0;
    while (frames > 0 && walker->GetTag(len) >= 0) {
        frames -= walker->tagCode == kTagShowFrame;
        walker->pos = walker->tagEnd;
        seen++;
    }
    return seen;
}

} // namespace

U32 QueueFrameActions(ScriptThread* thread, S32 frame, ActionList* list)
{
    MovieData* data = thread->player ? thread->player->sharedScript : nullptr;
    STagWalker walker(*thread, thread->startPos);
    U32 seen = SkipFrames(&walker, thread->len, frame);
    while (walker.GetTag(thread->len) >= 0 && walker.tagCode != kTagShowFrame) {
        const U8* body = walker.script + walker.pos;
        if (walker.tagCode == kTagDoAction)
            list->PushAction(body, body, walker.script + walker.tagEnd, data, thread);
        walker.pos = walker.tagEnd;
        seen++;
    }
    return seen;
}

void SPlayer::CallFrame(ScriptThread* thread, S32 frameToRun)
{
    if (actionDepth == 0)
        scene.ResetBudget();
    QueueFrameActions(thread, frameToRun, &scene.actions);
    DoActions();
    UpdateScreen();
}

// The caller goes on after the call when its level is the active one again. A caller whose timeline
// has gone is not to be entered again.
void ActionRunner::Call(ScriptThread* thread, const U8* resumeAt)
{
    S32 frame = 0;
    ScriptThread* target = PopFrame(thread, &frame);
    if (!target || calls.level >= SCallTable::kMaxLevels)
        return;
    ActionList*& list = calls.levels[calls.level + 1].list;
    if (!list)
        list = new (std::nothrow) ActionList;
    if (!list)
        return;
    player->scene.work += QueueFrameActions(target, frame, list);
    if (RunningBlock().actions)
        RunningBlock().actions = resumeAt;
    calls.level++;
}

// The lists of the first levels stay for the next calls.
void ActionRunner::DropLevel()
{
    calls.levels[calls.level].list->Clear();
    if (calls.level > kKeptLevels)
        calls.FreeLists(calls.level);
    calls.level--;
    resuming = true;
}

void EndCalls(SCallTable* calls)
{
    calls->FreeLists(2);
    calls->level = 0;
}
