// Placing, moving and removing.
#include "core/player/limits.h"
#include "tests/display/scene.h"

namespace {

TEST(Place, RefusesRecursionAndCrowds)
{
    // 20 and 21 place each other; from 100 on each holds the one before it.
    Cast movie;
    movie.DefineSprite(20, TagWriter().Place(21, 1).Show().End());
    movie.DefineSprite(21, TagWriter().Place(20, 1).Place(1, 2).Show().End());
    for (U16 id = 100; id < 300; id++)
        movie.DefineSprite(id, TagWriter().Place(id == 100 ? 1 : id - 1, 1).Show().End());
    Scene s(movie);
    EXPECT_EQ(s.Place(1, 20)->bottomChild->bottomChild->depth, 2);
    int levels = 0;
    for (const SObject* o = s.Place(3, 299); o; o = o->bottomChild)
        levels++;
    EXPECT_EQ(levels, gLimits.nesting - s.Root()->nesting);
    EXPECT_EQ(s.Place(9, 999), nullptr);

    const SLimits saved = gLimits;
    gLimits.liveObjects = 600;
    s.list.ResetBudget();
    int placed = 0;
    for (U16 depth = 10; depth < 1000; depth++)
        placed += s.Place(depth, 1) != nullptr;
    EXPECT_NEAR(placed, 600 - levels, 20); // whole blocks of the pool
    gLimits = saved;
}

// Sprites and buttons keep their type; the rest of a move holds in any case. Character 0 stands
// for a movie's root.
TEST(Move, ChangesWhatTheFlagsSay)
{
    const struct {
        U16 old, fresh;
        bool replaced;
    } cases[] = {{1, 2, true},   {1, 10, false},  {10, 1, false}, {10, 11, true},
                 {30, 1, false}, {30, 10, false}, {1, 30, false}, {0, 1, false}};
    Scene s((Cast()));
    for (const auto& c : cases) {
        SObject* obj = c.old == 0 ? s.Root() : s.Place(5, c.old, {}, 9);
        const SCharacter* old = obj->character;
        PlaceInfo move = s.Info(obj->depth, c.fresh, AtPixel(1, 0), 77);
        EXPECT_EQ(s.list.MoveObject(obj->parent, &move), obj);
        EXPECT_EQ(obj->character, c.replaced ? move.character : old) << c.old << " " << c.fresh;
        EXPECT_EQ(obj->xform.mat.tx, 20);
        EXPECT_EQ(obj->clipDepth, c.old == 0 ? 0 : 9);
        obj->puppet = 1;
        EXPECT_EQ(s.list.MoveObject(obj->parent, &move), nullptr);
        s.list.RemoveObject(s.Root(), 5);
    }
    EXPECT_EQ(s.player.FindCharacter(1)->users, 0u);
}

// A movie in a sprite's place, and clones of it that play the same bytes.
TEST(Place, LoadedMovies)
{
    Scene s((Cast()));
    Cast film;
    film.Place(3, 1).Show().End();
    const std::vector<U8> bytes = film.Bytes();
    auto* movie = new ScriptPlayer;
    movie->splayer = &s.player;
    movie->display = &s.list;
    movie->PushDataBuf(bytes.data(), S32(bytes.size()) - 4); // without its last two tags
    PlaceInfo info = s.Info(5, 1);
    info.character = s.player.NewPrivateCharacter();
    info.character->type = kCharLoadedMovie;
    info.character->player = movie;
    ASSERT_EQ(s.list.PlaceObject(s.Root(), &info)->thread, movie);
    EXPECT_EQ(movie->layerDepth, 5);
    EXPECT_EQ(s.list.PlaceObject(s.Root(), &info)->thread, nullptr); // shown already
    s.list.RemoveThisObject(s.At(5));
    s.player.CloneSprite(movie, "early", 4); // not all of the source is there
    EXPECT_EQ(s.At(4)->thread, nullptr);
    movie->PushDataBuf(bytes.data() + bytes.size() - 4, 4);
    s.player.CloneSprite(movie, "late", 6);
    s.list.RemoveObject(s.Root(), 5); // the source goes, the bytes stay
    s.player.CloneSprite(s.At(6)->thread, "again", 7);
    s.list.RemoveObject(s.Root(), 6);
    EXPECT_EQ(s.Shown().At(50, 50), kBlue);
}

} // namespace
