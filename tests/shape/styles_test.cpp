#include "tests/shape/shape_scene.h"

#include <gtest/gtest.h>

#include <cmath>

namespace {

// A block of `fills` solid fills and `lines` lines, their red channels counting up.
void PutBlock(ByteWriter& out, U32 fills, U32 lines, bool escape)
{
    for (U32 count : {fills, lines}) {
        if (escape)
            out.PutU8(0xFF).PutU16(count);
        else
            out.PutU8(count);
        for (U32 i = 1; i <= count; ++i)
            (count == fills ? out.PutU8(0) : out.PutU16(20)).PutColor({U8(i), 0, 0}, false);
    }
    out.UB(4, 9).UB(4, 3);
}

void ExpectBlock(const SShapeParser& p, U32 fills, U32 lines, U32 layer)
{
    ASSERT_EQ(p.nFills, fills);
    ASSERT_EQ(p.nLines, lines);
    EXPECT_EQ(p.Fill(0), nullptr);
    EXPECT_EQ(p.Fill(fills + 1), nullptr);
    EXPECT_EQ(p.LineStyle(lines + 1).color, nullptr);
    for (U32 i = 1; i <= fills; ++i) {
        ASSERT_EQ(p.Fill(i)->order, layer + i);
        ASSERT_EQ(p.Fill(i)->rgb.red, U8(i));
    }
    for (U32 i = 1; i <= lines; ++i) {
        ASSERT_EQ(p.LineStyle(i).color->order, layer + fills + i);
        ASSERT_EQ(p.LineStyle(i).color->rgb.red, U8(i));
    }
    EXPECT_EQ(p.nFillBits, 9);
    EXPECT_EQ(p.nLineBits, 3);
}

RColor* OnlyFill(ShapeScene& scene, SCharacterParser& p)
{
    p.raster = &scene.display.raster;
    return p.GetStyles() ? p.Fill(1) : nullptr;
}

// Where an inverse takes a device point, 16.16 or 24.8 as its translation says; wraps as painting
// does.
SPOINT Unmap(const MATRIX& inverse, S64 x, S64 y, int shift)
{
    const S64 u = (inverse.a * (x << shift) >> 16) + (inverse.c * (y << shift) >> 16) + inverse.tx;
    const S64 v = (inverse.b * (x << shift) >> 16) + (inverse.d * (y << shift) >> 16) + inverse.ty;
    return {S32(u), S32(v)};
}

TEST(Styles, CountsAndTheirEscape)
{
    const struct {
        U32 fills, lines;
        bool escape;
    } blocks[] = {{0, 2, false}, {254, 3, false}, {300, 1, true}, {3, 299, true}, {200, 7, false}};
    ShapeScene scene;
    ByteWriter out;
    for (const auto& b : blocks)
        PutBlock(out, b.fills, b.lines, b.escape);
    scene.data = out.Bytes();
    SCharacterParser p = scene.Parser();
    for (const auto& b : blocks) {
        ASSERT_TRUE(p.GetStyles());
        ExpectBlock(p, b.fills, b.lines, 0);
    }
}

TEST(Styles, NewBlockIsReadWithOldWidthsAndNumberedOn)
{
    ShapeScene scene;
    ByteWriter out;
    PutBlock(out, 2, 1, false);
    // Fill 0 is read as 9 bits although the new block says 4 too, and 3 bits of the byte are lost.
    out.UB(1, 0).UB(5, 0x12).UB(9, 2).UB(1, 0).Align();
    PutBlock(out, 5, 2, false);
    out.UB(6, 0);
    scene.data = out.Bytes();
    SCharacterParser p = scene.Parser();
    CURVE c;
    ASSERT_TRUE(p.GetStyles());
    ASSERT_EQ(p.GetEdge(&c), 0x12);
    EXPECT_EQ(p.fill0, 2u);
    ExpectBlock(p, 5, 2, 3);
    EXPECT_EQ(p.GetEdge(&c), SShapeParser::kEndOfShape);
}

TEST(Styles, SolidColorsAreTransformedThenPremultiplied)
{
    ColorTransform half, brighter;
    half.alphaMul = 128;
    half.CalcFlags();
    brighter.redAdd = 300;
    brighter.greenAdd = -50;
    brighter.CalcFlags();
    const struct {
        Rgba in;
        bool alpha;
        ColorTransform cx;
        RGBI out;
        int transparent;
    } cases[] = {
        {{200, 100, 0, 128}, true, {}, {0, 50, 100, 128}, 1},
        {{200, 100, 0, 128}, false, {}, {0, 100, 200, 255}, 0},
        {{200, 255, 7, 0}, true, {}, {0, 0, 0, 0}, 1}, // c * 1 >> 8
        {{200, 100, 40, 255}, true, half, {20, 50, 100, 127}, 1},
        {{10, 40, 40, 255}, true, brighter, {40, 0, 255, 255}, 0},
    };
    for (const auto& test : cases) {
        ShapeScene scene;
        ShapeBuilder shape;
        shape.AddFill(test.in);
        shape.AddLine({20, test.in});
        scene.Load(shape, test.alpha);
        SCharacterParser p = scene.Parser();
        p.getAlpha = test.alpha;
        p.cxform = test.cx;
        ASSERT_TRUE(p.GetStyles());
        for (RColor* color : {p.Fill(1), p.LineStyle(1).color}) {
            EXPECT_EQ(color->rgb, test.out);
            EXPECT_EQ(color->transparent, test.transparent);
            EXPECT_EQ(color->colorType, kColorSolid);
        }
    }
}

TEST(Styles, LineThicknessIsInDeviceUnits)
{
    ShapeScene scene;
    ShapeBuilder shape;
    for (U16 width : {0, 3, 400})
        shape.AddLine({width, {}});
    scene.Load(shape);
    SCharacterParser p = scene.Parser(ToMatrix(Mat::Scale(0.05)));
    ASSERT_TRUE(p.GetStyles());
    EXPECT_EQ(p.LineStyle(1).thickness, 0);
    EXPECT_EQ(p.LineStyle(2).thickness, 1);
    EXPECT_NEAR(p.LineStyle(3).thickness, 20, 1);
}

TEST(Styles, RampsKeepEightStopsInOrder)
{
    ShapeScene scene;
    ShapeBuilder shape;
    std::vector<Stop> stops;
    for (U8 ratio : {10, 40, 30, 60, 60, 90, 80, 255, 1, 2, 3})
        stops.push_back({ratio, {ratio, 0, 0, 255}});
    shape.AddFill(Fill::Radial({}, stops));
    shape.AddFill(Fill::Linear({}, {{0, {9, 9, 9, 254}}, {255, {}}}));
    shape.AddFill(Rgba{77, 0, 0});
    scene.Load(shape, true);
    SCharacterParser p = scene.Parser();
    p.getAlpha = true;
    ASSERT_TRUE(p.GetStyles());
    const GradColorRamp& ramp = p.Fill(1)->ramp;
    const std::vector<U8> kept(ramp.ratios, ramp.ratios + ramp.count);
    EXPECT_EQ(kept, (std::vector<U8>{10, 40, 40, 60, 60, 90, 90, 255}));
    EXPECT_EQ(ramp.colors[2].red, 30);
    EXPECT_EQ(p.Fill(1)->gradientType, kFillRadial);
    EXPECT_EQ(p.Fill(1)->transparent, 0);
    EXPECT_EQ(p.Fill(2)->transparent, 1);
    EXPECT_EQ(p.Fill(2)->ramp.colors[0].red, 9) << "stops are not premultiplied here";
    EXPECT_EQ(p.Fill(3)->rgb.red, 77);
}

TEST(Styles, MorphsAreBetweenTheirEnds)
{
    ShapeScene scene;
    ByteWriter out;
    out.PutU8(2);
    out.PutU8(0).PutColor({10, 20, 1, 255}, true).PutColor({20, 10, 0, 255}, true);
    out.PutU8(0x10).PutMatrix(Mat::Translate(100, 0)).PutMatrix(Mat::Translate(201, -1));
    out.PutU8(1).PutU8(200).PutColor({8, 0, 0, 255}, true).PutU8(100).PutColor({0, 8, 0, 0}, true);
    out.PutU8(1).PutU16(0).PutU16(65535).PutColor({1, 1, 1}, true).PutColor({3, 3, 3}, true);
    out.UB(4, 2).UB(4, 1);
    scene.data = out.Bytes();
    const struct {
        U16 ratio;
        RGBI solid;
        S32 tx, ty, thickness;
        U8 stop;
    } cases[] = {{0, {1, 20, 10, 255}, 100, 0, 0, 200},
                 {0x8000, {0, 15, 15, 255}, 150, -1, 32767, 150},
                 {0xFFFF, {0, 10, 19, 255}, 200, -1, 65534, 100}};
    for (const auto& test : cases) {
        SCharacterParser p = scene.Parser();
        p.getAlpha = true;
        p.ratio = test.ratio;
        ASSERT_TRUE(p.GetMorphStyles());
        EXPECT_EQ(p.Fill(1)->rgb, test.solid);
        EXPECT_EQ(p.Fill(2)->gradientMat.tx, test.tx);
        EXPECT_EQ(p.Fill(2)->gradientMat.ty, test.ty);
        EXPECT_EQ(p.Fill(2)->ramp.ratios[0], test.stop);
        EXPECT_EQ(p.Fill(2)->transparent, test.ratio != 0);
        EXPECT_NEAR(p.LineStyle(1).thickness, test.thickness, 2);
    }
}

TEST(Styles, BitmapFillsWithoutPixelsAreRed)
{
    ShapeScene scene;
    scene.movie.CreateCharacter(5)->type = kCharBitmap;
    scene.movie.CreateCharacter(6)->type = kCharShape;
    for (U16 id : {4, 5, 6}) {
        ShapeBuilder shape;
        shape.AddFill(Fill::Bitmap(kFillTiled, id, Mat::Scale(20)));
        scene.Load(shape);
        SCharacterParser p = scene.Parser();
        RColor* color = OnlyFill(scene, p);
        ASSERT_TRUE(color);
        EXPECT_EQ(color->colorType, kColorSolid);
        EXPECT_EQ(color->rgb, (RGBI{0, 0, 255, 255}));
    }
}

// The middle and the corners of the gradient square, and of a bitmap of 64 by 64 pixels, are found
// again from where they stand on the screen, near the origin and thousands of pixels away.
TEST(Styles, InversesFindThePlaceInTheFill)
{
    const Mat placements[] = {Mat::Scale(0.05), Mat::Scale(0.05).ThenTranslate(-30, 12),
                              Mat::Rotate(30).Then(Mat::Scale(0.2)).ThenTranslate(100, 3000),
                              Mat{-0x1000, 0x2000, 0x800, 0x3000, -2500, 40}};
    for (S32 away : {0, 500, 60000}) {
        for (const Mat& placement : placements) {
            ShapeScene scene;
            RColor color;
            color.SetUp(&scene.display.raster);
            SBitmapCore bitmap = {};
            U8 pixel = 0;
            bitmap.baseAddr = &pixel;
            color.bitmap = &bitmap;
            const Mat fills[] = {Mat::Scale(20).ThenTranslate(away, 300 - away),
                                 Mat::Gradient(away, -away, 2000, 1000, 20)};
            color.bitmapMat = ToMatrix(fills[0]);
            color.gradientMat = ToMatrix(fills[1]);
            SCharacterParser p = scene.Parser(ToMatrix(placement));
            p.raster = &scene.display.raster;
            for (int i : {0, 1}) {
                color.colorType = i == 0 ? kColorBitmap : kColorGradient;
                p.SetupColor(&color);
                const int shift = i == 0 ? 16 : 8;
                const double size = i == 0 ? 64 : 16384;
                const Mat& f = fills[i];
                for (double x : {-size, 0.0, size}) {
                    const double y = x / 2;
                    const double sx = (f.a * x + f.c * y) / 65536 + f.tx;
                    const double sy = (f.b * x + f.d * y) / 65536 + f.ty;
                    const double dx = (placement.a * sx + placement.c * sy) / 65536 + placement.tx;
                    const double dy = (placement.b * sx + placement.d * sy) / 65536 + placement.ty;
                    const SPOINT at = Unmap(i == 0 ? color.bitmapInv : color.gradientInv,
                                            S64(std::lround(dx)), S64(std::lround(dy)), shift);
                    // One device pixel either way, in units of the fill.
                    const double slack = (i == 0 ? 3.0 : 700.0) * (1 << shift);
                    EXPECT_NEAR(at.x, x * (1 << shift), slack) << i << " away " << away;
                    EXPECT_NEAR(at.y, y * (1 << shift), slack) << i << " away " << away;
                }
            }
        }
    }
}

TEST(Styles, CutShortOrOutOfColors)
{
    ShapeScene scene;
    ShapeBuilder shape;
    shape.AddFill(Rgba{1, 2, 3});
    shape.AddFill(Fill::Linear(Mat::Gradient(0, 0, 100, 100), {{0, {}}, {255, {}}}));
    shape.AddFill(Fill::Bitmap(kFillClipped, 9, Mat::Scale(20)));
    shape.AddLine({20, {}});
    scene.Load(shape);
    const S32 block = S32(scene.data.size()) - 1; // the last byte holds the end mark
    for (S32 len = 0; len <= block; ++len)
        EXPECT_EQ(scene.Parser(kUnitMatrix, len).GetStyles(), len == block) << len;
    scene.display.colorAlloc.SetBudget(0);
    ByteWriter many;
    PutBlock(many, 0, 40000, true);
    scene.data = many.Bytes();
    EXPECT_FALSE(scene.Parser().GetStyles());
}

} // namespace
