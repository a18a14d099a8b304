// What survives a seek back: every case is a movie whose frame 0 shows the new scene and whose
// frame 1 the old one.
#include "core/stream/str.h"
#include "tests/display/scene.h"

namespace {

struct Old {
    U16 depth = 5;
    PlaceOptions place = {};
    bool none = false;
    bool puppet = false;
};

struct Case {
    const char* what;
    Old old;
    std::optional<PlaceOptions> fresh;
    bool keepsOld;
    S32 x; // of the one that stays, pixels; -1: none stays
};

PlaceOptions Put(U16 id, S32 x = 0, std::optional<U16> ratio = {}, std::optional<U16> clip = {})
{
    PlaceOptions o;
    o.character = id;
    o.matrix = AtPixel(x, 0);
    o.ratio = ratio;
    o.clipDepth = clip;
    return o;
}

PlaceOptions Dimmed(U16 id)
{
    PlaceOptions o = Put(id);
    o.cx = Cx::Alpha(0.5);
    return o;
}

MovieWriter CaseMovie(const Case& c)
{
    MovieWriter m(100 * 20, 100 * 20);
    m.DefineShape(1, Square(kRed, 20)).DefineShape(2, Square(kGreen, 20));
    m.DefineSprite(10, TagWriter().Place(1, 5).Show(3).End());
    m.DefineSprite(11, TagWriter().Place(2, 5).Show(3).End());
    m.Place(1, 1).Place(1, 20000);
    if (c.fresh)
        m.Place2(c.old.depth, *c.fresh);
    m.Show();
    if (c.fresh)
        m.RemoveDepth(c.old.depth);
    if (!c.old.none)
        m.Place2(c.old.depth, c.old.place);
    m.Show().End();
    return m;
}

TEST(Hold, Table)
{
    const Case cases[] = {
        {"same shape", {5, Put(1, 7)}, Put(1, 7), true, 7},
        {"moved shape", {5, Put(1, 7)}, Put(1, 8), false, 8},
        {"dimmed shape", {5, Put(1)}, Dimmed(1), false, 0},
        {"another shape", {5, Put(2)}, Put(1), false, 0},
        {"another ratio", {5, Put(1, 0, 3)}, Put(1, 0, 4), false, 0},
        {"another clip depth", {5, Put(1, 0, {}, 9)}, Put(1, 0, {}, 8), false, 0},
        {"same sprite", {5, Put(10, 7)}, Put(10, 7), true, 7},
        {"moved sprite", {5, Put(10, 7)}, Put(10, 8), true, 8},
        {"dimmed sprite", {5, Put(10)}, Dimmed(10), true, 0},
        {"moved puppet", {5, Put(10, 7), false, true}, Put(10, 8), true, 7},
        {"another sprite", {5, Put(10, 7)}, Put(11, 8), true, 8},
        {"another sprite, another clip depth", {5, Put(10, 7, {}, 9)}, Put(11, 8), true, 8},
        {"sprite, another ratio", {5, Put(10, 7, 1)}, Put(10, 7), false, 7},
        {"sprite for shape", {5, Put(1)}, Put(10), false, 0},
        {"shape for sprite", {5, Put(10)}, Put(1), false, 0},
        {"only before", {5, Put(10)}, {}, false, -1},
        {"only before, highest of the timeline", {16383, Put(10)}, {}, false, -1},
        {"only before, made by a script", {16384, Put(10, 3)}, {}, true, 3},
        {"script's depth taken", {16384, Put(10, 0, 65535)}, Put(10, 4), false, 4},
        {"only after", {5, {}, true}, Put(10, 6), false, 6},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        Scene s(CaseMovie(c), 100, 100);
        s.player.Seek(1);
        s.Shown();
        SObject* old = s.At(c.old.depth);
        const U32 serial = old ? old->serial : 0;
        const U32 lowest = s.At(1)->serial, highest = s.At(20000)->serial;
        if (c.old.puppet)
            old->puppet = 1;
        if (old && old->OwnsThread())
            old->thread->DoFrame(1, false);

        s.player.Seek(0);
        const SObject* stays = s.At(c.old.depth);
        ASSERT_EQ(stays != nullptr, c.x >= 0);
        EXPECT_EQ(s.At(1)->serial, lowest);
        EXPECT_EQ(s.At(20000)->serial, highest);
        if (stays) {
            EXPECT_EQ(stays->serial == serial, c.keepsOld);
            EXPECT_EQ(stays->xform.mat.tx, c.x * 20);
            if (stays->OwnsThread()) { // a kept timeline stands where it was
                EXPECT_EQ(stays->thread->curFrame, c.keepsOld ? 1 : 0);
            }
        }
        EXPECT_EQ("", ExpectSame(s.Shown(), s.Repainted(), "hold"));
    }
}

TEST(Hold, OnlyWhatChangedIsRepainted)
{
    const Case c = {"", {5, Put(10, 50)}, Put(10, 50), true, 50};
    Scene s(CaseMovie(c), 100, 100);
    s.player.Seek(1);
    s.Shown();
    s.player.Seek(0);
    s.list.CalcUpdate();
    EXPECT_EQ(s.list.nDirty, 0);
}

// A mask that appears or disappears in the seek changes siblings that the seek keeps.
TEST(Hold, KeptObjectsAreMaskedAnew)
{
    for (const bool before : {false, true}) {
        MovieWriter m(100 * 20, 100 * 20);
        m.DefineShape(1, Square(kRed, 20)).DefineShape(2, Square(kGreen, 60));
        m.Place(2, 5);
        if (!before)
            m.Place2(3, Put(1, 0, {}, 6));
        m.Show();
        before ? m.Place2(3, Put(1, 0, {}, 6)) : m.RemoveDepth(3);
        m.Show().End();
        Scene s(m, 100, 100);
        s.player.Seek(1);
        EXPECT_EQ(s.Pixel(50, 50), before ? kWhitePixel : kGreenPixel);
        const U32 serial = s.At(5)->serial;
        s.player.Seek(0);
        EXPECT_EQ(s.At(5)->serial, serial);
        EXPECT_EQ(s.Pixel(50, 50), before ? kGreenPixel : kWhitePixel);
        EXPECT_EQ(s.Pixel(5, 5), kGreenPixel);
    }
}

TEST(Hold, TheTrackedButtonGoesOn)
{
    MovieWriter m(100 * 20, 100 * 20);
    m.Raw(7, {30, 0, 0}).Place(30, 5).Place(30, 6, AtPixel(1, 0)).Show();
    m.Move(6, AtPixel(2, 0)).Show().End();
    Scene s(m, 100, 100);
    s.player.Seek(1);
    EXPECT_EQ(s.At(5)->state, 1);
    for (const U16 depth : {5, 6}) { // 5 is kept, 6 is made anew
        SObject* old = s.At(depth);
        s.list.button = old;
        s.list.buttonState = 4;
        s.list.buttonIdentity = {s.Root(), s.Root()->serial, old->character, depth, 0};
        const U32 serial = old->serial;
        s.player.Seek(0);
        ASSERT_NE(s.list.button, nullptr);
        EXPECT_EQ(s.list.button, s.At(depth));
        EXPECT_EQ(s.At(depth)->serial == serial, depth == 5);
        EXPECT_EQ(s.At(depth)->state, depth == 5 ? 1 : 4);
        s.player.Seek(1);
    }
    s.list.button = s.At(5);
    s.Remove(5);
    EXPECT_EQ(s.list.button, nullptr);
}

TEST(Hold, EndsWithWhatIsHeld)
{
    Scene s(Cast(), 100, 100);
    SObject* sprite = s.Place(5, 12);
    s.list.BeginHold(sprite);
    EXPECT_EQ(sprite->bottomChild, nullptr);
    s.Remove(5);
    EXPECT_EQ(s.list.holdParent, nullptr);
    EXPECT_EQ(s.list.threads, &s.player);

    sprite = s.Place(5, 12);
    SObject* child = sprite->bottomChild;
    s.list.BeginHold(sprite);
    s.list.RemoveThisObject(child);
    s.list.BeginHold(s.Root()); // the open hold is finished first
    s.list.FinishHold();
    EXPECT_EQ(s.Root()->bottomChild, nullptr);
    s.list.FinishHold();

    s.Place(5, 12);
    s.list.BeginHold(s.Root()); // and a player may end with one open
}

} // namespace
