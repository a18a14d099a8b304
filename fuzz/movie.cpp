// A whole movie from any bytes: fed in pieces, played for 8 ticks at 64 x 64 with mouse and keys,
// then back.
#include "platform/headless/native_player.h"

// The first byte chooses how the rest is cut and drawn, so that one input is always one run.
extern "C" int LLVMFuzzerTestOneInput(const U8* data, size_t size)
{
    if (size < 1)
        return 0;
    U8 mode = data[0];
    SetHeadlessClock(0);
    NativePlayerWnd player(64, 64);
    player.SetQuality(mode & 3);
    if (mode & 4)
        player.OverrideBackground({0, 0, 0, 0});
    size_t block = mode & 8 ? 7 : size;
    for (size_t at = 1; at < size; at += block)
        player.Feed(data + at, block < size - at ? block : size - at);
    player.EndOfData();
    for (int tick = 0; tick < 8; ++tick) {
        player.Tick();
        const S32 x = 8 + tick * 6, y = mode & 16 ? 32 : x;
        const SPOINT pt = {x, y};
        player.scene.HitTest(&pt);
        player.MouseMove(x, y, 0);
        player.MouseDown(x, y);
        player.HandleKeyDown(mode & 32 ? 18 : 13 + tick, mode >> 7);
        tick & 1 ? player.MouseMove(64 - x, y, 1) : player.MouseUp(x, y);
    }
    player.CancelCapture(mode & 64);
    player.GotoFrame(3);
    player.Tick();
    player.GotoFrame(0);
    player.Picture();
    return 0;
}
