// Streaming sound read ahead of the picture, and the event sounds in its way.
#include "core/sound/mp3dec.h"
#include "platform/headless/headless_sound.h"
#include "tests/stream/stream_scene.h"
#include "tests/support/sound_writer.h"

#include <gtest/gtest.h>

namespace {

// A movie with a mixer of mono buffers of 2048 samples that are played when told.
struct SoundScene : NativeSoundMix, StreamScene {
    SoundScene() { list.soundMix = this; }
    explicit SoundScene(const std::vector<U8>& bytes) : SoundScene() { Push(movie, bytes); }
    void GetNativeSoundCap(U8* format) override { *format = 14; }
    // "t" is a tick of the timelines, "p" a buffer, with what a tick does for the sound before.
    SoundScene& Do(const std::string& steps)
    {
        for (const char step : steps) {
            if (step == 't')
                Tick();
            movie.TendStream();
            const S16* samples = step == 'p' ? PlayBuffer(0) : nullptr;
            heard.insert(heard.end(), samples, samples + (samples ? 2048 : 0));
        }
        return *this;
    }
    // The samples that are not 0, as "place:sample".
    std::string Heard() const
    {
        std::string text;
        for (size_t i = 0; i < heard.size(); i++)
            text += heard[i] ? " " + std::to_string(i) + ":" + std::to_string(heard[i]) : "";
        return text;
    }
    std::vector<S16> heard;
};

// Frames without a block are silence, a frame with two is twice as long; what is missing of short
// blocks, as all are here, is silence too.
TEST(SoundStream, EveryBlockComesOutAtItsPlace)
{
    for (const U8 format : {14, 14 + 0x30, 14 + 0x10}) {
        SoundScene scene(SoundMovie("1 / 2 / / 3 4 / 5 / .", 1000, format));
        EXPECT_EQ(" 0:1 1000:2 3000:3 4000:4 5000:5", scene.Do("tpppp").Heard()) << int(format);
        EXPECT_TRUE(scene.movie.streamChannel->StreamEnded());
    }
}

// Byte by byte nothing is lost or put into another order, and what waits does not count. A stream
// that waits goes on with 5 seconds' lead, or at the end of the data.
TEST(SoundStream, WaitsForData)
{
    std::string words, resumed;
    for (int i = 1; i <= 60; i++)
        words += std::to_string(i) + " / ";
    for (const size_t missing : {0, 1}) {
        const std::vector<U8> bytes = SoundMovie(words, 1500);
        SoundScene scene;
        for (size_t at = 0; at + missing < bytes.size(); at++) {
            const bool waited = scene.movie.streamChannel && scene.movie.streamChannel->Waiting();
            scene.movie.PushDataBuf(&bytes[at], 1), scene.Do("tp");
            if (waited && !scene.movie.streamChannel->Waiting())
                resumed += " " + std::to_string(scene.movie.numFramesComplete);
        }
        EXPECT_LT(scene.movie.streamChannel->ElapsedFrames(), 61);
        scene.movie.SetDataComplete(), scene.Do(std::string(60, 'p'));
        int next = 1;
        for (const S16 sample : scene.heard)
            next += sample == next;
        EXPECT_TRUE(next == 61 && scene.movie.streamChannel->StreamEnded());
    }
    EXPECT_EQ(" 50 16000 50", resumed) << "frame 0 was heard; 50 more are needed";
}

// Sounds that the reader meets start once, in the buffer where their frame's sound begins, whether
// or not the timeline has defined them yet; without a stream the timeline starts them.
TEST(SoundStream, EventSounds)
{
    SoundScene scene(SoundMovie("d1,100 d2,7 s2,0 s2,32 s1,0 / s1,0 1 / / /"
                                "f1 d1,200 d1,400 s1,0 s7,0 d2,9 / / .",
                                1024));
    EXPECT_EQ(" 0:100 2048:101 4096:200", scene.Do("tptpppttttp").Heard());
}

// What ends a stream ends its sound; the next block met starts it at the present frame, fading in.
// The counts and seeks of MPEG blocks are seen by the sound that follows them.
TEST(SoundStream, SeeksLoopsAndStops)
{
    SoundScene scene(SoundMovie("10 / 20 / 30 / 40 / 50 / 60 / .", 1024));
    scene.Do("tp").movie.Seek(3);
    EXPECT_EQ(2, scene.movie.streamChannel->ElapsedFrames()) << "met behind frame 2";
    scene.movie.Play(0), scene.Do("p").movie.StopPlay();
    scene.Do("p").movie.Play(0), scene.Do("tpttp").movie.Silence();
    scene.Do("p").movie.Seek(2), scene.movie.ClearScript();
    EXPECT_EQ(" 0:10 1024:20 3072:25 7168:30 8192:10 9216:20", scene.Do("p").Heard());
    SoundScene mpeg(SoundMovie("d1,100 m2048,0 / m0,-4096 / m0,0 / s1,0 / .", 999, 14 + 0x20));
    EXPECT_EQ(mp3decPresent() ? " 6144:100" : "", mpeg.Do("tppppp").Heard());
}

// No sound, and the timeline goes on.
TEST(SoundStream, Nonsense)
{
    for (const auto& [words, count, format] : std::vector<std::tuple<const char*, U16, U8>>{
             {"5 / 5 / /", 0, 14}, {"5 / / /", 9, 0x4E}, {"d1,1 s2,0 / / /", 9, 14}}) {
        SoundScene scene(SoundMovie(words, count, format));
        EXPECT_EQ("", scene.Do("tptptp").Heard());
        EXPECT_TRUE(scene.movie.curFrame == 2 && !scene.movie.streamChannel) << words;
    }
}

} // namespace
