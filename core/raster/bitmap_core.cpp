#include "core/raster/bitmap_core.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "core/player/limits.h"

namespace {
constexpr int kFormats = 6;
constexpr U32 kTableEntries = 256;
constexpr int kBitsPerPixel[kFormats] = {1, 2, 4, 8, 16, 32};

// Each weight is rounded on its own; what the four are then off 8 by goes to the first of the
// largest.
constexpr void FillWeights(int fx, int fy, U8* set)
{
    const int exact[4] = {(8 - fx) * (8 - fy), fx * (8 - fy), (8 - fx) * fy, fx * fy};
    int sum = 0, largest = 0;
    for (int i = 0; i < 4; ++i) {
        set[i] = U8((exact[i] + 4) >> 3);
        sum += set[i];
        largest = set[i] > set[largest] ? i : largest;
    }
    set[largest] = U8(set[largest] + 8 - sum);
}

constexpr SPixCoverage MakeCoverage()
{
    SPixCoverage table = {};
    for (int i = 0; i < 64; ++i)
        FillWeights(i >> 3, i & 7, table.sets[i]);
    return table;
}

bool KnownFormat(int format)
{
    return format >= 0 && format < kFormats;
}

bool IsMapped(int format)
{
    return format <= 3;
}

// The index at x in a row of a colour-mapped format.
U32 IndexAt(const U8* row, S32 x, int bits)
{
    const int perByte = 8 / bits;
    const int shift = bits * (perByte - 1 - x % perByte);
    return U32(row[x / perByte]) >> shift & ((1u << bits) - 1);
}

U32 Widen16(U32 v)
{
    return 0xFF000000u | U32(pix16Expand[v >> 10 & 31]) << 16 | U32(pix16Expand[v >> 5 & 31]) << 8 |
           pix16Expand[v & 31];
}

// One axis of FoldCoverage. The weights of its near side are at w[0] and w[other], those of its far
// side `step` further on.
void FoldAxis(S64* at, S64 size, U32* w, int step, int other)
{
    const bool before = *at < 0;
    if (!before && *at < size - 1)
        return;
    *at = before ? 0 : size - 2;
    for (U32* near : {w, w + other}) {
        U32& gains = before ? near[0] : near[step];
        U32& loses = before ? near[step] : near[0];
        gains += loses;
        loses = 0;
    }
}
} // namespace

constexpr SPixCoverage kPixCoverage = MakeCoverage();

const U8 pix16Expand[32] = {0,   15,  23,  31,  39,  47,  55,  63,  71,  79,  87,
                            95,  95,  111, 119, 127, 135, 143, 151, 159, 167, 175,
                            183, 191, 199, 207, 215, 223, 223, 239, 247, 255};

void SBitmapCore::PIInit()
{
    baseAddr = nullptr;
    cTab = nullptr;
    useCount = 0;
    transparent = 0;
    buildFailed = 0;
}

int SBitmapCore::PICreate(int format, int w, int h, const SColorTable* ctab, int)
{
    PIInit();
    transparent = HasTransparent(ctab);
    bmFormat = format;
    width = w;
    height = h;
    rowBytes = 0;
    if (!KnownFormat(format) || w <= 0 || h <= 0 || w > kMaxSide || h > kMaxSide ||
        U64(w) * U64(h) > gLimits.bitmapPixels)
        return 0;
    rowBytes = SBitmapCalcRowbytes(format, w);
    if (IsMapped(format)) {
        cTab = ctab ? static_cast<SColorTable*>(std::calloc(1, sizeof *cTab)) : nullptr;
        if (!cTab)
            return 0;
        cTab->count = std::min(ctab->count, kTableEntries);
        std::memcpy(cTab->colors, ctab->colors, cTab->count * sizeof cTab->colors[0]);
    }
    if (U64(rowBytes) * U64(h) > PTRDIFF_MAX)
        return 0;
    baseAddr = static_cast<U8*>(std::calloc(static_cast<size_t>(h), static_cast<size_t>(rowBytes)));
    return baseAddr != nullptr;
}

