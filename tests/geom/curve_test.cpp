#include "core/geom/curve.h"

#include <gtest/gtest.h>

#include <complex>
#include <random>

namespace {
constexpr S32 kOne = 0x10000;
constexpr CURVE kArch = {{0, 0}, {500, 1000}, {1000, 0}, 0};
constexpr CURVE kVast = {{kS32Min, kS32Min}, {kS32Max, kS32Max}, {kS32Max, kS32Min}, 0};

CURVE Line(SPOINT a, SPOINT b)
{
    CURVE c;
    CurveSetLine(&a, &b, &c);
    return c;
}

CURVE RandomCurve(std::mt19937& random, S32 extent)
{
    const auto any = [&] { return static_cast<S32>(random() % U32(2 * extent + 1)) - extent; };
    return {{any(), any()}, {any(), any()}, {any(), any()}, 0};
}

using Place = std::complex<double>;

Place Of(const SPOINT& p)
{
    return {static_cast<double>(p.x), static_cast<double>(p.y)};
}

Place Exact(const CURVE& c, double t)
{
    return Of(c.anchor1) * (1 - t) * (1 - t) + 2 * t * (1 - t) * Of(c.control) +
           Of(c.anchor2) * t * t;
}

// The ray's crossings by solving the quadratic; -1 when one is too near to an end of the curve, to
// a turning point or to p to be told.
int SolveCrossings(const CURVE& c, const SPOINT& p)
{
    const double slope = c.control.y - c.anchor1.y, bend = c.anchor2.y - c.control.y - slope;
    const double square = slope * slope - bend * (c.anchor1.y - p.y);
    int count = 0;
    for (double sign : {-1.0, 1.0}) {
        const double t = (sign * std::sqrt(square) - slope) / bend, x = Exact(c, t).real() - p.x;
        if (bend == 0 || std::fabs(square) < 1e-3 + slope * slope * 1e-12 || std::fabs(t) < 1e-9 ||
            std::fabs(t - 1) < 1e-9 || std::fabs(x) < 1e-4 + std::fabs(slope) * 1e-7)
            return -1;
        count += t > 0 && t < 1 && x > 0;
    }
    return count;
}

TEST(Curve, AgreesWithRealArithmetic)
{
    std::mt19937 random(1);
    for (int i = 0; i < 200; i++) {
        const CURVE c = RandomCurve(random, i % 2 ? 20 : 5000);
        const SPOINT p = RandomCurve(random, 5000).control;
        const S32 t = static_cast<S32>(random() % 0x10001);
        CURVE first = c, second, third;
        CurveDivide(&first, t, &first, &second);
        EXPECT_LT(std::abs(Of(second.anchor1) - Exact(c, t / 65536.0)), 4);
        EXPECT_EQ(Of(second.anchor2), Of(c.anchor2));
        SPOINT near; // a quarter along the first piece is a quarter of t along the whole
        CurveCalcPoint(&first, 0x4000, &near);
        EXPECT_LT(std::abs(Of(near) - Exact(c, t / 262144.0)), 8);
        CurveDivide(&c, &first, &second);
        EXPECT_LT(std::abs(Of(second.anchor1) - Exact(c, 0.5)), 2);
        CurveDivideTwo(&c, t, 0xC000, &first, &second, &third);
        EXPECT_LT(std::abs(Of(third.anchor1) - Exact(c, std::max(t, 0xC000) / 65536.0)), 8);

        SRECT box;
        CurveTightBounds(&c, &box);
        double low = 1e9, high = -1e9, length = 0, nearest = 1e9;
        for (int k = 0; k <= 4000; k++) {
            const Place at = Exact(c, k / 4000.0);
            low = std::min(low, at.real());
            high = std::max(high, at.imag());
            length += std::abs(at - Exact(c, std::max(k - 1, 0) / 4000.0));
            nearest = std::min(nearest, std::abs(at - Of(p)));
        }
        EXPECT_NEAR(box.xmin, low - 0.51, 0.515); // rounded outwards
        EXPECT_NEAR(box.ymax, high + 0.51, 0.515);
        EXPECT_NEAR(CurveLength(&c), length, 0.52 + length * 2e-4);
        CurveDivide(&c, CurveFindLength(&c, CurveLength(&c) / 3), &first, &second);
        EXPECT_NEAR(CurveLength(&first), length / 3, 4 + length * 1e-3);
        CurveNearestPoint(&c, &p, 1, &near);
        EXPECT_LT(std::abs(Of(near) - Of(p)), nearest + 3) << i;
    }
}

TEST(Curve, RaysAgreeWithTheSolvedQuadratic)
{
    std::mt19937 random(11);
    int told = 0;
    for (int i = 0; i < 60000; i++) {
        const S32 extent = i % 3 == 0 ? 12 : i % 3 == 1 ? 32767 : 1 << 27;
        const CURVE c = RandomCurve(random, extent);
        const SPOINT p = RandomCurve(random, extent).control;
        const int want = SolveCrossings(c, p);
        told += want >= 0;
        ASSERT_EQ(CurveXRaySect(&c, &p, 0), want >= 0 ? want : CurveXRaySect(&c, &p, 0)) << i;
    }
    EXPECT_GT(told, 50000);
}

TEST(Curve, RaysFollowTheHalfOpenRangeAtEndsAndTurns)
{
    const CURVE line = Line({10, 100}, {20, 0}), far = Line({0, -5}, {1 << 30, -1 << 30}),
                bowl = {{0, 0}, {50, -100}, {100, 0}, 0};
    const struct {
        const CURVE* c;
        SPOINT p;
        int want;
    } rows[] = {{&far, {-9, -8}, 1},  {&line, {0, 0}, 1},         {&line, {0, 100}, 0},
                {&line, {15, 50}, 0}, {&kArch, {-9, 500}, 0},     {&bowl, {-9, -50}, 2},
                {&bowl, {-9, 0}, 0},  {&kVast, {0, -1 << 28}, 2}, {&kVast, {1 << 29, -1 << 28}, 1}};
    for (const auto& row : rows)
        EXPECT_EQ(CurveXRaySect(row.c, &row.p, 3), row.want) << &row - rows;
    std::mt19937 random(3);
    for (int i = 0; i < 3000; i++) { // whatever a closed outline's vertices meet, it is left again
        const CURVE a = RandomCurve(random, i % 2 ? 4 : kS32Max / 2);
        const CURVE b = {a.anchor2, RandomCurve(random, 4).control, a.anchor1, 0};
        const SPOINT p = {kS32Min, i % 3 ? a.anchor1.y : b.control.y};
        EXPECT_EQ((CurveXRaySect(&a, &p, 0) + CurveXRaySect(&b, &p, 0)) % 2, 0) << i;
    }
}

TEST(Curve, SingleValues)
{
    const CURVE turn = {{0, 0}, {1000, 0}, {1000, 1000}, 0}, hook = {{0, 0}, {0, 0}, {5, -5}, 0};
    const CURVE cut = Line({0, 375}, {1000, 375}), above = Line({0, 501}, {1000, 501});
    const SPOINT out1 = {-100, 100}, out2 = {2300, -100}, in1 = {2000, 0}, in2 = {1010, 1020};
    const CURVE hill = {{0, 0}, {1000, 1000}, {2000, 0}, 0};
    const CURVE bow = {{0, 0}, {800, 1600}, {3200, -640}, 0};
    CURVE_STEPPER s;
    CurveInitStepper(&bow, 16, &s);
    while (CurveStep(&s))
        EXPECT_EQ(s.t / 4096 + s.count, 16);
    S32 t1, t2;
    SRECT box;
    CURVE outer, inner, wall = turn;
    CurveTightBounds(&kVast, &box);
    CurveAdjust(&hill, &out1, &out2, &outer); // keeps the directions at its ends
    CurveAdjust(&turn, &in1, &in2, &inner);   // turned inside out: the average move
    MakeVertLine(&wall, -32000);
    const S32 rows[][2] = {{CurveCalcCoord(-1, -1, 0, 0x8000), 0},   // -3/4, toward zero
                           {CurveCalcCoord(0, 0, -100, 0x4000), -7}, // -6.25, down
                           {CurveCalcCoord(kS32Max, kS32Max, kS32Max, 0x1234), kS32Max},
                           {CurveFlatness(&turn), 750},
                           {CurveCalcExtreme(0, 100, 100), -1},
                           {CurveCalcExtreme(0, -30, 60), 0x4000},
                           {CurveIsExtreme(&turn), false},
                           {CurveTangentAngle(&turn, 0x8000), 45 * kOne},
                           {CurveTangentAngle(&hook, 0), -45 * kOne},
                           {CurveLength(&kVast), kS32Max},
                           {CurveBoundsSect(&kArch, &cut, 1, 16, &t1, &t2), true},
                           {(t1 + 0x200) / 0x400, 16},
                           {CurveBoundsSect(&kArch, &above, 0, 16, &t1, &t2), false},
                           {outer.control.x, 1000},
                           {outer.control.y, 1200},
                           {inner.control.x, 2005},
                           {wall.control.y - wall.anchor1.x, 32500},
                           {s.point.x, 3200 - 1600 / 16}, // off by a part of the bend
                           {s.point.y, -640 + 3840 / 16},
                           {box.ymax, 0}};
    for (const auto& row : rows)
        EXPECT_EQ(row[0], row[1]) << "row " << &row - rows;
}

} // namespace
