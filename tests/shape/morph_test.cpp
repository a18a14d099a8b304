// Morph shapes at several ratios against shapes that stand still.
#include "tests/display/scene.h"
#include "tests/support/glyph_writer.h"

namespace {
// `part` halves of the way from one drawing to another, with or without what the second style block
// paints. The second side is straight at the start and curved later.
ShapeBuilder Stage(S32 part, bool whole = true)
{
    const auto at = [part](S32 from, S32 to) { return from + (to - from) * part / 2; };
    const U8 tone = U8(at(40, 240));
    ShapeBuilder s;
    s.Styles(0, s.AddFill(Fill::Radial(Mat::Gradient(600, 600, at(900, 500), at(900, 700)),
                                       {{0, {255, tone, 0, tone}}, {255, {0, 0, tone}}})));
    s.MoveTo(at(100, 300), at(60, 400)).LineTo(at(1000, 800), 100);
    part ? s.CurveTo(at(1000, 1100), at(500, 700), at(1000, 600), at(900, 1100))
         : s.LineTo(1000, 900);
    s.CurveTo(at(700, 500), at(700, 1100), at(100, 300), at(60, 400)).NewStyles();
    s.Styles(s.AddFill(Rgba{0, tone, 99, tone}), 0);
    return whole ? s.Rect(20, 20, at(200, 600), 300) : s;
}

TEST(Morph, PassesThroughTheShapesBetween)
{
    MovieWriter movie(1200, 1200);
    movie.DefineShape(1, Stage(0)).DefineShape(2, Stage(1)).DefineShape(3, Stage(2));
    movie.DefineShape(4, Stage(1, false)); // 6: an end list that ends early, and so does its shape
    movie.Raw(kTagDefineMorphShape, MorphBody(5, Stage(0), Stage(2)));
    movie.Raw(kTagDefineMorphShape, MorphBody(6, Stage(0), Stage(2, false)));
    Scene scene(movie, 60, true), still(movie, 60, true);
    const auto apart = [&](U16 id, U16 ratio, U16 stillId, S32 slack) {
        SObject *moving = scene.Place(1, id), *standing = still.Place(1, stillId);
        moving->ratio = ratio;
        const int largest = Compare(scene.Shown(), still.Shown()).largest;
        EXPECT_LE(std::abs(moving->devBounds.xmax - standing->devBounds.xmax), slack);
        scene.list.RemoveThisObject(moving);
        still.list.RemoveThisObject(standing);
        return largest;
    };
    EXPECT_EQ(apart(5, 0, 1, 0), 0);
    EXPECT_LE(apart(5, 0x8000, 2, 1), 2);
    EXPECT_LE(apart(5, 0xFFFF, 3, 1), 12);
    EXPECT_LE(apart(6, 0x8000, 4, 1), 2);
}
} // namespace
