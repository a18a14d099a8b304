// Streaming sound read ahead of the picture, and the event sounds in its way.
#include <fstream>

#include "core/sound/mp3_decomp.h"
#include "platform/headless/headless_sound.h"
#include "platform/headless/native_player.h"
#include "tests/stream/stream_scene.h"
#include "tests/support/sound_writer.h"

#include <gtest/gtest.h>

// A movie with a mixer of mono buffers of 2048 samples that are played when told.
struct SoundScene : NativeSoundMix, StreamScene {
    using Bytes = std::vector<U8>;
    SoundScene(const Bytes& b, const char* s) { list.soundMix = this, Push(movie, b), Do(s); }
    void GetNativeSoundCap(U8* format) override { *format = 14; }
    // "t" is a tick of the timelines, "p" a buffer, with what a tick does for the sound before.
    void Do(const std::string& steps)
    {
        for (const char step : steps) {
            step == 't' ? Tick() : movie.TendStream();
            const S16* samples = step == 'p' ? PlayBuffer(0) : nullptr;
            for (S32 i = 0; samples && i < 2048; i++, at++)
                if (all.push_back(samples[i]); samples[i])
                    heard += std::to_string(at) + ":" + std::to_string(samples[i]) + " ";
        }
    }
    const CSoundChannel* Stream() const { return movie.streamChannel; }
    S32 at = 0;
    std::vector<S16> all;
    std::string heard; // "place:sample " for each that is not 0
};

// Frames without a block are silence, a frame with two is twice as long; what is missing of short
// blocks, as all are here, is silence too. Counts and seeks of MPEG blocks are seen by the sound
// that follows. Streams that make no sense are silent.
TEST(SoundStream, EveryBlockComesOutAtItsPlace)
{
    for (const int format : {14, 14 + 0x30, 14 + 0x10}) {
        SoundScene scene(SoundMovie("b1 / b2 / / b3 b4 / b5 /", 1000, U8(format)), "tpppp");
        EXPECT_EQ("0:1 1000:2 3000:3 4000:4 5000:5 ", scene.heard);
    }
    SoundScene mpeg(SoundMovie("d1,7 m2048,0 / m0,-4096 / m0,0 / s1,0 /", 3000, 46), "tppppp");
    EXPECT_EQ(mp3decPresent() ? "6144:7 " : "", mpeg.heard);
    SoundScene still(SoundMovie("b5 / b5 / /", 0), "tptptp");
    SoundScene unknown(SoundMovie("b5 d1,1 s2,0 s1,64 / /", 9, 0x4E), "tptpp");
    EXPECT_EQ("0:1 ", still.heard + unknown.heard);
}

// The lead-in goes, though it is more than the first block, and leaves no gap; what comes out is
// the tone as it is decoded in one piece, at twice the rate.
TEST(SoundStream, MpegBlocksWithoutTheirLeadIn)
{
    if (!mp3decPresent())
        GTEST_SKIP();
    std::ifstream file(VEXEL_SOURCE_DIR "/tests/data/sound/tone.mp3", std::ios::binary);
    const std::string text(std::istreambuf_iterator<char>(file), {});
    const std::vector<U8> tone(text.begin(), text.end());
    MovieWriter writer(2000, 2000, Fps(10));
    writer.Raw(18, ByteWriter().PutU16(0x2A2A).PutU16(576).PutU16(1105));
    for (size_t at = 0, size = 0; at + 104 < tone.size(); at += size) {
        size = 104 + (tone[at + 2] >> 1 & 1);
        const std::vector<U8> frame(&tone[at], &tone[at] + size);
        writer.Raw(19, ByteWriter().PutU16(576).PutU16(0).PutBytes(frame)).Show();
    }
    writer.End();
    SoundScene scene(writer.Bytes(), "tppppppp");
    CMp3Decomp decoder(0x2A);
    const CSound sound = {0x2A, 1, tone.data(), S32(tone.size()), 1105};
    std::vector<S16> whole(7000), heard;
    decoder.Setup(&sound, true), decoder.Decompress(whole.data(), 7000);
    for (size_t i = 1; i < scene.all.size() && heard.size() < whole.size(); i += 2)
        heard.push_back(scene.all[i]);
    EXPECT_EQ(whole, heard);
}

