#include <gtest/gtest.h>

#include <cmath>
#include <random>
#include <vector>

#include "core/geom/curve.h"

namespace {
constexpr S32 kOne = 0x10000;

CURVE Quad(S32 x1, S32 y1, S32 cx, S32 cy, S32 x2, S32 y2)
{
    return {{x1, y1}, {cx, cy}, {x2, y2}, 0};
}

CURVE Line(S32 x1, S32 y1, S32 x2, S32 y2)
{
    const SPOINT a = {x1, y1}, b = {x2, y2};
    CURVE c;
    CurveSetLine(&a, &b, &c);
    return c;
}

long double Coord(long double a1, long double c, long double a2, long double t)
{
    return a1 * (1 - t) * (1 - t) + 2 * c * t * (1 - t) + a2 * t * t;
}

// The ray's crossings by solving the quadratic in floating point; -1 when one is too near to an end
// of the curve, to a turning point or to p to be told.
int SolveCrossings(const CURVE& c, const SPOINT& p)
{
    const long double a1 = c.anchor1.y - p.y, b = c.control.y - p.y, a2 = c.anchor2.y - p.y;
    const long double bend = a1 - 2 * b + a2, slope = b - a1;
    std::vector<long double> roots;
    if (bend == 0) {
        if (slope != 0)
            roots.push_back(-a1 / (2 * slope));
    } else {
        const long double d = slope * slope - bend * a1;
        if (std::fabs(d) < 1e-3L)
            return -1;
        if (d > 0)
            for (long double sign : {-1.0L, 1.0L})
                roots.push_back((-slope + sign * std::sqrt(d)) / bend);
    }
    int count = 0;
    for (long double t : roots) {
        const long double x =
            Coord(c.anchor1.x, c.control.x, c.anchor2.x, t) - static_cast<long double>(p.x);
        if (std::fabs(t) < 1e-9L || std::fabs(t - 1) < 1e-9L || std::fabs(x) < 1e-4L)
            return -1;
        count += t > 0 && t < 1 && x > 0;
    }
    return count;
}
} // namespace

TEST(CurveXRaySect, AgreesWithTheSolvedQuadratic)
{
    std::mt19937 random(11);
    int told = 0;
    for (int i = 0; i < 60000; i++) {
        const S32 extent = i % 3 == 0 ? 12 : i % 3 == 1 ? 900 : 32767;
        std::uniform_int_distribution<S32> coord(-extent, extent);
        const auto any = [&] { return coord(random); };
        const CURVE c = {{any(), any()}, {any(), any()}, {any(), any()}, 0};
        const SPOINT p = {any(), any()};
        const int want = SolveCrossings(c, p);
        if (want < 0)
            continue;
        told++;
        ASSERT_EQ(CurveXRaySect(&c, &p, 0), want)
            << c.anchor1.x << "," << c.anchor1.y << " " << c.control.x << "," << c.control.y << " "
            << c.anchor2.x << "," << c.anchor2.y << " from " << p.x << "," << p.y;
    }
    EXPECT_GT(told, 50000);
}

TEST(CurveXRaySect, EndsAndTurningPointsFollowTheHalfOpenRange)
{
    const CURVE up = Quad(10, 0, 10, 50, 10, 100), line = Line(10, 100, 20, 0);
    const CURVE arch = Quad(0, 0, 50, 100, 100, 0), bowl = Quad(0, 0, 50, -100, 100, 0);
    const struct {
        const CURVE* c;
        SPOINT p;
        int want;
    } rows[] = {
        {&up, {0, 0}, 1},      {&up, {0, 100}, 0},    {&up, {10, 50}, 0}, // on it: not right
        {&up, {9, 99}, 1},     {&up, {0, -1}, 0},     {&line, {0, 0}, 1},
        {&line, {0, 100}, 0},  {&line, {15, 50}, 0},  {&line, {14, 50}, 1},
        {&arch, {-9, 0}, 2},   {&arch, {50, 0}, 1},   {&arch, {-9, 50}, 0}, // its top
        {&arch, {-9, 49}, 2},  {&arch, {50, 49}, 1},  {&bowl, {-9, -50}, 2},
        {&bowl, {60, -50}, 0}, {&bowl, {-9, -51}, 0}, {&bowl, {-9, 0}, 0}};
    for (const auto& row : rows)
        EXPECT_EQ(CurveXRaySect(row.c, &row.p, 0), row.want) << row.p.x << "," << row.p.y;
}