void SBitmapCore::PIFree()
{
    std::free(baseAddr);
    std::free(cTab);
    baseAddr = nullptr;
    cTab = nullptr;
}

U32 SBitmapCore::PixelWord(S32 x, S32 y) const
{
    const U8* row = baseAddr + ptrdiff_t(y) * rowBytes;
    if (IsMapped(bmFormat))
        return cTab->colors[IndexAt(row, x, kBitsPerPixel[bmFormat])];
    if (bmFormat == 4) {
        U16 v;
        std::memcpy(&v, row + 2 * x, sizeof v);
        return Widen16(v);
    }
    U32 v;
    std::memcpy(&v, row + 4 * x, sizeof v);
    return v;
}

void SBitmapCore::GetRGBPixel(int x, int y, RGBI* dst) const
{
    x = x < 0 ? 0 : std::min(x, width - 1);
    y = y < 0 ? 0 : std::min(y, height - 1);
    *dst = FromLanes(UnpackLanes(PixelWord(x, y)));
}

// Two channels to a word: a sum of eight times 255 stays in its half.
void SBitmapCore::GetSSRGBPixel(S32 x, S32 y, RGBI* dst) const
{
    constexpr U32 kMask = 0x00FF00FF;
    S64 ix = x >> 16, iy = y >> 16;
    U32 w[4];
    std::copy_n(PixCoverage(x, y), 4, w);
    FoldCoverage(this, &ix, &iy, w);
    U32 redBlue = 0, alphaGreen = 0;
    for (int i = 0; i < 4; ++i) {
        if (w[i] == 0)
            continue;
        const U32 pixel = PixelWord(S32(ix) + (i & 1), S32(iy) + (i >> 1));
        redBlue += (pixel & kMask) * w[i];
        alphaGreen += (pixel >> 8 & kMask) * w[i];
    }
    const U32 packed = (redBlue >> 3 & kMask) | (alphaGreen >> 3 & kMask) << 8;
    *dst = FromLanes(UnpackLanes(packed));
}

void FoldCoverage(const SBitmapCore* bitmap, S64* ix, S64* iy, U32* w)
{
    FoldAxis(ix, bitmap->width, w, 1, 2);
    FoldAxis(iy, bitmap->height, w, 2, 1);
}

S32 SBitmapCalcRowbytes(int format, int width)
{
    switch (format) {
    case 0:
        return ((width + 31) >> 5) * 4;
    case 1:
        return ((width + 15) >> 4) * 4;
    case 2:
        return ((width + 7) >> 3) * 4;
    case 3:
        return (width + 3) & ~3;
    case 4:
        return (2 * width + 3) & ~3;
    case 5:
        return 4 * width;
    default:
        return 0;
    }
}

S32 SBitmapBitsPerPixel(int format)
{
    return KnownFormat(format) ? kBitsPerPixel[format] : 0;
}

bool HasTransparent(const SColorTable* ctab)
{
    if (!ctab)
        return false;
    const U32* end = ctab->colors + std::min(ctab->count, kTableEntries);
    return std::any_of(ctab->colors, end, [](U32 color) { return color >> 24 != 255; });
}

void SBitmapSwapBits(void* bits, size_t byteCount, int format)
{
    if (format != 4 && format != 5)
        return;
    auto* bytes = static_cast<U8*>(bits);
    for (size_t groups = byteCount / 4; groups > 0; --groups, bytes += 4) {
        U32 v;
        std::memcpy(&v, bytes, sizeof v);
        v = (v & 0x00FF00FF) << 8 | (v >> 8 & 0x00FF00FF);
        if (format == 5)
            v = v << 16 | v >> 16;
        std::memcpy(bytes, &v, sizeof v);
    }
}
