#include "tests/tools/tool_runner.h"

#include <algorithm>
#include <map>

namespace {

using Words = std::vector<std::string>;

// A header of the given length field and nothing right after it.
std::vector<U8> Header(U32 length)
{
    std::vector<U8> bytes = {'M', 'V', 'X', 5};
    for (int shift = 0; shift < 32; shift += 8)
        bytes.push_back(U8(length >> shift));
    return bytes;
}

class Errors : public ToolTest {
protected:
    void Expect(const Words& words, int code, const std::string& said)
    {
        const Outcome outcome = Run(words);
        std::string line;
        for (const std::string& word : words)
            line += word + " ";
        EXPECT_EQ(code, outcome.code) << line;
        EXPECT_EQ("", outcome.out) << line;
        EXPECT_EQ(0u, outcome.err.find("vexel: ")) << line << outcome.err;
        EXPECT_NE(std::string::npos, outcome.err.find(said)) << line << outcome.err;
        EXPECT_EQ(1, std::count(outcome.err.begin(), outcome.err.end(), '\n')) << outcome.err;
    }
};

TEST_F(Errors, OfTheCommandLine)
{
    Write("m.vxm", StripMovie(3));
    const struct {
        Words words;
        const char* said;
    } cases[] = {
        {{}, "a command is missing"},
        {{"play", "m.vxm"}, "unknown command play"},
        {{"render", "m.vxm"}, "needs an output"},
        {{"render", "-o", "x.png"}, "one movie"},
        {{"render", "m.vxm", "n.vxm", "-o", "x.png"}, "one movie"},
        {{"render", "m.vxm", "-o"}, "-o needs a value"},
        {{"render", "m.vxm", "-o", "x.png", "--allow-net"}, "unknown option --allow-net"},
        {{"render", "m.vxm", "-o", "x.png", "--progress=yes"}, "--progress takes no value"},
        {{"render", "m.vxm", "-o", "x.gif"}, ".gif output is not supported yet"},
        {{"render", "m.vxm", "-o", "x"}, "without extension"},
        {{"render", "m.vxm", "-o", "a.png/x"}, "without extension"},
        {{"render", "m.vxm", "-o", "%d%d.png"}, "one number"},
        {{"render", "m.vxm", "-o", "x.png", "--frames", "1-2"}, "several pictures"},
        {{"render", "m.vxm", "-o", "-", "--frames", "1-2"}, "several pictures"},
        {{"render", "m.vxm", "-o", "x.png", "--frame", "0"}, "--frame N"},
        {{"render", "m.vxm", "-o", "x.png", "--frame", "1x"}, "--frame N"},
        {{"render", "m.vxm", "-o", "x.png", "--frame", "99999999999"}, "--frame N"},
        {{"render", "m.vxm", "-o", "x.png", "--frame", "1", "--frames", "1-1"}, "--frame N"},
        {{"render", "m.vxm", "-o", "x%d.png", "--frames", "3-2"}, "--frames A-B"},
        {{"render", "m.vxm", "-o", "x.png", "--size", "10"}, "--size"},
        {{"render", "m.vxm", "-o", "x.png", "--size", "0x5"}, "--size"},
        {{"render", "m.vxm", "-o", "x.png", "--size", "8193x5"}, "--size"},
        {{"render", "m.vxm", "-o", "x.png", "--quality", "medium"}, "--quality"},
        {{"render", "m.vxm", "-o", "x.png", "--background", "red"}, "--background"},
        {{"render", "m.vxm", "-o", "x.png", "--background", "#12345g"}, "--background"},
        {{"info"}, "one movie"},
        {{"info", "--xml", "m.vxm"}, "unknown option --xml"},
        {{"dump", "m.vxm", "m.vxm"}, "one movie"},
    };
    for (const auto& c : cases)
        Expect(c.words, 2, c.said);
    EXPECT_EQ(Words{"m.vxm"}, Files());
}

TEST_F(Errors, OfTheMovie)
{
    const std::vector<U8> good = StripMovie(3);
    std::vector<U8> wrong = good;
    wrong[2] = 'Y';
    std::vector<U8> header(good.begin(), good.begin() + 12);
    const struct {
        std::vector<U8> bytes;
        int code;
        const char* said;
    } cases[] = {
        {{}, 3, "it is empty"},
        {wrong, 3, "not a VXM movie"},
        {{'M', 'Z'}, 3, "not a VXM movie\n"},
        {{'M', 'V', 'X', 5, 40, 0, 0}, 3, "its header ends after 7 bytes"},
        {Header(7), 3, "declares a length of 7 bytes"},
        {Header(0x80000000u), 3, "declares a length of 2147483648 bytes"},
        {Header(8), 3, "its header ends after 8 bytes"},
        {header, 3, "its header ends after 12 bytes"},
        {Header(0x7FFFFFFF), 5, "beyond the limit"},
    };
    for (const auto& c : cases) {
        Write("m.vxm", c.bytes);
        Expect({"render", "m.vxm", "-o", "x.png"}, c.code, c.said);
        Expect({"info", "m.vxm"}, c.code, c.said);
        Expect({"dump", "m.vxm"}, c.code, c.said);
        EXPECT_EQ(Words{"m.vxm"}, Files());
    }
    Expect({"info", "none.vxm"}, 3, "vexel: none.vxm: No such file");
    Expect({"render", ".", "-o", "x.png"}, 3, "vexel: .: Is a directory");
    Expect({"dump", "--", "-odd\nname"}, 3, "vexel: -odd?name: No such file");
}

TEST_F(Errors, OfTheArea)
{
    const struct {
        Box frame;
        int code;
        const char* said;
    } cases[] = {{{0, 0, 0, 200}, 1, "its area is empty"},
                 {{400, 0, 0, 200}, 1, "its area is empty"},
                 {{0, 8193 * 20, 0, 200}, 5, "8193x10 pixels is beyond the limit"}};
    for (const auto& c : cases) {
        MovieWriter movie(c.frame, Fps(10));
        movie.Show().End();
        Write("m.vxm", movie.Bytes());
        Expect({"render", "m.vxm", "-o", "x.png"}, c.code, c.said);
        EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "x.png", "--size", "5x5"}).code);
        RunShell("rm x.png");
    }
}

// Any bytes behind a right header: the listings end, and with nothing worse than a complaint.
TEST_F(Errors, SpoiltMoviesAreListedAllTheSame)
{
    TagWriter sprite;
    sprite.Place(1, 1).Show().End();
    MovieWriter movie(600, 600, Fps(10));
    ShapeBuilder shape;
    shape.Styles(0, shape.AddFill(Rgba{1, 2, 3, 255}), shape.AddLine({20, {4, 5, 6, 255}}));
    shape.Circle(300, 300, 200);
    movie.Background({1, 2, 3, 255}).DefineShape(1, shape).DefineSprite(2, sprite).Label("here");
    movie.Place2(1, {.character = U16(2), .name = "a"}).Show(3).End();
    const std::vector<U8> good = movie.Bytes();
    U32 seed = 12345;
    for (int round = 0; round < 25; round++) {
        std::vector<U8> bytes = good;
        for (int i = 0; i < 6; i++) {
            seed = seed * 1664525 + 1013904223;
            bytes[20 + (seed >> 8) % (bytes.size() - 20)] = U8(seed >> 24);
        }
        Write("m.vxm", bytes);
        EXPECT_EQ(0, Run({"dump", "m.vxm"}).code);
        EXPECT_EQ(0, Run({"info", "--json", "m.vxm"}).code);
        EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "x.png", "--frame", "4"}).code);
    }
}

} // namespace
