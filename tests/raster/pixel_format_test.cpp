// What the formats store, worked out by hand, and what they have in common.
#include "core/raster/palette.h"
#include "tests/raster/raster_scene.h"
#include "gtest/gtest.h"

namespace {

constexpr MATRIX kPixelSteps = {1 << 23, 0, 0, 0, -128 * (1 << 15), 0};

TEST(PixelFormat, StoresWhatTheBitsAllow)
{
    // 5-6-5, 5-5-5 and index for a colour over 100, 62, 31.
    const U32 rows[][4] = {{0xFFFFFFFF, 0xFFFF, 0x7FFF, 215}, {0x80FF0000, 0xB0E1, 0x5861, 144},
                           {0xFF0C0607, 0x0820, 0x0400, 0},   {0xFF339966, 0x34CC, 0x1A6C, 56},
                           {0xFF9698F9, 0x94DF, 0x4A7F, 131}, {0, 0x61E3, 0x30E3, 78}};
    for (const U32* r : rows)
        for (int f : {1, 2, 3}) {
            GradientScene s(105, 1, 0, kFillLinear, kPixelSteps, {0, 255},
                            {kBlack, SRGB{255, 160, 80, 255}});
            RasterScene::Box(s.NewObject(), {100, 102, 0, 1}, s.Solid(r[0]));
            s.bits.CreateScreenBits(105, 1, CPixelFormat(f)); // after the colours are made
            s.Paint();
            const U8* bytes = s.bits.RowAddr(0);
            EXPECT_EQ(r[f], f == 3 ? bytes[100] : reinterpret_cast<const U16*>(bytes)[100])
                << f << std::hex << " " << r[0];
        }
}

// The formats in order, each plain and then dithered.
constexpr auto Screen = [](int i, bool bottomUp) -> CScreenFormat {
    return {CPixelFormat(1 + i / 2), bottomUp, i % 2 == 1};
};

// Runs end at odd places, so that a colour reaches its pixels in every way there is. What a row
// hands down when errors diffuse begins with the area.
TEST(PixelFormat, NeitherRowOrderNorPiecesOfTheAreaMatter)
{
    for (int f = 0; f < 6; ++f) {
        GradientScene s(300, 9, 1, kFillLinear, kPixelSteps, {0, 255},
                        {SRGB{9, 200, 90, 255}, kWhite});
        RasterScene::Box(s.NewObject(), {33, 1001, 2, 31}, s.Solid(0xFF6E5A3C));
        RasterScene::Box(s.NewObject(), {81, 1103, 7, 18}, s.Solid(0x60F0A012));
        s.bits.CreateScreenBits(300, 9, Screen(f, false));
        s.Paint();
        const std::vector<U32> whole = s.Pixels();
        s.bits.CreateScreenBits(300, 9, Screen(f, true));
        s.Paint();
        if (!s.bits.Ops()->diffuses)
            for (SRECT piece : {SRECT{0, 23, 0, 5}, {23, 26, 0, 5}, {26, 257, 0, 9}, {0, 26, 5, 9}})
                s.Paint(piece);
        EXPECT_EQ(whole, s.Pixels()) << f;
        EXPECT_GT(s.bits.RowAddr(0), s.bits.RowAddr(8));
    }
}

TEST(PixelFormat, DitheringAveragesToTheColour)
{
    const double bounds[] = {8, 0.2, 8, 0.2, 42, 15.5};
    for (int f = 0; f < 6; ++f)
        for (SRGB c : {SRGB{30, 30, 75, 255}, {130, 185, 185, 255}, {253, 3, 99, 255}}) {
            GradientScene s(300, 40, 0, kFillLinear, kPixelSteps, {0}, {c});
            s.bits.CreateScreenBits(300, 40, Screen(f, false));
            s.Paint();
            double red = 0;
            for (U32 pixel : s.Pixels())
                red += pixel >> 16 & 255;
            EXPECT_NEAR(c.red, red / (300 * 40), bounds[f]) << f;
        }
}

TEST(PixelFormat, PaletteColoursAreFlatAndAnyTableWillDo)
{
    SColorTable table = {200, {}};
    for (U32 i = 0; i < 256; ++i)
        table.colors[i] = i * 2654435761u >> 6 & 0x3F3FFF; // crowded
    RasterScene s(2, 2, 0);
    RasterScene::Box(s.NewObject(), {0, 1, 0, 2}, s.Solid(0x8000FF00));
    s.bits.CreateScreenBits(2, 2, {kPixel8, false, true, &table, 7});
    for (U32 i = 0; i < 256; ++i) {
        const RGBI c = FromLanes(UnpackLanes(table.colors[i] | 0xFF000000));
        EXPECT_EQ(i < 200 && i != 7, s.bits.Ops()->pack(s.bits.Row(0), c) == i * 0x01010101) << i;
    }
    EXPECT_EQ(nullptr, std::memchr(s.bits.Palette()->inverse, 7, CPalette::kCells));
    table.count = 1;
    for (S32 none : {-1, 0, 300})
        for (SColorTable* t : {&table, (SColorTable*)nullptr}) {
            s.bits.SetPalette(t, none);
            s.Paint(true);
            // The only index there is; or the colour over black, or it whole where not all show.
            EXPECT_EQ(t ? 0 : none == 0 ? 30 : 18, *s.bits.RowAddr(1));
        }
}

} // namespace
