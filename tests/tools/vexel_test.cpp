// What the program says, lists, renders and refuses.
#include "tests/tools/tool.h"

#include <random>
#include <set>

namespace {

TEST_F(Tool, SaysOneLineAboutAnError)
{
    Write("../m", MovingSquare(3));
    for (S32 width : {0, 8193}) {
        MovieWriter movie(width * 20, 200);
        movie.Show(3).End();
        Write("../" + std::to_string(width), movie.Bytes());
    }
    const struct {
        const char* line;
        int code;
        const char* said;
    } cases[] = {
        {"$vexel", 2, "a command is missing"},
        {"$vexel play ../m", 2, "unknown command play"},
        {"$vexel render ../m", 2, "needs an output"},
        {"$vexel render -o x.png", 2, "one movie"},
        {"$vexel render ../m -o", 2, "-o needs a value"},
        {"$vexel render ../m -o x.png --allow", 2, "unknown option --allow"},
        {"$vexel render ../m -o x.png --progress=yes", 2, "--progress takes no value"},
        {"$vexel render ../m -o x.BMP", 2, "no format goes by the extension .bmp: png, gif"},
        {"$vexel render ../m -o a.png/x", 2, "without extension"},
        {"$vexel render ../m -o %d%d.png", 2, "one number"},
        {"$vexel render ../m -o x.png --frames 1-2", 2, "several pictures"},
        {"$vexel render ../m -o x.png --frame 0", 2, "--frame N"},
        {"$vexel render ../m -o x.png --frame 1x", 2, "--frame N"},
        {"$vexel render ../m -o x.png --frame 99999999999", 2, "--frame N"},
        {"$vexel render ../m -o x.png --frame 1 --frames 1-1", 2, "--frame N"},
        {"$vexel render ../m -o x.gif --frame 1 --duration 1", 2, "--duration S"},
        {"$vexel render ../m -o x.gif --duration 0.0", 2, "--duration S"},
        {"$vexel render ../m -o x.png --duration 1", 2, "several pictures"},
        {"$vexel render ../m -o x%d.gif", 2, "takes no number"},
        {"$vexel render ../m -o - --format bmp", 2, "--format takes one of png, gif"},
        {"$vexel render ../m -o x.y4m --background transparent", 2, "cannot be transparent"},
        {"$vexel render ../m -o x%d.png --frames 3-2", 2, "--frames A-B"},
        {"$vexel render ../m -o x.png --size 0x5", 2, "--size"},
        {"$vexel render ../m -o x.png --size 8193x5", 2, "--size"},
        {"$vexel render ../m -o x.png --quality medium", 2, "--quality"},
        {"$vexel render ../m -o x.png --background '#12345g'", 2, "--background"},
        {"$vexel info", 2, "one movie"},
        {"$vexel info none", 3, "vexel: none: No such file"},
        {"$vexel render . -o x.png", 3, "vexel: .: Is a directory"},
        {"$vexel dump -- '-odd\nname'", 3, "vexel: -odd?name: No such file"},
        {"$vexel render - -o x.png", 3, "vexel: -: not a VXM movie: it is empty\n"},
        {"printf 'MVY\\5____' | $vexel info -", 3, "not a VXM movie\n"},
        {"printf MZ | $vexel render - -o x.png", 3, "not a VXM movie\n"},
        {"printf 'MVX\\5\\50\\0\\0' | $vexel dump -", 3, "its header ends after 7 bytes"},
        {"printf 'MVX\\5\\7\\0\\0\\0' | $vexel info -", 3, "a length of 7 bytes"},
        {"printf 'MVX\\5\\0\\0\\0\\200' | $vexel info -", 3, "a length of 2147483648 bytes"},
        {"printf 'MVX\\5\\10\\0\\0\\0' | $vexel dump -", 3, "its header ends after 8 bytes"},
        {"printf 'MVX\\5\\0\\0\\0\\177' | $vexel render - -o x.png", 5, "beyond the limit"},
        {"$vexel render ../0 -o x.png", 1, "its area is empty"},
        {"$vexel render ../8193 -o x.png", 5, "8193x10 pixels is beyond the limit"},
    };
    for (const auto& c : cases) {
        const Outcome outcome = Shell(c.line);
        EXPECT_EQ(c.code, outcome.code) << c.line;
        EXPECT_EQ("", outcome.out + Files()) << c.line;
        EXPECT_EQ(0u, outcome.err.find("vexel: ")) << outcome.err;
        EXPECT_NE(std::string::npos, outcome.err.find(c.said)) << c.line << "\n" << outcome.err;
        EXPECT_EQ(outcome.err.size() - 1, outcome.err.find('\n')) << outcome.err;
    }
    EXPECT_EQ(0, Run("render ../0 -o x.png --size 5x5").code);
}

// One of each tag that is listed with fields of its own.
std::vector<U8> Sampler()
{
    TagWriter sprite;
    sprite.Place(1, 1).Show().Label("inner").Show().End();
    ShapeBuilder shape;
    shape.AddFill(Fill::Bitmap(0x41, 7, Mat::Scale(3)));
    shape.Styles(shape.AddFill(Rgba{}), 0, shape.AddLine({})).LineTo(200, 0);
    shape.CurveTo(300, 100, 200, 200).NewStyles();
    shape.Fill0(shape.AddFill(Fill::Radial({}, {{0, {}}, {9, {}}}))).LineTo(0, 0);
    PlaceOptions all = {.character = U16(2), .cx = Cx::Alpha(0.5), .ratio = U16(5)};
    all.name = "caf\xe9";
    all.clipDepth = U16(9);
    MovieWriter movie(550 * 20, 400 * 20, Fps(12.5));
    movie.Background({255, 0, 16, 255}).DefineShape(1, 22, {-20, 320, -20, 220}, shape);
    movie.DefineSprite(2, sprite).DefineSprite(2, 7, {}).Label("st\"art").Show();
    movie.Place(1, 3, Mat::Translate(40, -60)).DoAction({7, 0}).FreeCharacter(2).Show();
    movie.Place2(4, all).Move(3, Mat{0x18000, 0, 0, 0x8000, 1, 2});
    movie.Remove(1, 3).RemoveDepth(4).DefineSprite(2, 8, {}).Raw(500, {1, 2, 3}).Show().End();
    return movie.Bytes();
}

TEST_F(Tool, Lists)
{
    Write("../m", Sampler());
    const std::pair<const char*, std::vector<const char*>> cases[] = {
        {"$vexel --version", {"vexel 0."}},
        {"$vexel --help", {"vexel render", "vexel state", "vexel info", "vexel dump", "--background"}},
        {"$vexel dump ../m",
         {"       0  header version=5", "frame=0,11000,0,8000 rate=12.5 frames=3\n",
          "      21  SetBackgroundColor code=9 length=3 color=#ff0010\n",
          "id=1 bounds=-20,320,-20,220 fills=3 lines=1 edges=3\n",
          "  DefineSprite code=39 length=25 id=2 frames=2\n",
          "    PlaceObject code=4 length=5 id=1 depth=1 matrix=identity\n",
          "    FrameLabel code=43 length=6 label=\"inner\"\n", "label=\"st\\\"art\"\n",
          "id=1 depth=3 matrix=1,0,0,1,40,-60\n", "FreeCharacter code=3 length=2 id=2\n",
          "flags=0x7a depth=4 id=2 cxform=r*256+0,g*256+0,b*256+0,a*128+0 ratio=5 "
          "name=\"caf\\xe9\" clip=24931\n",
          "flags=0x05 depth=3 move matrix=1.5,0,0,0.5,1,2\n",
          "RemoveObject code=5 length=4 id=1 depth=3\n", "RemoveObject2 code=28 length=2 depth=4\n",
          "Tag500 code=500 length=3\n", "  End code=0 length=0\n"}},
        {"$vexel info ../m",
         {"version   5\n", "size      550x400 pixels (0,11000,0,8000 twips)\n",
          "rate      12.5 frames a second\nframes    3\ntags\n", "      5  ShowFrame\n",
          "      1  Tag500\nlabels\n      1  \"st\\\"art\"\ncharacters\n"
          "      1  shape   DefineShape2  -20,320,-20,220 twips\n"
          "      2  sprite  DefineSprite  2 frames\n      2  sprite  DefineSprite  8 frames\n"}},
        {"ln ../m '../m\"\xe9'; $vexel info --json '../m\"\xe9'",
         {R"({"schema":1,"file":"../m\"\u00e9","version":5,"length":)",
          R"(,"truncated":false,"size":[550,400],"frame":[0,11000,0,8000],"rate":12.5,)"
          R"("frames":3,"framesFound":3,"tags":{"End":2,"ShowFrame":5,"FreeCharacter":1,)"
          R"("PlaceObject":2,"RemoveObject":1,"SetBackgroundColor":1,"DoAction":1,)"
          R"("DefineShape2":1,"PlaceObject2":2,"RemoveObject2":1,"DefineSprite":3,)"
          R"("FrameLabel":2,"Tag500":1},"labels":[{"frame":1,"name":"st\"art"}],)"
          R"("characters":[{"id":1,"type":"shape","tag":"DefineShape2","code":22,)"
          R"("bounds":[-20,320,-20,220]},{"id":2,"type":"sprite","tag":"DefineSprite",)"
          R"("code":39,"frames":2},{"id":2,)"
          R"("type":"sprite","tag":"DefineSprite","code":39,"frames":8}],"streams":[]})"}},
        {"head -c 40 ../m | $vexel info --json -", {R"("bytes":40,"truncated":true,)"}},
        {"head -c 40 ../m | $vexel dump - 2>../said; cat - ../said",
         {"\n      26  incomplete: 14 bytes\n",
          "vexel: -: truncated: 0 of 3 frames are complete (40 of "}},
    };
    for (const auto& [line, parts] : cases) {
        const Outcome outcome = Shell(line);
        EXPECT_EQ(0, outcome.code) << line;
        size_t at = 0;
        for (const std::string part : parts) {
            at = outcome.out.find(part, at);
            ASSERT_NE(std::string::npos, at) << part << "\nis not in\n" << outcome.out;
            at += part.size();
        }
    }
}

