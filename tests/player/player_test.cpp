#include "core/player/limits.h"
#include "tests/player/player_scene.h"

namespace {

// The first tick is due when the movie starts; a late one is not made up for. The clock ends and
// starts over between the fourth and the fifth. A day without ticks is a long time, but no time
// ahead.
TEST(Tick, PlaysOneFrameWheneverOneIsDue)
{
    SetHeadlessClock((0x7FFFFFF - 149) * S64(1000));
    PlayingShell player(MovingSquare(40));
    const std::pair<S64, S32> steps[] = {{0, 1},  {99, 1},       {1, 2},  {1, 2}, {99, 3},
                                         {99, 3}, {1000, 4},     {99, 4}, {5, 5}, {96, 5},
                                         {4, 6},  {86400000, 7}, {99, 7}, {1, 8}};
    for (const auto& [milliseconds, frame] : steps) {
        AdvanceHeadlessClock(milliseconds * 1000);
        player.DoPlay(1);
        EXPECT_EQ(frame, player.curFrame);
    }
    player.DoPlay(0);
    EXPECT_EQ(9, player.curFrame) << "without the clock";
    player.actionDepth = 1;
    player.DoPlay(0);
    EXPECT_EQ(9, player.curFrame) << "while actions run";
}

TEST(Tick, TimerFiresTenTimesAFrame)
{
    const std::pair<U16, S32> cases[] = {{Fps(12), 8}, {Fps(120), 0}, {0, 25600}, {0xFFFF, 0}};
    for (const auto& [rate, interval] : cases)
        EXPECT_EQ(interval, PlayingShell(MovingSquare(3, rate)).TimerInterval()) << rate;
}

// Ticks of more than a frame's 100 ms turn anti-aliasing off, those of less than a quarter turn it
// on again. A third of all ticks must be such, of 5 at least, and 11 pass after a switch.
TEST(Tick, QualityFollowsTheSpeed)
{
    PlayingShell player(MovingSquare(20));
    Shot(&player);
    player.autoQuality = 1;
    int tick = 1;
    std::vector<int> switches;
    const std::pair<int, S64> phases[] = {{5, 101}, {16, 24}, {30, 100}, {38, 101}, {60, 25}};
    for (const auto& [end, milliseconds] : phases) {
        player.blitCost = milliseconds;
        for (; tick <= end; tick++) {
            const int before = player.scene.antialias;
            player.Tick();
            if (player.scene.antialias != before)
                switches.push_back(tick);
        }
    }
    EXPECT_EQ((std::vector<int>{5, 16, 38}), switches);
    player.SetQuality(1);
    EXPECT_EQ(0, player.autoQuality);
    player.ControlClose();
    EXPECT_EQ(0, player.sampledTicks | player.slowTicks | player.fastTicks) << "of another movie";
}

TEST(Levels, NamesGiveNumbers)
{
    const std::pair<const char*, S32> cases[] = {
        {"_level12", 12}, {"_LEVEL7a", 7}, {"_vexel3", 3}, {"_level", 0}, {"level1", -1}};
    for (const auto& [name, level] : cases)
        EXPECT_EQ(level, LayerNum(name)) << name;
}

TEST(Levels, AreMadeClearedAndLimited)
{
    gLimits.loadedMovies = 2;
    PlayingShell player(MovingSquare(5));
    ScriptPlayer* five = player.OpenLayer(5, 0);
    ScriptPlayer* two = player.OpenLayer(2, 0);
    EXPECT_EQ(nullptr, player.OpenLayer(3, 0));
    five->SetVariable("a", "1", 0);
    EXPECT_NE(nullptr, player.OpenLayer(5, 1)->FindVariable("a"));
    EXPECT_EQ(nullptr, player.OpenLayer(5, 0)->FindVariable("a"));
    EXPECT_STREQ("BeOS 4.1013", five->FindVariable("$VERSION")->value);
    player.scene.threadCursor = five; // as if it went during the walk, when it was next
    player.ClearLayer(5);
    EXPECT_EQ(&player, player.scene.threadCursor);
    EXPECT_EQ(two, player.layers);
    EXPECT_EQ(nullptr, player.OpenLayer(-1, 0));
    EXPECT_EQ(nullptr, player.OpenLayer(65536, 0)) << "would lie where level 0 does";
    EXPECT_EQ(&player, player.OpenLayer(0, 0));
    EXPECT_FALSE(player.Started() || player.TimerRuns() || player.layers != nullptr);
    gLimits = {};
}

// A second movie over the first: it plays along, lies above it, and takes its objects with it. The
// sprite that its second frame places shows its own first frame and waits for the next tick.
TEST(Levels, PlayAlongAboveTheRoot)
{
    TagWriter sprite;
    sprite.Place(1, 1).Show().Move(1, Mat::Translate(200, 0)).Show().End();
    MovieWriter movie;
    movie.DefineShape(1, Square({0, 0, 255, 255})).DefineSprite(2, sprite).Show();
    movie.Place(2, 1, Mat::Translate(200, 200)).Show(2).End();
    const std::vector<U8> cover = movie.Bytes();
    PlayingShell player(MovingSquare(20));
    const Picture alone = Shot(&player);
    player.OpenLayer(1, 0)->PushDataBuf(cover.data(), static_cast<S32>(cover.size()));
    player.Tick();
    for (int x : {18, 25}) {
        player.Tick();
        EXPECT_EQ(0xFF0000FFu, Shot(&player).At(x, 18));
    }
    player.ClearLayer(1);
    player.GotoFrame(0);
    EXPECT_EQ("", ExpectSame(Shot(&player), alone, "level-gone"));
}

// What is painted and copied is what changed, and up to 4 pixels around it. A control asks the
// shell to draw and leaves the painting to it; pixels made anew are asked for.
TEST(Screen, PaintsAndCopiesWhatItMust)
{
    const SRECT whole = {0, 100, 0, 80}, beyond = {-0x7FFFFFFF, 0x7FFFFFFF, -99, 0x7FFFFFFF};
    const SRECT spoiled = {7, 27, 5, 21}, around = {5, 29, 3, 23};
    const SRECT moved = {8, 26, 8, 24}; // from (10, 10) to (14, 12), 10 wide and high
    for (int quality : {0, 1}) {
        PlayingShell player(MovingSquare(3));
        player.SetQuality(quality);
        const Picture before = Shot(&player);
        for (S32 y = 5; y < 21; y++)
            std::fill_n(reinterpret_cast<U32*>(player.bits.RowAddr(y)) + 7, 20, 0xFF00FF00u);
        player.Repaint(&spoiled);
        EXPECT_TRUE(RectEqual(&around, &player.blitted, 2));
        EXPECT_EQ("", ExpectSame(Shot(&player), before, "repaint"));
        for (auto draw : {&SPlayer::Repaint, &SPlayer::OnDraw}) {
            RectSetEmpty(&player.blitted);
            (player.*draw)(&beyond);
            EXPECT_TRUE(RectEqual(&whole, &player.blitted, 0));
        }
        RectSetEmpty(&player.invalidated);
        player.FreeBuffer();
        player.UpdateScreen();
        EXPECT_TRUE(player.bits.HasBits());
        EXPECT_EQ("", ExpectSame(Shot(&player), before, "freed"));
        EXPECT_TRUE(RectEqual(&whole, &player.invalidated, 0));
        player.Tick();
        EXPECT_TRUE(RectEqual(&moved, &player.blitted, 2));
        RectSetEmpty(&player.blitted);
        RectSetEmpty(&player.invalidated);
        player.playing = 0;
        player.Tick();
        player.SetQuality(!quality);
        EXPECT_TRUE(RectEqual(&whole, &player.invalidated, 0));
        EXPECT_TRUE(RectIsEmpty(&player.blitted));
    }
}

// No pixels without an area, nor beyond the limit; no smoothing beyond 8000 pixels.
TEST(Screen, SizeAndQualityDecide)
{
    gLimits.surfacePixels = 4 * 8001;
    const struct {
        S32 width, height, quality;
        bool pixels, antialias, animated;
    } cases[] = {{0, 20, 1, 0, 1, 1},   {8000, 4, 1, 1, 1, 1}, {8001, 4, 2, 1, 0, 0},
                 {4, 8000, 2, 1, 1, 0}, {4, 8001, 0, 1, 0, 1}, {4, 8002, 1, 0, 0, 1}};
    for (const auto& c : cases) {
        PlayingShell player(MovingSquare(2), c.width, c.height);
        player.SetQuality(c.quality);
        EXPECT_EQ(c.pixels, player.Picture() != nullptr) << c.width << "x" << c.height;
        EXPECT_EQ(!c.pixels, player.cleared) << c.width << "x" << c.height;
        EXPECT_EQ(c.pixels || c.width == 0, player.UpdateBuffer(1)) << c.width << "x" << c.height;
        EXPECT_EQ(c.antialias, player.scene.antialias) << c.width << "x" << c.height;
        EXPECT_EQ(c.animated, player.scene.animatedMovie) << c.width << "x" << c.height;
    }
    gLimits = {};
}

struct AreaShell : PlayingShell {
    using PlayingShell::PlayingShell;
    void ClientRect(SRECT* r) override { *r = area; }
    SRECT area = {-30, 70, 500, 580};
};

// What cannot be had is asked for again with the buffer freed, or when its size changes.
TEST(Screen, RefusedPixels)
{
    AreaShell player(MovingSquare(2));
    std::string made;
    const std::tuple<U32, S32, bool> steps[] = {
        {1, 70, 0}, {20000, 70, 0}, {20000, 70, 1}, {20000, 999, 1}, {20000, 80, 0}};
    for (const auto& [limit, right, freed] : steps) {
        gLimits.surfacePixels = limit, player.area.xmax = right;
        freed ? player.FreeBuffer() : void();
        made += std::to_string(player.UpdateBuffer(1));
    }
    gLimits = {};
    EXPECT_EQ("00101", made);
}

// A shell whose area does not begin at 0, or runs backwards.
TEST(Screen, OnlyTheSizeOfTheClientCounts)
{
    AreaShell player(MovingSquare(3));
    PlayingShell normal(MovingSquare(3));
    for (auto zoom : {&SPlayer::Home, &SPlayer::ControlZoomIn, &SPlayer::Control100}) {
        for (SPlayer* p : {static_cast<SPlayer*>(&player), static_cast<SPlayer*>(&normal)})
            (p->*zoom)();
        EXPECT_EQ("", ExpectSame(Shot(&player), Shot(&normal), "client"));
    }
    for (const SRECT& area : {SRECT{kS32Max, kS32Min, 0, 80}, SRECT{0, 100, 3, 2}}) {
        player.area = area;
        player.FreeBuffer();
        player.ControlZoomIn();
        EXPECT_TRUE(player.UpdateBuffer(1) && !player.bits.HasBits());
    }
}

} // namespace
