// Trigonometry on fixed-point degrees, by tables and integer polynomials: the same result on every
// machine. inBits and outBits are the fraction bits of the argument and of the result.
#pragma once

#include "core/geom/fixed.h"

// 90, 180 and 360 degrees in 16.16.
constexpr S32 kAngle90 = 0x5A0000;
constexpr S32 kAngle180 = 0xB40000;
constexpr S32 kAngle360 = 0x1680000;

// Sine and cosine, exact at the multiples of a quarter degree. 0 <= inBits, outBits <= 30.
S32 _FPSin(S32 angle, int inBits, int outBits);
S32 _FPCos(S32 angle, int inBits, int outBits);

// Arc tangent in degrees, -90 to 90, within 0.001 degrees. 0 <= inBits <= 30, 0 <= outBits <= 23.
S32 _FPATan(S32 x, int inBits, int outBits);
// The direction of (x, y), -180 to 180; 90 for (0, 0).
S32 _FPATan2(S32 y, S32 x, int inBits, int outBits);

// Tangent in 16.16 of an angle in 16.16 degrees; 0 where the cosine is 0.
S32 FixedTan(S32 angle);
