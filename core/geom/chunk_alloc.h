// Items of one fixed size from blocks of many: thousands of small records come and go per frame
// without a heap call each. Each owner holds one ChunkAlloc per record type and passes sizeof(T).
// Not thread-safe. Items are raw memory, aligned for pointers and 64-bit members; destructors are
// the owner's business. The blocks, and so every item, die with the allocator.
#pragma once

#include "core/geom/types.h"

class ChunkAlloc;

// A slot of a block: the word before every item. A free slot keeps the next free slot's address in
// the caller's area.
struct ChunkSlot;

// Header of one heap allocation; the slots follow.
struct ChunkBlock {
    U32 tag;             // the owner's marker, for looking at memory
    ChunkAlloc* owner;   //
    ChunkBlock* next;    // in creation order
    ChunkBlock* prev;    //
    ChunkSlot* freeList; // first free slot
    U16 used;            // items handed out
    U16 number;          // rank in creation order
};

class ChunkAlloc {
public:
    // size: bytes per item (0 counts as 1). itemsPerChunk is brought into 1 to 65535. keepEmpties:
    // a block stays allocated when its last item is freed, until FreeEmpties. tag: the blocks'
    // marker. Allocates nothing yet.
    ChunkAlloc(int size, int itemsPerChunk, int keepEmpties, U32 tag);
    ~ChunkAlloc();
    ChunkAlloc(const ChunkAlloc&) = delete;
    ChunkAlloc& operator=(const ChunkAlloc&) = delete;

    // A zeroed item; null when the heap or the budget is exhausted.
    void* Alloc();
    // Gives an item of this allocator back; null is ignored. Its block becomes the next to allocate
    // from when it is older than the current one, which keeps live items packed.
    void Free(void* item);
    // Releases every block without items.
    void FreeEmpties();

    // No more than maxBlocks blocks from now on: Alloc returns null instead of making another.
    void SetBudget(size_t maxBlocks) { budget = maxBlocks; }

    // Bytes per slot, the word before the item included; blocks held now.
    S32 ItemSize() const { return itemSize; }
    size_t BlockCount() const { return blockCount; }

private:
    ChunkBlock* CreateChunk();
    void FreeChunk(ChunkBlock* block);
    ChunkBlock* FindFreeSlot() const;

    S32 itemSize;
    S32 itemsPerChunk;
    U32 tag;
    S32 nextNumber; // number of the next block
    bool keepEmpties;
    ChunkBlock* first;   // all blocks, in creation order
    ChunkBlock* last;    //
    ChunkBlock* current; // the block to allocate from next; every block before it is full
    size_t blockCount;
    size_t budget; // most blocks allowed
};
