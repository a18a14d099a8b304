// Sprites that take away themselves, or what they are in, while all kinds of things hold on to
// them.
#include "tests/player/player_scene.h"
#include "tests/support/script_writer.h"

#include <deque>

namespace {

// A shell that leaves requests open, and unloads everything at any command.
struct OpenShell : PlayingShell {
    using PlayingShell::PlayingShell;
    void StreamGetURLNotify(const char*, const char*, void* to) override { asked.push_back(to); }
    void CloseStream(StreamData* in) override { closed = in; }
    void ProcessFSCommand(const char* c, const char*) override { *c ? ControlClose() : void(); }
    // Answers the oldest request, with a movie whose last byte is still to come.
    void Answer(const std::vector<U8>& bytes)
    {
        StreamInNew(&streams.emplace_back(), "b", asked.front());
        asked.pop_front();
        StreamInWrite(&streams.back(), bytes.data(), S32(bytes.size()) - 1), DoPlay(0);
    }

    std::deque<void*> asked;
    std::deque<StreamData> streams;
    StreamData* closed = nullptr;
};

// Has a button at (30, 0) pixels and one at (0, 0) in each sprite: in "s" and its clone "c", both
// in "p" and its clone "q". A press drags; a click, the key "k" or the start runs the script.
std::vector<U8> Buttons(const std::vector<U8>& script, bool atOnce)
{
    const std::vector<U8> drag = AssembleScript(R"(0 0 "" StartDrag)");
    MovieWriter movie(2000, 2000, Fps(10));
    TagWriter parent = TagWriter().Place2(1, {.character = 3, .name = "s"});
    parent.DoAction(AssembleScript(R"("s" "c" 16384 CloneSprite)")).Show();
    movie.DefineShape(1, Square()).DefineSprite(3, TagWriter().Place(2, 1).Show());
    movie.DefineButton(2, 34, {{0x0F, 1, 1}}, {{4, drag}, {8 | 'k' << 9, script}});
    movie.DefineSprite(4, parent).Place(2, 2, Mat::Translate(600, 0));
    movie.Place2(1, {.character = 4, .name = "p"});
    movie.DoAction(AssembleScript(R"("p" "q" 16384 CloneSprite)"));
    return movie.DoAction(atOnce ? script : std::vector<U8>()).Show().Raw(99, {0}), movie.Bytes();
}

// Held by the mouse that drags it, by the focus, by a key, or by a stream, in whose movie the mouse
// or the first frame starts the script. Whatever becomes of it, nobody holds it afterwards, and
// what was asked for can still arrive.
TEST(Removal, OfWhatIsInUse)
{
    for (const std::string removal :
         {R"("" RemoveSprite)", R"("../s" "d" 16384 CloneSprite)", R"(".." RemoveSprite)",
          R"("" "" GetURLExpr 64)", R"("b" "" GetURLExpr 64)", R"("" ".." GetURLExpr 64)",
          R"(GetURL "" _level1)", "GetURL b _level1", R"(GetURL "" _level0)",
          "GetURL FSCommand:x b"})
        for (const char use : {'m', 'f', 'k', 's', 'a'}) {
            SCOPED_TRACE(removal + " " + use);
            const auto script = AssembleScript(removal + R"( NextFrame Play "x" 1 SetVariable)");
            OpenShell player(Buttons(script, false), 100, 100);
            player.GetURL("b", "_level1", nullptr, 0);
            player.Answer(Buttons(script, false));
            const bool fed = use == 's' || use == 'a';
            player.GetURL(fed ? "b" : "FSCommand:", "_level1/q/c", nullptr, 0x40);
            fed ? player.Answer(Buttons(script, use == 'a')) : void();
            StreamData* const stream = &player.streams.back();
            ScriptThread* const clone = player.FindTarget(nullptr, "_level1/q/c");
            const ObjectRef held(&player.scene, clone ? clone->rootObject : nullptr);
            const S32 x = use == 's' ? 35 : 5;
            if (use == 'm' || use == 's') {
                player.MouseMove(x, 5, 0), player.MouseDown(x, 5), player.MouseMove(x, 6, 1);
                EXPECT_TRUE(held && held.Get() == player.drag.object.Get());
                player.MouseUp(x, 6);
            }
            if (use == 'f')
                player.ButtonFocusSet(held.Get()->bottomChild);
            player.HandleKeyDown(use == 'k' ? 'k' : 13, 0);
            EXPECT_TRUE((use == 'a' || !held) && !player.drag.object);
            EXPECT_TRUE(!fed || (player.closed && player.StreamInWrite(stream, "", 1) < 0));
            while (!player.asked.empty())
                player.Answer(Buttons(script, false));
            player.DoPlay(0), player.MouseMove(5, 7, 0), player.HandleKeyDown(18, 0);
            for (StreamData& each : player.streams)
                player.StreamInDestroy(&each);
        }
}

} // namespace
