#include "core/stream/parser.h"
#include "core/stream/str.h"
#include "core/stream/tags.h"
#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

#include <string>

namespace {

// A reader over exactly the given bytes and the zero that every block carries behind them.
struct Reader : SParser {
    explicit Reader(std::vector<U8> bytes) : store(std::move(bytes))
    {
        store.push_back(0);
        store.shrink_to_fit();
        Attach(store.data(), static_cast<S32>(store.size()) - 1);
    }
    std::vector<U8> store;
};

TEST(Parser, ReadsBitsAcrossBytes)
{
    Reader r({0xB4, 0x5F, 0x80, 0x12, 0x34, 0x56, 0x78, 0x9A});
    EXPECT_EQ(r.GetBits(0), 0u);
    EXPECT_EQ(r.GetSBits(0), 0);
    EXPECT_EQ(r.GetBits(3), 5u);         // 101
    EXPECT_EQ(r.GetSBits(2), -2);        // 10
    EXPECT_EQ(r.GetSBits(9), 279 - 512); // 100010111
    EXPECT_EQ(r.GetBits(32), 0xE0048D15u);
    EXPECT_EQ(r.GetByte(), 0x78) << "the rest of the last byte is dropped";
    EXPECT_EQ(r.GetBits(2), 2u) << "bits go on in the byte they were in, whatever was read between";
    r.InitBits();
    EXPECT_EQ(r.GetSBits(4), -7); // 9
    r.InitBits();
    r.pos = 3;
    EXPECT_EQ(r.GetSBits(32), 0x12345678);
}

TEST(Parser, ReadsLittleEndianNumbersAndColours)
{
    Reader r({0x34, 0x12, 0x78, 0x56, 0x34, 0x92, 1, 2, 3, 4, 5, 6, 0});
    EXPECT_EQ(r.GetWord(), 0x1234);
    EXPECT_EQ(r.GetDWord(), 0x92345678u);
    EXPECT_EQ(r.GetColor(0), (SRGB{1, 2, 3, 255}));
    RGBI c;
    r.GetColor(&c, 1);
    EXPECT_EQ(c, (RGBI{6, 5, 4, 0})) << "blue comes first in memory, red on the wire";
}

TEST(Parser, ReadsRectanglesAndMatricesByteAligned)
{
    const Box box{-1, 38400, -0x3FFFFFFF, 21600};
    const Mat mat{0x18000, -0x4000, 0x123, -0x10000, -77, 1 << 20};
    ByteWriter w;
    w.PutRect({}).PutMatrix({}).PutRect(box).PutMatrix(mat).PutMatrix(Mat::Translate(5, -6));
    Reader r(w.Bytes());
    SRECT rect;
    MATRIX m;
    r.GetRect(&rect);
    EXPECT_TRUE(Same(rect, SRECT{0, 0, 0, 0}));
    EXPECT_EQ(r.pos, 1);
    r.GetMatrix(&m);
    EXPECT_TRUE(MatrixIsIdentity(&m));
    EXPECT_EQ(r.pos, 2);
    r.GetRect(&rect);
    EXPECT_TRUE(Same(rect, SRECT{-1, 38400, -0x3FFFFFFF, 21600}));
    r.GetMatrix(&m);
    EXPECT_TRUE(Same(m, MATRIX{0x18000, -0x4000, 0x123, -0x10000, -77, 1 << 20}));
    r.GetMatrix(&m);
    EXPECT_TRUE(Same(m, MATRIX{0x10000, 0, 0, 0x10000, 5, -6}));
    EXPECT_EQ(r.pos, r.limit);
}

TEST(Parser, ColourTransformTellsAddFromMultiply)
{
    // Each: flags and width, then the terms. 01: multiply only, 10: add only, 00: neither.
    ByteWriter w;
    w.UB(2, 1).UB(4, 10).SB(10, 256).SB(10, 0).SB(10, -1).SB(10, 128).Align();
    w.UB(2, 2).UB(4, 9).SB(9, -255).SB(9, 255).SB(9, 1).Align();
    w.UB(2, 0).UB(4, 15).Align();
    w.UB(2, 3).UB(4, 3).SB(3, 1).SB(3, 2).SB(3, 3).SB(3, -1).SB(3, -2).SB(3, -3).Align();
    Reader r(w.Bytes());
    ColorTransform cx;
    r.GetColorTransform(&cx, 1);
    EXPECT_EQ(cx.flags, 1u);
    EXPECT_TRUE(cx.redMul == 256 && cx.greenMul == 0 && cx.blueMul == -1 && cx.alphaMul == 128);
    EXPECT_TRUE(cx.redAdd == 0 && cx.alphaAdd == 0);
    r.GetColorTransform(&cx, 0);
    EXPECT_EQ(cx.flags, 2u);
    EXPECT_TRUE(cx.redMul == 256 && cx.blueMul == 256 && cx.alphaMul == 256);
    EXPECT_TRUE(cx.redAdd == -255 && cx.greenAdd == 255 && cx.blueAdd == 1 && cx.alphaAdd == 0);
    r.GetColorTransform(&cx, 1);
    const ColorTransform identity;
    EXPECT_TRUE(Equal(&cx, &identity));
    r.GetColorTransform(&cx, 0);
    EXPECT_TRUE(cx.redMul == 1 && cx.greenMul == 2 && cx.blueMul == 3 && cx.alphaMul == 256);
    EXPECT_TRUE(cx.redAdd == -1 && cx.greenAdd == -2 && cx.blueAdd == -3 && cx.alphaAdd == 0);
    EXPECT_EQ(r.pos, r.limit);
}

TEST(Parser, NothingIsReadBeyondTheBlock)
{
    Reader r({0xFF, 0xFF, 'x'});
    EXPECT_EQ(r.GetDWord(), 0x78FFFFu);
    EXPECT_EQ(r.GetByte(), 0);
    EXPECT_EQ(r.GetBits(31), 0u);
    SRECT rect;
    r.GetRect(&rect);
    EXPECT_TRUE(Same(rect, SRECT{0, 0, 0, 0}));
    EXPECT_STREQ(r.GetStringP(), "");
    r.Skip(kS32Max);
    EXPECT_EQ(r.pos, 3);
    r.pos = 1;
    r.Skip(-1);
    EXPECT_EQ(r.pos, 1);
    r.pos = 2;
    EXPECT_STREQ(r.GetStringP(), "x") << "a string without its zero ends with the block";
    EXPECT_EQ(r.pos, 3);
    Reader strings({0, 'a', 'b', 0, 'c'});
    EXPECT_STREQ(strings.GetStringP(), "");
    EXPECT_EQ(strings.pos, 1);
    EXPECT_STREQ(strings.GetStringP(), "ab");
    EXPECT_EQ(strings.pos, 4);
    Reader none({});
    none.Attach(nullptr, 50);
    EXPECT_EQ(none.GetWord(), 0);
    EXPECT_STREQ(none.GetStringP(), "");
    EXPECT_EQ(none.GetTag(50), -1);
}

TEST(Parser, CopiesNoMoreThanTheTagHolds)
{
    Reader r({1, 2, 3, 4, 5});
    U8 out[8] = {};
    r.tagEnd = 3;
    EXPECT_EQ(r.GetData(out, 2), 2);
    EXPECT_EQ(r.GetData(out + 2, 2), 1);
    EXPECT_EQ(out[2], 3);
    EXPECT_EQ(out[3], 0);
    r.pos = 5; // a record read past the end of its tag
    EXPECT_EQ(r.GetData(out, 4), 0);
    r.pos = 4;
    r.tagEnd = 0x20000000;
    EXPECT_EQ(r.GetData(out, -1), 0);
    EXPECT_EQ(r.GetData(out, kS32Max), 1);
}

struct TagCase {
    std::vector<U8> bytes;
    int code, body, end;
};

TEST(Parser, TagHeadersWhole)
{
    std::vector<U8> short62(64, 9), long2{0x7F, 0x02, 2, 0, 0, 0, 7, 7},
        long0{0xBF, 0x06, 0, 0, 0, 0};
    short62[0] = 0x7E, short62[1] = 0xFF;                         // 1111111101 111110
    const TagCase cases[] = {{{0x40, 0x00}, kTagShowFrame, 2, 2}, // short, empty
                             {short62, 1021, 2, 64},
                             {long2, 9, 6, 8}, // the long form for a short length
                             {long0, 26, 6, 6}};
    for (const TagCase& c : cases) {
        Reader r(c.bytes);
        EXPECT_EQ(r.GetTag(r.limit), c.code);
        EXPECT_EQ(r.tagCode, c.code);
        EXPECT_EQ(r.pos, c.body);
        EXPECT_EQ(r.tagEnd, c.end);
        for (S32 part = 0; part < c.end; part++) {
            r.pos = 0;
            EXPECT_EQ(r.GetTag(part), -1) << part << " bytes of code " << c.code;
            EXPECT_EQ(r.pos, 0);
        }
        EXPECT_EQ(r.GetTag(kS32Max), c.code) << "the same call succeeds once the data is there";
    }
}

TEST(Parser, NoLengthMakesATagReachBeyondItsData)
{
    for (U32 length : {3u, 0x7FFFFFFFu, 0x80000000u, 0xFFFFFFFAu, 0xFFFFFFFFu}) {
        ByteWriter w;
        w.PutU16(0x7F).PutU32(length).PutU16(0);
        Reader r(w.Bytes());
        EXPECT_EQ(r.GetTag(r.limit), -1) << length;
        EXPECT_EQ(r.pos, 0);
    }
    Reader r({0x40, 0x00});
    EXPECT_EQ(r.GetTag(-5), -1);
    EXPECT_EQ(r.GetTag(kS32Min), -1);
}

TEST(Str, FoldsAsciiLettersOnly)
{
    EXPECT_TRUE(StrEqual("Intro", "INTRO"));
    EXPECT_FALSE(StrEqual("Intro", "Intr"));
    EXPECT_FALSE(StrEqual("Intr", "Intro"));
    EXPECT_FALSE(StrEqual("a[", "A{")) << "the neighbours of the letters do not fold";
    EXPECT_FALSE(StrEqual("\xE4", "\xC4"));
    EXPECT_TRUE(StrEqual("", ""));
    EXPECT_FALSE(StrEqual(nullptr, nullptr));
    EXPECT_EQ(StrHash("$Version"), StrHash("$vERSION"));
    EXPECT_STREQ(SkipPrefix("_LEVEL12", "_level"), "12");
    EXPECT_EQ(SkipPrefix("_lev", "_level"), nullptr);
}

TEST(Str, ReadsLeadingDigits)
{
    const std::pair<const char*, S32> cases[] = {
        {"12ab", 12}, {"-5", 0}, {" 1", 0}, {"", 0}, {"007", 7}, {"4294967297", 1}, {"\xB2", 0}};
    for (auto [text, value] : cases)
        EXPECT_EQ(ToInt(text), value) << text;
}

TEST(Str, CopiesAreCountedAndBounded)
{
    char* part = CreateStr("abcdef", 3);
    EXPECT_STREQ(part, "abc");
    FreeStr(part);
    EXPECT_EQ(CreateStr(nullptr), nullptr);
    // 80 times a megabyte in turn fits the 64 MiB that may be alive; 80 at once do not.
    const std::string megabyte((1u << 20) - 1, 'x');
    for (int i = 0; i < 80; i++) {
        char* s = CreateStr(megabyte.c_str());
        ASSERT_NE(s, nullptr);
        FreeStr(s);
    }
    std::vector<char*> alive;
    while (char* s = CreateStr(megabyte.c_str()))
        alive.push_back(s);
    EXPECT_GE(alive.size(), 60u);
    EXPECT_LE(alive.size(), 64u);
    for (char* s : alive)
        FreeStr(s);
}

} // namespace
