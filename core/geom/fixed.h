// Fixed-point arithmetic. A 16.16 number is a value times 65536 in a signed 32-bit integer.
// Products and quotients are formed in 64 bits and narrowed by wrapping; nothing here saturates or
// traps. Multiplying rounds toward minus infinity (an arithmetic shift), dividing rounds toward
// zero: the two are never interchangeable.
#pragma once

#include "core/geom/types.h"

constexpr S32 kFixedOne = 0x10000;
constexpr S32 kFixedHalf = 0x8000;

// (x * y) >> 16.
inline S32 FixedMul(S32 x, S32 y)
{
    return static_cast<S32>((static_cast<S64>(x) * y) >> 16);
}

// (x << 16) / y; 0 when y is 0.
inline S32 FixedDiv(S32 x, S32 y)
{
    return y == 0 ? 0 : static_cast<S32>(static_cast<S64>(x) * 65536 / y);
}

// a / b toward zero, narrowed to 32 bits; 0 when b is 0. Every operand is safe.
inline S32 DivTrunc(S64 a, S64 b)
{
    if (b == 0)
        return 0;
    if (b == -1) // the one quotient that can overflow 64 bits and trap
        return static_cast<S32>(0 - static_cast<U64>(a));
    return static_cast<S32>(a / b);
}

// The absolute value; the most negative number gives 0x80000000.
inline U32 Magnitude(S32 v)
{
    return v < 0 ? 0u - static_cast<U32>(v) : static_cast<U32>(v);
}
inline U64 Magnitude(S64 v)
{
    return v < 0 ? 0u - static_cast<U64>(v) : static_cast<U64>(v);
}

// True when x and y differ by at most tol; the difference is taken in 64 bits.
inline bool WithinTolerance(S32 x, S32 y, S32 tol)
{
    const S64 d = static_cast<S64>(x) - y;
    return d <= tol && -d <= tol;
}

// v brought into the range of 32 bits.
inline S32 SaturateS32(S64 v)
{
    return static_cast<S32>(v > kS32Max ? kS32Max : v < kS32Min ? kS32Min : v);
}

// v << n for n >= 0, otherwise v >> -n rounded to nearest (halves up). n is limited to +-31.
inline S32 ShiftRounded(S32 v, int n)
{
    if (n >= 0)
        return static_cast<S32>(static_cast<U32>(v) << (n > 31 ? 31 : n));
    const int k = n < -31 ? 31 : -n;
    return static_cast<S32>((static_cast<S64>(v) + (S64{1} << (k - 1))) >> k);
}

// v rounded to the nearest multiple of m, halves away from zero; v itself when m is 0.
inline S32 FixedNearestMultiple(S32 v, S32 m)
{
    if (m == 0)
        return v;
    const S64 half = m / 2;
    return static_cast<S32>((v >= 0 ? v + half : v - half) / m * m);
}

// d * num / den rounded to nearest, for |d| < 2^34 and |den| < 2^62. Exact while |den| < 2^29,
// within one or two units of |d| * 2^-28 beyond. A result outside +-2^62 is cut to that bound; 0
// when den is 0.
S64 ScaleByRatio(S64 d, S64 num, S64 den);
