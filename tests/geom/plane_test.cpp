#include <gtest/gtest.h>

#include "core/geom/matrix.h"
#include "core/geom/point.h"
#include "core/geom/rect.h"

namespace {
constexpr S32 kOne = 0x10000;
constexpr SRECT kEmpty = {kRectEmpty, kRectEmpty, kRectEmpty, kRectEmpty};

void ExpectRect(const SRECT& got, const SRECT& want)
{
    EXPECT_EQ(got.xmin, want.xmin);
    EXPECT_EQ(got.xmax, want.xmax);
    EXPECT_EQ(got.ymin, want.ymin);
    EXPECT_EQ(got.ymax, want.ymax);
}

void ExpectPoint(const SPOINT& got, const SPOINT& want)
{
    EXPECT_EQ(got.x, want.x);
    EXPECT_EQ(got.y, want.y);
}

void ExpectMatrix(const MATRIX& got, const MATRIX& want, S32 tol)
{
    EXPECT_TRUE(MatrixEqual(&got, &want, tol))
        << got.a << " " << got.b << " " << got.c << " " << got.d << " " << got.tx << " " << got.ty;
}
} // namespace

TEST(Point, LengthsFollowTheTable)
{
    const struct {
        SPOINT v;
        double length;
    } rows[] = {{{3 << 16, 4 << 16}, 327680},
                {{1, 0}, 1},
                {{5, -12}, 13},
                {{-30000, 17}, 30000},
                {{123456, -654321}, 665865.87},
                {{1 << 20, 1 << 20}, 1482910.4},
                {{kS32Max, 0}, 2147483647},
                {{kS32Min, 0}, 2147483647},
                {{kS32Min, kS32Min}, 2147483647.0},
                {{0, 0}, 0}};
    for (const auto& row : rows)
        EXPECT_NEAR(PointLength(&row.v), row.length, 1 + row.length * 5e-5) << row.v.x;
    const SPOINT p = {100, 100}, q = {103, 96};
    EXPECT_EQ(PointDistance(&p, &q), 5);
}

TEST(Point, TheTwoFastEstimatesDiffer)
{
    const SPOINT origin = {0, 0}, p = {-10, 7}, far = {kS32Min, kS32Min};
    EXPECT_EQ(PointFastLength(&p), 14);
    EXPECT_EQ(PointFastDistance(&origin, &p), 5);
    EXPECT_EQ(PointFastLength(&far), kS32Max);
    EXPECT_EQ(PointFastDistance(&far, &origin), 0x40000000);
}

TEST(Point, AverageWeighsTheFirstPoint)
{
    const SPOINT p = {100, -100}, q = {0, 0};
    SPOINT r;
    PointAverage(&p, &q, kOne, &r);
    ExpectPoint(r, p);
    PointAverage(&p, &q, 0x4000, &r);
    ExpectPoint(r, {25, -25});
}

TEST(Point, ShiftsRoundAndScalesRoundDown)
{
    SPOINT p = {5, -5};
    PointShift(&p, -1, &p);
    ExpectPoint(p, {3, -2});
    PointShift(&p, 4, &p);
    ExpectPoint(p, {48, -32});
    EXPECT_EQ(ShiftRounded(kS32Max, -31), 1);
    EXPECT_EQ(ShiftRounded(kS32Min, -99), -1);
    EXPECT_EQ(ShiftRounded(1, 99), 0);
    PointScale(&p, 0x8001, &p);
    ExpectPoint(p, {24, -17});
}

TEST(Point, NormalizeSetsTheLength)
{
    SPOINT p = {300, -400};
    PointNormalize(&p, 50);
    EXPECT_NEAR(p.x, 30, 1);
    EXPECT_NEAR(p.y, -40, 1);
    SPOINT zero = {0, 0};
    PointNormalize(&zero, 50);
    ExpectPoint(zero, {0, 0});
}

TEST(Point, PolarAndAngleAgree)
{
    const SPOINT origin = {1000, -2000};
    for (int degrees = -175; degrees <= 180; degrees += 5) {
        SPOINT p;
        PointPolar(100000, degrees * kOne, &origin, &p);
        EXPECT_NEAR(PointAngle(&p, &origin), degrees * kOne, 200) << degrees;
    }
}

