#include <gtest/gtest.h>

#include <cmath>

#include "core/geom/fixed.h"
#include "core/geom/tables.h"
#include "core/geom/trig.h"

namespace {
constexpr S32 kDegree = 0x10000;
constexpr double kPi = 3.14159265358979323846;
} // namespace

TEST(Fixed, RoundsProductsDownAndQuotientsTowardZero)
{
    EXPECT_EQ(FixedMul(-1, 1), -1);
    EXPECT_EQ(FixedMul(1, 1), 0);
    EXPECT_EQ(FixedMul(0x18000, -3), -5);
    EXPECT_EQ(FixedMul(kS32Min, kS32Min), 0); // 2^46 narrowed
    EXPECT_EQ(FixedDiv(-1, 0x20000), 0);
    EXPECT_EQ(FixedDiv(7, -2), -229376);
    EXPECT_EQ(FixedDiv(5, 0), 0);
    EXPECT_EQ(FixedDiv(kS32Min, -1), 0); // 2^47 narrowed
    EXPECT_EQ(DivTrunc(-7, 2), -3);
    EXPECT_EQ(DivTrunc(1, 0), 0);
}

TEST(Fixed, MagnitudesAndLerpHoldAtTheEndsOfTheRange)
{
    EXPECT_EQ(Magnitude(kS32Min), 0x80000000u);
    EXPECT_EQ(Abs32(kS32Min), kS32Max);
    EXPECT_EQ(FixedLerp(kS32Min, kS32Max, 0x8000), -1);
    EXPECT_EQ(FixedLerp(kS32Min, kS32Max, 0x10000), kS32Max);
    EXPECT_EQ(FixedLerp(0, -1, 1), -1); // rounds down
}

TEST(Fixed, NearestMultipleTakesHalvesAwayFromZero)
{
    const struct {
        S32 v, m, want;
    } rows[] = {{14, 10, 10},  {15, 10, 20}, {-14, 10, -10}, {-15, 10, -20},       {7, 0, 7},
                {16, -10, 10}, {3, 1, 3},    {1, 3, 0},      {kS32Min, 1, kS32Min}};
    for (const auto& row : rows)
        EXPECT_EQ(FixedNearestMultiple(row.v, row.m), row.want) << row.v << " " << row.m;
}

TEST(Fixed, RatiosKeepTheirPrecisionWithLongTerms)
{
    EXPECT_EQ(ScaleByRatio(100, 1, 3), 33);
    EXPECT_EQ(ScaleByRatio(100, -2, 3), -67);
    EXPECT_EQ(ScaleByRatio(-100, 2, -3), 67);
    EXPECT_EQ(ScaleByRatio(1000000, S64{1} << 60, S64{3} << 60), 333333);
    EXPECT_EQ(ScaleByRatio(3, S64{1} << 60, 1), kS32Max);
    EXPECT_EQ(ScaleByRatio(-3, S64{1} << 40, 7), kS32Min);
    EXPECT_EQ(ScaleByRatio(3, 4, 0), 0);
}

TEST(Tables, EntriesAreTheNearestWholeNumbers)
{
    // T is nearest to r when (2T - 1)^2 <= (2r)^2 <= (2T + 1)^2, all in whole numbers.
    for (U64 i = 0; i <= 64; i++) {
        const U64 square = (4096 + i * i) << 30;
        const U64 t = kLengthTable[i];
        EXPECT_LE((2 * t - 1) * (2 * t - 1), square) << i;
        EXPECT_GE((2 * t + 1) * (2 * t + 1), square) << i;
    }
    EXPECT_EQ(kLengthTable[65], kLengthTable[64]);
    for (int i = 0; i < 512; i++)
        EXPECT_NEAR(kSineTable[i], std::sin(i * kPi / 720) * 2147483648.0, 0.5001) << i;
}

