#include <cmath>

#include "tests/raster/raster_scene.h"
#include "gtest/gtest.h"

namespace {

ColorTransform Red(S16 mul, S16 add)
{
    ColorTransform t;
    t.redMul = mul;
    t.redAdd = add;
    t.CalcFlags();
    return t;
}

TEST(ColorTransform, ClampsByBitsEightToFifteenOnly)
{
    struct Row {
        S16 mul, add;
        U16 in, out;
    };
    const Row rows[] = {
        {256, 300, 100, 255},
        {256, -300, 100, 0},
        {128, 0, 200, 100},
        {256, 10, 250, 255},
        {0, 0, 200, 0},
        {-256, 0, 255, 0},
        {32767, 32767, 255, 255},
        {-32768, -32768, 255, 128}, // -65408: its bits 8 to 15 are zero, so the low byte passes
        {-1, 0, 255, 0},
    };
    for (const Row& r : rows) {
        RGBI c = {1, 2, r.in, 255};
        Red(r.mul, r.add).Apply(&c, 1);
        EXPECT_EQ(r.out, c.red) << r.mul << " " << r.add;
        SRGB s = Red(r.mul, r.add).Apply(SRGB{U8(r.in), 2, 1, 255});
        EXPECT_EQ(r.out, s.red) << r.mul << " " << r.add;
        EXPECT_EQ(2, c.green);
    }
}

TEST(ColorTransform, ConcatAppliesTheArgumentFirst)
{
    ColorTransform t = Red(128, 10);
    ColorTransform inner = Red(128, 20);
    t.Concat(&inner);
    EXPECT_EQ(64, t.redMul);
    EXPECT_EQ(10 + 10, t.redAdd); // the old multiplier halves the inner offset
    ColorTransform identity;
    t.Concat(&identity);
    EXPECT_EQ(64, t.redMul);
    identity.Concat(&t);
    EXPECT_TRUE(Equal(&identity, &t));
    ColorTransform doubled = Red(512, 0), halved = Red(128, 0);
    doubled.Concat(&halved);
    EXPECT_EQ(0u, doubled.flags);
}

TEST(Color, LanesKeepTheirChannels)
{
    for (U32 pixel : {0x00000000u, 0xFF010203u, 0x80FFFFFFu, 0x12345678u}) {
        EXPECT_EQ(pixel, PackLanes(UnpackLanes(pixel)));
        RGBI c = FromLanes(UnpackLanes(pixel));
        EXPECT_EQ(pixel >> 24, c.alpha);
        EXPECT_EQ(pixel & 0xFF, c.blue);
    }
    // 0x40 of each over opaque 0x80: 0x80 * (256 - 0x40) >> 8 is 0x60.
    EXPECT_EQ(0xFFA0A0A0u & 0x00FFFFFFu,
              PackLanes(BlendLanes(UnpackLanes(0xFF808080), UnpackLanes(0x40404040))) &
                  0x00FFFFFFu);
}

TEST(Gradient, RampFollowsItsStops)
{
    MATRIX inv = {0x10000, 0, 0, 0x10000, 0, 0};
    GradientScene flat(1, 1, 0, kFillLinear, inv, {128}, {SRGB{10, 20, 30, 255}});
    for (int i = 0; i < kRampEntries; ++i)
        EXPECT_EQ(0xFF0A141Eu, flat.c->builtRamp[i]);
    GradientScene three(1, 1, 0, kFillLinear, inv, {51, 102, 102, 204},
                        {kBlack, kWhite, SRGB{255, 0, 0, 128}, SRGB{0, 0, 0, 0}});
    EXPECT_EQ(0xFF000000u, three.c->builtRamp[0]);
    EXPECT_EQ(0xFF000000u, three.c->builtRamp[51]);
    EXPECT_EQ(0xFF323232u, three.c->builtRamp[61]); // 255 * 10 / 51
    EXPECT_EQ(0xFFFFFFFFu, three.c->builtRamp[102]);
    // Past the double stop: alpha 128 * 51 / 102 = 64, red 127 * 65 >> 8 = 32.
    EXPECT_EQ(0x40200000u, three.c->builtRamp[153]);
    EXPECT_EQ(0u, three.c->builtRamp[204]);
    EXPECT_EQ(0u, three.c->builtRamp[256]);
}

TEST(Gradient, LinearRowsAreTheSameWhereverTheyStart)
{
    // 64 pixels across the square: from -16384 << 8 to 16384 << 8 in steps of 512 << 8.
    MATRIX inv = {512 * 65536, 0, 300, 0, -16384 * 256, 0};
    for (int aa : {0, 1}) {
        GradientScene s(96, 3, aa, kFillLinear, inv, {0, 255}, {kBlack, kWhite});
        s.Paint();
        std::vector<U32> whole = s.Pixels();
        EXPECT_EQ(0xFF000000u, whole[0]);
        EXPECT_EQ(s.c->builtRamp[4], whole[1]); // 512 << 8 >> 15
        EXPECT_EQ(s.c->builtRamp[256], whole[95]);
        for (S32 x = 0; x < 96; x += 5)
            s.Paint({x, x + 5, 1, 2});
        EXPECT_EQ(whole, s.Pixels());
    }
}

TEST(Gradient, RadialSlabsAndPixelsFollowTheDistance)
{
    // 40 pixels from the centre at (50, 50) to the rim, on any orientation.
    MATRIX inv = {16384 / 40 * 65536,    0, 0, 16384 / 40 * 65536, -16384 / 40 * 50 * 256,
                  -16384 / 40 * 50 * 256};
    for (int aa : {0, 1}) {
        GradientScene s(100, 100, aa, kFillRadial, inv, {0, 255}, {kBlack, kWhite});
        s.Paint();
        for (S32 y = 0; y < 100; ++y)
            for (S32 x = 0; x < 100; ++x) {
                double d = std::hypot(x - 50.0, y - 50.0) * (16384 / 40) / 64;
                // Both coordinates are floored to a sixty-fourth of the rim, and the index as well.
                EXPECT_NEAR(std::min(d, 255.0), s.At(x, y) & 0xFF, 2.6) << x << "," << y;
            }
        // Under a translucent colour every pixel counts by itself, so columns equal the whole.
        S32 k = aa ? 4 : 1;
        RasterScene::Box(s.NewObject(), {0, 100 * k, 0, 100 * k}, s.Solid(0x20FFFFFF));
        s.Paint();
        std::vector<U32> whole = s.Pixels();
        for (S32 x = 0; x < 100 && aa; ++x)
            s.Paint({x, x + 1, 0, 100});
        EXPECT_EQ(whole, s.Pixels());
    }
}

TEST(Gradient, WithoutStopsWhatLiesBelowShows)
{
    for (int aa : {0, 1}) {
        GradientScene s(8, 1, aa, kFillLinear, {}, {}, {});
        s.objects.emplace_front();
        S32 k = aa ? 4 : 1;
        RasterScene::Box(s.objects.front(), {2 * k, 6 * k, 0, k}, s.Solid(0xFF00FF00));
        RasterScene::Box(s.NewObject(), {4 * k, 8 * k, 0, k}, s.Solid(0x80FFFFFF));
        s.Paint(true);
        const std::vector<U32> want = {0,          0,          0xFF00FF00, 0xFF00FF00,
                                       0xFF80FF80, 0xFF80FF80, 0x80808080, 0x80808080};
        EXPECT_EQ(want, s.Pixels());
    }
}

} // namespace
