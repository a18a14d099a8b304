// Text fields under the mouse and the keyboard.
#include "tests/player/fields_scene.h"

namespace {

// Field 1 is an "a" of 10 pixels a column from pixel 2 on; its lines are 20 pixels high.
TEST(Fields, AreTypedInto)
{
    MovieWriter movie = Begin();
    for (U16 id : {2, 3})
        movie.Raw(kTagDefineEditText, FieldBody(id, {.box = {0, 2000, 0, 1000},
                                                     .flags = kLines | kFieldMaxLen,
                                                     .maxLen = 12,
                                                     .variable = "v",
                                                     .text = "aaaa\raaaa"}));
    movie.Place(2, 1).Place(3, 2, Mat::Translate(0, 2000)).Show().Label("V_changed");
    movie.DoAction(AssembleScript("\"n\" \"n\" GetVariable \"+\" StringAdd SetVariable"));
    Stage s(movie);
    EXPECT_EQ(0, s.HandleKeyDown('x', 0));
    s.MouseDown(24, 10);
    const U32 plain = Shot(&s).At(60, 60);
    s.MouseMove(36, 30, 1);
    s.MouseUp(36, 30);
    s.MouseMove(80, 10, 0);
    EXPECT_TRUE(s.Field(1)->Anchor() == 2 && s.Field(1)->Caret() == 8 && s.GetCursorType() == 3);
    EXPECT_TRUE(plain == Shot(&s).At(60, 60) && U8(Shot(&s).At(39, 4)) == 0);
    const struct {
        int key, modifiers;
        const char* text;
        U32 anchor, caret;
    } keys[] = {{'x', 2, "aaaa\raaaa", 2, 8}, {'x', 0, "aaxa", 3, 3},  {1, 1, "aaxa", 3, 2},
                {127, 0, "aaa", 2, 2},        {8, 0, "aa", 1, 1},      {13, 0, "a\ra", 2, 2},
                {14, 0, "a\ra", 0, 0},        {4, 1, "a\ra", 0, 1},    {27, 0, "a\ra", 1, 1},
                {233, 1, "a\xE9\ra", 2, 2},   {9, 0, "a\xE9\ra", 2, 2}};
    for (const auto& k : keys) {
        EXPECT_EQ(k.key != 9 && k.modifiers != 2, s.HandleKeyDown(k.key, k.modifiers)) << k.key;
        EXPECT_TRUE(s.Text(1) == k.text && s.Text(2) == k.text && s.Value("v") == k.text) << k.key;
        EXPECT_TRUE(s.Field(1)->Anchor() == k.anchor && s.Field(1)->Caret() == k.caret) << k.key;
    }
    EXPECT_EQ("+++++", s.Value("n"));
    s.EditPaste("b\r\n\tb 0123456789");
    EXPECT_EQ("a\xE9"
              "b\rb 0123\ra",
              s.Text(2));
    char* copy = (s.EditCommand(0), nullptr);
    s.EditCopy(&copy);
    EXPECT_EQ(s.Text(1), copy);
    FreeStr(copy);
    s.scene.RemoveObject(s.rootObject, 1);
    EXPECT_EQ(0, s.HandleKeyDown('x', 0));
    s.MouseDown(24, 110);
    s.MouseDown(24, 190);
    EXPECT_FALSE(s.focusText);
}

} // namespace
