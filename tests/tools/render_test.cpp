#include "tests/tools/tool_runner.h"

#include <png.h>

#include <algorithm>
#include <cstdlib>

namespace {

using Words = std::vector<std::string>;

// Pixels as they stand in the file: red, green, blue, alpha, not multiplied.
std::vector<U8> RawPng(const std::string& path, U32* format)
{
    png_image image = {};
    image.version = PNG_IMAGE_VERSION;
    if (!png_image_begin_read_from_file(&image, path.c_str()))
        return {};
    *format = image.format;
    image.format = PNG_FORMAT_RGBA;
    std::vector<U8> bytes(PNG_IMAGE_SIZE(image));
    png_image_finish_read(&image, nullptr, bytes.data(), 0, nullptr);
    return bytes;
}

class Render : public ToolTest {
protected:
    // The column where the square begins in a picture of StripMovie, or -1. Its sides may lie a
    // part of a pixel off, so that they are half red.
    static int SquareAt(const Picture& picture)
    {
        for (int x = 0; x < picture.width; x++) {
            if ((picture.At(x, 5) & 0xFF) < 100)
                return x;
        }
        return -1;
    }
    // The first n bytes of a movie.
    static std::vector<U8> Cut(std::vector<U8> movie, size_t n)
    {
        movie.resize(n);
        return movie;
    }
    // Bytes up to the end of frame n, counted from 1.
    static size_t EndOfFrame(int n, const std::vector<U8>& movie)
    {
        size_t at = 0;
        for (; n > 0; n--, at += 2) {
            const U8 showFrame[] = {0x40, 0x00};
            at = size_t(
                std::search(movie.begin() + ptrdiff_t(at), movie.end(), showFrame, showFrame + 2) -
                movie.begin());
        }
        return at;
    }
};

TEST_F(Render, NamesAndPicturesOfASequence)
{
    Write("m.vxm", StripMovie(12));
    EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "p%04d.png"}).code);
    EXPECT_EQ(13u, Files().size());
    EXPECT_EQ(0, SquareAt(Load("p0001.png")));
    EXPECT_EQ(44, SquareAt(Load("p0012.png")));
    EXPECT_EQ(0, Run({"render", "--frames=3-4", "m.vxm", "-o", "a%%%d.png"}).code);
    EXPECT_EQ(8, SquareAt(Load("a%3.png")));
    EXPECT_EQ(12, SquareAt(Load("a%4.png")));
    EXPECT_FALSE(Exists("a%5.png"));
}

// Picture N follows N - 1 ticks: after the last frame comes the first.
TEST_F(Render, OnePictureAtAnyTime)
{
    Write("m.vxm", StripMovie(5));
    const struct {
        const char* frame;
        int square;
    } cases[] = {{"1", 0}, {"2", 4}, {"5", 16}, {"6", 0}, {"13", 8}};
    for (const auto& c : cases) {
        EXPECT_EQ(0, Run({"render", "m.vxm", "--frame", c.frame, "-o", "x.png"}).code);
        EXPECT_EQ(c.square, SquareAt(Load("x.png"))) << c.frame;
    }
    EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "x.png"}).code);
    EXPECT_EQ(0, SquareAt(Load("x.png")));
}

TEST_F(Render, SizeQualityAndBackground)
{
    Write("m.vxm", StripMovie(2));
    EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "x.png", "--size=120x80", "--quality=low",
                      "--background", "#0a0B0c"})
                     .code);
    const Picture picture = Load("x.png");
    EXPECT_EQ(120, picture.width);
    EXPECT_EQ(80, picture.height);
    EXPECT_EQ(0xFF0A0B0Cu, picture.At(60, 60));
    EXPECT_EQ(0xFFFF0000u, picture.At(18, 18));
    EXPECT_EQ(0xFF0A0B0Cu, picture.At(21, 21));
}

