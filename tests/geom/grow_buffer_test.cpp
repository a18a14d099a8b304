#include <gtest/gtest.h>

#include "core/geom/grow_buffer.h"

namespace {
struct Pair {
    U32 key;
    U64 value;
};
} // namespace

TEST(GrowBufferResize, ElementsGainedAreZeroEvenWhereOldOnesLay)
{
    GrowBuffer<Pair> buffer;
    EXPECT_EQ(buffer.begin(), buffer.end());
    ASSERT_TRUE(buffer.Resize(0));
    for (U32 i = 1; i <= 20; i++)
        ASSERT_TRUE(buffer.Push({i, U64{i} << 40}));
    ASSERT_TRUE(buffer.Resize(3));
    EXPECT_EQ(buffer.Back().key, 3u);
    ASSERT_TRUE(buffer.Resize(100));
    U64 sum = 0;
    for (const Pair& pair : buffer)
        sum += pair.key + pair.value;
    EXPECT_EQ(sum, 6 + (U64{6} << 40));
    buffer.Back().key = 9;
    EXPECT_EQ(buffer[99].key, 9u);
}

TEST(GrowBufferResize, AnImpossibleSizeChangesNothing)
{
    GrowBuffer<Pair> buffer;
    ASSERT_TRUE(buffer.Push({7, 7}));
    EXPECT_FALSE(buffer.Resize(static_cast<size_t>(-1)));
    EXPECT_FALSE(buffer.Resize(static_cast<size_t>(-1) / sizeof(Pair)));
    EXPECT_EQ(buffer.size(), 1u);
    EXPECT_EQ(buffer.Back().value, 7u);
}
