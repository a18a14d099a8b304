#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

namespace {

// Shape 1, and sprite 2 with the shape at depth 1 and two frames.
MovieWriter Start()
{
    MovieWriter movie(4000, 4000);
    ShapeBuilder shape;
    shape.Styles(0, shape.AddFill(Rgba{0, 0, 255, 255})).Rect(0, 0, 200, 200);
    TagWriter sprite;
    sprite.Place(1, 1).Show(2).End();
    movie.DefineShape(1, shape).DefineSprite(2, sprite);
    return movie;
}

TEST(Place, TagsCarryTheirParts)
{
    MovieWriter writer = Start();
    const Mat mat{0x20000, 5, 6, 0x8000, -70, 80};
    writer.Place(1, 1, mat, Cx::Add(1, 2, 3)).Place(1, 2, mat).Place(99, 3);
    writer.Place2(4, {.character = 1, .matrix = mat, .cx = Cx::Multiply(1, 2, 3, 4), .ratio = 777});
    writer.Place2(5, {.character = 99, .matrix = mat}).Place2(6, {.matrix = mat});
    writer.Place2(7, {.character = 1, .clipDepth = 9}).Place2(8, {.character = 2});
    writer.Place2(4, {.move = true, .ratio = 778}).Place(0xFFFE, 20);
    writer.Background({10, 20, 30}).Background({1, 2, 3}).Show().End();
    StreamScene scene(writer);
    scene.Tick();
    EXPECT_EQ(scene.Tree(), "1:1@-70 2:1@-70 4:1@-70 7:1 8:2(1:1)")
        << "unknown characters and reserved ones are not placed";
    EXPECT_TRUE(Same(scene.At(2)->xform.mat, MATRIX{0x20000, 5, 6, 0x8000, -70, 80}));
    EXPECT_EQ(scene.At(1)->xform.cxform.blueAdd, 3);
    EXPECT_EQ(scene.At(2)->xform.cxform.flags, 0u);
    EXPECT_EQ(scene.At(4)->xform.cxform.alphaMul, 4);
    EXPECT_EQ(scene.At(4)->ratio, 778);
    EXPECT_EQ(scene.At(7)->clipDepth, 9);
    EXPECT_EQ(scene.At(1)->name, nullptr);
    EXPECT_STREQ(scene.At(8)->name, "instance1");
    EXPECT_EQ(scene.list.backgroundColor, (SRGB{10, 20, 30, 255}));
}

TEST(Place, AClipDepthAfterANameIsReadFromTheName)
{
    MovieWriter writer = Start();
    writer.Place2(1, {.character = 1, .name = "ab", .clipDepth = 5});
    writer.Place2(2, {.character = 1, .name = "", .clipDepth = 0x1234});
    writer.Place2(3, {.character = 1, .name = "mask"}).Show().End();
    StreamScene scene(writer);
    scene.Tick();
    EXPECT_STREQ(scene.At(1)->name, "ab");
    EXPECT_EQ(scene.At(1)->clipDepth, 0x6261);
    EXPECT_EQ(scene.At(2)->clipDepth, 0x3400) << "the zero, then the first byte of what follows";
    EXPECT_EQ(scene.At(3)->clipDepth, 0);
}

TEST(Place, CharactersFreedWhileShownStayOnScreen)
{
    MovieWriter writer = Start();
    writer.Place(2, 1).FreeCharacter(2).FreeCharacter(1).Place(2, 2).Show().Show().End();
    StreamScene scene(writer);
    scene.Tick();
    scene.Tick();
    EXPECT_EQ(scene.Tree(), "1:2(1:1)");
    EXPECT_EQ(scene.movie.FindCharacter(1), nullptr);
    for (int i = 0; i < 7; i++)
        scene.Tick();
    EXPECT_EQ(scene.Tree(), "1:2") << "looping, the sprite finds its shape no more";
    scene.movie.ClearScript();
    scene.movie.FreeCache();
    EXPECT_EQ(scene.movie.charAlloc.BlockCount(), 0u);
}

// Sprite 2 called "a" at depth 3, with a transform.
MovieWriter NamedSprite()
{
    MovieWriter writer = Start();
    writer.Place2(3, {.character = 2,
                      .matrix = Mat::Translate(50, 60),
                      .cx = Cx::Add(1, 2, 3, 4),
                      .ratio = 5,
                      .name = "a"});
    writer.Show(2).End();
    return writer;
}

TEST(Clone, CopiesThePlacementButTheName)
{
    StreamScene scene(NamedSprite());
    scene.Tick();
    scene.At(3)->clipDepth = 4;
    scene.movie.CloneSprite(scene.At(3)->thread, "b", 0x10000 + 16390);
    const SObject* clone = scene.At(16390);
    ASSERT_NE(clone, nullptr) << "the depth has 16 bits";
    EXPECT_EQ(scene.Tree(), "3:2@50(1:1) 16390:2@50(1:1)");
    EXPECT_STREQ(clone->name, "b");
    EXPECT_EQ(clone->ratio, 0xFFFF);
    EXPECT_EQ(clone->clipDepth, 4);
    EXPECT_EQ(clone->xform.cxform.redAdd, 1);
    scene.movie.CloneSprite(scene.At(3)->thread, nullptr, 16390);
    EXPECT_STREQ(scene.At(16390)->name, "instance1");
    EXPECT_EQ(scene.Tree(), "3:2@50(1:1) 16390:2@50(1:1)") << "what stood there is gone";
    scene.movie.Seek(0);
    EXPECT_NE(scene.At(16390), nullptr) << "clones outlive seeks";
    scene.movie.CloneSprite(nullptr, "c", 1);
}

TEST(Clone, MayReplaceItsOwnSource)
{
    StreamScene scene(NamedSprite());
    scene.Tick();
    scene.movie.FreeCharacter(U16(2)); // only the source itself still holds the character
    SObject* source = scene.At(3);
    scene.movie.CloneSprite(source->thread, source->name, 3);
    EXPECT_EQ(scene.Tree(), "3:2@50(1:1)");
    EXPECT_STREQ(scene.At(3)->name, "a");
    EXPECT_EQ(scene.At(3)->ratio, 0xFFFF);
}

TEST(Clone, RemovedSpritesCanLeaveAnEmptyOne)
{
    StreamScene scene(NamedSprite());
    scene.Tick();
    scene.At(3)->clipDepth = 9;
    const SRECT bounds = scene.At(3)->character->bounds;
    scene.movie.RemoveSprite(scene.At(3)->thread, true);
    EXPECT_EQ(scene.Tree(), "3:65532@50");
    const SObject* empty = scene.At(3);
    EXPECT_EQ(empty->character->type, kCharSprite);
    EXPECT_TRUE(Same(empty->character->bounds, bounds));
    EXPECT_EQ(scene.movie.FindCharacter(0xFFFC), nullptr);
    EXPECT_STREQ(empty->name, "a");
    EXPECT_EQ(empty->ratio, 5);
    EXPECT_EQ(empty->clipDepth, 9);
    EXPECT_EQ(empty->xform.cxform.alphaAdd, 4);
    ASSERT_NE(empty->thread, nullptr);
    scene.Tick();
    EXPECT_EQ(empty->thread->curFrame, -1) << "it has no frames to run";
    // Once more, asked of the sprite's own timeline.
    empty->thread->RemoveSprite(empty->thread, true);
    EXPECT_EQ(scene.Tree(), "3:65532@50");
    scene.movie.RemoveSprite(scene.At(3)->thread, false);
    EXPECT_EQ(scene.Tree(), "");
    scene.movie.RemoveSprite(nullptr, true);
}

// What others show of a movie's characters is empty once the movie is gone.
TEST(Clone, NothingShowsTheCharactersOfAMovieThatIsGone)
{
    StreamScene scene(NamedSprite());
    scene.Tick();
    {
        ScriptPlayer other;
        other.display = &scene.list;
        other.layerDepth = 2;
        scene.list.AddThread(&other);
        Push(other, NamedSprite().Bytes());
        other.DrawFrame(0, true);
        scene.movie.CloneSprite(scene.list.FindChild(other.rootObject, 3)->thread, "x", 20000);
        EXPECT_EQ(scene.Tree(), "3:2@50(1:1) 20000:2@50(1:1)");
    }
    EXPECT_EQ(scene.Tree(), "3:2@50(1:1) 20000:0@50(1:0)") << "empty";
    scene.Tick();
    EXPECT_EQ(scene.movie.curFrame, 1);
}

} // namespace
