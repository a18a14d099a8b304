// Points and vectors on integer coordinates (twips in movie space, device units after the camera).
// Results go to an out-parameter, which may be one of the inputs. Differences are formed in 64 bits
// where a 32-bit one could wrap.
#pragma once

#include "core/geom/fixed.h"

struct SPOINT {
    S32 x;
    S32 y;

    bool operator==(const SPOINT&) const = default;
};

// Length of (dx, dy) by the interpolated table, in coordinate units: within 1 part in 30,000 of the
// true length, never more than one unit below it besides, and saturated at kS32Max. For |dx|, |dy|
// below 2^45.
S32 VectorLength(S64 dx, S64 dy);
// The same, not saturated.
U64 VectorLengthWide(S64 dx, S64 dy);

// Both coordinates within tol of each other.
inline bool PointEqual(const SPOINT* p1, const SPOINT* p2, S32 tol)
{
    return WithinTolerance(p1->x, p2->x, tol) && WithinTolerance(p1->y, p2->y, tol);
}

// v1 + (v2 - v1) * t, t in 16.16, the product rounded down: t = 0 gives v1.
inline S32 FixedInterpolate(S32 v1, S32 v2, S32 t)
{
    return static_cast<S32>(v1 + (((static_cast<S64>(v2) - v1) * t) >> 16));
}

// p2 + (p1 - p2) * t, t in 16.16: the weight t belongs to the first point.
inline void PointAverage(const SPOINT* p1, const SPOINT* p2, S32 t, SPOINT* dst)
{
    *dst = {FixedInterpolate(p2->x, p1->x, t), FixedInterpolate(p2->y, p1->y, t)};
}

// Both coordinates shifted: left when n >= 0, right with rounding when n < 0.
inline void PointShift(const SPOINT* p, int n, SPOINT* dst)
{
    *dst = {ShiftRounded(p->x, n), ShiftRounded(p->y, n)};
}

// Both coordinates times s (16.16).
inline void PointScale(const SPOINT* p, S32 s, SPOINT* dst)
{
    *dst = {FixedMul(p->x, s), FixedMul(p->y, s)};
}

// Table length of the vector; distance of two points.
S32 PointLength(const SPOINT* p);
S32 PointDistance(const SPOINT* p1, const SPOINT* p2);

// A quick estimate of the length: the sum of the magnitudes less half the smaller one.
S32 PointFastLength(const SPOINT* p);
// Half the larger of the two differences. Not the estimate of PointFastLength: callers rely on it.
S32 PointFastDistance(const SPOINT* p1, const SPOINT* p2);

// Scales the vector to the length len; a vector shorter than 1 stays as it is.
void PointNormalize(SPOINT* p, S32 len);

// The point at distance r and angle (16.16 degrees), seen from origin (null: from (0, 0)).
void PointPolar(S32 r, S32 angle, const SPOINT* origin, SPOINT* dst);
// The angle of p seen from origin (null: from (0, 0)), 16.16 degrees, -180 to 180.
S32 PointAngle(const SPOINT* p, const SPOINT* origin);

// The point of the segment a-b nearest to p, and the foot of the perpendicular from p on the
// endless line through a and b, both rounded to nearest. A segment without length gives a.
void PointNearestLine(const SPOINT* p, const SPOINT* a, const SPOINT* b, SPOINT* dst);
void PointPerpNearestLine(const SPOINT* p, const SPOINT* a, const SPOINT* b, SPOINT* dst);