// Any bytes behind a right header: the programs end, and with nothing worse than a complaint.
TEST_F(Tool, ListsSpoiltMovies)
{
    std::mt19937 dice(12345);
    for (int round = 0; round < 25; round++) {
        std::vector<U8> bytes = Sampler();
        for (int i = 0; i < 6; i++)
            bytes[20 + dice() % (bytes.size() - 20)] = U8(dice());
        Write("../m", bytes);
        for (const char* words : {"dump ../m", "info ../m", "render ../m -o x.png --frame 4"})
            EXPECT_EQ(0, Run(words).code) << words << " " << round;
    }
}

// Picture N follows N - 1 ticks: after the last frame comes the first. A pass ends where the frames
// do, whatever the header promises.
TEST_F(Tool, RendersThePicturesAskedFor)
{
    Write("../m", MovingSquare(5));
    MovieWriter promising(200, 200, Fps(10), U16(65535));
    promising.Show(2).End();
    Write("../promising", promising.Bytes());
    std::vector<U8> cut = MovingSquare(6);
    cut.resize(MovingSquare(3).size() + 1);
    Write("../cut", cut);
    const struct {
        const char* words;
        int code;
        const char* files;
        int frame; // in the last of them, when it is looked at
    } cases[] = {{"../m -o x.png", 0, "x.png", 1},
                 {"../m -o x.PNG --frame 5", 0, "x.PNG", 5},
                 {"../m -o x.png --frame 13", 0, "x.png", 3},
                 {"../m -o x%d.png", 0, "x1.png x2.png x3.png x4.png x5.png", 5},
                 {"../m -o x%%%04d.png --frames=5-6", 0, "x%0005.png x%0006.png", 1},
                 {"../promising -o %d.png", 0, "1.png 2.png", 0},
                 {"../cut -o %d.png", 1, "1.png 2.png 3.png", 3},
                 {"../cut -o %d.png --frames 2-6", 1, "2.png 3.png", 3},
                 {"../cut -o %d.png --frames 2-3", 0, "2.png 3.png", 3},
                 {"../cut -o x.png --frame 4", 1, "", 0}};
    for (const auto& c : cases) {
        EXPECT_EQ(c.code, Run(std::string("render ") + c.words).code) << c.words;
        const std::string files = Files();
        EXPECT_EQ(c.files, files);
        // Near the corner that no other frame's square covers.
        if (c.frame > 0) {
            const Picture last = Load(files.substr(files.rfind(' ') + 1));
            EXPECT_EQ(0xFFC81E1Eu, last.At(7 + 4 * c.frame, 16 + 2 * c.frame)) << c.words;
        }
        Shell("rm *");
    }
    EXPECT_EQ(0u, Run("render ../cut -o x.png").err.find("vexel: ../cut: truncated: 3 of 6 "));
    EXPECT_EQ("picture 1\npicture 2\n", Run("render ../m -o %d.png --frames 1-2 --progress").err);
}

