#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iterator>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "platform/sdl/sdl_sound.h"

namespace {

S32 Milliseconds()
{
    const auto now = std::chrono::steady_clock::now().time_since_epoch();
    return S32(std::chrono::duration_cast<std::chrono::milliseconds>(now).count() & 0x7FFFFFF);
}

template <typename Done> bool Wait(Done done)
{
    for (int i = 0; i < 5000 && !done(); i++)
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    return done();
}

// Frames i, -i of CD quality; as a stream without data, 10 ms of silence a picture frame.
CSoundChannel* NewChannel(const std::vector<S16>& samples, bool stream)
{
    CSoundChannel* channel = new CSoundChannel;
    const S32 bytes = S32(samples.size()) * 2;
    channel->sound = {15, stream ? 441 : bytes / 4, reinterpret_cast<const U8*>(&samples[0]),
                      bytes};
    if (stream)
        channel->refill = [](CSoundChannel*, void*) { return true; };
    return channel;
}

// Its audio thread hands on what the mixer makes, sample by sample.
TEST(SdlSound, DiskDriverWritesTheSamples)
{
    const std::string path = testing::TempDir() + "vexel_sdl_" + std::to_string(getpid()) + ".raw";
    setenv("SDL_AUDIODRIVER", "disk", 1);
    setenv("SDL_DISKAUDIOFILE", path.c_str(), 1);
    setenv("SDL_DISKAUDIODELAY", "2", 1);
    std::vector<S16> samples;
    for (S16 i = 1; i <= 10000; i++)
        samples.insert(samples.end(), {i, S16(-i)});
    NativeSoundMix mix(Milliseconds);
    CSoundChannel* channel = NewChannel(samples, false);
    EXPECT_TRUE(mix.AddSound(channel));
    EXPECT_TRUE(Wait([&] { return channel->Removed(); }));
    channel->Release();
    EXPECT_TRUE(Wait([&] { return mix.IdleCount() > 1; }));
    mix.CloseDevice();
    std::ifstream file(path, std::ios::binary);
    const std::string raw{std::istreambuf_iterator<char>(file), {}};
    std::vector<S16> written(raw.size() / 2);
    std::memcpy(written.data(), raw.data(), written.size() * 2);
    const auto first = std::find(written.begin(), written.end(), 1);
    ASSERT_GT(size_t(written.end() - first), samples.size());
    EXPECT_TRUE(std::equal(samples.begin(), samples.end(), first));
    EXPECT_EQ(0, std::count_if(written.begin(), first, [](S16 s) { return s != 0; }));
    EXPECT_EQ(0, (first - written.begin()) % 4096) << "begins with a buffer";
    std::remove(path.c_str());
}

// A stream is heard at the pace of time, whatever the player's thread adds and takes away.
TEST(SdlSound, DummyDriverKeepsTime)
{
    setenv("SDL_AUDIODRIVER", "dummy", 1);
    NativeSoundMix mix(Milliseconds);
    const std::vector<S16> samples(20, 100);
    CSoundChannel* stream = NewChannel(samples, true);
    const S32 start = Milliseconds();
    ASSERT_TRUE(mix.AddSound(stream));
    const auto tick = [&] {
        CSoundChannel* event = NewChannel(samples, false);
        EXPECT_TRUE(mix.AddSound(event));
        event->Release();
        mix.PurgeList();
        return stream->ElapsedFrames() >= 50;
    };
    EXPECT_TRUE(Wait(tick));
    EXPECT_LT(350, (Milliseconds() - start) & 0x7FFFFFF);
    mix.CloseDevice();
    EXPECT_TRUE(tick()) << "opens it again";
    stream->Release();
}

TEST(SdlSound, NoDeviceIsSaid)
{
    setenv("SDL_AUDIODRIVER", "nothing like that", 1);
    NativeSoundMix mix(Milliseconds);
    CSoundChannel* channel = NewChannel({1, 1}, false);
    EXPECT_FALSE(mix.AddSound(channel));
    EXPECT_TRUE(mix.DeviceRefused());
    channel->Release();
}

} // namespace
