// Placing, moving and removing.
#include "core/player/limits.h"
#include "core/stream/str.h"
#include "tests/display/scene.h"

namespace {

std::string Order(const SObject* parent)
{
    std::string text;
    for (const SObject* o = parent->bottomChild; o; o = o->above)
        text += std::to_string(o->depth) + ":" + std::to_string(o->character->tag) + " ";
    return text;
}

TEST(Place, OrderByDepthWithLaterOnesBelow)
{
    Scene s(Cast(), 100, 100);
    s.Place(30, 1);
    s.Place(10, 2);
    s.Place(20, 3);
    s.Place(20, 1);
    s.Place(65535, 2);
    EXPECT_EQ(Order(s.Root()), "10:2 20:1 20:3 30:1 65535:2 ");
    s.Remove(20);
    s.Remove(25);
    EXPECT_EQ(Order(s.Root()), "10:2 20:3 30:1 65535:2 ");
    EXPECT_EQ(s.At(25), nullptr);
    s.list.RemoveThisObject(s.At(30));
    s.list.RemoveThisObject(nullptr);
    EXPECT_EQ(Order(s.Root()), "10:2 20:3 65535:2 ");
}

TEST(Place, InstanceNames)
{
    Scene s(Cast(), 100, 100);
    EXPECT_STREQ(s.Place(1, 12)->name, "instance1"); // its child takes the second number
    EXPECT_EQ(s.Place(2, 1)->name, nullptr);
    PlaceInfo info = s.Info(3, 10);
    info.name = "ship";
    EXPECT_STREQ(s.list.PlaceObject(s.Root(), &info)->name, "ship");
    s.Remove(1);
    EXPECT_STREQ(s.Place(4, 10)->name, "instance3");
    info = s.Info(5, 1);
    info.name = "";
    EXPECT_STREQ(s.list.PlaceObject(s.Root(), &info)->name, "");
}

TEST(Place, ASpriteShowsItsFirstFrameAtOnce)
{
    Scene s(Cast(), 100, 100);
    SObject* outer = s.Place(7, 12);
    EXPECT_TRUE(outer->OwnsThread());
    EXPECT_EQ(outer->thread->layerDepth, 7);
    EXPECT_EQ(s.list.threads->rootObject, outer->bottomChild); // the newest thread is the inner one
    SObject* shape = outer->bottomChild->bottomChild;
    ASSERT_NE(shape, nullptr);
    EXPECT_EQ(shape->thread, outer->bottomChild->thread);
    EXPECT_FALSE(shape->OwnsThread());
    EXPECT_EQ(shape->nesting, outer->nesting + 2);

    s.list.threadCursor = outer->thread; // as if the tick stood there
    s.Remove(7);
    EXPECT_EQ(s.list.threads, &s.player);
    EXPECT_EQ(s.list.threadCursor, &s.player);
    EXPECT_EQ(s.player.nextThread, nullptr);
}

TEST(Place, RefusesRecursionAndCrowds)
{
    // 20 places itself; 21 and 22 place each other.
    MovieWriter movie = Cast();
    movie.DefineSprite(20, TagWriter().Place(20, 1).Place(1, 2).Show().End());
    movie.DefineSprite(21, TagWriter().Place(22, 1).Show().End());
    movie.DefineSprite(22, TagWriter().Place(21, 1).Place(2, 2).Show().End());
    for (U16 id = 100; id < 300; id++) // each holds the one before it
        movie.DefineSprite(id, TagWriter().Place(id == 100 ? 1 : id - 1, 1).Show().End());
    movie.Show();
    Scene s(movie, 100, 100);
    s.player.Seek(1);

    EXPECT_EQ(Order(s.Place(1, 20)), "2:1 ");
    EXPECT_EQ(Order(s.Place(2, 21)->bottomChild), "2:2 ");
    int levels = 0;
    for (SObject* o = s.Place(3, 299); o; o = o->bottomChild)
        levels++;
    EXPECT_EQ(levels, gLimits.nesting - s.Root()->nesting);
    EXPECT_NE(s.Hit(5, 5), nullptr);
    EXPECT_EQ(s.list.PlaceObject(s.Root(), std::vector{s.Info(9, 999)}.data()), nullptr);

    const SLimits saved = gLimits;
    gLimits.liveObjects = 600;
    s.list.ResetBudget();
    int placed = 0;
    for (U16 depth = 10; depth < 1000; depth++)
        placed += s.Place(depth, 1) != nullptr;
    EXPECT_GT(placed, 300);
    EXPECT_LT(placed, 608);
    s.Shown();
    gLimits = saved;
}

TEST(Move, ChangesWhatTheFlagsSay)
{
    Scene s(Cast(), 100, 100);
    PlaceInfo info = s.Info(5, 1, AtPixel(10, 10), 9);
    info.name = "first";
    SObject* obj = s.list.PlaceObject(s.Root(), &info);
    PlaceInfo move = s.Info(5, 2, AtPixel(50, 50), 77);
    move.flags = PlaceInfo::kMove | PlaceInfo::kRatio;
    move.ratio = 42;
    move.name = "second";
    EXPECT_EQ(s.list.MoveObject(s.Root(), &move), obj);
    EXPECT_EQ(obj->character->tag, 1);
    EXPECT_EQ(obj->xform.mat.tx, 200);
    EXPECT_EQ(obj->ratio, 42);
    EXPECT_EQ(obj->clipDepth, 9);
    EXPECT_STREQ(obj->name, "first");
    EXPECT_TRUE(obj->dirty);

    move.flags = PlaceInfo::kMove | PlaceInfo::kCharacter | PlaceInfo::kMatrix;
    s.list.MoveObject(s.Root(), &move);
    EXPECT_EQ(obj->character->tag, 2);
    EXPECT_EQ(obj->xform.mat.tx, 1000);
    EXPECT_EQ(s.player.FindCharacter(1)->users, 0u);

    move.depth = 6;
    EXPECT_EQ(s.list.MoveObject(s.Root(), &move), nullptr);
    obj->puppet = 1;
    move.depth = 5;
    move.mat.tx = 0;
    EXPECT_EQ(s.list.MoveObject(s.Root(), &move), nullptr);
    EXPECT_EQ(obj->xform.mat.tx, 1000);
}

TEST(Move, SpritesAndButtonsKeepTheirType)
{
    MovieWriter movie = Cast();
    movie.Raw(7, {30, 0, 0}); // a button without records
    movie.Show();
    Scene s(movie, 100, 100);
    s.player.Seek(1);
    struct Case {
        U16 old, fresh;
        bool replaced;
    };
    const Case cases[] = {{1, 2, true},   {1, 10, false},  {10, 1, false}, {10, 11, true},
                          {30, 1, false}, {30, 10, false}, {1, 30, false}};
    for (const Case& c : cases) {
        SObject* obj = s.Place(5, c.old);
        PlaceInfo move = s.Info(5, c.fresh, AtPixel(1, 0));
        move.flags |= PlaceInfo::kMove;
        EXPECT_EQ(s.list.MoveObject(s.Root(), &move), obj);
        EXPECT_EQ(obj->character->tag, c.replaced ? c.fresh : c.old) << c.old << " to " << c.fresh;
        EXPECT_EQ(obj->xform.mat.tx, 20); // the rest of the move holds in any case
        s.Remove(5);
    }
    // Nor does a movie's root change.
    PlaceInfo move = s.Info(0, 1);
    s.list.MoveObject(&s.list.root, &move);
    EXPECT_EQ(s.Root()->character->type, kCharMovieRoot);
}

TEST(Place, ACharacterOutlivesItsDictionaryEntry)
{
    Scene s(Cast(), 100, 100);
    s.Place(5, 1, AtPixel(0, 0));
    s.Place(6, 10, AtPixel(40, 0));
    s.player.FreeCharacter(1);
    s.player.FreeCharacter(10);
    EXPECT_EQ(s.Pixel(5, 5), kRedPixel);
    EXPECT_EQ(s.Pixel(45, 5), kRedPixel);
    s.Remove(5);
    s.Remove(6);
    EXPECT_EQ(s.Pixel(5, 5), kWhitePixel);
    EXPECT_EQ(s.Pixel(45, 5), kWhitePixel);
}

TEST(Place, APrivateCopyDiesWithItsObject)
{
    Scene s(Cast(), 100, 100);
    SCharacter* own = s.player.NewPrivateCharacter();
    own->type = kCharSprite;
    PlaceInfo info = s.Info(5, 1);
    info.character = own;
    SObject* obj = s.list.PlaceObject(s.Root(), &info);
    obj->dropTarget = CreateStr("/a");
    EXPECT_TRUE(obj->OwnsThread());
    s.Place(6, 1);
    s.player.ClearScript(); // the leak checker watches the rest
    EXPECT_EQ(s.Root(), nullptr);
    EXPECT_EQ(s.list.root.bottomChild, nullptr);
}

// A movie in a sprite's place, and a clone of it that plays the same bytes.
TEST(Place, LoadedMovies)
{
    Scene s(Cast(), 100, 100);
    MovieWriter inner(100 * 20, 100 * 20);
    inner.DefineShape(1, Square(kBlue, 20)).Place(1, 1, AtPixel(0, 40)).Show().End();
    const std::vector<U8> bytes = inner.Bytes();
    auto* movie = new ScriptPlayer;
    movie->splayer = &s.player;
    movie->display = &s.list;
    movie->PushDataBuf(bytes.data(), S32(bytes.size()) - 4); // without its last two tags

    SCharacter* record = s.player.NewPrivateCharacter();
    record->type = kCharLoadedMovie;
    record->player = movie;
    PlaceInfo info = s.Info(5, 1);
    info.character = record;
    ASSERT_EQ(s.list.PlaceObject(s.Root(), &info)->thread, movie);
    EXPECT_EQ(s.Pixel(5, 45), kBluePixel);
    EXPECT_EQ(s.list.PlaceObject(s.Root(), &info)->thread, nullptr); // shown already
    s.list.RemoveThisObject(s.At(5));

    s.player.CloneSprite(movie, "early", 6);
    EXPECT_EQ(s.At(6)->thread, nullptr); // not all of the source is there
    movie->PushDataBuf(bytes.data() + bytes.size() - 4, 4);
    s.player.CloneSprite(movie, "late", 6);
    auto* clone = static_cast<ScriptPlayer*>(s.At(6)->thread);
    ASSERT_NE(clone, nullptr);
    EXPECT_EQ(*movie->sharedScript, 2);
    EXPECT_EQ(clone->numFrames, 1);
    EXPECT_NE(clone->FindCharacter(1), movie->FindCharacter(1));

    s.Remove(5); // the source goes, the bytes stay
    s.Move(6, AtPixel(30, 0));
    EXPECT_EQ(s.Pixel(5, 45), kWhitePixel);
    EXPECT_EQ(s.Pixel(35, 45), kBluePixel);
    s.player.CloneSprite(clone, "again", 7);
    s.Remove(6);
    s.Move(7, AtPixel(60, 0));
    EXPECT_EQ(s.Pixel(65, 45), kBluePixel);
}

} // namespace
