#include "tests/support/movie_writer.h"
#include "tests/support/picture.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <filesystem>

namespace {

using Bytes = std::vector<U8>;

// Reads a string of zeros and ones, with blanks between fields, into bytes.
Bytes Bits(const std::string& text)
{
    Bytes bytes;
    int used = 0;
    for (char c : text) {
        if (c == ' ')
            continue;
        if (used++ % 8 == 0)
            bytes.push_back(0);
        bytes.back() |= U8((c - '0') << (7 - (used - 1) % 8));
    }
    return bytes;
}

struct Tag {
    int code = 0;
    bool isLong = false;
    Bytes body;
};

std::vector<Tag> Split(const Bytes& bytes, size_t at = 0)
{
    std::vector<Tag> tags;
    while (at + 2 <= bytes.size()) {
        U32 word = U32(bytes[at]) | U32(bytes[at + 1]) << 8;
        size_t length = word & 63;
        bool isLong = length == 63;
        at += 2;
        if (isLong) {
            length = bytes[at] | size_t(bytes[at + 1]) << 8 | size_t(bytes[at + 2]) << 16 |
                     size_t(bytes[at + 3]) << 24;
            at += 4;
        }
        auto body = bytes.begin() + std::ptrdiff_t(at);
        tags.push_back({int(word >> 6), isLong, Bytes(body, body + std::ptrdiff_t(length))});
        at += length;
    }
    EXPECT_EQ(bytes.size(), at);
    return tags;
}

Bytes ShapeBytes(const ShapeBuilder& shape, bool alpha)
{
    ByteWriter out;
    shape.Write(out, alpha);
    return out.Bytes();
}

} // namespace

TEST(ByteWriter, RecordsAreBitExact)
{
    EXPECT_EQ(Bits("00000 000"), ByteWriter().PutRect({}).Bytes());
    EXPECT_EQ(Bits("01010 0000000000 0101000000 0000000000 1111111111 000"),
              ByteWriter().PutRect({0, 320, 0, -1}).Bytes());
    EXPECT_EQ(Bits("0 0 00000 0"), ByteWriter().PutMatrix({}).Bytes());
    EXPECT_EQ(Bits("1 10001 00010000000000000 10000000000000000 0 00011 011 100 0000"),
              ByteWriter().PutMatrix({0x2000, 0, 0, -0x10000, 3, -4}).Bytes());
    EXPECT_EQ(Bits("0 1 01110 01000000000000 11000000000000 00000"),
              ByteWriter().PutMatrix({0x10000, 0x1000, -0x1000, 0x10000, 0, 0}).Bytes());
    EXPECT_EQ(Bits("00 0000 00"), ByteWriter().PutCx({}, true).Bytes());
    EXPECT_EQ(Bits("10 1001 000000000 011111111 111111111 100000001 000000"),
              ByteWriter().PutCx(Cx::Add(0, 255, -1, -255), true).Bytes());
    // Without alpha, an alpha multiplier is not written and does not count.
    EXPECT_EQ(Bits("00 0000 00"), ByteWriter().PutCx(Cx::Alpha(0.5), false).Bytes());
    EXPECT_EQ((Bytes{0x80, 'a', 0, 0x34, 0x12}),
              ByteWriter().UB(1, 1).PutString("a").PutU16(0x1234).Bytes());
}

TEST(ByteWriter, MatricesTurnClockwiseAndCombineInOrder)
{
    Mat turned = Mat::Rotate(90);
    EXPECT_EQ(0x10000, turned.b); // the x axis now points down
    EXPECT_EQ(-0x10000, turned.c);
    Mat both = Mat::Translate(10, 0).Then(Mat::Rotate(90)).Then(Mat::Scale(2));
    EXPECT_EQ(0, both.tx);
    EXPECT_EQ(20, both.ty);
    Mat down = Mat::Gradient(100, 200, 400, 50, 90); // the square's right edge is the bottom
    EXPECT_EQ(100, down.tx);
    EXPECT_EQ(200 + 200, down.ty + (S64(down.b) * 16384 >> 16));
}

