// Fonts, and static text against the same glyphs placed as shapes.
#include "core/shape/font.h"
#include "core/stream/character.h"
#include "tests/display/scene.h"
#include "tests/support/glyph_writer.h"

namespace {
// 0: a square; 1: and a circle; 2: with a hole; 3: with a square of the same turn in it instead,
// which makes no hole in a glyph.
ShapeBuilder Glyph(int which, Rgba color = {})
{
    ShapeBuilder g;
    g.AddFill(color);
    g.Fill1(1).Rect(0, -800, 800, 0);
    if (which == 1)
        g.Circle(1200, -300, 300);
    if (which == 2)
        g.Polygon({{200, -600}, {200, -200}, {600, -200}, {600, -600}});
    return which == 3 ? g.Rect(200, -600, 600, -200) : g;
}

MovieWriter Text(const Mat& mat, const std::vector<TextRun>& runs, const FontText& plain = {},
                 const FontText& wide = {"", 8})
{
    const Glyphs glyphs = {Glyph(3), Glyph(1), Glyph(2)};
    MovieWriter movie(1200, 1200);
    movie.Raw(kTagDefineFont, FontBody(1, glyphs)).Raw(kTagDefineFontInfo, FontInfoBody(1, plain));
    movie.Raw(kTagDefineFont2, Font2Body(2, glyphs, wide));
    movie.Raw(kTagDefineText2, TextBody(3, {0, 1200, 0, 1200}, mat, runs));
    return movie;
}

TEST(Text, EqualsItsGlyphsAsShapes)
{
    const Mat tilt = {0x1C000, 0x2000, -0x3000, 0x11000, 40, -30};
    MovieWriter written = Text( // no such font, and then no such glyph
        tilt, {{.font = {{9, 900}}, .glyphs = {{0, 50}}},
               {.font = {{1, 256}}, .x = 50, .y = 500, .glyphs = {{0, 250}, {7, 50}, {1, 100}}},
               {.font = {{2, 384}}, .color = {{9, 80, 0, 128}}, .y = 900, .glyphs = {{2, 9}}}});
    MovieWriter placed(1200, 1200);
    placed.DefineShape(1, Glyph(0))
        .DefineShape(2, Glyph(1))
        .DefineShape(4, Glyph(2, {9, 80, 0, 128}));
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
    MovieWriter movie = Text({}, {{.font = {{1, 512}}, .x = 100, .y = 500, .glyphs = {{0, 500}}},
                                  {.color = {{0, 0, 9}}, .glyphs = {{2, 500}}}});
    movie.DefineShape(4, Square({}, 60));
    Scene drawn(movie), masked(movie);
    drawn.Place(1, 3);
    masked.Place(1, 3, {}, 5);
    masked.Place(2, 4);
    EXPECT_LE(Compare(masked.Shown(), drawn.Shown()).largest, 9);
    for (SPOINT pt : {SPOINT{15, 15}, {6, 6}, {40, 15}, {32, 8}, {27, 15}})
        EXPECT_EQ(drawn.list.HitTest(&pt) != nullptr, drawn.Shown().At(pt.x, pt.y) != kWhite);
}

TEST(Text, FontsOfBothForms)
{
    const std::string name(255, 'n');
    MovieWriter movie = Text({}, {}, {"Plain", 7, {0x3B1, 66}},
                             {name, 0x8D, {65, 66, 0x3B3}, {900, -200, 50, 820, -3, 840}});
    for (U16 first : {10, 13, 999}) // tables that lie: the first offset, below the glyph count
        movie.Raw(kTagDefineFont, ByteWriter().PutU16(first).PutU16(first - 10).PutU32(0));
    movie.Raw(kTagDefineFont2, ByteWriter().PutU16(4).PutU16(0).PutU8(0).PutU16(9).PutU32(4));
    Scene scene(movie);
    const auto font = [&scene](U16 id) { return SFont(scene.player.FindCharacter(id)); };
    for (U16 id : {10, 13, 999, 4})
        EXPECT_EQ(font(id).GlyphCount(), 0u) << id;
    EXPECT_EQ(font(1).Name(), "Plain");
    EXPECT_EQ(font(2).Name(), name);
    EXPECT_TRUE(font(1).Bold() && font(1).Italic() && font(2).Bold() && !font(2).Italic());
    EXPECT_EQ(font(1).FindGlyph(66), 1);
    EXPECT_EQ(font(1).FindGlyph(0), -1) << "the list of codes is short";
    EXPECT_EQ(font(2).FindGlyph(0x3B3), 2);
    EXPECT_EQ(font(2).Ascent() + font(2).Descent() + font(2).Leading(), 750);
    EXPECT_EQ(font(2).Advance(1) + font(2).Advance(3), -3);
}
} // namespace
