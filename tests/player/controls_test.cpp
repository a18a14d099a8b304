#include "platform/headless/headless_sound.h"
#include "tests/player/player_scene.h"
#include "tests/support/glyph_writer.h"

#include <cstdlib>

namespace {

// A shell that keeps what it is told, and supplies fonts and movies.
struct ToldShell : PlayingShell {
    using PlayingShell::PlayingShell;
    void EnableMenus(const MenuStatus& status) override { menu = status; }
    void StreamGetURLNotify(const char*, const char*, void* notifyData) override
    {
        StreamFailed(notifyData);
        PushDataBuf(answer.data(), S32(answer.size()));
    }
    void GetUnixFontData(U8** data, S32* size) override
    {
        *data = static_cast<U8*>(std::malloc(answer.size() + 1));
        *size = S32(std::copy(answer.begin(), answer.end(), *data) - *data);
        answer.assign(9, 0); // no movie the second time
    }

    MenuStatus menu = {};
    std::vector<U8> answer;
};

// Three frames, from the first; then the frame, and whether the menus show it playing, looping,
// able to go forward and back. A movie that stands on its last frame with its loop off starts anew.
TEST(Controls, StepThroughTheMovieWithTheMenus)
{
    ToldShell player(MovingSquare(3));
    const std::pair<void (SPlayer::*)(), S32> steps[] = {
        {&SPlayer::ControlForward, 10111}, {&SPlayer::ControlForward, 20101},
        {&SPlayer::ControlForward, 20101}, {&SPlayer::ControlBack, 10111},
        {&SPlayer::ControlForward, 20101}, {&SPlayer::ControlLoop, 20001},
        {&SPlayer::ControlPlay, 1010},     {&SPlayer::ControlPlay, 10},
        {&SPlayer::ControlForward, 10011}, {&SPlayer::ControlRewind, 10},
    };
    for (const auto& [control, expected] : steps) {
        (player.*control)();
        const MenuStatus& m = player.menu;
        const S32 flags = m.playing * 1000 + m.looping * 100 + m.canForward * 10;
        EXPECT_EQ(expected, player.curFrame * 10000 + flags + (m.canBack & m.canRewind));
    }
    player.autoQuality = 1;
    player.SetMenuState(MenuStatus{});
    player.ControlHighQuality();
    EXPECT_FALSE(player.scene.antialias || player.autoQuality || player.menu.canPlay);
}

// What is not there yet may come, unless the stream has ended without it.
TEST(Controls, ForwardWhileLoading)
{
    const std::vector<U8> movie = MovingSquare(3);
    std::string possible;
    for (const size_t missing : {movie.size() - 15, size_t(30), size_t(5), size_t(0)}) {
        NativePlayerWnd player(0, 0);
        player.Feed(movie.data(), movie.size() - missing);
        for (MenuStatus menu : {MenuStatus(), MenuStatus()}) {
            player.GetMenuState(&menu), player.EndOfData();
            possible += std::to_string(menu.canForward);
        }
    }
    EXPECT_EQ("00101111", possible);
}

// The host's flags; then without them.
TEST(Controls, OpenAndClose)
{
    ToldShell player(MovingSquare(3));
    player.ControlOpen(""); // else the timer would stop
    player.sharedTimer = player.hostCamera = 1;
    player.SetZoomRect(0, 0, 100, 100);
    const S32 scale = player.scene.camera.a;
    MovieWriter movie(777, -50);
    movie.Show(9);
    player.answer = movie.Bytes();
    player.ControlOpen("a movie");
    EXPECT_TRUE(player.TimerRuns() && !player.running && !player.IsZoomed());
    EXPECT_TRUE(player.scene.camera.a == scale && player.Width() == 38 && player.Height() == 0);
    player.sharedTimer = player.hostCamera = 0;
    player.PushDataComplete();
    player.ControlClose();
    EXPECT_FALSE(player.TimerRuns() || player.menu.canBack || player.scene.camera.a == scale);
    player.Feed(MovingSquare(2).data(), 30);
    EXPECT_EQ(100, player.Width()) << "each movie its own size";
}

// A frame of 2000 x 1600 twips on 100 x 80 pixels. Half of the view around its middle, within the
// frame, no closer than a twip a pixel; what shows the whole frame is no zoom. Cameras are
// right to a pixel, and a pixel is 20 twips.
TEST(Zoom, StaysWithinTheFrame)
{
    const std::pair<void (*)(SPlayer&), SRECT> cases[] = {
        {[](SPlayer& p) { p.ZoomScale(200), p.ControlZoomOut(); }, {kRectEmpty, 0, 0, 0}},
        {[](SPlayer& p) { p.ControlZoomContext(30, 20); }, {100, 1100, 0, 800}},
        {[](SPlayer& p) { p.ControlZoomIn(), p.Pan(10, -5); }, {600, 1600, 350, 1150}},
        {[](SPlayer& p) { p.ControlZoomIn(), p.Pan(99, -99); }, {1000, 2000, 0, 800}},
        {[](SPlayer& p) { p.Pan(10, 10); }, {kRectEmpty, 0, 0, 0}},
    };
    PlayingShell player(MovingSquare(3), 100, 80);
    for (size_t i = 0; i < 2 * std::size(cases); i++) {
        player.Home();
        player.SetQuality(i % 2);
        cases[i / 2].first(player);
        EXPECT_TRUE(RectEqual(&cases[i / 2].second, &player.zoomRect, 30)) << i;
    }
    const std::tuple<SPOINT, SPOINT, SRECT> views[] = {
        {{9, -7}, {300, 300}, {250, 350, 260, 340}},
        {{301, 201}, {301, 1599}, {151, 452, 1399, 1600}},
        {{4000, 400}, {1000, -300}, {0, 2000, 0, 400}},
    };
    for (const auto& [size, centre, view] : views) {
        player.Zoom(size, centre);
        EXPECT_TRUE(RectEqual(&view, &player.zoomRect, 0)) << size.x;
    }
}

// However often it moves a zoom keeps its size, and its place when it moves to and fro; it comes to
// rest a pixel from the frame's side at most. What the scale mode adds or cuts away counts with
// what is visible. At the fixed scale it waits.
TEST(Zoom, PansWithoutLoss)
{
    const SRECT start = {301, 1304, 401, 1203}, last = {997, 2000, 798, 1600};
    const SRECT down = {500, 1500, 50, 450}, left = {-750, 1250, 600, 1000};
    for (int quality : {0, 1}) {
        PlayingShell player(MovingSquare(3), 100, 80);
        player.SetQuality(quality);
        player.zoomRect = start;
        player.SetCamera(2);
        for (int i = 0; i < 200; i++)
            i % 2 ? player.Pan(-3, 2) : player.Pan(3, -2);
        EXPECT_TRUE(RectEqual(&start, &player.zoomRect, 0));
        player.Pan(kS32Max, kS32Max), player.Pan(9, 9);
        const SRECT& z = player.zoomRect;
        EXPECT_TRUE(RectEqual(&last, &z, 10) && z.xmax <= 2000 && z.ymax <= 1600);
        player.scaleMode = kScaleFixed;
        player.Pan(kS32Min, kS32Min);
        EXPECT_GT(z.xmin, 900);
        player.scaleMode = kScaleShowAll;
        player.SetZoomRect(500, 0, 1500, 400), player.Pan(0, 5);
        EXPECT_TRUE(RectEqual(&down, &z, 0));
        player.scaleMode = kScaleFill;
        player.SetZoomRect(0, 600, 2000, 1000), player.Pan(-999, 0);
        EXPECT_TRUE(RectEqual(&left, &z, 5)) << z.xmin;
    }
}

// 100% is a scale of its own, during which a zoom waits; or a zoom to the top left corner.
TEST(Zoom, And100Percent)
{
    ToldShell player(MovingSquare(3), 50, 40);
    player.Control100();
    player.SetZoomRect(0, 0, 100, 80);
    EXPECT_TRUE(player.scene.camera.a == 13107 && player.menu.view100 && !player.menu.viewAll);
    player.SetZoomRect(10, 0, 10, 800);
    EXPECT_NEAR(6553, player.scene.camera.a, 1) << "no rectangle: the whole movie";
    player.scaleMode = SPlayer::kScaleTopLeft100;
    player.Control100();
    EXPECT_TRUE(player.zoomRect.xmax == 1000 && player.zoomRect.ymax == 800 && player.menu.view100);
    player.SetZoomRect(kS32Min, 0, 100, 80);
    EXPECT_TRUE(player.IsZoomed());
    ToldShell nowhere(MovingSquare(3), 50, 0);
    nowhere.scaleMode = SPlayer::kScaleTopLeft100;
    nowhere.Control100();
    EXPECT_FALSE(nowhere.IsZoomed() || nowhere.menu.view100);
}

// The movie of the fonts is run once and asked for once, and nothing of it is seen, heard or plays
// on.
TEST(Fonts, AreDefinedOnce)
{
    MovieWriter movie;
    movie.Background({9, 9, 9, 255})
        .Raw(14, ByteWriter().PutU16(3).PutBytes({14, 1, 0, 0, 0, 7, 7}));
    movie.Raw(15, ByteWriter().PutU16(3).PutU8(0));
    movie.Show().Raw(kTagDefineFont2, Font2Body(7, {Square()}, {.name = "_sans", .codes = {65}}));
    movie.Show(2).End();
    for (bool available : {true, false}) {
        NativeSoundMix mix;
        MovieWriter plain;
        plain.Show(9);
        ToldShell player(plain.Bytes());
        player.scene.soundMix = &mix;
        player.answer = available ? movie.Bytes() : std::vector<U8>();
        player.scene.tagsLeft = 0;
        EXPECT_EQ(available * 2, player.LoadBuiltInFonts() + player.LoadBuiltInFonts());
        player.DoPlay(0);
        EXPECT_EQ(available, player.fontPlayer.FindCharacter(7) && player.fontPlayer.curFrame == 2);
        EXPECT_EQ(nullptr, player.fontPlayer.rootObject);
        EXPECT_FALSE(mix.IsDeviceOpen() || player.scene.backgroundColor.red == 9 ||
                     !player.soundOn);
    }
}

} // namespace
