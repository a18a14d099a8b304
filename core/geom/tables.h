// Constant tables of the geometry, computed beforehand with exact arithmetic.
#pragma once

#include "core/geom/types.h"

// Sines of i quarter degrees, times 2^31, rounded to nearest.
extern const U32 kSineTable[512];

// sqrt(1 + (i/64)^2) times 2^20, rounded to nearest, for i = 0 to 64; the last entry is repeated so
// that interpolation at i = 64 has a neighbour.
extern const U32 kLengthTable[66];
