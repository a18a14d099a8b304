#include "core/geom/rect.h"

namespace {
S32 Min(S32 a, S32 b)
{
    return a < b ? a : b;
}

S32 Max(S32 a, S32 b)
{
    return a > b ? a : b;
}

// Distance between two ranges on one axis, 0 when they touch.
U32 Gap(S32 min1, S32 max1, S32 min2, S32 max2)
{
    if (min2 > max1)
        return static_cast<U32>(min2) - static_cast<U32>(max1);
    if (min1 > max2)
        return static_cast<U32>(min1) - static_cast<U32>(max2);
    return 0;
}
} // namespace

void RectSet(S32 x1, S32 y1, S32 x2, S32 y2, SRECT* r)
{
    *r = {Min(x1, x2), Max(x1, x2), Min(y1, y2), Max(y1, y2)};
}

void RectSetPoint(const SPOINT* p, SRECT* r)
{
    *r = {p->x, p->x, p->y, p->y};
}

void RectSetPoint2(const SPOINT* p1, const SPOINT* p2, SRECT* r)
{
    RectSet(p1->x, p1->y, p2->x, p2->y, r);
}

void RectSetHuge(SRECT* r)
{
    *r = {-0x400000, 0x3FFFFF, -0x400000, 0x3FFFFF};
}

void RectValidate(SRECT* r)
{
    if (r->xmin > r->xmax || r->ymin > r->ymax)
        RectSetEmpty(r);
}

void RectOffset(S32 dx, S32 dy, SRECT* r)
{
    if (!RectIsEmpty(r))
        *r = {r->xmin + dx, r->xmax + dx, r->ymin + dy, r->ymax + dy};
}

void RectInset(S32 d, SRECT* r)
{
    if (RectIsEmpty(r))
        return;
    *r = {r->xmin + d, r->xmax - d, r->ymin + d, r->ymax - d};
    RectValidate(r);
}

void RectShift(const SRECT* r, int n, SRECT* dst)
{
    if (RectIsEmpty(r))
        *dst = *r;
    else
        *dst = {ShiftRounded(r->xmin, n), ShiftRounded(r->xmax, n), ShiftRounded(r->ymin, n),
                ShiftRounded(r->ymax, n)};
}

void RectCenter(const SRECT* r, SPOINT* p)
{
    if (RectIsEmpty(r)) {
        *p = {0, 0};
        return;
    }
    const S64 width = static_cast<S64>(r->xmax) - r->xmin;
    const S64 height = static_cast<S64>(r->ymax) - r->ymin;
    *p = {static_cast<S32>(r->xmin + width / 2), static_cast<S32>(r->ymin + height / 2)};
}

void RectSizePoint(const SRECT* r, SPOINT* p)
{
    *p = {r->xmax - r->xmin, r->ymax - r->ymin};
}

S32 RectSize(const SRECT* r)
{
    SPOINT size;
    RectSizePoint(r, &size);
    return PointLength(&size);
}

void RectIntersect(const SRECT* a, const SRECT* b, SRECT* dst)
{
    if (RectIsEmpty(a) || RectIsEmpty(b)) {
        RectSetEmpty(dst);
        return;
    }
    *dst = {Max(a->xmin, b->xmin), Min(a->xmax, b->xmax), Max(a->ymin, b->ymin),
            Min(a->ymax, b->ymax)};
    RectValidate(dst);
}

void RectUnion(const SRECT* a, const SRECT* b, SRECT* dst)
{
    if (RectIsEmpty(a))
        *dst = *b;
    else if (RectIsEmpty(b))
        *dst = *a;
    else
        *dst = {Min(a->xmin, b->xmin), Max(a->xmax, b->xmax), Min(a->ymin, b->ymin),
                Max(a->ymax, b->ymax)};
}

bool RectEqual(const SRECT* a, const SRECT* b, S32 tol)
{
    if (RectIsEmpty(a) || RectIsEmpty(b))
        return RectIsEmpty(a) && RectIsEmpty(b);
    return IsWithin(a->xmin, b->xmin, tol) && IsWithin(a->xmax, b->xmax, tol) &&
           IsWithin(a->ymin, b->ymin, tol) && IsWithin(a->ymax, b->ymax, tol);
}

void RectGetPoint(const SRECT* r, int i, SPOINT* p)
{
    const S32 mx = MiddleOf(r->xmin, r->xmax);
    const S32 my = MiddleOf(r->ymin, r->ymax);
    const SPOINT handles[] = {{r->xmin, r->ymax}, {r->xmax, r->ymax}, {r->xmax, r->ymin},
                              {r->xmin, r->ymin}, {mx, r->ymax},      {r->xmax, my},
                              {mx, r->ymin},      {r->xmin, my},      {mx, my}};
    *p = handles[i >= 0 && i < 8 ? i : 8];
}

int RectOppositePoint(int i)
{
    // The handle across differs in the second lowest bit, for corners and sides alike.
    return i >= 0 && i < 8 ? i ^ 2 : 8;
}

S32 RectNearDistance(const SRECT* r, const SPOINT* p)
{
    return VectorLength(Gap(r->xmin, r->xmax, p->x, p->x), Gap(r->ymin, r->ymax, p->y, p->y));
}

S32 RectDistance(const SRECT* a, const SRECT* b)
{
    return VectorLength(Gap(a->xmin, a->xmax, b->xmin, b->xmax),
                        Gap(a->ymin, a->ymax, b->ymin, b->ymax));
}

void Interpolate(const SRECT* r0, const SRECT* r1, S32 t, SRECT* dst)
{
    *dst = {FixedLerp(r0->xmin, r1->xmin, t), FixedLerp(r0->xmax, r1->xmax, t),
            FixedLerp(r0->ymin, r1->ymin, t), FixedLerp(r0->ymax, r1->ymax, t)};
}
