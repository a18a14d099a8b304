// Timelines: frames, seeks, labels, and what their tags and clones place.
#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

#include <random>

namespace {

Mat X(S32 x)
{
    return Mat::Translate(x, 0);
}

// Shapes 1 to 3, and sprite 9 with shape 1 at depth 1, moved in each of three frames.
MovieWriter Start()
{
    MovieWriter movie(4000, 4000);
    ShapeBuilder square;
    square.Styles(0, square.AddFill(Rgba{255, 0, 0, 255})).Rect(0, 0, 200, 200);
    TagWriter sprite;
    sprite.Place(1, 1).Show().Move(1, X(1)).Show().Move(1, X(2)).Show().End();
    for (U16 id = 1; id <= 3; id++)
        movie.DefineShape(id, square);
    movie.DefineSprite(9, sprite);
    return movie;
}

// Every frame places, moves or removes something.
MovieWriter BusyMovie()
{
    MovieWriter movie = Start();
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

TEST(Timeline, AnySeekShowsWhatPlayingShows)
{
    StreamScene scene(BusyMovie());
    ScriptPlayer& movie = scene.movie;
    for (int tick = 0; tick < 20; tick++) {
        scene.Tick();
        ASSERT_TRUE(movie.curFrame == tick % 8 && scene.Tree() == kBusyTrees[tick % 8]) << tick;
    }
    std::mt19937 random(5);
    for (int i = 0; i < 200; i++) {
        const int target = static_cast<int>(random() % 8);
        scene.list.ResetBudget();
        movie.Seek(target);
        if (i % 4 == 0)
            movie.DoFrame(1, true); // a rebuild stays at its frame
        ASSERT_TRUE(movie.curFrame == target && scene.Tree() == kBusyTrees[target]) << i;
        ASSERT_FALSE(movie.seeking || scene.list.holdParent);
        ASSERT_STREQ(movie.label, target < 5 ? "Start" : "M\xE4rz");
    }
    movie.Seek(-3);
    EXPECT_EQ(movie.curFrame, 0);
    movie.Seek(kS32Max);
    EXPECT_EQ(movie.curFrame, 7);
    EXPECT_EQ(movie.DrawFrame(kS32Min, true), kDrawn);
    EXPECT_TRUE(scene.Tree().empty() && !movie.label);
}

TEST(Timeline, StopsAndPlays)
{
    MovieWriter single;
    single.Show().End();
    StreamScene scene(BusyMovie()), still(single);
    ScriptPlayer& movie = scene.movie;
    movie.loop = false;
    for (int i = 0; i < 12; i++)
        scene.Tick();
    EXPECT_TRUE(movie.curFrame == 7 && !movie.playing) << "without loop the end stops it";
    movie.Play(false);
    EXPECT_TRUE(movie.curFrame == 7 && movie.playing);
    movie.Play(true);
    EXPECT_EQ(movie.curFrame, 0) << "from the last frame it starts anew";
    movie.StopPlay();
    scene.Tick();
    EXPECT_EQ(movie.curFrame, 0);
    movie.loop = true;
    movie.Seek(7);
    movie.Play(true);
    EXPECT_EQ(movie.curFrame, 7) << "with loop it goes on";
    still.Tick();
    still.Tick();
    EXPECT_FALSE(still.movie.playing) << "one frame has nothing to loop through";
}

TEST(Timeline, WaitsForDataAndGoesOn)
{
    StreamScene scene;
    EXPECT_EQ(scene.movie.DrawFrame(0, true), kNeedsData);
    int shown = -1, most = -1;
    for (U8 byte : BusyMovie().Bytes()) {
        scene.movie.PushDataBuf(&byte, 1);
        scene.Tick();
        ASSERT_LE(scene.movie.curFrame, std::min(shown + 1, scene.movie.numFramesComplete));
        shown = scene.movie.curFrame;
        most = std::max(most, shown);
        ASSERT_EQ(scene.Tree(), shown >= 0 ? kBusyTrees[shown] : "");
    }
    EXPECT_TRUE(shown == 0 && most == 7) << "the End tag's last byte lets it loop";
}

TEST(Timeline, LabelsAreFoundAheadOfPlaying)
{
    StreamScene scene(BusyMovie());
    const std::pair<const char*, S32> rows[] = {
        {"START", 0}, {"m\xE4RZ", 5}, {"m\xC4rz", -1}, {"star", -1}, {nullptr, -1}};
    for (const auto& [name, frame] : rows)
        EXPECT_EQ(scene.movie.FindLabel(name), frame);
    EXPECT_EQ(scene.movie.pos, scene.movie.startPos);
    MovieWriter late;
    late.Show(2).End().Label("late").Show();
    const std::vector<U8> bytes = late.Bytes();
    StreamScene partly;
    partly.movie.PushDataBuf(bytes.data(), S32(bytes.size()) - 4);
    EXPECT_EQ(partly.movie.FindLabel("late"), -1) << "not all there yet";
    EXPECT_EQ(StreamScene(late).movie.FindLabel("late"), 2) << "beyond the End tag";
}

TEST(Timeline, TagsPerTickAreBoundedAndRootsComeAndGo)
{
    StreamScene scene(BusyMovie());
    scene.list.tagsLeft = 7; // four definitions, a place, a label, a ShowFrame
    for (int i = 0; i < 2; i++)
        EXPECT_EQ(scene.movie.DrawFrame(5, true), kNeedsData);
    EXPECT_EQ(scene.movie.curFrame, 0);
    scene.list.ResetBudget();
    EXPECT_EQ(scene.movie.DrawFrame(5, true), kDrawn);
    scene.list.tagsLeft = 1;
    EXPECT_EQ(scene.movie.DrawFrame(2, true), kNeedsData);
    EXPECT_FALSE(scene.movie.seeking || scene.list.holdParent) << "interrupted rebuilds close it";
    scene.movie.ClearScript();
    EXPECT_EQ(scene.list.root.bottomChild, nullptr);
    scene.list.ResetBudget();
    scene.movie.layerDepth = 17;
    Push(scene.movie, BusyMovie().Bytes());
    EXPECT_EQ(scene.movie.DrawFrame(1, true), kDrawn);
    EXPECT_EQ(scene.Tree(), kBusyTrees[1]);
    EXPECT_EQ(scene.list.FindChild(&scene.list.root, 17), scene.movie.rootObject);
    EXPECT_EQ(scene.movie.rootObject->thread, &scene.movie);
    ScriptPlayer alone;
    Push(alone, BusyMovie().Bytes());
    EXPECT_EQ(alone.DrawFrame(0, true), kDrawFailed);
}

TEST(Place, TagsCarryTheirParts)
{
    MovieWriter writer = Start();
    const Mat mat{0x20000, 5, 6, 0x8000, -70, 80};
    const Cx both{{1, 2, -3, 256}, {-1, 4, 5, 0}};
    writer.Place(1, 1, mat, both).Place(1, 2, mat).Raw(1003, std::vector<U8>()).Place(99, 3);
    writer.Place2(4, {.character = 1, .matrix = mat, .cx = Cx::Multiply(1, 2, 3, 4), .ratio = 777});
    writer.Place2(5, {.character = 99, .matrix = mat}).Place2(6, {.matrix = mat});
    writer.Place2(7, {.character = 1, .clipDepth = 9}).Place2(8, {.character = 9});
    writer.Place2(4, {.move = true, .ratio = 778}).Place(0xFFFE, 20).FreeCharacter(kIdMovieRoot);
    // After a name the clip depth is read from the name itself.
    writer.Place2(9, {.character = 1, .name = "ab", .clipDepth = 5});
    writer.Place2(10, {.character = 1, .name = "", .clipDepth = 0x1234});
    writer.Background({10, 20, 30}).Background({1, 2, 3}).Show().End();
    StreamScene scene(writer);
    scene.Tick();
    EXPECT_EQ(scene.Tree(), "1:1@-70 2:1@-70 4:1@-70 7:1 8:9(1:1) 9:1 10:1")
        << "unknown characters and reserved ones are not placed";
    EXPECT_NE(scene.movie.FindCharacter(kIdMovieRoot), nullptr);
    EXPECT_TRUE(Same(scene.At(2)->xform.mat, MATRIX{0x20000, 5, 6, 0x8000, -70, 80}));
    const ColorTransform &added = scene.At(1)->xform.cxform, &times = scene.At(4)->xform.cxform;
    EXPECT_TRUE(added.flags == 3 && added.redMul == 1 && added.blueMul == -3);
    EXPECT_TRUE(added.redAdd == -1 && added.blueAdd == 5 && added.alphaMul == 256);
    EXPECT_TRUE(times.flags == 1 && times.redMul == 1 && times.alphaMul == 4 && times.redAdd == 0);
    EXPECT_EQ(scene.At(2)->xform.cxform.flags, 0u);
    EXPECT_EQ(scene.At(4)->ratio, 778);
    EXPECT_EQ(scene.At(7)->clipDepth, 9);
    EXPECT_STREQ(scene.At(8)->name, "instance1");
    EXPECT_STREQ(scene.At(9)->name, "ab");
    EXPECT_EQ(scene.At(9)->clipDepth, 0x6261);
    EXPECT_EQ(scene.At(10)->clipDepth, 0x3400) << "the zero, then the first byte of what follows";
    EXPECT_EQ(scene.list.backgroundColor, (SRGB{10, 20, 30, 255}));
}

// Sprite 9 called "a" at depth 3, with a transform and a clip depth, after its first tick.
struct NamedSprite : StreamScene {
    NamedSprite() : StreamScene(Writer())
    {
        Tick();
        At(3)->clipDepth = 4;
    }
    static MovieWriter Writer()
    {
        MovieWriter writer = Start();
        PlaceOptions options = {.character = 9, .matrix = X(50), .cx = Cx::Add(1, 2, 3, 4)};
        options.ratio = 5;
        options.name = "a";
        writer.Place2(3, options).Show(2).End();
        return writer;
    }
    void ExpectCopy(U16 depth, const char* name, U32 ratio)
    {
        const SObject* copy = At(depth);
        ASSERT_NE(copy, nullptr);
        EXPECT_STREQ(copy->name, name);
        EXPECT_TRUE(copy->ratio == ratio && copy->clipDepth == 4);
        EXPECT_EQ(copy->xform.cxform.alphaAdd, 4);
    }
};

TEST(Clone, CopiesThePlacementButTheName)
{
    NamedSprite scene;
    scene.movie.CloneSprite(scene.At(3)->thread, "b", 0x10000 + 16390);
    scene.ExpectCopy(16390, "b", 0xFFFF); // the depth has 16 bits
    scene.movie.CloneSprite(scene.At(3)->thread, nullptr, 16390);
    scene.Tick();
    EXPECT_EQ(scene.Tree(), "3:9@50(1:1@1) 16390:9@50(1:1@1)") << "each runs on its own";
    scene.movie.Seek(0);
    scene.ExpectCopy(16390, "instance1", 0xFFFF); // what stood there is gone; it outlives the seek
    EXPECT_EQ(scene.Tree(), "3:9@50(1:1@1) 16390:9@50(1:1@1)") << "only placements go back";
    NamedSprite alone;
    alone.movie.FreeCharacter(U16(9)); // only the source itself still holds the character
    alone.movie.CloneSprite(alone.At(3)->thread, alone.At(3)->name, 3);
    alone.ExpectCopy(3, "a", 0xFFFF);
    scene.movie.CloneSprite(nullptr, "c", 1);
}

TEST(Clone, RemovedSpritesCanLeaveAnEmptyOne)
{
    NamedSprite scene;
    const SRECT bounds = scene.At(3)->character->bounds;
    ScriptThread* self = scene.At(3)->thread;
    self->RemoveSprite(self, true); // asked of the sprite's own timeline
    scene.movie.RemoveSprite(scene.At(3)->thread, true);
    scene.ExpectCopy(3, "a", 5);
    scene.Tick();
    EXPECT_EQ(scene.Tree(), "3:65532@50");
    EXPECT_TRUE(Same(scene.At(3)->character->bounds, bounds));
    EXPECT_EQ(scene.At(3)->thread->curFrame, -1) << "it has no frames to run";
    EXPECT_EQ(scene.movie.FindCharacter(0xFFFC), nullptr);
    scene.movie.RemoveSprite(scene.At(3)->thread, false);
    EXPECT_EQ(scene.Tree(), "");
    EXPECT_EQ(scene.list.threads, &scene.movie) << "the timeline went with its object";
    scene.movie.RemoveSprite(nullptr, true);
}

// What others show of a movie's characters is empty once the movie is gone.
TEST(Clone, NothingShowsTheCharactersOfAMovieThatIsGone)
{
    NamedSprite scene;
    {
        ScriptPlayer other;
        other.display = &scene.list;
        other.layerDepth = 2;
        scene.list.AddThread(&other);
        Push(other, NamedSprite::Writer().Bytes());
        other.DrawFrame(0, true);
        scene.movie.CloneSprite(scene.list.FindChild(other.rootObject, 3)->thread, "x", 20000);
        EXPECT_EQ(scene.Tree(), "3:9@50(1:1) 20000:9@50(1:1)");
    }
    EXPECT_EQ(scene.Tree(), "3:9@50(1:1) 20000:0@50(1:0)");
    scene.Tick();
    EXPECT_EQ(scene.movie.curFrame, 1);
}

} // namespace
