#include <gtest/gtest.h>

#include <cmath>
#include <random>

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

CURVE RandomCurve(std::mt19937* random, S32 extent)
{
    std::uniform_int_distribution<S32> coord(-extent, extent);
    CURVE c;
    for (S32* v :
         {&c.anchor1.x, &c.anchor1.y, &c.control.x, &c.control.y, &c.anchor2.x, &c.anchor2.y})
        *v = coord(*random);
    c.isLine = 0;
    return c;
}

// One coordinate at a real parameter.
double Exact(S32 a1, S32 c, S32 a2, double t)
{
    return a1 * (1 - t) * (1 - t) + 2.0 * c * t * (1 - t) + a2 * t * t;
}

double ExactX(const CURVE& c, double t)
{
    return Exact(c.anchor1.x, c.control.x, c.anchor2.x, t);
}

double ExactY(const CURVE& c, double t)
{
    return Exact(c.anchor1.y, c.control.y, c.anchor2.y, t);
}

void ExpectNear(const SPOINT& got, double x, double y, double tol)
{
    EXPECT_NEAR(got.x, x, tol);
    EXPECT_NEAR(got.y, y, tol);
}
} // namespace

TEST(Curve, FlatnessMeasuresTheControlPointsOffset)
{
    const struct {
        CURVE c;
        S32 want;
    } rows[] = {
        {Quad(0, 0, 50, 50, 100, 100), 0}, {Quad(0, 0, 54, 50, 100, 100), 4},
        {Quad(0, 0, 54, 54, 100, 100), 6}, {Quad(0, 0, 50, 43, 100, 100), 7},
        {Line(0, 0, 101, 33), 0},          {Quad(kS32Min, 0, kS32Max, 0, kS32Min, 0), kS32Max}};
    for (const auto& row : rows)
        EXPECT_EQ(CurveFlatness(&row.c), row.want);
}

TEST(Curve, PointsFollowTheirRoundings)
{
    const struct {
        CURVE c;
        S32 t;
        SPOINT want;
    } rows[] = {{Quad(0, 0, 2, 2, 4, 0), 0x8000, {2, 1}},
                {Quad(-1, 1, -1, 1, 0, 0), 0x8000, {0, 0}}, // -3/4 and 3/4, toward zero
                {Quad(-3, -3, 5, 6, 7, 9), kOne, {7, 9}},
                {Quad(-3, -3, 5, 6, 7, 9), 0, {-3, -3}},
                {Quad(0, 0, 0, 0, 100, -100), 0x4000, {6, -7}}, // 6.25 and -6.25, down
                {Quad(kS32Min, 0, kS32Min, 0, kS32Min, 0), 0x8000, {kS32Min, 0}},
                {Quad(kS32Max, 0, kS32Max, 0, kS32Max, 0), 0x1234, {kS32Max, 0}}};
    for (const auto& row : rows) {
        SPOINT p;
        CurveCalcPoint(&row.c, row.t, &p);
        EXPECT_EQ(p.x, row.want.x);
        EXPECT_EQ(p.y, row.want.y);
    }
}

TEST(Curve, DividingKeepsToTheCurve)
{
    std::mt19937 random(1);
    for (int i = 0; i < 200; i++) {
        const CURVE c = RandomCurve(&random, 100000);
        const S32 t = static_cast<S32>(random() % 0x10001);
        CURVE first = c, second;
        CurveDivide(&first, t, &first, &second);
        EXPECT_EQ(first.anchor2.x, second.anchor1.x);
        EXPECT_EQ(second.anchor2.y, c.anchor2.y);
        ExpectNear(first.anchor2, ExactX(c, t / 65536.0), ExactY(c, t / 65536.0), 4);
        SPOINT p; // a quarter along the first piece is a quarter of t along the whole
        CurveCalcPoint(&first, 0x4000, &p);
        ExpectNear(p, ExactX(c, t / 262144.0), ExactY(c, t / 262144.0), 8);
        CurveDivide(&c, &first, &second);
        ExpectNear(first.anchor2, ExactX(c, 0.5), ExactY(c, 0.5), 2);
    }
    CURVE line = Line(0, 0, 100, 40), rest;
    CurveDivide(&line, 0x4000, &line, &rest);
    EXPECT_TRUE(line.isLine && rest.isLine);
    EXPECT_NEAR(line.anchor2.x, 25, 1); // rounded down twice
}

