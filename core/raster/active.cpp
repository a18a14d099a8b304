// Edges entering the active list, their motion, and the order of the list.
#include <algorithm>

#include "core/raster/active_edge.h"
#include "core/raster/raster.h"

void RActiveEdge::SetUpLine(const REdge* e, S32 y)
{
    stepKind = kStepLine;
    dx = ((S64(e->anchor2x) - e->anchor1x) * 65536) / (e->anchor2y - e->anchor1y);
    xl = S64(e->anchor1x) * 65536 + dx * (y - e->anchor1y);
    x = RoundedX();
}

void RActiveEdge::SetUpCurve(const REdge* e, S32 y)
{
    S64 x1 = e->anchor1x, cx = e->controlx, x2 = e->anchor2x;
    S64 y1 = e->anchor1y, cy = e->controly, y2 = e->anchor2y;
    S64 n = 2 * (y2 - y1);
    S64 inv = 0x1000000 / n;
    S64 inv2 = inv * inv >> 24;
    dx = inv * 2 * (cx - x1);
    dy = inv * 2 * (cy - y1);
    d2x = 2 * (x1 - 2 * cx + x2) * inv2;
    d2y = 2 * (y1 - 2 * cy + y2) * inv2;
    stepsLeft = S32(n);
    xl = x1 * 65536;
    yl = y1 * 65536;
    x = S32(x1);
    // Scanline by scanline, so that a curve entered in the middle looks as if painted from its top.
    for (S32 row = S32(y1) + 1; row <= y; ++row)
        Step(row);
}

void RActiveEdge::SetUpVertical(S32 atX)
{
    stepKind = kStepLine;
    dx = 0;
    xl = S64(atX) * 65536;
    x = atX;
}

// How far the stepped curve can stray from the hull of its points, `width` wide: the first
// difference leaves out half a second difference, and both differences are made of truncated
// inverses of the step count, whose error grows with the number of steps.
static S64 StrayBound(const REdge* e, S64 width)
{
    if (e->isLine)
        return 1;
    S64 rise = e->anchor2y - e->anchor1y;
    S64 n = 2 * rise;
    return 2 * width / rise + ((2 * width * (n * n + 4 * n)) >> 24) + ((2 * width * n) >> 24) + 16;
}

void RActiveEdge::SetUp(const REdge* e, S32 y, bool interpolate, S32 xmin, S32 xmax)
{
    ymax = e->anchor2y;
    color1 = e->color1;
    color2 = e->color2;
    fillRule = e->fillRule;
    dir = e->dir;
    S32 low = std::min(e->anchor1x, e->anchor2x);
    S32 high = std::max(e->anchor1x, e->anchor2x);
    if (!e->isLine) {
        low = std::min<S32>(low, e->controlx);
        high = std::max<S32>(high, e->controlx);
    }
    // Most edges reach into the area; only the others are worth a closer look.
    bool outside = high < xmin || low >= xmax;
    S64 stray = outside ? StrayBound(e, S64(high) - low) : 0;
    if (outside && high + stray < xmin) {
        SetUpVertical(xmin);
    } else if (outside && low - stray >= xmax) {
        SetUpVertical(xmax);
    } else if (e->isLine) {
        SetUpLine(e, y);
    } else {
        stepKind = interpolate ? kStepCurveInterpolate : kStepCurve;
        SetUpCurve(e, y);
    }
}

// The step is taken with the old count tested, so a curve takes one step more than it has.
void RActiveEdge::StepCurve(S32 y)
{
    S64 target = S64(y) * 65536;
    while (yl < target && stepsLeft >= 0) {
        yl += dy >> 8;
        dy += d2y;
        xl += dx >> 8;
        dx += d2x;
        --stepsLeft;
    }
    x = RoundedX();
}

void RActiveEdge::StepCurveInterpolate(S32 y)
{
    S64 oldX = xl;
    S64 oldY = yl;
    StepCurve(y);
    if (yl == oldY)
        return;
    S64 target = S64(y) * 65536;
    S64 t = (xl - oldX) * (target - yl) >> 16;
    x = S32((t * 65536 / (yl - oldY) + xl + 0x8000) >> 16);
}

bool CRaster::SetUpActive(const REdge* edge)
{
    RActiveEdge* a = static_cast<RActiveEdge*>(activeAlloc.Alloc());
    if (!a)
        return false;
    a->SetUp(edge, y, !antialias, areaDev.xmin, areaDev.xmax);
    work += 1 + U64(y - std::min<S32>(y, edge->anchor1y)) / 8;
    if (active.Push({a->x, 0, a}))
        return true;
    activeAlloc.Free(a);
    return false;
}

// New edges go behind the old ones; SortActive brings them to their places.
void CRaster::AddActive()
{
    REdge* edge = buckets[y - areaDev.ymin];
    if (!edge)
        return;
    size_t before = active.size();
    while (edge && SetUpActive(edge))
        edge = edge->nextObj;
    // Many at once, as at the top of a repainted rectangle, would make insertion slow.
    if (active.size() - before > 32)
        SortAll();
    needsSort = true;
}

// Stable, with the places as second key, because the library's stable sort would allocate.
void CRaster::SortAll()
{
    for (size_t i = 0; i < active.size(); ++i)
        active[i].place = U32(i);
    std::sort(active.begin(), active.end(), [](const RActiveRef& a, const RActiveRef& b) {
        return a.x != b.x ? a.x < b.x : a.place < b.place;
    });
    work += active.size() * 8;
}

// The list is nearly in order from scanline to scanline: insertion, unless too much has to move.
// Edges with equal x keep their order.
void CRaster::SortActive()
{
    if (!needsSort)
        return;
    needsSort = false;
    size_t n = active.size();
    size_t allowed = 16 * n + 64;
    RActiveRef* list = active.data();
    for (size_t i = 1; i < n; ++i) {
        RActiveRef ref = list[i];
        size_t j = i;
        for (; j > 0 && list[j - 1].x > ref.x; --j)
            list[j] = list[j - 1];
        list[j] = ref;
        work += i - j;
        if (i - j > allowed) {
            SortAll();
            return;
        }
        allowed -= i - j;
    }
}

void CRaster::FreeActive()
{
    for (size_t i = 0; i < active.size(); ++i)
        activeAlloc.Free(active[i].edge);
    active.Clear();
}
