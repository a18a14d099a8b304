#include "core/player/decimal.h"

#include <bit>
#include <cstring>

#include "core/player/big_number.h"

namespace {
// Both directions multiply a number of 64 bits by a power of ten that is known to 64 bits, and keep
// count of how far the product can be off. In the rare case that this leaves two results possible,
// big numbers decide.

// The lowest mantissa bit of a double with the exponent field E counts 2^(E - kExponentBias).
constexpr int kMantissaBits = 52;
constexpr int kExponentBias = 1075;
constexpr int kLowestExponent = -1074;
constexpr U64 kHiddenBit = U64{1} << kMantissaBits;
constexpr U64 kInfinityBits = U64{0x7FF} << kMantissaBits;

// mantissa * 2^exponent with the highest bit of the mantissa set: at most `slack` units of the
// mantissa below the true number, never above it.
struct SScaled {
    U64 mantissa = 0;
    int exponent = 0;
    U32 slack = 0;
};

constexpr SScaled TopBits(const BigNumber& big, int exponent)
{
    const int low = big.Bits() - 64;
    return {big.Extract(low), low + exponent, 0};
}

constexpr int kFinePowers = 26;   // 5^25 is exact in 64 bits
constexpr int kCoarseFirst = -14; // 10^-364
constexpr int kCoarsePowers = 28; // up to 10^338

// 10^n = coarse * fine, n = 26 * i + j.
struct PowerTable {
    SScaled fine[kFinePowers];
    SScaled coarse[kCoarsePowers];

    constexpr PowerTable()
    {
        for (int j = 0; j < kFinePowers; j++) {
            BigNumber five(1);
            five.MultiplyByPowerOfFive(j);
            fine[j] = TopBits(five, j);
        }
        for (int i = 0; i < kCoarsePowers; i++)
            coarse[i] = Coarse((kCoarseFirst + i) * kFinePowers);
    }

private:
    static constexpr SScaled Coarse(int n)
    {
        constexpr int kRoom = 960; // leaves more than 64 bits after dividing by 5^364
        BigNumber big(1);
        if (n >= 0) {
            big.MultiplyByPowerOfFive(n);
            return TopBits(big, n);
        }
        big.ShiftLeft(kRoom);
        big.DivideByPowerOfFive(-n);
        return TopBits(big, n - kRoom);
    }
};

constexpr PowerTable kPowers;

// The upper 64 bits of the product, the lower ones in *low.
U64 Multiply(U64 a, U64 b, U64* low)
{
    const U64 aHigh = a >> 32, aLow = a & 0xFFFFFFFF;
    const U64 bHigh = b >> 32, bLow = b & 0xFFFFFFFF;
    const U64 lowest = aLow * bLow;
    const U64 cross = aHigh * bLow + (lowest >> 32); // no overflow: below 2^64 - 2^32
    const U64 middle = aLow * bHigh + (cross & 0xFFFFFFFF);
    *low = middle << 32 | (lowest & 0xFFFFFFFF);
    return aHigh * bHigh + (cross >> 32) + (middle >> 32);
}

// 10^n, for n from -364 to 363. A coarse power is below the true one by less than a unit, the
// product's lost bits are less than another, and moving it up by a bit doubles the first: below 3.
SScaled PowerOfTenScaled(int n)
{
    const int index = n - kCoarseFirst * kFinePowers;
    const SScaled& coarse = kPowers.coarse[index / kFinePowers];
    const SScaled& fine = kPowers.fine[index % kFinePowers];
    if (n >= 0 && n < kFinePowers)
        return fine;
    U64 low;
    U64 high = Multiply(coarse.mantissa, fine.mantissa, &low);
    int exponent = coarse.exponent + fine.exponent + 64;
    if (!(high >> 63)) {
        high = high << 1 | low >> 63;
        exponent--;
    }
    return {high, exponent, 3};
}

U64 BitsOf(double value)
{
    U64 bits;
    std::memcpy(&bits, &value, sizeof bits);
    return bits;
}

double FromBits(U64 bits)
{
    double value;
    std::memcpy(&value, &bits, sizeof value);
    return value;
}

// The finite double as a whole number times 2^exponent.
U64 Split(U64 bits, int* exponent)
{
    const int field = static_cast<int>(bits >> kMantissaBits);
    const U64 mantissa = bits & (kHiddenBit - 1);
    *exponent = field ? field - kExponentBias : kLowestExponent;
    return field ? mantissa | kHiddenBit : mantissa;
}

// The bits of the double nearest to m * 2^exponent, for m of more than 60 bits. Bits of doubles
// are in the order of their values, and a carry moves into the exponent field by itself.
U64 RoundToBits(U64 m, int exponent)
{
    const int top = 63 - std::countl_zero(m) + exponent;
    const int unit = top - kMantissaBits > kLowestExponent ? top - kMantissaBits : kLowestExponent;
    const int shift = unit - exponent;
    if (shift > 63)
        return shift == 64 && m > U64{1} << 63;
    const U64 half = U64{1} << (shift - 1);
    const U64 rest = m & (half * 2 - 1);
    U64 whole = m >> shift;
    if (rest > half || (rest == half && (whole & 1)))
        whole++;
    const U64 bits = (static_cast<U64>(unit - kLowestExponent) << kMantissaBits) + whole;
    return bits < kInfinityBits ? bits : kInfinityBits;
}

// The digits of the decimal as one number, *exponent adjusted. No point halfway between doubles has
// as many digits as are taken; of what follows only matters that it is not 0.
BigNumber AllDigits(const SDecimal& decimal, int* exponent)
{
    constexpr int kDecidingDigits = 800;
    BigNumber big(decimal.lead);
    if (!decimal.dropped)
        return big;
    int n = SDecimal::kLeadDigits;
    const char* c = decimal.tail;
    for (; c < decimal.end && n < kDecidingDigits; c++) {
        if (*c == '.')
            continue;
        big.MultiplyAdd(10, static_cast<U32>(*c - '0'));
        n++;
    }
    while (c < decimal.end && (*c == '0' || *c == '.'))
        c++;
    big.MultiplyAdd(10, c < decimal.end);
    *exponent -= n + 1 - SDecimal::kLeadDigits;
    return big;
}

// Whether the decimal is above, on or below the point halfway between the double and the next.
int CompareToMiddle(const SDecimal& decimal, U64 bits)
{
    int ten = static_cast<int>(decimal.exponent);
    BigNumber left = AllDigits(decimal, &ten);
    int two;
    BigNumber right(Split(bits, &two) * 2 + 1);
    if (ten >= 0)
        left.MultiplyByPowerOfFive(ten);
    else
        right.MultiplyByPowerOfFive(-ten);
    const int shift = ten - (two - 1);
    if (shift >= 0)
        left.ShiftLeft(shift);
    else
        right.ShiftLeft(-shift);
    return left.Compare(right);
}

double ScaleDecimal(const SDecimal& decimal)
{
    const SScaled power = PowerOfTenScaled(static_cast<int>(decimal.exponent));
    const int zeros = std::countl_zero(decimal.lead);
    U64 low;
    const U64 high = Multiply(decimal.lead << zeros, power.mantissa, &low);
    const int exponent = power.exponent + 64 - zeros;
    const U64 bits = RoundToBits(high | (low != 0), exponent);
    if (power.slack == 0 && !decimal.dropped)
        return FromBits(bits);
    const U64 slack = power.slack + 2 + (decimal.dropped ? U64{1} << zeros : 0);
    const U64 above = high > ~slack ? ~U64{0} : high + slack;
    if (RoundToBits(above, exponent) == bits)
        return FromBits(bits);
    const int side = CompareToMiddle(decimal, bits);
    return FromBits(bits + (side > 0 || (side == 0 && (bits & 1))));
}

// Powers of ten that are exact as doubles.
constexpr int kExactPowers = 22;
constexpr double kPowersOfTen[kExactPowers + 1] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                                   1e8,  1e9,  1e10, 1e11, 1e12, 1e13, 1e14, 1e15,
                                                   1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22};

