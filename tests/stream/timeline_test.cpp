#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>

namespace {

ShapeBuilder Square()
{
    ShapeBuilder shape;
    shape.Styles(0, shape.AddFill(Rgba{255, 0, 0, 255})).Rect(0, 0, 200, 200);
    return shape;
}

Mat X(S32 x)
{
    return Mat::Translate(x, 0);
}

// Shapes 1 to 3; every frame places, moves or removes something.
MovieWriter BusyMovie()
{
    MovieWriter movie(4000, 4000);
    for (U16 id = 1; id <= 3; id++)
        movie.DefineShape(id, Square());
    movie.Place(1, 10).Label("Start").Show();                       // 0
    movie.Place(2, 5, X(100)).Show();                               // 1
    movie.Move(10, X(50)).Show();                                   // 2
    movie.RemoveDepth(5).Place2(7, {.character = 3}).Show();        // 3
    movie.Place2(7, {.move = true, .character = 2}).Show();         // 4
    movie.Label("M\xE4rz").Remove(1, 10).Place(3, 10, X(9)).Show(); // 5
    movie.RemoveDepth(7).Show().Show().End();                       // 6, 7
    return movie;
}

const char* const kBusyTrees[] = {"10:1",        "5:2@100 10:1", "5:2@100 10:1@50", "7:3 10:1@50",
                                  "7:2 10:1@50", "7:2 10:3@9",   "10:3@9",          "10:3@9"};

TEST(Timeline, RunsFrameByFrameAndLoops)
{
    StreamScene scene(BusyMovie());
    EXPECT_EQ(scene.movie.DrawFrame(0, true), kDrawn);
    EXPECT_EQ(scene.Tree(), kBusyTrees[0]);
    for (int tick = 1; tick < 20; tick++) {
        scene.Tick();
        ASSERT_EQ(scene.movie.curFrame, tick % 8);
        ASSERT_EQ(scene.Tree(), kBusyTrees[tick % 8]) << tick;
    }
}

TEST(Timeline, AnySeekShowsWhatPlayingShows)
{
    StreamScene scene(BusyMovie());
    std::mt19937 random(5);
    for (int i = 0; i < 200; i++) {
        const int target = static_cast<int>(random() % 8);
        scene.list.ResetBudget();
        scene.movie.Seek(target);
        ASSERT_EQ(scene.movie.curFrame, target);
        ASSERT_EQ(scene.Tree(), kBusyTrees[target]) << "step " << i;
        ASSERT_FALSE(scene.movie.seeking);
        ASSERT_EQ(scene.list.holdParent, nullptr);
        if (random() % 4 == 0) {
            scene.movie.DoFrame(1, true);
            ASSERT_EQ(scene.movie.curFrame, target) << "a rebuild stays at its frame";
            ASSERT_EQ(scene.Tree(), kBusyTrees[target]);
        }
    }
    scene.movie.Seek(-3);
    EXPECT_EQ(scene.movie.curFrame, 0);
    scene.movie.Seek(kS32Max);
    EXPECT_EQ(scene.movie.curFrame, 7);
    EXPECT_EQ(scene.movie.DrawFrame(kS32Min, true), kDrawn);
    EXPECT_EQ(scene.movie.curFrame, -1);
    EXPECT_EQ(scene.Tree(), "");
}

TEST(Timeline, StopsAndPlays)
{
    StreamScene scene(BusyMovie());
    ScriptPlayer& movie = scene.movie;
    movie.loop = false;
    for (int i = 0; i < 12; i++)
        scene.Tick();
    EXPECT_EQ(movie.curFrame, 7);
    EXPECT_FALSE(movie.playing) << "without loop the end stops it";
    movie.Play(false);
    EXPECT_TRUE(movie.playing);
    EXPECT_EQ(movie.curFrame, 7);
    movie.Play(true);
    EXPECT_EQ(movie.curFrame, 0) << "from the last frame it starts anew";
    movie.StopPlay();
    scene.Tick();
    EXPECT_EQ(movie.curFrame, 0);
    movie.loop = true;
    movie.Seek(7);
    movie.Play(true);
    EXPECT_EQ(movie.curFrame, 7) << "with loop it goes on";

    MovieWriter single;
    single.Show().End();
    StreamScene still(single);
    still.Tick();
    still.Tick();
    EXPECT_FALSE(still.movie.playing) << "one frame has nothing to loop through";
}

TEST(Timeline, WaitsForDataAndGoesOn)
{
    const std::vector<U8> bytes = BusyMovie().Bytes();
    StreamScene scene;
    int shown = -1, most = -1;
    for (U8 byte : bytes) {
        scene.movie.PushDataBuf(&byte, 1);
        scene.Tick();
        ASSERT_LE(scene.movie.curFrame, scene.movie.numFramesComplete);
        ASSERT_LE(scene.movie.curFrame, shown + 1);
        shown = scene.movie.curFrame;
        most = std::max(most, shown);
        ASSERT_EQ(scene.Tree(), shown >= 0 ? kBusyTrees[shown] : "");
    }
    EXPECT_EQ(shown, 0) << "the End tag's last byte lets it loop";
    EXPECT_EQ(most, 7);
    EXPECT_TRUE(scene.movie.playing);
}

TEST(Timeline, LabelsAreFoundAheadOfPlaying)
{
    StreamScene scene(BusyMovie());
    ScriptPlayer& movie = scene.movie;
    EXPECT_EQ(movie.FindLabel("START"), 0);
    EXPECT_EQ(movie.FindLabel("m\xE4RZ"), 5);
    EXPECT_EQ(movie.FindLabel("m\xC4rz"), -1) << "only the ASCII letters fold";
    EXPECT_EQ(movie.FindLabel("star"), -1);
    EXPECT_EQ(movie.FindLabel(nullptr), -1);
    EXPECT_EQ(movie.pos, movie.startPos);
    movie.Seek(6);
    EXPECT_STREQ(movie.label, "M\xE4rz");
    movie.Seek(2);
    EXPECT_STREQ(movie.label, "Start");

    MovieWriter late;
    late.Show(2).End().Label("late").Show();
    std::vector<U8> bytes = late.Bytes();
    StreamScene partly;
    bytes.resize(bytes.size() - 4);
    Push(partly.movie, bytes);
    EXPECT_EQ(partly.movie.FindLabel("late"), -1) << "not all there yet";
    EXPECT_EQ(StreamScene(late).movie.FindLabel("late"), 2) << "beyond the End tag";
}

// A sprite of three frames that moves its own child, on a timeline that moves the sprite.
MovieWriter SpriteMovie()
{
    MovieWriter movie(4000, 4000);
    TagWriter sprite;
    sprite.Place(1, 1).Show().Move(1, X(1)).Show().Move(1, X(2)).Show().End();
    movie.DefineShape(1, Square()).DefineSprite(2, sprite);
    movie.Place2(4, {.character = 2, .name = "ball"}).Show().Move(4, X(30)).Show(2);
    movie.RemoveDepth(4).Show().End();
    return movie;
}

TEST(Timeline, SpritesRunOnTheirOwnAndSurviveSeeks)
{
    StreamScene scene(SpriteMovie());
    scene.Tick();
    EXPECT_EQ(scene.Tree(), "4:2(1:1)") << "the sprite's first frame comes in the same tick";
    scene.Tick();
    EXPECT_EQ(scene.Tree(), "4:2@30(1:1@1)");
    scene.Tick();
    EXPECT_EQ(scene.Tree(), "4:2@30(1:1@2)");
    ScriptThread* sprite = scene.At(4)->thread;
    scene.movie.Seek(0);
    EXPECT_EQ(scene.Tree(), "4:2(1:1@2)") << "only the placement goes back";
    EXPECT_EQ(scene.At(4)->thread, sprite);
    EXPECT_FALSE(sprite->IsRoot());
    scene.movie.Seek(3);
    EXPECT_EQ(scene.Tree(), "");
    EXPECT_EQ(scene.list.threads, &scene.movie) << "the timeline went with its object";
    scene.movie.Seek(2);
    EXPECT_EQ(scene.Tree(), "4:2@30(1:1)") << "placed anew";
}

TEST(Timeline, TagsPerTickAreBounded)
{
    StreamScene scene(BusyMovie());
    scene.list.tagsLeft = 6; // three shapes, a place, a label, a ShowFrame
    EXPECT_EQ(scene.movie.DrawFrame(5, true), kNeedsData);
    EXPECT_EQ(scene.movie.curFrame, 0);
    EXPECT_EQ(scene.movie.DrawFrame(5, true), kNeedsData);
    scene.list.ResetBudget();
    EXPECT_EQ(scene.movie.DrawFrame(5, true), kDrawn);
    EXPECT_EQ(scene.Tree(), kBusyTrees[5]);
    scene.list.tagsLeft = 1;
    EXPECT_EQ(scene.movie.DrawFrame(2, true), kNeedsData);
    EXPECT_EQ(scene.list.holdParent, nullptr) << "an interrupted rebuild closes its hold";
    EXPECT_FALSE(scene.movie.seeking);
}

TEST(Timeline, HasNoRootWithoutHeaderOrDisplay)
{
    StreamScene empty;
    EXPECT_EQ(empty.movie.DrawFrame(0, true), kNeedsData);
    EXPECT_EQ(empty.movie.rootObject, nullptr);
    ScriptPlayer alone;
    Push(alone, BusyMovie().Bytes());
    EXPECT_EQ(alone.DrawFrame(0, true), kDrawFailed);

    StreamScene scene(BusyMovie());
    scene.movie.layerDepth = 17;
    scene.movie.DrawFrame(1, false);
    EXPECT_EQ(scene.list.FindChild(&scene.list.root, 17), scene.movie.rootObject);
    EXPECT_EQ(scene.movie.rootObject->character->type, kCharMovieRoot);
    EXPECT_EQ(scene.movie.rootObject->thread, &scene.movie);
    scene.movie.ClearScript();
    EXPECT_EQ(scene.list.root.bottomChild, nullptr);
    Push(scene.movie, BusyMovie().Bytes());
    EXPECT_EQ(scene.movie.DrawFrame(1, true), kDrawn);
    EXPECT_EQ(scene.Tree(), kBusyTrees[1]);
}

} // namespace
