// Fixed-size items handed out from blocks of many, for records that come and go by the thousand
// in every frame. Each owner holds one allocator per record size. Not thread-safe.
#pragma once

#include "core/geom/types.h"

class ChunkAlloc;

// A slot: the pointer to its block, then the caller's item. While the slot is free the item's
// first word links to the next free slot.
struct ChunkSlot;

// The head of one heap allocation; the slots follow it.
struct ChunkBlock {
    U32 tag;             // the owner's marker, for memory dumps only
    ChunkAlloc* owner;   // the allocator it belongs to
    ChunkBlock* next;    // younger block
    ChunkBlock* prev;    // older block
    ChunkSlot* freeList; // first free slot, null when full
    U16 used;            // items handed out
    U32 number;          // age: the n-th block that the owner made
};

// The allocator drifts back to its oldest blocks, which keeps live items packed and lets younger
// blocks empty out. Items are plain memory: their destructors are the caller's business, and the
// allocator's destructor releases every block, items in use or not.
class ChunkAlloc {
public:
    // size: bytes per item, taken as at least 1. itemsPerChunk: 1 to 65535, clamped. keepEmpties:
    // a block whose last item is freed stays until FreeEmpties. No memory is taken yet.
    ChunkAlloc(int size, int itemsPerChunk, int keepEmpties, U32 tag);
    ~ChunkAlloc();
    ChunkAlloc(const ChunkAlloc&) = delete;
    ChunkAlloc& operator=(const ChunkAlloc&) = delete;

    // An item of zeros, aligned for pointers and 64-bit numbers; null when the heap is exhausted
    // or the budget spent.
    void* Alloc();

    // Takes back an item of this allocator; null is ignored. Nothing may use the item afterwards.
    void Free(void* item);

    // Releases every block without an item in use.
    void FreeEmpties();

    // From now on no block is made while maxBlocks or more exist.
    void SetBudget(size_t maxBlocks) { budget = maxBlocks; }

    S32 ItemSize() const { return itemSize; }
    const ChunkBlock* First() const { return first; }
    size_t BlockCount() const { return blockCount; }

private:
    ChunkBlock* CreateChunk();
    void FreeChunk(ChunkBlock* block);
    void SelectBlockWithRoom();

    S32 itemSize;        // bytes per slot, back pointer included
    S32 itemsPerChunk;   // slots per block
    U32 tag;             // copied into every block
    S32 nextNumber;      // of the next block made
    S32 keepEmpties;     // not 0: empty blocks stay
    ChunkBlock* first;   // blocks in the order of their making
    ChunkBlock* last;    //
    ChunkBlock* current; // where to allocate next; null when every block is full
    ChunkBlock* oldest;  // no block older than this one has room; null when none has
    size_t blockCount;   // blocks in the list
    size_t budget;       // blocks allowed
};
