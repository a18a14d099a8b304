// Fonts, and static text against the same glyphs placed as shapes.
#include "core/shape/font.h"
#include "core/stream/character.h"
#include "tests/display/scene.h"
#include "tests/support/glyph_writer.h"

namespace {
// What stands inside a square: a hole, or a square of the same turn, which makes none in a glyph.
const std::vector<Pt> kHole = {{200, -600}, {200, -200}, {600, -200}, {600, -600}};
const std::vector<Pt> kSame = {{200, -600}, {600, -600}, {600, -200}, {200, -200}};

ShapeBuilder Glyph(const std::vector<Pt>& inside = {{0, 0}}, Rgba color = {})
{
    ShapeBuilder g;
    g.AddFill(color);
    return g.Fill1(1).Rect(0, -800, 800, 0).Polygon(inside);
}
const Glyphs kGlyphs = {Glyph(kSame), Glyph().Circle(1200, -300, 300), Glyph(kHole)};

// Fonts 1 and 2, and text 3.
MovieWriter Text(int code, const Mat& mat, const std::vector<TextRun>& runs)
{
    MovieWriter movie(1200, 1200);
    movie.Raw(kTagDefineFont, FontBody(1, kGlyphs));
    movie.Raw(kTagDefineFont2, Font2Body(2, kGlyphs, {"", 8}));
    movie.Raw(code, TextBody(3, {0, 1200, 0, 1200}, mat, runs, code == kTagDefineText2));
    return movie;
}

TEST(Text, EqualsItsGlyphsAsShapes)
{
    const Mat tilt = {0x1C000, 0x2000, -0x3000, 0x11000, 40, -30};
    const Rgba pale = {9, 80, 0, 128};
    const std::vector<TextRun> runs = {
        // no such font, and then no such glyph
        {.font = {{9, 900}}, .glyphs = {{0, 50}}},
        {.font = {{1, 256}}, .x = 50, .y = 500, .glyphs = {{0, 250}, {7, 50}, {1, 100}}},
        {.font = {{2, 384}}, .color = pale, .y = 900, .glyphs = {{2, 9}}}};
    MovieWriter written = Text(kTagDefineText2, tilt, runs), placed(1200, 1200);
    placed.DefineShape(1, Glyph()).DefineShape(2, kGlyphs[1]).DefineShape(4, Glyph(kHole, pale));
    TagWriter glyphs, inner;
    glyphs.Place(1, 1, Mat::Scale(0.25).ThenTranslate(50, 500));
    glyphs.Place(2, 2, Mat::Scale(0.25).ThenTranslate(350, 500));
    glyphs.Place(4, 3, Mat::Scale(0.375).ThenTranslate(450, 900));
    placed.DefineSprite(5, glyphs.Show()).DefineSprite(3, inner.Place(5, 1, tilt).Show());
    for (MovieWriter* movie : {&written, &placed})
        movie->Place(3, 1, Mat::Rotate(-9), Cx{{256, 99, 256, 256}, {7, 70, 9, 0}});
    const Picture want = Scene(placed, 60, true).Shown();
    EXPECT_EQ("", ExpectSame(Scene(written, 60, true).Shown(), want, "text-as-shapes"));
}

TEST(Text, MasksAndIsHitWhereItIsDrawn)
{
    const Rgba gray = {9, 9, 9};
    MovieWriter movie =
        Text(kTagDefineText, {}, {{{{1, 512}}, gray, 100, 500, {{0, 500}, {2, 500}}}});
    movie.DefineShape(4, Square({0, 0, 255}, 60));
    Scene drawn(movie), masked(movie);
    drawn.Place(1, 3);
    masked.Place(1, 3, {}, 5);
    masked.Place(2, 4);
    const S32 rows[][3] = {{15, 15, 1}, {6, 6, 1}, {40, 15, 0}, {32, 8, 1}, {27, 15, 0}};
    for (const auto& [x, y, hit] : rows) {
        const SPOINT pt = {x, y};
        EXPECT_EQ(drawn.Shown().At(x, y) != kWhite, hit != 0) << x;
        EXPECT_EQ(drawn.list.HitTest(&pt) != nullptr, hit != 0) << x;
        EXPECT_EQ(masked.Shown().At(x, y), hit ? kBlue : kWhite) << x;
    }
}

TEST(Text, FontsOfBothForms)
{
    const FontText text = {std::string(255, 'n'), 0x8D, {65, 66, 0x3B3}, {9, -2, 5, 8, -3, 8, 7}};
    MovieWriter movie;
    movie.Raw(kTagDefineFont, FontBody(1, kGlyphs))
        .Raw(kTagDefineFont2, Font2Body(2, kGlyphs, text));
    movie.Raw(kTagDefineFontInfo, FontInfoBody(1, {"Plain", 7, {0x3B1, 66}}));
    for (U16 first : {10, 13, 990}) // tables that lie: the first offset, below the glyph count
        movie.Raw(kTagDefineFont, ByteWriter().PutU16(first).PutU16(first - 10).PutU32(0));
    movie.Raw(kTagDefineFont2,
              ByteWriter().PutU16(4).PutU16(0).PutU8(0).PutU16(9).PutU32(4).PutU32(0));
    Scene scene(movie);
    for (U16 id : {10, 13, 990, 4})
        EXPECT_EQ(SFont(scene.player.FindCharacter(id)).GlyphCount(), 0u) << id;
    const SFont plain(scene.player.FindCharacter(1)), wide(scene.player.FindCharacter(2));
    EXPECT_TRUE(plain.Name() == "Plain" && wide.Name() == text.name);
    EXPECT_TRUE(plain.Bold() && plain.Italic() && wide.Bold() && !wide.Italic());
    EXPECT_TRUE(plain.FindGlyph(66) == 1 && plain.FindGlyph(0) == -1 && wide.FindGlyph(0x3B3) == 2);
    EXPECT_TRUE(wide.Ascent() == 9 && wide.Descent() == -2 && wide.Leading() == 5);
    EXPECT_TRUE(wide.Advance(1) == -3 && wide.Advance(3) == 0);
}
} // namespace
