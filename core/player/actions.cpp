// The run of the action queue: blocks in their order, records in theirs, and the table of what each
// record does.
#include "core/player/action_runner.h"

#include <cmath>

#include "core/player/limits.h"
#include "core/player/numbers.h"
#include "core/player/random.h"
#include "core/stream/movie_data.h"

void SPlayer::DoActions()
{
    if (!loaded)
        return;
    if (actionsAborted) {
        scene.actions.Clear();
        return;
    }
    if (actionDepth > 0)
        return;
    ActionRunner runner(this);
    actionDepth++;
    runner.Run();
    EndRun();
    actionDepth--;
    runner.SendRequests();
}

void SPlayer::EndRun()
{
    if (!cameraWaits)
        return;
    cameraWaits = false;
    SetCamera(2);
    RefreshMenus();
}

ActionRunner::ActionRunner(SPlayer* p) : player(p), stack(p->stack), calls(p->scene.calls) {}

void ActionRunner::Run()
{
    calls.level = 1;
    calls.levels[1] = {&player->scene.actions, nullptr, false};
    workLimit = player->scene.work + gLimits.workPerRun;
    while (calls.level > 0) {
        if (calls.levels[calls.level].list->Size() > 0)
            NextBlock();
        else
            DropLevel();
    }
}

SActionBlock& ActionRunner::RunningBlock() const
{
    ActionList* list = calls.levels[calls.level].list;
    return list->At(list->Head());
}

// A target chosen before a call is still chosen after it. A caller whose timeline went is passed
// over, like every other block of it.
void ActionRunner::NextBlock()
{
    SCallLevel& level = calls.levels[calls.level];
    const SActionBlock block = RunningBlock();
    if (!resuming) {
        level.target = nullptr;
        level.targetSet = false;
    }
    resuming = false;
    if (block.actions)
        RunBlock(block);
    else
        level.list->PopFront();
}

// The bytes stay while the block runs, whatever becomes of its movie.
void ActionRunner::RunBlock(const SActionBlock& block)
{
    MovieData* data = block.data;
    if (data)
        data->AddRef();
    if (player->tracer.record)
        RunRecords<true>(block);
    else
        RunRecords<false>(block);
    if (data)
        data->Release();
}

ScriptThread* ActionRunner::RecordThread() const
{
    const SCallLevel& level = calls.levels[calls.level];
    return level.targetSet ? level.target : RunningBlock().thread;
}

// Outside the block there is nothing to go on with; at its very end neither.
const U8* ActionRunner::JumpTarget(const SActionBlock& block, const SActionRecord& record) const
{
    const S64 at = (record.next - block.body) + static_cast<S16>(record.Word(0));
    return at >= 0 && at <= block.end - block.body ? block.body + at : block.end;
}

// The guard against scripts that never end. False when the run is over. The end mark of a block is
// no record, and is not counted.
bool ActionRunner::CountRecord()
{
    executed++;
    player->scene.work++;
    if (executed <= gLimits.actionsPerRun && player->scene.work <= workLimit && !stack.overflowed)
        return true;
    Abort();
    return false;
}

void ActionRunner::Abort()
{
    player->actionsAborted = true;
    stack.Clear(); // nobody can look at it before the movie has gone
    EndCalls(&calls);
    player->scene.actions.Clear();
}

