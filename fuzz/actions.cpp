// Action records from any bytes, in a small movie with sprites, labels, a button and a second
// level, ticked and clicked on.
#include "core/player/limits.h"
#include "platform/headless/native_player.h"
#include "tests/support/movie_writer.h"

using Bytes = std::vector<U8>;

// A push button that shows the shape; one block for all transitions and Enter, one for the release.
static ByteWriter Button(const Bytes& all, const Bytes& release)
{
    ByteWriter records;
    records.PutU8(0x0F).PutU16(1).PutU16(1).PutMatrix({}).PutCx({}, true).PutU8(0);
    ByteWriter body;
    body.PutU16(4).PutU8(0).PutU16(U32(records.Size()) + 2).PutBytes(records.Bytes());
    body.PutU16(U32(all.size()) + 4).PutU16(13 << 9 | 0x1FF).PutBytes(all);
    return body.PutU16(0).PutU16(8).PutBytes(release);
}

static Bytes Movie(const Bytes& root, const Bytes& sprite, const Bytes& button)
{
    MovieWriter movie(2000, 2000, 10 << 8, 4);
    ShapeBuilder square;
    square.Styles(0, square.AddFill(Rgba{200, 30, 30, 255})).Rect(0, 0, 200, 200);
    TagWriter a, b;
    b.DoAction(button).Place(1, 1).Show().End();
    a.DoAction(sprite).Place2(1, {.character = 2, .name = "b"}).Show().Label("x").Show().End();
    movie.DefineShape(1, square).DefineSprite(2, b).DefineSprite(3, a);
    movie.Raw(kTagDefineButton2, Button(button, sprite));
    movie.Place2(1, {.character = 3, .name = "a"}).Place(4, 2).DoAction(root).Show();
    movie.Label("x").DoAction(sprite).Show().DoAction(root).Show().Show();
    return movie.Bytes();
}

// The first two bytes say where the program of the root ends and that of the sprite, in 256ths.
extern "C" int LLVMFuzzerTestOneInput(const U8* data, size_t size)
{
    if (size < 2 || size > 1u << 16)
        return 0;
    const size_t first = 2 + (size - 2) * data[0] / 256;
    const size_t second = first + (size - first) * data[1] / 256;
    const Bytes movie = Movie({data + 2, data + first}, {data + first, data + second},
                              {data + second, data + size});
    gLimits.actionsPerRun = 5000;
    gLimits.workPerRun = 1u << 20;
    SetHeadlessClock(0);
    NativePlayerWnd player(64, 64);
    player.Feed(movie.data(), movie.size());
    if (ScriptPlayer* level = player.OpenLayer(20000, 0)) {
        level->PushDataBuf(movie.data(), static_cast<S32>(movie.size()));
        level->DrawFrame(0, true);
    }
    player.EndOfData();
    for (S32 i = 0; i < 6; i++) {
        player.MouseMove(5, 5 + i % 3 * 20, i & 1);
        player.HandleKeyDown(13 + i, 0);
        i & 1 ? player.MouseDown(5, 5) : player.MouseUp(5, 5);
        player.Tick();
    }
    return 0;
}
