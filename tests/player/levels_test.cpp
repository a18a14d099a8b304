#include "core/player/limits.h"
#include "tests/player/player_scene.h"

namespace {

std::string Version(ScriptPlayer* movie)
{
    const SVariable* variable = movie->FindVariable("$VERSION");
    return variable != nullptr && variable->value != nullptr ? variable->value : "none";
}

TEST(Levels, NamesGiveNumbers)
{
    const struct {
        const char* name;
        S32 level;
    } cases[] = {{"_level12", 12}, {"_LEVEL0", 0},  {"_vexel3", 3}, {"_level", 0},
                 {"_level7a", 7},  {"level12", -1}, {"", -1},       {nullptr, -1},
                 {"/_level1", -1}, {"_level-4", 0}};
    for (const auto& c : cases)
        EXPECT_EQ(c.level, LayerNum(c.name)) << (c.name ? c.name : "null");
}

TEST(Levels, AreMadeFoundAndCleared)
{
    CountingShell player;
    EXPECT_EQ("BeOS 4.1013", Version(&player));
    ScriptPlayer* five = player.OpenLayer(5, 0);
    ScriptPlayer* two = player.OpenLayer(2, 0);
    ASSERT_NE(nullptr, five);
    EXPECT_EQ("BeOS 4.1013", Version(two));
    EXPECT_EQ(two, player.layers);
    EXPECT_EQ(five, FindLayer(player.layers, 5));
    five->SetVariable("a", "1", 0);
    EXPECT_EQ(five, player.OpenLayer(5, 1));
    EXPECT_NE(nullptr, five->FindVariable("a"));
    EXPECT_EQ(five, player.OpenLayer(5, 0));
    EXPECT_EQ(nullptr, five->FindVariable("a"));
    EXPECT_EQ("BeOS 4.1013", Version(five));
    player.ClearLayer(5);
    player.ClearLayer(77);
    EXPECT_EQ(nullptr, FindLayer(player.layers, 5));
    EXPECT_EQ(two, FindLayer(player.layers, 2));
    EXPECT_EQ(&player, player.OpenLayer(0, 1));
}

TEST(Levels, AreLimited)
{
    const SLimits before = gLimits;
    gLimits.loadedMovies = 2;
    CountingShell player;
    EXPECT_EQ(nullptr, player.OpenLayer(-1, 0));
    EXPECT_NE(nullptr, player.OpenLayer(1, 0));
    EXPECT_NE(nullptr, player.OpenLayer(9, 0));
    EXPECT_EQ(nullptr, player.OpenLayer(3, 0));
    EXPECT_NE(nullptr, player.OpenLayer(9, 0));
    gLimits = before;
}

// A second movie over the first: it plays along, lies above it, and takes its objects with it.
TEST(Levels, PlayAlongAboveTheRoot)
{
    MovieWriter cover(100 * 20, 80 * 20, Fps(10));
    cover.DefineShape(1, Square({0, 0, 255, 255})).Place(1, 1, Mat::Translate(200, 200)).Show();
    cover.Move(1, Mat::Translate(1000, 200)).Show().End();
    const std::vector<U8> bytes = cover.Bytes();
    CountingShell player;
    player.Open(MovingSquare(20));
    const Picture alone = Shot(&player);
    ScriptPlayer* level = player.OpenLayer(1, 0);
    level->PushDataBuf(bytes.data(), static_cast<S32>(bytes.size()));
    player.actionDepth = 0;
    player.Tick();
    EXPECT_EQ(0, level->curFrame);
    EXPECT_EQ(0xFF0000FFu, Shot(&player).At(18, 16));
    player.Tick();
    EXPECT_EQ(1, level->curFrame);
    EXPECT_EQ(0xFF0000FFu, Shot(&player).At(55, 15));
    player.ClearLayer(1);
    player.GotoFrame(0);
    EXPECT_EQ("", ExpectSame(Shot(&player), alone, "level-gone"));
}

TEST(Levels, OpeningTheRootAnewUnloadsEverything)
{
    CountingShell player;
    player.Open(MovingSquare(20));
    player.OpenLayer(3, 0);
    player.SetZoomRect(0, 0, 500, 500);
    EXPECT_EQ(&player, player.OpenLayer(0, 1));
    EXPECT_TRUE(player.Started());
    EXPECT_EQ(&player, player.OpenLayer(0, 0));
    EXPECT_FALSE(player.Started());
    EXPECT_FALSE(player.TimerRuns());
    EXPECT_EQ(nullptr, player.layers);
    EXPECT_TRUE(RectIsEmpty(&player.zoomRect));
    EXPECT_EQ("BeOS 4.1013", Version(&player));
    player.Open(MovingSquare(3));
    CountingShell other;
    other.Open(MovingSquare(3));
    EXPECT_EQ("", ExpectSame(Shot(&player), Shot(&other), "second-movie"));
}

} // namespace
