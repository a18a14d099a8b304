// A player that has warmed up takes no memory from the system, whatever its movie does.
#include <fstream>
#include <iterator>

#include "core/text/field_record.h"
#include "tests/display/scene.h"
#include "tests/support/allocation_counter.h"
#include "tests/support/glyph_writer.h"

static int AllocationsOf(const std::vector<U8>& movie, S32 ticks)
{
    NativePlayerWnd player(0, 0);
    player.Feed(movie.data(), movie.size());
    player.EndOfData();
    const auto play = [&player](S32 count) {
        for (; count > 0; count--)
            player.Tick();
    };
    play(player.numFrames + 1);
    EXPECT_EQ(player.curFrame, 1) << "one whole loop";
    const int before = gAllocations;
    play(ticks);
    return gAllocations - before;
}

TEST(Allocation, NoneOnceWarm)
{
    if (!kAllocationsCount)
        GTEST_SKIP() << "allocations can be counted with glibc and without sanitizers only";
    std::ifstream file(VEXEL_SOURCE_DIR "/samples/viaduct.vxm", std::ios::binary);
    const std::vector<char> movie(std::istreambuf_iterator<char>(file), {});
    EXPECT_EQ(AllocationsOf({movie.begin(), movie.end()}, 200), 0);
    MovieWriter fields(4000, 4000, Fps(10));
    fields.Raw(kTagDefineEditText, FieldBody(2, {.box = {0, 900, 0, 500},
                                                 .flags = kFieldText,
                                                 .variable = "v",
                                                 .text = "come and go"}));
    fields.Place(2, 1).Show(3).RemoveDepth(1).Show(2).End();
    EXPECT_EQ(AllocationsOf(fields.Bytes(), 40), 0);
}
