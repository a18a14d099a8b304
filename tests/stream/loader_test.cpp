#include "core/player/limits.h"
#include "core/stream/script_player.h"
#include "tests/stream/stream_scene.h"

#include <gtest/gtest.h>

namespace {

std::vector<U8> Part(const std::vector<U8>& bytes, size_t from, size_t to)
{
    return {bytes.begin() + static_cast<std::ptrdiff_t>(from),
            bytes.begin() + static_cast<std::ptrdiff_t>(to)};
}

void SetLength(std::vector<U8>& bytes, U32 length)
{
    for (int i = 0; i < 4; i++)
        bytes.at(size_t(4 + i)) = static_cast<U8>(length >> (8 * i));
}

// Three frames; a body in the long form and one whose bytes look like ShowFrame tags.
MovieWriter ThreeFrames()
{
    MovieWriter movie(200 * 20, 100 * 20, Fps(12.5));
    movie.Background({1, 2, 3}).Show();
    movie.Raw(1000, {0x40, 0, 0x40, 0, 0x40, 0}).Raw(43, {'a', 0}, true).Show();
    movie.Raw(1001, std::vector<U8>(70, 0x40)).Show().End();
    return movie;
}

// All that must not depend on how the bytes came.
std::vector<S32> State(const ScriptPlayer& m)
{
    std::vector<S32> state = {
        m.scriptErr,    m.scriptLen,  m.len,        m.gotHeader, m.frame.xmin,
        m.frame.xmax,   m.frame.ymin, m.frame.ymax, m.frameRate, m.frameDelay,
        S32(m.version), m.numFrames,  m.startPos,   m.pos,       m.numFramesComplete};
    state.insert(state.end(), m.script, m.script + m.len);
    return state;
}

TEST(Loader, BlocksOfAnySizeGiveTheSameMovie)
{
    const std::vector<U8> bytes = ThreeFrames().Bytes();
    ScriptPlayer whole;
    Push(whole, bytes);
    EXPECT_TRUE(Same(whole.frame, SRECT{0, 4000, 0, 2000}));
    EXPECT_EQ(whole.frameRate, 0xC8000);
    EXPECT_EQ(whole.frameDelay, 80);
    EXPECT_EQ(whole.numFrames, 3);
    EXPECT_EQ(whole.version, 5u);
    EXPECT_EQ(whole.numFramesComplete, 16000);
    EXPECT_EQ(whole.CountFrames(), 3);
    EXPECT_EQ(whole.script[whole.scriptLen], 0);
    for (size_t size : {1, 2, 3, 7, 13, 21, 50}) {
        ScriptPlayer pieces;
        for (size_t i = 0; i < bytes.size(); i += size)
            Push(pieces, Part(bytes, i, std::min(i + size, bytes.size())));
        EXPECT_EQ(State(whole), State(pieces)) << size;
    }
}

TEST(Loader, HeaderIsReadInSteps)
{
    const std::vector<U8> bytes = ThreeFrames().Bytes();
    ScriptPlayer movie;
    EXPECT_TRUE(Same(movie.frame, SRECT{0, 1440, 0, 1440}));
    Push(movie, Part(bytes, 0, 7));
    EXPECT_EQ(movie.scriptLen, -1);
    Push(movie, Part(bytes, 7, 8));
    EXPECT_EQ(movie.scriptLen, static_cast<S32>(bytes.size()));
    EXPECT_EQ(movie.len, 8);
    Push(movie, Part(bytes, 8, 20));
    EXPECT_FALSE(movie.gotHeader);
    EXPECT_EQ(movie.numFramesComplete, -1);
    Push(movie, Part(bytes, 20, 21));
    EXPECT_TRUE(movie.gotHeader);
}

TEST(Loader, CountsTheFramesThatAreAllThere)
{
    // Where each ShowFrame ends, from lengths of the file up to it.
    MovieWriter first(4000, 2000, Fps(12.5)), second = first;
    first.Background({1, 2, 3}).Show();
    second.Background({1, 2, 3}).Show();
    second.Raw(1000, {0x40, 0, 0x40, 0, 0x40, 0}).Raw(43, {'a', 0}, true).Show();
    const S32 ends[] = {S32(first.Bytes().size()), S32(second.Bytes().size())};
    const std::vector<U8> bytes = ThreeFrames().Bytes();
    ScriptPlayer movie;
    for (size_t i = 0; i + 1 < bytes.size(); i++) {
        Push(movie, Part(bytes, i, i + 1));
        // The third ShowFrame is the last tag but the End tag's two bytes.
        const S32 there =
            (movie.len >= ends[0]) + (movie.len >= ends[1]) + (movie.len >= movie.scriptLen - 2);
        ASSERT_EQ(movie.numFramesComplete, movie.gotHeader ? there - 1 : -1) << movie.len;
        ASSERT_EQ(movie.CountFrames(), movie.gotHeader ? there : 0);
    }
    EXPECT_FALSE(movie.FrameAvailable(3));
    Push(movie, Part(bytes, bytes.size() - 1, bytes.size()));
    EXPECT_EQ(movie.numFramesComplete, ScriptPlayer::kAllFrames);
    EXPECT_TRUE(movie.FrameAvailable(70000));
}

TEST(Loader, TheSentinelHidesNoFrames)
{
    MovieWriter writer;
    writer.Show(20000).End();
    std::vector<U8> bytes = writer.Bytes();
    ScriptPlayer movie;
    Push(movie, Part(bytes, 0, bytes.size() - 1));
    EXPECT_EQ(movie.numFramesComplete, 19999);
    EXPECT_TRUE(movie.FrameAvailable(19999));
    EXPECT_FALSE(movie.FrameAvailable(20000));
    Push(movie, Part(bytes, bytes.size() - 1, bytes.size()));
    EXPECT_TRUE(movie.FrameAvailable(19999));
}

TEST(Loader, DeclaredLengthRules)
{
    const std::vector<U8> bytes = ThreeFrames().Bytes();
    std::vector<U8> longer = bytes;
    longer.resize(bytes.size() + 100, 0x40);
    ScriptPlayer whole, dropped, cut;
    Push(whole, bytes);
    Push(dropped, longer);
    Push(dropped, longer);
    EXPECT_EQ(State(whole), State(dropped));

    std::vector<U8> shorter = bytes;
    SetLength(shorter, 30);
    Push(cut, shorter);
    EXPECT_EQ(cut.len, 30);
    EXPECT_TRUE(cut.Complete());
    EXPECT_EQ(cut.BytesFrom(cut.script + 10), 20);
    EXPECT_EQ(cut.BytesFrom(cut.script + 30), 0);
    EXPECT_EQ(cut.BytesFrom(bytes.data()), 0);

    // Too short to hold its header at all: complete, but never a movie.
    SetLength(shorter, 20);
    ScriptPlayer stub;
    Push(stub, shorter);
    EXPECT_TRUE(stub.Complete());
    EXPECT_FALSE(stub.gotHeader);
    EXPECT_EQ(stub.CountFrames(), 0);
}

TEST(Loader, ErrorsAreFinalUntilCleared)
{
    const std::vector<U8> good = ThreeFrames().Bytes();
    std::vector<U8> magic = good, tooShort = good, negative = good, tooLong = good;
    magic[2] = 'Y';
    SetLength(tooShort, 7);
    SetLength(negative, 0xFFFFFFFF);
    SetLength(tooLong, gLimits.movieBytes + 1);
    const std::pair<std::vector<U8>, S32> cases[] = {
        {magic, -1}, {tooShort, -1}, {negative, -1}, {tooLong, -2}};
    for (const auto& [bytes, error] : cases) {
        ScriptPlayer movie;
        for (U8 byte : bytes)
            movie.PushDataBuf(&byte, 1);
        EXPECT_EQ(movie.scriptErr, error);
        EXPECT_EQ(movie.script, nullptr);
        EXPECT_FALSE(movie.Complete());
        EXPECT_EQ(movie.DrawFrame(0, true), error);
        Push(movie, good);
        EXPECT_EQ(movie.scriptErr, error);
        movie.ClearScript();
        Push(movie, good);
        EXPECT_EQ(movie.scriptErr, 0);
        EXPECT_EQ(movie.numFrames, 3);
    }
}

TEST(Loader, RateZeroIsTheSlowest)
{
    MovieWriter writer(400, 400, 0);
    writer.Show(40);
    ScriptPlayer movie;
    Push(movie, writer.Bytes());
    EXPECT_EQ(movie.frameRate, 256);
    EXPECT_EQ(movie.frameDelay, 256000);
}

TEST(Loader, AWideFrameReadsZerosForWhatIsMissing)
{
    // 1920x1080 pixels take a rectangle of 10 bytes, so that at 21 bytes the count's high byte is
    // still to come.
    MovieWriter writer(1920 * 20, 1080 * 20, Fps(30), 0x0203);
    writer.Show(3);
    ScriptPlayer whole, pieces;
    const std::vector<U8> bytes = writer.Bytes();
    Push(whole, bytes);
    EXPECT_EQ(whole.numFrames, 0x0203);
    Push(pieces, Part(bytes, 0, 21));
    Push(pieces, Part(bytes, 21, bytes.size()));
    EXPECT_EQ(pieces.numFrames, 3);
    EXPECT_TRUE(Same(pieces.frame, whole.frame));
    EXPECT_EQ(pieces.startPos, whole.startPos);
}

TEST(Loader, ASharedBufferLivesAsLongAsItsLastHolder)
{
    const std::vector<U8> bytes = ThreeFrames().Bytes();
    auto* first = new ScriptPlayer;
    Push(*first, bytes);
    ScriptPlayer second;
    first->sharedScript = second.sharedScript = new S32(2);
    second.Attach(first->script, first->limit);
    second.scriptLen = first->scriptLen;
    delete first;
    EXPECT_EQ(second.script[0], 'M');
    EXPECT_EQ(*second.sharedScript, 1);
}

} // namespace
