// What `vexel render` writes besides PNG, read back and compared with the PNG sequence.
#include "tests/tools/tool.h"

#include <zlib.h>

namespace {

// 31 x 21 pixels, 30 frames a second (33 ms): a square half transparent in pictures 1 to 3, opaque
// from 4 on beside another; picture 5 stands for two, and the other is gone in 7 and 8.
std::vector<U8> Squares()
{
    MovieWriter m(31 * 20, 21 * 20, Fps(30));
    m.DefineShape(1, Square({255, 0, 0, 255})).Place2(1, {.character = U16(1)});
    m.Move(1, Mat::Translate(20, 20), Cx::Alpha(0.6)).Show().Move(1, Mat::Translate(80, 60)).Show();
    m.Move(1, Mat::Translate(380, 200)).Show().Move(1, Mat::Translate(40, 60), Cx::Alpha(1));
    m.Place(1, 2, Mat::Translate(380, 200)).Show().Move(1, Mat::Translate(60, 60)).Show(2);
    m.RemoveDepth(2).Show(2).End();
    return m.Bytes();
}

// Of two pictures the first has a bar on the left edge, and the second a longer one.
std::vector<U8> Bars()
{
    MovieWriter m(31 * 20, 21 * 20, Fps(30));
    m.DefineShape(1, Square()).Place(1, 1, Mat::Translate(-180, 140)).Show();
    m.Place(1, 2, Mat::Translate(-180, -40)).Place(1, 3, Mat::Translate(-180, 240)).Show().End();
    return m.Bytes();
}

constexpr size_t kBytes = 31 * 21 * 4; // of a picture

// Draws the images of an animated PNG over each other: R, G, B, A of a picture for each 33 ms.
std::string PlayApng(const std::string& bytes)
{
    const auto Number = [](auto& s, size_t i) { return size_t(U8(s[i]) << 8 | U8(s[i + 1])); };
    const size_t depth = bytes[25] == 6 ? 4 : 3;
    std::string canvas(kBytes, '\0'), shown, control, chunk;
    for (size_t at = 33; at < bytes.size(); at += chunk.size() + 8) {
        chunk = bytes.substr(at + 4, Number(bytes, at + 2) + 4);
        control = chunk.compare(0, 4, "fcTL") == 0 ? chunk : control;
        if (chunk.compare(2, 2, "AT") != 0)
            continue;
        const size_t start = chunk[0] == 'f' ? 8 : 4, w = Number(control, 10);
        std::string rows(Number(control, 14) * (w * depth + 1), '\1');
        uLongf n = rows.size();
        uncompress((U8*)rows.data(), &n, (const U8*)chunk.data() + start, chunk.size() - start);
        for (size_t i = 0; i < w * Number(control, 14); i++) {
            const size_t x = i % w + Number(control, 18), y = i / w + Number(control, 22);
            const std::string pixel = rows.substr(i * depth + i / w + 1, depth) + '\xff';
            if (control[29] == 0 || pixel[3] != 0)
                canvas.replace((y * 31 + x) * 4, 4, pixel, 0, 4);
        }
        for (size_t ms = Number(control, 24); ms > 0; ms -= 33)
            shown += canvas;
    }
    return shown;
}

// In the GIF pictures 6 and 8 are no images of their own.
TEST_F(Tool, ExportsWhatItRenders)
{
    Write("../m", Squares());
    const std::string wide = Run("render ../m -o - --format rgba").out;
    const std::string words = Run("render ../m -o - --format rgb565").out;
    ASSERT_EQ(wide.size(), 2 * words.size());
    for (size_t i = 0; i < wide.size(); i += 4) {
        const U32 word = U8(words[i / 2]) | U32(U8(words[i / 2 + 1])) << 8;
        ASSERT_EQ((wide[i] & 0xF8u) << 8 | (wide[i + 1] & 0xFCu) << 3 | U8(wide[i + 2]) >> 3, word);
    }
    EXPECT_EQ(std::string(31, '\xd7'), Run("render ../m -o - --format pal8").out.substr(0, 31));
    const std::string head = "YUV4MPEG2 W31 H21 F1000:33 Ip A1:1 C420jpeg XCOLORRANGE=LIMITED\n";
    const std::string video = Run("render ../m --format=y4m -o -").out;
    ASSERT_EQ(head.size() + 8 * (6 + 651 + 2 * 16 * 11), video.size());
    EXPECT_EQ(head + "FRAME\n\xeb", video.substr(0, head.size() + 7));
    const char* red = &video[head.size() + 3 * 1009 + 6];
    EXPECT_EQ("\x51\x5a\xf0", std::string({red[160], red[651 + 51], red[651 + 176 + 51]}));

    const char* decode = "ffmpeg -v error -i x.gif -vsync 0 -f rawvideo -pix_fmt rgba -";
    const bool skip = Shell("command -v ffmpeg").code != 0;
    for (const std::string more : {"", " --background transparent"}) {
        std::string delays, want = Run("render ../m -o - --format rgba" + more).out;
        EXPECT_EQ(more.empty() ? "\xff\x66\x66\xff" : std::string("\xff\0\0\x99", 4),
                  want.substr(128, 4));
        EXPECT_TRUE(want == PlayApng(Run("render ../m -o - --format apng" + more).out)) << more;
        Run("render ../m -o x.gif" + more);
        for (size_t at = 0; (at = Read("x.gif").find("!\xf9\4", at + 1)) != std::string::npos;)
            delays += std::to_string(Read("x.gif")[at + 4]);
        EXPECT_EQ("343376", delays) << "hundredths, in all 26";
        want = want.erase(5 * kBytes, kBytes).substr(0, 6 * kBytes);
        const std::string got = skip ? want : Shell(decode).out;
        ASSERT_EQ(want.size(), got.size());
        for (size_t i = 0; i < want.size() && !skip; i += 4)
            ASSERT_EQ(0, U8(want[i + 3]) > 127 ? want.compare(i, 3, got, i, 3) : got[i + 3]);
    }
    Write("../m", Bars());
    const std::string bars = "render ../m --background transparent -o - --format ";
    EXPECT_TRUE(Run(bars + "rgba").out == PlayApng(Run(bars + "apng").out));
    if (skip)
        GTEST_SKIP() << "ffmpeg is not installed: no GIF is decoded";
}

TEST_F(Tool, ExportsAllOrNothing)
{
    Write("../m", Squares());
    const std::string fake = "f() { printf '#!/bin/sh\n%s' \"$1\" >../ffmpeg; chmod +x ../ffmpeg;"
                             "PATH=$PWD/..:$PATH $vexel render ../m -o ${2:--x.mp4}; }; ";
    const std::pair<std::string, std::string> cases[] = {
        {"PATH= $vexel render ../m -o x.webm", "x.webm: writing it takes ffmpeg"},
        {fake + "f 'echo \"[x @ 1] odd\nb\" >&2; cat; exit 1'", "-x.mp4: ffmpeg: odd\n"},
        {"$vexel render ../m -o /dev/full --format gif", "/dev/full: cannot write: "},
        {"{ $vexel render ../m -o - --format rgba --size 999x999; echo $? >../code; } | true; "
         "exit $(cat ../code)",
         "-: cannot write: "},
        {"ulimit -f 1; $vexel render ../m -o x.y4m", "x.y4m: cannot write: "}};
    for (const auto& [line, said] : cases) {
        const Outcome outcome = Shell(line);
        EXPECT_EQ(0u, outcome.err.find("vexel: " + said)) << outcome.err;
        EXPECT_EQ("1", std::to_string(outcome.code) + Files()) << line;
    }
    for (const char* takesAll : {"f 'for last; do :; done; wc -c >\"${last#file:}\"'; cat ./-x.mp4",
                                 "f 'wc -c' '/dev/stdout --format mp4' | cat"})
        EXPECT_EQ(std::to_string(8 * 32 * 22 * 4) + "\n", Shell(fake + takesAll).out);
    const std::string noWait = "{ dd oflag=nonblock status=none; $vexel render ../m -o - --format ";
    EXPECT_EQ(std::to_string(8 * 999 * 999 * 4) + "\n",
              Shell(noWait + "rgba --size 999x999; } | { sleep 0.2; wc -c; }").out);
    Shell("ln -s ../trap y.png.$$.part; exec $vexel render ../m -o y.png");
    EXPECT_FALSE(Read("y.png").empty() || !Read("../trap").empty()) << Files();
}

} // namespace
