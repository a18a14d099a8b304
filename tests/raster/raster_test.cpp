#include <array>
#include <random>

#include "tests/raster/raster_scene.h"
#include "gtest/gtest.h"

namespace {

// --- an independent renderer: every sample point by itself
// -----------------------------------------

S32 CrossingOf(const REdge& e, S32 y)
{
    S64 slope = (S64(e.anchor2x) - e.anchor1x) * 65536 / (e.anchor2y - e.anchor1y);
    return S32((S64(e.anchor1x) * 65536 + slope * (y - e.anchor1y) + 0x8000) >> 16);
}

struct Layer {
    RColor* color;
    RColor* clip;
    bool on;
};

// How often a colour is entered left of (and at) sample column x of scanline y.
bool IsOn(const RasterScene::Object& o, const RColor* c, S32 x, S32 y)
{
    int toggles = 0, winding = 0;
    bool counts = false;
    for (const REdge& e : o.edges) {
        bool mine = e.color1 == c || e.color2 == c;
        if (!mine || y < e.anchor1y || y >= e.anchor2y || CrossingOf(e, y) > x)
            continue;
        ++toggles;
        winding += e.dir;
        counts = counts || e.fillRule == kRuleWinding;
    }
    return counts ? winding != 0 : toggles % 2 != 0;
}

bool ClipOn(RasterScene& s, RColor* clip, S32 x, S32 y)
{
    for (RasterScene::Object& o : s.objects)
        for (RColor* c : o.colors)
            if (c == clip)
                return IsOn(o, c, x, y) &&
                       (!o.clip || o.clip == ClipMarker() || ClipOn(s, o.clip, x, y));
    return false;
}

using Sum = std::array<U32, 4>;

Sum SampleColor(RasterScene& s, S32 x, S32 y)
{
    Sum sum = {0, 0, 0, 0};
    std::vector<RGBI> stack;
    for (RasterScene::Object& o : s.objects)
        for (RColor* c : o.colors)
            if (c->colorType != kColorClip && IsOn(o, c, x, y) &&
                (!o.clip || ClipOn(s, o.clip, x, y)))
                stack.push_back(c->rgb);
    for (const RGBI& c : stack)
        for (int k = 0; k < 4; ++k) {
            U32 channel = k == 0 ? c.blue : k == 1 ? c.green : k == 2 ? c.red : c.alpha;
            sum[k] = (sum[k] * (256 - c.alpha) >> 8) + channel;
        }
    return sum;
}

U32 ReferencePixel(RasterScene& s, S32 x, S32 y)
{
    int n = s.antialias ? 4 : 1;
    Sum total = {0, 0, 0, 0};
    for (int j = 0; j < n; ++j)
        for (int i = 0; i < n; ++i) {
            Sum one = SampleColor(s, x * n + i, y * n + j);
            for (int k = 0; k < 4; ++k)
                total[k] += one[k];
        }
    for (U32& v : total)
        v /= U32(n * n);
    return total[0] | total[1] << 8 | total[2] << 16 | total[3] << 24;
}

void ExpectReference(RasterScene& s, const char* what)
{
    int bad = 0;
    for (S32 y = 0; y < s.bits.Height() && bad < 3; ++y)
        for (S32 x = 0; x < s.bits.Width() && bad < 3; ++x)
            if (s.At(x, y) != ReferencePixel(s, x, y)) {
                ++bad;
                ADD_FAILURE() << what << " at " << x << "," << y << std::hex << ": " << s.At(x, y)
                              << " wanted " << ReferencePixel(s, x, y);
            }
}

std::vector<Corner> RandomPolygon(std::mt19937& rng, S32 extent)
{
    std::uniform_int_distribution<S32> at(-extent / 4, extent + extent / 4);
    std::vector<Corner> p;
    for (int i = 0; i < 5; ++i)
        p.push_back({at(rng), at(rng)});
    return p;
}

// A stage, then polygons of every rule and opacity, some under a mask, one pair sharing edges.
void FillScene(RasterScene& s, unsigned seed, bool stage)
{
    std::mt19937 rng(seed);
    S32 extent = 24 * (s.antialias ? 4 : 1);
    if (stage)
        RasterScene::Box(s.NewObject(), {0, extent, 0, extent}, s.Solid(0xFF336699));
    RColor* mask = s.Clip();
    for (int i = 0; i < 7; ++i) {
        bool masked = i == 3 || i == 4;
        RasterScene::Object& o = s.NewObject(masked ? mask : nullptr);
        U32 alpha = (rng() & 1) ? 255 : rng() & 255;
        RColor* c = s.Solid(alpha << 24 | (rng() & 0xFFFFFF));
        RasterScene::Polygon(o, RandomPolygon(rng, extent), c, i & 1 ? kRuleWinding : kRuleEvenOdd);
        RasterScene::Polygon(o, RandomPolygon(rng, extent), s.Solid(rng() | 0xFF000000),
                             kRuleEvenOdd);
        if (i == 4) {
            RasterScene::Object& m = s.NewObject(ClipMarker());
            RasterScene::Polygon(m, RandomPolygon(rng, extent), mask, kRuleEvenOdd);
        }
    }
    RasterScene::Object& pair = s.NewObject();
    RColor* left = s.Solid(0xFF00FF00);
    RColor* right = s.Solid(0x80FF0000);
    RasterScene::Own(pair, left);
    RasterScene::Own(pair, right);
    S32 q = extent / 4;
    RasterScene::Line(pair, {q, q}, {q + 3, 3 * q}, left, nullptr, kRuleEvenOdd);
    RasterScene::Line(pair, {2 * q, q}, {2 * q - 5, 3 * q}, left, right, kRuleEdge);
    RasterScene::Line(pair, {3 * q, q}, {3 * q + 1, 3 * q}, right, nullptr, kRuleEvenOdd);
}

TEST(Raster, EqualsSamplingEveryPointByItself)
{
    for (unsigned seed = 1; seed <= 40; ++seed)
        for (int aa : {0, 1}) {
            RasterScene s(24, 24, aa);
            FillScene(s, seed, true);
            s.Paint();
            ExpectReference(s, aa ? "anti-aliased" : "plain");
        }
}

TEST(Raster, TransparentOutputStartsCleared)
{
    for (int aa : {0, 1}) {
        RasterScene s(24, 24, aa);
        FillScene(s, 77, false);
        s.Paint(true);
        s.Paint(true); // nothing of the first paint may remain
        ExpectReference(s, "alpha output");
    }
}

// Flat curves and tall ones with far control points stray from their hulls while they are stepped.
TEST(Raster, PiecesOfTheAreaEqualTheWhole)
{
    struct Curved {
        Corner a, c, b;
        S32 width, border;
    };
    const Curved curves[] = {{{2, 1}, {30, 3}, {6, 23}, 40, 7},
                             {{2, 1}, {-4, 20}, {6, 23}, 40, 19},
                             {{7500, 4}, {1500, 9}, {1500, 249}, 2000, 1458},
                             {{6000, 2}, {2000, 4}, {2000, 237}, 550, 491}};
    for (int aa : {0, 1})
        for (const Curved& k : curves) {
            RasterScene s(k.width, 64, aa);
            FillScene(s, 5, true);
            RColor* c = s.Solid(0xA0FFFF00);
            RasterScene::Object& o = s.NewObject();
            RasterScene::Own(o, c);
            RasterScene::Curve(o, k.a, k.c, k.b, c, nullptr, kRuleEvenOdd);
            RasterScene::Line(o, {20000, k.a.y}, {20000, k.b.y}, c, nullptr, kRuleEvenOdd);
            s.Paint();
            std::vector<U32> whole = s.Pixels();
            s.bits.CreateScreenBits(k.width, 64, kPixel32,
                                    true); // and the rows' order is no matter
            s.Paint({0, k.border, 0, 64});
            for (S32 y = 0; y < 64; ++y)
                s.Paint({k.border, k.width, y, y + 1});
            EXPECT_EQ(whole, s.Pixels()) << k.border << (aa ? " anti-aliased" : " plain");
        }
}

TEST(Raster, UncoveredPixelsBlendOverWhiteOrTheBackgroundBits)
{
    RasterScene s(2, 1, 0);
    RasterScene::Box(s.NewObject(), {0, 2, 0, 1}, s.Solid(0x80FF0000));
    s.Paint();
    EXPECT_EQ(0xFF, int(s.At(0, 0) >> 24));
    EXPECT_EQ(127, int(s.At(0, 0) & 0xFF)); // white * 128 >> 8
    CBitBuffer under;
    under.CreateScreenBits(1, 1);
    under.Ops()->fillRow(under.Row(0), 0, 0xFF0000FF, 1);
    s.raster.SetBackgroundBits(&under);
    s.Paint();
    EXPECT_EQ(0xFF80007Fu, s.At(0, 0));
    EXPECT_EQ(0xFFu, s.At(1, 0) >> 24); // beyond the background bits: white again
}

// Crossings of a quadratic worked out by stepping the documented differences with big integers.
TEST(Raster, CurvesCrossWhereTheSteppingSays)
{
    struct Row {
        Corner a, c, b;
        int aa;
        std::vector<S32> x; // first set pixel or sub-pixel of the area left of the far border
    };
    const Row rows[] = {
        {{0, 0}, {8, 4}, {0, 8}, 0, {0, 2, 3, 4, 5, 4, 4, 3}},
        {{0, 0}, {40, 1}, {60, 2}, 0, {0, 38}},
        {{0, 0}, {300, 1}, {700, 2}, 0, {0, 313}}, // 32-bit differences would wrap here
    };
    for (const Row& r : rows) {
        RasterScene s(800, S32(r.x.size()), r.aa);
        RColor* c = s.Solid(0xFFFFFFFF);
        RasterScene::Object& o = s.NewObject();
        RasterScene::Own(o, c);
        RasterScene::Curve(o, r.a, r.c, r.b, c, nullptr, kRuleEvenOdd);
        RasterScene::Line(o, {800, 0}, {800, S32(r.x.size())}, c, nullptr, kRuleEvenOdd);
        s.Paint();
        for (S32 y = 0; y < S32(r.x.size()); ++y) {
            S32 x = 0;
            while (x < 800 && s.At(x, y) == 0)
                ++x;
            EXPECT_EQ(r.x[size_t(y)], x) << "row " << y;
        }
    }
}

TEST(Raster, SurvivesWhatNoShapeShouldHold)
{
    RasterScene s(16, 16, 1);
    RColor* c = s.Solid(0xFF112233);
    RasterScene::Object& o = s.NewObject(c); // clipped by itself
    RasterScene::Own(o, c);
    RasterScene::Line(o, {-32768, -32768}, {32767, 32767}, c, c, kRuleEdge);
    RasterScene::Line(o, {5, 3}, {5, 40}, nullptr, nullptr, kRuleEdge);
    RasterScene::Line(o, {5, 3}, {9, 40}, c, nullptr, kRuleWinding);
    RasterScene::Curve(o, {0, 0}, {32767, -32768}, {-32768, 64}, c, nullptr, kRuleEvenOdd);
    o.edges.push_back(o.edges.front());
    o.edges.back().anchor2y = o.edges.back().anchor1y;
    s.Paint();
    s.Paint({3, 2, 9, 4});
    s.Paint({-100, 100, -100, 100});
    s.bits.FreeBits();
    s.Paint();
}

} // namespace