// The whole part of m * 2^two * 10^ten * 2: one bit more than the digits, to round by. Below 2^51.
U64 ExactTwice(U64 m, int two, int ten)
{
    const int shift = two + ten + 1;
    BigNumber big(m);
    if (shift > 0)
        big.ShiftLeft(shift);
    if (ten >= 0)
        big.MultiplyByPowerOfFive(ten);
    else
        big.DivideByPowerOfFive(-ten);
    return big.Extract(shift < 0 ? -shift : 0);
}

U64 TwiceDigits(U64 m, int two, int ten)
{
    const SScaled power = PowerOfTenScaled(ten);
    U64 low;
    const U64 high = Multiply(m, power.mantissa, &low);
    const int shift = -(two + power.exponent + 64) - 1;
    const U64 twice = high >> shift;
    if (power.slack == 0 || (high + power.slack + 2) >> shift == twice)
        return twice;
    return ExactTwice(m, two, ten);
}

// The power of ten of a number from 2^two up to below 2^(two + 1), or one too high.
int GuessPowerOfTen(int two)
{
    const double guess = two * 0.301029995663981;
    return static_cast<int>(guess < 0 ? guess - 0.5 : guess + 0.5);
}
} // namespace

double DecimalToDouble(const SDecimal& decimal)
{
    constexpr int kTooLarge = 309;  // 10^309 and above is infinite
    constexpr int kTooSmall = -324; // below 10^-324 is 0
    const S64 e = decimal.exponent;
    if (decimal.lead == 0 || decimal.count + e <= kTooSmall)
        return 0;
    if (decimal.count + e > kTooLarge)
        return FromBits(kInfinityBits);
    if (decimal.lead <= kHiddenBit * 2 && !decimal.dropped && e >= -kExactPowers &&
        e <= kExactPowers) {
        const double lead = static_cast<double>(decimal.lead);
        return e < 0 ? lead / kPowersOfTen[-e] : lead * kPowersOfTen[e];
    }
    return ScaleDecimal(decimal);
}

U64 DoubleToDigits(double value, int* exponent)
{
    int two;
    U64 m = Split(BitsOf(value), &two);
    const int zeros = std::countl_zero(m);
    m <<= zeros;
    two -= zeros;
    int ten = GuessPowerOfTen(two + 63);
    U64 twice = TwiceDigits(m, two, kDigits - 1 - ten);
    if (twice < kDigitsEnd / 10 * 2) {
        ten--;
        twice = TwiceDigits(m, two, kDigits - 1 - ten);
    }
    *exponent = ten;
    return (twice + 1) / 2;
}
