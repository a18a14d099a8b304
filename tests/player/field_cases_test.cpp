// Text fields where things come together: turned and under a mask, sharing variables, and removed
// while they are in use.
#include "tests/player/fields_scene.h"

namespace {
constexpr U32 kOwn = kFieldFont | kFieldOwnGlyphs;

// A field of three lines in a sprite whose mask leaves off its last pixels. Its lines begin at
// offsets 0, 9, 15, 18 and 28, at pixels 12, 32, 42, 2 and 42. A step is a move of the pressed
// mouse or a key, then anchor, caret and scroll.
TEST(Fields, AreSelectedAndWalkedThrough)
{
    const S32 moves[][5] = {{36, 12, 2, 2, 1}, {66, 52, 2, 17, 1}, {99, 75, 2, 27, 2},
                            {50, -9, 2, 4, 1}, {50, 30, 2, 11, 1}, {4, 5, 2, 0, 1}};
    const S32 keys[][5] = {
        {1, 0, 2, 2, 1},    {15, 0, 9, 9, 1},   {15, 0, 15, 15, 1}, {15, 0, 21, 21, 2},
        {15, 1, 21, 28, 3}, {14, 0, 21, 21, 3}, {6, 0, 2, 2, 1},    {4, 0, 8, 8, 1},
        {2, 0, 9, 9, 1},    {4, 1, 9, 13, 1},   {2, 0, 13, 13, 1},  {2, 0, 15, 15, 1},
        {1, 1, 15, 13, 1},  {15, 1, 15, 17, 1}, {1, 0, 15, 15, 1},  {8, 0, 13, 13, 1},
        {13, 0, 14, 14, 1}, {7, 0, 27, 27, 3},  {4, 0, 29, 29, 3},  {127, 0, 29, 29, 3},
        {3, 0, 27, 27, 3},  {8, 0, 26, 26, 3},  {6, 1, 26, 8, 1},   {13, 0, 9, 9, 1}};
    FieldText field = {.box = {0, 2080, 0, 1280}, .flags = kLines | kFieldLayout};
    field.layout[0] = kTextCenter;
    field.variable = "/:v", field.text = "aaaa aaa bbbb\r\ncc\rdddddddddddd";
    TagWriter sprite;
    sprite.Place2(1, {.character = 3, .matrix = Mat::Scale(9.9), .clipDepth = 9}).Place(2, 2);
    for (const Mat& m : {Mat(), Mat::Rotate(30).Then(Mat::Scale(1.25)).ThenTranslate(1600, 300)}) {
        MovieWriter movie = Begin();
        movie.Raw(kTagDefineEditText, FieldBody(2, field)).DefineShape(3, Square());
        Stage s(movie.DefineSprite(4, 1, sprite).Place(4, 1, m));
        const auto press = [&](S32 x, S32 y) {
            const MATRIX place = {m.a, m.b, m.c, m.d, m.tx / 20, m.ty / 20};
            SPOINT p = {x, y};
            MatrixTransformPoint(&place, &p, &p);
            s.MouseMove(p.x, p.y, 1);
        };
        const auto expect = [&](const S32* step) {
            const EditText& f = *s.focusText.Get()->editText;
            ASSERT_TRUE(f.Anchor() == U32(step[2]) && f.Caret() == U32(step[3])) << step[0];
            ASSERT_EQ(step[4], f.Scroll()) << step[0];
            const Picture partial = Shot(&s);
            s.scene.FreeCache(), s.scene.ModifyCamera();
            ASSERT_EQ("", ExpectSame(partial, Shot(&s), "field-repaint"));
        };
        EXPECT_FALSE((press(101, 12), s.focusText));
        for (const auto& step : moves)
            press(step[0], step[1]), expect(step);
        s.MouseUp(0, 0), s.focusText.Get()->editText->Select(2, 16);
        for (const auto& step : keys)
            s.HandleKeyDown(step[0], step[1]), expect(step);
        EXPECT_EQ("aaaa aaa\rdd", s.Value("v"));
    }
}

// From above: a field that keeps the focus, below one that is not selectable; one of three bytes at
// most; one to be read only, with a border; one typed into beyond its end, bound to what is none,
// and one with the columns that it shows then; one whose variable goes; a password, and its stars.
// To the right the fifth masks a square.
TEST(Fields, HeedTheirFlagsAndVariables)
{
    const U32 flags[] = {
        kFieldKeepFocus, kFieldMaxLen, kFieldReadOnly | kFieldBorder, 0, 0, 0, kFieldPassword, 0,
        kFieldNoSelect};
    const char* const names[] = {"v", "v", "v", "v.scroll", "t", "/s:w", "p", "u", ""};
    MovieWriter movie = Begin();
    for (U16 row = 1; row <= 9; row++) {
        FieldText f = {.box = {0, 2080, 0, 480}, .flags = flags[row - 1] | kFieldFont};
        f.flags |= row < 7 ? kOwn : 0, f.maxLen = 3, f.variable = names[row - 1];
        movie.Raw(kTagDefineEditText, FieldBody(U16(row + 1), f));
        movie.Place(U16(row + 1), row, Mat::Translate(0, 500 * (row - 1)));
    }
    movie.Background({0, 200, 0, 255}).DefineSprite(11, TagWriter().Show()).Place(10, 20);
    movie.Place2(10, {.character = 11, .name = "s"}).DefineShape(12, Square());
    movie.Place2(21, {.character = 6, .matrix = Mat::Translate(2200, 0), .clipDepth = 22});
    Stage s(movie.Place(12, 22, Mat::Scale(5).ThenTranslate(2200, 0)));
    const auto type = [&s](int row, std::string_view keys) {
        s.MouseDown(99, 25 * row - 15), s.MouseUp(99, 25 * row - 15);
        for (char key : keys)
            s.HandleKeyDown(U8(key), 0);
    };
    s.Set("v", "aaaa"), s.Set("t", " aaaaa a a"), s.Set("u", "***");
    const std::tuple<int, const char*, std::string> typed[] = {
        {2, "c", "aaaa"}, {2, "\b", "aaa"}, {3, "\bd", "aaa"}, {1, "b", "aaab"}};
    for (const auto& [row, keys, text] : typed) {
        type(row, keys);
        EXPECT_TRUE(s.Text(1) == text && s.Text(2) == text && s.Text(3) == text) << row << keys;
    }
    EXPECT_EQ((s.MouseDown(190, 190), s.focusText.Get()), s.rootObject->bottomChild);
    type(4, "aa a aaaaa a a"), type(6, "2"), type(7, "a a");
    EXPECT_EQ("2 1 a a", s.Value("/s:w") + " " + s.Value("v.scroll") + " " + s.Value("p"));
    char* copy = (s.EditCommand(0), nullptr);
    EXPECT_TRUE((s.EditCopy(&copy), !copy && s.Field(7)->HasSelection()));
    s.scene.RemoveObject(s.rootObject, 10), type(6, "3"), s.SetFocusText(nullptr);
    EXPECT_TRUE(s.Text(6) == "23" && s.Value("w") == "none" && !s.FindVariable("v.scroll"));
    Picture p = Shot(&s);
    for (U32* row : {&p.At(0, 75), &p.At(0, 150)})
        EXPECT_TRUE(std::equal(row, row + 24 * 200, row + 25 * 200));
    EXPECT_TRUE(p.At(50, 60) == ~0u && p.At(104, 60) << 8 == 0 && p.At(124, 13) << 8 == 0xC81E1E00);
    EXPECT_EQ((s.Set("t", ""), Shot(&s).At(124, 13)), 0xFF00C800) << "no text, no hole in the mask";
}

// The frame that hears of a change takes the field away under the pressed mouse; then others come
// in its place.
TEST(Fields, GoWhileTheyAreUsed)
{
    MovieWriter movie = Begin();
    for (U16 id : {2, 3})
        movie.Raw(kTagDefineEditText,
                  FieldBody(id, {.box = {0, 1000, 0, 500}, .flags = kOwn, .variable = "v"}));
    movie.DefineShape(4, Square()).Place(2, 1).Show().Label("v_changed");
    Stage s(movie.DoAction(AssembleScript("GotoFrame 2")).Show().RemoveDepth(1));
    PlaceInfo info;
    info.Clear();
    info.flags = PlaceInfo::kMove | PlaceInfo::kCharacter, info.depth = 1;
    std::string shown;
    for (U16 id : {0, 3, 4, 2}) {
        info.character = s.FindCharacter(id);
        s.MouseDown(20, 10);
        id == 0 ? void(s.HandleKeyDown('a', 0)) : void(s.scene.MoveObject(s.rootObject, &info));
        EXPECT_TRUE(!s.focusText && !s.HandleKeyDown('b', 0));
        s.MouseMove(9, 10, 1), s.MouseUp(9, 10);
        const SObject* there = s.scene.FindChild(s.rootObject, 1);
        shown += !there ? "gone " : !there->editText ? "shape " : s.Text(1) + " ";
        id == 0 ? s.GotoFrame(0) : s.Set("v", "c");
    }
    EXPECT_EQ("gone a shape c ", shown);
}

} // namespace
