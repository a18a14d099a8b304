// One image tag from any bytes: decoded, fetched from, dropped and decoded again.
#include <cstdlib>
#include <vector>

#include "core/player/limits.h"
#include "core/stream/script_player.h"
#include "tests/support/movie_writer.h"

// The first byte: which tag, and whether the image is preceded by the shared tables, whose length
// (16 bits) and bytes then come first. Then the body of the image's tag behind the id.
static std::vector<U8> MovieAround(const U8* data, size_t size)
{
    static const int kCodes[] = {6, 20, 21, 35, 36, 36, 35, 6};
    const U8 mode = *data++;
    size--;
    MovieWriter movie;
    if (mode & 8 && size >= 2) {
        const size_t rest = size - 2, length = size_t(data[0] | data[1] << 8);
        const size_t tables = length < rest ? length : rest;
        movie.Raw(kTagDefineJPEGTables, {data + 2, data + 2 + tables});
        data += 2 + tables;
        size = rest - tables;
    }
    ByteWriter body = ByteWriter().PutU16(1).PutBytes({data, data + size});
    movie.Raw(kCodes[mode & 7], body.Bytes(), (mode & 16) != 0);
    return movie.Bytes();
}

static void Require(bool truth)
{
    if (!truth)
        std::abort();
}

// Every pixel is a premultiplied colour, and opaque where the image says so.
static U64 CheckPixels(const SBitmapCore& bitmap)
{
    U64 hash = U64(bitmap.width) << 32 | U64(bitmap.height);
    for (S32 y = 0; y < bitmap.height; ++y) {
        for (S32 x = 0; x < bitmap.width; ++x) {
            const U32 pixel = bitmap.PixelWord(x, y), alpha = pixel >> 24;
            Require((pixel >> 16 & 255) <= alpha && (pixel >> 8 & 255) <= alpha &&
                    (pixel & 255) <= alpha);
            Require(bitmap.transparent || alpha == 255);
            hash = (hash ^ pixel) * 0x100000001B3u;
        }
    }
    return hash;
}

static U64 BuildAndFetch(SCharacter* ch)
{
    if (!ScriptThread::BuildBits(ch))
        return 0;
    const SBitmapCore& bitmap = ch->bitmap;
    const S32 right = bitmap.width << 16, bottom = bitmap.height << 16;
    RGBI sum, c;
    for (S32 x : {kS32Min, -0x18000, -1, 0, 0x6000, right - 0x10000, right - 1, right, kS32Max}) {
        for (S32 y : {kS32Min, -0x9000, 0, 0xA000, bottom - 0x12345, bottom - 1, kS32Max}) {
            bitmap.GetSSRGBPixel(x, y, &c);
            sum.alpha += c.alpha;
            bitmap.GetRGBPixel(x, y, &c);
            sum.alpha += c.alpha;
        }
    }
    return CheckPixels(bitmap) + sum.alpha;
}

extern "C" int LLVMFuzzerTestOneInput(const U8* data, size_t size)
{
    if (size < 1 || size > 1u << 20)
        return 0;
    gLimits.bitmapPixels = 1u << 18;
    gLimits.jpegScanPixels = 1u << 22;
    gLimits.jpegBytes = 4u << 20;
    const std::vector<U8> bytes = MovieAround(data, size);
    ScriptPlayer movie;
    movie.PushDataBuf(bytes.data(), S32(bytes.size()));
    while (movie.DoTag() == kDrawn) {
    }
    SCharacter* ch = movie.FindCharacter(1);
    Require(ch != nullptr);
    const U64 first = BuildAndFetch(ch);
    movie.FreeCache();
    Require(!ch->bitmap.baseAddr && BuildAndFetch(ch) == first);
    return 0;
}
