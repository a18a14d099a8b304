#include "core/shape/edge_piece.h"

#include "core/display/display_list.h"

namespace {
constexpr S32 kLineFlatness = 2; // flatter curves are stepped as lines

S32 Clamp16(S32 v)
{
    return v < -0x8000 ? -0x8000 : v > 0x7FFF ? 0x7FFF : v;
}

SPOINT ClampPoint(const SPOINT& p)
{
    return {Clamp16(p.x), Clamp16(p.y)};
}
} // namespace

EPieceFate GuardPiece(CURVE* c, bool mayHalve)
{
    SRECT r;
    CurveBounds(c, &r);
    if (r.ymax < -kShownReach || r.ymin > kShownReach)
        return kPieceDrop;
    if (PieceFits(*c))
        return kPieceKeep;
    if (r.xmax < -kShownReach)
        MakeVertLine(c, -kEdgeReach);
    else if (r.xmin > kShownReach)
        MakeVertLine(c, kEdgeReach);
    else if (mayHalve)
        return kPieceSplit;
    // A vertical line loses nothing by this. Any other piece is so steep or so far out that its
    // ends matter more than its course.
    *c = {ClampPoint(c->anchor1), ClampPoint(c->control), ClampPoint(c->anchor2), c->isLine};
    return kPieceKeep;
}

REdge* PushEdge(DisplayList* display, REdge** list, const CURVE& c)
{
    REdge* e = display->NewEdge();
    if (!e)
        return nullptr;
    const bool down = c.anchor1.y <= c.anchor2.y;
    const SPOINT& top = down ? c.anchor1 : c.anchor2;
    const SPOINT& bottom = down ? c.anchor2 : c.anchor1;
    e->anchor1x = S16(top.x);
    e->anchor1y = S16(top.y);
    e->controlx = S16(c.control.x);
    e->controly = S16(c.control.y);
    e->anchor2x = S16(bottom.x);
    e->anchor2y = S16(bottom.y);
    e->isLine = c.isLine || CurveFlatness(&c) < kLineFlatness;
    e->dir = down ? 1 : -1;
    e->next = *list;
    *list = e;
    return e;
}