TEST(Curve, DividingTwiceGivesTheMiddlePiece)
{
    const CURVE c = Quad(0, 0, 40000, 80000, 90000, -10000);
    for (const auto& t : {std::pair{0x4000, 0xC000}, {0xC000, 0x4000}, {0, kOne}, {kOne, kOne}}) {
        const double low = std::min(t.first, t.second) / 65536.0;
        const double high = std::max(t.first, t.second) / 65536.0;
        CURVE a, b, d;
        CurveDivideTwo(&c, t.first, t.second, &a, &b, &d);
        ExpectNear(a.anchor1, 0, 0, 0);
        ExpectNear(b.anchor1, ExactX(c, low), ExactY(c, low), 4);
        ExpectNear(b.anchor2, ExactX(c, high), ExactY(c, high), 8);
        ExpectNear(d.anchor2, 90000, -10000, 0);
    }
}

TEST(Curve, TightBoundsTouchTheTurningPoints)
{
    std::mt19937 random(2);
    for (int i = 0; i < 300; i++) {
        const CURVE c = RandomCurve(&random, i % 2 ? 20 : 30000);
        SRECT tight, hull;
        CurveTightBounds(&c, &tight);
        CurveBounds(&c, &hull);
        double xmin = c.anchor1.x, xmax = xmin, ymin = c.anchor1.y, ymax = ymin;
        for (int k = 0; k <= 4000; k++) {
            xmin = std::min(xmin, ExactX(c, k / 4000.0));
            xmax = std::max(xmax, ExactX(c, k / 4000.0));
            ymin = std::min(ymin, ExactY(c, k / 4000.0));
            ymax = std::max(ymax, ExactY(c, k / 4000.0));
        }
        const double sampled[] = {-xmin, xmax, -ymin, ymax};
        const double got[] = {-1.0 * tight.xmin, 1.0 * tight.xmax, -1.0 * tight.ymin,
                              1.0 * tight.ymax};
        for (int side = 0; side < 4; side++) {
            ASSERT_GE(got[side], sampled[side] - 1e-6);
            ASSERT_LT(got[side], sampled[side] + 1.02);
        }
        SRECT common;
        RectIntersect(&tight, &hull, &common);
        ASSERT_TRUE(RectEqual(&common, &tight, 0));
    }
    const CURVE line = Line(5, 9, -5, 0);
    SRECT r;
    CurveTightBounds(&line, &r);
    EXPECT_TRUE(r.xmin == -5 && r.xmax == 5 && r.ymin == 0 && r.ymax == 9);
    const CURVE vast = Quad(kS32Min, 0, kS32Max, 0, kS32Min, 0);
    CurveTightBounds(&vast, &r);
    EXPECT_EQ(r.xmax, 0); // the middle, -1/2, rounded outwards
}

TEST(Curve, ExtremaLieWhereTheDirectionTurns)
{
    EXPECT_EQ(CurveCalcExtreme(0, 100, 0), 0x8000);
    EXPECT_EQ(CurveCalcExtreme(0, 100, 100), -1);
    EXPECT_EQ(CurveCalcExtreme(0, 50, 100), -1);
    EXPECT_EQ(CurveCalcExtreme(5, 5, 5), -1);
    EXPECT_EQ(CurveCalcExtreme(0, -30, 60), 0x4000); // 30 / 120
    EXPECT_EQ(CurveCalcExtreme(kS32Min, kS32Max, kS32Min), 0x8000);
    const CURVE arch = Quad(0, 0, 50, 100, 100, 0), monotone = Quad(0, 0, 100, 0, 100, 100);
    S32 tx, ty;
    CurveExtrema(&arch, &tx, &ty);
    EXPECT_EQ(tx, -1);
    EXPECT_EQ(ty, 0x8000);
    EXPECT_TRUE(CurveIsExtreme(&arch));
    EXPECT_FALSE(CurveIsExtreme(&monotone));
}

