// What survives a seek back: every case is a movie whose frame 0 shows the new scene and whose
// frame 1 the old one.
#include <cstring>

#include "tests/display/scene.h"

namespace {

PlaceOptions Put(U16 id, S32 x = 0, U16 ratio = 0, U16 clipDepth = 0, double opacity = 1)
{
    return {false, id, AtPixel(x, 0), Cx::Alpha(opacity), ratio, {}, clipDepth};
}

// Neighbours below and above the depth in question stay in any case. What is not to be placed has
// no options.
Cast SeekMovie(U16 depth, const PlaceOptions& old, const PlaceOptions& fresh)
{
    Cast m;
    m.Place(1, 1).Place(2, 6, AtPixel(20, 20)).Place(1, 20000).Place2(depth, fresh);
    m.Show().RemoveDepth(depth).Place2(depth, old);
    return m;
}

TEST(Hold, Table)
{
    const struct {
        const char* what;
        U16 depth;
        PlaceOptions old, fresh;
        bool keepsOld;
        S32 x; // of the one that stays, pixels; -1: none stays
        bool puppet = false;
    } cases[] = {
        {"same shape", 5, Put(1, 7), Put(1, 7), true, 7},
        {"moved shape", 5, Put(1, 7), Put(1, 8), false, 8},
        {"dimmed shape", 5, Put(1), Put(1, 0, 0, 0, 0.5), false, 0},
        {"another ratio", 5, Put(1, 0, 3), Put(1, 0, 4), false, 0},
        {"another clip depth", 5, Put(1, 0, 0, 9), Put(1, 0, 0, 8), false, 0},
        {"a mask goes", 5, Put(1, 0, 0, 9), {}, false, -1},
        {"a mask comes", 5, {}, Put(1, 0, 0, 9), false, 0},
        {"same sprite", 5, Put(10, 7), Put(10, 7), true, 7},
        {"moved sprite", 5, Put(10, 7), Put(10, 8), true, 8},
        {"dimmed sprite", 5, Put(10), Put(10, 0, 0, 0, 0.5), true, 0},
        {"moved puppet", 5, Put(10, 7), Put(10, 8), true, 7, true},
        {"another sprite, another clip depth", 5, Put(10, 7, 0, 9), Put(11, 8), true, 8},
        {"sprite, another ratio", 5, Put(10, 7, 1), Put(10, 7), false, 7},
        {"sprite for shape", 5, Put(1), Put(10), false, 0},
        {"only before, highest of the timeline", 16383, Put(10), {}, false, -1},
        {"only before, made by a script", 16384, Put(10, 3), {}, true, 3},
        {"script's depth taken", 16384, Put(10, 0, 65535), Put(10, 4), false, 4},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        Scene s(SeekMovie(c.depth, c.old, c.fresh), 60, false, 1);
        const auto serial = [&s](U16 depth) { return s.At(depth) ? s.At(depth)->serial : 0; };
        const U32 before[] = {serial(c.depth), serial(1), serial(6), serial(20000)};
        if (c.old.character == 10) {
            s.At(c.depth)->puppet = c.puppet;
            s.At(c.depth)->thread->DoFrame(1, false);
        }
        s.player.Seek(0);
        const SObject* stays = s.At(c.depth);
        ASSERT_EQ(stays ? stays->xform.mat.tx : -20, c.x * 20);
        EXPECT_EQ(stays && serial(c.depth) == before[0], c.keepsOld);
        EXPECT_TRUE(serial(1) == before[1] && serial(6) == before[2] && serial(20000) == before[3]);
        if (stays && stays->OwnsThread()) { // a kept timeline stands where it was
            EXPECT_EQ(stays->thread->curFrame, c.keepsOld ? 1 : 0);
        }
        s.list.CalcUpdate(); // what is the same is not repainted
        EXPECT_TRUE(c.what != strstr(c.what, "same") || s.list.nDirty == 0);
        const Picture partial = s.Shown();
        EXPECT_EQ("", ExpectSame(partial, s.Repainted(), "hold"));
    }
}

TEST(Hold, TheTrackedButtonGoesOn)
{
    for (const bool moved : {false, true}) { // and is made anew
        Scene s(SeekMovie(5, Put(30, moved), Put(30)), 60, false, 1);
        const U32 serial = s.At(5)->serial;
        s.list.button = s.At(5);
        s.list.buttonIdentity = {s.Root(), s.Root()->serial, s.At(5)->character, 5, 0};
        s.list.buttonState = 4;
        s.player.Seek(0);
        EXPECT_EQ(s.list.button, s.At(5));
        EXPECT_EQ(s.At(5)->serial == serial, !moved);
        EXPECT_EQ(s.At(5)->state, moved ? 4 : 1);
        s.list.RemoveObject(s.Root(), 5);
        EXPECT_EQ(s.list.button, nullptr);
    }
}

TEST(Hold, EndsWithWhatIsHeld)
{
    Scene s((Cast()));
    s.list.BeginHold(s.Place(5, 12));
    s.list.RemoveObject(s.Root(), 5);
    EXPECT_EQ(s.list.holdParent, nullptr);
    EXPECT_EQ(s.list.threads, &s.player);
    SObject* child = s.Place(5, 12)->bottomChild;
    s.list.BeginHold(child->parent);
    s.list.RemoveThisObject(child);
    EXPECT_EQ(s.list.holdList, nullptr);
    s.list.BeginHold(s.Root()); // the open hold is finished first
    s.list.FinishHold();
    EXPECT_EQ(s.Root()->bottomChild, nullptr);
    s.Place(5, 12);
    s.list.BeginHold(s.Root()); // and a player may end with one open
}

} // namespace
