// Dirty rectangles and the camera.
#include "tests/display/scene.h"

namespace {

TEST(DecomposeRect, CutsTheUnionIntoTwo)
{
    struct Case {
        SRECT a, b, wantA, wantB;
    };
    const Case cases[] = {
        // A cross: both ways of joining waste the same, so the middle goes down.
        {{0, 100, 40, 60}, {40, 60, 0, 100}, {40, 60, 0, 40}, {0, 100, 40, 100}},
        {{40, 60, 0, 100}, {0, 100, 40, 60}, {40, 60, 0, 40}, {0, 100, 40, 100}},
        // Stairs: the wide upper part takes the middle along.
        {{0, 100, 0, 50}, {90, 110, 40, 100}, {0, 110, 0, 50}, {90, 110, 50, 100}},
        // Side by side: no top, no bottom.
        {{0, 60, 0, 50}, {50, 100, 0, 50}, {50, 100, 0, 0}, {0, 100, 0, 50}},
        // One inside the other comes out as the outer one in two parts.
        {{0, 100, 0, 100}, {40, 60, 40, 60}, {0, 100, 0, 40}, {0, 100, 40, 100}},
    };
    for (const Case& c : cases) {
        SRECT a = c.a, b = c.b;
        DecomposeRect(&a, &b);
        EXPECT_EQ(RectEqual(&a, &c.wantA, 0), true) << a.xmin << ' ' << a.xmax << ' ' << a.ymax;
        EXPECT_EQ(RectEqual(&b, &c.wantB, 0), true) << b.xmin << ' ' << b.xmax << ' ' << b.ymin;
        EXPECT_FALSE(RectTestOverlap(&a, &b));
    }
}

struct Dirty : testing::Test {
    DisplayList list; // without bits: 2000 x 2000

