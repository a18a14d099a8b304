// Rectangles with inclusive bounds. The empty rectangle is marked by xmin = kRectEmpty alone; every
// function that makes one sets all four fields to the marker. Results may overwrite an input.
#pragma once

#include "core/geom/point.h"

// The two x bounds come before the two y bounds.
struct SRECT {
    S32 xmin;
    S32 xmax;
    S32 ymin;
    S32 ymax;

    bool operator==(const SRECT&) const = default;
};

constexpr S32 kRectEmpty = kS32Min;
constexpr S32 kRectHugeMin = -0x400000;
constexpr S32 kRectHugeMax = 0x3FFFFF;

inline bool RectIsEmpty(const SRECT* r)
{
    return r->xmin == kRectEmpty;
}
inline void RectSetEmpty(SRECT* r)
{
    *r = {kRectEmpty, kRectEmpty, kRectEmpty, kRectEmpty};
}
inline void RectSetHuge(SRECT* r)
{
    *r = {kRectHugeMin, kRectHugeMax, kRectHugeMin, kRectHugeMax};
}

// The rectangle spanned by two corners, sorted.
void RectSet(S32 x1, S32 y1, S32 x2, S32 y2, SRECT* r);
inline void RectSetPoint(const SPOINT* p, SRECT* r)
{
    *r = {p->x, p->x, p->y, p->y};
}
inline void RectSetPoint2(const SPOINT* p1, const SPOINT* p2, SRECT* r)
{
    RectSet(p1->x, p1->y, p2->x, p2->y, r);
}

// Makes a rectangle with reversed bounds empty.
inline void RectValidate(SRECT* r)
{
    if (r->xmin > r->xmax || r->ymin > r->ymax)
        RectSetEmpty(r);
}

// Moves the rectangle; an empty one stays.
void RectOffset(S32 dx, S32 dy, SRECT* r);
// Moves every side inward by d (outward when negative); empty when nothing is left.
void RectInset(S32 d, SRECT* r);
// Every field shifted as by PointShift; an empty rectangle is copied.
void RectShift(const SRECT* r, int n, SRECT* dst);

// The centre, rounded toward (xmin, ymin); (0, 0) when empty.
void RectCenter(const SRECT* r, SPOINT* p);
// Width and height, whether empty or not.
void RectSizePoint(const SRECT* r, SPOINT* p);
// The diagonal (table length).
S32 RectSize(const SRECT* r);

// p inside, the bounds included.
inline bool RectPointIn(const SRECT* r, const SPOINT* p)
{
    return p->x >= r->xmin && p->x <= r->xmax && p->y >= r->ymin && p->y <= r->ymax;
}

// True when the two share a point; touching edges do. An empty rectangle meets nothing (the second
// one through its marker, which lies left of everything).
inline bool RectTestIntersect(const SRECT* a, const SRECT* b)
{
    return !RectIsEmpty(a) && a->xmin <= b->xmax && b->xmin <= a->xmax && a->ymin <= b->ymax &&
           b->ymin <= a->ymax;
}

// What the two have in common; a shared edge is a degenerate rectangle, not an empty one.
inline void RectIntersect(const SRECT* a, const SRECT* b, SRECT* dst)
{
    if (RectIsEmpty(a) || RectIsEmpty(b)) {
        RectSetEmpty(dst);
        return;
    }
    *dst = {a->xmin > b->xmin ? a->xmin : b->xmin, a->xmax < b->xmax ? a->xmax : b->xmax,
            a->ymin > b->ymin ? a->ymin : b->ymin, a->ymax < b->ymax ? a->ymax : b->ymax};
    RectValidate(dst);
}

// The bounds of both; an empty one adds nothing.
void RectUnion(const SRECT* a, const SRECT* b, SRECT* dst);

// Grows r to hold p; an empty r becomes the point.
inline void RectUnionPoint(const SPOINT* p, SRECT* r)
{
    if (RectIsEmpty(r)) {
        RectSetPoint(p, r);
        return;
    }
    if (p->x < r->xmin)
        r->xmin = p->x;
    else if (p->x > r->xmax)
        r->xmax = p->x;
    if (p->y < r->ymin)
        r->ymin = p->y;
    else if (p->y > r->ymax)
        r->ymax = p->y;
}

// Every field within tol; two empty rectangles are equal, an empty and a full one never.
bool RectEqual(const SRECT* a, const SRECT* b, S32 tol);

// The handle points: 0 to 3 the corners from (xmin, ymax) on, turning through (xmax, ymax),
// (xmax, ymin), (xmin, ymin); 4 to 7 the middles of the ymax, xmax, ymin and xmin sides; any other
// index the centre.
void RectGetPoint(const SRECT* r, int i, SPOINT* p);
// The handle across from handle i; 8 (the centre) for anything but 0 to 7.
int RectOppositePoint(int i);

// Distance from p to the rectangle, 0 inside; distance between two rectangles, 0 when they touch.
// Both by the length table; neither looks at emptiness.
S32 RectNearDistance(const SRECT* r, const SPOINT* p);
S32 RectDistance(const SRECT* a, const SRECT* b);

// Every field r0 + (r1 - r0) * t, t in 16.16; neither rectangle's emptiness is looked at.
void Interpolate(const SRECT* r0, const SRECT* r1, S32 t, SRECT* dst);
