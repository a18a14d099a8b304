// Bitmap colours: what of an image reaches which pixel, in every format of the image.
#include <gtest/gtest.h>

#include <cstring>

#include "core/raster/bitmap_fill.h"
#include "tests/raster/raster_scene.h"

namespace {
constexpr S32 kSide = 8;

// An image of any format with 8 x 8 different pixels as far as the format has them.
struct Image {
    SBitmapCore core = {};

    explicit Image(int format, U32 alpha = 255)
    {
        SColorTable table = {256, {}};
        for (U32 i = 0; i < 256; ++i)
            table.colors[i] =
                Premultiplied(alpha << 24 | i * 7 % 256 << 16 | i * 50 % 256 << 8 | i);
        core.PIInit();
        EXPECT_TRUE(core.PICreate(format, kSide, kSide, format < 4 ? &table : nullptr, 1));
        core.transparent = alpha < 255;
        for (S32 i = 0; i < core.rowBytes * kSide; ++i)
            core.baseAddr[i] = U8(i * 37 + i / 11);
        if (format == 5)
            std::memcpy(core.baseAddr, table.colors, kSide * kSide * 4);
    }
    ~Image() { core.PIFree(); }
    static U32 Premultiplied(U32 argb)
    {
        RGBI c = FromLanes(UnpackLanes(argb));
        Premultiply(&c);
        return PackLanes(ToLanes(c));
    }
    U32 At(S32 x, S32 y)
    {
        RGBI c;
        core.GetRGBPixel(x, y, &c);
        return PackLanes(ToLanes(c));
    }
};

RColor* Fill(RasterScene& s, Image& image, const MATRIX& inverse, U8 type,
             const ColorTransform& cx = {})
{
    RColor* c = s.New();
    c->colorType = kColorBitmap;
    c->bitmap = &image.core;
    c->bitmapType = type;
    c->bitmapInv = inverse;
    c->bitmapStart = {inverse.tx, inverse.ty};
    c->cxform = cx;
    c->transparent = image.core.transparent || cx.LowersAlpha();
    c->BuildCache();
    return c;
}

constexpr MATRIX kOwnSize = {0x10000, 0, 0, 0x10000, -(3 << 16), -(2 << 16)};

TEST(Bitmap, AtItsOwnSizeAnImageIsItsPixels)
{
    for (int aa : {0, 1}) {
        for (int format = 0; format <= 5; ++format) {
            Image image(format);
            for (U8 type : {kFillClipped, kFillTiled}) {
                MATRIX drifting = kOwnSize;
                drifting.a += 40;
                drifting.tx += 0x5000;
                for (const MATRIX& inverse : {kOwnSize, type == kFillTiled ? kOwnSize : drifting}) {
                    RasterScene s(20, 20, aa);
                    RColor* fill = Fill(s, image, inverse, type);
                    const S32 end = aa ? 80 : 20;
                    RasterScene::Box(s.NewObject(), {0, end, 0, end}, fill);
                    s.Paint();
                    for (S32 y = 0; y < 20; ++y) {
                        for (S32 x = 0; x < 20; ++x) {
                            const bool tiled = type == kFillTiled;
                            const U32 want = tiled ? image.At((x + 5) % kSide, (y + 6) % kSide)
                                                   : image.At(x - 3, y - 2);
                            ASSERT_EQ(s.At(x, y), want) << x << ' ' << y << " format " << format;
                        }
                    }
                }
            }
        }
    }
}

// The quick loops against the image's own fetches, under a rotation that leaves the image on all
// sides.
TEST(Bitmap, RowsAreSampledAsSinglePoints)
{
    const MATRIX turned = {0x7A31, -0x3C11, 0x4E57, 0x6B29, -0x22345, -0x1A987};
    for (int format = 0; format <= 5; ++format) {
        for (int smooth : {0, 1}) {
            Image image(format, format == 5 ? 90 : 255);
            RasterScene s(24, 24, 0);
            s.raster.SetSmoothing(smooth);
            RColor* fill = Fill(s, image, turned, kFillClipped);
            for (S32 y = 0; y < 24; ++y) {
                s.raster.SetYCoord(y);
                RGBI row[24], want;
                BuildBitmapPixels(fill, 0, 24, row);
                for (S32 x = 0; x < 24; ++x) {
                    const S32 u = turned.a * x + turned.c * y + turned.tx;
                    const S32 v = turned.b * x + turned.d * y + turned.ty;
                    if (smooth)
                        image.core.GetSSRGBPixel(u, v, &want);
                    else
                        image.core.GetRGBPixel(u >> 16, v >> 16, &want);
                    ASSERT_EQ(row[x], want) << format << " at " << x << ' ' << y;
                }
            }
        }
    }
}

// One half transparent colour as a solid, as a gradient, as images, and as an opaque image that its
// transform makes transparent.
TEST(Bitmap, TransparencyIsTheSameByEveryRoute)
{
    for (int aa : {0, 1}) {
        std::vector<U32> want;
        for (int route = 0; route < 4; ++route) {
            RasterScene s(8, 8, aa);
            Image image(5, route == 3 ? 255 : 100);
            const U32 pixel = Image::Premultiplied((route == 3 ? 0xFF : 100u) << 24 | 0x80C8FF);
            for (S32 i = 0; i < kSide * kSide; ++i)
                std::memcpy(image.core.baseAddr + 4 * i, &pixel, 4);
            RColor* fill = s.Solid(0x6480C8FF);
            if (route == 1) {
                fill = s.New();
                fill->colorType = kColorGradient;
                fill->gradientType = kFillRadial;
                fill->transparent = 1;
                fill->ramp.count = 1;
                fill->ramp.colors[0] = {0x80, 0xC8, 0xFF, 100};
                fill->BuildCache();
            } else if (route > 1) {
                ColorTransform cx;
                cx.alphaAdd = route == 3 ? -155 : 0;
                cx.CalcFlags();
                fill = Fill(s, image, kOwnSize, kFillTiled, cx);
            }
            RasterScene::Polygon(s.NewObject(), {{1, 0}, {30, 5}, {9, 31}}, fill, kRuleEvenOdd);
            s.Paint();
            if (route == 0)
                want = s.Pixels();
            EXPECT_EQ(s.Pixels(), want) << "route " << route << " aa " << aa;
        }
    }
}

// 200 * 128 >> 8 = 100, then lowered to the alpha: 255 * 64 >> 8 = 63, (100 * 64) >> 8 = 25.
TEST(Bitmap, TransformsGoThroughMapsAndPalettes)
{
    for (int format : {3, 5}) {
        Image image(format);
        image.core.baseAddr[0] = 0;
        const U32 orange = 0xFFC80A00;
        (format == 3 ? image.core.cTab->colors[0]
                     : reinterpret_cast<U32*>(image.core.baseAddr)[0]) = orange;
        ColorTransform cx;
        cx.alphaMul = 64;
        cx.redMul = 128;
        cx.greenAdd = 300;
        cx.blueAdd = -5;
        cx.CalcFlags();
        RasterScene s(4, 4, 0);
        RColor* fill = Fill(s, image, kOwnSize, kFillClipped, cx);
        RGBI got;
        s.raster.SetYCoord(0);
        CalcBitmapPixel(fill, 0, &got);
        EXPECT_EQ(got, (RGBI{0, 63, 25, 63})) << format;
        EXPECT_EQ(image.core.useCount, 1);
        fill->FreeCache();
        fill->FreeCache();
        EXPECT_EQ(image.core.useCount, 0);
    }
}
} // namespace
