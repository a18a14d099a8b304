// ActionRunner: one run of the action queue. Internal to the player.
#pragma once

#include "core/player/opcodes.h"
#include "core/player/player.h"

// A request for a URL, recorded by a script and sent off after the run. All strings owned.
struct SURLRequest {
    char* url;
    char* window;
    char* postData; // null: none
    U8 flags;
};

// Lives on the stack of SPlayer::DoActions. Whatever a record does may end timelines, levels, even
// the whole movie: between two records only the player itself, the call table and the bytes of the
// running block are known to be there, and the block's timeline is looked up anew in its queue.
class ActionRunner {
public:
    explicit ActionRunner(SPlayer* player);
    ~ActionRunner();
    ActionRunner(const ActionRunner&) = delete;
    ActionRunner& operator=(const ActionRunner&) = delete;

    // Runs what is queued, and what is queued meanwhile, until nothing is left or a limit strikes.
    void Run();
    // Hands the requests over, in the order in which they were recorded.
    void SendRequests();

private:
    static constexpr int kMaxRequests = 32;

    struct Operands {
        double a;
        double b; // was on top
    };

    // --- queue and levels (actions.cpp, calls.cpp) ---
    void NextBlock();
    void RunBlock(const SActionBlock& block);
    template <bool kTraced> void RunRecords(const SActionBlock& block);
    bool CountRecord();
    void Abort();
    void DropLevel();
    void Call(ScriptThread* thread, const U8* resumeAt);
    SActionBlock& RunningBlock() const;
    ScriptThread* RecordThread() const;
    const U8* JumpTarget(const SActionBlock& block, const SActionRecord& record) const;

    // --- stack (action_runner.cpp) ---
    double PopNumber();
    Operands PopOperands();
    S32 PopInt();
    void PushNumber(double value);
    void PushBool(bool value);
    void PushText(const char* text, int n);
    void PushRecord(const SActionRecord& record);
    void Divide();
    int CompareStrings();
    void AppendString();
    void PushLength();
    void Extract(int multibyte);
    void FirstByte();
    void Character(bool twoBytes);
    void ChargeText(S64 bytes);
    void ChargeNumber(const ScriptValue& value);

    // --- timelines and objects (action_targets.cpp) ---
    void SeekTo(ScriptThread* thread, S64 frame);
    void SeekLabel(ScriptThread* thread, const SActionRecord& record);
    void SeekNamed(ScriptThread* thread, bool play);
    int RecordsToSkip(ScriptThread* thread, S32 frame, U8 count) const;
    int RecordsToSkipNamed(ScriptThread* thread, U8 count);
    ScriptThread* PopFrame(ScriptThread* thread, S32* frame);
    void SetTarget(const char* path);
    void SetTargetText(const SActionRecord& record);
    ScriptThread* PopTarget(ScriptThread* thread);
    void PushVariable(ScriptThread* thread);
    void StoreVariable(ScriptThread* thread);
    void PushProperty(ScriptThread* thread);
    void StoreProperty(ScriptThread* thread);
    void CloneSprite(ScriptThread* thread);
    void RemoveSprite(ScriptThread* thread);
    void StartDrag(ScriptThread* thread);
    void StopSounds();

    // --- requests (url_actions.cpp) ---
    void RecordURL(const SActionRecord& record);
    void RecordURLExpr(ScriptThread* thread, U8 flags);
    ScriptThread* FindFrom(const ScriptThread* thread, const char* path) const;
    bool ResolveWindow(ScriptThread* thread, ScriptValue* window, U8* flags);
    bool SetToPath(const ScriptThread* target, ScriptValue* window) const;
    void AddRequest(char* url, char* window, char* postData, U8 flags);

    SPlayer* const player;
    ValueStack& stack;
    SCallTable& calls;
    bool resuming = false; // the next block goes on after a call
    U32 executed = 0;      // records of this run, skipped ones included
    U64 workLimit = 0;     // of DisplayList::work, for this run
    int requestCount = 0;
    SURLRequest requests[kMaxRequests] = {};
};

// Takes what a walk over tags has used of the tick's budget as work of the run, when it ends.
class TagCharge {
public:
    explicit TagCharge(SPlayer* p) : player(p), before(p->scene.tagsLeft) {}
    ~TagCharge()
    {
        if (before > player->scene.tagsLeft)
            player->scene.work += before - player->scene.tagsLeft;
    }
    TagCharge(const TagCharge&) = delete;
    TagCharge& operator=(const TagCharge&) = delete;

private:
    SPlayer* player;
    U32 before;
};

// Queues the action blocks of a frame (from 0) of the timeline; returns how many tags were looked
// at.
U32 QueueFrameActions(ScriptThread* thread, S32 frame, ActionList* list);

// Ends all levels of calls at once; whoever runs them notices by `level`.
void EndCalls(SCallTable* calls);
