// Buttons: what the pointer makes of them, what they show, where they are hit, what they set off.
#include <sstream>

#include "core/stream/sounds.h"
#include "platform/headless/headless_sound.h"
#include "tests/display/scene.h"

namespace {

// A button of 20 pixels at each of four places: "a" at (0, 0), "b" at (30, 0), "m" at (0, 30), "n"
// at (30, 30); the last two are menus. They show character 1, 2 or 3 by their state, and 4 in all
// but the down state. They have a block for every transition, which begins with 16 times the button
// plus the transition, and one for a key.
struct Panel : Cast {
    Panel()
    {
        for (int i = 0; i < 4; i++) {
            ButtonBlocks blocks = {{13 << 9, {0xFF}}};
            for (int code = 0; code < 9; code++)
                blocks.push_back({1u << code, {U8(i * 16 + code), 0}});
            DefineButton(U16(40 + i), 34, {{1, 1, 1}, {2, 2, 2}, {4, 3, 3}, {3, 4, 7}, {8, 1, 9}},
                         blocks, i > 1);
            Place(U16(40 + i), U16(10 + i), AtPixel(i % 2 * 30, i / 2 * 30));
        }
    }
};

struct Stage : Scene {
    using Scene::Scene;

    // Tests the pointer at a button by its name, or beside all: pressed when upper case or "_".
    // Returns what that fires.
    std::string Point(char where)
    {
        const int at = int(names.find(char(std::tolower(where))));
        const SPOINT pt = {at < 0 ? 25 : at % 2 * 30 + 10, at < 0 ? 25 : at / 2 * 30 + 10};
        std::string fired;
        list.SetButton(list.HitButton(&pt), std::isupper(where) || where == '_');
        for (; queue.Size() > 0; queue.PopFront()) {
            fired += names[queue.At(queue.Head()).actions[0] / 16];
            fired += char('0' + queue.At(queue.Head()).actions[0] % 16);
        }
        return fired.empty() ? "-" : fired;
    }
    static std::string Images(const SObject* obj)
    {
        std::string ids;
        for (const SObject* child = obj->bottomChild; child; child = child->above)
            ids += char('0' + child->character->tag);
        return ids;
    }