TEST(Trig, SineClimbsAQuarterOfTheWayBetweenTableEntries)
{
    // From a 40-digit sine at the two neighbouring quarter degrees.
    const struct {
        S32 angle, want;
    } rows[] = {
        {90 * kDegree, 65536}, {-90 * kDegree, -65536}, {180 * kDegree, 0}, {30 * kDegree, 32768},
        {1972633, 32793},      {2942566, 46169},        {5891686, 65535},   {6553, 29},
        {-4921753, -63310},    {131072000, -22415},     {6887833, 63239}};
    for (const auto& row : rows)
        EXPECT_EQ(_FPSin(row.angle, 16, 16), row.want) << row.angle;
}

TEST(Trig, SineAndCosineStayCloseAndSymmetricAllAround)
{
    for (S32 angle = -800 * kDegree; angle < 800 * kDegree; angle += 12345) {
        const double radians = angle / 65536.0 * kPi / 180;
        ASSERT_NEAR(_FPSin(angle, 16, 16), std::sin(radians) * 65536, 217) << angle;
        ASSERT_NEAR(_FPCos(angle, 16, 16), std::cos(radians) * 65536, 217) << angle;
        ASSERT_EQ(_FPSin(angle, 16, 16), -_FPSin(-angle, 16, 16)) << angle;
        ASSERT_EQ(_FPCos(angle, 16, 16), _FPCos(-angle, 16, 16)) << angle;
    }
    for (int angle = 0; angle < 1440; angle++) { // exact at the table's entries
        ASSERT_EQ(_FPSin(angle, 2, 16), std::lround(std::sin(angle * kPi / 720) * 65536)) << angle;
        ASSERT_EQ(_FPCos(angle, 2, 16), std::lround(std::cos(angle * kPi / 720) * 65536)) << angle;
    }
}

TEST(Trig, TakesEveryAngleAndBitCount)
{
    for (S32 angle : {kS32Min, kS32Max, 0, 45, -1})
        for (int bits : {-5, 0, 1, 2, 22, 30, 40}) {
            EXPECT_LE(Magnitude(_FPSin(angle, bits, bits)), 1u << 30);
            EXPECT_LE(Magnitude(_FPCos(angle, bits, 16)), 0x10000u);
            _FPATan(angle, bits, bits);
            _FPATan2(angle, kS32Min, bits, 16);
        }
    EXPECT_EQ(_FPSin(kS32Min, 0, 16), _FPSin(-128, 0, 16)); // -2^31 is -128 of a full circle
    EXPECT_EQ(_FPSin(90, 0, 30), 1 << 30);
}

TEST(Trig, ArcTangentIsGoodToAThousandthDegree)
{
    EXPECT_EQ(_FPATan(0x10000, 16, 16), 45 * kDegree);
    EXPECT_EQ(_FPATan(0, 16, 16), 0);
    for (S32 x = 0; x < 0x60000; x += 371) {
        const double degrees = std::atan(x / 65536.0) * 180 / kPi;
        ASSERT_NEAR(_FPATan(x, 16, 16) / 65536.0, degrees, 0.0012) << x;
        ASSERT_EQ(_FPATan(-x, 16, 16), -_FPATan(x, 16, 16)) << x;
        ASSERT_NEAR(_FPATan(x * 512, 25, 16), _FPATan(x, 16, 16), 64) << x;
    }
}

TEST(Trig, DirectionsOfVectors)
{
    const struct {
        S32 y, x, degrees;
    } rows[] = {{0, 1, 0},         {1, 1, 45},
                {1, 0, 90},        {1, -1, 135},
                {0, -1, 180},      {-1, 0, -90},
                {-1, -1, -135},    {-1, 1, -45},
                {0, 0, 90},        {0x10000, 1, 90},
                {-5, -5, -135},    {0, kS32Min, 180},
                {kS32Min, 1, -90}, {kS32Min, kS32Min, -135}};
    for (const auto& row : rows)
        EXPECT_NEAR(_FPATan2(row.y, row.x, 16, 16), row.degrees * kDegree, 120)
            << row.y << " " << row.x;
    EXPECT_EQ(_FPATan2(0, -1, 16, 16), 180 * kDegree);
    EXPECT_EQ(FixedTan(45 * kDegree), 0x10000);
    EXPECT_EQ(FixedTan(90 * kDegree), 0);
}
