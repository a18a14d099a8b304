#include <chrono>
#include <deque>
#include <numeric>
#include <sstream>
#include <thread>

#include <gtest/gtest.h>

#include "core/player/limits.h"
#include "core/sound/sound_info.h"
#include "core/stream/parser.h"
#include "platform/headless/headless_sound.h"
#include "platform/headless/native_player.h"

namespace {

std::string Text(const S16* block, int format, S32 first, S32 count)
{
    std::string text;
    for (S32 i = first; i < first + count; i++)
        text += " " + std::to_string(format & 2 ? block[i] : reinterpret_cast<const U8*>(block)[i]);
    return text;
}

struct TestMix : NativeSoundMix {
    explicit TestMix(int format) : cap(U8(format)) { OpenDevice(); }
    bool OpenNativeDevice(CSound* f) override
    {
        return asked++, NativeSoundMix::OpenNativeDevice(f);
    }
    void GetNativeSoundCap(U8* format) override { *format = cap; }
    std::string Play(S32 at, S32 count) { return Text(PlayBuffer(0), cap, at, count); }
    U8 cap;
    int asked = 0; // for the device
};

// What a stream's refill brings.
struct Step {
    S32 samples;
    S16 silence;
    bool more;
};

// A channel and its samples, read from text; without any 1, 2, 3, ..., 3000. A stream of these goes
// by its steps, and meets a sound with each.
struct Sound {
    Sound(int f, const std::string& text, U64 tag = 0) : block(4096)
    {
        std::istringstream in(text);
        S32 n, bytes = text.empty() ? 6000 : 0;
        for (std::iota(block.begin(), block.end(), 1); in >> n; bytes += f & 2 ? 2 : 1)
            f & 2 ? block[bytes / 2] = S16(n) : reinterpret_cast<U8*>(&block[0])[bytes] = U8(n);
        it->sound = {U8(f), kS32Max, reinterpret_cast<U8*>(&block[0]), bytes, 0};
        it->tag = tag;
    }
    Sound(CSoundMix* m, Sound* e, std::deque<Step> s) : Sound(6, "", 9)
    {
        mix = m, met = e, steps = s;
        it->sound.numSamples = 100, it->refill = Refill, it->refillContext = this;
        it->Prepare(), e->it->Prepare();
        it->decomp->Setup(&it->sound, true);
    }
    ~Sound() { it->Release(); }
    static bool Refill(CSoundChannel* channel, void* context)
    {
        Sound* stream = static_cast<Sound*>(context);
        stream->mix->AddSoundLocked(stream->met->it);
        const Step step = stream->steps.front();
        if (stream->steps.size() > 1)
            stream->steps.pop_front();
        channel->blockLeft = step.samples, channel->silenceCount = step.silence;
        return step.more;
    }
    std::vector<S16> block;
    CSoundChannel* it = new CSoundChannel;
    CSoundMix* mix = nullptr;
    Sound* met = nullptr;
    std::deque<Step> steps;
};

// Formats: 4 is 8-bit at 11025 Hz; +4 doubles the rate, +2 is 16-bit, +1 is stereo. How: in and out
// point, loops, envelope.
TEST(Mixer, EventSoundsByHand)
{
    const struct {
        int from, to;
        std::vector<const char*> sounds;
        const char* how;
        std::string heard;
    } cases[] = {
        {11, 15, {"10 -10 13 -20"}, "0 99 1", " 10 -10 10 -10 11 -15 13 -20"},
        {6, 14, {"4 8"}, "0 99 1", " 4 4 4 4 5 6 7 8 6 4 2 0"},
        {14, 10, {"1 2 -3 -4 9"}, "0 99 1", " 1 -4 4 0"},
        {13, 5, {"10 9 11 9 20 9 23 9"}, "0 99 1", " 15 9"},
        {12, 14, {"0 128 255"}, "0 99 1", " -32768 0 32512 0"},
        {14, 12, {"-32768 -1 0 255 256 32767"}, "0 99 1", " 0 127 128 128 129 255 128"},
        {15, 14, {"3 4 -3 -4"}, "0 99 1", " 3 -4 0"},
        {8, 15, {"130 131"}, "0 99 1", " 512 512 512 512 512 512 768 768"},
        {14, 14, {"80 80 80 80 80 80"}, "0 99 1 1 0 0 5 32768 32768", " 0 0 20 40 60 80 0"},
        {14, 14, {"9 32767 32767 32767"}, "0 9 1 0 32768 32768 6 0 0", " 9 27306 21845 16383"},
        {14, 14, {"20000 -20000 3"}, "0 9 1 9 65535 65535", " 32767 -32768 5"},
        {12, 12, {"255 0 138"}, "0 9 1 0 65535 65535", " 255 0 147"},
        {11, 11, {"0 8 80 80 80 80"}, "0 9 1 0 0 32768 8 32768 0", " 0 8 20 60 40 40"},
        {14, 14, {"8 8 8 8 8 8"}, "0 9 1 3 0 0 1 32768 32768 5 0 0", " 0 0 0 4 2 0"},
        {12, 12, {}, "", " 128"},
        {14, 14, {"30000 32767", "30000 1", "-30000 0"}, "0 9 1", " 30000 32767 0"},
        {12, 12, {"128 255 0", "0 255 0", "255 255 0"}, "0 9 1", " 127 255 0 128"},
        {14, 14, std::vector<const char*>(9, "-4000"), "0 9 1", " -32000"},
        {14, 14, {""}, "3 6 2", " 4 5 6 4 5 6 0 0"},
        {14, 14, {""}, "6 6 2", " 0"},
        {6, 6, {""}, "8003 8008 0", " 2001 2002 0"},
        {12, 12, {"1 2 3"}, "0 4294967295 2", " 1 2 3 1 2 3 128"}};
    for (const auto& c : cases) {
        std::deque<Sound> sounds;
        TestMix mix(c.to);
        for (const char* text : c.sounds) {
            CSoundChannel* it = sounds.emplace_back(c.from, text).it;
            std::istringstream how(c.how);
            how >> it->inPoint >> it->outPoint >> it->loops;
            for (SEnvelopePoint p; how >> p.position >> p.left >> p.right;)
                it->points[it->numPoints++] = p;
            EXPECT_EQ(it->inPoint < it->outPoint, mix.AddSound(it));
        }
        EXPECT_EQ(c.heard, mix.Play(0, S32(std::count(c.heard.begin(), c.heard.end(), ' '))));
        mix.PurgeList(), mix.PlayBuffer(0);
        EXPECT_EQ(c.sounds.empty() || c.heard == " 0" ? 2 : 1, mix.IdleCount());
    }
}

// The frame before a block is carried over, the envelope and the loop go on; a ninth sound advances
// unheard and moves up in step.
TEST(Mixer, GoesOnAcrossBuffers)
{
    TestMix mix(14);
    Sound slow(10, "");
    slow.it->numPoints = 2;
    slow.it->points[0] = {2048, 32768, 32768}, slow.it->points[1] = {4096, 0, 0};
    mix.AddSound(slow.it);
    EXPECT_EQ(" 1 1 1 2 2", mix.Play(0, 5));
    EXPECT_EQ(" 1024 1024 1023", mix.Play(0, 3)) << "1024.5, 1025, 1025.5, falling by 16 / 32768";
    mix.RemoveAll();
    std::deque<Sound> sounds;
    for (int i = 0; i < 10; i++) {
        sounds.emplace_back(14, i % 9 ? "" : "1").it->loops = 2;
        mix.AddSound(sounds[i].it);
    }
    EXPECT_EQ(" 8 15 21", mix.Play(0, 3));
    EXPECT_TRUE(sounds[9].it->Removed());
    EXPECT_EQ(" 23992 24000 8", mix.Play(950, 3)) << "8 x 2999";
}

// Sounds 1 and 3 are one, tagged differently. Sums of what is heard tell who plays.
TEST(Mixer, FlagsAndRemoval)
{
    TestMix mix(14);
    std::deque<Sound> sounds;
    const auto add = [&](U64 tag, int like, int flags) {
        CSoundChannel* it = sounds.emplace_back(14, "", tag).it;
        it->sound = sounds[like].it->sound;
        it->syncFlags = U8(flags);
        return mix.AddSound(it);
    };
    EXPECT_TRUE(add(1, 0, 0) && add(2, 1, 0) && add(1, 1, 0));
    EXPECT_FALSE(add(2, 1, kSyncNoMultiple));
    EXPECT_EQ(" 3", mix.Play(0, 1));
    mix.RemoveTagged(1);
    EXPECT_EQ(" 2049", mix.Play(0, 1));
    EXPECT_TRUE(add(1, 0, kSyncNoMultiple) && !add(1, 1, kSyncStop));
    EXPECT_FALSE(mix.SoundPlaying(&sounds[1].it->sound));
    EXPECT_EQ(" 1", mix.Play(0, 1));
    mix.FreeSound(&sounds[0].it->sound);
    EXPECT_EQ(" 0", mix.Play(0, 1));
}

// Movies may share data, and still stop their own sounds only.
TEST(Mixer, SoundsOfTwoMoviesAreTwo)
{
    TestMix mix(14);
    Sound one(14, "5"), other(14, "");
    other.it->sound = one.it->sound, other.it->sound.movie = 1;
    other.it->syncFlags = kSyncNoMultiple;
    EXPECT_TRUE(mix.AddSound(one.it) && mix.AddSound(other.it));
    mix.FreeSound(&one.it->sound);
    EXPECT_TRUE(mix.SoundPlaying(&other.it->sound) && !mix.SoundPlaying(&one.it->sound));
}

// What will not play makes no decoder, and a device that is refused is asked for every 2 s.
TEST(Mixer, StartsThatWillNotPlay)
{
    TestMix mix(14);
    std::deque<Sound> sounds;
    const auto add = [&](int flags) {
        CSoundChannel* it = sounds.emplace_back(14, "").it;
        it->sound = sounds[0].it->sound;
        it->syncFlags = U8(flags);
        const bool plays = mix.AddSound(it);
        return std::to_string(plays) + (it->decomp ? "+" : "-");
    };
    EXPECT_EQ("1+", add(0));
    EXPECT_EQ("0-", add(kSyncNoMultiple));
    while (sounds.size() < gLimits.soundChannels + 1)
        add(0);
    EXPECT_EQ("0-", add(0));
    mix.CloseDevice(), mix.RemoveAll();
    mix.refuseDevice = true, mix.asked = 0;
    std::string asked;
    for (int s = 0; s < 5; s++, AdvanceHeadlessClock(1000000))
        add(0), asked += add(0) + std::to_string(mix.asked) + " ";
    EXPECT_EQ("0-1 0-1 0-2 0-2 0-3 ", asked);
    mix.refuseDevice = false;
    EXPECT_TRUE(mix.DeviceRefused() && !mix.HasRoom());
    AdvanceHeadlessClock(1000000);
    EXPECT_EQ("1+", add(0));
    EXPECT_FALSE(mix.DeviceRefused());
}

// Far more than a buffer may pass over: 3 more a frame since the last of every 4096.
TEST(Mixer, LateInPointIsHeardAtOnce)
{
    TestMix mix(14);
    const std::vector<U8> data(1 << 20);
    Sound late(14, "");
    late.it->sound = {14 + kSoundAdpcm, kS32Max, data.data(), S32(data.size()), 0};
    late.it->inPoint = 2500000;
    EXPECT_TRUE(mix.AddSound(late.it));
    EXPECT_EQ(" 4320 4323", mix.Play(0, 2));
    EXPECT_LT(2500000u / 16, late.it->StartCost());
}

// All fields, none, and a record passed over.
TEST(Mixer, StartRecord)
{
    struct : SParser {
    } parser;
    const U8 data[] = {0x3F, 1, 2, 0, 0, 5,    6,    7, 8,    9, 1,
                       1,    3, 0, 0, 1, 0x34, 0x12, 2, 0x80, 0, 0xFF};
    parser.Attach(data, sizeof data);
    Sound sound(14, "");
    const CSoundChannel& it = *sound.it;
    GetSoundInfo(&parser, sound.it);
    EXPECT_TRUE(parser.pos == 20 && it.syncFlags == 3 && it.inPoint == 0x201 && it.numPoints == 1);
    EXPECT_TRUE(it.outPoint == 0x08070605 && it.loops == 0x109 && it.points[0].left == 0x1234);
    EXPECT_TRUE(it.points[0].position == 0x01000003 && it.points[0].right == 0x8002);
    GetSoundInfo(&parser, sound.it);
    EXPECT_TRUE(parser.pos == 21 && it.syncFlags == 0 && it.inPoint == 0x201 && it.loops == 0x109);
    parser.pos = 0, GetSoundInfo(&parser, nullptr);
    EXPECT_EQ(20, parser.pos);
}

// Buffers end every 46.44 ms; what was not asked for in time, up to an hour, is made up for.
TEST(Mixer, PulledByTheClock)
{
    SetHeadlessClock(5000000);
    NativeSoundMix mix;
    Sound sound(15, "7 8", 0);
    mix.Record(), mix.AddSound(sound.it);
    std::string buffers;
    for (const S64 step :
         std::vector<S64>{46439, 1, 46439, 1000000, -3000000, 46440, 3700000000, 46440}) {
        AdvanceHeadlessClock(step), mix.Pump();
        buffers += std::to_string(mix.Recording().size() / 4096) + " ";
    }
    EXPECT_EQ("0 1 1 23 23 24 24 25 ", buffers);
    EXPECT_EQ(" 7 8 0", Text(mix.Recording().data(), 15, 0, 3));
}

// 512 frames a buffer: 10, 5 of silence, a picture frame's 100 of silence, 300, silence for ever.
TEST(Mixer, Streams)
{
    SetHeadlessClock(0x7FFFFF8 * S64(1000)); // 8 ms before it starts over
    TestMix mix(6);
    Sound met(6, "1000");
    Sound stream(&mix, &met, {{10, 0, 1}, {0, -5, 1}, {0, 0, 1}, {300, 0, 1}, {0, 0, 0}});
    stream.it->SetSamplesPlayed(200);
    ASSERT_TRUE(mix.AddSound(stream.it));
    std::string text;
    for (const S64 milliseconds : {0, 10, 53, 500}) {
        AdvanceHeadlessClock(milliseconds * 1000);
        text += std::to_string(stream.it->ElapsedFrames());
    }
    const S16* heard = mix.PlayBuffer(0);
    for (const S32 at : {0, 9, 114, 414})
        text += Text(heard, 6, at, 2);
    EXPECT_EQ("2399 1001 2 10 0 0 11 310 0", text) << "63 ms are guessed at most";
    EXPECT_TRUE(stream.it->ElapsedFrames() == 7 && stream.it->StreamEnded()) << "712 samples";
    Sound quiet(&mix, &met, {{400, 0, 1}});
    quiet.it->doNotCount = quiet.it->fadeIn = true;
    mix.AddSound(quiet.it);
    EXPECT_EQ(" 128", mix.Play(256, 1)) << "257 half way up";
    AdvanceHeadlessClock(50000);
    EXPECT_EQ(0, quiet.it->ElapsedFrames());
}

// The audio thread plays; the player adds, asks, removes and purges; a reader adds from within.
TEST(Mixer, TwoThreads)
{
    TestMix mix(15);
    std::atomic<bool> stop{false};
    std::thread audio([&] {
        for (; !stop; std::this_thread::sleep_for(std::chrono::microseconds(20)))
            mix.PlayBuffer(0);
    });
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(2);
    for (U64 round = 0; std::chrono::steady_clock::now() < end; round++) {
        Sound event(12, "1 2 3 4", round % 3), met(14, "", round % 2);
        event.it->loops = 5000;
        mix.AddSound(event.it);
        Sound stream(&mix, &met, {{100, 0, 1}, {0, 3, 1}, {50, 0, 0}});
        EXPECT_TRUE(mix.AddSound(stream.it));
        while (!stream.it->StreamEnded())
            mix.PurgeList(), stream.it->ElapsedFrames();
        mix.RemoveTagged(round % 3 ? 9 : 1), mix.FreeSound(&event.it->sound), mix.RemoveAll();
    }
    stop = true;
    audio.join();
}

} // namespace