TEST(Curve, SteppingMissesTheEndByTheBend)
{
    const CURVE c = Quad(0, 0, 800, 1600, 3200, -640);
    CURVE_STEPPER s;
    CurveInitStepper(&c, 16, &s);
    int steps = 0;
    while (CurveStep(&s))
        steps++;
    EXPECT_EQ(steps, 16);
    EXPECT_EQ(s.t, kOne);
    ExpectNear(s.point, 3200 - 1600.0 / 16, -640 + 3840.0 / 16, 1);
    EXPECT_NE(s.prev.x, s.point.x);
    CurveInitStepper(&c, 0, &s);
    EXPECT_FALSE(CurveStep(&s));
    const CURVE vast = Quad(kS32Min, kS32Min, -1, -1, kS32Max, kS32Max);
    CurveInitStepper(&vast, 1, &s);
    EXPECT_TRUE(CurveStep(&s));
    ExpectNear(s.point, kS32Max - 1, kS32Max - 1, 0);
}

TEST(Curve, ReverseTransformAndVerticalLine)
{
    CURVE c = Quad(1, 2, 3, 4, 5, 6);
    CurveReverse(&c, &c);
    ExpectNear(c.anchor1, 5, 6, 0);
    ExpectNear(c.anchor2, 1, 2, 0);
    const MATRIX m = {0, kOne, -kOne, 0, 10, 0};
    CurveTransform(&c, &m, &c);
    ExpectNear(c.control, 6, 3, 0);
    MakeVertLine(&c, -32000);
    EXPECT_TRUE(c.isLine);
    ExpectNear(c.anchor1, -32000, 5, 0);
    ExpectNear(c.control, -32000, 3, 0);
    ExpectNear(c.anchor2, -32000, 1, 0);
}

TEST(Curve, ParametersOfPiecesAndLines)
{
    EXPECT_EQ(CurveParamInterpolate(0x8000, 0x8000, 0x1234), 0x1234);
    EXPECT_EQ(CurveParamInterpolate(0xC000, 0x4000, 0), 0x8000);
    const CURVE line = Line(0, 0, 100, 200);
    const SPOINT on = {25, 50}, before = {-9, -9};
    EXPECT_EQ(CurveLineCalcParam(&line, &on), 0x4000);
    EXPECT_EQ(CurveLineCalcParam(&line, &before), 0);
}

TEST(Curve, AdjustKeepsTheEndDirections)
{
    const CURVE c = Quad(0, 0, 1000, 0, 1000, 1000);
    SPOINT a1 = {0, -100}, a2 = {1100, 1000}; // the outer side, offset by 100
    CURVE moved;
    CurveAdjust(&c, &a1, &a2, &moved);
    ExpectNear(moved.control, 1100, -100, 0);
    const CURVE bow = Quad(0, 0, 300, 400, 900, 500);
    a1 = {-80, 60};
    a2 = {884, 599};
    CurveAdjust(&bow, &a1, &a2, &moved);
    for (S32 t : {0, kOne})
        EXPECT_NEAR(CurveTangentAngle(&moved, t), CurveTangentAngle(&bow, t), kOne / 4);
    a1 = {10, 20}; // both moved alike, and turned inside out: the average move
    a2 = {1010, 1020};
    CurveAdjust(&c, &a1, &a2, &moved);
    ExpectNear(moved.control, 1010, 20, 0);
    a1 = {2000, 0};
    CurveAdjust(&c, &a1, &a2, &moved);
    ExpectNear(moved.control, 2005, 10, 0);
    const CURVE line = Line(0, 0, 10, 0);
    CurveAdjust(&line, &a1, &a2, &moved);
    EXPECT_TRUE(moved.isLine);
    ExpectNear(moved.control, 1505, 510, 0);
    const CURVE vast = Quad(kS32Min, 0, 0, kS32Min, kS32Max, kS32Max);
    CurveAdjust(&vast, &vast.anchor1, &vast.anchor2, &moved);
    ExpectNear(moved.control, 0, kS32Min, 4);
}