TEST(ShapeWriter, EdgesAndSelectorsAreAsNarrowAsTheyCanBe)
{
    ShapeBuilder shape;
    shape.AddFill(Rgba{1, 2, 3, 4});
    shape.AddFill(Rgba{5, 6, 7, 8});
    shape.Fill1(2).MoveTo(-3, 4).LineTo(-3, 5).LineTo(4, 5).LineTo(0, 0).CurveTo(1, 0, 1, -1);
    Bytes want = {2, 0, 1, 2, 3, 0, 5, 6, 7, 0};
    Bytes records = Bits("0010 0000 0 00101 00100 1101 0100 10 "
                         "1 1 0000 0 1 01 1 1 0010 0 0 0111 1 1 0010 1 1100 1011 "
                         "1 0 0000 01 00 00 11 0 00000");
    want.insert(want.end(), records.begin(), records.end());
    EXPECT_EQ(want, ShapeBytes(shape, false));
    want.insert(want.begin() + 5, 4);
    want.insert(want.begin() + 10, 8);
    EXPECT_EQ(want, ShapeBytes(shape, true));
    Box box = shape.Bounds();
    EXPECT_EQ((std::vector<S32>{-3, 4, -1, 5}),
              (std::vector{box.xmin, box.xmax, box.ymin, box.ymax}));
}

TEST(ShapeWriter, NewStylesFollowTheOldSelectorsAndStartOnAByte)
{
    ShapeBuilder shape;
    int first = shape.AddFill(Rgba{9, 9, 9});
    shape.Fill1(first).MoveTo(0, 0).LineTo(1, 0).Fill1(0).NewStyles();
    for (int i = 0; i < 3; i++)
        shape.AddFill(Rgba{7, 7, 7});
    shape.Fill1(3).LineTo(2, 0);
    Bytes want = {1, 0, 9, 9, 9, 0, 0x10};
    auto append = [&](const Bytes& more) { want.insert(want.end(), more.begin(), more.end()); };
    append(Bits("0 00101 00000 1 1 1 0000 0 0 01 0 10100 0"));
    append({3, 0, 7, 7, 7, 0, 7, 7, 7, 0, 7, 7, 7, 0, 0x20});
    append(Bits("0 00100 11 1 1 0000 0 0 01 0 00000"));
    EXPECT_EQ(want, ShapeBytes(shape, false));
}

TEST(ShapeWriter, LargeThings)
{
    ShapeBuilder shape;
    for (int i = 0; i < 300; i++)
        shape.AddFill(Rgba{});
    Bytes bytes = ShapeBytes(shape, false);
    EXPECT_EQ((Bytes{0xFF, 300 & 0xFF, 300 >> 8}), Bytes(bytes.begin(), bytes.begin() + 3));
    EXPECT_EQ(0x90, bytes[3 + 300 * 4 + 1]); // nine selector bits

    ShapeBuilder far; // twice as far as one record reaches
    far.MoveTo(-100000, 0).LineTo(100000, 0);
    Bytes records = ShapeBytes(far, false);
    EXPECT_EQ(200000, far.Bounds().xmax - far.Bounds().xmin);
    EXPECT_EQ(3u + (6 + 5 + 36 + 4 * (2 + 4 + 2 + 17) + 6 + 7) / 8, records.size());
}

TEST(TagWriter, HeadersAreShortUpToSixtyTwoBytes)
{
    TagWriter tags;
    tags.Raw(9, Bytes(62)).Raw(9, Bytes(63)).Raw(1023, {5}, true).Show(2).End();
    std::vector<Tag> read = Split(tags.Tags());
    ASSERT_EQ(6u, read.size());
    EXPECT_FALSE(read[0].isLong);
    EXPECT_TRUE(read[1].isLong);
    EXPECT_EQ(63u, read[1].body.size());
    EXPECT_EQ(1023, read[2].code);
    EXPECT_TRUE(read[2].isLong);
    EXPECT_EQ(Bytes{5}, read[2].body);
    EXPECT_EQ(2, tags.Frames());
}

