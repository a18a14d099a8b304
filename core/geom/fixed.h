// Arithmetic on 16.16 fixed-point numbers (0x10000 is 1.0). Sums and narrowings wrap at 32 bits;
// nothing here traps or saturates unless it says so.
#pragma once

#include "core/geom/types.h"

// The 64-bit product shifted down by 16: rounds toward minus infinity.
inline S32 FixedMul(S32 x, S32 y)
{
    return static_cast<S32>((static_cast<S64>(x) * y) >> 16);
}

// a / b toward zero, narrowed to 32 bits; 0 when b is 0. |a| stays below 2^63.
inline S32 DivTrunc(S64 a, S64 b)
{
    return b == 0 ? 0 : static_cast<S32>(a / b);
}

// (x << 16) / y toward zero; 0 when y is 0.
inline S32 FixedDiv(S32 x, S32 y)
{
    return DivTrunc(static_cast<S64>(x) * 0x10000, y);
}

// |v| as an unsigned number, right for the most negative value too (0x80000000).
inline U32 Magnitude(S32 v)
{
    return v < 0 ? 0u - static_cast<U32>(v) : static_cast<U32>(v);
}

// |v| as a signed number; the most negative value gives the greatest positive one.
inline S32 Abs32(S32 v)
{
    return v >= 0 ? v : v == kS32Min ? kS32Max : -v;
}

// Narrows to 32 bits, keeping to the ends of the range instead of wrapping.
inline S32 Saturate32(S64 v)
{
    return v > kS32Max ? kS32Max : v < kS32Min ? kS32Min : static_cast<S32>(v);
}

// a + (b - a) * t with t in 16.16, the product rounded down: t = 0 gives a, 0x10000 gives b. The
// difference is taken in 64 bits, so that the result stays between a and b however far apart.
inline S32 FixedLerp(S32 a, S32 b, S32 t)
{
    return static_cast<S32>(a + (((static_cast<S64>(b) - a) * t) >> 16));
}

// (a + b) / 2 rounded down, the sum taken in 64 bits.
inline S32 MiddleOf(S32 a, S32 b)
{
    return static_cast<S32>((static_cast<S64>(a) + b) >> 1);
}

// True when a and b differ by at most tol; the difference does not wrap.
inline bool IsWithin(S32 a, S32 b, S32 tol)
{
    const S64 diff = static_cast<S64>(a) - b;
    return diff <= tol && -diff <= tol;
}

// v rounded to the nearest multiple of m, halves away from zero. v itself when m is 0.
inline S32 FixedNearestMultiple(S32 v, S32 m)
{
    if (m == 0)
        return v;
    const S64 half = m / 2;
    return static_cast<S32>((v >= 0 ? v + half : v - half) / m * m);
}

// x * num / den to the nearest integer, saturated to 32 bits; 0 when den is 0. |x| is at most 2^32,
// |num| and |den| below 2^62; the ratio is used with 29 significant bits or more.
S32 ScaleByRatio(S64 x, S64 num, S64 den);