// A closed outline with vertices on many rows: outside points see an even number, inside points an
// odd one, whatever the ray meets.
TEST(CurveXRaySect, ClosedOutlinesKeepTheirParity)
{
    const CURVE ring[] = {Quad(40, 0, 40, 17, 28, 28),
                          Quad(28, 28, 17, 40, 0, 40),
                          Quad(0, 40, -17, 40, -28, 28),
                          Line(-28, 28, -40, 0),
                          Quad(-40, 0, -40, -17, -28, -28),
                          Line(-28, -28, 0, -40),
                          Line(0, -40, 28, -40),
                          Quad(28, -40, 60, -20, 40, 0)};
    for (S32 far : {1, 1 << 18, 1 << 25})
        for (S32 y = -60; y <= 60; y++) {
            int outside = 0, inside = 0;
            for (CURVE c : ring) {
                for (S32* v : {&c.anchor1.x, &c.control.x, &c.anchor2.x, &c.anchor1.y, &c.control.y,
                               &c.anchor2.y})
                    *v *= far;
                const SPOINT left = {-60 * far, y * far}, middle = {0, y * far};
                outside += CurveXRaySect(&c, &left, 0);
                inside += CurveXRaySect(&c, &middle, 3);
            }
            EXPECT_EQ(outside % 2, 0) << y;
            EXPECT_EQ(inside % 2, y >= -40 && y < 40) << y << " " << far;
        }
}

TEST(CurveXRaySect, IsBoundedForAnyCoordinates)
{
    const CURVE vast = Quad(kS32Min, kS32Min, kS32Max, kS32Max, kS32Max, kS32Min);
    const SPOINT corner = {kS32Min, kS32Min}, other = {kS32Max, kS32Max}, middle = {0, -1 << 28};
    const SPOINT between = {1 << 29, -1 << 28};
    EXPECT_EQ(CurveXRaySect(&vast, &corner, 0), 1); // one of its ends lies at the corner itself
    EXPECT_EQ(CurveXRaySect(&vast, &other, 0), 0);
    EXPECT_EQ(CurveXRaySect(&vast, &middle, 65535), 2); // at x = 1.8e8 and 1.7e9
    EXPECT_EQ(CurveXRaySect(&vast, &between, 0), 1);
}

TEST(CurveLength, AgreesWithNumericalIntegration)
{
    // Integrated to 12 digits.
    const struct {
        CURVE c;
        double want;
    } rows[] = {{Quad(0, 0, 100, 200, 300, 0), 375.463641},
                {Quad(0, 0, 0, 1000, 1000, 1000), 1623.22524},
                {Quad(-5, 3, 7, -9, 20, 4), 28.7038556},
                {Quad(0, 0, 1000, 0, 0, 0), 1000},
                {Line(-3, 0, 0, 4), 5},
                {Quad(7, 7, 7, 7, 7, 7), 0},
                {Quad(0, 0, 2000000000, 1, 0, 2000000000), 2147483647}}; // 3.08e9, held at the end
    for (const auto& row : rows)
        EXPECT_NEAR(CurveLength(&row.c), row.want, 0.51 + row.want * 2e-4);
}

