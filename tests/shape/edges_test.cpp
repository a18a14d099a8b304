#include "tests/shape/shape_scene.h"

#include <gtest/gtest.h>

#include <cmath>
#include <map>
#include <random>

namespace {

CURVE Curve(SPOINT a, SPOINT c, SPOINT b, bool line = false)
{
    return {a, c, b, line};
}

// How often edges go down less how often they go up, on each scanline where that is not 0.
std::map<S32, int> Imbalance(const std::vector<REdge*>& edges)
{
    std::map<S32, int> change, result;
    for (const REdge* e : edges) {
        change[e->anchor1y] += e->dir;
        change[e->anchor2y] -= e->dir;
    }
    int sum = 0;
    for (const auto& [y, d] : change)
        if ((sum += d) != 0)
            result[y] = sum;
    return result;
}

// The integral of x dy along a quadratic piece.
double AreaUnder(double x1, double y1, double cx, double cy, double x2, double y2)
{
    return (x1 * (2 * cy + y2 - 3 * y1) + 2 * cx * (y2 - y1) + x2 * (3 * y2 - 2 * cy - y1)) / 6;
}

double SignedArea(const std::vector<REdge*>& edges)
{
    double area = 0;
    for (const REdge* e : edges)
        area +=
            e->dir * (e->isLine ? (e->anchor1x + e->anchor2x) / 2.0 * (e->anchor2y - e->anchor1y)
                                : AreaUnder(e->anchor1x, e->anchor1y, e->controlx, e->controly,
                                            e->anchor2x, e->anchor2y));
    return area;
}

TEST(Edges, PiecesOfOneCurve)
{
    const struct {
        const char* what;
        CURVE curve;
        std::vector<std::vector<S32>> pieces; // y of anchor 1, control, anchor 2, then isLine
    } cases[] = {
        {"2 above", Curve({0, 10}, {50, 8}, {90, 60}), {{10, 10, 60, 0}}},
        {"3 above", Curve({0, 10}, {50, 7}, {90, 90}), {{9, 9, 10, 1}, {9, 9, 90, 0}}},
        {"2 below", Curve({0, 10}, {50, 62}, {90, 60}), {{10, 60, 60, 0}}},
        {"level", Curve({0, 10}, {50, 11}, {90, 10}), {}},
        {"level line", Curve({0, 10}, {45, 10}, {90, 10}, true), {}},
        {"tall curve",
         Curve({0, 0}, {400, 500}, {0, 1000}),
         {{0, 125, 250, 0}, {250, 375, 500, 0}, {500, 625, 750, 0}, {750, 875, 1000, 0}}},
        {"256", Curve({0, 0}, {400, 128}, {0, 256}), {{0, 128, 256, 0}}},
        {"tall line", Curve({0, 1000}, {0, 500}, {0, 0}, true), {{0, 500, 1000, 1}}},
        {"bent by 1", Curve({0, 0}, {1, 50}, {0, 100}), {{0, 50, 100, 1}}},
        {"bent by 2", Curve({0, 0}, {2, 50}, {0, 100}), {{0, 50, 100, 0}}},
    };
    for (const auto& test : cases) {
        for (bool reversed : {false, true}) {
            ShapeScene scene;
            SCharacterParser p = scene.Parser();
            CURVE c = test.curve;
            if (reversed)
                std::swap(c.anchor1, c.anchor2);
            p.AddCurve(&c);
            std::vector<std::vector<S32>> got;
            for (const REdge* e : scene.Edges())
                got.push_back({e->anchor1y, e->controly, e->anchor2y, e->isLine});
            std::sort(got.begin(), got.end());
            EXPECT_EQ(got, test.pieces) << test.what << reversed;
        }
    }
}

TEST(Edges, ColorsAndRuleOfTheTwoSides)
{
    const struct {
        int fill0, fill1, color1, color2;
        U8 rule, windingRule;
    } cases[] = {{0, 5, 5, 0, kRuleEvenOdd, kRuleWinding},
                 {3, 0, 3, 0, kRuleEvenOdd, kRuleWinding},
                 {1, 2, 1, 2, kRuleEdge, kRuleEdge},
                 {2, 2, 2, 2, kRuleEdge, kRuleEdge},
                 {7, 4, 4, 0, kRuleEvenOdd, kRuleWinding}, // 7 is not in the table
                 {0, 6, 0, 0, 0, 0}};
    for (const auto& test : cases) {
        for (bool winding : {false, true}) {
            ShapeScene scene;
            ShapeBuilder shape;
            for (U8 i = 1; i <= 5; ++i)
                shape.AddFill(Rgba{i, 0, 0});
            scene.Load(shape.Styles(test.fill0, test.fill1).MoveTo(0, 0).LineTo(3, 40));
            SCharacterParser p = scene.Parser();
            p.useWinding = winding;
            ASSERT_TRUE(p.BuildEdges(true, &kSmallBounds));
            ASSERT_EQ(scene.Edges().size(), test.color1 ? 1u : 0u);
            if (!test.color1)
                continue;
            const REdge* e = scene.obj.edges;
            EXPECT_EQ(e->color1->rgb.red, test.color1);
            EXPECT_EQ(e->color2 ? e->color2->rgb.red : 0, test.color2);
            EXPECT_EQ(e->fillRule, winding ? test.windingRule : test.rule);
        }
    }
}

TEST(Edges, GlyphsUseThePresetColor)
{
    ShapeScene scene;
    ByteWriter out;
    ShapeBuilder().Fill1(1).Rect(0, 0, 10, 10).Fill1(2).Rect(20, 0, 30, 10).WriteGlyph(out);
    scene.data = out.Bytes();
    RColor ink;
    ink.SetUp(nullptr);
    SCharacterParser p = scene.Parser();
    p.useWinding = true;
    p.SetOnlyFill(&ink);
    ASSERT_TRUE(p.BuildEdges(false, &kSmallBounds));
    ASSERT_EQ(scene.Edges().size(), 2u);
    EXPECT_EQ(scene.obj.edges->color1, &ink);
    EXPECT_EQ(scene.obj.edges->fillRule, kRuleWinding);
    EXPECT_EQ(scene.obj.colors, nullptr);
}

// A closed outline crosses every scanline as often down as up, and its pieces enclose what its
// curves enclose but for rounding.
TEST(Edges, ClosedOutlinesStayClosedAndKeepTheirArea)
{
    std::mt19937 random(3);
    auto coord = [&](S32 range) { return S32(random() % U32(2 * range)) - range; };
    for (int i = 0; i < 400; ++i) {
        const S32 range = i & 1 ? 300 : 3000;
        ShapeBuilder shape;
        shape.AddFill(Rgba{1, 2, 3});
        const Pt start = {coord(range), coord(range)};
        Pt pen = start;
        double area = 0;
        shape.Fill1(1).MoveTo(start.x, start.y);
        for (int k = 0; k < 6; ++k) {
            const Pt c = {coord(range), coord(range)};
            const Pt to = k == 5 ? start : Pt{coord(range), coord(range)};
            const bool straight = random() % 3 == 0;
            straight ? shape.LineTo(to.x, to.y) : shape.CurveTo(c.x, c.y, to.x, to.y);
            area += straight ? (pen.x + to.x) / 2.0 * (to.y - pen.y)
                             : AreaUnder(pen.x, pen.y, c.x, c.y, to.x, to.y);
            pen = to;
        }
        ShapeScene scene;
        scene.Load(shape);
        ASSERT_TRUE(scene.Build());
        EXPECT_TRUE(Imbalance(scene.Edges()).empty()) << i;
        double height = 0;
        for (const REdge* e : scene.Edges())
            height += e->anchor2y - e->anchor1y + 4;
        EXPECT_NEAR(SignedArea(scene.Edges()), area, 2 * height) << i;
    }
}

TEST(Edges, FarCoordinatesKeepTheFillsOfWhatShows)
{
    const struct {
        const char* what;
        Box box;
        S32 left, right; // x of the sides on scanline 0
    } cases[] = {{"far left", {-90000, -50000, -100, 100}, -32000, -32000},
                 {"far right", {50000, 90000, -100, 100}, 32000, 32000},
                 {"over everything", {-90000, 90000, -90000, 90000}, -32000, 32000},
                 {"high", {-500, 500, -200000, 100}, -500, 500},
                 {"above", {-500, 500, -90000, -20000}, 0, 0}};
    for (const auto& test : cases) {
        for (const SRECT& bounds : {kHugeBounds, kSmallBounds}) { // bounds may lie
            ShapeScene scene;
            ShapeBuilder shape;
            shape.Fill1(shape.AddFill(Rgba{}));
            shape.Rect(test.box.xmin, test.box.ymin, test.box.xmax, test.box.ymax);
            scene.Load(shape);
            ASSERT_TRUE(scene.Build(bounds));
            std::vector<S32> crossings;
            for (const REdge* e : scene.Edges()) {
                EXPECT_EQ(e->anchor1x, e->anchor2x) << test.what;
                if (e->anchor1y <= 0 && e->anchor2y > 0)
                    crossings.push_back(e->anchor1x);
            }
            std::sort(crossings.begin(), crossings.end());
            const std::vector<S32> sides = {test.left, test.right};
            EXPECT_EQ(crossings, test.left || test.right ? sides : std::vector<S32>()) << test.what;
        }
    }
    ShapeScene scene;
    ShapeBuilder shape;
    shape.Fill1(shape.AddFill(Rgba{}));
    scene.Load(shape.Ellipse(3000, -7000, 60000, 50000));
    ASSERT_TRUE(scene.Build(kHugeBounds));
    const std::vector<REdge*> edges = scene.Edges();
    EXPECT_LT(edges.size(), 2000u);
    for (const auto& [y, d] : Imbalance(edges))
        EXPECT_TRUE(y <= -16000 || y >= 15999) << y << ": " << d;
}

// Once a piece has been too deep, there is that much less room for the others.
TEST(Edges, DepthIsSpentForGood)
{
    ShapeScene scene;
    SCharacterParser p = scene.Parser();
    p.depth = 16;
    const CURVE tall = Curve({0, 0}, {90, 200}, {0, 400}), low = Curve({0, 0}, {90, 100}, {0, 200});
    p.AddCurve(&tall);
    EXPECT_EQ(p.depth, 17);
    EXPECT_EQ(scene.Edges().size(), 0u);
    p.AddCurve(&low);
    EXPECT_EQ(scene.Edges().size(), 1u);
}

TEST(Edges, AMaskHasOneColorInAllItsStyleBlocks)
{
    ShapeScene scene;
    ShapeBuilder shape;
    const int first = shape.AddFill(Rgba{1, 1, 1}), second = shape.AddFill(Rgba{2, 2, 2});
    const int line = shape.AddLine({20, {}});
    shape.Styles(first, second, line).Rect(0, 0, 10, 10).NewStyles();
    shape.Fill0(0).Fill1(shape.AddFill(Rgba{3, 3, 3})).Rect(20, 0, 30, 10);
    scene.Load(shape);
    scene.obj.clipDepth = 9;
    ASSERT_TRUE(scene.Build());
    const std::vector<REdge*> edges = scene.Edges();
    ASSERT_EQ(edges.size(), 4u);
    const RColor* mask = edges[0]->color1;
    EXPECT_EQ(mask->colorType, kColorClip);
    EXPECT_EQ(mask->transparent, 1);
    EXPECT_EQ(mask->order, 0u);
    for (const REdge* e : edges) {
        EXPECT_EQ(e->color1, mask);
        EXPECT_TRUE(!e->color2 || e->color2 == mask);
    }
    SCharacterParser p = scene.Parser();
    ASSERT_TRUE(p.GetStyles());
    p.MakeClipper();
    EXPECT_EQ(p.LineStyle(1).color, nullptr);
}

TEST(Edges, WithoutEdgesOrOutputShapesAreEmptyOrUnbuilt)
{
    ShapeScene scene;
    ShapeBuilder shape;
    shape.Fill1(shape.AddFill(Rgba{}));
    for (int i = 0; i < 2000; ++i)
        shape.CurveTo(i, 30000, 5 * i, (i & 1) * 30000);
    scene.Load(shape);
    scene.display.edgeAlloc.SetBudget(1);
    EXPECT_TRUE(scene.Build());
    EXPECT_GT(scene.Edges().size(), 0u);
    EXPECT_LT(scene.Edges().size(), 100000u);
    scene.display.bits = nullptr;
    EXPECT_TRUE(scene.Build());
    EXPECT_EQ(scene.obj.colors->raster, nullptr);
    EXPECT_EQ(scene.obj.colors->cached, 0);
}

TEST(Edges, BoxesHaveTheirSlopingSides)
{
    ShapeScene scene;
    RColor ink;
    ink.SetUp(nullptr);
    const SRECT box = {0, 20, 0, 10};
    REdge* list = nullptr;
    AddRect(&box, &kUnitMatrix, &ink, &scene.display, &list);
    ASSERT_TRUE(list && list->next && !list->next->next);
    EXPECT_EQ(list->fillRule, kRuleEvenOdd);
    EXPECT_EQ(list->color1, &ink);
}

} // namespace
