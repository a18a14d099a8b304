#include "tests/player/player_scene.h"

namespace {

constexpr S64 kMs = 1000;

class Tick : public testing::Test {
protected:
    void SetUp() override { SetHeadlessClock(0); }
};

// Each step moves the clock and tries a tick; the frame shown afterwards is given.
struct Step {
    S64 advance; // milliseconds
    S32 frame;
};

void PlaySteps(NativePlayerWnd* player, std::initializer_list<Step> steps)
{
    S64 at = 0;
    for (const Step& step : steps) {
        at += step.advance;
        AdvanceHeadlessClock(step.advance * kMs);
        player->DoPlay(1);
        EXPECT_EQ(step.frame, player->curFrame) << "after " << at << " ms";
    }
}

// The first tick is due when the movie starts; a late one is not made up for.
TEST_F(Tick, PlaysOneFrameWheneverOneIsDue)
{
    CountingShell player;
    player.Open(MovingSquare(40));
    PlaySteps(&player,
              {{0, 1}, {99, 1}, {1, 2}, {1, 2}, {1000, 3}, {99, 3}, {5, 4}, {96, 4}, {4, 5}});
}

TEST_F(Tick, CrossesTheEndOfTheClock)
{
    SetHeadlessClock((0x7FFFFFF - 149) * kMs);
    CountingShell player;
    player.Open(MovingSquare(40));
    PlaySteps(&player, {{0, 1}, {100, 2}, {60, 2}, {40, 3}, {99, 3}, {1, 4}});
}

TEST_F(Tick, WithoutTheClockAlwaysPlays)
{
    CountingShell player;
    player.Open(MovingSquare(40));
    for (S32 frame = 1; frame < 5; frame++) {
        player.DoPlay(0);
        EXPECT_EQ(frame, player.curFrame);
    }
}

TEST_F(Tick, DoesNothingBeforeTheFirstFrameOrInsideActions)
{
    CountingShell player;
    const std::vector<U8> movie = MovingSquare(3);
    player.Feed(movie.data(), 30);
    player.DoPlay(0);
    EXPECT_EQ(-1, player.curFrame);
    EXPECT_FALSE(player.TimerRuns());
    player.Feed(movie.data() + 30, movie.size() - 30);
    EXPECT_EQ(0, player.curFrame);
    EXPECT_TRUE(player.TimerRuns());
    player.actionDepth = 1;
    player.DoPlay(0);
    EXPECT_EQ(0, player.curFrame);
}

TEST_F(Tick, TimerFiresTenTimesAFrame)
{
    const struct {
        U16 rate;
        S32 interval;
    } cases[] = {{Fps(12), 8}, {Fps(10), 10}, {Fps(120), 0}, {1, 25600}, {0, 25600}, {0xFFFF, 0}};
    for (const auto& c : cases) {
        CountingShell player;
        player.Open(MovingSquare(3, c.rate));
        EXPECT_EQ(c.interval, player.TimerInterval()) << c.rate;
    }
}

TEST_F(Tick, LoopsAndStops)
{
    CountingShell player;
    player.Open(MovingSquare(3));
    std::vector<S32> shown;
    for (int tick = 0; tick < 7; tick++) {
        player.loop = tick < 4;
        player.Tick();
        shown.push_back(player.curFrame);
    }
    EXPECT_EQ((std::vector<S32>{1, 2, 0, 1, 2, 2, 2}), shown);
    EXPECT_FALSE(player.playing);
}

// A sprite that a tick places shows its first frame and waits for the next tick; one that a tick
// removes has had its turn before its parent.
TEST_F(Tick, WalksTimelinesThatComeAndGo)
{
    TagWriter sprite;
    sprite.Place(1, 1).Show().Move(1, Mat::Translate(400, 0)).Show().RemoveDepth(1).Show().End();
    MovieWriter movie(100 * 20, 80 * 20, Fps(10));
    movie.DefineShape(1, Square()).DefineSprite(2, sprite).Show();
    movie.Place2(1, {.character = U16(2)}).Place2(2, {.character = U16(2)}).Show(2);
    movie.RemoveDepth(1).RemoveDepth(2).Show().End();
    CountingShell player;
    player.Open(movie.Bytes());
    EXPECT_EQ(&player, player.scene.threads);
    player.Tick();
    ASSERT_NE(&player, player.scene.threads);
    EXPECT_EQ(0, player.scene.threads->curFrame);
    player.Tick();
    EXPECT_EQ(1, player.scene.threads->curFrame);
    EXPECT_EQ(1, player.scene.threads->nextThread->curFrame);
    player.Tick();
    EXPECT_EQ(&player, player.scene.threads);
    EXPECT_EQ(nullptr, player.scene.threadCursor);
}

// A level that is unloaded from inside the walk must not be visited, even when it was next.
TEST_F(Tick, SurvivesTheRemovalOfTheNextTimeline)
{
    CountingShell player;
    player.Open(MovingSquare(5));
    player.OpenLayer(1, 0);
    player.OpenLayer(2, 0);
    player.scene.threadCursor = FindLayer(player.layers, 1);
    player.ClearLayer(1);
    EXPECT_EQ(&player, player.scene.threadCursor);
    player.Tick();
    EXPECT_EQ(1, player.curFrame);
}

// Ticks that are too slow for the frame rate turn anti-aliasing off, quick ones turn it on again;
// between the two nothing changes. Decided after 5 samples and 11 ticks after a switch.
TEST_F(Tick, QualityFollowsTheSpeed)
{
    CountingShell player;
    player.Open(MovingSquare(200));
    Shot(&player);
    player.autoQuality = 1;
    player.blitCost = 101;
    std::vector<int> switches;
    for (int tick = 1; tick <= 40; tick++) {
        const int before = player.highQuality;
        player.Tick();
        if (player.highQuality != before)
            switches.push_back(tick), player.blitCost = 0;
        EXPECT_EQ(player.highQuality, player.scene.antialias);
    }
    EXPECT_EQ((std::vector<int>{5, 16}), switches);
}

TEST_F(Tick, QualityStaysInTheMiddleAndWhereItWasSet)
{
    CountingShell player;
    player.Open(MovingSquare(200));
    Shot(&player);
    player.autoQuality = 1;
    player.blitCost = 60;
    for (int tick = 0; tick < 30; tick++)
        player.Tick();
    EXPECT_EQ(1, player.highQuality);
    player.SetQuality(0);
    player.blitCost = 0;
    for (int tick = 0; tick < 30; tick++)
        player.Tick();
    EXPECT_EQ(0, player.highQuality);
}

TEST_F(Tick, GoingToAFrameShowsWhatPlayingThereShows)
{
    const std::vector<U8> bytes = MovingSquare(12);
    for (S32 frame : {0, 1, 7, 11}) {
        CountingShell player, jumper;
        player.Open(bytes);
        jumper.Open(bytes);
        for (S32 i = 0; i < frame; i++)
            player.Tick();
        jumper.GotoFrame(9);
        jumper.GotoFrame(frame);
        EXPECT_FALSE(jumper.playing);
        EXPECT_EQ(frame, jumper.curFrame);
        EXPECT_EQ("", ExpectSame(Shot(&jumper), Shot(&player), "goto-frame"));
    }
}

} // namespace