TEST(TagWriter, PlacementsCarryWhatWasGivenInOrder)
{
    TagWriter tags;
    tags.Place(7, 9).Place2(0x102, {.character = U16(3)}).Move(4, Mat::Translate(1, 1));
    tags.Place2(5, {.move = true,
                    .character = U16(6),
                    .matrix = Mat(),
                    .cx = Cx(),
                    .ratio = U16(0xABCD),
                    .name = "hi",
                    .clipDepth = U16(8)});
    tags.Remove(7, 9).RemoveDepth(2).Background({1, 2, 3}).Label("a");
    std::vector<Tag> read = Split(tags.Tags());
    ASSERT_EQ(8u, read.size());
    EXPECT_EQ((Bytes{7, 0, 9, 0, 0}), read[0].body);
    EXPECT_EQ((Bytes{0x02, 2, 1, 3, 0}), read[1].body);
    EXPECT_EQ((Bytes{0x05, 4, 0, 0x04, 0xA0}), read[2].body);
    EXPECT_EQ((Bytes{0x7F, 5, 0, 6, 0, 0, 0, 0xCD, 0xAB, 'h', 'i', 0, 8, 0}), read[3].body);
    EXPECT_EQ((Bytes{7, 0, 9, 0}), read[4].body);
    EXPECT_EQ((Bytes{2, 0}), read[5].body);
    EXPECT_EQ((Bytes{1, 2, 3}), read[6].body);
    EXPECT_EQ((Bytes{'a', 0}), read[7].body);
    const int codes[] = {4, 26, 26, 26, 5, 28, 9, 43};
    for (size_t i = 0; i < 8; i++)
        EXPECT_EQ(codes[i], read[i].code);
}

TEST(MovieWriter, TheHeaderCountsItself)
{
    TagWriter sprite;
    sprite.Show(3).End();
    MovieWriter movie(20, 20, Fps(12.5));
    movie.DefineSprite(4, sprite).Show(2).End();
    Bytes bytes = movie.Bytes();
    // 5 + 4 * 6 bits of rectangle: four bytes; twelve and a half frames a second; two frames.
    Bytes head = {'M', 'V', 'X', 5, U8(bytes.size()), 0, 0, 0};
    Bytes rect = Bits("00110 000000 010100 000000 010100 000");
    head.insert(head.end(), rect.begin(), rect.end());
    head.insert(head.end(), {0x80, 12, 2, 0});
    EXPECT_EQ(head, Bytes(bytes.begin(), bytes.begin() + 16));
    std::vector<Tag> tags = Split(bytes, 16);
    ASSERT_EQ(4u, tags.size());
    EXPECT_EQ(39, tags[0].code);
    EXPECT_EQ((Bytes{4, 0, 3, 0, 0x40, 0, 0x40, 0, 0x40, 0, 0, 0}), tags[0].body);
    EXPECT_EQ(7, MovieWriter(20, 20, 256, U16(7)).Bytes()[14]);
}

TEST(Picture, SurvivesAFileAndTellsDifferences)
{
    std::string folder = ::testing::TempDir() + "vexel_picture_test";
    std::filesystem::create_directories(folder);
    setenv("VEXEL_TEST_OUT", folder.c_str(), 1);
    Picture one(16, 16), back;
    for (int i = 0; i < 256; i++) // every alpha, with the colours that premultiplying allows
        one.pixels[size_t(i)] = U32(i) << 24 | U32(i) << 16 | U32(i / 2) << 8 | U32(i / 5);
    ASSERT_TRUE(SavePng(folder + "/one.png", one));
    ASSERT_TRUE(LoadPng(folder + "/one.png", &back));
    EXPECT_EQ("", ExpectSame(back, one, "round-trip"));
    back.At(3, 2) += 0x000300;
    back.At(5, 9) ^= 0x01;
    PictureDiff diff = Compare(back, one, 1);
    EXPECT_EQ(1, diff.count);
    EXPECT_EQ(3, diff.largest);
    EXPECT_EQ(3, diff.firstX);
    EXPECT_EQ(2, diff.firstY);
    EXPECT_EQ("", ExpectSame(back, one, "tolerated", 1, 1));
    EXPECT_NE("", ExpectSame(back, one, "differs"));
    EXPECT_TRUE(LoadPng(folder + "/differs-diff.png", &back));
    EXPECT_EQ(0xFFFF0000, back.At(5, 9));
    EXPECT_NE("", ExpectSame(one, Picture(16, 15), "size"));
    EXPECT_NE("", ExpectSamePng(one, folder + "/none.png", "missing"));
    unsetenv("VEXEL_TEST_OUT");
    std::filesystem::remove_all(folder);
}
