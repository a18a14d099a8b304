// The picture keeps time with the streaming sound.
#include "platform/headless/headless_sound.h"
#include "tests/player/player_scene.h"
#include "tests/support/sound_writer.h"

#include <thread>

// The frames shown at later and later times, in ms, with an x where no device is open; at negative
// times it has stood still.
static std::string Frames(bool noDevice, const std::vector<S64>& steps)
{
    NativeSoundMix mix;
    mix.refuseDevice = noDevice;
    SPlayer::theSoundMix = &mix;
    PlayingShell player(SoundMovie("b9 /", 4410, 14, 30));
    player.loop = false;
    std::string frames;
    for (const S64 step : steps) {
        AdvanceHeadlessClock(std::abs(step) * 1000);
        step < 0 ? void() : mix.Pump();
        player.DoPlay(1);
        frames += std::to_string(player.curFrame) + (mix.IsDeviceOpen() ? " " : "x ");
    }
    SPlayer::theSoundMix = nullptr;
    return frames;
}

// Frame n is due when half of the one before has been heard. A clock that jumps takes the picture
// along, but no further than 63 ms beyond the last buffer; at the end of the sound, and without a
// device, it rules. After 2 s of silence the device is closed.
TEST(Pacing, PictureFollowsWhatIsHeard)
{
    EXPECT_EQ("0 1 2 2 12 12 17 27 28 28 29 29 29 29x ",
              Frames(false, {45, 15, 100, 5, 1000, -500, 0, 1000, 3000, 50, 50, 100, 2000, 100}));
    EXPECT_EQ("1x 2x 2x 3x ", Frames(true, {0, 100, 99, -1}));
}

// A device that is never closed.
struct Driver : NativeSoundMix {
    void CloseNativeDevice() override {}
};

// It asks for buffers all the time, while movies arrive, seek, play on and are gone.
TEST(Pacing, TwoThreads)
{
    Driver driver;
    SPlayer::theSoundMix = &driver;
    std::atomic<bool> stop{!driver.OpenDevice()};
    std::thread audio([&] {
        for (; !stop; std::this_thread::sleep_for(std::chrono::microseconds(20)))
            driver.PlayBuffer(0);
    });
    const std::vector<U8> bytes = SoundMovie("d1,5 b1 s1,0 / d2,6 s2,0 / f1 b3 /", 441, 14, 40);
    for (size_t round = 0; round < 300; round++) {
        NativePlayerWnd player(20, 20);
        for (size_t at = 0, n = round % 50 + 7; at < bytes.size(); at += n) {
            player.Feed(&bytes[at], std::min(n, bytes.size() - at));
            at % 11 ? void() : player.GotoFrame(S32(at % 13));
            player.Play(0), player.DoPlay(0);
        }
        driver.RemoveAll();
    }
    stop = true, audio.join(), SPlayer::theSoundMix = nullptr;
}
