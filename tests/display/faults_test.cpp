// Faults that were found once and mended.
#include "tests/display/scene.h"

namespace {

// Two objects at one depth of which a seek keeps one, and a mask that it keeps as well.
TEST(Faults, ASeekRepaintsATwinThatGoesButNoMaskThatStays)
{
    Cast movie;
    movie.Place2(3, {.character = U16(1), .clipDepth = U16(6)}).Place(2, 5);
    movie.Place(1, 8, AtPixel(35, 35)).Show().Place(1, 8, AtPixel(35, 35));
    Scene s(movie, 60, false, 1);
    s.player.Seek(0);
    s.list.CalcUpdate();
    EXPECT_TRUE(s.list.nDirty == 1 && s.list.dirtyList[0].xmin == 33);
}

// The view joins what is pending and takes one merge along; the lost pixels mark nothing else.
TEST(Faults, WhatWaitsStaysAndIsPaintedInOrder)
{
    Scene s{Cast()};
    const SRECT a = {10, 20, 10, 20}, b = {40, 50, 40, 50}, outside = {500, 600, 500, 600};
    s.list.InvalidateRect(&a);
    s.list.InvalidateRect(&b);
    s.player.FreeBuffer();
    EXPECT_FALSE(s.list.needCalcUpdate);
    EXPECT_TRUE(s.list.nDirty == 2 && s.list.dirtyList[1].xmin == 38);
    s.player.Repaint(&outside);
    EXPECT_TRUE(s.list.nDirty == 0 && s.player.blitted.xmax == 60);
    PlaceInfo info = s.Info(1, 1, AtPixel(40, 40));
    s.list.PlaceObject(s.Place(5, 1), &info);
    s.Shown();
    s.Root()->FreeChildren();
    EXPECT_TRUE(s.list.nDirty == 2 && s.list.dirtyList[0].xmin == 38) << "children first";
}

// The first of its depth; ascending ones cost no search.
TEST(Faults, DepthsStayInOrderWithoutLongSearches)
{
    Scene s{Cast()};
    std::vector<std::pair<U16, SObject*>> want, have;
    const U32 budget = s.list.tagsLeft;
    for (U16 depth = 1000; depth < 2000; depth++)
        want.emplace_back(depth, s.Place(depth, 4));
    EXPECT_EQ(s.list.tagsLeft, budget);
    for (int step = 0; step < 3000; step++) {
        const U16 depth = U16(step * 29 % 43 * step % 40);
        const auto at = std::lower_bound(want.begin(), want.end(), std::pair(depth, (SObject*)0));
        if (step % 7 < 4)
            want.insert(at, {depth, s.Place(depth, 4)});
        else if (s.list.RemoveObject(s.Root(), depth); at != want.end() && at->first == depth)
            want.erase(at);
    }
    for (SObject* o = s.Root()->bottomChild; o; o = o->above)
        have.emplace_back(o->depth, o);
    EXPECT_EQ(have, want);
}

TEST(Faults, MenusAndHomeSayWhatTheTimelineCanDo)
{
    Scene s{Cast()};
    MenuStatus menu;
    s.player.numFrames = 5; // more than there are
    s.player.scaleMode = kScaleFixed;
    s.player.Home();
    s.player.GetMenuState(&menu);
    EXPECT_TRUE(menu.view100 && !menu.canForward);
}

} // namespace
