// Strokes as pictures: what they cover, where they end, and how thin ones hang together.
#include "core/display/display_list.h"
#include "core/shape/stroker.h"
#include "tests/raster/raster_scene.h"

#include <gtest/gtest.h>
#include <random>

namespace {
constexpr S32 kSide = 48; // of the picture, pixels

// One stroke, painted; coordinates are quarter pixels when anti-aliased.
struct Stroke : RasterScene {
    DisplayList display;
    size_t edges;

    Stroke(int aa, S32 thickness, const std::vector<CURVE>& path) : RasterScene(kSide, kSide, aa)
    {
        REdge* list = nullptr;
        RColor* black = Solid(0xFF000000);
        display.raster.SetAntialias(aa);
        SStroker stroker(&display, &list);
        stroker.BeginStroke(thickness, black);
        for (const CURVE& c : path)
            stroker.AddStrokeCurve(&c);
        stroker.EndStroke();
        for (Own(NewObject(), black); list; list = list->next)
            objects[0].edges.push_back(*list);
        edges = objects[0].edges.size();
        Paint(true);
    }
};

CURVE Line(SPOINT a, SPOINT b)
{
    return {a, {(a.x + b.x) >> 1, (a.y + b.y) >> 1}, b, 1};
}

// From the middle of pixel number p.
double Distance(S32 p, S32 unit, const std::vector<CURVE>& path)
{
    const SPOINT middle = {(p % kSide * 64 + 32) * unit, (p / kSide * 64 + 32) * unit};
    const MATRIX finer = {64 << 16, 0, 0, 64 << 16, 0, 0};
    S32 best = kS32Max;
    for (CURVE c : path) {
        CurveTransform(&c, &finer, &c);
        CurveNearestPoint(&c, &middle, 1, &c.control);
        best = std::min(best, PointDistance(&middle, &c.control));
    }
    return best / 64.;
}

// Lines and curves, closed now and then; of size 1 a single point.
std::vector<CURVE> Wander(std::mt19937* random, S32 unit, S32 size)
{
    const auto pick = [&] { return 2 * unit + S32((*random)() % U32(size * unit - unit + 1)); };
    const auto any = [&] { return SPOINT{pick(), pick()}; };
    const SPOINT start = any();
    std::vector<CURVE> path = {Line(start, any())};
    for (U32 n = (*random)() % 5; n > 0; --n)
        path.push_back({path.back().anchor2, any(), any(), 0});
    path.push_back(Line(path.back().anchor2, (*random)() % 2 ? any() : start));
    return path;
}

// Also where a thick curve is tight, folds back or crosses itself.
TEST(Strokes, CoverWhatIsNear)
{
    std::mt19937 random(11);
    for (int i = 0; i < 120; ++i) {
        const S32 unit = i & 1 ? 4 : 1, thickness = 4 + S32(random() % (i % 3 ? 20 : 80));
        const std::vector<CURVE> path = Wander(&random, unit, i % 4 ? 40 : i % 8 + 1);
        const Stroke stroke(unit == 4, thickness, path);
        for (S32 p = 0; p < kSide * kSide; ++p) {
            const double inside = (thickness >> 1) - Distance(p, unit, path);
            const bool sure = std::abs(inside) > (unit == 4 ? 4.2 : 2.6);
            const U32 alpha = stroke.At(p % kSide, p / kSide) >> 24;
            ASSERT_TRUE(!sure || alpha == (inside > 0 ? 255 : 0)) << i << ": pixel " << p;
        }
    }
}

// Level edges are none. A corner is two pieces outside and one line inside, an end four pieces, and
// a closed path has no ends.
TEST(Strokes, EdgesOfJoinsAndEnds)
{
    const SPOINT a = {50, 50}, b = {150, 50}, c = {150, 150}, d = {50, 150};
    EXPECT_EQ(Stroke(1, 40, {Line(a, b), Line(b, c)}).edges, 2u + 3 + 8);
    EXPECT_EQ(Stroke(1, 40, {Line(c, b), Line(b, a)}).edges, 2u + 3 + 8);
    EXPECT_EQ(Stroke(1, 40, {Line(a, b), Line(b, c), Line(c, d), Line(d, a)}).edges, 4u + 4 * 3);
}

// Each row: thickness, place across, length, and what pixels 1 to 3 across get.
TEST(Strokes, SnapToThePixelGrid)
{
    const U32 rows[][4] = {{0, 9, 20, 0x00FF00}, {4, 9, 13, 0x00FF00},  {4, 10, 20, 0x00FF00},
                           {4, 9, 12, 0x3FBF00}, {8, 9, 20, 0xFFFF00},  {8, 10, 20, 0x00FFFF},
                           {6, 9, 20, 0x7FFF00}, {12, 11, 20, 0xFFFFFF}};
    for (const auto& [thickness, at, length, alphas] : rows) {
        const S32 v = S32(at), end = 20 + S32(length);
        const Stroke s(1, S32(thickness), {Line({20, v}, {end, v})});
        const Stroke t(1, S32(thickness), {Line({v, end}, {v, 20})});
        EXPECT_EQ((s.At(6, 1) >> 24 << 16) + (s.At(6, 2) >> 24 << 8) + (s.At(6, 3) >> 24), alphas);
        EXPECT_EQ((t.At(1, 6) >> 24 << 16) + (t.At(2, 6) >> 24 << 8) + (t.At(3, 6) >> 24), alphas);
    }
}

// Takes away a pixel and all that hang on it.
void Erase(std::vector<U32>* pixels, S32 p)
{
    if (std::exchange((*pixels)[size_t(p)], 0) != 0)
        for (S32 step : {1, kSide - 1, kSide, kSide + 1, -1, 1 - kSide, -kSide, -1 - kSide})
            Erase(pixels, p + step);
}

// Every line has as many pixels as it is long, and all pixels of a path hang together.
TEST(Strokes, ThinOnesAreOnePixelWideAndWhole)
{
    std::mt19937 random(9);
    for (S32 i = 0; i < 400; ++i) {
        const SPOINT to = {i % 41 + 4, i / 10 + 4};
        const std::vector<U32> line = Stroke(0, i % 4, {Line({24, 24}, to)}).Pixels();
        const S32 length = std::max(std::abs(to.x - 24), std::abs(to.y - 24));
        EXPECT_EQ(std::count(line.begin(), line.end(), 0u) + length, kSide * kSide) << i;
        std::vector<U32> path = Stroke(0, 1, Wander(&random, 1, i % 40 + 4)).Pixels();
        Erase(&path, S32(std::max_element(path.begin(), path.end()) - path.begin()));
        EXPECT_EQ(std::count(path.begin(), path.end(), 0u), kSide * kSide) << i;
    }
}

TEST(Strokes, AnyNumbersEndSoon)
{
    std::mt19937 random(1);
    const auto any = [&] { return S32(random()) >> (random() % 32); };
    for (int i = 0; i < 300; ++i) {
        const CURVE c = {{any(), any()}, {any(), any()}, {any(), any()}, i & 2};
        EXPECT_LT(Stroke(i & 1, any(), {c}).edges, 5000u);
    }
    // A curve that leaves no edges is paid for all the same.
    DisplayList display;
    REdge* list = nullptr;
    SStroker stroker(&display, &list);
    stroker.BeginStroke(4000, nullptr);
    const CURVE hidden = {{0, -50000}, {9000, -90000}, {-900, -60000}, 0};
    display.recordsLeft = 100;
    for (int i = 0; i < 30; ++i)
        stroker.AddStrokeCurve(&hidden);
    EXPECT_TRUE(!list && display.recordsLeft == 0);
}

} // namespace