// Colours are stored as they were before they were multiplied by alpha.
TEST_F(Tool, RendersAsAskedFor)
{
    MovieWriter movie(30 * 20, 20 * 20);
    movie.Background({9, 9, 9, 255}).DefineShape(1, Square({250, 130, 38, 200})).Place(1, 1);
    movie.Show().End();
    Write("../m", movie.Bytes());
    EXPECT_EQ(0, Run("render ../m -o t.png --background transparent").code);
    EXPECT_EQ(6, Read("t.png").at(25)) << "colour with alpha";
    EXPECT_EQ(0u, Load("t.png").At(25, 5));
    EXPECT_EQ(0xC8C4661Du, Load("t.png").At(5, 5));
    EXPECT_EQ(0,
              Run("render ../m -o o.png --size=99x80 --quality=low --background '#0a0B0c'").code);
    EXPECT_EQ(2, Read("o.png").at(25)) << "colour alone";
    const Picture picture = Load("o.png");
    EXPECT_EQ(99 * 80u, picture.pixels.size());
    EXPECT_EQ(0xFF0A0B0Cu, picture.At(60, 60));
    std::set<U32> colors(picture.pixels.begin(), picture.pixels.end());
    EXPECT_EQ(2u, colors.size()) << "nothing is smoothed";
}

