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
    s.Styles(0, s.AddFill(Rgba{255, tone, 0, tone})).MoveTo(at(100, 300), at(60, 400));
    s.LineTo(at(1000, 800), 100);
    part ? s.CurveTo(at(965, 1065), at(503, 703), at(930, 600), at(907, 1101))
         : s.LineTo(930, 907);
    s.CurveTo(at(700, 500), at(700, 1100), at(100, 300), at(60, 400)).NewStyles();
    s.Styles(s.AddFill(Fill::Linear({at(4, 2), 0, 0, 9}, {{0, {0, tone, 9}}, {99, {}}})), 0);
    return whole ? s.Rect(20, 20, at(200, 600), 300) : s;
}

TEST(Morph, PassesThroughTheShapesBetween)
{
    MovieWriter movie(1200, 1200);
    movie.DefineShape(1, Stage(0)).DefineShape(2, Stage(1)).DefineShape(3, Stage(2));
    movie.Raw(kTagDefineMorphShape, MorphBody(4, Stage(0), Stage(2)));
    // An end list that ends early ends the shape.
    movie.DefineShape(5, Stage(1, false));
    movie.Raw(kTagDefineMorphShape, MorphBody(6, Stage(0), Stage(2, false)));
    const U16 rows[][4] = {{4, 0, 1, 0}, {4, 0x8000, 2, 2}, {4, 0xFFFF, 3, 128}, {6, 0x8000, 5, 2}};
    for (const auto& [id, ratio, stillId, apart] : rows) {
        Scene moving(movie, 300, true), still(movie, 300, true);
        SObject *m = moving.Place(1, id), *s = still.Place(1, stillId);
        m->ratio = ratio;
        EXPECT_LE(Compare(moving.Shown(), still.Shown()).largest, apart) << id << ' ' << ratio;
        EXPECT_NEAR(m->devBounds.ymax, s->devBounds.ymax, 1);
    }
}
} // namespace
