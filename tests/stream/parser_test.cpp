#include "core/player/limits.h"
#include "core/stream/str.h"
#include "core/stream/tags.h"
#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

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

TEST(Parser, ReadsBitsNumbersAndRecords)
{
    const Mat mat{0x18000, -0x4000, 0x123, -0x10000, -77, 1 << 20};
    ByteWriter w;
    w.PutBytes({0xB4, 0x5F, 0x80, 0x12, 0x34, 0x56, 0x78, 0x9A, 0x34, 0x12, 1, 2, 3, 0x92});
    w.PutRect({}).PutMatrix({}).PutRect({-1, 38400, -0x3FFFFFFF, 21600}).PutMatrix(mat);
    Reader r(w.PutBytes({1, 2, 3, 4, 5, 6, 0}).Bytes());
    EXPECT_EQ(r.GetBits(3), 5u);         // 101
    EXPECT_EQ(r.GetSBits(2), -2);        // 10
    EXPECT_EQ(r.GetSBits(9), 279 - 512); // 100010111
    EXPECT_EQ(r.GetBits(32), 0xE0048D15u);
    EXPECT_EQ(r.GetByte(), 0x78) << "the rest of the last byte is dropped";
    EXPECT_EQ(r.GetBits(2), 2u) << "bits go on in the byte they were in, whatever was read between";
    r.InitBits();
    EXPECT_EQ(r.GetSBits(4), -7); // 9
    EXPECT_EQ(r.GetWord(), 0x1234);
    EXPECT_EQ(r.GetDWord(), 0x92030201u);
    SRECT empty, rect;
    MATRIX unit, m;
    RGBI c;
    r.GetRect(&empty);
    r.GetMatrix(&unit);
    EXPECT_TRUE(Same(empty, SRECT{0, 0, 0, 0}) && MatrixIsIdentity(&unit) && r.pos == 16);
    r.GetRect(&rect);
    r.GetMatrix(&m);
    EXPECT_TRUE(Same(rect, SRECT{-1, 38400, -0x3FFFFFFF, 21600}));
    EXPECT_TRUE(Same(m, MATRIX{0x18000, -0x4000, 0x123, -0x10000, -77, 1 << 20}));
    EXPECT_EQ(r.GetColor(0), (SRGB{1, 2, 3, 255}));
    r.GetColor(&c, 1);
    EXPECT_EQ(c, (RGBI{6, 5, 4, 0})) << "blue comes first in memory, red on the wire";
    EXPECT_EQ(r.pos, r.limit);
}

TEST(Parser, NothingIsReadBeyondTheBlockOrTheTag)
{
    Reader r({0xFF, 0xFF, 'x'}), strings({0, 'a', 'b', 0, 'c'});
    EXPECT_EQ(r.GetDWord(), 0x78FFFFu);
    EXPECT_EQ(r.GetBits(31), 0u);
    r.Skip(kS32Max);
    EXPECT_EQ(r.pos, 3);
    r.Skip(-1);
    EXPECT_STREQ(r.GetStringP(), "");
    for (const char* want : {"", "ab", "c", ""}) // the last but one without its zero
        EXPECT_STREQ(strings.GetStringP(), want);
    r.Attach(nullptr, 50);
    EXPECT_STREQ(r.GetStringP(), "");
    EXPECT_EQ(r.GetTag(50), -1);
    const S32 rows[][4] = {
        {1, 4, 2, 2}, {3, 4, 2, 1}, {5, 4, 4, 0}, {4, 9999, -1, 0}, {4, 9999, kS32Max, 1}};
    for (const auto& [pos, tagEnd, wanted, got] : rows) {
        U8 out[8];
        strings.pos = pos;
        strings.tagEnd = tagEnd;
        EXPECT_EQ(strings.GetData(out, wanted), got) << pos;
    }
}

TEST(Parser, TagHeadersWholeOrNotAtAll)
{
    std::vector<U8> short62(64, 9);
    short62[0] = 0x7E, short62[1] = 0xFF; // 1111111101 111110
    const struct {
        std::vector<U8> bytes;
        int code, body, end;
    } rows[] = {{{0x40, 0x00}, kTagShowFrame, 2, 2},
                {short62, 1021, 2, 64},
                {{0x7F, 0x02, 2, 0, 0, 0, 7, 7}, 9, 6, 8}, // the long form for a short length
                {{0xBF, 0x06, 0, 0, 0, 0}, 26, 6, 6}};
    for (const auto& row : rows) {
        Reader r(row.bytes);
        for (S32 part = -5; part < row.end; part++) {
            EXPECT_EQ(r.GetTag(part), -1) << part << " bytes of code " << row.code;
            EXPECT_EQ(r.pos, 0);
        }
        EXPECT_EQ(r.GetTag(kS32Max), row.code);
        EXPECT_EQ(r.tagCode, row.code);
        EXPECT_TRUE(r.pos == row.body && r.tagEnd == row.end) << row.code;
    }
    for (U32 length : {3u, 0x7FFFFFFFu, 0x80000000u, 0xFFFFFFFAu, 0xFFFFFFFFu}) {
        Reader r(ByteWriter().PutU16(0x7F).PutU32(length).PutU16(0).Bytes());
        EXPECT_EQ(r.GetTag(r.limit), -1) << length;
        EXPECT_EQ(r.pos, 0);
    }
}

// The list goes through all forms of its index; whoever walks it sees the order of creation.
TEST(Variables, FoldNamesKeepTheirOrderAndAreBounded)
{
    const SLimits saved = gLimits;
    gLimits.variables = 1000;
    gLimits.stringBytes = 7;
    ScriptThread thread;
    for (int i = 0; i < 2200; i++)
        thread.SetVariable(("Na" + std::to_string(i % 1100)).c_str(),
                           std::to_string(12345678 + i).c_str(), 0);
    int count = 0;
    for (const SVariable* var = thread.vars; var; var = var->next, count++) {
        ASSERT_EQ(var->name, "Na" + std::to_string(count));
        ASSERT_EQ(thread.FindVariable(("nA" + std::to_string(count)).c_str()), var);
        ASSERT_EQ(var->value, std::to_string((12345678 + 1100 + count) / 10)) << "cut";
    }
    EXPECT_EQ(count, 1000);
    thread.ClearVariables();
    thread.SetVariable("much too long", "1", 0);
    EXPECT_EQ(thread.vars, nullptr) << "dropped, not cut to another name";
    thread.SetVariable("exactly", "own", 0);
    thread.SetVariable("EXACTLY", thread.vars->value, 0);
    EXPECT_STREQ(thread.vars->value, "own") << "a value that is the variable's own string";
    thread.SetVariable("exactly", nullptr, 0);
    EXPECT_EQ(thread.FindVariable("EXACTLY")->value, nullptr);
    gLimits = saved;
}

} // namespace
