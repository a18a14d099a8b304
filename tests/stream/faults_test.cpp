// Hostile movies that once crashed or stalled the player.
#include "core/player/limits.h"
#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

namespace {

// Shows a movie in a sprite's place at depth 7, whose object owns it; clones its sprite to `depth`.
ScriptPlayer* Load(StreamScene& s, ScriptThread* thread, S32 depth)
{
    auto* guest = new ScriptPlayer;
    guest->display = &s.list;
    guest->PushDataBuf(s.movie.script, s.movie.len);
    PlaceInfo info;
    info.Clear();
    info.character = guest->NewPrivateCharacter();
    info.character->type = kCharLoadedMovie;
    info.depth = 7;
    s.list.PlaceObject(thread->rootObject, &info);
    thread->CloneSprite(s.list.FindChild(guest->rootObject, 3)->thread, "clone", depth);
    return guest;
}

TEST(Faults, AMovieMayGoWhateverStillShowsIt)
{
    MovieWriter movie;
    movie.DefineShape(1, ShapeBuilder()).DefineSprite(2, TagWriter().Place(1, 1).Show(2).End());
    movie.Place(2, 3).Show(4).End();
    StreamScene s(movie);
    s.movie.DrawFrame(1, true);
    Load(s, s.At(3)->thread, 20000);
    s.list.RemoveThisObject(s.At(3)); // the guest and the clone are out of the tree when it ends
    Load(s, &s.movie, 7);             // the original ends with what the clone replaces
    EXPECT_EQ(s.Tree(), "7:0");
    Load(s, &s.movie, 20000);
    s.movie.Seek(0); // the guest ends in the middle of the hold
    EXPECT_EQ(s.Tree(), "3:2(1:1) 20000:0(1:0)");
    ScriptPlayer* guest = Load(s, &s.movie, 8);
    guest->ClearScript(); // its object goes without it
    delete guest;
}

TEST(Faults, WorkAndMemoryAreBoundedAndShared)
{
    const SLimits saved = gLimits;
    gLimits.allStringBytes = 9000;
    gLimits.tagsPerDraw = 1000;
    gLimits.tagsPerTimeline = 200;
    TagWriter busy;
    MovieWriter movie;
    for (int i = 0; i < 9000; i++)
        busy.Raw(0x3FF, std::vector<U8>()).Show(i % 900 == 899);
    movie.DefineSprite(0x101, busy);
    for (U16 depth = 1; depth <= 9; depth++)
        movie.Place(0x101, depth);
    movie.Show(9).Raw(kTagPlaceObject2, {0x22, 99, 0, 1, 1, 'a'});
    for (int i = 0; i < 20; i++)
        movie.Raw(0x3FF, std::vector<U8>(60, 'a')); // nothing ends the name
    movie.Show(15993);
    StreamScene s(movie);
    for (int i = 0; i < 10; i++, s.Tick())
        s.list.ResetBudget();
    EXPECT_EQ(s.movie.curFrame, 9) << "it gets ahead in every tick";
    EXPECT_GE(s.At(6)->thread->curFrame, 0) << "each goes on where it stopped";
    EXPECT_LE(s.list.tagsLeft, 160u) << "the name costs more than its tag";
    for (int i = 0; i < 100; i++)
        s.movie.SetVariable(std::to_string(i).c_str(), "", 0);
    EXPECT_EQ(s.movie.FindVariable("90"), nullptr) << "each takes more than its letters";
    gLimits = saved;
    ScriptPlayer loader;
    loader.PushDataBuf(s.movie.script, 12);
    loader.FreeAll();
    loader.PushDataBuf(s.movie.script + 12, s.movie.len - 14);
    EXPECT_EQ(loader.numFrames, 16002);
    EXPECT_FALSE(loader.FrameAvailable(16001));
}

} // namespace
