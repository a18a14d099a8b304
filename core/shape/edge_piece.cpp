#include "core/shape/edge_piece.h"

#include "core/display/display_list.h"

namespace {
constexpr S32 kMaxDepth = 16;
constexpr S32 kMaxRise = 0x100;  // of one curved edge, in scanlines
constexpr S32 kControlSlack = 2; // moving a control point this far beats tiny pieces
constexpr S32 kLineFlatness = 2; // flatter curves are stepped as lines

S32 Clamp16(S32 v)
{
    return v < -0x8000 ? -0x8000 : v > 0x7FFF ? 0x7FFF : v;
}

SPOINT ClampPoint(const SPOINT& p)
{
    return {Clamp16(p.x), Clamp16(p.y)};
}

// Brings the control point between the rows of its anchors when it is no more than kControlSlack
// outside. False when it is farther out: the curve turns and has to be split.
bool SettleControl(CURVE* c)
{
    const bool down = c->anchor1.y <= c->anchor2.y;
    const S32 top = down ? c->anchor1.y : c->anchor2.y;
    const S32 bottom = down ? c->anchor2.y : c->anchor1.y;
    const S64 above = S64(top) - c->control.y;
    const S64 below = S64(c->control.y) - bottom;
    if (above > kControlSlack || below > kControlSlack)
        return false;
    c->control.y = above > 0 ? top : below > 0 ? bottom : c->control.y;
    return true;
}

S64 Rise(const CURVE& c)
{
    const S64 d = S64(c.anchor2.y) - c.anchor1.y;
    return d < 0 ? -d : d;
}

// The stepper takes two steps a row, and the crossing is where the step ends that passes the row.
// Pieces of a circle of an eighth still pass.
bool StepsWide(const CURVE& c)
{
    const S64 limit = Rise(c) * 3 / 2;
    const S64 leg1 = S64{c.control.x} - c.anchor1.x;
    const S64 leg2 = S64{c.anchor2.x} - c.control.x;
    const bool wide = leg1 > limit || -leg1 > limit || leg2 > limit || -leg2 > limit;
    return wide && limit != 0 && CurveFlatness(&c) >= kLineFlatness && PieceFits(c);
}

bool WhollyBeyond(const CURVE& c, S32 reach)
{
    const S32 y1 = c.anchor1.y, y2 = c.control.y, y3 = c.anchor2.y;
    return (y1 > reach && y2 > reach && y3 > reach) || (y1 < -reach && y2 < -reach && y3 < -reach);
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

// All splits work on the curve in its own direction, or the pieces would forget which way they
// wind.
void CEdgeCutter::AddCurve(const CURVE* c)
{
    if (edgesLost)
        return;
    CURVE piece = *c;
    if (piece.isLine) {
        AddPiece(&piece);
        return;
    }
    // None of its pieces would show; a curve that reaches far out could have a great many.
    if (WhollyBeyond(piece, hugeCoords ? kShownReach : kEdgeReach))
        return;
    if (!SettleControl(&piece))
        SplitAtTurn(piece);
    else if (Rise(piece) > kMaxRise || (exact && depth < kMaxDepth && StepsWide(piece)))
        SplitAtMiddle(piece);
    else
        AddPiece(&piece);
}

void CEdgeCutter::SplitAtTurn(const CURVE& c)
{
    const S64 fromControl = S64(c.anchor1.y) - c.control.y;
    const S32 t = DivTrunc(fromControl * 0x10000, fromControl - c.control.y + c.anchor2.y);
    CURVE first, second;
    CurveDivide(&c, t, &first, &second);
    AddHalves(first, second);
}

void CEdgeCutter::SplitAtMiddle(const CURVE& c)
{
    CURVE first, second;
    CurveDivide(&c, &first, &second);
    AddHalves(first, second);
}

// A piece dropped for its depth leaves the counter up on purpose: what follows in this build has
// less room to split, so that a wild outline cannot go on costing time.
void CEdgeCutter::AddHalves(const CURVE& first, const CURVE& second)
{
    if (++depth > kMaxDepth)
        return;
    U32& records = edgeDisplay->recordsLeft;
    records -= records != 0; // whoever reads them stops; not all pieces leave edges to run out of
    AddCurve(&first);
    AddCurve(&second);
    --depth;
}

void CEdgeCutter::AddPiece(CURVE* c)
{
    if (c->anchor1.y == c->anchor2.y)
        return;
    if (hugeCoords || !PieceFits(*c)) {
        const EPieceFate fate = GuardPiece(c, depth < kMaxDepth);
        if (fate == kPieceSplit)
            SplitAtMiddle(*c);
        if (fate != kPieceKeep)
            return;
    }
    REdge* e = PushEdge(edgeDisplay, edgeList, *c);
    if (!e) {
        edgesLost = true;
        return;
    }
    e->fillRule = fillRule;
    e->color1 = color1;
    e->color2 = color2;
}
