// Rectangles with inclusive bounds. Both x bounds come first. A rectangle is empty when its xmin is
// kRectEmpty, whatever the other fields hold; functions that make an empty rectangle set all four.
// Results may be written over an input.
#pragma once

#include "core/geom/point.h"

struct SRECT {
    S32 xmin; // coordinate units; kRectEmpty marks an empty rectangle
    S32 xmax;
    S32 ymin;
    S32 ymax;
};

constexpr S32 kRectEmpty = kS32Min;

inline bool RectIsEmpty(const SRECT* r)
{
    return r->xmin == kRectEmpty;
}

inline void RectSetEmpty(SRECT* r)
{
    *r = {kRectEmpty, kRectEmpty, kRectEmpty, kRectEmpty};
}

// From two corners in any order.
void RectSet(S32 x1, S32 y1, S32 x2, S32 y2, SRECT* r);
void RectSetPoint(const SPOINT* p, SRECT* r);
void RectSetPoint2(const SPOINT* p1, const SPOINT* p2, SRECT* r);

// The rectangle that stands for "everything": -0x400000 to 0x3FFFFF on both axes.
void RectSetHuge(SRECT* r);

// Makes r empty when its bounds are in the wrong order.
void RectValidate(SRECT* r);

// These two leave an empty rectangle as it is. A negative d grows.
void RectOffset(S32 dx, S32 dy, SRECT* r);
void RectInset(S32 d, SRECT* r);

// Every bound by ShiftRounded; an empty rectangle is copied.
void RectShift(const SRECT* r, int n, SRECT* dst);

// min + (max - min) / 2, the division toward zero; (0,0) for an empty rectangle.
void RectCenter(const SRECT* r, SPOINT* p);
// Width and height as a vector; emptiness is not looked at.
void RectSizePoint(const SRECT* r, SPOINT* p);
// Length of the diagonal.
S32 RectSize(const SRECT* r);

inline bool RectPointIn(const SRECT* r, const SPOINT* p)
{
    return r->xmin <= p->x && p->x <= r->xmax && r->ymin <= p->y && p->y <= r->ymax;
}

// Touching edges intersect. An empty b needs no test of its own: its bounds lie below everything.
inline bool RectTestIntersect(const SRECT* a, const SRECT* b)
{
    return !RectIsEmpty(a) && a->xmin <= b->xmax && b->xmin <= a->xmax && a->ymin <= b->ymax &&
           b->ymin <= a->ymax;
}

// The common part, which may be a degenerate rectangle (a shared edge); empty when there is none.
void RectIntersect(const SRECT* a, const SRECT* b, SRECT* dst);

// The smallest rectangle around both; an empty one adds nothing.
void RectUnion(const SRECT* a, const SRECT* b, SRECT* dst);

// Grows r to hold p; an empty r becomes the one-point rectangle.
inline void RectUnionPoint(const SPOINT* p, SRECT* r)
{
    if (RectIsEmpty(r)) {
        *r = {p->x, p->x, p->y, p->y};
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

// Two empty rectangles are equal; otherwise every bound must be within tol.
bool RectEqual(const SRECT* a, const SRECT* b, S32 tol);

// Handle points: 0 to 3 the corners (xmin,ymax) (xmax,ymax) (xmax,ymin) (xmin,ymin), 4 to 7 the
// middles of the sides at ymax, xmax, ymin, xmin; any other index the centre.
void RectGetPoint(const SRECT* r, int i, SPOINT* p);
// The handle across the rectangle; 8 for the centre and for anything else.
int RectOppositePoint(int i);

// Distance from p to the rectangle, 0 inside.
S32 RectNearDistance(const SRECT* r, const SPOINT* p);
// Distance between two rectangles, 0 when they touch or overlap. Neither may be empty.
S32 RectDistance(const SRECT* a, const SRECT* b);

// Every bound from r0 (t = 0) to r1 (t = 0x10000); emptiness is not looked at.
void Interpolate(const SRECT* r0, const SRECT* r1, S32 t, SRECT* dst);
