#include "core/geom/chunk_alloc.h"
#include "core/geom/grow_buffer.h"

#include <gtest/gtest.h>

#include <random>
#include <vector>

namespace {

TEST(ChunkAlloc, BlocksComeDriftBackAndGo)
{
    EXPECT_EQ(ChunkAlloc(65, 4, 1, 0).ItemSize(), 64 + 2 * S32(sizeof(void*)));
    ChunkAlloc pool(16, 2, 1, 0);
    pool.SetBudget(3);
    std::vector<void*> items(7);
    for (void*& item : items)
        item = pool.Alloc();
    EXPECT_EQ(items[6], nullptr) << "the budget is spent";
    for (size_t i : {5u, 2u, 0u})
        pool.Free(items[i]);
    for (size_t i : {0u, 2u, 5u}) // the oldest block with room comes first
        EXPECT_EQ(pool.Alloc(), items[i]);
    pool.Free(items[4]);
    pool.Free(items[5]);
    pool.FreeEmpties();
    EXPECT_EQ(pool.BlockCount(), 2u);
    EXPECT_NE(pool.Alloc(), nullptr);
}

// Random use, checked against a plain list of what is live: items never overlap and start as zeros,
// no block is made while one has room, and unless they are kept, empty ones go.
TEST(ChunkAlloc, SurvivesRandomUse)
{
    for (int keep : {0, 1}) {
        ChunkAlloc pool(24, 5, keep, 0);
        std::mt19937 random(7);
        std::vector<U64*> live;
        for (int i = 0; i < 20000; i++) {
            if (random() % 100 < ((i / 2000) % 2 ? 45u : 55u)) {
                const size_t blocks = pool.BlockCount(), room = blocks * 5 - live.size();
                auto* item = static_cast<U64*>(pool.Alloc());
                ASSERT_EQ(pool.BlockCount(), blocks + (room == 0));
                ASSERT_EQ(item[0] | item[1] | item[2], 0u);
                item[0] = item[2] = reinterpret_cast<std::uintptr_t>(item);
                live.push_back(item);
            } else if (!live.empty()) {
                std::swap(live[random() % live.size()], live.back());
                U64* item = live.back();
                live.pop_back();
                ASSERT_TRUE(item[0] == reinterpret_cast<std::uintptr_t>(item) &&
                            item[2] == item[0]);
                pool.Free(item);
            }
            if (random() % 1000 == 0)
                pool.FreeEmpties();
            for (const ChunkBlock* block = pool.First(); block && !keep; block = block->next)
                ASSERT_GT(block->used, 0);
        }
    }
}

TEST(GrowBuffer, KeepsItsMemoryAndGainsZeros)
{
    GrowBuffer<U64> buffer;
    for (U64 i = 0; i < 1000; i++)
        ASSERT_TRUE(buffer.Push(i * i));
    const U64* memory = buffer.data();
    buffer.Truncate(3);
    ASSERT_TRUE(buffer.Resize(1000));
    EXPECT_EQ(buffer[2] + buffer[3] + buffer[999], 4u) << "zeros even where old elements lay";
    EXPECT_EQ(buffer.data(), memory);
    EXPECT_FALSE(buffer.Resize(static_cast<size_t>(-1)));
    EXPECT_EQ(buffer.size(), 1000u);
}

} // namespace
