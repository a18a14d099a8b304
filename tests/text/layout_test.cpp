// Lines, carets and scrolling of text fields, with a font of round advances; and what fields and
// fonts say.
#include "core/stream/character.h"
#include "core/text/text_layout.h"
#include "tests/display/scene.h"
#include "tests/support/glyph_writer.h"

#include <random>
#include <tuple>

namespace {
// At a height of 1024 letters are 100 wide, and these the second number.
const std::pair<char, S32> kWidths[] = {{' ', 50}, {'-', 60}, {'*', 80}, {'W', 300}, {'i', 40}};

// Fonts 1, of round advances and named for the device; 2, of two outlines without tables.
MovieWriter Fonts()
{
    FontText text = {"_Serif", 0x80, {}, {800, 200, 0}};
    for (S32 code = 32; code < 127; code++) {
        text.codes.push_back(code);
        text.layout.push_back(100);
        for (const auto& [c, width] : kWidths)
            text.layout.back() = c == code ? width : text.layout.back();
    }
    MovieWriter movie;
    ShapeBuilder glyph;
    glyph.AddFill(Rgba{});
    glyph.Fill1(1).MoveTo(0, 0).CurveTo(800, 400, 0, 800).Close();
    movie.Raw(kTagDefineFont, FontBody(2, {glyph, glyph}));
    return movie.Raw(kTagDefineFont2, Font2Body(1, Glyphs(95), text)), movie;
}

// A layout whose box is `width` by `height`, its left upper corner at (40, 40).
struct Field {
    SFieldRecord record;
    FieldFont font;
    TextLayout text;

    Field(S32 width, U32 flags, std::string_view s, S32 height = 9000, EFieldAlign align = {},
          std::array<S32, 4> layout = {})
    {
        static Scene scene(Fonts());
        record.bounds = {0, width + 80, 0, height + 80};
        record.flags = U16(flags | kFieldFont | kFieldOwnGlyphs);
        record.fontId = 1, record.height = 1024, record.align = align, record.leading = layout[3];
        record.leftMargin = layout[0], record.rightMargin = layout[1], record.indent = layout[2];
        font.Resolve(record, &scene.player, nullptr);
        text.SetFormat(record, &font);
        text.SetText(s);
    }

