// Dirty rectangles and the camera.
#include "tests/display/scene.h"

static bool operator==(const SRECT& a, const SRECT& b)
{
    return RectEqual(&a, &b, 0);
}

namespace {

using Rects = std::vector<SRECT>;

// Rectangles are clipped, and grow by two; what they cost when they are merged decides. Those that
// overlap all the same are cut into bands.
TEST(Dirty, PendingRectangles)
{
    const struct {
        Rects dirt, want;
    } cases[] = {
        {{{10, 20, 30, 40}, {-50, 1, 100, 110}}, {{8, 22, 28, 42}, {0, 3, 98, 112}}},
        {{{-100, -3, 0, 10}, {3000, 4000, 0, 10}, {kS32Min, 0, 0, 0}}, {}},
        // Grown it touches the border; that everything swallows such a line saves nothing.
        {{{-99, -2, 0, 9}, {kS32Min + 1, kS32Max, -9, kS32Max}},
         {{0, 0, 0, 11}, {0, 2000, 0, 2000}}},
        // Nothing overlaps: the fourth forces the cheapest pair, which is (first, fourth).
        {{{2, 98, 2, 98}, {1902, 1998, 2, 98}, {2, 98, 1902, 1998}, {152, 198, 2, 98}},
         {{0, 200, 0, 100}, {1900, 2000, 0, 100}, {0, 100, 1900, 2000}}},
        // A union exactly as large as the two areas does not pay; a smaller one does.
        {{{2, 98, 2, 98}, {102, 198, 2, 98}}, {{0, 100, 0, 100}, {100, 200, 0, 100}}},
        {{{2, 98, 2, 98}, {102, 198, 2, 98}, {92, 198, 2, 98}}, {{0, 200, 0, 100}}},
        // A cross: both ways of joining waste the same, so the middle goes down.
        {{{2, 98, 42, 58}, {42, 58, 2, 98}}, {{40, 60, 0, 40}, {0, 100, 40, 100}}},
        {{{42, 58, 2, 98}, {2, 98, 42, 58}}, {{40, 60, 0, 40}, {0, 100, 40, 100}}},
        // Stairs: the wide upper part takes the middle along.
        {{{2, 98, 2, 48}, {92, 108, 42, 98}}, {{0, 110, 0, 50}, {90, 110, 50, 100}}},
    };
    DisplayList list; // without bits: 2000 x 2000
    for (const auto& c : cases) {
        list.Update(); // without bits the dirt is dropped
        EXPECT_TRUE(RectIsEmpty(&list.devDirtyRgn));
        for (const SRECT& r : c.dirt)
            list.InvalidateRect(&r);
        list.DecomposeDirtyList();
        EXPECT_TRUE(Rects(list.dirtyList, list.dirtyList + list.nDirty) == c.want) << &c - cases;
    }
}

TEST(Camera, Table)
{
    const SRECT film = {0, 11000, 0, 8000}, usual = {0, 550, 0, 400}, wide = {0, 1100, 0, 400};
    const struct {
        SRECT frame, client;
        int antialias;
        S32 mode;
        MATRIX want;
    } cases[] = {
        {film, {-101, 100, 0, 400}, 0, 0, {1197, 0, 0, 1197, -101, 127}},
        {film, usual, 1, 0, {13107, 0, 0, 13107, 1, 1}},
        {film, wide, 0, kScaleFill, {6553, 0, 0, 6553, 1, -199}},
        {film, wide, 0, 7, {6553, 0, 0, 3276, 1, 1}},
        {film, wide, 0, kScaleFixed, {3276, 0, 0, 3276, 276, 1}},
        {film, wide, 1, kScaleFixed, {13107, 0, 0, 13107, 1101, 1}},
        {film, wide, 0, kAlignRight | kAlignTop, {3276, 0, 0, 3276, 551, 0}},
        {film, {-100, 1100, 0, 400}, 0, kAlignLeft | kAlignRight, {3276, 0, 0, 3276, -100, 1}},
        {film, {0, 0, 0, 0}, 0, 0, {95, 0, 0, 95, -7, -5}},
        {{5, 5, 7, 7}, {0, 16, 0, 16}, 0, 0, {65536, 0, 0, 65536, 3, 1}},
    };
    for (const auto& c : cases) {
        DisplayList list;
        list.SetCamera(&c.frame, &c.client, c.antialias, c.mode);
        EXPECT_TRUE(MatrixEqual(&list.camera, &c.want, 0)) << "case " << &c - cases;
        EXPECT_EQ(list.devViewRect.xmax, c.antialias ? 8000 : 2000);
        list.Update();
        EXPECT_FALSE(list.SetCamera(&c.frame, &c.client, c.antialias, c.mode));
        list.animatedMovie = 1; // changes the smoothing alone
        EXPECT_EQ(list.SetCamera(&c.frame, &c.client, c.antialias, c.mode), c.antialias != 0);
        EXPECT_EQ(list.nDirty, c.antialias);
    }
}

} // namespace