    Dirty() { list.Update(); }
    void Invalidate(S32 xmin, S32 xmax, S32 ymin, S32 ymax)
    {
        const SRECT r = {xmin, xmax, ymin, ymax};
        list.InvalidateRect(&r);
    }
    void ExpectPending(const std::vector<SRECT>& want)
    {
        ASSERT_EQ(size_t(list.nDirty), want.size());
        for (size_t i = 0; i < want.size(); i++) {
            EXPECT_TRUE(RectEqual(&list.dirtyList[i], &want[i], 0)) << "entry " << i;
            EXPECT_EQ(list.dirtyArea[i], RectArea(&want[i]));
        }
    }
};

TEST_F(Dirty, RectanglesGrowAndAreClipped)
{
    Invalidate(10, 20, 30, 40);
    Invalidate(-50, 1, 100, 110);
    ExpectPending({{8, 22, 28, 42}, {0, 3, 98, 112}});
    list.Update(); // without bits the dirt is dropped
    EXPECT_EQ(list.nDirty, 0);
    EXPECT_TRUE(RectIsEmpty(&list.devDirtyRgn));

    Invalidate(-100, -3, 0, 10);
    Invalidate(3000, 4000, 0, 10);
    SRECT empty;
    RectSetEmpty(&empty);
    list.InvalidateRect(&empty);
    EXPECT_EQ(list.nDirty, 0);
    Invalidate(-100, -2, 0, 10); // grown it touches the border
    Invalidate(kS32Min + 1, kS32Max, kS32Min, kS32Max);
    ExpectPending({{0, 0, 0, 12}, {0, 2000, 0, 2000}}); // swallowing a line saves nothing
}

TEST_F(Dirty, OnlyPayingPairsMergeUntilTheListIsFull)
{
    Invalidate(2, 98, 2, 98);
    Invalidate(1902, 1998, 2, 98);
    Invalidate(2, 98, 1902, 1998);
    ASSERT_EQ(list.nDirty, 3);
    // Nothing overlaps: the fourth forces the cheapest pair, which is (first, fourth).
    Invalidate(152, 198, 2, 98);
    ExpectPending({{0, 200, 0, 100}, {1900, 2000, 0, 100}, {0, 100, 1900, 2000}});
    const SRECT whole = {0, 2000, 0, 2000};
    EXPECT_TRUE(RectEqual(&list.devDirtyRgn, &whole, 0));
    EXPECT_FALSE(list.MergeDirtyList(false));
    list.Update();

    // A union exactly as large as the two areas does not pay.
    Invalidate(2, 98, 2, 98);
    Invalidate(102, 198, 2, 98);
    EXPECT_EQ(list.nDirty, 2);
    Invalidate(92, 198, 2, 98);
    ExpectPending({{0, 100, 0, 100}, {90, 200, 0, 100}});
    list.DecomposeDirtyList();
    ExpectPending({{0, 200, 0, 100}});
}

TEST(Camera, Table)
{
    struct Case {
        SRECT frame, client;
        int antialias;
        S32 mode;
        MATRIX want;
    };
    const SRECT film = {0, 11000, 0, 8000};
    const SRECT usual = {0, 550, 0, 400}, wide = {0, 1100, 0, 400}, nothing = {0, 0, 0, 0};
    const SRECT odd = {-100, 1100, 0, 400};
    const Case cases[] = {
        {film, usual, 0, 0, {3276, 0, 0, 3276, 1, 1}},
        {film, usual, 1, 0, {13107, 0, 0, 13107, 1, 1}},
        {film, wide, 0, kScaleShowAll, {3276, 0, 0, 3276, 276, 1}},
        {film, wide, 0, kScaleFill, {6553, 0, 0, 6553, 1, -199}},
        {film, wide, 0, kScaleStretch, {6553, 0, 0, 3276, 1, 1}},
        {film, wide, 0, 7, {6553, 0, 0, 3276, 1, 1}},
        {film, wide, 0, kScaleFixed, {3276, 0, 0, 3276, 276, 1}},
        {film, wide, 1, kScaleFixed, {13107, 0, 0, 13107, 1101, 1}},
        {film, wide, 0, kAlignLeft | kAlignRight, {3276, 0, 0, 3276, 0, 1}},
        {film, wide, 0, kAlignRight | kAlignTop, {3276, 0, 0, 3276, 551, 0}},
        {film, wide, 0, kAlignBottom, {3276, 0, 0, 3276, 276, 1}},
        {film, odd, 0, kAlignLeft, {3276, 0, 0, 3276, -100, 1}},
        {film, nothing, 0, 0, {95, 0, 0, 95, -7, -5}},
        {{5, 5, 7, 7}, {0, 16, 0, 16}, 0, 0, {65536, 0, 0, 65536, 3, 1}},
    };
    for (const Case& c : cases) {
        DisplayList list;
        list.SetCamera(&c.frame, &c.client, c.antialias, c.mode);
        EXPECT_TRUE(MatrixEqual(&list.camera, &c.want, 0))
            << "case " << &c - cases << ": " << list.camera.a << ' ' << list.camera.d << ' '
            << list.camera.tx << ' ' << list.camera.ty;
        EXPECT_EQ(list.devViewRect.xmax, c.antialias ? 8000 : 2000);
        EXPECT_EQ(list.raster.Antialias(), c.antialias);
    }
}

TEST(Camera, OnlyAChangeInvalidates)
{
    DisplayList list;
    const SRECT film = {0, 11000, 0, 8000}, client = {0, 550, 0, 400};
    EXPECT_TRUE(list.SetCamera(&film, &client, 1, 0));
    list.Update();
    EXPECT_FALSE(list.SetCamera(&film, &client, 1, 0));
    EXPECT_EQ(list.nDirty, 0);
    list.animatedMovie = 1; // changes the smoothing alone
    EXPECT_TRUE(list.SetCamera(&film, &client, 1, 0));
    EXPECT_EQ(list.nDirty, 1);
    EXPECT_TRUE(list.root.dirty);
}

TEST(Background, Priorities)
{
    DisplayList list;
    list.Update();
    const SRGB red = {255, 0, 0, 255}, white = {255, 255, 255, 255};
    list.SetBackgroundColor(white, 1); // the same colour: nothing to repaint, but it counts
    EXPECT_EQ(list.nDirty, 0);
    list.SetBackgroundColor(red, 1);
    EXPECT_EQ(list.backgroundColor, white);
    list.Reset();
    list.SetBackgroundColor(red, 1);
    EXPECT_EQ(list.backgroundColor, red);
    EXPECT_EQ(list.nDirty, 1);
    list.SetBackgroundColor(white, 2);
    list.SetBackgroundColor(red, 2);
    list.Reset();
    EXPECT_EQ(list.backgroundColor, white);
    EXPECT_EQ(list.backgroundPriority, 2);
}

} // namespace
