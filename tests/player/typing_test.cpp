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

// Words and ends; those of a password are hidden, and what cannot be typed into scrolls.
TEST(Fields, AreWalkedThroughByWords)
{
    const U32 flags[] = {kLines, kUsual | kFieldPassword, kLines | kFieldReadOnly};
    MovieWriter movie = Begin();
    for (U16 id : {2, 3, 4}) {
        FieldText field = {.box = {0, 2000, 0, 1000}, .flags = flags[id - 2]};
        field.text = id == 4 ? "a\ra\ra\ra\ra" : "aa a-a\r\naa";
        movie.Raw(kTagDefineEditText, FieldBody(id, field));
        movie.Place(id, U16(id - 1), Mat::Translate(0, 1000 * (id - 2)));
    }
    Stage s(movie);
    const struct {
        U16 field;
        int key, modifiers;
        U32 anchor, caret, length;
        S32 scroll;
    } keys[] = {
        {1, 2, 2, 3, 3, 10, 1},  {1, 2, 2, 8, 8, 10, 1},   {1, 2, 2, 10, 10, 10, 1},
        {1, 1, 2, 8, 8, 10, 1},  {1, 1, 3, 8, 3, 10, 1},   {1, 3, 2, 0, 0, 10, 1},
        {1, 4, 3, 0, 10, 10, 1}, {1, 2, 0, 10, 10, 10, 1}, {1, 8, 2, 8, 8, 8, 1},
        {1, 3, 2, 0, 0, 8, 1},   {1, 127, 2, 0, 0, 5, 1},  {2, 2, 2, 10, 10, 10, 1},
        {2, 1, 2, 0, 0, 10, 1},  {2, 127, 2, 0, 0, 0, 1},  {3, 15, 0, 0, 0, 9, 2},
        {3, 7, 0, 0, 0, 9, 4},   {3, 3, 2, 0, 0, 9, 1},    {3, 4, 2, 0, 0, 9, 4},
        {3, 14, 0, 0, 0, 9, 3},  {3, 'x', 0, 0, 0, 9, 3},  {3, 2, 0, 1, 1, 9, 1},
    };
    U16 clicked = 0;
    for (const auto& k : keys) {
        const S32 y = 50 * (k.field - 1) + 10;
        if (clicked != k.field)
            s.MouseDown(3, y), s.MouseUp(3, y);
        clicked = k.field;
        s.HandleKeyDown(k.key, k.modifiers);
        const EditText& f = *s.Field(k.field);
        EXPECT_EQ((std::array{k.anchor, k.caret, k.length, U32(k.scroll)}),
                  (std::array{f.Anchor(), f.Caret(), f.Length(), U32(f.Scroll())}))
            << k.field << ": " << k.key << ", " << k.modifiers;
    }
}

// The second frame puts another field of the same kind in its place; the view is zoomed before.
TEST(Fields, AreSelectedInOverARebuild)
{
    MovieWriter movie = Begin();
    movie.Raw(kTagDefineEditText,
              FieldBody(2, {.box = {0, 4000, 0, 4000}, .flags = kLines, .text = "aaaaaaaaaaaa"}));
    Stage s(movie.Place(2, 1).Show().RemoveDepth(1).Place(2, 1));
    s.ControlZoomIn();
    for (S32 column : {6, 8}) {
        SPOINT p = {40 + 200 * column, 300};
        MatrixTransformPoint(&s.scene.camera, &p, &p);
        const S32 unit = s.scene.antialias ? 4 : 1;
        EXPECT_GT(p.x / unit, 2 * column) << "in view";
        column == 6 ? s.MouseDown(p.x / unit, 2) : s.MouseMove(p.x / unit, 2, 1);
    }
    const EditText* before = s.Field(1);
    EXPECT_TRUE(before->Anchor() == 6 && before->Caret() == 8 && !s.panning);
    const U32 serial = s.focusText.Get()->serial;
    s.Tick();
    ASSERT_TRUE(s.focusText && s.focusText.Get()->serial != serial);
    EditText& f = *s.Field(1);
    EXPECT_TRUE(f.Anchor() == 6 && f.Caret() == 8 && f.Selecting());
    s.CancelCapture(1);
    MenuStatus menu;
    s.GetEditMenuState(&menu);
    EXPECT_TRUE(!f.Selecting() && menu.canViewAll && menu.canZoomIn && menu.zoomed);
    s.EditCommand(1);
    s.GetEditMenuState(&menu);
    EXPECT_TRUE(s.Text(1) == "aaaaaaaaaa" && !menu.canViewAll && !menu.canZoomIn && !menu.zoomed);
    s.EditCommand(0), s.EditPaste("b\n\nb\r\n\tb");
    EXPECT_EQ("b\r\rb\rb", s.Text(1));
}

} // namespace