TEST_F(Render, TransparentPicturesKeepTheirColours)
{
    ShapeBuilder squares;
    squares.Styles(0, squares.AddFill(Rgba{250, 130, 7, 128})).Rect(0, 0, 200, 200);
    squares.Styles(0, squares.AddFill(Rgba{1, 2, 3, 255})).Rect(200, 0, 400, 200);
    MovieWriter movie(30 * 20, 10 * 20);
    movie.Background({9, 9, 9, 255}).DefineShape(1, squares).Place(1, 1).Show().End();
    Write("m.vxm", movie.Bytes());
    EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "t.png", "--background", "transparent"}).code);
    U32 format = 0;
    const std::vector<U8> raw = RawPng(PathOf("t.png"), &format);
    ASSERT_EQ(30u * 10 * 4, raw.size());
    EXPECT_TRUE(format & PNG_FORMAT_FLAG_ALPHA);
    const auto pixel = [&](size_t x) {
        const U8* p = &raw[4 * (30 * 5 + x)];
        return std::vector<int>(p, p + 4);
    };
    EXPECT_EQ((std::vector<int>{0, 0, 0, 0}), pixel(25));
    EXPECT_EQ((std::vector<int>{1, 2, 3, 255}), pixel(15));
    const int want[] = {250, 130, 7, 128};
    for (size_t i = 0; i < 4; i++)
        EXPECT_NEAR(want[i], pixel(5)[i], 2) << i; // one unit is lost by storing multiplied values
    EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "o.png"}).code);
    RawPng(PathOf("o.png"), &format);
    EXPECT_FALSE(format & PNG_FORMAT_FLAG_ALPHA);
}

TEST_F(Render, StandardInputAndOutput)
{
    const std::vector<U8> movie = StripMovie(3);
    Write("m.vxm", movie);
    EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "x.png"}).code);
    const Outcome piped = Run({"render", "-", "-o", "-"}, movie);
    EXPECT_EQ(0, piped.code);
    EXPECT_EQ(Read("x.png"), piped.out);
    EXPECT_EQ("", piped.err);
}

TEST_F(Render, PicturesDoNotDependOnHowDataCame)
{
    Write("m.vxm", StripMovie(4));
    EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "a%d.png"}).code);
    EXPECT_EQ(0, RunShell("dd if=m.vxm bs=1 2>/dev/null | $vexel render - -o b%d.png").code);
    for (const char* n : {"1", "2", "3", "4"})
        EXPECT_EQ(Read(std::string("a") + n + ".png"), Read(std::string("b") + n + ".png")) << n;
    EXPECT_FALSE(Exists("b5.png"));
}

// The pipe stays open until each picture has appeared; a program that waited for more data than
// that picture needs would never write it.
TEST_F(Render, WritesPicturesWhileThePipeIsOpen)
{
    const std::vector<U8> movie = StripMovie(3);
    Write("m.vxm", movie);
    std::string feeder;
    size_t at = 0;
    for (int n = 1; n <= 3; n++) {
        const size_t end = EndOfFrame(n, movie);
        feeder += "tail -c +" + std::to_string(at + 1) + " m.vxm | head -c " +
                  std::to_string(end - at) + "; i=0; while [ ! -e p" + std::to_string(n) +
                  ".png ] && [ $i -lt 200 ]; do sleep 0.05; i=$((i+1)); done; [ -e p" +
                  std::to_string(n) + ".png ] || echo late >&2; ";
        at = end;
    }
    feeder += "tail -c +" + std::to_string(at + 1) + " m.vxm";
    const Outcome outcome = RunShell("{ " + feeder + "; } | $vexel render - -o p%d.png");
    EXPECT_EQ(0, outcome.code);
    EXPECT_EQ("", outcome.err);
    EXPECT_EQ((Words{"m.vxm", "p1.png", "p2.png", "p3.png"}), Files());
}

