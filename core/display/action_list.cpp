#include "core/display/action_list.h"

#include <cstdlib>

#include "core/stream/movie_data.h"
#include "core/stream/script_thread.h"

namespace {
constexpr U32 kFirstCapacity = 32;
constexpr U32 kLargestCapacity = 4096;

SActionBlock* NewBlocks(U32 count)
{
    return static_cast<SActionBlock*>(std::calloc(count, sizeof(SActionBlock)));
}
} // namespace

ActionList::ActionList() : capacity(kFirstCapacity), mask(0), blocks(NewBlocks(kFirstCapacity))
{
    if (!blocks)
        capacity = 0;
    mask = capacity ? capacity - 1 : 0;
}

ActionList::~ActionList()
{
    Clear();
    std::free(blocks);
}

void ActionList::PushAction(const U8* actions, const U8* body, const U8* end, MovieData* data,
                            ScriptThread* thread)
{
    if (Size() >= capacity && !Grow())
        return;
    if (data)
        data->AddRef();
    if (thread)
        thread->actionsQueued++;
    At(tail) = {actions, end, body, data, thread};
    tail++;
}

// When memory is exhausted the old ring stays, and is full.
bool ActionList::Grow()
{
    const U32 doubled = capacity * 2;
    if (capacity == 0 || doubled > kLargestCapacity)
        return false;
    SActionBlock* grown = NewBlocks(doubled);
    if (!grown)
        return false;
    for (U32 i = head; i != tail; i++)
        grown[i & (doubled - 1)] = At(i);
    std::free(blocks);
    blocks = grown;
    capacity = doubled;
    mask = doubled - 1;
    return true;
}

U32 ActionList::RemoveThread(ScriptThread* thread)
{
    U32 i = head;
    for (; i != tail && thread->actionsQueued > 0; i++) {
        if (At(i).thread != thread)
            continue;
        At(i).actions = nullptr;
        At(i).thread = nullptr;
        thread->actionsQueued--;
    }
    return i - head;
}

void ActionList::PopFront()
{
    SActionBlock& block = At(head);
    MovieData* data = block.data;
    if (block.thread)
        block.thread->actionsQueued--;
    block.data = nullptr;
    block.thread = nullptr;
    head++;
    if (data)
        data->Release();
}

void ActionList::Clear()
{
    while (Size() > 0)
        PopFront();
    head = tail = 0;
}

void SCallTable::FreeLists(int from)
{
    for (int i = from; i <= kMaxLevels && levels[i].list; i++) {
        delete levels[i].list;
        levels[i].list = nullptr;
    }
}