TEST(Point, NearestPointsOnLines)
{
    const struct {
        SPOINT p, a, b, onSegment, onLine;
        S32 param;
    } rows[] = {
        {{5, 9}, {0, 0}, {10, 0}, {5, 0}, {5, 0}, 0x8000},
        {{-7, 3}, {0, 0}, {10, 0}, {0, 0}, {-7, 0}, 0},
        {{30, 30}, {0, 0}, {10, 10}, {10, 10}, {30, 30}, 0x10000},
        {{8, 0}, {0, 0}, {8, 8}, {4, 4}, {4, 4}, 0x8000},
        {{3, 4}, {1, 1}, {1, 1}, {1, 1}, {1, 1}, 0},
        {{100000, 700000},
         {-300000, 100000},
         {500000, 900000},
         {200000, 600000},
         {200000, 600000},
         40960},
        {{0, 5}, {kS32Min, 0}, {kS32Max, 0}, {0, 0}, {0, 0}, 0x8000},
    };
    for (const auto& row : rows) {
        SPOINT got;
        PointNearestLine(&row.p, &row.a, &row.b, &got);
        EXPECT_TRUE(PointEqual(&got, &row.onSegment, row.a.x == kS32Min ? 8 : 0)) << got.x;
        PointPerpNearestLine(&row.p, &row.a, &row.b, &got);
        EXPECT_TRUE(PointEqual(&got, &row.onLine, row.a.x == kS32Min ? 8 : 0)) << got.x;
        EXPECT_NEAR(PointLineParam(&row.p, &row.a, &row.b), row.param, 1);
    }
}

TEST(Rect, UnionsAndIntersections)
{
    const SRECT a = {0, 10, 0, 10}, b = {10, 20, 0, 10}, c = {11, 20, 0, 10}, dot = {3, 3, -4, -4};
    const struct {
        SRECT a, b, common, both;
    } rows[] = {{a, b, {10, 10, 0, 10}, {0, 20, 0, 10}},
                {a, c, kEmpty, {0, 20, 0, 10}},
                {kEmpty, kEmpty, kEmpty, kEmpty},
                {kEmpty, dot, kEmpty, dot},
                {dot, kEmpty, kEmpty, dot},
                {a, dot, kEmpty, {0, 10, -4, 10}}};
    for (const auto& row : rows) {
        SRECT r = row.a;
        RectIntersect(&r, &row.b, &r);
        ExpectRect(r, row.common);
        EXPECT_EQ(RectTestIntersect(&row.a, &row.b), !RectIsEmpty(&row.common));
        r = row.b;
        RectUnion(&row.a, &r, &r);
        ExpectRect(r, row.both);
    }
}

TEST(Rect, InsetShiftAndOffsetLeaveEmptyAlone)
{
    SRECT r = kEmpty;
    RectOffset(5, 5, &r);
    RectInset(-5, &r);
    RectShift(&r, 2, &r);
    ExpectRect(r, kEmpty);
    RectSet(20, 30, 10, 0, &r);
    ExpectRect(r, {10, 20, 0, 30});
    RectInset(-1, &r);
    RectOffset(1, 2, &r);
    ExpectRect(r, {10, 22, 1, 33});
    RectShift(&r, -2, &r);
    ExpectRect(r, {3, 6, 0, 8});
    RectInset(2, &r);
    ExpectRect(r, kEmpty);
}

TEST(Rect, HandlesAndTheirOpposites)
{
    const SRECT r = {0, 11, -20, 5};
    const SPOINT want[] = {{0, 5},   {11, 5},  {11, -20}, {0, -20}, {5, 5},
                           {11, -8}, {5, -20}, {0, -8},   {5, -8}};
    for (int i = 0; i < 9; i++) {
        SPOINT p;
        RectGetPoint(&r, i, &p);
        ExpectPoint(p, want[i]);
    }
    const int opposite[] = {2, 3, 0, 1, 6, 7, 4, 5, 8};
    for (int i = 0; i < 9; i++)
        EXPECT_EQ(RectOppositePoint(i), opposite[i]);
    EXPECT_EQ(RectOppositePoint(-1), 8);
}

TEST(Rect, CentresRoundTowardZeroWidth)
{
    SPOINT p;
    const SRECT odd = {-5, 0, 0, 7}, reversed = {0, -3, 0, -3},
                whole = {kS32Min + 1, kS32Max, 0, 0};
    RectCenter(&odd, &p);
    ExpectPoint(p, {-3, 3});
    RectCenter(&reversed, &p);
    ExpectPoint(p, {-1, -1});
    RectCenter(&whole, &p);
    ExpectPoint(p, {0, 0});
    RectCenter(&kEmpty, &p);
    ExpectPoint(p, {0, 0});
}

