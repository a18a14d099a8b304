// Points and vectors in 32-bit coordinates (twips, or device units once transformed), and the
// functions on them. Results may be written over an input.
#pragma once

#include "core/geom/fixed.h"

struct SPOINT {
    S32 x; // coordinate units
    S32 y; // coordinate units, growing downwards on the screen
};

// True when both coordinates differ by at most tol.
bool PointEqual(const SPOINT* p1, const SPOINT* p2, S32 tol);

// The point between p2 (t = 0) and p1 (t = 0x10000): the weight belongs to the first point.
inline void PointAverage(const SPOINT* p1, const SPOINT* p2, S32 t, SPOINT* dst)
{
    *dst = {FixedLerp(p2->x, p1->x, t), FixedLerp(p2->y, p1->y, t)};
}

// One coordinate shifted by n bits: left when n >= 0, else right with rounding, halves upwards.
S32 ShiftRounded(S32 v, int n);
// Both coordinates by ShiftRounded.
void PointShift(const SPOINT* p, int n, SPOINT* dst);

// Both coordinates times s (16.16), each rounded down.
void PointScale(const SPOINT* p, S32 s, SPOINT* dst);

// Length of a vector whose extents are given as magnitudes: the longer one times an interpolated
// table of sqrt(1 + r*r), good to 0.005%. Lengths beyond 32 bits give the greatest value.
S32 VectorLength(U32 dx, U32 dy);

// VectorLength of the vector p, and of the vector between two points.
S32 PointLength(const SPOINT* p);
S32 PointDistance(const SPOINT* p1, const SPOINT* p2);

// |x| + |y| - min(|x|, |y|) / 2: an estimate of the length, 0 to 12% long.
S32 PointFastLength(const SPOINT* p);

// Half of the larger coordinate difference. Deliberately another formula than PointFastLength's:
// callers rely on this value.
S32 PointFastDistance(const SPOINT* p1, const SPOINT* p2);

// Makes p a vector of length len in the same direction; a vector shorter than 1 stays as it is.
void PointNormalize(SPOINT* p, S32 len);

// The point at distance r from origin (from (0,0) when null) in direction angle, 16.16 degrees.
void PointPolar(S32 r, S32 angle, const SPOINT* origin, SPOINT* dst);

// Direction of p seen from origin (from (0,0) when null): 16.16 degrees from -180 to 180. Two
// coinciding points give 90 degrees.
S32 PointAngle(const SPOINT* p, const SPOINT* origin);

// The point of the segment a-b nearest to p, rounded to whole units.
void PointNearestLine(const SPOINT* p, const SPOINT* a, const SPOINT* b, SPOINT* dst);

// The foot of the perpendicular from p on the endless line through a and b; a when they coincide.
void PointPerpNearestLine(const SPOINT* p, const SPOINT* a, const SPOINT* b, SPOINT* dst);

// How far along the segment a-b its point nearest to p lies, 0 to 0x10000; 0 when a and b coincide.
S32 PointLineParam(const SPOINT* p, const SPOINT* a, const SPOINT* b);
