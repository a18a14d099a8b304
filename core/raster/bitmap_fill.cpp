// The cache of a bitmap colour, its transform, and its slabs.
#include "core/raster/bitmap_fill.h"

#include <algorithm>

#include "core/raster/bitmap_rows.h"
#include "core/raster/raster.h"

namespace {
constexpr S32 kPiece = 256;         // pixels handled at once
constexpr S32 kTiledExtent = 2048;  // pixels over which tiles must not drift to count as unscaled
constexpr S64 kCameraError = 16;    // by which the scale is off at 20 twips a pixel
constexpr S64 kDriftLimit = 0x8000; // half a pixel

static_assert(sizeof(RChannelMaps) <= kRampEntries * sizeof(U32));

// Unlike the transform of single colours this one looks at the whole value before it cuts.
U8 MapChannel(S32 i, S32 mul, S32 add)
{
    const S32 v = add * 256 + i * mul;
    if (v & ~0xFFFF)
        return v < 1 ? 0 : 255;
    return U8(v >> 8);
}

// The channels of the image are premultiplied or opaque; what the transform does to an opaque
// pixel's alpha it has to do to them as well.
void BuildMapChannel(U8* map, S32 mul, S32 add, U32 opaque)
{
    for (S32 i = 0; i < 256; ++i)
        map[i] = U8(MapChannel(i, mul, add) * (opaque + 1) >> 8);
}

void BuildMaps(const ColorTransform& cx, bool transparent, RChannelMaps* maps)
{
    BuildMapChannel(maps->alpha, cx.alphaMul, cx.alphaAdd, 255);
    maps->transparent = transparent || cx.LowersAlpha();
    const U32 opaque = maps->transparent ? maps->alpha[255] : 255;
    BuildMapChannel(maps->red, cx.redMul, cx.redAdd, opaque);
    BuildMapChannel(maps->green, cx.greenMul, cx.greenAdd, opaque);
    BuildMapChannel(maps->blue, cx.blueMul, cx.blueAdd, opaque);
}

RGBI Mapped(const RChannelMaps& maps, const RGBI& c)
{
    const U16 a = maps.alpha[c.alpha];
    return {std::min<U16>(maps.blue[c.blue], a), std::min<U16>(maps.green[c.green], a),
            std::min<U16>(maps.red[c.red], a), a};
}

void ApplyColorMap(const RChannelMaps& maps, RGBI* row, S32 n)
{
    for (S32 i = 0; i < n; ++i)
        row[i] = Mapped(maps, row[i]);
}

void BuildPalette(const SColorTable& table, const RChannelMaps& maps, U32* built)
{
    for (S32 i = 0; i < 256; ++i)
        built[i] = PackLanes(ToLanes(Mapped(maps, FromLanes(UnpackLanes(table.colors[i])))));
}

// The transform as the format wants it: a palette of its own, or maps for each pixel.
bool BuildTransform(RColor* color)
{
    const SBitmapCore* bitmap = color->bitmap;
    color->bitmapPalette = bitmap->cTab ? bitmap->cTab->colors : nullptr;
    if (color->cxform.flags == 0)
        return true;
    if (!color->builtRamp)
        color->builtRamp = color->raster->AllocRamp();
    if (!color->builtRamp)
        return false;
    if (bitmap->cTab) {
        RChannelMaps maps;
        BuildMaps(color->cxform, bitmap->transparent, &maps);
        BuildPalette(*bitmap->cTab, maps, color->builtRamp);
        color->bitmapPalette = color->builtRamp;
    } else {
        color->maps = reinterpret_cast<RChannelMaps*>(color->builtRamp);
        BuildMaps(color->cxform, bitmap->transparent, color->maps);
    }
    return true;
}

bool DriftsLittle(S32 scale, S32 side, bool tiled)
{
    const S64 off = std::abs(S64(scale) - 0x10000);
    return off <= kCameraError ||
           off * (tiled ? std::max(side, kTiledExtent) : side) <= kDriftLimit;
}

// The whole pixel nearest to where the image's own 0 comes to lie.
S32 Origin(S64 translation, S32 scale)
{
    const S64 far = S64(1) << 46;
    const S64 at = std::clamp(-translation, -far, far) * 0x10000 / scale;
    return S32(std::clamp<S64>((at + 0x8000) >> 16, kS32Min / 2, kS32Max / 2));
}

// Drawn at its own size the image is copied pixel by pixel, wherever between two pixels it lies.
void FindOrigin(RColor* color)
{
    const MATRIX& m = color->bitmapInv;
    const bool tiled = BitmapTiles(color);
    color->bitmapUnscaled = m.b == 0 && m.c == 0 &&
                            DriftsLittle(m.a, color->bitmap->width, tiled) &&
                            DriftsLittle(m.d, color->bitmap->height, tiled);
    if (color->bitmapUnscaled)
        color->bitmapOrigin = {Origin(color->bitmapStart.x, m.a),
                               Origin(color->bitmapStart.y, m.d)};
}

void DrawBitmapSlab(RColor* color, S32 x0, S32 x1)
{
    const CRaster* raster = color->raster;
    if (raster->Ops()->isWords) {
        color->bitmapWords(color, x0, x1 - x0, reinterpret_cast<U32*>(raster->Row().bits) + x0);
        return;
    }
    U32 row[kPiece];
    for (S32 x = x0; x < x1; x += kPiece) {
        const S32 n = std::min(kPiece, x1 - x);
        color->bitmapWords(color, x, n, row);
        raster->Ops()->copyRow(raster->Row(), x, row, n);
    }
}

void DrawMappedSlab(RColor* color, S32 x0, S32 x1)
{
    const CRaster* raster = color->raster;
    RGBI row[kPiece];
    for (S32 x = x0; x < x1; x += kPiece) {
        const S32 n = std::min(kPiece, x1 - x);
        BuildBitmapPixels(color, x, n, row);
        raster->Ops()->writeRow(raster->Row(), x, row, n);
    }
}

// Opaque words at their own size need no channels at all.
void CopyBitmapSlab(RColor* color, S32 x0, S32 x1)
{
    const CRaster* raster = color->raster;
    const U32* words = UnscaledWords(color, raster->CurrentRow());
    while (x0 < x1) {
        S32 column, n = x1 - x0;
        const bool repeats = UnscaledSegment(color, x0, &column, &n);
        if (repeats)
            raster->Ops()->fillRow(
                raster->Row(), x0,
                raster->Ops()->pack(raster->Row(), FromLanes(UnpackLanes(words[column]))), n);
        else
            raster->Ops()->copyRow(raster->Row(), x0, words + column, n);
        x0 += n;
    }
}

void BuildBitmapSlab(RColor* color, S32 x0, S32 x1, RGBI* dst)
{
    BuildBitmapPixels(color, x0, x1 - x0, dst);
}

void CompositeBitmapSlab(RColor* color, S32 x0, S32 x1, RGBI* dst)
{
    RGBI row[kPiece];
    for (S32 x = x0; x < x1; x += kPiece) {
        const S32 n = std::min(kPiece, x1 - x);
        BuildBitmapPixels(color, x, n, row);
        CompositeRGB(row, dst + (x - x0), n);
    }
}
} // namespace