TEST(CurveLength, FindsTheParameterOfALength)
{
    const CURVE c = Quad(0, 0, 10000, 20000, 30000, 0), line = Line(0, 0, 100, 0);
    const S32 whole = CurveLength(&c);
    for (S32 part = 1; part < 8; part++) {
        const S32 t = CurveFindLength(&c, whole / 8 * part);
        CURVE first, second;
        CurveDivide(&c, t, &first, &second);
        EXPECT_NEAR(CurveLength(&first), whole / 8.0 * part, 12) << part;
    }
    EXPECT_EQ(CurveFindLength(&c, 0), 0);
    EXPECT_EQ(CurveFindLength(&c, kS32Min), 0);
    EXPECT_EQ(CurveFindLength(&c, kS32Max), kOne);
    EXPECT_NEAR(CurveFindLength(&line, 25), 0x4000, 2);
}

TEST(CurveTangent, DirectionsAtTheEndsAndTheMiddle)
{
    const struct {
        CURVE c;
        S32 t;
        int degrees;
    } rows[] = {{Quad(0, 0, 100, 0, 100, 100), 0, 0},
                {Quad(0, 0, 100, 0, 100, 100), kOne, 90},
                {Quad(0, 0, 100, 0, 100, 100), 0x8000, 45},
                {Line(0, 0, -7, 0), 0x1000, 180},
                {Quad(0, 0, 0, 0, 5, -5), 0, -45},
                {Quad(0, 0, 5, 5, 5, 5), kOne, 45},
                {Quad(kS32Min, 0, kS32Max, 0, kS32Max, 9), 0, 0}};
    for (const auto& row : rows)
        EXPECT_NEAR(CurveTangentAngle(&row.c, row.t), row.degrees * kOne, 100);
}

TEST(CurveNearest, IsAsNearAsAnySample)
{
    std::mt19937 random(5);
    std::uniform_int_distribution<S32> coord(-5000, 5000);
    const auto any = [&] { return coord(random); };
    for (int i = 0; i < 200; i++) {
        const CURVE c = {{any(), any()}, {any(), any()}, {any(), any()}, 0};
        const SPOINT p = {any(), any()};
        SPOINT near, check;
        CurveCalcPoint(&c, CurveNearestPoint(&c, &p, 1, &near), &check);
        EXPECT_TRUE(PointEqual(&near, &check, 0));
        double best = 1e9;
        for (int k = 0; k <= 2000; k++) {
            const long double t = k / 2000.0L;
            const double x = static_cast<double>(Coord(c.anchor1.x, c.control.x, c.anchor2.x, t));
            const double y = static_cast<double>(Coord(c.anchor1.y, c.control.y, c.anchor2.y, t));
            best = std::min(best, std::hypot(x - p.x, y - p.y));
        }
        EXPECT_LT(std::hypot(near.x - p.x, near.y - p.y), best + 3) << i;
    }
    const CURVE vast = Quad(kS32Min, kS32Min, kS32Max, kS32Max, kS32Max, kS32Min);
    const SPOINT p = {kS32Min, kS32Max};
    SPOINT near;
    CurveNearestPoint(&vast, &p, 0, &near); // ends, within its depth
}

TEST(CurveBoundsSect, FindsCrossingsAndOnlyThose)
{
    const CURVE arch = Quad(0, 0, 500, 1000, 1000, 0);
    const CURVE cut = Line(0, 375, 1000, 375); // meets the arch at t = 1/4 and 3/4
    const CURVE above = Line(0, 501, 1000, 501), apart = Line(2000, 0, 3000, 0);
    S32 t1 = -1, t2 = -1;
    ASSERT_TRUE(CurveBoundsSect(&arch, &cut, 1, 16, &t1, &t2));
    EXPECT_NEAR(t1, 0x4000, 300);
    EXPECT_NEAR(t2, 0x4000, 300);
    EXPECT_FALSE(CurveBoundsSect(&arch, &above, 0, 16, &t1, &t2));
    EXPECT_FALSE(CurveBoundsSect(&arch, &apart, 1, 16, &t1, &t2));
    EXPECT_TRUE(CurveBoundsSect(&arch, &arch, 1, 16, &t1, &t2));
}
