#include "tests/support/movie_writer.h"

#include <gtest/gtest.h>

namespace {

// A string of zeros and ones, with blanks between fields, as bytes.
std::vector<U8> Bits(const std::string& text)
{
    ByteWriter out;
    for (char c : text)
        out.UB(c == ' ' ? 0 : 1, c == '1');
    return out.Bytes();
}

TEST(ByteWriter, RecordsAreBitExact)
{
    const struct {
        ByteWriter got;
        const char* want;
    } cases[] = {
        {ByteWriter().PutRect({0, 320, 0, -1}),
         "01010 0000000000 0101000000 0000000000 1111111111"},
        {ByteWriter().PutMatrix({0x2000, 0, 0, -0x10000, 3, -4}),
         "1 10001 00010000000000000 10000000000000000 0 00011 011 100"},
        {ByteWriter().PutMatrix({0x10000, 0x1000, -0x1000, 0x10000, 0, 0}),
         "0 1 01110 01000000000000 11000000000000 00000"},
        {ByteWriter().PutCx(Cx::Add(0, 255, -1, -255), true),
         "10 1001 000000000 011111111 111111111 100000001"},
        // Without alpha, an alpha multiplier is not written and does not count.
        {ByteWriter().PutCx(Cx::Alpha(0.5), false), "00 0000"},
        {ByteWriter().UB(1, 1).PutString("a").PutU16(0x1234),
         "10000000 01100001 00000000 00110100 00010010"},
    };
    for (const auto& c : cases)
        EXPECT_EQ(c.got.Bytes(), Bits(c.want)) << c.want;
}

TEST(ShapeWriter, RecordsAreBitExact)
{
    ShapeBuilder shape;
    shape.AddFill(Rgba{1, 2, 3, 4});
    shape.AddFill(Rgba{5, 6, 7, 8});
    shape.Fill1(2).MoveTo(-3, 4).LineTo(-3, 5).LineTo(4, 5).LineTo(0, 0).CurveTo(1, 0, 1, -1);
    shape.Fill1(0).NewStyles();
    shape.Fill1(shape.AddFill(Rgba{9, 9, 9, 9})).LineTo(2, -1);
    ByteWriter want, got;
    want.PutBytes({2, 0, 1, 2, 3, 4, 0, 5, 6, 7, 8, 0});
    want.PutBytes(Bits("0010 0000 0 00101 00100 1101 0100 10 "
                       "1 1 0000 0 1 01 1 1 0010 0 0 0111 1 1 0010 1 1100 1011 "
                       "1 0 0000 01 00 00 11 0 10100 00"));
    want.PutBytes({1, 0, 9, 9, 9, 9, 0, 0x10});
    want.PutBytes(Bits("0 00100 1 1 1 0000 0 0 01 0 00000"));
    shape.Write(got, true);
    EXPECT_EQ(got.Bytes(), want.Bytes());
}

TEST(MovieWriter, TagsAndHeaderAreByteExact)
{
    MovieWriter movie(20, 20, Fps(12.5));
    movie.DefineSprite(4, TagWriter().Show(3).End()).Raw(9, std::vector<U8>(63)).Place(7, 9);
    movie.Place2(5, {true, U16(6), Mat(), Cx(), U16(0xABCD), "hi", U16(8)}).Show().End();
    ByteWriter want;
    want.PutBytes({'M', 'V', 'X', 5, 126, 0, 0, 0});
    want.PutBytes(Bits("00110 000000 010100 000000 010100")).PutBytes({0x80, 12, 1, 0});
    want.PutBytes({0xCC, 0x09, 4, 0, 3, 0, 0x40, 0, 0x40, 0, 0x40, 0, 0, 0});
    want.PutBytes({0x7F, 0x02, 63, 0, 0, 0}).PutBytes(std::vector<U8>(63));
    want.PutBytes({0x05, 0x01, 7, 0, 9, 0, 0}).PutBytes({0x8E, 0x06, 0x7F, 5, 0, 6, 0, 0, 0});
    want.PutBytes({0xCD, 0xAB, 'h', 'i', 0, 8, 0, 0x40, 0, 0, 0});
    EXPECT_EQ(movie.Bytes(), want.Bytes());
}

} // namespace
