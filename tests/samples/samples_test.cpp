#include "platform/headless/native_player.h"
#include "samples/scene.h"
#include "tests/support/picture.h"

#include <gtest/gtest.h>

#include <fstream>
#include <iterator>

namespace {

std::vector<U8> Committed(const std::string& name)
{
    std::ifstream file(VEXEL_SOURCE_DIR "/samples/" + name + ".vxm", std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

// The committed movies are what the program writes on every machine, and all of their pictures are
// the same whether only what changed is painted or everything. Where a radial span starts may cost
// a step of its ramp.
TEST(Samples, AreWhatIsCommittedAndRepaintAlike)
{
    const struct {
        const char* name;
        std::vector<U8> made;
        int frames;
    } samples[] = {{"viaduct", MakeViaduct(), 120},
                   {"clockwork", MakeClockwork(), 96},
                   {"shapes", MakeShapes(), 1},
                   {"poster", MakePoster(), 120},
                   {"gallery", MakeGallery(), 96},
                   {"metamorphosis", MakeMetamorphosis(), 96},
                   {"album", MakeAlbum(Committed("album")), 120}};
    for (const auto& [name, made, frames] : samples) {
        SCOPED_TRACE(name);
        EXPECT_TRUE(Committed(name) == made);
        NativePlayerWnd player(160, 120);
        player.Feed(made.data(), made.size());
        player.EndOfData();
        EXPECT_EQ(player.numFrames, frames);
        for (int tick = 0; tick <= frames; tick++) { // once round
            const Picture partial = PictureOf(*player.Picture());
            player.scene.InvalidateRect(&player.scene.devViewRect);
            ASSERT_LE(Compare(partial, PictureOf(*player.Picture())).largest, 3) << tick;
            EXPECT_EQ(player.curFrame, tick % frames);
            player.Tick();
        }
    }
}

} // namespace