    const std::string names = "abmn";
    ActionList& queue = list.actions;
};

// For each place where the pointer goes what that fires; then all states, and what is shown by the
// button that it went to last.
TEST(Buttons, PointerTable)
{
    for (const std::string row :
         {"aAa: a0 a2 a3 2111 24", "aA: a0 a2 3111 3", "aA_A: a0 a2 a4 a5 3111 3",
          "aA_-a: a0 a2 a4 a6 a0 2111 24", "aA__Aa: a0 a2 a4 - a5 a3 2111 24",
          "aABb: a0 a2 a4 a6b0 1211 24", "aAbBb: a0 a2 a4 - a6b0 1211 24", "ab: a0 a1b0 1211 24",
          "aB: a0 a1 1111 14", "aBBb: a0 a1 - b0 1211 24", "AAaA: - - a0 a2 3111 3",
          "_M_M: - m7 m8 m7 1131 3", "_MNn: - m7 m8n7 n3 1112 24", "mMAa: m0 m2 m8 a0 2111 24",
          "aANn: a0 a2 a4 a6n0 1112 24", "aN: a0 a1n7 1113 3", "aA_B: a0 a2 a4 - 4111 14"}) {
        Stage s((Panel()));
        std::string got = row.substr(0, row.find(' ') + 1);
        const size_t last = s.names.find(char(std::tolower(row[got.size() - 3])));
        for (const char where : row.substr(0, got.size() - 2))
            got += s.Point(where) + " ";
        for (U16 depth = 10; depth < 14; depth++)
            got += char('0' + s.At(depth)->state);
        EXPECT_EQ(got + " " + s.Images(s.At(U16(10 + last))), row);
    }
}

// Colours come from the records, or in the old form from a tag of their own, whose last one serves
// all that are left. The old form knows the click only.
TEST(Buttons, RecordsBecomeImages)
{
    const Cx first = Cx::Multiply(1, 2, 3), rest = Cx::Add(9, 9, 9);
    const std::vector<ButtonImage> images = {{1, 1, 5, AtPixel(3, 4), first}, {1, 99, 6, {}, rest},
                                             {1, 0xFFFE, 7, {}, rest},        {1, 50, 8, {}, rest},
                                             {17, 10, 9, {}, rest},           {2, 2, 5, {}, rest}};
    for (const bool old : {false, true}) {
        Cast m;
        m.DefineButton(50, old ? 7 : 34, images, {{0, {0x77, 0}}});
        m.Raw(23, ByteWriter().PutU16(50).PutCx(first, false).PutCx(rest, false));
        m.Raw(23, ByteWriter().PutU16(50)); // too late
        Stage s(m);
        SObject* obj = s.Place(0xFFFE, 50);
        ASSERT_EQ(s.Images(obj), "1:");
        const STransform& shape = s.list.FindChild(obj, 3)->xform;
        EXPECT_TRUE(shape.mat.ty == 80 && shape.cxform.greenMul == 2 && shape.cxform.redAdd == 0);
        EXPECT_EQ(s.list.FindChild(obj, 7)->xform.cxform.redAdd, 9);
        for (int code = 0; code < 9; code++)
            s.list.DoButtonAction(obj, code);
        const SActionBlock& click = s.queue.At(s.queue.Head()); // perhaps none
        ASSERT_EQ(s.queue.Size(), old ? 1u : 0u);
        EXPECT_TRUE(!old || (click.actions[0] == 0x77 && click.end == click.actions + 2));
        s.list.UpdateButton(obj, 2);
        EXPECT_EQ(s.Images(obj), "2");
    }
}

// In nine places, in plain and in smooth drawing, the depth that is hit. Actors: depth, character,
// tens and units of its place in cells, clip depth. 50 is hit in the 20 pixels to the right of its
// own place; 51 has it in a sprite; the areas of 52 have no shape of their own; 53 and 54 are
// fields, of which the second cannot be selected in.
TEST(Buttons, HitAreas)
{
    Cast m;
    m.DefineButton(50, 34, {{8, 1, 1, AtPixel(20, 0)}, {1, 3, 2}});
    m.DefineSprite(51, TagWriter().Place(50, 3).Show());
    m.DefineButton(52, 7, {{8, 10, 1}, {8, 50, 1}, {8, 53, 1}, {8, 99, 1}, {7, 3, 1}});
    for (U16 id : {53, 54})
        m.Raw(37, ByteWriter().PutU16(id).PutRect({0, 400, 0, 400}).PutU16(id == 54 ? 0x1020 : 32));
    for (const std::string row :
         {".5.......: 5 50 0 0", ".....5...: 5 50 11 0", "....3....: 5 51 1 0",
          ".6.......: 5 50 0 0 6 50 0 0", ".5.......: 5 50 0 0 6 3 0 0", ".........: 5 52 0 0",
          ".........: 2 1 0 9 5 50 0 0", ".5.......: 2 2 0 9 5 50 0 0",
          ".........: 2 50 0 9 5 50 0 0", "....5....: 5 53 11 0", ".........: 5 54 11 0",
          ".6.......: 5 50 0 0 6 53 10 0"})
        for (S32 unit : {1, 4}) {
            Stage s(m, 60, unit == 4);
            std::istringstream actors(row.substr(10));
            for (U16 depth, id, place, clip; actors >> depth >> id >> place >> clip;)
                s.Place(depth, id, AtPixel(place / 10 * 20, place % 10 * 20), clip);
            s.Shown();
            std::string hits;
            const SPOINT far = {0x4000001E, 0x4000000A};
            for (int at = 0; at < 9; at++) {
                const SPOINT pt = {at % 3 * 20 + 10, at / 3 * 20 + 10};
                const SObject* hit = s.list.HitButton(&pt);
                hits += hit ? char('0' + hit->depth) : '.';
            }
            EXPECT_EQ(hits, row.substr(0, 9)) << row;
            EXPECT_TRUE(!s.list.HitButton(&far) && s.list.nDirty + s.list.needCalcUpdate == 0);
            SRECT area;
            s.Place(20, 50, Mat::Scale(0.5).ThenTranslate(20, 40))->CalcButtonBounds(&area);
            const SRECT bounds = {11 * unit, 21 * unit, 2 * unit, 12 * unit};
            EXPECT_TRUE(RectEqual(&area, &bounds, 2));
        }
}

// What becomes of a button under the pointer when the movie jumps back to a frame with that one:
// the same object (2), a new one with its state (1), or an idle one. An image that two states share
// is the same object in both.
TEST(Buttons, AcrossSeeks)
{
    std::istringstream cases("40 0 0 2  40 1 0 1  40 0 1 0  41 0 0 0");
    for (U16 id, x, ratio, found; cases >> id >> x >> ratio >> found;) {
        Panel m;
        m.Place2(50, {.character = id, .matrix = AtPixel(x, 0), .ratio = ratio}).Show();
        m.RemoveDepth(50).Place(40, 50);
        Stage s(m, 60, false, 1);
        const U32 serial = s.list.FindChild(s.At(50), 57)->serial;
        s.Point('a');
        s.player.Seek(0);
        SObject* now = s.At(50);
        const bool on = s.list.button == now && now->state == 2 && s.Images(now) == "24";
        const bool same = s.list.FindChild(now, 57)->serial == serial;
        EXPECT_EQ(on + (on && same), found) << id << x << ratio;
    }
}

// What a timeline has queued goes with it, as does its being a target; not so when it is only
// listed anew. 60 shows "a" where it is itself hit, and takes it along when it is left for it.
TEST(Buttons, Removal)
{
    Panel m;
    m.DefineSprite(70, TagWriter().DoAction({1}).Show().End());
    m.DefineButton(60, 34, {{9, 1, 1}, {2, 40, 2}}, {{1, {0x20}}, {2, {0x21}}});
    for (U8 mark : {10, 11, 12})
        m.DoAction({mark, 0}).Show();
    Stage s(m);
    s.Place(99, 60);
    EXPECT_TRUE(s.Point('a') == "m0" && s.Point('a') == "m1" && !s.list.button);
    s.player.Seek(2); // frame 1 is passed over in silence
    ScriptThread* thread = s.Place(5, 70)->thread;
    s.list.calls.level = 1;
    s.list.calls.levels[1] = {&s.queue, thread, true};
    s.list.AddThread(thread);
    ASSERT_EQ(s.queue.Size(), 2u);
    const SActionBlock& block = s.queue.At(s.queue.Head() + 1);
    EXPECT_TRUE(block.thread == thread && s.list.calls.levels[1].target == thread);
    s.list.RemoveObject(s.Root(), 5);
    EXPECT_TRUE(!block.actions && !block.thread && !s.list.calls.levels[1].targetSet);
    s.list.calls.level = 0;
    for (int i = 0; i < 5000; i++)
        s.queue.PushAction(nullptr, nullptr, nullptr, nullptr, nullptr);
    EXPECT_TRUE(s.queue.Size() == 4096 && s.queue.At(s.queue.Head()).actions[0] == 12);
}

// The sound that each transition starts: none while sounds are off, none is left after Suspend.
TEST(Buttons, Sounds)
{
    NativeSoundMix mix;
    SPlayer::theSoundMix = &mix;
    Panel m;
    const std::vector<U8> full = {15, 0, 0, 0, 0, 9, 0, 0, 0, 1, 0, 1, 0, 0, 0, 0, 1, 2, 3, 4};
    ByteWriter sounds = ByteWriter().PutU16(40).PutU16(80).PutBytes(full).PutU16(81).PutBytes(full);
    m.Raw(17, sounds.PutU16(0).PutU16(83).PutU8(0)).Raw(17, {41, 0, 1, 0, 0, 99, 0, 0, 40, 0, 0});
    for (U8 id = 80; id < 84; id++)
        m.Raw(kTagDefineSound, std::vector<U8>{id, 0, 14, 9, 0, 0, 0, id, 0, id, 0});
    std::string started;
    for (int code = 0; code < 40; code++) {
        Stage s(m);
        s.player.soundOn = code / 10 != 1;
        s.list.DoButtonAction(s.At(code / 10 == 3 ? 11 : 10), code % 10);
        code / 10 == 2 ? s.player.Suspend() : void();
        CSound sound;
        for (U16 id = 80; id < 84; id++)
            if (SoundOf(s.player.FindCharacter(id), &sound) && mix.SoundPlaying(&sound))
                started += std::to_string(code * 100 + id) + " ";
    }
    EXPECT_EQ(started, "81 180 383 680 781 880 ");
    SPlayer::theSoundMix = nullptr;
}
} // namespace