// The pipe stays open until each picture has appeared; a program that waited for more data than
// that picture needs would never write it.
TEST_F(Tool, RendersFromPipesAtOnceAndTheSame)
{
    Write("../m", MovingSquare(3));
    std::string feed = "at=0; n=1; ";
    for (int n = 1; n <= 3; n++)
        feed += "end=" + std::to_string(MovingSquare(n).size() - 2) +
                "; tail -c +$((at + 1)) ../m | head -c $((end - at)); at=$end; "
                "timeout 10 sh -c \"until [ -e $n.png ]; do sleep 0.05; done\" || echo late >&2; "
                "n=$((n + 1)); ";
    EXPECT_EQ("", Shell("{ " + feed + " tail -c 2 ../m; } | $vexel render - -o %d.png").err);
    EXPECT_EQ("1.png 2.png 3.png", Files());
    const Outcome same =
        Shell("$vexel render ../m -o x%d.png; for n in 1 2 3; do cmp x$n.png $n.png;"
              "done; $vexel render - -o - <../m | cmp - 1.png");
    EXPECT_EQ("", same.out + same.err);
}

// A file too large to write leaves neither a part of itself nor harm to the one that was there.
TEST_F(Tool, WritesAllOrNothing)
{
    Write("../m", MovingSquare(2));
    const Outcome outcome = Shell("echo old >x.png; trap '' XFSZ; ulimit -f 1; "
                                  "$vexel render ../m --size 3000x3000 -o x.png");
    EXPECT_EQ(1, outcome.code);
    EXPECT_EQ(0u, outcome.err.find("vexel: x.png: cannot write: "));
    EXPECT_EQ("old\nx.png", Read("x.png") + Files());
    Shell("mkdir d.png; mkfifo f.png; : >../x.png; ln -s ../x.png l.png");
    for (const char* words : {"render ../m -o - >/dev/full", "info ../m >/dev/full",
                              "render ../m -o d.png", "render ../m -o none/x.png"})
        EXPECT_EQ(1, Run(words).code) << words;
    EXPECT_EQ(0, Run("render ../m -o l.png && [ -L l.png ]").code);
    EXPECT_EQ(100, Load("../x.png").width);
    const char* pipe = "timeout 10 cmp f.png ../x.png & $vexel render ../m -o f.png; "
                       "wait $! && [ -p f.png ]";
    EXPECT_EQ(0, Shell(pipe).code);
}

} // namespace
