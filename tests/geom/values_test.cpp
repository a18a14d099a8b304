// Numbers, points, rectangles, matrices and angles: single values, and laws.
#include "core/geom/matrix.h"
#include "core/geom/trig.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <vector>

namespace {
constexpr S32 kOne = 0x10000;
constexpr double kPi = 3.14159265358979323846;
constexpr SRECT kNone = {kRectEmpty, kRectEmpty, kRectEmpty, kRectEmpty};
constexpr SPOINT kLow = {kS32Min, kS32Min}, kOrigin = {0, 0};
constexpr SRECT kBox = {0, 10, 0, 10}, kDot = {3, 3, -4, -4};
constexpr MATRIX kThrice = {3 * kOne, 0, 0, kOne / 2, 0, 0};

template <typename T> const T* Arg(const T& record)
{
    return &record;
}
S32 Arg(const S32& number)
{
    return number;
}

// The fields of the record that a function leaves in its last argument, the others given by value;
// the same must come out where the first argument itself is written over.
template <typename T, typename F, typename First, typename... Rest>
std::vector<S32> Out(F function, const First& first, const Rest&... rest)
{
    T result = {};
    function(Arg(first), Arg(rest)..., &result);
    if constexpr (std::is_same_v<T, First>) {
        T over = first;
        function(&over, Arg(rest)..., &over);
        EXPECT_EQ(std::memcmp(&over, &result, sizeof(T)), 0);
    }
    std::vector<S32> fields(sizeof(T) / sizeof(S32));
    std::memcpy(fields.data(), &result, sizeof(T));
    return fields;
}

TEST(Values, Numbers)
{
    const SRECT apart = {13, 20, 14, 20};
    const SPOINT west = {kS32Min, 0}, east = {kS32Max, 0};
    const SRECT low = {kS32Min + 1, 0, 0, 0}, high = {kS32Max, 0, 0, 0};
    const S64 rows[][2] = {
        {FixedMul(0x18000, -3), -5},
        {FixedMul(kS32Min, kS32Min), 0},
        {FixedDiv(1, -3), -21845},
        {FixedDiv(5, 0), 0},
        {FixedLerp(kS32Min, kS32Max, 0x8000), -1},
        {ScaleByRatio(1000000, S64{1} << 60, S64{3} << 60), 333333},
        {ScaleByRatio(-3, S64{1} << 40, 7), kS32Min},
        {ScaleByRatio(3, 4, 0), 0},
        {ScaleByRatio(100, -2, 3), -67},
        {ShiftRounded(kS32Min, -99), -1},
        {PointLineParam(Arg(SPOINT{0, 5}), &west, &east), 0x8000},
        {PointLength(&kLow), kS32Max},
        {PointFastDistance(&kLow, &kOrigin), 0x40000000},
        {RectDistance(&kBox, &apart), 5},
        {RectNearDistance(&kBox, Arg(SPOINT{-30, 50})), 50},
        {RectEqual(&low, &high, 100), false},
        {MatrixTransformThickness(&kThrice, 1000), 2150},
        {FixedNearestMultiple(-8, 5), -10},
        {FixedNearestMultiple(7, 5), 5},
        {FixedTan(90 * kOne), 0}, // the cosine is exactly 0 there
        {PointFastLength(Arg(SPOINT{-30, 40})), 55},
        {RectOppositePoint(5) * 10 + RectOppositePoint(8), 78},
        {RectPointIn(&kBox, Arg(SPOINT{10, 0})), true},
        {RectPointIn(&kBox, Arg(SPOINT{11, 0})), false},
        {MatrixIsScaleOnly(Arg(MATRIX{kOne, 16, -16, 1, 9, 9})), true},
        {MatrixIsScaleOnly(Arg(MATRIX{kOne, 17, 0, 1, 0, 0})), false},
        {MatrixIsIdentity(Arg(MATRIX{kOne, 0, 0, kOne, 0, 1})), false},
    };
    for (const auto& row : rows)
        EXPECT_EQ(row[0], row[1]) << "row " << &row - rows;
}

TEST(Values, Records)
{
    const SRECT shared = {10, 20, 0, 10}, beside = {11, 20, 0, 10}, view = {100, 200, 0, 100},
                wide = {0, 400, -50, 50};
    const MATRIX shear = {kOne, 0x4000, -0x8000, 0x20000, 10, 20};
    const MATRIX next = {0x8000, kOne, -0x8000, -kOne, -5, 7}, quarter = {0, kOne, -kOne, 0, 0, 0};
    const MATRIX halves = {0x8000, 0x8000, 0x8000, 0x8000, 1, 2},
                 thrice = {0x8000, 0, 0, 0x30000, 1, 1};
    const auto inverse = [](const MATRIX& m) { return Out<MATRIX>(MatrixInvert, m); };
    inverse({kS32Min, kS32Min, kS32Min, 1, kS32Min, kS32Min}); // ends
    const struct {
        std::vector<S32> got, want;
    } rows[] = {
        {Out<SPOINT>(PointAverage, SPOINT{100, -100}, kOrigin, 0x4000), {25, -25}},
        {Out<SPOINT>(PointShift, SPOINT{5, -5}, -1), {3, -2}},
        {Out<SPOINT>(PointPolar, 1000, -90 * kOne, SPOINT{5, 7}), {5, -993}},
        {Out<SPOINT>(PointNearestLine, SPOINT{-7, 3}, kOrigin, SPOINT{10, 0}), {0, 0}},
        {Out<SPOINT>(PointNearestLine, SPOINT{10, 70}, SPOINT{-30, 10}, SPOINT{50, 90}), {20, 60}},
        {Out<SPOINT>(PointNearestLine, SPOINT{12, 12}, kOrigin, SPOINT{10, 10}), {10, 10}},
        {Out<SPOINT>(PointPerpNearestLine, SPOINT{30, 31}, kOrigin, SPOINT{10, 0}), {30, 0}},
        {Out<SRECT>(RectIntersect, kBox, shared), {10, 10, 0, 10}},
        {Out<SRECT>(RectIntersect, kBox, beside), Out<SRECT>(RectIntersect, kNone, kDot)},
        {Out<SRECT>(RectUnion, kDot, kNone), {3, 3, -4, -4}},
        {Out<SRECT>(RectShift, SRECT{10, 22, 1, 33}, -2), {3, 6, 0, 8}},
        {Out<SPOINT>(RectCenter, SRECT{-5, 0, 0, 7}), {-3, 3}},
        {Out<SPOINT>(RectCenter, SRECT{kS32Min + 1, kS32Max, 0, 0}), {0, 0}},
        {Out<SPOINT>(RectGetPoint, SRECT{0, 11, -20, 5}, 5), {11, -8}},
        {Out<MATRIX>(MatrixConcat, shear, next), {0x6000, 0xC000, -0x14000, -0x28000, -10, -3}},
        {Out<MATRIX>(MatrixConcat, kThrice, thrice), {0x18000, 0, 0, 0x18000, 1, 1}},
        {Out<SPOINT>(MatrixTransformPoint, halves, SPOINT{-1, -1}), {-1, 0}},
        {Out<SRECT>(MatrixTransformRect, quarter, SRECT{0, 10, 0, 20}), {-20, 0, 0, 10}},
        {inverse({kOne, 0x8000, -0x8000, kOne, 200, -300}),
         {52428, -26214, 26214, 52428, -39, 320}},
        {inverse({0x400, 0x200, -0x200, 0x400, 0, 0}), {3355443, -1677721, 1677721, 3355443, 0, 0}},
        {inverse({0x1F000, 0x1F000, -0x1F000, 0x1F000, 0, 0}), {16912, -16912, 16912, 16912, 0, 0}},
        {inverse({0x20000, 0, 0, 0x4000, 1001, -1000}), {0x8000, 0, 0, 0x40000, -500, 4000}},
        {inverse({kOne, kOne, kOne, kOne, 5, 6}), {kOne, 0, 0, kOne, 0, 0}}, // has none
        {inverse({65 * kOne, 1, 0, 65 * kOne, 9, 9}), {0, 0, 0, 0, 0, 0}},   // the distorted range
        // 100/3 is not exact: x is anchored at its minimum, y at its maximum.
        {Out<MATRIX>(MatrixMap, SRECT{0, 3, 0, 3}, view), {2184533, 0, 0, 2184533, 100, 1}},
        {Out<MATRIX>(MatrixMapAspect, wide, view), {0x4000, 0, 0, 0x4000, 100, 50}},
    };
    for (const auto& row : rows)
        EXPECT_EQ(row.got, row.want) << "row " << &row - rows;
}

TEST(Trig, SineClimbsAQuarterOfTheWayBetweenTableEntries)
{
    // From a 40-digit sine at the two neighbouring quarter degrees.
    const S32 rows[][2] = {{1972633, 32793}, {2942566, 46169},   {5891686, 65535},
                           {6553, 29},       {-4921753, -63310}, {131072000, -22415}};
    for (const auto& row : rows)
        EXPECT_EQ(_FPSin(row[0], 16, 16), row[1]) << row[0];
    EXPECT_EQ(_FPSin(90, 0, 30), 1 << 30);
    EXPECT_EQ(_FPSin(kS32Min, 0, 16), _FPSin(-128, 0, 16)); // -2^31 is -128 of a full circle
    EXPECT_EQ(_FPCos(45, -5, 40), _FPCos(45, 0, 30)) << "counts of bits are brought into range";
}

TEST(Trig, FollowsTheMathematicsAllAround)
{
    for (S32 angle = -800 * kOne; angle < 800 * kOne; angle += 12345) {
        const double radians = angle / 65536.0 * kPi / 180;
        ASSERT_NEAR(_FPSin(angle, 16, 16), std::sin(radians) * 65536, 217) << angle;
        ASSERT_NEAR(_FPCos(angle, 16, 16), std::cos(radians) * 65536, 217) << angle;
    }
    for (int angle = 0; angle < 1440; angle++) { // exact at the table's entries
        ASSERT_EQ(_FPSin(angle, 2, 16), std::lround(std::sin(angle * kPi / 720) * 65536)) << angle;
        ASSERT_EQ(_FPCos(angle, 2, 16), std::lround(std::cos(angle * kPi / 720) * 65536)) << angle;
    }
    for (S32 x = 0; x < 0x60000; x += 371) {
        const SPOINT p = {-x, 0x20000};
        ASSERT_NEAR(PointLength(&p), std::hypot(p.x, p.y), 1 + std::hypot(p.x, p.y) * 5e-5);
        const S32 angle = _FPATan(x, 16, 16);
        ASSERT_NEAR(angle / 65536.0, std::atan(x / 65536.0) * 180 / kPi, 0.0012) << x;
        ASSERT_EQ(_FPATan(-x, 16, 16), -angle) << x;
    }
    const S32 rows[][3] = {{0, -1, 180},      {1, 0, 90},        {-1, 0, -90},
                           {0, 0, 90},        {-5, -5, -135},    {kOne, 1, 90},
                           {0, kS32Min, 180}, {kS32Min, 1, -90}, {kS32Min, kS32Min, -135}};
    for (const auto& [y, x, degrees] : rows)
        EXPECT_NEAR(_FPATan2(y, x, 16, 16), degrees * kOne, 120) << y << " " << x;
}

} // namespace
