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

// Where an inverse takes a device point whose coordinates carry `shift` fraction bits; it wraps as
// painting does.
SPOINT Unmap(const MATRIX& inverse, S64 x, S64 y, int shift)
{
    const auto part = [shift](S64 f, S64 v) { return f * (v << shift) >> 16; };
    return {S32(part(inverse.a, x) + part(inverse.c, y) + inverse.tx),
            S32(part(inverse.b, x) + part(inverse.d, y) + inverse.ty)};
}

struct Place {
    double x, y;
};

Place Map(const Mat& m, Place p)
{
    return {(m.a * p.x + m.c * p.y) / 65536 + m.tx, (m.b * p.x + m.d * p.y) / 65536 + m.ty};
}

// A fill is put through the parser; its middle and two corners have to be found again from the
// pixels where they stand, to about one pixel (`slack`, in units of the fill).
void ExpectInverse(const Mat& fill, const Mat& placement, RColorType type, int antialias)
{
    const int shift = type == kColorBitmap ? 16 : 8;
    const double size = type == kColorBitmap ? 64 : 16384;
    const double slack = (type == kColorBitmap ? 3.0 : 700.0) * (1 << shift);
    ShapeScene scene;
    scene.display.raster.SetAntialias(antialias);
    U8 pixel = 0;
    SBitmapCore bitmap = {};
    bitmap.baseAddr = &pixel;
    RColor color;
    color.SetUp(&scene.display.raster);
    color.colorType = type;
    color.bitmap = &bitmap;
    color.bitmapMat = color.gradientMat = ToMatrix(fill);
    SCharacterParser p =
        scene.Parser(ToMatrix(antialias ? placement.Then(Mat::Scale(4)) : placement));
    p.raster = &scene.display.raster;
    p.SetupColor(&color);
    const MATRIX& inverse = type == kColorBitmap ? color.bitmapInv : color.gradientInv;
    for (double x : {-size, 0.0, size}) {
        const Place at = Map(placement, Map(fill, {x, x / 2}));
        const SPOINT found = Unmap(inverse, std::lround(at.x), std::lround(at.y), shift);
        EXPECT_NEAR(found.x, x * (1 << shift), slack) << type << antialias;
        EXPECT_NEAR(found.y, x / 2 * (1 << shift), slack) << type << antialias;
    }
    color.FreeCache();
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

// Far away the shifted translations need more than 32 bits.
TEST(Styles, InversesFindThePlaceInTheFill)
{
    const Mat placements[] = {Mat::Scale(0.05).ThenTranslate(-30, 12), Mat::Scale(1),
                              Mat::Rotate(30).Then(Mat::Scale(0.2)).ThenTranslate(100, 3000),
                              Mat{-0x1000, 0x2000, 0x800, 0x3000, -2500, 40}};
    for (S32 away : {0, 500, 60000})
        for (const Mat& placement : placements)
            for (int antialias : {0, 1}) {
                ExpectInverse(Mat::Scale(20).ThenTranslate(away, 300 - away), placement,
                              kColorBitmap, antialias);
                ExpectInverse(Mat::Gradient(away, -away, 2000, 1000, 20), placement, kColorGradient,
                              antialias);
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
