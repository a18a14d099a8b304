// Style blocks, shape records, and the edges that come of them.
#include "core/display/display_list.h"
#include "core/shape/character_parser.h"
#include "core/stream/script_player.h"
#include "tests/support/shape_writer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <map>
#include <random>

namespace {
constexpr MATRIX kUnit = {0x10000, 0, 0, 0x10000, 0, 0};
constexpr SRECT kSmallBounds = {-1000, 1000, -1000, 1000};
constexpr SRECT kHugeBounds = {-40000, 40000, -40000, 40000};

// One object of a display list and the parsers that a test runs on it.
struct ShapeScene {
    DisplayList display;
    CBitBuffer bits;
    ScriptPlayer movie;
    SObject obj = {};
    std::vector<U8> data;

    explicit ShapeScene(std::vector<U8> bytes = {}) : data(std::move(bytes))
    {
        bits.CreateScreenBits(16, 16);
        display.bits = &bits;
        obj.display = &display;
        display.ResetBudget();
    }
    explicit ShapeScene(const ShapeBuilder& shape, bool alpha = false) : ShapeScene()
    {
        ByteWriter out;
        shape.Write(out, alpha);
        data = out.Bytes();
    }

    // A parser over the first `len` bytes of `data`; all of them by default.
    SCharacterParser Parser(const MATRIX& mat = kUnit, S32 len = -1)
    {
        const S32 size = len < 0 ? S32(data.size()) : len;
        return SCharacterParser(&obj, &movie, data.data(), size, 0, &mat);
    }

    std::vector<REdge*> Edges() const
    {
        std::vector<REdge*> all;
        for (REdge* e = obj.edges; e; e = e->next)
            all.push_back(e);
        return all;
    }