// Byte by byte nothing is lost, and what waits does not count. A stream that waits goes on with 5
// seconds' lead, or at the end of the data.
TEST(SoundStream, WaitsForData)
{
    const std::vector<U8> bytes = SoundMovie("b /", 1500, 14, 60);
    std::string resumed;
    for (const size_t missing : {0, 1}) {
        SoundScene scene({}, "");
        for (size_t at = 0; at + missing < bytes.size(); at++) {
            const bool waited = scene.Stream() && scene.Stream()->Waiting();
            scene.movie.PushDataBuf(&bytes[at], 1), scene.Do(scene.Stream() ? "p" : "tp");
            if (waited && !scene.Stream()->Waiting())
                resumed += std::to_string(scene.movie.numFramesComplete) + " ";
        }
        EXPECT_LT(scene.Stream()->ElapsedFrames(), 61);
        scene.movie.SetDataComplete(), scene.Do(std::string(60, 'p'));
        EXPECT_TRUE(std::count(scene.heard.begin(), scene.heard.end(), ':') == 60 &&
                    scene.heard.ends_with(":60 ") && scene.Stream()->StreamEnded());
    }
    EXPECT_EQ("50 16000 50 ", resumed) << "frame 0 was heard; 50 more are needed";
}

// Sounds that the reader meets start once, in the buffer where their frame's sound begins, whether
// or not the timeline has defined them yet; without a stream the timeline starts them. One that is
// freed falls silent.
TEST(SoundStream, EventSounds)
{
    SoundScene scene(SoundMovie("d1,100 d2,7 s2,0 s2,32 d3,8 s3,0 f3 s1,0 / s1,0 b1 / / / "
                                "f1 d1,200 d1,400 s1,0 s7,0 d2,9 / /",
                                1024),
                     "tptpppttttp");
    EXPECT_EQ("0:100 2048:101 4096:200 ", scene.heard);
}

// Many definitions ahead of the picture; and while sounds are off the reader starts none.
TEST(SoundStream, ReaderStartsWhatMayBeHeard)
{
    std::string defined;
    for (const int id : {100, 356, 612, 868})
        for (int i = 0; i < 50; i++)
            defined += "d" + std::to_string(id + i) + "," + std::to_string(id + i) + " ";
    SoundScene scene(SoundMovie("b1 / " + defined + "s917,0 s100,0 f100 s100,0 / /", 1024), "tp");
    EXPECT_EQ("0:1018 ", scene.heard);
    NativePlayerWnd player(1, 1);
    SoundScene hushed(SoundMovie("b1 d1,50 / / s1,0 / s1,0 / s1,0 /", 1024), "tp");
    hushed.movie.splayer = &player, player.soundOn = 0, hushed.Do("p");
    player.soundOn = 1, hushed.Do("p");
    EXPECT_EQ("0:1 4096:50 ", hushed.heard);
}

// Making decoders is paid for: a frame that makes hundreds is not done in a tick.
TEST(SoundStream, StartsArePaidFor)
{
    MovieWriter writer(2000, 2000, Fps(10));
    writer.Raw(14, ByteWriter().PutU16(1).PutU8(46).PutU32(99).PutU16(0).PutU32(0));
    for (int i = 0; i < 300; i++)
        writer.Raw(15, ByteWriter().PutU16(1).PutU8(0)).Raw(15, ByteWriter().PutU16(1).PutU8(32));
    writer.Show().End();
    SoundScene scene(writer.Bytes(), "t");
    EXPECT_EQ(mp3decPresent() ? -1 : 0, scene.movie.curFrame);
    scene.Do("t");
    EXPECT_EQ(0, scene.movie.curFrame);
}

// What ends a stream ends its sound; the next block met starts it at the present frame, fading in.
TEST(SoundStream, SeeksLoopsAndStops)
{
    SoundScene scene(SoundMovie("b10 / b20 / b30 / b40 / b50 / b60 /", 1024), "tp");
    scene.movie.Seek(3);
    EXPECT_EQ(2, scene.Stream()->ElapsedFrames()) << "met behind frame 2";
    scene.movie.Play(0), scene.Do("p"), scene.movie.StopPlay(), scene.Do("p");
    scene.movie.Play(0), scene.Do("tpttp"), scene.movie.Silence(), scene.Do("p");
    scene.movie.Seek(2), scene.movie.ClearScript(), scene.Do("p");
    EXPECT_EQ("0:10 1024:20 3072:25 7168:30 8192:10 9216:20 ", scene.heard);
}
