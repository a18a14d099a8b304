// Thin strokes: outlines one unit wide around each segment.
#include "core/shape/stroker.h"

namespace {
constexpr int kMaxLevel = 5; // of halving one curve

// Which way a line leads: along the rows, or down or up them and to which side.
enum ESector { kRight, kLeft, kDownRight, kDownLeft, kUpRight, kUpLeft };

ESector SectorOf(const SPOINT& from, const SPOINT& to)
{
    const S64 dx = S64{to.x} - from.x;
    const S64 dy = S64{to.y} - from.y;
    if ((dx < 0 ? -dx : dx) >= (dy < 0 ? -dy : dy))
        return dx < 0 ? kLeft : kRight;
    if (dy > 0)
        return dx < 0 ? kDownLeft : kDownRight;
    return dx > 0 ? kUpRight : kUpLeft;
}

// Where the two sides of an outline lie: a line along the rows has one pixel in every column, any
// other one in every row. Its first and its last pixel are among the four that meet at its end, so
// that the pixels of neighbouring lines touch. The raster takes crossings at the top of a row
// and in the middle of a column, and that is why a slope decides between the pixels on one side of
// the points and on the other.
struct SSides {
    SPOINT left, right;
};

SSides SidesOf(ESector sector, bool level)
{
    const SPOINT upper = {0, level ? 0 : -1};
    const SPOINT lower = {0, level ? 1 : 0};
    switch (sector) {
    case kRight:
        return {upper, lower};
    case kLeft:
        return {lower, upper};
    case kDownRight:
        return {{1, 0}, {0, 0}};
    case kDownLeft:
        return {{0, 0}, {-1, 0}};
    case kUpRight:
        return {{-1, 0}, {0, 0}};
    default:
        return {{0, 0}, {1, 0}};
    }
}

SStrokePoint Moved(const SPOINT& p, const SPOINT& by)
{
    return FinePoint(p) + FinePoint(by);
}
} // namespace

void SStroker::StrokeThinLine(const CURVE* c)
{
    const bool level = c->anchor1.y == c->anchor2.y;
    const SSides sides = SidesOf(SectorOf(c->anchor1, c->anchor2), level);
    const SStrokeEnd start = {
        {}, {}, Moved(c->anchor1, sides.left), Moved(c->anchor1, sides.right), 0};
    Connect(start);
    last = {{}, {}, Moved(c->anchor2, sides.left), Moved(c->anchor2, sides.right), 0};
    AddEdge(start.left, last.left);
    AddEdge(last.right, start.right);
}

void SStroker::StrokeThinCurve(const CURVE* c)
{
    StrokeThinBend({FinePoint(c->anchor1), FinePoint(c->control), FinePoint(c->anchor2), {}, {}},
                   0);
}

// Curves become lines, whose crossings are exact: at this width a step astray would be a gap.
void SStroker::StrokeThinBend(const SBend& b, int level)
{
    if (level < kMaxLevel && !IsNearlyStraight(b) && SpendSplit()) {
        const SStrokePoint p = FineMiddle(b.p1, b.control);
        const SStrokePoint q = FineMiddle(b.control, b.p2);
        const SStrokePoint m = FineMiddle(p, q);
        StrokeThinBend({b.p1, p, m, {}, {}}, level + 1);
        StrokeThinBend({m, q, b.p2, {}, {}}, level + 1);
        return;
    }
    CURVE line;
    const SPOINT from = RasterPoint(b.p1);
    const SPOINT to = RasterPoint(b.p2);
    CurveSetLine(&from, &to, &line);
    if (from.x != to.x || from.y != to.y)
        StrokeThinLine(&line);
}
