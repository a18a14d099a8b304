// The fine grid on which strokes are computed: points, offsets and directions.
#pragma once

#include "core/geom/curve.h"

// A point in 1/256 raster unit, wide enough for any device coordinate and offset.
struct SStrokePoint {
    S64 x;
    S64 y;
};

constexpr int kStrokeBits = 8;
constexpr S64 kStrokeOne = S64{1} << kStrokeBits;

inline SStrokePoint operator+(const SStrokePoint& a, const SStrokePoint& b)
{
    return {a.x + b.x, a.y + b.y};
}

inline SStrokePoint operator-(const SStrokePoint& a, const SStrokePoint& b)
{
    return {a.x - b.x, a.y - b.y};
}

inline bool operator==(const SStrokePoint& a, const SStrokePoint& b)
{
    return a.x == b.x && a.y == b.y;
}

inline SStrokePoint FinePoint(const SPOINT& p)
{
    return {S64{p.x} * kStrokeOne, S64{p.y} * kStrokeOne};
}

inline SStrokePoint FineMiddle(const SStrokePoint& a, const SStrokePoint& b)
{
    return {(a.x + b.x) >> 1, (a.y + b.y) >> 1};
}

// To the raster grid. The quarter besides the half keeps widths: the sides of a stroke around a
// path on the grid lie a and -a off it, and plain rounding would move both in or both out.
inline SPOINT RasterPoint(const SStrokePoint& p)
{
    constexpr S64 kRound = kStrokeOne / 2 + kStrokeOne / 4;
    return {Saturate32((p.x + kRound) >> kStrokeBits), Saturate32((p.y + kRound) >> kStrokeBits)};
}

// The products of vectors below 2^31 in both coordinates.
inline S64 Dot(const SStrokePoint& a, const SStrokePoint& b)
{
    return a.x * b.x + a.y * b.y;
}

// Above 0 when b lies clockwise of a on the screen.
inline S64 Cross(const SStrokePoint& a, const SStrokePoint& b)
{
    return a.x * b.y - a.y * b.x;
}

// v times a 16.16 factor, the same for v and -v.
inline SStrokePoint Scaled(const SStrokePoint& v, S64 factor)
{
    return {v.x * factor / 0x10000, v.y * factor / 0x10000};
}

// The unit vector of v in 16.16 and, unless null, the length of v; (0, 0) and 0 for the zero
// vector. v lies below 2^42.
SStrokePoint UnitVector(const SStrokePoint& v, S64* length);

// One end of a segment of a stroke.
struct SStrokeEnd {
    SStrokePoint at;     // on the path
    SStrokePoint normal; // unit vector to the left of the way, 16.16
    SStrokePoint left;   // where the two sides of the stroke end
    SStrokePoint right;
    S64 length; // of its segment, in 1/256 raster unit
};