TEST(Rect, DistancesAndTolerance)
{
    const SRECT a = {0, 10, 0, 10}, right = {13, 20, 14, 20}, over = {5, 50, 10, 50};
    const SPOINT inside = {10, 0}, outside = {-30, 50};
    EXPECT_EQ(RectDistance(&a, &right), 5);
    EXPECT_EQ(RectDistance(&right, &a), 5);
    EXPECT_EQ(RectDistance(&a, &over), 0);
    EXPECT_EQ(RectNearDistance(&a, &inside), 0);
    EXPECT_EQ(RectNearDistance(&a, &outside), 50);
    const SRECT near = {1, 9, -1, 11}, low = {kS32Min + 1, 0, 0, 0}, high = {kS32Max, 0, 0, 0};
    EXPECT_TRUE(RectEqual(&a, &near, 1));
    EXPECT_FALSE(RectEqual(&a, &near, 0));
    EXPECT_FALSE(RectEqual(&low, &high, 100)); // the difference does not wrap to something small
    EXPECT_FALSE(RectEqual(&a, &kEmpty, kS32Max));
}

TEST(Matrix, InverseMatchesExactArithmetic)
{
    const struct {
        MATRIX m, want;
        S32 tol;
    } rows[] = {
        {{0x10000, 0x8000, -0x8000, 0x10000, 200, -300},
         {52428, -26214, 26214, 52428, -40, 320},
         2},
        {{300000, -120000, 45000, 90000, 5000, 7000}, {11930, 15907, -5965, 39768, -273, -5461}, 2},
        {{655, 300, -200, 900, 0, 0}, {5951455, -1983818, 1322545, 4331337, 0, 0}, 400},
        {{0x200000, 0x100000, -0x80000, 0x180000, -4000, 12345},
         {1755, -1170, 585, 2340, -3, -512},
         2},
        {{0x20000000, 0x4000000, 0, 0x30000000, 100, 100}, {8, 0, 0, 5, 0, 0}, 1},
        {{0x20000, 0, 0, 0x4000, 1000, -1000}, {0x8000, 0, 0, 0x40000, -500, 4000}, 0},
        {{0, 0, 0, 0x20000, 7, 8}, {0, 0, 0, 0x8000, 0, -4}, 0},
        {{1, 0, 0, 2, 0, 0}, {0, 0, 0, kS32Min, 0, 0}, 0},
        {{0, 0, 0, 0, 5, 6}, {kOne, 0, 0, kOne, 0, 0}, 0},
        {{kOne, kOne, kOne, kOne, 5, 6}, {kOne, 0, 0, kOne, 0, 0}, 0}, // no inverse
        {{20 * kOne, 1, 0, 20 * kOne, 0, 0}, {3276, 0, 0, 3276, 0, 0}, 0},
        {{65 * kOne, 1, 0, 65 * kOne, 9, 9}, {0, 0, 0, 0, 0, 0}, 0}, // the distorted range
    };
    for (const auto& row : rows) {
        MATRIX m = row.m;
        MatrixInvert(&m, &m);
        ExpectMatrix(m, row.want, row.tol);
    }
    MATRIX worst = {kS32Min, kS32Min, kS32Min, 1, kS32Min, kS32Min};
    MatrixInvert(&worst, &worst); // must end
}

TEST(Matrix, InverseTakesPointsBack)
{
    for (int degrees = 0; degrees < 360; degrees += 15) {
        MATRIX m, scale, back;
        MatrixRotate(degrees * kOne, &m);
        MatrixScale(kOne / 2 + degrees * 300, 3 * kOne, &scale);
        scale.tx = 1234;
        scale.ty = -777;
        MatrixConcat(&m, &scale, &m);
        MatrixInvert(&m, &back);
        const SPOINT p = {3000, -2000};
        SPOINT q;
        MatrixTransformPoint(&m, &p, &q);
        MatrixTransformPoint(&back, &q, &q);
        EXPECT_TRUE(PointEqual(&p, &q, 5)) << degrees << ": " << q.x << "," << q.y;
    }
}

