// ActionList: the queue of action blocks that wait to be run, and the levels of calls that run
// them.
#pragma once

#include "core/geom/types.h"

class MovieData;
class ScriptThread;

// One block of action records. A null `thread` with null `actions` is an entry whose timeline went;
// it is skipped.
struct SActionBlock {
    const U8* actions;    // first record
    const U8* end;        // no record reaches beyond: the end of the tag that holds the block
    const U8* body;       // no jump goes before: the start of that tag's body
    MovieData* data;      // counted; the bytes that the block lies in
    ScriptThread* thread; // the timeline that it acts on
};

// A ring that grows from 32 to 4096 entries; counters never wrap in practice and the slot of
// counter c is c & mask. Player thread only.
class ActionList {
public:
    ActionList();
    ~ActionList();
    ActionList(const ActionList&) = delete;
    ActionList& operator=(const ActionList&) = delete;

    // Appends a block, and keeps its bytes alive; dropped silently when the queue is full.
    void PushAction(const U8* actions, const U8* body, const U8* end, MovieData* data,
                    ScriptThread* thread);
    // Every entry of the timeline becomes null, in place; the number of entries looked at.
    U32 RemoveThread(ScriptThread* thread);
    // Both counters to 0; all blocks are let go.
    void Clear();

    U32 Head() const { return head; }
    U32 Tail() const { return tail; }
    U32 Size() const { return tail - head; }
    // The entry of a counter from Head() to Tail() - 1; valid until the next PushAction.
    SActionBlock& At(U32 counter) { return blocks[counter & mask]; }
    // Lets go of the first entry and advances the head; only when Size() is above 0.
    void PopFront();

private:
    bool Grow();

    U32 capacity; // a power of two; 0 when even the first allocation failed
    U32 mask;
    SActionBlock* blocks;
    U32 head = 0;
    U32 tail = 0;
};

// A level of calls: level 1 drains the display list's own queue, each deeper one a list that a call
// has built.
struct SCallLevel {
    ActionList* list;     // owned from level 2 on, where it may wait empty for the next call
    ScriptThread* target; // chosen by the running block; may be null though targetSet
    bool targetSet;       // records act on `target` instead of the block's timeline
};

// The levels of one player. `level` names the active one, 0 while nothing runs.
struct SCallTable {
    static constexpr int kMaxLevels = 256;

    int level = 0;
    SCallLevel levels[kMaxLevels + 1] = {}; // from 1

    SCallTable() = default;
    ~SCallTable() { FreeLists(2); }
    SCallTable(const SCallTable&) = delete;
    SCallTable& operator=(const SCallTable&) = delete;
    // The lists of that level, 2 or above, and all deeper ones.
    void FreeLists(int from);
};
