#include "core/geom/trig.h"

#include "core/geom/fixed.h"
#include "core/geom/tables.h"

namespace {
constexpr int kTableBits = 31; // fraction bits of the sine table
constexpr int kPolyBits = 25;  // fraction bits of the arc tangent's polynomial

// The arc tangent in degrees over 0 to 1 as a polynomial in Newton's form: nodes and divided
// differences.
constexpr S32 kAtanNode[] = {0,       3355,     16777,    33554,    335544,
                             3355443, 10066329, 16777216, 23488102, 30198988};
constexpr S32 kAtanCoef[] = {0,          1922527331, -384492,   -640841711, 4459892,  381432251,
                             -104783335, -174281885, 172290461, -51671014,  -30088283};

int ClampBits(int bits)
{
    return bits < 0 ? 0 : bits > 30 ? 30 : bits;
}

S64 Degrees(int degrees, int bits)
{
    return static_cast<S64>(degrees) << bits;
}

S64 ReduceToCircle(S32 angle, int bits)
{
    const S64 circle = Degrees(360, bits);
    const S64 rest = angle % circle;
    return rest < 0 ? rest + circle : rest;
}

S64 ShiftUp(S64 v, int bits)
{
    return bits >= 0 ? v * (S64{1} << bits) : v >> -bits;
}

// The sine of 0 to 90 degrees, rounded to outBits.
S32 QuarterSine(S64 angle, int inBits, int outBits)
{
    const S64 i = ShiftUp(angle, 2 - inBits) & 0x1FF;
    const S64 rem = angle - ShiftUp(i, inBits - 2);
    const S64 from = kSineTable[i];
    const S64 step = kSineTable[i + 1] - from;
    // The step is taken over a whole degree although the entries lie a quarter apart; pictures
    // depend on it. Falling steps are subtracted, so that both directions round alike.
    const S64 part = ((step < 0 ? -step : step) * rem) >> inBits;
    const S64 v = step < 0 ? from - part : from + part;
    return static_cast<S32>((v + (S64{1} << (kTableBits - 1 - outBits))) >> (kTableBits - outBits));
}

// The sine of 0 to 180 degrees (below 180).
S32 HalfSine(S64 angle, int inBits, int outBits)
{
    const bool falling = angle > Degrees(90, inBits);
    return QuarterSine(falling ? Degrees(180, inBits) - angle : angle, inBits, outBits);
}

// Degrees with 25 fraction bits for a tangent t of 0 to 1 with 25 fraction bits.
S64 AtanPolynomial(S64 t)
{
    S64 p = kAtanCoef[10];
    for (int i = 9; i >= 0; i--)
        p = (((t - kAtanNode[i]) * p) >> kPolyBits) + kAtanCoef[i];
    return p;
}

S64 RoundPolynomial(S64 p, int outBits)
{
    if (outBits >= kPolyBits)
        return ShiftUp(p, outBits - kPolyBits);
    return (p + (S64{1} << (kPolyBits - 1 - outBits))) >> (kPolyBits - outBits);
}
} // namespace

S32 _FPSin(S32 angle, int inBits, int outBits)
{
    const int in = ClampBits(inBits);
    const int out = ClampBits(outBits);
    const S64 reduced = ReduceToCircle(angle, in);
    const S64 half = Degrees(180, in);
    return reduced >= half ? -HalfSine(reduced - half, in, out) : HalfSine(reduced, in, out);
}

S32 _FPCos(S32 angle, int inBits, int outBits)
{
    const int in = ClampBits(inBits);
    const int out = ClampBits(outBits);
    const S64 reduced = ReduceToCircle(angle, in);
    if (reduced >= Degrees(270, in))
        return HalfSine(reduced - Degrees(270, in), in, out);
    if (reduced >= Degrees(90, in))
        return -HalfSine(reduced - Degrees(90, in), in, out);
    return HalfSine(Degrees(90, in) - reduced, in, out);
}

S32 _FPATan(S32 x, int inBits, int outBits)
{
    const int in = ClampBits(inBits);
    const int out = ClampBits(outBits);
    const S64 magnitude = Abs32(x);
    const bool steep = magnitude > (S64{1} << in);
    const S64 tangent = steep ? (S64{1} << (2 * in)) / magnitude : magnitude;
    const S64 angle = RoundPolynomial(AtanPolynomial(ShiftUp(tangent, kPolyBits - in)), out);
    const S64 result = steep ? Degrees(90, out) - angle : angle;
    return static_cast<S32>(x < 0 ? -result : result);
}

S32 _FPATan2(S32 y, S32 x, int inBits, int outBits)
{
    const int in = ClampBits(inBits);
    const int out = ClampBits(outBits);
    if (x == 0)
        return static_cast<S32>(y < 0 ? -Degrees(90, out) : Degrees(90, out));
    const S64 quotient = ShiftUp(y, in) / x;
    const S64 slope = quotient < -kS32Max ? -kS32Max : quotient > kS32Max ? kS32Max : quotient;
    const S64 angle = _FPATan(static_cast<S32>(slope), in, out);
    if (x > 0)
        return static_cast<S32>(angle);
    return static_cast<S32>(y < 0 ? angle - Degrees(180, out) : angle + Degrees(180, out));
}

S32 FixedTan(S32 angle)
{
    return FixedDiv(_FPSin(angle, 16, 16), _FPCos(angle, 16, 16));
}