bool BuildBitmapCache(RColor* color)
{
    SBitmapCore* bitmap = color->bitmap;
    if (!bitmap || !bitmap->baseAddr)
        return false;
    // Held in any case: pixels that go again with every fill would be decoded for every fill.
    bitmap->useCount += !color->bitmapHeld;
    color->bitmapHeld = 1;
    if (!BuildTransform(color))
        return false;
    FindOrigin(color);
    ChooseBitmapRows(color);
    const bool isCopy = color->bitmapUnscaled && bitmap->bmFormat == 5;
    color->drawSlabProc = color->maps ? DrawMappedSlab : isCopy ? CopyBitmapSlab : DrawBitmapSlab;
    color->buildSlabProc = color->transparent ? CompositeBitmapSlab : BuildBitmapSlab;
    return true;
}

void FreeBitmapCache(RColor* color)
{
    if (color->bitmapHeld)
        color->bitmap->useCount--;
    color->bitmapHeld = 0;
    color->bitmapRow = nullptr;
    color->bitmapWords = nullptr;
    color->bitmapPalette = nullptr;
    color->maps = nullptr; // their memory is the ramp's
}

void BuildBitmapPixels(const RColor* color, S32 x, S32 n, RGBI* dst)
{
    if (!color->bitmapRow) {
        std::fill_n(dst, n, color->rgb);
        return;
    }
    color->bitmapRow(color, x, n, dst);
    if (color->maps)
        ApplyColorMap(*color->maps, dst, n);
}

void CalcBitmapPixel(RColor* color, S32 x, RGBI* dst)
{
    BuildBitmapPixels(color, x, 1, dst);
}
