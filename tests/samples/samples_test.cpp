#include "platform/headless/native_player.h"
#include "samples/alphabet.h"
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

// The committed movies are what the program writes on every machine, and all of their pictures, or
// those before anybody plays with them, are the same whether only what changed is painted, in two
// ticks, or everything. Where a radial span starts may cost a step of its ramp.
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
                   {"album", MakeAlbum(Committed("album")), 120},
                   {"orchard", MakeOrchard(), 1},
                   {"orchard_end", MakeOrchardEnd(), 1},
                   {"form", MakeForm(), 1}};
    for (const auto& [name, made, frames] : samples) {
        SCOPED_TRACE(name);
        EXPECT_TRUE(Committed(name) == made);
        NativePlayerWnd player(160, 120);
        player.Feed(made.data(), made.size());
        player.EndOfData();
        EXPECT_GE(player.numFrames, frames);
        for (int tick = 0; tick <= frames; tick++) { // once round
            const Picture partial = PictureOf(*player.Picture());
            EXPECT_EQ(player.curFrame, tick % frames);
            if (tick % 2 == 0)
                player.scene.InvalidateRect(&player.scene.devViewRect);
            ASSERT_LE(Compare(partial, PictureOf(*player.Picture())).largest, 3) << tick;
            player.Tick();
        }
    }
}

// Every letter stays in its line and about its advance, and no stroke of it was lost: what a slip
// in the table would show.
TEST(Alphabet, LettersKeepToTheirPlaces)
{
    for (U16 code : AlphabetCodes()) {
        SCOPED_TRACE(code);
        EXPECT_TRUE(AlphabetAdvance(code) >= 200 && AlphabetAdvance(code) <= 960);
        EXPECT_EQ(AlphabetOutline(code).empty(), code == ' ');
        for (const GlyphContour& contour : AlphabetOutline(code))
            for (const GlyphEdge& e : contour.edges) {
                EXPECT_TRUE(e.x >= -40 && e.x <= AlphabetAdvance(code) + 40) << e.x;
                EXPECT_TRUE(e.y >= -kAlphabetAscent && e.y <= kAlphabetDescent) << e.y;
            }
    }
    for (U16 code = 0x20; code < 0x7F; code++)
        EXPECT_GT(AlphabetAdvance(code), 0) << code;
}

} // namespace