// One block, from `actions` to where it ends, calls, or is ended by what it does.
template <bool kTraced> void ActionRunner::RunRecords(const SActionBlock& block)
{
    const int level = calls.level;
    const U8* pc = block.actions;
    const U8* const end = block.end;
    int skip = 0;
    Operands n;
    SActionRecord record;
    while (ReadActionRecord(pc, end, &record) && record.opcode != kOpEnd) {
        pc = record.next;
        if (skip > 0) {
            skip--;
            if (!CountRecord())
                return;
            continue;
        }
        ScriptThread* const thread = RecordThread();
        if constexpr (kTraced)
            player->tracer.record(player->tracer.context, thread, record, stack);
        switch (record.opcode) {
        case kOpNextFrame:
            SeekTo(thread, thread ? S64(thread->curFrame) + 1 : 0);
            break;
        case kOpPrevFrame:
            SeekTo(thread, thread ? S64(thread->curFrame) - 1 : 0);
            break;
        case kOpPlay:
            if (thread)
                thread->Play(false);
            break;
        case kOpStop:
            if (thread)
                thread->StopPlay();
            break;
        case kOpToggleQuality:
            player->ControlHighQuality();
            break;
        case kOpStopSounds:
            StopSounds();
            break;
        case kOpAdd:
            n = PopOperands();
            PushNumber(n.a + n.b);
            break;
        case kOpSubtract:
            n = PopOperands();
            PushNumber(n.a - n.b);
            break;
        case kOpMultiply:
            n = PopOperands();
            PushNumber(n.a * n.b);
            break;
        case kOpDivide:
            Divide();
            break;
        case kOpEquals:
            n = PopOperands();
            PushBool(n.a == n.b);
            break;
        case kOpLess:
            n = PopOperands();
            PushBool(n.a < n.b);
            break;
        case kOpAnd: // of whole numbers: 0.5 is false
            n = PopOperands();
            PushBool(TruncateToInt(n.a) != 0 && TruncateToInt(n.b) != 0);
            break;
        case kOpOr:
            n = PopOperands();
            PushBool(TruncateToInt(n.a) != 0 || TruncateToInt(n.b) != 0);
            break;
        case kOpNot:
            PushBool(PopNumber() == 0);
            break;
        case kOpStringEquals:
            PushBool(CompareStrings() == 0);
            break;
        case kOpStringLess:
            PushBool(CompareStrings() < 0);
            break;
        case kOpStringLength:
        case kOpMBStringLength: // bytes too: movies depend on it
            PushLength();
            break;
        case kOpStringExtract:
            Extract(0);
            break;
        case kOpMBStringExtract:
            Extract(1);
            break;
        case kOpStringAdd:
            AppendString();
            break;
        case kOpCharToAscii:
        case kOpMBCharToAscii:
            FirstByte();
            break;
        case kOpAsciiToChar:
            Character(false);
            break;
        case kOpMBAsciiToChar:
            Character(true);
            break;
        case kOpPop:
        case kOpTrace:
            stack.Pop();
            break;
        case kOpToInteger:
            PushNumber(std::trunc(PopNumber()));
            break;
        case kOpRandomNumber:
            PushNumber(Random(PopInt()));
            break;
        case kOpGetTime: // the one difference of two clock values that may be negative
            PushNumber(PlayerClock() - player->startTime);
            break;
        case kOpPush:
            PushRecord(record);
            break;
        case kOpGetVariable:
            PushVariable(thread);
            break;
        case kOpSetVariable:
            StoreVariable(thread);
            break;
        case kOpGetProperty:
            PushProperty(thread);
            break;
        case kOpSetProperty:
            StoreProperty(thread);
            break;
        case kOpSetTarget:
            SetTargetText(record);
            break;
        case kOpSetTargetExpr:
            SetTarget(stack.Pop().Text());
            break;
        case kOpCloneSprite:
            CloneSprite(thread);
            break;
        case kOpRemoveSprite:
            RemoveSprite(thread);
            break;
        case kOpStartDrag:
            StartDrag(thread);
            break;
        case kOpEndDrag:
            player->EndDrag();
            break;
        case kOpGotoFrame:
            SeekTo(thread, record.Word(0));
            break;
        case kOpGotoLabel:
            SeekLabel(thread, record);
            break;
        case kOpGotoFrameExpr:
            SeekNamed(thread, record.Byte(0) != 0);
            break;
        case kOpWaitForFrame:
            skip = RecordsToSkip(thread, record.Word(0), record.Byte(2));
            break;
        case kOpWaitForFrameExpr:
            skip = RecordsToSkipNamed(thread, record.Byte(0));
            break;
        case kOpJump:
            pc = JumpTarget(block, record);
            break;
        case kOpIf:
            if (PopNumber() != 0) // so what is not a number jumps
                pc = JumpTarget(block, record);
            break;
        case kOpCallFrame:
            Call(thread, pc);
            break;
        case kOpGetURL:
            RecordURL(record);
            break;
        case kOpGetURLExpr:
            RecordURLExpr(thread, record.Byte(0));
            break;
        }
        // When the movie has gone, the limits are no longer those of this run.
        if (calls.level == 0 || !CountRecord() || calls.level != level)
            return;
    }
    calls.levels[level].list->PopFront();
}
