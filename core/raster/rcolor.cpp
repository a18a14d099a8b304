// Life of a colour: set up, its cache, and the procedures of solid and clip colours.
#include "core/raster/rcolor.h"

#include <cstring>

#include "core/raster/bitmap_fill.h"
#include "core/raster/gradient.h"
#include "core/raster/lanes8.h"
#include "core/raster/raster.h"

static void DrawNothing(RColor*, S32, S32) {}

static void BuildNothing(RColor*, S32, S32, RGBI*) {}

static void DrawSolidSlab(RColor* color, S32 x0, S32 x1)
{
    CRaster* raster = color->raster;
    raster->Ops()->fillRow(raster->Row(), x0, color->rgbPixel, x1 - x0);
}

static void BuildSolidSlab(RColor* color, S32 x0, S32 x1, RGBI* dst)
{
    for (S32 i = 0, n = x1 - x0; i < n; ++i)
        dst[i] = color->rgb;
}

static void CompositeSolidSlab(RColor* color, S32 x0, S32 x1, RGBI* dst)
{
    CompositeRGBSolid(&color->rgb, dst, x1 - x0);
}

void CompositeRGB(const RGBI* src, RGBI* dst, int n)
{
    int i = 0;
    for (; i + 2 <= n; i += 2)
        StorePair(dst + i, BlendPair(LoadPair(dst + i), LoadPair(src + i)));
    if (i < n)
        dst[i] = FromLanes(BlendLanes(ToLanes(dst[i]), ToLanes(src[i])));
}

void CompositeRGBSolid(const RGBI* c, RGBI* dst, int n)
{
    RGBI twice[2] = {*c, *c};
    Lanes8 src = LoadPair(twice);
    int i = 0;
    for (; i + 2 <= n; i += 2)
        StorePair(dst + i, BlendPair(LoadPair(dst + i), src));
    if (i < n)
        dst[i] = FromLanes(BlendLanes(ToLanes(dst[i]), ToLanes(*c)));
}

void CalcSolidPixel(RColor* color, S32, RGBI* dst)
{
    *dst = color->rgb;
}

void RColor::SetUp(CRaster* r)
{
    std::memset(static_cast<void*>(this), 0, sizeof *this);
    raster = r;
    colorType = kColorSolid;
    drawSlabProc = DrawNothing;
    buildSlabProc = BuildNothing;
    cxform.Clear();
}

void RColor::BuildCache()
{
    pixValid = 0;
    cached = 1;
    skipped = colorType == kColorClip;
    if (!raster)
        return;
    if (colorType == kColorGradient) {
        skipped = !BuildGradientCache(this);
    } else if (colorType == kColorBitmap) {
        skipped = !BuildBitmapCache(this);
    } else if (colorType == kColorSolid) {
        drawSlabProc = DrawSolidSlab;
        buildSlabProc = transparent ? CompositeSolidSlab : BuildSolidSlab;
    }
    transparent = transparent || skipped;
}

void RColor::FreeCache()
{
    if (!cached)
        return;
    cached = 0;
    pixValid = 0;
    drawSlabProc = DrawNothing;
    buildSlabProc = BuildNothing;
    if (colorType == kColorBitmap)
        FreeBitmapCache(this);
    if (builtRamp)
        raster->FreeRamp(builtRamp);
    builtRamp = nullptr;
}

RColor* ClipMarker()
{
    static RColor marker = [] {
        RColor c;
        c.SetUp(nullptr);
        c.colorType = kColorClip;
        c.transparent = 1;
        c.visible = 1;
        return c;
    }();
    return &marker;
}
