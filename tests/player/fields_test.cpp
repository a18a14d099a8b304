// Text fields in a movie: what they show, and the variables that they are bound to.
#include "core/player/limits.h"
#include "tests/player/fields_scene.h"

namespace {

TEST(Fields, DrawWhatStaticTextDraws)
{
    const Mat turned = Mat::Rotate(30).Then(Mat::Scale(1.5)).ThenTranslate(1400, 700);
    const Cx faded = Cx::Multiply(256, 128, 256, 200);
    MovieWriter field = Begin(), fixed = Begin();
    const Rgba blue = {20, 40, 220, 255};
    field.Raw(
        kTagDefineEditText,
        FieldBody(
            2, {.box = {0, 1500, 0, 1000}, .flags = kLines, .color = blue, .text = "aaa a\raa"}));
    const TextRun first = {{{1, 400}}, blue, 40, 40 + 320, {{0, 200}, {0, 200}, {0, 400}, {0, 0}}};
    const TextRun second = {{{1, 400}}, blue, 40, 40 + 720, {{0, 200}, {0, 0}}};
    fixed.Raw(kTagDefineText2, TextBody(2, {0, 1500, 0, 1000}, {}, {first, second}));
    Stage a(field.Place(2, 1, turned, faded)), b(fixed.Place(2, 1, turned, faded));
    EXPECT_EQ("", ExpectSame(Shot(&a), Shot(&b), "field-static"));
}

// Text that is too wide, too high or scrolled never leaves the box; the mask itself paints nothing.
TEST(Fields, StayInTheirBoxAndScroll)
{
    MovieWriter movie = Begin();
    const std::string lines = "aaaaaaaaaaaaaaaaaa\r \raaaaaaaaaaaa\ra\ra";
    movie.Raw(kTagDefineEditText, FieldBody(2, {.box = {0, 1000, 0, 900},
                                                .flags = kUsual | kFieldMultiline,
                                                .variable = "v",
                                                .text = lines}));
    Stage s(movie.Place(2, 1, Mat::Translate(1000, 1000)));
    const auto dark = [&](int x, int y) { return U8(Shot(&s).At(x, y)) < 128; };
    EXPECT_TRUE(dark(54, 64) && dark(94, 64) && !dark(101, 64) && !dark(104, 64) && !dark(54, 84));
    EXPECT_EQ("1 4", s.Value("v.scroll") + " " + s.Value("V.maxscroll"));
    s.Set("v.scroll", "3.9");
    EXPECT_TRUE(dark(54, 64) && dark(94, 64) && dark(54, 84) && !dark(74, 84) && !dark(54, 104));
    for (const auto& [name, value, scroll] : {std::array{"v.scroll", "99", "4"},
                                              {"v.scroll", "x", "4"},
                                              {"v.maxscroll", "1", "4"},
                                              {"v.scroll", "-5", "1"}})
        EXPECT_EQ(scroll, (s.Set(name, value), s.Value("v.scroll"))) << name << value;
    EXPECT_EQ("none none", s.Value("w.scroll") + " " + s.Value("v.other"));
}

TEST(Fields, ShowTheirVariables)
{
    MovieWriter movie = Begin(), sprite;
    const Box box = {0, 2000, 0, 500};
    movie.Raw(kTagDefineEditText,
              FieldBody(2, {.box = box, .flags = kUsual, .variable = "v", .text = "first"}));
    movie.Raw(kTagDefineEditText, FieldBody(3, {.box = box, .variable = "/s:w"}));
    movie.DoAction(AssembleScript("\"v\" \"second\" SetVariable")).Place(2, 1).Place(3, 2);
    movie.DefineSprite(4, sprite.Show().End()).Place2(3, {.character = 4, .name = "s"}).Show();
    movie.Place(3, 4).Move(1, Mat::Translate(20, 20));
    movie.Place2(2, {.move = true, .character = 2});
    Stage s(movie);
    EXPECT_EQ("second", s.Text(1));
    s.Set("/s:W", "there");
    EXPECT_EQ("there none", s.Text(2) + " " + s.Value("w"));
    s.Tick();
    EXPECT_EQ("second second there", s.Text(1) + " " + s.Text(2) + " " + s.Text(4));
    s.GotoFrame(0);
    EXPECT_EQ("second there", s.Text(1) + " " + s.Text(2));
    s.Set("v", std::string(70000, 'x').c_str());
    EXPECT_EQ(65535u, s.Field(1)->Length());
    s.scene.RemoveObject(s.rootObject, 3);
    s.Set("/s:w", "gone");
    EXPECT_EQ("there", s.Text(2));
}

TEST(Fields, BlinkWhereTypingGoes)
{
    MovieWriter movie = Begin();
    movie.Raw(kTagDefineEditText, FieldBody(2, {.box = {0, 2000, 0, 500}, .flags = kUsual}));
    Stage s(movie.Place(2, 1));
    const auto caret = [&] { return U8(Shot(&s).At(2, 10)) < 255; };
    EXPECT_FALSE((s.CursorTick(), caret()));
    s.MouseDown(50, 10);
    EXPECT_TRUE(caret() && (s.CursorTick(), !caret()) && (s.CursorTick(), caret()));
    s.CursorTick();
    s.HandleKeyDown(3, 0);
    EXPECT_TRUE(caret());
    s.MouseDown(50, 100);
    EXPECT_FALSE(caret() || (s.CursorTick(), caret()));
}

// Outlines that reach far beyond their lines, where one line changes; the last may be measured no
// more.
TEST(Fields, PaintWhatReachesBeyondALine)
{
    for (int rects : {1, 5000}) {
        MovieWriter movie(4000, 4000, Fps(10));
        ShapeBuilder tall;
        tall.AddFill(Rgba{});
        tall.Fill1(1).Rect(0, -2000, 100, 1500);
        for (int i = 1; i < rects; i++)
            tall.Rect(0, 0, 10, 10);
        const FontText text = {"Tall", 0x80, {'i', 'a'}, {819, 205, 0, 512, 512}};
        movie.Raw(kTagDefineFont2, Font2Body(1, {ShapeBuilder(), tall}, text));
        movie.Raw(kTagDefineEditText, FieldBody(2, {.box = {0, 4000, 0, 4000},
                                                    .flags = kLines,
                                                    .variable = "v",
                                                    .text = "ii\rii\rii\rii\rii"}));
        Stage s(movie.Place(2, 1));
        for (const char* changed : {"ii\rii\rai\rii\rii", "ii\rii\rii\rii\rii"}) {
            const Picture before = Shot(&s);
            s.Set("v", changed);
            const Picture part = Shot(&s);
            EXPECT_NE("", ExpectSame(before, part, "tall-changed"));
            s.scene.FreeCache(), s.scene.ModifyCamera();
            EXPECT_EQ("", ExpectSame(part, Shot(&s), "tall")) << rects;
        }
    }
}

// A caret that has been scrolled out of view is not seen in the margin, where nobody would erase
// it.
TEST(Fields, HideTheirCaretsWithTheirLines)
{
    MovieWriter movie = Begin();
    movie.Raw(kTagDefineEditText, FieldBody(2, {.box = {0, 1000, 0, 900},
                                                .flags = kUsual | kFieldMultiline,
                                                .variable = "v",
                                                .text = "a\ra\ra\ra"}));
    Stage s(movie.Place(2, 1, Mat::Scale(4)));
    s.MouseDown(150, 30), s.MouseUp(150, 30);
    for (const int key : {97, 8}) {
        s.Set("v.scroll", "2");
        Shot(&s);
        s.HandleKeyDown(key, 0);
        const Picture part = Shot(&s);
        s.scene.FreeCache(), s.scene.ModifyCamera();
        EXPECT_EQ("", ExpectSame(part, Shot(&s), "caret-out"));
    }
}

TEST(Fields, KeepToTheirLimits)
{
    gLimits.textFieldBytes = 100, gLimits.textFields = 2;
    MovieWriter movie = Begin();
    for (U16 id : {2, 3, 4}) {
        const std::string name(id == 2 ? 1024 : id == 3 ? 1025 : 1, 'n');
        const Box box = {0, 900, 0, 500};
        movie.Raw(kTagDefineEditText,
                  FieldBody(id, {.box = box, .flags = kUsual, .variable = name, .text = "t"}));
    }
    Stage s(movie.Place(2, 1).Place(3, 2).Place(4, 3));
    EXPECT_TRUE(s.Text(1) == "t" && s.Text(2) == "" && !s.Field(3));
    const std::string path(1024, 'n'), longText(80, 'x');
    s.Set(path.c_str(), longText.c_str()), s.Set(path.c_str(), "");
    s.scene.RemoveObject(s.rootObject, 2);
    PlaceInfo info;
    info.Clear();
    info.flags = PlaceInfo::kCharacter, info.depth = 4, info.character = s.FindCharacter(4);
    s.scene.PlaceObject(s.rootObject, &info);
    s.Set("n", longText.c_str());
    EXPECT_EQ(longText.substr(0, 20), s.Text(4)) << "the other's room is taken";
    gLimits = {};
}

} // namespace
