#include "core/geom/chunk_alloc.h"

#include <cassert>
#include <cstdlib>
#include <cstring>

// Under AddressSanitizer the items that nobody holds are marked, so that a use after Free is found
// as it would be for memory from the heap.
#if defined(__has_feature)
#if __has_feature(address_sanitizer)
#define __SANITIZE_ADDRESS__ 1
#endif
#endif
#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/asan_interface.h>
static void MarkFree(void* p, size_t n)
{
    __asan_poison_memory_region(p, n);
}
static void MarkUsed(void* p, size_t n)
{
    __asan_unpoison_memory_region(p, n);
}
#else
static void MarkFree(void*, size_t) {}
static void MarkUsed(void*, size_t) {}
#endif

struct ChunkSlot {
    ChunkBlock* block; // where the slot lies
    ChunkSlot* next;   // next free slot while this one is free; the item's first word otherwise
};

namespace {
// Items hold 64-bit numbers, which some 32-bit targets align to 8: slots are laid out in words of
// whatever a record's member needs.
struct AlignProbe {
    char lead;
    union {
        void* pointer;
        U64 number;
    } value;
};
constexpr size_t kWord = offsetof(AlignProbe, value);
constexpr size_t kHeadSize = (sizeof(ChunkBlock) + kWord - 1) / kWord * kWord;

S32 SlotSize(int size)
{
    const size_t bytes = size < 1 ? 1 : static_cast<size_t>(size);
    return static_cast<S32>(((bytes - 1) & ~(kWord - 1)) + 2 * kWord);
}

U8* ItemOf(ChunkSlot* slot)
{
    return reinterpret_cast<U8*>(slot) + kWord;
}

ChunkSlot* SlotOf(void* item)
{
    return reinterpret_cast<ChunkSlot*>(static_cast<U8*>(item) - kWord);
}
} // namespace

ChunkAlloc::ChunkAlloc(int size, int perChunk, int keep, U32 marker)
    : itemSize(SlotSize(size)), itemsPerChunk(perChunk < 1       ? 1
                                              : perChunk > 65535 ? 65535
                                                                 : perChunk),
      tag(marker), nextNumber(0), keepEmpties(keep), first(nullptr), last(nullptr),
      current(nullptr), oldest(nullptr), blockCount(0), budget(static_cast<size_t>(-1))
{
}

ChunkAlloc::~ChunkAlloc()
{
    while (first)
        FreeChunk(first);
}

void* ChunkAlloc::Alloc()
{
    if (!current || !current->freeList)
        SelectBlockWithRoom();
    if (!current && !CreateChunk())
        return nullptr;
    ChunkSlot* slot = current->freeList;
    MarkUsed(slot, static_cast<size_t>(itemSize));
    current->freeList = slot->next;
    current->used++;
    return std::memset(ItemOf(slot), 0, static_cast<size_t>(itemSize) - kWord);
}

void ChunkAlloc::Free(void* item)
{
    if (!item)
        return;
    ChunkSlot* slot = SlotOf(item);
    ChunkBlock* block = slot->block;
    assert(block->owner == this && block->used > 0);
    slot->next = block->freeList;
    block->freeList = slot;
    MarkFree(ItemOf(slot), static_cast<size_t>(itemSize) - kWord);
    block->used--;
    if (block->used == 0 && !keepEmpties) {
        FreeChunk(block);
        return;
    }
    if (!current || block->number < current->number)
        current = block;
    if (!oldest || block->number < oldest->number)
        oldest = block;
}

void ChunkAlloc::FreeEmpties()
{
    for (ChunkBlock* block = first; block;) {
        ChunkBlock* next = block->next;
        if (block->used == 0)
            FreeChunk(block);
        block = next;
    }
}

// Makes the oldest block with a free slot current, or none. Everything older than `oldest` is full,
// which spares the walk over a long list of full blocks.
void ChunkAlloc::SelectBlockWithRoom()
{
    ChunkBlock* block = oldest;
    while (block && !block->freeList)
        block = block->next;
    oldest = block;
    current = block;
}

ChunkBlock* ChunkAlloc::CreateChunk()
{
    const U64 bytes = kHeadSize + static_cast<U64>(itemsPerChunk) * static_cast<U64>(itemSize);
    if (blockCount >= budget || bytes > static_cast<size_t>(-1) / 2)
        return nullptr;
    void* memory = std::malloc(static_cast<size_t>(bytes));
    if (!memory)
        return nullptr;
    auto* block = static_cast<ChunkBlock*>(memory);
    *block = {tag, this, nullptr, last, nullptr, 0, static_cast<U32>(nextNumber++)};

    // From the last slot to the first, so that the list hands them out in address order.
    U8* slots = static_cast<U8*>(memory) + kHeadSize;
    for (S32 i = itemsPerChunk - 1; i >= 0; i--) {
        auto* slot = reinterpret_cast<ChunkSlot*>(slots + static_cast<size_t>(i) * itemSize);
        *slot = {block, block->freeList};
        block->freeList = slot;
    }
    (last ? last->next : first) = block;
    last = block;
    blockCount++;
    current = block;
    oldest = oldest ? oldest : block;
    return block;
}

void ChunkAlloc::FreeChunk(ChunkBlock* block)
{
    (block->prev ? block->prev->next : first) = block->next;
    (block->next ? block->next->prev : last) = block->prev;
    if (current == block)
        current = first;
    if (oldest == block)
        oldest = block->next;
    blockCount--;
    MarkUsed(block, kHeadSize + static_cast<size_t>(itemsPerChunk) * itemSize);
    std::free(block);
}