TEST_F(Render, TruncatedMoviesGiveWhatIsComplete)
{
    const std::vector<U8> movie = StripMovie(6);
    Write("m.vxm", Cut(movie, EndOfFrame(3, movie) + 3));
    const std::string said = "vexel: m.vxm: truncated: 3 of 6 frames are complete (" +
                             std::to_string(EndOfFrame(3, movie) + 3) + " of " +
                             std::to_string(movie.size()) + " bytes)\n";
    const struct {
        Words words;
        int code;
        size_t pictures;
    } cases[] = {{{"-o", "p%d.png"}, 1, 3},
                 {{"-o", "p%d.png", "--frames", "2-6"}, 1, 2},
                 {{"-o", "p%d.png", "--frames", "2-3"}, 0, 2},
                 {{"-o", "p.png", "--frame", "4"}, 1, 0},
                 {{"-o", "p.png"}, 0, 1}};
    for (const auto& c : cases) {
        Words words = {"render", "m.vxm"};
        words.insert(words.end(), c.words.begin(), c.words.end());
        const Outcome outcome = Run(words);
        EXPECT_EQ(c.code, outcome.code);
        EXPECT_EQ(said, outcome.err);
        EXPECT_EQ(1 + c.pictures, Files().size());
        RunShell("rm -f p*.png");
    }
    const Outcome nothing = Run({"render", "-", "-o", "p.png"}, Cut(movie, 30));
    EXPECT_EQ(1, nothing.code);
    EXPECT_NE(std::string::npos, nothing.err.find("truncated: 0 of 6 frames"));
}

// A pass ends where the frames do, whatever the header promises.
TEST_F(Render, HeadersMayLieAboutTheFrames)
{
    for (U16 promised : {U16(1), U16(65535)}) {
        MovieWriter movie(200, 200, Fps(10), promised);
        movie.Show(4).End();
        Write("m.vxm", movie.Bytes());
        EXPECT_EQ(0, Run({"render", "m.vxm", "-o", "p%d.png"}).code);
        EXPECT_EQ(5u, Files().size()) << promised;
    }
}

// A file too large to write leaves neither a part of itself nor harm to the one that was there.
TEST_F(Render, FailingWritesLeaveNothing)
{
    Write("m.vxm", StripMovie(2));
    Write("x.png", {'o', 'l', 'd'});
    const Outcome outcome =
        RunShell("trap '' XFSZ; ulimit -f 1; $vexel render m.vxm --size 3000x3000 -o x.png");
    EXPECT_EQ(1, outcome.code);
    EXPECT_NE(std::string::npos, outcome.err.find("vexel: x.png: cannot write: "));
    EXPECT_EQ("old", Read("x.png"));
    EXPECT_EQ((Words{"m.vxm", "x.png"}), Files());
    EXPECT_EQ(1, RunShell("$vexel render m.vxm -o - >/dev/full").code);
    EXPECT_EQ(1, RunShell("$vexel info m.vxm >/dev/full").code);
    EXPECT_EQ(1, RunShell("ln -s /dev/full full.png; $vexel render m.vxm -o full.png").code);
    EXPECT_EQ(1, RunShell("mkdir d.png; $vexel render m.vxm -o d.png").code);
    EXPECT_EQ(1, RunShell("$vexel render m.vxm -o none/x.png").code);
}

TEST_F(Render, FollowsLinksToTheFile)
{
    Write("m.vxm", StripMovie(2));
    EXPECT_EQ(0, RunShell("mkdir there; : >there/x.png; ln -s there/x.png x.png; "
                          "$vexel render m.vxm -o x.png; [ -L x.png ]")
                     .code);
    EXPECT_EQ(60, Load("there/x.png").width);
}

TEST_F(Render, ProgressOnlyWhenAskedFor)
{
    Write("m.vxm", StripMovie(2));
    EXPECT_EQ("", Run({"render", "m.vxm", "-o", "p%d.png"}).err);
    EXPECT_EQ("picture 1\npicture 2\n",
              Run({"render", "m.vxm", "-o", "p%d.png", "--progress"}).err);
}

} // namespace
