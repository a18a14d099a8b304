#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <vector>

#include "core/geom/chunk_alloc.h"
#include "core/geom/grow_buffer.h"

namespace {
constexpr int kWord = sizeof(void*);

bool IsZero(const void* item, size_t size)
{
    const auto* bytes = static_cast<const U8*>(item);
    for (size_t i = 0; i < size; i++)
        if (bytes[i] != 0)
            return false;
    return true;
}

std::vector<void*> AllocMany(ChunkAlloc* pool, int count)
{
    std::vector<void*> items;
    for (int i = 0; i < count; i++)
        items.push_back(pool->Alloc());
    return items;
}
} // namespace

TEST(ChunkAlloc, SlotsHoldTheItemAndOneWord)
{
    const struct {
        int size, want;
    } rows[] = {{0, 2 * kWord},       {1, 2 * kWord},
                {kWord, 2 * kWord},   {64, 64 + kWord},
                {65, 64 + 2 * kWord}, {1028, (1028 + kWord - 1) / kWord * kWord + kWord}};
    for (const auto& row : rows)
        EXPECT_EQ(ChunkAlloc(row.size, 4, 1, 0).ItemSize(), row.want) << row.size;
}

TEST(ChunkAlloc, ASecondBlockComesAndStaysUntilEmptied)
{
    ChunkAlloc pool(64, 32, 1, 0x66666666);
    const std::vector<void*> items = AllocMany(&pool, 33);
    EXPECT_EQ(pool.BlockCount(), 2u);
    EXPECT_EQ(pool.First()->used, 32);
    EXPECT_EQ(pool.Last()->number, 1u);
    EXPECT_EQ(pool.Last()->tag, 0x66666666u);
    pool.Free(items[32]);
    EXPECT_EQ(pool.BlockCount(), 2u);
    pool.FreeEmpties();
    EXPECT_EQ(pool.BlockCount(), 1u);
    EXPECT_EQ(pool.First(), pool.Last());
    EXPECT_EQ(pool.Current(), pool.First());
    EXPECT_NE(pool.Alloc(), nullptr); // block 0 is full: a third block is made
    EXPECT_EQ(pool.Last()->number, 2u);
}

TEST(ChunkAlloc, DriftsBackToTheOldestBlock)
{
    ChunkAlloc pool(16, 2, 1, 0);
    const std::vector<void*> items = AllocMany(&pool, 6);
    pool.Free(items[5]);
    pool.Free(items[2]);
    pool.Free(items[0]);
    EXPECT_EQ(pool.Alloc(), items[0]); // block 0, then the oldest with room
    EXPECT_EQ(pool.Alloc(), items[2]);
    EXPECT_EQ(pool.Alloc(), items[5]);
    EXPECT_EQ(pool.BlockCount(), 3u);
}

TEST(ChunkAlloc, ReleasesAtOnceWhenEmptiesAreNotKept)
{
    ChunkAlloc pool(16, 2, 0, 0);
    const std::vector<void*> items = AllocMany(&pool, 5);
    pool.Free(items[4]);
    EXPECT_EQ(pool.BlockCount(), 2u);
    pool.Free(items[0]);
    pool.Free(items[1]);
    EXPECT_EQ(pool.BlockCount(), 1u);
    EXPECT_EQ(pool.First(), pool.Last());
    pool.Free(nullptr);
}

TEST(ChunkAlloc, ItemsStartAsZerosAndAligned)
{
    ChunkAlloc pool(40, 3, 1, 0);
    for (int round = 0; round < 2; round++) {
        const std::vector<void*> items = AllocMany(&pool, 10);
        for (void* item : items) {
            EXPECT_TRUE(IsZero(item, 40));
            EXPECT_EQ(reinterpret_cast<std::uintptr_t>(item) % alignof(void*), 0u);
            std::memset(item, 0xA5, 40);
        }
        for (void* item : items)
            pool.Free(item);
    }
    EXPECT_EQ(pool.BlockCount(), 4u);
}

TEST(ChunkAlloc, TheBudgetEndsInNull)
{
    ChunkAlloc pool(16, 2, 1, 0);
    pool.SetBudget(2);
    const std::vector<void*> items = AllocMany(&pool, 5);
    EXPECT_NE(items[3], nullptr);
    EXPECT_EQ(items[4], nullptr);
    EXPECT_EQ(pool.Alloc(), nullptr);
    pool.Free(items[1]);
    EXPECT_EQ(pool.Alloc(), items[1]);
    ChunkAlloc tiny(1, 0, 1, 0), wide(1, 70000, 1, 0); // counts are brought into 1 to 65535
    EXPECT_NE(tiny.Alloc(), nullptr);
    AllocMany(&wide, 65535);
    EXPECT_EQ(wide.BlockCount(), 1u);
    EXPECT_EQ(wide.First()->used, 65535);
    wide.Alloc();
    EXPECT_EQ(wide.BlockCount(), 2u);
}

// Random use, checked against a plain list of what is live: items never overlap, and no block is
// made while one has room.
TEST(ChunkAlloc, SurvivesRandomUse)
{
    for (int keep = 0; keep < 2; keep++) {
        ChunkAlloc pool(24, 5, keep, 0);
        std::mt19937 random(7);
        std::vector<U64*> live;
        for (int i = 0; i < 20000; i++) {
            if (random() % 1000 == 0)
                pool.FreeEmpties();
            const bool grow = random() % 100 < ((i / 2000) % 2 ? 45u : 55u);
            if (grow) {
                const size_t room = pool.BlockCount() * 5 - live.size();
                const size_t blocks = pool.BlockCount();
                auto* item = static_cast<U64*>(pool.Alloc());
                ASSERT_EQ(pool.BlockCount(), blocks + (room == 0));
                ASSERT_TRUE(IsZero(item, 24));
                item[0] = item[1] = item[2] = reinterpret_cast<std::uintptr_t>(item);
                live.push_back(item);
            } else if (!live.empty()) {
                std::swap(live[random() % live.size()], live.back());
                U64* item = live.back();
                ASSERT_TRUE(item[0] == reinterpret_cast<std::uintptr_t>(item) &&
                            item[2] == item[0]);
                live.pop_back();
                pool.Free(item);
            }
        }
    }
}

TEST(GrowBuffer, KeepsWhatWasPushedAndItsMemory)
{
    GrowBuffer<U64> buffer;
    for (U64 i = 0; i < 1000; i++)
        ASSERT_TRUE(buffer.Push(i * i));
    EXPECT_EQ(buffer.size(), 1000u);
    EXPECT_EQ(buffer[999], 998001u);
    buffer.Truncate(10);
    buffer.Truncate(2000);
    EXPECT_EQ(buffer.size(), 10u);
    const U64* memory = buffer.data();
    buffer.Clear();
    ASSERT_TRUE(buffer.Reserve(1000));
    ASSERT_TRUE(buffer.Push(5));
    EXPECT_EQ(buffer.data(), memory);
    EXPECT_FALSE(buffer.Reserve(static_cast<size_t>(-1) / 8));
    EXPECT_EQ(buffer[0], 5u);
}
