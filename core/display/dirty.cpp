// Dirty rectangles: which parts of the device area are to be repainted.
#include <algorithm>

#include "core/display/display_list.h"

namespace {
S32 Cut(S64 v)
{
    return static_cast<S32>(std::clamp<S64>(v, -kS32Max, kS32Max));
}

// `r` moved outward by d on every side. The least number stays unused, for it would mean an empty
// rectangle.
SRECT Grown(const SRECT* r, S32 d)
{
    return {Cut(S64{r->xmin} - d), Cut(S64{r->xmax} + d), Cut(S64{r->ymin} - d),
            Cut(S64{r->ymax} + d)};
}

S32 UnionArea(const SRECT* a, const SRECT* b)
{
    SRECT both;
    RectUnion(a, b, &both);
    return RectArea(&both);
}
} // namespace

bool RectTestOverlap(const SRECT* a, const SRECT* b)
{
    return a->xmin < b->xmax && b->xmin < a->xmax && a->ymin < b->ymax && b->ymin < a->ymax;
}

S32 RectArea(const SRECT* r)
{
    return (r->xmax - r->xmin) * (r->ymax - r->ymin);
}

// Cuts the union into a top, a middle and a bottom band and joins the middle one to the neighbour
// that wastes less; a tie goes to the bottom. Bands without height are kept as they are.
void DecomposeRect(SRECT* a, SRECT* b)
{
    const SRECT* first = a->ymin < b->ymin ? a : b;
    const SRECT* last = b->ymax > a->ymax ? b : a;
    const SRECT top = {first->xmin, first->xmax, first->ymin, std::max(a->ymin, b->ymin)};
    const SRECT bottom = {last->xmin, last->xmax, std::min(a->ymax, b->ymax), last->ymax};
    const SRECT middle = {std::min(a->xmin, b->xmin), std::max(a->xmax, b->xmax), top.ymax,
                          bottom.ymin};
    const S32 topWaste = UnionArea(&top, &middle) - RectArea(&top);
    const S32 bottomWaste = UnionArea(&middle, &bottom) - RectArea(&bottom);
    if (topWaste >= bottomWaste) {
        *a = top;
        RectUnion(&middle, &bottom, b);
    } else {
        RectUnion(&top, &middle, a);
        *b = bottom;
    }
}

void DisplayList::Grow(const SRECT* r, SRECT* dst) const
{
    *dst = *r;
    if (!RectIsEmpty(r))
        *dst = Grown(r, antialias ? 8 : 2);
}

// The growth of two pixels covers what rounding and thin strokes put outside the bounds, and what
// CalcBitsDirty cuts off.
void DisplayList::InvalidateRect(const SRECT* r)
{
    if (RectIsEmpty(r))
        return;
    SRECT grown;
    Grow(r, &grown);
    if (!RectTestIntersect(&grown, &devViewRect))
        return;
    SRECT* entry = &dirtyList[nDirty];
    RectIntersect(&grown, &devViewRect, entry);
    RectUnion(&devDirtyRgn, entry, &devDirtyRgn);
    dirtyArea[nDirty] = RectArea(entry);
    nDirty++;
    MergeDirtyList(nDirty == kMaxDirty);
}

// Unforced, a pair is merged only when its union is smaller than the two areas together.
bool DisplayList::MergeDirtyList(bool forced)
{
    S32 best = forced ? kS32Max : 0;
    int bestI = -1, bestJ = -1;
    for (int i = 0; i < nDirty; i++) {
        for (int j = i + 1; j < nDirty; j++) {
            const S32 cost = UnionArea(&dirtyList[i], &dirtyList[j]) - dirtyArea[i] - dirtyArea[j];
            if (cost >= best)
                continue;
            best = cost;
            bestI = i;
            bestJ = j;
        }
    }
    if (bestI < 0)
        return false;
    RectUnion(&dirtyList[bestI], &dirtyList[bestJ], &dirtyList[bestI]);
    dirtyArea[bestI] = RectArea(&dirtyList[bestI]);
    nDirty--;
    std::copy(dirtyList + bestJ + 1, dirtyList + nDirty + 1, dirtyList + bestJ);
    std::copy(dirtyArea + bestJ + 1, dirtyArea + nDirty + 1, dirtyArea + bestJ);
    return true;
}

// One pass over the pairs: three rectangles may still overlap afterwards, which costs time only.
void DisplayList::MakeDisjoint()
{
    for (int i = 0; i < nDirty; i++) {
        for (int j = i + 1; j < nDirty; j++) {
            if (RectTestOverlap(&dirtyList[i], &dirtyList[j]))
                DecomposeRect(&dirtyList[i], &dirtyList[j]);
        }
    }
}

void DisplayList::DecomposeDirtyList()
{
    while (MergeDirtyList(false)) {
    }
    MakeDisjoint();
    for (int i = 0; i < nDirty; i++)
        dirtyArea[i] = RectArea(&dirtyList[i]);
}

void DisplayList::CalcBitsDirty(const SRECT* dev, SRECT* pix) const
{
    *pix = *dev;
    if (antialias && !RectIsEmpty(dev))
        *pix = {dev->xmin / 4, dev->xmax / 4, dev->ymin / 4, dev->ymax / 4};
}