    std::vector<REdge*> Build(const SRECT& bounds, const MATRIX& mat = kUnit)
    {
        Parser(mat).BuildEdges(true, &bounds);
        return Edges();
    }
};

TEST(Edges, PiecesOfOneCurve)
{
    const struct {
        CURVE curve;
        std::vector<std::vector<S32>> pieces; // y of anchor 1, control, anchor 2, then isLine
    } rows[] = {{{{0, 10}, {50, 8}, {90, 60}, 0}, {{10, 10, 60, 0}}},
                {{{0, 10}, {50, 7}, {90, 90}, 0}, {{9, 9, 10, 1}, {9, 9, 90, 0}}},
                {{{0, 10}, {50, 62}, {90, 60}, 0}, {{10, 60, 60, 0}}},
                {{{0, 10}, {50, 11}, {90, 10}, 0}, {}},
                {{{0, 0}, {400, 256}, {0, 512}, 0}, {{0, 128, 256, 0}, {256, 384, 512, 0}}},
                {{{0, 1000}, {0, 500}, {0, 0}, 1}, {{0, 500, 1000, 1}}},
                {{{0, 0}, {1, 50}, {0, 100}, 0}, {{0, 50, 100, 1}}},
                {{{0, 0}, {2, 50}, {0, 100}, 0}, {{0, 50, 100, 0}}}};
    for (const auto& row : rows) {
        ShapeScene scene;
        scene.Parser().AddCurve(&row.curve);
        std::vector<std::vector<S32>> got;
        for (const REdge* e : scene.Edges())
            got.push_back({e->anchor1y, e->controly, e->anchor2y, e->isLine});
        std::sort(got.begin(), got.end());
        EXPECT_EQ(got, row.pieces) << &row - rows;
    }
    // Once a piece has been too deep, there is that much less room for the others.
    ShapeScene scene;
    SCharacterParser p = scene.Parser();
    p.depth = 16;
    p.AddCurve(&rows[4].curve);
    p.AddCurve(&rows[0].curve);
    EXPECT_EQ(p.depth, 17);
    EXPECT_EQ(scene.Edges().size(), 1u);
}

TEST(Edges, ColorsAndRuleOfTheTwoSides)
{
    const struct {
        int fill0, fill1, color1, color2;
        bool winding;
        U8 rule;
    } rows[] = {{0, 5, 5, 0, false, kRuleEvenOdd}, {3, 0, 3, 0, true, kRuleWinding},
                {2, 2, 2, 2, false, kRuleEdge},    {1, 2, 1, 2, true, kRuleEdge},
                {7, 4, 4, 0, true, kRuleWinding},  {0, 6, 0, 0, false, 0}}; // 5 in the table
    for (const auto& row : rows) {
        ShapeBuilder shape;
        for (U8 i = 1; i <= 5; ++i)
            shape.AddFill(Rgba{i, 0, 0});
        ShapeScene scene(shape.Styles(row.fill0, row.fill1).LineTo(3, 400));
        SCharacterParser p = scene.Parser();
        p.useWinding = row.winding;
        ASSERT_TRUE(p.BuildEdges(true, &kSmallBounds));
        ASSERT_EQ(scene.Edges().size(), row.color1 ? 1u : 0u);
        for (const REdge* e : scene.Edges()) {
            EXPECT_EQ(e->color1->rgb.red, row.color1);
            EXPECT_EQ(e->color2 ? e->color2->rgb.red : 0, row.color2);
            EXPECT_EQ(e->fillRule, row.rule);
        }
    }
}

TEST(Edges, AMaskHasOneColorInAllItsStyleBlocks)
{
    ShapeBuilder shape;
    shape.AddFill(Rgba{1, 1, 1});
    shape.Styles(1, shape.AddFill(Rgba{2, 2, 2})).Rect(0, 0, 10, 10).NewStyles().Fill0(0);
    ShapeScene scene(shape.Fill1(shape.AddFill(Rgba{3, 3, 3})).Rect(20, 0, 30, 10));
    scene.obj.clipDepth = 9;
    const std::vector<REdge*> edges = scene.Build(kSmallBounds);
    ASSERT_EQ(edges.size(), 4u);
    for (const REdge* e : edges) {
        EXPECT_EQ(e->color1, edges[0]->color1);
        EXPECT_TRUE(!e->color2 || e->color2 == e->color1);
        EXPECT_EQ(e->color1->colorType, kColorClip);
    }
}

// The integral of x dy along a quadratic piece.
double AreaUnder(double x1, double y1, double cx, double cy, double x2, double y2)
{
    return (x1 * (2 * cy + y2 - 3 * y1) + 2 * cx * (y2 - y1) + x2 * (3 * y2 - 2 * cy - y1)) / 6;
}

// A closed outline crosses every scanline as often down as up, and its pieces enclose what its
// curves enclose but for rounding.
TEST(Edges, ClosedOutlinesStayClosedAndKeepTheirArea)
{
    const MATRIX turn = {0, 0x20000, -0x8000, 0, 7, -9};
    std::mt19937 random(3);
    for (int i = 0; i < 400; ++i) {
        const auto any = [&] { return S32(random() % 6000 - 3000) / (i & 1 ? 10 : 1); };
        ShapeBuilder shape;
        const Pt start = {any(), any()};
        Pt pen = start;
        double area = 0, height = 0;
        shape.Fill1(shape.AddFill(Rgba{1, 2, 3})).MoveTo(start.x, start.y);
        for (int k = 0; k < 6; ++k) {
            Pt c = {any(), any()};
            const Pt to = k == 5 ? start : Pt{any(), k == 3 ? pen.y : any()};
            if (random() % 3 == 0) {
                c = {(pen.x + to.x) / 2, (pen.y + to.y) / 2};
                shape.LineTo(to.x, to.y);
            } else {
                shape.CurveTo(c.x, c.y, to.x, to.y);
            }
            area += AreaUnder(pen.x, pen.y, c.x, c.y, to.x, to.y);
            pen = to;
        }
        ShapeScene scene(shape);
        std::map<S32, int> change;
        for (const REdge* e : scene.Build(kSmallBounds, i & 2 ? turn : kUnit)) {
            area -= e->dir * AreaUnder(e->anchor1x, e->anchor1y, e->controlx, e->controly,
                                       e->anchor2x, e->anchor2y);
            height += e->anchor2y - e->anchor1y + 4;
            change[e->anchor1y] += e->dir;
            change[e->anchor2y] -= e->dir;
        }
        EXPECT_NEAR(area, 0, 2 * height) << i;
        for (const auto& [y, less] : change)
            EXPECT_EQ(less, 0) << y;
    }
}

TEST(Edges, FarCoordinatesKeepTheFillsOfWhatShows)
{
    const struct {
        Box box;
        std::vector<S32> sides; // x on scanline 0
    } rows[] = {{{-90000, -50000, -100, 100}, {-32000, -32000}},
                {{50000, 90000, -100, 100}, {32000, 32000}},
                {{-90000, 90000, -90000, 90000}, {-32000, 32000}},
                {{-500, 500, -200000, 100}, {-500, 500}},
                {{-500, 500, -90000, -20000}, {}}};
    for (const auto& [box, sides] : rows)
        for (const SRECT& bounds : {kHugeBounds, kSmallBounds}) { // bounds may lie
            ShapeBuilder shape;
            shape.Fill1(shape.AddFill(Rgba{}))
                .Rect(1, -3, 2, -1)
                .Rect(box.xmin, box.ymin, box.xmax, box.ymax);
            ShapeScene scene(shape);
            std::vector<S32> crossings;
            for (const REdge* e : scene.Build(bounds))
                if (e->anchor1y <= 0 && e->anchor2y > 0)
                    crossings.push_back(e->anchor1x);
            std::sort(crossings.begin(), crossings.end());
            EXPECT_EQ(crossings, sides) << box.xmin;
        }
}

// Near its end the data is read by another, careful reader, with the same results; and whatever the
// bytes, every edge that reaches the raster obeys the raster's terms.
TEST(Records, AreReadAlikeEverywhereAndMakeOnlySoundEdges)
{
    std::mt19937 random(7);
    for (int i = 0; i < 3000; ++i) {
        const auto any = [&] { return S32(random() % 30000) >> (random() % 16); };
        ShapeBuilder shape;
        shape.Fill1(shape.AddFill(Rgba{1, 1, 1}));
        for (int k = 0; k < 12; ++k) {
            if (random() % 4 == 0)
                shape.Fill0(int(random() % 2)).MoveTo(any(), -any());
            random() % 2 ? shape.LineTo(any(), k) : shape.CurveTo(any(), any(), -any(), any());
        }
        ShapeScene scene(shape), longer(shape);
        longer.data.resize(scene.data.size() + 40);
        SCharacterParser p = scene.Parser(), q = longer.Parser();
        CURVE c = {}, d = {};
        EXPECT_TRUE(p.GetStyles() && q.GetStyles());
        for (int flags = 0; flags != SShapeParser::kEndOfShape;) {
            flags = p.GetEdge(&c);
            ASSERT_EQ(flags, q.GetEdge(&d));
            ASSERT_TRUE(p.pos == q.pos && p.bitPos == q.bitPos && p.bitBuf == q.bitBuf);
            ASSERT_EQ(std::memcmp(&c, &d, sizeof c), 0);
        }

        for (U32 n = random() % 8; n > 0; --n)
            scene.data[random() % scene.data.size()] = U8(random());
        scene.data.resize(scene.data.size() - random() % 4);
        const int shift = int(random() % 16);
        const MATRIX mat = {S32(random()) >> shift, S32(random()) >> 18,    S32(random()) >> 16,
                            S32(random()) >> shift, S32(random()) >> shift, S32(random()) >> 8};
        scene.obj.clipDepth = i % 3 == 0;
        for (const REdge* e : scene.Build(i & 1 ? kHugeBounds : kSmallBounds, mat)) {
            ASSERT_LT(e->anchor1y, e->anchor2y);
            ASSERT_TRUE(e->anchor1y <= e->controly && e->controly <= e->anchor2y);
            ASSERT_TRUE(e->color1 && (e->color2 != nullptr) == (e->fillRule == kRuleEdge));
        }
    }
}

// A block of `fills` solid fills and `lines` lines, their red channels counting up.
void PutBlock(ByteWriter& out, U32 fills, U32 lines)
{
    for (U32 count : {fills, lines}) {
        count < 255 ? out.PutU8(count) : out.PutU8(0xFF).PutU16(count);
        for (U32 i = 1; i <= count; ++i)
            (count == fills ? out.PutU8(0) : out.PutU16(20)).PutColor({U8(i), 0, 0}, false);
    }
    out.UB(4, 9).UB(4, 3);
}

TEST(Styles, BlocksAreReadWithOldWidthsAndNumberedOn)
{
    const U32 rows[][3] = {{0, 2, 0}, {254, 3, 2}, {256, 1, 259}, {3, 256, 516}};
    ByteWriter out;
    for (const auto& [fills, lines, layer] : rows) {
        PutBlock(out, fills, lines);
        if (fills != 3) // a selector in the old width; then the byte's last bits are lost
            out.UB(1, 0).UB(5, 0x12).UB(9, 257).UB(1, 0);
    }
    ShapeScene scene(out.UB(6, 0).Bytes());
    SCharacterParser p = scene.Parser();
    CURVE c;
    ASSERT_TRUE(p.GetStyles());
    for (const auto& [fills, lines, layer] : rows) {
        ASSERT_TRUE(p.nFills == fills && p.nLines == lines);
        EXPECT_TRUE(!p.Fill(fills + 1) && !p.LineStyle(lines + 1).color);
        for (U32 i = 1; i <= fills; ++i)
            ASSERT_TRUE(p.Fill(i)->order == layer + i && p.Fill(i)->rgb.red == U8(i)) << i;
        for (U32 i = 1; i <= lines; ++i)
            ASSERT_EQ(p.LineStyle(i).color->order, layer + fills + i);
        EXPECT_EQ(p.GetEdge(&c), fills == 3 ? SShapeParser::kEndOfShape : 0x12);
    }
    EXPECT_EQ(p.fill0, 257u);
}

TEST(Styles, SolidColorsAreTransformedThenPremultiplied)
{
    ColorTransform half;
    half.alphaMul = 128;
    half.CalcFlags();
    const struct {
        Rgba in;
        bool alpha;
        ColorTransform cx;
        RGBI out;
    } rows[] = {{{200, 100, 0, 128}, true, {}, {0, 50, 100, 128}},
                {{200, 100, 0, 128}, false, {}, {0, 100, 200, 255}},
                {{200, 255, 7, 0}, true, {}, {0, 0, 0, 0}}, // c * 1 >> 8
                {{200, 100, 40, 255}, true, half, {20, 50, 100, 127}}};
    for (const auto& row : rows) {
        ShapeBuilder shape;
        shape.AddFill(row.in);
        shape.AddLine({20, row.in});
        ShapeScene scene(shape, row.alpha);
        SCharacterParser p = scene.Parser();
        p.getAlpha = row.alpha;
        p.cxform = row.cx;
        ASSERT_TRUE(p.GetStyles());
        EXPECT_EQ(p.Fill(1)->rgb, row.out);
        EXPECT_EQ(p.LineStyle(1).color->rgb, row.out);
        EXPECT_EQ(p.Fill(1)->transparent, row.out.alpha < 255);
    }
}

TEST(Styles, MorphsAreBetweenTheirEndsAndRampsKeepEightStops)
{
    ByteWriter out;
    out.PutU8(2);
    out.PutU8(0).PutColor({10, 20, 1, 255}, true).PutColor({20, 10, 0, 255}, true);
    out.PutU8(0x12).PutMatrix(Mat::Translate(100, 0)).PutMatrix(Mat::Translate(201, -1));
    out.PutU8(11);
    for (U8 ratio : {10, 40, 30, 60, 60, 90, 80, 255, 1, 2, 3}) {
        out.PutU8(ratio).PutColor({ratio, 0, 0, 255}, true);
        out.PutU8(ratio / 2).PutColor({0, 8, 0, 0}, true);
    }
    out.PutU8(1).PutU16(0).PutU16(65535).PutColor({1, 1, 1}, true).PutColor({3, 3, 3}, true);
    ShapeScene scene(out.UB(4, 2).UB(4, 1).Bytes());
    const struct {
        U16 ratio;
        RGBI solid;
        S32 tx, ty, thickness, red;
        std::vector<U8> stops;
    } rows[] = {{0, {1, 20, 10, 255}, 100, 0, 0, 30, {10, 40, 40, 60, 60, 90, 90, 255}},
                {0x8000, {0, 15, 15, 255}, 150, -1, 32767, 15, {7, 30, 30, 45, 45, 67, 67, 191}},
                {0xFFFF, {0, 10, 19, 255}, 200, -1, 65534, 0, {5, 20, 20, 30, 30, 45, 45, 127}}};
    for (const auto& row : rows) {
        SCharacterParser p = scene.Parser();
        p.getAlpha = true;
        p.ratio = row.ratio;
        ASSERT_TRUE(p.GetMorphStyles());
        const RColor* fill = p.Fill(2);
        EXPECT_EQ(p.Fill(1)->rgb, row.solid);
        EXPECT_TRUE(fill->gradientMat.tx == row.tx && fill->gradientMat.ty == row.ty);
        EXPECT_EQ(std::vector<U8>(fill->ramp.ratios, fill->ramp.ratios + fill->ramp.count),
                  row.stops);
        EXPECT_EQ(fill->ramp.colors[2].red, row.red);
        EXPECT_TRUE(fill->transparent == (row.ratio != 0) && fill->gradientType == kFillRadial);
        EXPECT_NEAR(p.LineStyle(1).thickness, row.thickness, 2);
    }
}

// Worked out by hand. Far away the shifted translations need more than 32 bits.
TEST(Styles, InversesOfFills)
{
    const MATRIX fill = {0x200000, 0, 0, 0x200000, 600000, -640000}; // half a pixel to two pixels
    const struct {
        MATRIX base;
        int antialias;
        MATRIX want; // the translation in pixels
    } rows[] = {{{0x1000, 0, 0, 0x1000, -70000, 7}, 0, {0x8000, 0, 0, 0x8000, 32500, 39993}},
                {{0x4000, 0, 0, 0x4000, 20, 28}, 1, {0x8000, 0, 0, 0x8000, -37505, 39993}},
                {{0, 0x1000, -0x1000, 0, 5, 7}, 0, {0, -0x8000, 0x8000, 0, -37507, 40005}}};
    for (const auto& row : rows)
        for (RColorType type : {kColorBitmap, kColorGradient}) {
            ShapeScene scene;
            scene.display.raster.SetAntialias(row.antialias);
            SBitmapCore bitmap = {};
            RColor color;
            color.SetUp(&scene.display.raster);
            color.colorType = type;
            color.bitmap = &bitmap;
            color.bitmapMat = color.gradientMat = fill;
            SCharacterParser p = scene.Parser(row.base);
            p.raster = &scene.display.raster;
            p.SetupColor(&color);
            MATRIX want = row.want;
            want.tx *= type == kColorBitmap ? 0x8000 : 0x80;
            want.ty *= type == kColorBitmap ? 0x8000 : 0x80;
            EXPECT_TRUE(MatrixEqual(type == kColorBitmap ? &color.bitmapInv : &color.gradientInv,
                                    &want, 0));
            color.FreeCache();
        }
}

TEST(Styles, CutShortOrWithoutPixels)
{
    ShapeBuilder shape;
    shape.AddFill(Fill::Linear(Mat::Gradient(0, 0, 100, 100), {{0, {}}, {255, {}}}));
    for (U16 id : {4, 5, 6})
        shape.AddFill(Fill::Bitmap(kFillClipped, id, Mat::Scale(20)));
    shape.AddLine({20, {}});
    ShapeScene scene(shape);
    scene.movie.CreateCharacter(5)->type = kCharBitmap;
    SCharacter* six = scene.movie.CreateCharacter(6);
    six->type = kCharShape;
    six->bitmap.baseAddr = scene.data.data();
    const S32 block = S32(scene.data.size()) - 1; // the last byte holds the end mark
    for (S32 len = 0; len < block; ++len)
        EXPECT_FALSE(scene.Parser(kUnit, len).GetStyles()) << len;
    SCharacterParser p = scene.Parser();
    p.raster = &scene.display.raster;
    ASSERT_TRUE(p.GetStyles());
    for (U32 i : {2u, 3u, 4u}) {
        EXPECT_EQ(p.Fill(i)->colorType, kColorSolid) << i;
        EXPECT_EQ(p.Fill(i)->rgb, (RGBI{0, 0, 255, 255})) << "red where a bitmap has no pixels";
    }
    scene.display.colorAlloc.SetBudget(0);
    scene.display.edgeAlloc.SetBudget(0);
    EXPECT_TRUE(scene.Build(kSmallBounds).empty());
}

} // namespace
