// One scanline: crossings in x order, and the stack of the colours that are on between them.
#include <algorithm>

#include "core/raster/active_edge.h"
#include "core/raster/raster.h"

// What lies below this colour on the stack may show.
static inline bool LetsThrough(const RColor* c)
{
    return c->transparent || c->clipColor;
}

void CRaster::ClearStack()
{
    for (RColor* c = stackTop; c; c = c->nextActive)
        c->visible = 0;
    stackTop = nullptr;
}

// Finds c's link when it is on, or the link where it belongs; paints up to x when a change there
// shows.
RColor** CRaster::FindPlace(RColor* c, S32 x)
{
    RColor** link = &stackTop;
    bool shows = true;
    bool on = c->visible != 0;
    U64 steps = 1;
    while (*link && (on ? *link != c : (*link)->order >= c->order)) {
        shows = shows && LetsThrough(*link);
        link = &(*link)->nextActive;
        ++steps;
    }
    work += steps;
    if (shows)
        PaintSlab(x);
    return link;
}

void CRaster::SwitchOn(RColor* c, S32 x, U8 count)
{
    RColor** link = FindPlace(c, x);
    c->nextActive = *link;
    *link = c;
    c->visible = count;
}

void CRaster::SwitchOff(RColor* c, S32 x)
{
    RColor** link = FindPlace(c, x);
    if (*link)
        *link = c->nextActive;
    c->visible = 0;
}

void CRaster::DoEdgeEvenOddRule(RColor* c, S32 x)
{
    if (c->visible)
        SwitchOff(c, x);
    else
        SwitchOn(c, x, 1);
}

// The winding count lives in eight bits: 256 turns in one direction are none.
void CRaster::DoEdgeWindingRule(RColor* c, S32 x, S8 dir)
{
    if (!c->visible) {
        SwitchOn(c, x, U8(dir));
        return;
    }
    U8 count = U8(c->visible + dir);
    if (count)
        c->visible = count;
    else
        SwitchOff(c, x);
}

// A colour on each side: both switch.
void CRaster::DoEdgeEdgeRule(const RActiveEdge* e)
{
    if (e->color1)
        DoEdgeEvenOddRule(e->color1, e->x);
    if (e->color2)
        DoEdgeEvenOddRule(e->color2, e->x);
}

void CRaster::CrossEdge(const RActiveEdge* e)
{
    if (e->fillRule == kRuleEdge)
        DoEdgeEdgeRule(e);
    else if (e->color1 && e->fillRule == kRuleWinding)
        DoEdgeWindingRule(e->color1, e->x, e->dir);
    else if (e->color1)
        DoEdgeEvenOddRule(e->color1, e->x);
}

void CRaster::PaintActive()
{
    ClearStack();
    paintX = areaDev.xmin;
    RActiveRef* list = active.data();
    size_t n = active.size();
    size_t kept = 0;
    S32 left = kS32Min; // crossing of the edge before, on the next scanline
    work += n;
    for (size_t i = 0; i < n; ++i) {
        RActiveEdge* e = list[i].edge;
        // Once the right border is painted nothing more of this scanline can be seen.
        if (paintX < areaDev.xmax && work < workLimit)
            CrossEdge(e);
        if (e->ymax <= y + 1) {
            activeAlloc.Free(e);
            continue;
        }
        e->Step(y + 1);
        list[kept++] = {e->x, 0, e};
        needsSort = needsSort || e->x < left;
        left = e->x;
    }
    active.Truncate(kept);
    rowLost = rowLost || work >= workLimit;
}

// The colour's masks are all on, to the outermost.
bool CRaster::ClipIsOn(const RColor* c)
{
    for (const RColor* clip = c->clipColor; clip; clip = clip->clipColor) {
        ++work;
        if (!clip->visible)
            return false;
    }
    return true;
}

// Collects the colours that count, top first, down to the first opaque one.
int CRaster::Collect()
{
    int count = 0;
    U64 steps = 1;
    for (RColor* c = stackTop; c && count < kMaxCollected; c = c->nextActive) {
        ++steps;
        if (c->skipped || (c->clipColor && !ClipIsOn(c)))
            continue;
        collected[count++] = c;
        if (!c->transparent)
            break;
    }
    work += steps;
    return count;
}

void CRaster::PaintSlab(S32 x)
{
    S32 x0 = paintX;
    S32 x1 = std::min(x, areaDev.xmax);
    if (x1 <= x0)
        return;
    paintX = x1;
    if (antialias) {
        RecordSpan(x1);
        return;
    }
    int count = Collect();
    if (count)
        DrawCollected(x0, x1, collected, count);
}
