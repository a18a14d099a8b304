// The picture keeps time with the streaming sound.
#include "core/player/limits.h"
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

// A device that asks for nothing paces for a second; the picture then goes by the clock, until the
// device goes on.
TEST(Pacing, DevicesThatDoNotAsk)
{
    EXPECT_EQ("1 1 1 2 2 3 11 ", Frames(false, {-100, -500, -400, -1, -99, -1, 0}));
    EXPECT_EQ("1 10 11 12 22 ", Frames(false, {-100, 900, -1050, -100, 0}));
    gLimits.framesPerTick = 0;
    EXPECT_EQ("0 1 2 3 ", Frames(false, {45, 500, 1, 1}));
    gLimits = {};
}

// What is heard within so many ticks of a shell that ticks the player only while it runs.
static std::string Heard(NativeSoundMix* mix, NativePlayerWnd* player, int ticks, S64 ms = 100)
{
    std::string heard;
    for (mix->Record(); ticks > 0; ticks--) {
        AdvanceHeadlessClock(ms * 1000), mix->Pump();
        player->running ? player->DoPlay(1) : void();
    }
    for (size_t i = 0; i < mix->Recording().size(); i += 2)
        if (const S16 sample = mix->Recording().data()[i])
            heard += std::to_string(sample) + " ";
    return heard;
}

// It is silent from then on, and from the first frame on when that comes later; its timer knows the
// movie's rate. Sounds that are stopped from elsewhere leave the way to further ones free.
TEST(Pacing, SuspendAndRun)
{
    const std::vector<U8> movie = SoundMovie("b9 / d1,100 s1,0 b8 /", 4410, 14, 9);
    for (const bool late : {false, true}) {
        NativeSoundMix mix;
        NativePlayerWnd player(20, 20);
        player.PlayThrough(&mix), player.Run();
        EXPECT_FALSE(player.TimerRuns());
        late ? player.Suspend() : void();
        player.Feed(movie.data(), movie.size());
        EXPECT_EQ(late ? "" : "9 100 8 9 100 8 ", Heard(&mix, &player, 4));
        player.Suspend();
        EXPECT_EQ("", Heard(&mix, &player, 5));
        player.GotoFrame(1), player.Suspend(); // once more, for what that has started
        EXPECT_EQ("", Heard(&mix, &player, 5));
        player.Play(0), player.Run();
        EXPECT_TRUE(player.TimerRuns() && player.TimerInterval() == 10);
        EXPECT_NE("", Heard(&mix, &player, 4));
        mix.RemoveAll();
        EXPECT_EQ("100 100 ", Heard(&mix, &player, 4));
    }
}

// The stream of a level paces all movies; that of a sprite is heard and nothing else.
TEST(Pacing, StreamsElsewhere)
{
    const std::vector<U8> cover = SoundMovie("b9 /", 4410, 14, 30);
    TagWriter sprite;
    sprite.Raw(18, ByteWriter().PutU16(0x0E0E).PutU16(4410));
    for (int i = 0; i < 30; i++)
        sprite.Raw(19, ByteWriter().PutU16(9)).Show();
    MovieWriter movie(2000, 2000, Fps(10));
    movie.Show().DefineSprite(2, sprite.End()).Place(2, 1).Show(30).End();
    for (const bool level : {true, false}) {
        NativeSoundMix mix;
        NativePlayerWnd player(20, 20);
        const std::vector<U8> root = level ? MovingSquare(30) : movie.Bytes();
        player.PlayThrough(&mix), player.Feed(root.data(), root.size());
        level ? player.OpenLayer(1, 0)->PushDataBuf(cover.data(), S32(cover.size())) : void();
        player.Tick();
        EXPECT_EQ("9 9 9 9 9 9 9 9 9 9 ", Heard(&mix, &player, 1, 1000));
        EXPECT_EQ(level ? 11 : 2, player.curFrame);
    }
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