TEST(Matrix, ConcatAppliesTheFirstThenTheSecond)
{
    MATRIX m1 = {kOne, 0x4000, -0x8000, 0x20000, 10, 20},
           m2 = {0x8000, 0x10000, 0, -0x10000, -5, 7};
    MATRIX both, aliased = m1;
    MatrixConcat(&m1, &m2, &both);
    // Worked out by hand: x' = 0.5x - 0.25y, y' = 0.75x - 2.5y, then the moves.
    ExpectMatrix(both, {0x8000, 0xC000, -0x4000, -0x28000, 0, -3}, 0);
    MatrixConcat(&aliased, &m2, &aliased);
    ExpectMatrix(aliased, both, 0);
    aliased = m2;
    MatrixConcat(&m1, &aliased, &aliased);
    ExpectMatrix(aliased, both, 0);
    const MATRIX s1 = {0x20000, 0, 0, 0x8000, 3, -3}, s2 = {0x8000, 0, 0, 0x30000, 1, 1};
    MatrixConcat(&s1, &s2, &both);
    ExpectMatrix(both, {0x10000, 0, 0, 0x18000, 2, -8}, 0);
}

TEST(Matrix, TransformsRoundEachProductDown)
{
    const MATRIX m = {0x8000, 0x8000, 0x8000, 0x8000, 1, 2};
    SPOINT p = {-1, -1};
    MatrixTransformPoint(&m, &p, &p);
    ExpectPoint(p, {-1, 0});
    MATRIX turn;
    MatrixRotate(90 * kOne, &turn);
    SRECT r = {0, 10, 0, 20}, none = kEmpty;
    MatrixTransformRect(&turn, &r, &r);
    ExpectRect(r, {-20, 0, 0, 10});
    MatrixTransformRect(&turn, &none, &none);
    ExpectRect(none, kEmpty);
}

TEST(Matrix, PredicatesUseTheirTolerances)
{
    MATRIX m = {kOne, 16, -16, 1, 9, 9};
    EXPECT_TRUE(MatrixIsScaleOnly(&m));
    m.c = kS32Min;
    EXPECT_FALSE(MatrixIsScaleOnly(&m));
    m = {kOne, 0, 0, -1, 0, 0};
    EXPECT_FALSE(MatrixIsScaleOnly(&m));
    EXPECT_FALSE(MatrixIsIdentity(&m));
    MatrixTranslate(0, 0, &m);
    EXPECT_TRUE(MatrixIsIdentity(&m));
}

TEST(Matrix, MapsAnchorTheMinimumInXAndTheMaximumInY)
{
    const SRECT src = {0, 3, 0, 3}, dst = {100, 200, 0, 100}, flat = {5, 5, 5, 5};
    MATRIX m;
    MatrixMap(&src, &dst, &m); // 100/3 is not exact: the far edges show which side is anchored
    ExpectMatrix(m, {2184533, 0, 0, 2184533, 100, 1}, 0);
    MatrixMap(&flat, &dst, &m);
    EXPECT_EQ(m.a, 100 * kOne);
    const SRECT wide = {0, 400, -50, 50};
    MatrixMapAspect(&wide, &dst, &m);
    ExpectMatrix(m, {kOne / 4, 0, 0, kOne / 4, 100, 50}, 0);
}

TEST(Matrix, DecomposesAndScalesLineWidths)
{
    MATRIX m, scale;
    MatrixScale(3 * kOne, kOne / 2, &scale);
    MatrixRotate(30 * kOne, &m);
    MatrixConcat(&scale, &m, &m);
    SPOINT size;
    S32 rot;
    MatrixDecompose(&m, &size, &rot);
    EXPECT_NEAR(size.x, 3 * kOne, 12);
    EXPECT_NEAR(size.y, kOne / 2, 4);
    EXPECT_NEAR(rot, 30 * kOne, 100);
    EXPECT_NEAR(MatrixTransformThickness(&scale, 1000), 2150, 2); // sqrt((9 + 1/4) / 2) * 1000
    MatrixScale(100, 100, &scale);
    EXPECT_EQ(MatrixTransformThickness(&scale, 20), 1);
    EXPECT_EQ(MatrixTransformThickness(&scale, 0), 0);
}

TEST(Interpolate, RunsFromTheFirstToTheSecond)
{
    const MATRIX m0 = {0, 10, 20, 30, 40, -1}, m1 = {100, 10, 0, 31, 80, 0};
    MATRIX m;
    Interpolate(&m0, &m1, 0x4000, &m);
    ExpectMatrix(m, {25, 10, 15, 30, 50, -1}, 0);
    const SRECT r0 = {0, 10, 0, 10}, r1 = {100, 200, -100, 0};
    SRECT r;
    Interpolate(&r0, &r1, kOne, &r);
    ExpectRect(r, r1);
    Interpolate(&r0, &r1, 0, &r);
    ExpectRect(r, r0);
}
