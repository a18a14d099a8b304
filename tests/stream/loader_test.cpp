// Movies as they arrive, and the dictionary that their definitions fill.
#include "core/player/limits.h"
#include "core/stream/movie_data.h"
#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

namespace {

std::vector<U8> Part(const std::vector<U8>& bytes, size_t from, size_t to)
{
    return {bytes.data() + from, bytes.data() + std::min(to, bytes.size())};
}

// The first frames of three; a body in the long form and one whose bytes look like ShowFrame tags.
std::vector<U8> Frames(int count)
{
    MovieWriter movie(200 * 20, 100 * 20, Fps(12.5), 3);
    movie.Background({1, 2, 3}).Show();
    if (count > 1)
        movie.Raw(1000, {0x40, 0, 0x40, 0, 0x40, 0}).Raw(43, {'a', 0}, true).Show();
    if (count > 2)
        movie.Raw(1001, std::vector<U8>(70, 0x40)).Show();
    return movie.Bytes();
}

std::vector<U8> WithLength(std::vector<U8> bytes, U32 length)
{
    for (size_t i = 0; i < 4; i++)
        bytes[4 + i] = static_cast<U8>(length >> (8 * i));
    return bytes;
}

// All that must not depend on how the bytes came.
std::vector<S32> State(const ScriptPlayer& m)
{
    std::vector<S32> state = {
        m.scriptErr,  m.scriptLen, m.len,        m.gotHeader,  m.frame.xmax,
        m.frame.ymax, m.frameRate, m.frameDelay, m.numFrames,  S32(m.version),
        m.startPos,   m.pos,       m.frame.xmin, m.frame.ymin, m.numFramesComplete};
    state.insert(state.end(), m.script, m.script + m.len + 1);
    return state;
}

TEST(Loader, BlocksOfAnySizeGiveTheSameMovie)
{
    ScriptPlayer whole;
    Push(whole, Frames(3));
    EXPECT_TRUE(Same(whole.frame, SRECT{0, 4000, 0, 2000}));
    EXPECT_TRUE(whole.frameRate == 0xC8000 && whole.frameDelay == 80 && whole.version == 5);
    EXPECT_TRUE(whole.numFrames == 3 && whole.CountFrames() == 3 && whole.FrameAvailable(70000));
    std::vector<U8> bytes = Frames(3);
    bytes.insert(bytes.end(), 50, 0x40); // beyond the declared length: dropped
    for (size_t size : {1, 2, 3, 7, 13, 21, 50, 1000}) {
        ScriptPlayer pieces;
        for (size_t i = 0; i < bytes.size(); i += size) {
            Push(pieces, Part(bytes, i, i + size));
            EXPECT_EQ(pieces.scriptLen < 0, i + size < 8);
            EXPECT_EQ(pieces.gotHeader, i + size > 20);
            int there = 0; // until the whole movie is
            for (int n = 1; n <= 3; n++)
                there += pieces.gotHeader && pieces.len >= S32(Frames(n).size());
            EXPECT_EQ(pieces.numFramesComplete, there == 3 ? ScriptPlayer::kAllFrames : there - 1);
            EXPECT_EQ(pieces.CountFrames(), there);
        }
        EXPECT_EQ(State(whole), State(pieces)) << size;
    }
}

TEST(Loader, LengthsAndErrors)
{
    std::vector<U8> magic = Frames(3);
    magic[2] = 'Y';
    const struct {
        std::vector<U8> bytes;
        S32 error, len;
        bool header;
    } rows[] = {{magic, -1, 0, false},
                {WithLength(Frames(3), 7), -1, 0, false},
                {WithLength(Frames(3), 0xFFFFFFFF), -1, 0, false},
                {WithLength(Frames(3), gLimits.movieBytes + 1), -2, 0, false},
                {WithLength(Frames(3), 20), 0, 20, false}, // complete, but never a movie
                {WithLength(Frames(3), 30), 0, 30, true}};
    for (const auto& row : rows) {
        ScriptPlayer movie;
        for (U8 byte : row.bytes)
            movie.PushDataBuf(&byte, 1);
        Push(movie, Frames(3)); // errors are final
        EXPECT_EQ(movie.scriptErr, row.error);
        EXPECT_EQ(movie.DrawFrame(0, true), row.header  ? kDrawFailed
                                            : row.error ? row.error
                                                        : kNeedsData);
        EXPECT_TRUE(movie.len == row.len && movie.gotHeader == row.header) << movie.len;
        EXPECT_EQ(movie.Complete(), row.error == 0);
        EXPECT_EQ(movie.BytesFrom(movie.script + 10), row.len ? row.len - 10 : 0);
        EXPECT_EQ(movie.BytesFrom(row.bytes.data()), 0);
        movie.ClearScript();
        Push(movie, Frames(3));
        EXPECT_TRUE(movie.scriptErr == 0 && movie.CountFrames() == 3);
    }
}

TEST(Loader, UnusualHeaders)
{
    // 1920x1080 pixels take a rectangle of 10 bytes, so that at 21 bytes the count's high byte is
    // still to come.
    MovieWriter wide(1920 * 20, 1080 * 20, 0, 0x0203);
    wide.Show(20000);
    const std::vector<U8> bytes = wide.Bytes();
    ScriptPlayer whole, pieces;
    Push(whole, bytes);
    Push(pieces, Part(bytes, 0, 21));
    Push(pieces, Part(bytes, 21, bytes.size() - 1));
    EXPECT_TRUE(whole.numFrames == 0x0203 && pieces.numFrames == 3);
    EXPECT_TRUE(Same(pieces.frame, whole.frame) && pieces.startPos == whole.startPos);
    EXPECT_TRUE(whole.frameRate == 256 && whole.frameDelay == 256000) << "0 is the slowest rate";
    EXPECT_TRUE(pieces.FrameAvailable(19998) && !pieces.FrameAvailable(19999));
    Push(pieces, Part(bytes, bytes.size() - 1, bytes.size()));
    EXPECT_TRUE(pieces.FrameAvailable(19999)) << "the sentinel hides no frames";
    // A shared buffer lives as long as its last holder.
    auto* first = new ScriptPlayer;
    Push(*first, bytes);
    ScriptPlayer second;
    second.sharedScript = first->sharedScript;
    second.sharedScript->AddRef();
    second.Attach(first->script, first->limit);
    second.scriptLen = first->scriptLen;
    delete first;
    EXPECT_EQ('M', second.script[0]);
}

// A movie whose tags have all run, without a display.
struct Ran : ScriptPlayer {
    explicit Ran(MovieWriter& writer)
    {
        writer.Show().End();
        Push(*this, writer.Bytes());
        while (DoTag() == kDrawn) {
        }
        EXPECT_TRUE(atEnd);
    }
};

std::vector<U8> Body(U16 id, const std::vector<U8>& rest)
{
    return ByteWriter().PutU16(id).PutBytes(rest).Bytes();
}

// The kept part of the body: its first byte, and its length.
void ExpectBody(const SCharacter* ch, U8 first, S32 length)
{
    ASSERT_TRUE(ch && ch->data);
    EXPECT_EQ(ch->data[0], first);
    EXPECT_EQ(ch->DataLen(), length);
}

TEST(Definitions, KeepTypeCodeBoundsAndBody)
{
    const int rows[][3] = {{2, 0, 1},  {22, 0, 1}, {32, 0, 1}, {46, 7, 1}, {7, 2, 0}, // tag, type
                           {10, 3, 0}, {11, 4, 1}, {33, 4, 1}, {37, 9, 1}, {6, 1, 0}, // bounds
                           {20, 1, 0}, {21, 1, 0}, {35, 1, 0}, {36, 1, 0}};
    MovieWriter writer;
    for (const auto& [tag, type, bounds] : rows) {
        ByteWriter rest;
        if (bounds)
            rest.PutRect({-20, 400, 0, 1000});
        if (tag == 46)
            rest.PutRect({1, 2, 3, 4});
        writer.Raw(tag, Body(U16(100 + tag), rest.PutBytes({0xAB, 0xCD, 0xEF}).Bytes()));
    }
    Ran movie(writer);
    for (const auto& [tag, type, bounds] : rows) {
        const SCharacter* ch = movie.FindCharacter(U16(100 + tag));
        const bool bits = type == kCharBitmap; // keeps the tag's own header
        ExpectBody(ch, bits ? U8(tag << 6 | 5) : 0xAB, bits ? 7 : 3);
        EXPECT_TRUE(ch->type == type && ch->tagCode == tag) << tag;
        EXPECT_TRUE(
            Same(ch->bounds, bounds ? SRECT{-20, 400, 0, 1000} : SRECT{kRectEmpty, 0, 0, 0}));
    }
    EXPECT_TRUE(Same(movie.FindCharacter(146)->endBounds, SRECT{1, 2, 3, 4}));
}

TEST(Definitions, ReadWhatTheirKindNeeds)
{
    MovieWriter writer, nested;
    writer.Raw(34, Body(1, {1, 0x77})).DefineSprite(6, 9, nested.Show(2).End());
    ByteWriter font;
    font.PutU16(2).PutU16(0x8081).PutU8(255).PutBytes(std::vector<U8>(255, 'n')).PutU16(300);
    writer.Raw(48, font.PutU8(0x66).Bytes());
    writer.Raw(14, Body(3, {0x2F, 1, 2, 3, 4, 0xFE, 0xFF, 0x55, 0x56}));
    writer.Raw(14, Body(4, {0x1F, 1, 0, 0, 0, 0x44})).Raw(14, Body(5, {0x4F, 1, 0, 0, 0, 0x44}));
    // The first of the attachments to a record of the right type counts.
    writer.Raw(10, Body(7, {0})).Raw(7, Body(8, {0}));
    writer.Raw(13, Body(7, {0x11})).Raw(13, Body(7, {0x12})).Raw(13, Body(8, {0x13}));
    writer.Raw(17, Body(8, {0x21})).Raw(17, Body(8, {0x22})).Raw(23, Body(8, {0x31}));
    writer.Raw(23, Body(7, {0x32})).Raw(13, Body(9, {0x14}));
    // Taken and reserved ids.
    writer.Raw(2, Body(10, {0})).Raw(7, Body(10, {0})).Raw(2, Body(11, {0})).FreeCharacter(11);
    writer.Raw(7, Body(11, {0})).Raw(2, Body(0xFFFC, {0})).Raw(2, Body(0xFFFB, {0}));
    Ran movie(writer);
    ExpectBody(movie.FindCharacter(1), 0x77, 1);
    EXPECT_EQ(movie.FindCharacter(1)->button.trackAsMenu, 1);
    const SCharacter* wide = movie.FindCharacter(2);
    ExpectBody(wide, 0x66, 1);
    EXPECT_TRUE(wide->font.flags == 0x8081 && wide->font.glyphCount == 300);
    EXPECT_EQ(wide->font.distance, 258) << "a long name needs more than a byte";
    const SCharacter* mpeg = movie.FindCharacter(3);
    ExpectBody(mpeg, 0x55, 2);
    EXPECT_TRUE(mpeg->sound.format == 0x2F && mpeg->sound.sampleCount == 0x04030201u);
    EXPECT_TRUE(mpeg->sound.start == -2 && mpeg->sound.dataLen == 2);
    ExpectBody(movie.FindCharacter(4), 0x44, 1);
    EXPECT_EQ(movie.FindCharacter(5), nullptr) << "an unknown compression";
    ExpectBody(movie.FindCharacter(6), 0x40, 6);
    EXPECT_TRUE(movie.FindCharacter(6)->sprite.numFrames == 9 && !movie.FindCharacter(6)->tagCode);
    EXPECT_EQ(movie.FindCharacter(7)->font.info[0], 0x11);
    EXPECT_EQ(movie.FindCharacter(8)->button.sounds[0], 0x21);
    EXPECT_EQ(movie.FindCharacter(8)->button.cxform[0], 0x31);
    EXPECT_EQ(movie.FindCharacter(10)->type, kCharShape);
    EXPECT_EQ(movie.FindCharacter(11)->type, kCharButton) << "free for another definition";
    EXPECT_TRUE(!movie.FindCharacter(0xFFFC) && movie.FindCharacter(0xFFFB));
    SCharacter* old = movie.FindCharacter(10);
    RetainCharacter(old);
    movie.FreeCharacter(10);
    EXPECT_NE(movie.CreateCharacter(10), old) << "still in use";
    ReleaseCharacter(old);
    movie.FreeAll();
    movie.FreeCache();
    EXPECT_EQ(movie.charAlloc.BlockCount(), 0u) << "every record went back to the pool";
}

TEST(Definitions, BodiesThatAreTooShortKeepNothing)
{
    // Each is cut everywhere; the tag behind it lends its bytes to the fixed fields, no more.
    const std::vector<U8> body = Body(1, {0x2F, 0, 200, 2, 3, 4, 5, 6});
    for (int tag : {2, 6, 7, 10, 11, 14, 34, 37, 39, 46, 48})
        for (size_t cut = 0; cut <= body.size(); cut++) {
            MovieWriter writer;
            writer.Raw(tag, Part(body, 0, cut)).Raw(1000, std::vector<U8>(250, 1));
            Ran movie(writer);
            if (const SCharacter* ch = movie.FindCharacter(1)) {
                EXPECT_TRUE(ch->DataLen() >= 0 && ch->DataLen() <= movie.BytesFrom(ch->data));
                EXPECT_TRUE(tag != 48 || ch->font.glyphCount == 0);
            }
        }
}

} // namespace
