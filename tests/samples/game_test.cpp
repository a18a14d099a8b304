#include "core/player/random.h"
#include "core/stream/sounds.h"
#include "platform/headless/headless_sound.h"
#include "platform/headless/native_player.h"
#include "samples/orchard.h"

#include <gtest/gtest.h>

using namespace orchard;

namespace {

// Someone with a mouse and an ear. A pixel here is ten of the movie's.
struct Gamer {
    Gamer()
    {
        const std::vector<U8> movie = MakeOrchard();
        SetHeadlessClock(0);
        SeedRandom(11);
        player.PlayThrough(&mix);
        player.SetMovieFile(VEXEL_SOURCE_DIR "/samples/orchard.vxm");
        player.Feed(movie.data(), movie.size());
    }
    double Property(const std::string& path, int index)
    {
        return player.GetProperty(player.FindTarget(nullptr, path.c_str()), index);
    }
    int Frame(const std::string& path) { return int(Property(path, 4)) - 1; } // below 0: not there
    int Shown(const std::string& path)
    {
        return Frame(path + "/tens") * 10 + Frame(path + "/ones");
    }
    int Number(const char* name) { return std::atoi(player.FindVariable(name)->value); }
    void Click(S32 x, S32 y)
    {
        player.MouseMove(x, y, 0);
        player.MouseDown(x, y);
        player.MouseUp(x, y);
    }
    // Under the lowest apple that can still be caught, until the board with the score hangs still.
    void Play(bool catching)
    {
        for (; !player.layers && ticks < 2000; ticks++) {
            player.Tick();
            MATRIX best = {0, 0, 0, 0, pointer * 200, 0};
            for (SObject* o = catching ? player.rootObject->bottomChild : nullptr; o; o = o->above)
                if (const MATRIX& m = o->xform.mat; o->depth > 16384 && m.ty < 432 * 20)
                    best = m.ty > best.ty ? m : best;
            if (pointer != best.tx / 200)
                player.MouseMove(pointer = best.tx / 200, 30, 0);
            for (U16 id = kClickSound; id <= kTune; id++) {
                CSound sound;
                bool plays = SoundOf(player.FindCharacter(id), &sound) && mix.SoundPlaying(&sound);
                starts[id] += plays && !playing[id];
                playing[id] = plays;
            }
        }
        for (int i = 0; i < 30; i++)
            player.Tick();
    }
    NativeSoundMix mix;
    NativePlayerWnd player{64, 48};
    int starts[kTune + 1] = {}, playing[kTune + 1] = {}, pointer = -1, ticks = 0;
};

TEST(Orchard, IsPlayedFromBeginningToEndAndAgain)
{
    Gamer gamer;
    SPlayer& player = gamer.player;
    gamer.Click(25, 29);
    player.MouseMove(0, 30, 0); // further than the basket goes
    player.HandleKeyDown(2, 0);
    EXPECT_EQ(gamer.Property("/basket", 0), 44 + 28);
    gamer.Play(true);
    EXPECT_NEAR(gamer.ticks, 30 * 24, 20);
    const int score = gamer.Number("score"), caught = gamer.Number("caught");
    const int golden = (score - caught) / 4;
    EXPECT_TRUE(caught > 25 && golden > 0 && score == caught + 4 * golden) << caught;
    EXPECT_TRUE(gamer.Shown("/score") == score && gamer.Shown("/clock") == 0);
    EXPECT_EQ(gamer.Frame("/basket/body/heap"), 7);
    EXPECT_EQ(gamer.Shown("_level1/board/score"), score);
    EXPECT_EQ(gamer.Frame("_level1/board/verdict"), 1 + (score >= 24) + (score >= 36));
    EXPECT_EQ(gamer.starts[kClickSound], 1);
    EXPECT_TRUE(gamer.starts[kTune] == 1 && !gamer.playing[kTune]);
    EXPECT_EQ(gamer.starts[kGoldSound], golden);
    EXPECT_NEAR(gamer.starts[kCatchSound], caught - golden, 4); // two that overlap count once
    EXPECT_EQ(gamer.starts[kMissSound], gamer.Number("missed"));

    player.SetVariable(&player, "length", "5000", 0);
    gamer.Click(32, 34); // again
    EXPECT_TRUE(!player.layers && player.curFrame == 1);
    player.MouseMove(0, 30, 0);
    gamer.Play(false);
    EXPECT_TRUE(gamer.Number("caught") == 0 && gamer.Number("missed") > 0);
    EXPECT_EQ(gamer.Shown("_level1/board/score"), 0);
    EXPECT_EQ(gamer.Shown("_level1/board/best"), score);
}

} // namespace
