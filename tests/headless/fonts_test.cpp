// The built-in fonts as the shell hands them to the core.
#include "core/shape/font.h"
#include "tests/player/player_scene.h"
#include "tests/support/glyph_writer.h"
#include "tools/fonts/built_in_fonts.h"

namespace {

struct Fonts : testing::Test {
    void SetUp() override
    {
        if (size == 0)
            GTEST_SKIP() << "built without fonts";
        ASSERT_TRUE(player.LoadBuiltInFonts());
    }
    SFont Font(U16 id) { return SFont(player.fontPlayer.FindCharacter(id)); }
    // How many dark stretches there are down the middle of a character, 205 pixels to the em, above
    // its baseline.
    int DownTheMiddle(U16 id, U32 code)
    {
        const U32 glyph = U32(Font(id).FindGlyph(code));
        const TextRun run = {.font = {{id, U16(4096)}}, .x = 0, .y = 5000, .glyphs = {{glyph, 0}}};
        TagWriter tags;
        tags.Raw(kTagDefineText2, TextBody(9, {0, 8000, 0, 8000}, {}, {run})).Place(9, 1);
        // They go before the last two tags, of two bytes each.
        std::vector<U8> all(movie, movie + size);
        all.insert(all.end() - 4, tags.Tags().begin(), tags.Tags().end());
        for (size_t i = 0; i < 4; i++)
            all[4 + i] = U8(all.size() >> (8 * i));
        PlayingShell shown(all);
        const Picture picture = Shot(&shown);
        int stretches = 0, x = Font(id).Advance(glyph) / 10;
        for (int y = 1; y < 250; y++)
            stretches += U8(picture.At(x, y)) < 128 && U8(picture.At(x, y - 1)) >= 128;
        return stretches;
    }

    NativePlayerWnd player{10, 10};
    size_t size = 0;
    const U8* const movie = BuiltInFonts(&size);
};

TEST_F(Fonts, AreWholeAndMeasured)
{
    for (U16 id = 0; const char* name : {"_sans", "_serif", "_typewriter"}) {
        const SFont font = Font(++id);
        const auto width = [&](U32 code) { return font.Advance(U32(font.FindGlyph(code))); };
        ASSERT_EQ(name, font.Name());
        for (U32 code = 0x20; code <= 0xFF; code++)
            EXPECT_EQ(code < 0x7F || code >= 0xA0, width(code) > 0) << code;
        EXPECT_TRUE(font.Descent() > 200 && font.Ascent() > 800 && font.Ascent() < 1000);
        EXPECT_TRUE(id == 3 ? width('i') == width('m') : width('i') * 2 < width('m'));
        for (auto [code, stretches] : {std::pair<U32, int>{'o', 2}, {'8', 3}, {0xF4, 3}, {'i', 2}})
            EXPECT_EQ(stretches, DownTheMiddle(id, code)) << id << " " << code;
    }
}

} // namespace
