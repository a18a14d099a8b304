// Streaming sound read ahead of the picture, and the event sounds in its way.
#include "core/sound/mp3dec.h"
#include "platform/headless/headless_sound.h"
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
                if (samples[i])
                    heard += std::to_string(at) + ":" + std::to_string(samples[i]) + " ";
        }
    }
    const CSoundChannel* Stream() const { return movie.streamChannel; }
    S32 at = 0;
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