    // The lines; one that a break ends is followed by "!", one that the room ends by "|".
    std::string Lines() const
    {
        std::string out;
        for (U32 i = 0; i < text.LineCount(); i++) {
            const STextLine& l = text.Line(i);
            out.append(text.Text() + l.start, l.end - l.start);
            out += l.hard ? "!" : i + 1 < text.LineCount() ? "|" : "";
        }
        return out;
    }
};
constexpr U32 kLines = kFieldMultiline, kWrap = kFieldMultiline | kFieldWrap;

TEST(Text, BreaksIntoLines)
{
    const std::tuple<S32, S32, U32, std::string, std::string> rows[] = {
        {350, 0, kWrap, "aa bb", "aa |bb"},
        {300, 0, kWrap, "aaa   b ", "aaa   |b "},
        {300, 0, kWrap, "  aa-b", "  |aa-|b"},
        {300, 0, kWrap, "aaa-b", "aaa|-b"},
        {300, 0, kWrap, "a\rb\nc\r\nd\n\re\r", "a!b!c!d!!e!"},
        {0, 0, kWrap, "ab c", "a|b |c"},
        {300, 100, kWrap, "aaaaa\raaa", "aa|aaa!aa|a"},
        {240, 0, kWrap | kFieldPassword, "a b-cd\re", "a b|-cd!e"},
        {300, 0, kLines, "aaaa bbb\rc", "aaaa bbb!c"},
        {300, 0, kFieldWrap, "aaa\r\nbb", "aaa\r\nbb"}};
    for (const auto& [width, indent, flags, text, lines] : rows)
        EXPECT_EQ(Field(width, flags, text, 0, {}, {0, 0, indent, 0}).Lines(), lines) << text;
}

TEST(Text, AlignsAndSpreads)
{
    const std::tuple<S32, EFieldAlign, std::string, U32, U32, S32> rows[] = {
        {1000, kTextRight, "aa bb", 0, 0, 80 + 490},
        {1000, kTextCenter, "aa bb", 0, 0, 80 + 245},
        {360, kTextRight, "aa   bb", 0, 0, 80 + 100},      // hanging spaces have no width
        {360, kTextRight, "aa   bb", 0, 5, 80 + 300},      // nor a place outside
        {360, kTextRight, "aa   bb", 1, 5, 70 + 110},      // without the indent
        {60, kTextCenter, "W", 0, 0, 80},                  // wider than the room
        {561, kTextJustify, "a b c dddd", 0, 4, 80 + 401}, // odd twips go to later spaces
        {561, kTextJustify, "a b c dddd", 1, 7, 70 + 100},
        {561, kTextJustify, "a b c\rdddd", 0, 4, 80 + 300}};
    for (const auto& [width, align, s, line, offset, x] : rows)
        EXPECT_EQ(Field(width, kWrap, s, 0, align, {30, 20, 10, 0}).text.XOf(line, offset), x) << s;
}

TEST(Text, CaretsAtPointsAndByKeys)
{
    const Field f(9000, kLines, "iWa\r\ni\niiii", 2500);
    const S32 points[][3] = {{59, 0, 0},      {60, 0, 1},    {229, 0, 1},    {230, 0, 2},
                             {429, 0, 2},     {430, 0, 3},   {-99, -9, 0},   {9999, 1039, 3},
                             {9999, 1040, 6}, {99, 2040, 8}, {99, 99999, 8}, {101, 99999, 9}};
    for (const auto& [x, y, offset] : points)
        EXPECT_EQ(f.text.OffsetAt(SPOINT{x, y}), U32(offset)) << x << "," << y;
    const Field soft(300, kWrap, "aa bbbbb");
    EXPECT_TRUE(soft.text.OffsetAt(0, 9999) == 2 && soft.text.OffsetAt(1, 9999) == 5);
    EXPECT_TRUE(soft.text.LineOf(2) == 0 && soft.text.LineOf(3) == 1 && soft.text.LineOf(9) == 2);

    S32 goal = TextLayout::kNoGoal;
    U32 at = 2; // at the end of the W, 340 from the left
    const std::string keys = "ddduuerldruPrphl";
    const U32 carets[] = {6, 11, 11, 6, 2, 3, 5, 3, 6, 7, 5, 7, 8, 1, 0, 0};
    for (size_t i = 0; i < keys.size(); at = carets[i++])
        EXPECT_EQ(f.text.Move(at, ECaretMove(std::string("lrudhepP").find(keys[i])), &goal),
                  carets[i]);
}

TEST(Text, ScrollsTheLeast)
{
    const std::string ten = "0\r1\r2\r3\r4\r5\r6\r7\r8\r9";
    const S32 boxes[][3] = {{3000, 0, 8},   {2999, 0, 9},     {0, 0, 10},   {-80, 0, 10},
                            {4000, 500, 8}, {1020, -5000, 9}, {20000, 0, 1}};
    for (const auto& [height, leading, most] : boxes)
        EXPECT_EQ(Field(900, kLines, ten, height, {}, {0, 0, 0, leading}).text.MaxScroll(), most);
    Field f(900, kLines, ten, 3000);
    const S32 shown[][2] = {{10, 4}, {6, 4}, {2, 2}, {18, 8}, {0, 1}, {99, 8}};
    for (const auto& [offset, scroll] : shown)
        EXPECT_EQ((f.text.Show(U32(offset)), f.text.Scroll()), scroll) << offset;
    EXPECT_TRUE(f.text.LineTop(7) == 40 && f.text.Baseline(6) == -160 && f.text.LineAt(39) == 6);
    EXPECT_EQ((f.text.Replace(10, 99, ""), f.text.Scroll()), 4);

    Field one(300, 0, "aaaaaa");
    const S32 across[][2] = {{6, 300}, {3, 300}, {2, 200}, {5, 200}};
    for (const auto& [offset, shift] : across)
        EXPECT_EQ((one.text.Show(U32(offset)), one.text.HScroll()), shift) << offset;
    EXPECT_EQ(one.text.OffsetAt(SPOINT{41, 0}), 2u);
    EXPECT_EQ((one.text.Replace(0, 2, ""), one.text.HScroll()), 100);
}

// Whatever is typed, the lines are those of the same text laid out at once; and a caret that is
// looked for where it is drawn is found.
TEST(Text, EditsLeaveWhatTheWholeTextGives)
{
    std::mt19937 random(7);
    const auto pick = [&](U32 n) { return random() % n; };
    for (int round = 0; round < 240; round++) {
        const S32 width = std::array{-80, 0, 120, 300, 360, 777}[pick(6)];
        const U32 flags = std::array{kWrap, kWrap, kLines, kWrap | kFieldPassword, 0u}[pick(5)];
        const std::array<S32, 4> layout = {0, 0, S32(pick(2) * 100), 0};
        Field f(width, flags, "", 2000, EFieldAlign(pick(4)), layout);
        std::string text;
        for (int edit = 0; edit < 60; edit++) {
            const U32 at = pick(U32(text.size()) + 1), removed = pick(9) ? pick(4) : pick(40);
            std::string s(pick(6), ' ');
            for (char& c : s)
                c = "aaWi  -\r\n"[pick(9)];
            text.replace(at, removed, s);
            edit % 2 ? f.text.SetText(text) : f.text.Replace(at, removed, s);
            const Field whole(width, flags, text, 2000, f.record.align, layout);
            ASSERT_EQ(f.Lines(), whole.Lines()) << width;
            for (U32 o = 0; o <= text.size(); o++) {
                const U32 line = f.text.LineOf(o);
                const STextLine &l = f.text.Line(line), &w = whole.text.Line(line);
                ASSERT_TRUE(l.start == w.start && l.width == w.width && l.seen == w.seen);
                const S32 x = f.text.XOf(line, o); // the same for all hanging spaces
                ASSERT_TRUE(x >= f.text.Box().xmax ||
                            f.text.XOf(line, f.text.OffsetAt(line, x)) == x);
            }
        }
    }
    for (S32 width : {-80, 0, 300}) { // and the longest there is
        Field f(width, kWrap, std::string(70000, 'a'), width);
        EXPECT_EQ(f.text.LineCount(), width == 300 ? 21845u : 65535u);
        EXPECT_EQ((f.text.Replace(9, 0, "a"), f.text.Length()), 65535u);
    }
}

TEST(Text, FieldsAndFontsAsTheyStand)
{
    MovieWriter movie = Fonts();
    ByteWriter body =
        ByteWriter().PutU16(3).PutRect({-20, 40, 0, 60}).PutU16(0x29B7).PutU16(2).PutU16(1600);
    body.PutColor({1, 2, 3, 4}, true).PutU16(77).PutU8(3).PutU16(5).PutU16(6).PutU16(7);
    body.PutU16(U32(-8)).PutString("/a:b").PutString("text");
    movie.Raw(kTagDefineEditText, body);
    Scene scene(movie);
    SCharacter cut = *scene.player.FindCharacter(3);
    const SFieldRecord r(&cut);
    EXPECT_TRUE(r.flags == 0x29B7 && r.fontId == 2 && r.height == 1600 && r.bounds.xmin == -20);
    EXPECT_TRUE(r.color == (SRGB{1, 2, 3, 4}) && r.maxLen == 77 && r.align == kTextJustify);
    EXPECT_TRUE(r.leftMargin == 5 && r.rightMargin == 6 && r.indent == 7 && r.leading == -8);
    cut.dataLen -= 3; // a string ends with its tag
    EXPECT_TRUE(r.variable == "/a:b" && r.text == "text" && SFieldRecord(&cut).text == "te");

    // Without tables: codes from 32 on, the outline's reach (not its control point's) and a bit.
    FieldFont font;
    font.Resolve(r, &scene.player, nullptr);
    const S32 bare[][3] = {{' ', 0, 400}, {'!', 1, 625 + 100}, {'"', -1, 800}, {200, -1, 800}};
    for (const auto& [code, glyph, advance] : bare)
        EXPECT_TRUE(font.Glyph(U8(code)) == glyph && font.Advance(U8(code)) == advance) << code;
    SFieldRecord device = r;
    device.fontId = 1, device.flags &= U16(~kFieldOwnGlyphs);
    font.Resolve(device, &scene.player, &scene.player);
    EXPECT_TRUE(font.Glyph('b') == 66 && font.Advance('W') == 469 && font.Ascent() == 1250);
    font.Resolve(device, &scene.player, nullptr);
    EXPECT_TRUE(font.Glyph('b') == -1 && font.Advance(' ') == 800 && font.Ascent() == 1280);
    for (const char* name : {"_SERIF", "Times", "PT Serif"})
        EXPECT_STREQ(DeviceFontFor(name), "_serif");
    for (const char* name : {"Courier New", "Serif Mono", "MS Sans Serif"})
        EXPECT_STREQ(DeviceFontFor(name), name[0] == 'M' ? "_sans" : "_typewriter");
}
} // namespace
