// Image tags: which pixels they come to, broken ones too, and how long the pixels live.
#include "core/player/limits.h"
#include "tests/stream/stream_scene.h"
#include "tests/support/image_writer.h"

#include <gtest/gtest.h>

using Words = std::vector<U32>;
using Bytes = std::vector<U8>;

// The image that the parts make together, as the tag of a movie that starts with another tag.
static Words Decode(int code, std::initializer_list<Bytes> parts, int first = 999, Bytes body = {})
{
    MovieWriter movie;
    ByteWriter image = ByteWriter().PutU16(1);
    for (const Bytes& part : parts)
        image.PutBytes(part);
    movie.Raw(first, body).Raw(code, image);
    StreamScene s(movie);
    s.movie.DrawFrame(0, false);
    SCharacter* ch = s.movie.FindCharacter(1);
    Words words;
    for (S32 i = 0; ScriptThread::BuildBits(ch) && i < ch->bitmap.width * ch->bitmap.height; i++)
        words.push_back(ch->bitmap.PixelWord(i % ch->bitmap.width, i / ch->bitmap.width));
    return words;
}

TEST(Images, LosslessPixelsAreThoseOfTheFile)
{
    const std::vector<Rgba> table = {{255, 0, 0, 255}, {200, 100, 50, 100}, {1, 2, 3, 0}};
    for (int format = 0; format < 4; format++) {
        const ImageSource image = {2, 2, {1, 0, 0, format ? 3u : 0}, format, table};
        const U32 red = 0xFFFF0000, last = format ? 0 : red; // 3 is beyond the table
        EXPECT_EQ(Decode(20, {LosslessBody(image, false)}), (Words{0xFFC86432, red, red, last}));
        EXPECT_EQ(Decode(36, {LosslessBody(image, true)}), (Words{0x64646432, red, red, last}));
    }
    const Bytes words = LosslessBody({1, 2, {12 << 10 | 3 << 5 | 28, 0x801F}, 4}, false);
    EXPECT_EQ(Decode(20, {words}), (Words{0xFF5F1FDF, 0xFF0000FF}));
    const ImageSource deep = {3, 1, {0x80FF4020, 0x00123456, 0x40000001}};
    EXPECT_EQ(Decode(36, {LosslessBody(deep, true)}), (Words{0x80804020, 0, 0x40000001}));
    const Bytes plain = LosslessBody(deep, false), cut = {plain.begin(), plain.end() - 9};
    EXPECT_EQ(Decode(20, {cut}), (Words{0xFFFF4020, 0xFF123456, 0}));
    for (Bytes head : {Bytes{5, 0, 0, 9, 0}, Bytes{6, 9, 0, 9, 0}, Bytes{5, 255, 255, 255, 255}})
        EXPECT_EQ(Decode(20, {head, Deflated(Bytes(99))}), Words());
}

TEST(Images, JpegRoutesAgree)
{
    ImageSource image = {40, 48, {}};
    for (U32 i = 0; i < 40 * 48; i++)
        image.pixels.push_back(0xFF400000u + (i % 40 * 2 << 8) + i / 40 * 3);
    const JpegStreams jpeg = MakeJpeg(image), scans = MakeJpeg(image, true);
    const Words want = Decode(21, {jpeg.whole});
    for (size_t i = 0; i < image.pixels.size() * 3; i++)
        ASSERT_NEAR(want.at(i / 3) >> i % 3 * 8 & 255, image.pixels[i / 3] >> i % 3 * 8 & 255, 9);
    EXPECT_EQ(Decode(6, {jpeg.image}, 8, jpeg.tables), want);
    EXPECT_EQ(Decode(6, {jpeg.whole}, 8), want);
    EXPECT_EQ(Decode(21, {jpeg.tables, jpeg.image}), want);
    EXPECT_EQ(Decode(21, {{0xFF, 0xD9, 0xFF, 0xD8}, jpeg.whole}), want) << "marks before it";
    EXPECT_EQ(Decode(21, {scans.whole}), want) << "the same coefficients in scans";
    EXPECT_EQ(Decode(21, {MakeJpeg(image, false, true).whole}), Words()) << "four inks";
    EXPECT_EQ(Decode(6, {jpeg.whole}), Words()) << "no tables";
    EXPECT_EQ(Decode(21, {{jpeg.whole.begin(), jpeg.whole.end() - 40}}).at(450), want[450]);
    const Bytes torn(scans.whole.begin(), scans.whole.end() - 2);
    EXPECT_EQ(Decode(21, {torn, {0xFF, 0xC4, 0, 1}}), want) << "a break behind a scan";
    const Bytes size = {U8(jpeg.whole.size()), U8(jpeg.whole.size() >> 8), 0, 0};
    const Words veiled = Decode(35, {size, jpeg.whole, Deflated({0, 1})});
    EXPECT_EQ((Words{veiled[0], veiled[1] >> 16, veiled[2]}), (Words{0, 0x101, want[2]}));
}

TEST(Images, PixelsStayWhileTheyAreUsed)
{
    gLimits.movieBitmapPixels = 600; // one small image and a bit
    const Bytes body = LosslessBody({2, 2, {0xFF000080, 0xFF000040, 0, 0xFF0000C0}}, true);
    MovieWriter movie;
    movie.Raw(36, ByteWriter().PutU16(1).PutBytes(body));
    movie.Raw(36, ByteWriter().PutU16(2).PutBytes(body));
    StreamScene s(movie);
    s.movie.DrawFrame(0, false);
    SCharacter *first = s.movie.FindCharacter(1), *second = s.movie.FindCharacter(2);
    EXPECT_TRUE(s.movie.BuildBits(first));
    first->bitmap.useCount++;
    EXPECT_FALSE(s.movie.BuildBits(second)) << "no room";
    first->bitmap.useCount--;
    EXPECT_TRUE(s.movie.BuildBits(second) && !first->bitmap.baseAddr) << "room is made";
    s.list.pixelsLeft = 100;
    EXPECT_FALSE(s.movie.BuildBits(first)) << "enough for one repaint";
    s.list.pixelsLeft = 1000;
    EXPECT_TRUE(s.movie.BuildBits(first));
    gLimits = {};
    RGBI c;
    first->bitmap.GetSSRGBPixel(0x2000, 0x2000, &c);
    EXPECT_EQ(c, (RGBI{104, 0, 0, 223}));
}
