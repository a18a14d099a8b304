// What is on the screen, and what lies under a point.
#include "tests/display/scene.h"

namespace {

TEST(Paint, DepthDecides)
{
    Scene s(Cast(), 100, 100);
    s.Place(20, 1, AtPixel(10, 10));
    s.Place(10, 2, AtPixel(20, 20));
    EXPECT_EQ(s.Pixel(25, 25), kRedPixel);
    EXPECT_EQ(s.Pixel(35, 35), kGreenPixel);
    EXPECT_EQ(s.Hit(25, 25), s.At(20));
    EXPECT_EQ(s.Hit(35, 35), s.At(10));
    EXPECT_EQ(s.Hit(45, 45), nullptr);
    EXPECT_EQ(s.Hit(9, 15), nullptr);
}

TEST(Paint, AMovedParentTakesItsChildrenAlong)
{
    for (const bool smooth : {false, true}) {
        Scene s(Cast(), 100, 100, smooth);
        SObject* outer = s.Place(5, 12, AtPixel(10, 10));
        EXPECT_EQ(s.Pixel(15, 15), kRedPixel);
        SObject* shape = outer->bottomChild->bottomChild;
        EXPECT_TRUE(shape->drawn);
        s.Move(5, AtPixel(60, 70));
        EXPECT_EQ(s.Hit(65, 75), shape);
        EXPECT_EQ(s.Pixel(15, 15), kWhitePixel);
        EXPECT_EQ(s.Pixel(65, 75), kRedPixel);
        EXPECT_NEAR(shape->devBounds.xmin, smooth ? 240 : 60, 1);
        EXPECT_NEAR(s.list.bitsDirty.xmax, 100, 0);
    }
}

TEST(Paint, OnlyDirtyPixelsAreTouched)
{
    Scene s(Cast(), 100, 100);
    s.Place(5, 1, AtPixel(10, 10));
    s.Place(6, 2, AtPixel(70, 70));
    s.Shown();
    RectSetEmpty(&s.list.bitsDirty);
    s.Remove(5);
    s.Shown();
    const SRECT want = {8, 32, 8, 32};
    EXPECT_TRUE(RectEqual(&s.list.bitsDirty, &want, 1)) << s.list.bitsDirty.xmax;
    EXPECT_EQ(s.list.nDirty, 0);
}

// What stands a pixel out of its bounds belongs to a repaint beside the bounds too.
TEST(Paint, OverhangSurvivesARepaintBesideIt)
{
    for (const bool smooth : {false, true}) {
        MovieWriter movie(100 * 20, 100 * 20);
        movie.DefineShape(1, 32, {0, 18 * 20, 0, 18 * 20}, Square(kRed, 20)).Show();
        Scene s(movie, 100, 100, smooth);
        s.Place(5, 1, AtPixel(10, 10));
        EXPECT_EQ(s.Pixel(28, 15), kRedPixel);
        const S32 unit = smooth ? 4 : 1;
        const SRECT beside = {30 * unit, 40 * unit, 0, 40 * unit};
        s.list.InvalidateRect(&beside);
        EXPECT_EQ(s.Pixel(28, 15), kRedPixel);
    }
}

TEST(Paint, HiddenMeansAllBelow)
{
    Scene s(Cast(), 100, 100);
    SObject* outer = s.Place(5, 12, AtPixel(10, 10));
    EXPECT_NE(s.Hit(15, 15), nullptr);
    outer->Modify();
    outer->visible = 0;
    EXPECT_EQ(s.Pixel(15, 15), kWhitePixel);
    EXPECT_EQ(s.Hit(15, 15), nullptr);
}

// The mask covers 0..20; content at depths 5 and 10 is masked, at 11 it is not.
TEST(Paint, MasksAndTheirRange)
{
    for (const bool smooth : {false, true}) {
        MovieWriter movie = Cast();
        movie.DefineShape(5, Square(kGreen, 60)).DefineShape(6, Square(kBlue, 60)).Show();
        Scene s(movie, 100, 100, smooth);
        s.player.Seek(1);
        s.Place(5, 5);
        s.Place(10, 6, AtPixel(10, 0));
        s.Place(11, 1, AtPixel(70, 70));
        EXPECT_EQ(s.Pixel(50, 50), kBluePixel);
        s.Place(3, 1, {}, 10);
        EXPECT_EQ(s.Pixel(5, 5), kGreenPixel);
        EXPECT_EQ(s.Pixel(15, 5), kBluePixel);
        EXPECT_EQ(s.Pixel(50, 50), kWhitePixel); // repainted though nothing of it moved
        EXPECT_EQ(s.Pixel(75, 75), kRedPixel);
        EXPECT_EQ(s.Hit(5, 5), s.At(5));
        EXPECT_EQ(s.Hit(15, 5), s.At(10));
        EXPECT_EQ(s.Hit(50, 50), nullptr);
        EXPECT_EQ(s.Hit(75, 75), s.At(11));

        s.Place(4, 1, AtPixel(10, 10), 7); // a mask in the mask's range: both together
        EXPECT_EQ(s.Pixel(15, 15), kBluePixel);
        EXPECT_EQ(s.Pixel(5, 5), kWhitePixel);
        s.Move(10, AtPixel(80, 80));
        EXPECT_EQ(s.Pixel(15, 15), kGreenPixel);
        EXPECT_EQ(s.Pixel(25, 25), kWhitePixel);
        EXPECT_EQ(s.Hit(15, 15), s.At(5));
        EXPECT_EQ(s.Hit(12, 5), nullptr);
        s.Remove(4);
        s.Remove(3);
        EXPECT_EQ(s.Pixel(50, 50), kGreenPixel);
        EXPECT_EQ("", ExpectSame(s.Shown(), s.Repainted(), "masks"));
    }
}

// The inner mask reaches beyond the outer one's range and takes the outer one's clip along.
TEST(Paint, AnInnerMaskReachesFurther)
{
    MovieWriter movie = Cast();
    movie.DefineShape(5, Square(kGreen, 60)).DefineShape(6, Square(kBlue, 60)).Show();
    Scene s(movie, 100, 100);
    s.player.Seek(1);
    s.Place(3, 1, {}, 7);
    s.Place(5, 5, {}, 12);
    s.Place(10, 6);
    EXPECT_EQ(s.Pixel(5, 5), kBluePixel);
    EXPECT_EQ(s.Pixel(50, 50), kWhitePixel);
    s.Remove(3);
    EXPECT_EQ(s.Pixel(50, 50), kBluePixel);
    s.Place(3, 1, {}, 7);
    EXPECT_EQ(s.Pixel(50, 50), kWhitePixel);
}

// Without colours there is no mask: what it ought to hide shows, but is not hit.
TEST(Paint, AnEmptyMaskHidesNothing)
{
    Scene s(Cast(), 100, 100);
    s.Place(3, 4, {}, 10);
    s.Place(5, 1);
    EXPECT_EQ(s.Pixel(5, 5), kRedPixel);
    EXPECT_EQ(s.Hit(5, 5), nullptr);
    PlaceInfo move = s.Info(3, 2, AtPixel(50, 50));
    s.list.MoveObject(s.Root(), &move); // now it does
    EXPECT_EQ(s.Pixel(5, 5), kWhitePixel);
}

// Masks nested among siblings are as deep a recursion as a movie likes.
TEST(Paint, ManyMasksAreSafe)
{
    Scene s(Cast(), 100, 100);
    for (U32 depth = 1; depth < 20000; depth++)
        s.Place(U16(20000 - depth), 1, {}, 30000);
    s.Place(25000, 2);
    EXPECT_EQ(s.Pixel(5, 5), kGreenPixel);
    EXPECT_EQ(s.Hit(5, 5), s.At(25000));
    s.list.FreeCache();
    EXPECT_EQ(s.Pixel(5, 5), kGreenPixel);
}

TEST(Paint, HitsFollowTheShape)
{
    for (const bool smooth : {false, true}) {
        MovieWriter movie(100 * 20, 100 * 20);
        ShapeBuilder ring; // a disc with a hole, and a second colour beside it with a common edge
        ring.Styles(ring.AddFill(kRed), 0);
        ring.Circle(800, 800, 600).Circle(800, 800, 200);
        ShapeBuilder pair;
        const int left = pair.AddFill(kRed), right = pair.AddFill(kBlue);
        pair.Styles(0, left).MoveTo(0, 0).LineTo(0, 400);
        pair.Styles(right, left).MoveTo(400, 0).LineTo(400, 400);
        pair.Styles(right, 0).MoveTo(800, 400).LineTo(800, 0);
        movie.DefineShape(1, ring).DefineShape(2, pair).Show().End();
        Scene s(movie, 100, 100, smooth);
        s.Place(5, 1);
        s.Place(6, 2, AtPixel(50, 75));
        EXPECT_EQ(s.Hit(40, 15), s.At(5));
        EXPECT_EQ(s.Hit(65, 40), s.At(5));
        EXPECT_EQ(s.Hit(40, 40), nullptr) << "the hole";
        EXPECT_EQ(s.Hit(12, 12), nullptr) << "the corner of the bounds";
        EXPECT_EQ(s.Hit(60, 85), s.At(6));
        EXPECT_EQ(s.Hit(80, 85), s.At(6));
        EXPECT_EQ(s.Hit(95, 85), nullptr);
        // Pixels and hits agree, but for the smoothed border.
        const Picture p = s.Shown();
        int unlike = 0;
        for (int y = 0; y < 100; y++)
            for (int x = 0; x < 100; x++)
                unlike += (p.At(x, y) != kWhitePixel) != (s.Hit(x, y) != nullptr);
        EXPECT_LT(unlike, smooth ? 300 : 200);
        EXPECT_EQ("", ExpectSame(p, s.Repainted(), "hits-leave-no-trace"));
    }
}

TEST(Paint, BackgroundAndTransparency)
{
    Scene s(Cast(), 100, 100, true);
    s.Place(5, 1, AtPixel(10, 10));
    s.list.SetBackgroundColor({0, 0, 255, 0}, 1); // painted opaque whatever its alpha
    EXPECT_EQ(s.Pixel(99, 99), kBluePixel);
    s.list.SetBackgroundColor({}, 2);
    EXPECT_EQ(s.Pixel(99, 99), 0u);
    EXPECT_EQ(s.Pixel(15, 15), kRedPixel);
    s.Remove(5);
    EXPECT_EQ(s.Pixel(15, 15), 0u);
}

TEST(Paint, FocusHighlight)
{
    for (const bool smooth : {false, true}) {
        Scene s(Cast(), 100, 100, smooth);
        const S32 unit = smooth ? 4 : 1;
        s.list.tabFocusRect = {20 * unit, 60 * unit, 30 * unit, 50 * unit};
        const Picture p = s.Repainted();
        constexpr U32 kYellow = 0xFFFFFF00;
        for (int y = 0; y < 100; y++) {
            for (int x = 0; x < 100; x++) {
                const bool in = x >= 20 && x < 60 && y >= 30 && y < 50;
                const bool inner = x >= 23 && x < 57 && y >= 33 && y < 47;
                ASSERT_EQ(p.At(x, y), in && !inner ? kYellow : kWhitePixel) << x << ' ' << y;
            }
        }
        s.list.useFocusRect = 0;
        EXPECT_EQ(s.Repainted().At(20, 30), kWhitePixel);
    }
}

TEST(Objects, BoundingBoxOfATree)
{
    Scene s(Cast(), 100, 100);
    SObject* sprite = s.Place(5, 12, AtPixel(10, 10).Then(Mat::Scale(2)));
    PlaceInfo info = s.Info(9, 1, AtPixel(-5, 30));
    s.list.PlaceObject(sprite, &info);
    SRECT box, doubled;
    GetBoundingBox(sprite, &box);
    const SRECT want = {200, 1200, 400, 2400};
    EXPECT_TRUE(RectEqual(&box, &want, 0)) << box.xmin << ' ' << box.xmax << ' ' << box.ymax;
    const MATRIX twice = ToMatrix(Mat::Scale(2));
    GetBoundingBox(sprite, &twice, &doubled);
    EXPECT_EQ(doubled.ymax, 4800);
    sprite->FreeChildren();
    GetBoundingBox(sprite, &box);
    EXPECT_TRUE(RectIsEmpty(&box));
}

} // namespace
