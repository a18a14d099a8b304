// Trigonometry on integers. Angles are degrees with `inBits` fraction bits (0 to 30), results have
// `outBits` fraction bits (0 to 30); counts outside are taken as the nearest bound. Nothing calls
// the mathematics library, so that results are the same everywhere.
#pragma once

#include "core/geom/types.h"

// Any angle is accepted. Exact at the multiples of 90 degrees; between the entries of a table in
// quarter degrees the result climbs only a quarter of the way, an error of at most 0.0033.
S32 _FPSin(S32 angle, int inBits, int outBits);
S32 _FPCos(S32 angle, int inBits, int outBits);

// Degrees from -90 to 90 for a tangent x with inBits fraction bits; good to 0.001 degrees.
S32 _FPATan(S32 x, int inBits, int outBits);

// Direction of the vector (x, y) in degrees, from -180 to 180. (0, 0) gives 90.
S32 _FPATan2(S32 y, S32 x, int inBits, int outBits);

// sin/cos in 16.16 of an angle in 16.16 degrees; 0 where the cosine is 0.
S32 FixedTan(S32 angle);
