// Thin strokes: outlines one unit wide around each segment.
#include "core/shape/stroker.h"

namespace {
constexpr int kMaxLevel = 5; // of halving one curve

// The quarter of the circle that a way leads into.
enum ESector { kRight, kDown, kLeft, kUp };

ESector SectorOf(const SPOINT& from, const SPOINT& to)
{
    const S64 dx = S64{to.x} - from.x;
    const S64 dy = S64{to.y} - from.y;
    if ((dx < 0 ? -dx : dx) >= (dy < 0 ? -dy : dy))
        return dx < 0 ? kLeft : kRight;
    return dy < 0 ? kUp : kDown;
}

// Where the two sides of an outline lie. A way across has one pixel in every column, a way along
// the rows one in every row. What slopes lies half a row lower than its edges, because the raster
// takes their crossings at the top of a row; so only a level way has its pixels below it.
struct SSides {
    SPOINT left, right;
};

SSides SidesOf(ESector sector, bool level)
{
    if (sector == kDown)
        return {{1, 0}, {0, 0}};
    if (sector == kUp)
        return {{0, 0}, {1, 0}};
    const SPOINT upper = {0, level ? 0 : -1};
    const SPOINT lower = {0, level ? 1 : 0};
    return sector == kRight ? SSides{upper, lower} : SSides{lower, upper};
}

SPOINT Moved(const SPOINT& p, const SPOINT& by)
{
    return {Saturate32(S64{p.x} + by.x), Saturate32(S64{p.y} + by.y)};
}

CURVE Moved(const CURVE& c, const SPOINT& by)
{
    return {Moved(c.anchor1, by), Moved(c.control, by), Moved(c.anchor2, by), c.isLine};
}

bool SamePoint(const SPOINT& a, const SPOINT& b)
{
    return a.x == b.x && a.y == b.y;
}
} // namespace

void SStroker::StrokeThinLine(const CURVE* c)
{
    StrokeThinPiece(*c, SectorOf(c->anchor1, c->anchor2));
}

void SStroker::StrokeThinPiece(const CURVE& c, int sector)
{
    const bool level = c.isLine && c.anchor1.y == c.anchor2.y;
    const SSides sides = SidesOf(ESector(sector), level);
    const CURVE left = Moved(c, sides.left);
    CURVE right = Moved(c, sides.right);
    Connect({{}, {}, FinePoint(left.anchor1), FinePoint(right.anchor1), 0});
    last = {{}, {}, FinePoint(left.anchor2), FinePoint(right.anchor2), 0};
    CurveReverse(&right, &right);
    AddCurve(&left);
    AddCurve(&right);
}

void SStroker::StrokeThinCurve(const CURVE* c)
{
    StrokeThinBend(*c, 0);
}

// A curve whose ends lead into one quarter stays in it all the way.
void SStroker::StrokeThinBend(const CURVE& c, int level)
{
    const bool start = SamePoint(c.anchor1, c.control);
    const bool end = SamePoint(c.control, c.anchor2);
    if (start && end)
        return;
    const ESector sector = SectorOf(c.anchor1, start ? c.anchor2 : c.control);
    if (sector == SectorOf(end ? c.anchor1 : c.control, c.anchor2)) {
        StrokeThinPiece(c, sector);
        return;
    }
    CURVE one, two;
    if (level < kMaxLevel) {
        CurveDivide(&c, &one, &two);
        StrokeThinBend(one, level + 1);
        StrokeThinBend(two, level + 1);
    } else if (!SamePoint(c.anchor1, c.anchor2)) {
        CurveSetLine(&c.anchor1, &c.anchor2, &one);
        StrokeThinLine(&one);
    }
}
