#include "core/player/limits.h"
#include "tests/player/player_scene.h"

namespace {

constexpr SRECT kWhole = {0, 100, 0, 80};

bool Contains(const SRECT& outer, const SRECT& inner)
{
    return outer.xmin <= inner.xmin && outer.xmax >= inner.xmax && outer.ymin <= inner.ymin &&
           outer.ymax >= inner.ymax;
}

TEST(Screen, CopiesOnlyWhatChanged)
{
    for (int quality : {0, 1}) {
        CountingShell player;
        player.SetQuality(quality);
        player.Open(MovingSquare(3));
        player.OnDraw();
        EXPECT_TRUE(RectEqual(&kWhole, &player.blitted, 0));
        player.ForgetRects();
        player.Tick();
        // The square goes from (10, 10) to (14, 12); two pixels around it count as touched.
        EXPECT_TRUE(Contains(player.blitted, {10, 24, 10, 22}));
        EXPECT_TRUE(Contains({6, 28, 6, 26}, player.blitted));
        EXPECT_TRUE(RectIsEmpty(&player.invalidated));
    }
}

TEST(Screen, CopiesNothingWhenNothingChanged)
{
    MovieWriter movie(100 * 20, 80 * 20, Fps(10));
    movie.DefineShape(1, Square()).Place(1, 1).Show(4).End();
    CountingShell player;
    player.Open(movie.Bytes());
    player.OnDraw();
    const int before = player.blits;
    player.Tick();
    player.Tick();
    EXPECT_EQ(2, player.curFrame);
    EXPECT_EQ(before, player.blits);
}

// A control asks the shell to draw and leaves the painting to it.
TEST(Screen, ControlsAskForARedraw)
{
    CountingShell player;
    player.Open(MovingSquare(3));
    player.OnDraw();
    player.ForgetRects();
    player.SetQuality(0);
    EXPECT_TRUE(RectEqual(&kWhole, &player.invalidated, 0));
    EXPECT_TRUE(RectIsEmpty(&player.blitted));
    player.OnDraw();
    EXPECT_TRUE(RectEqual(&kWhole, &player.blitted, 0));
    player.ForgetRects();
    player.OnDraw();
    EXPECT_TRUE(RectIsEmpty(&player.blitted));
}

TEST(Screen, RepaintsWhatWasSpoiled)
{
    for (int quality : {0, 1}) {
        CountingShell player;
        player.SetQuality(quality);
        player.Open(MovingSquare(3));
        const Picture before = Shot(&player);
        for (S32 y = 5; y < 21; y++)
            std::fill_n(reinterpret_cast<U32*>(player.bits.RowAddr(y)) + 7, 20, 0xFF00FF00u);
        const SRECT spoiled = {7, 27, 5, 21};
        player.ForgetRects();
        player.Repaint(&spoiled);
        EXPECT_TRUE(Contains(player.blitted, spoiled));
        EXPECT_FALSE(Contains(player.blitted, kWhole));
        EXPECT_EQ("", ExpectSame(Shot(&player), before, "repaint"));
        const SRECT beyond = {-0x7FFFFFFF, 0x7FFFFFFF, -0x7FFFFFFF, 0x7FFFFFFF};
        player.Repaint(&beyond);
        EXPECT_EQ("", ExpectSame(Shot(&player), before, "repaint-all"));
    }
}

// What the dirty rectangles leave behind is what painting everything gives, through see-through
// shapes that cross one another.
TEST(Screen, DirtyRectanglesAddUpToTheWholePicture)
{
    MovieWriter movie(100 * 20, 80 * 20, Fps(10));
    movie.DefineShape(1, Square({200, 0, 0, 128})).DefineShape(2, Square({0, 90, 200, 200}));
    for (U16 depth = 1; depth <= 6; depth++)
        movie.Place(U16(1 + depth % 2), depth, Mat::Translate(depth * 250, depth * 170));
    movie.Show();
    for (int i = 1; i <= 25; i++) {
        for (U16 depth = 1; depth <= 6; depth++)
            movie.Move(depth, Mat::Rotate(i * depth * 7)
                                  .ThenTranslate((i * depth * 71) % 2100, (i * depth * 53) % 1700));
        movie.Show();
    }
    movie.End();
    const std::vector<U8> bytes = movie.Bytes();
    CountingShell player;
    player.Open(bytes);
    for (int tick = 0; tick < 25; tick++) {
        const Picture piecewise = Shot(&player);
        player.Repaint(&kWhole);
        ASSERT_EQ("", ExpectSame(piecewise, Shot(&player), "dirty")) << "tick " << tick;
        player.Tick();
    }
}

TEST(Screen, ComesBackAfterItsPixelsWereFreed)
{
    CountingShell player;
    player.Open(MovingSquare(3));
    const Picture before = Shot(&player);
    player.ForgetRects();
    player.FreeBuffer();
    EXPECT_FALSE(player.bits.HasBits());
    EXPECT_TRUE(RectEqual(&kWhole, &player.invalidated, 0));
    EXPECT_EQ("", ExpectSame(Shot(&player), before, "freed"));
}

TEST(Screen, WithoutPixelsIsCleared)
{
    CountingShell empty(0, 20);
    empty.Open(MovingSquare(3));
    EXPECT_TRUE(empty.UpdateBuffer(1));
    EXPECT_EQ(nullptr, empty.Picture());
    EXPECT_EQ(1, empty.clears);
    empty.Tick();
    EXPECT_EQ(1, empty.curFrame);

    const SLimits before = gLimits;
    gLimits.surfacePixels = 100 * 80 - 1;
    CountingShell tooLarge;
    tooLarge.Open(MovingSquare(3));
    EXPECT_FALSE(tooLarge.UpdateBuffer(1));
    EXPECT_EQ(nullptr, tooLarge.Picture());
    gLimits = before;
    EXPECT_NE(nullptr, tooLarge.Picture());
}

TEST(Screen, VeryLargeAreasAreNotSmoothed)
{
    const struct {
        S32 width, height;
        int antialias;
    } cases[] = {{8000, 4, 1}, {8001, 4, 0}, {4, 8000, 1}, {4, 8001, 0}};
    for (const auto& c : cases) {
        CountingShell player(c.width, c.height);
        player.Open(MovingSquare(2));
        player.SetCamera(0);
        EXPECT_EQ(c.antialias, player.scene.antialias) << c.width << "x" << c.height;
    }
}

TEST(View, ZoomsAndComesHome)
{
    CountingShell player;
    player.Open(MovingSquare(3));
    const MATRIX home = player.scene.camera;
    player.SetZoomRect(0, 0, 1000, 800);
    EXPECT_NEAR(2 * home.a, player.scene.camera.a, 2);
    player.scaleMode = kScaleFixed;
    player.SetCamera(0);
    EXPECT_NEAR(home.a, player.scene.camera.a, 2) << "a zoom waits while the scale is fixed";
    player.SetZoomRect(10, 0, 10, 800);
    EXPECT_EQ(kScaleShowAll, player.scaleMode);
    EXPECT_TRUE(RectIsEmpty(&player.zoomRect));
    EXPECT_TRUE(MatrixEqual(&home, &player.scene.camera, 0));
}

TEST(View, BestQualitySmoothsAnimatedMovies)
{
    CountingShell player;
    player.Open(MovingSquare(3));
    EXPECT_EQ(1, player.scene.animatedMovie);
    player.SetQuality(2);
    EXPECT_EQ(0, player.scene.animatedMovie);
    EXPECT_EQ(1, player.scene.antialias);
    player.SetQuality(0);
    EXPECT_EQ(0, player.scene.antialias);
}

TEST(View, MenusFollowTheMovie)
{
    CountingShell player;
    MenuStatus menu;
    player.GetMenuState(&menu);
    EXPECT_FALSE(menu.canViewAll || menu.canPlay || menu.canBack || menu.canForward);
    player.Open(MovingSquare(3));
    player.GetMenuState(&menu);
    EXPECT_TRUE(menu.canViewAll && menu.canZoomIn && menu.canPlay && menu.canForward);
    EXPECT_TRUE(menu.viewAll && menu.highQuality && menu.looping && menu.playing);
    EXPECT_FALSE(menu.canRewind || menu.zoomed || menu.view100);
    player.SetZoomRect(0, 0, 1000, 800);
    player.GotoFrame(2);
    player.GetMenuState(&menu);
    EXPECT_TRUE(menu.zoomed && menu.canRewind && menu.canBack);
    EXPECT_FALSE(menu.canForward || menu.viewAll || menu.playing);
}

} // namespace
