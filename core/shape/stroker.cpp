// A stroke's path from its beginning to its end, and the sides of thick segments.
#include "core/shape/stroker.h"

#include "core/display/display_list.h"

namespace {
constexpr S32 kThickFrom = 4;
// Offsets of a greater thickness would all leave what an edge can hold.
constexpr S32 kMaxThickness = 0x3FFF;
constexpr S32 kSnapLength = 13;    // quarter pixels
constexpr int kMaxLevel = 5;       // of halving one curve
constexpr S64 kHardlyATurn = 1144; // the sine of 1 degree in 16.16

bool SamePoint(const SPOINT& a, const SPOINT& b)
{
    return a.x == b.x && a.y == b.y;
}

bool StandsStill(const CURVE& c)
{
    return SamePoint(c.anchor1, c.anchor2) && (c.isLine || SamePoint(c.anchor1, c.control));
}

// Lines of one, two and three pixels come to lie on whole pixels.
S32 Snapped(S32 v, S32 thickness)
{
    if (thickness == 4 || thickness == 12)
        return (v & ~3) + 2;
    return thickness == 8 ? (v + 2) & ~3 : v;
}

void SnapLine(CURVE* c, S32 thickness)
{
    const S64 dx = S64{c->anchor2.x} - c->anchor1.x;
    const S64 dy = S64{c->anchor2.y} - c->anchor1.y;
    if (dx == 0 && (dy >= kSnapLength || dy <= -kSnapLength))
        c->anchor1.x = c->anchor2.x = Snapped(c->anchor1.x, thickness);
    else if (dy == 0 && (dx >= kSnapLength || dx <= -kSnapLength))
        c->anchor1.y = c->anchor2.y = Snapped(c->anchor1.y, thickness);
}

SStrokePoint LeftOf(const SStrokePoint& direction)
{
    return {direction.y, -direction.x};
}

SStrokePoint AlongFrom(const SStrokePoint& normal)
{
    return {-normal.y, normal.x};
}

SStrokePoint LeftNormal(const SStrokePoint& from, const SStrokePoint& to)
{
    return LeftOf(UnitVector(to - from, nullptr));
}

S64 LargerExtent(const SStrokePoint& v)
{
    const S64 x = v.x < 0 ? -v.x : v.x;
    const S64 y = v.y < 0 ? -v.y : v.y;
    return x > y ? x : y;
}

SPOINT Between(const SStrokePoint& from, const SStrokePoint& to)
{
    return {Saturate32(to.x - from.x), Saturate32(to.y - from.y)};
}
} // namespace

SStroker::SStroker(DisplayList* display, REdge** list)
    : CEdgeCutter(display, list), antialias(display->raster.Antialias() != 0)
{
    fillRule = kRuleWinding;
    exact = antialias;
}

void SStroker::BeginStroke(S32 width, RColor* color)
{
    const S32 least = antialias ? kThickFrom : 1;
    thickness = width < least ? least : width > kMaxThickness ? kMaxThickness : width;
    thick = thickness >= kThickFrom;
    half = S64{thickness >> 1} * kStrokeOne;
    color1 = color;
    isOpen = true;
    started = hasLast = false;
}

// A curve without extent draws nothing, but a path of nothing else is a dot.
void SStroker::AddStrokeCurve(const CURVE* c)
{
    if (edgesLost)
        return;
    if (!hasLast)
        startPt = c->anchor1;
    hasLast = true;
    lastPt = c->anchor2;
    if (StandsStill(*c))
        return;
    if (thick) {
        CURVE moved = *c;
        if (antialias && c->isLine)
            SnapLine(&moved, thickness);
        StrokeThickCurve(&moved);
    } else if (c->isLine) {
        StrokeThinLine(c);
    } else {
        StrokeThinCurve(c);
    }
}

// Whether a path is closed is asked before snapping, which may have parted its ends.
void SStroker::EndStroke()
{
    if (!isOpen)
        return;
    isOpen = false;
    if (!started) {
        if (hasLast)
            StrokeDot();
    } else if (SamePoint(startPt, lastPt)) {
        Join(last, first);
    } else if (thick) {
        StrokeJoin(last.left, last.right, last.at);
        StrokeJoin(first.right, first.left, first.at);
    } else {
        AddEdge(last.left, last.right);
        AddEdge(first.right, first.left);
    }
}

void SStroker::StrokeDot()
{
    const S64 before = thickness / 2 * kStrokeOne;
    const SStrokePoint p = FinePoint(lastPt) - SStrokePoint{before, before};
    const S64 side = thickness * kStrokeOne;
    if (!thick) {
        AddEdge({p.x, p.y + side}, p);
        AddEdge({p.x + side, p.y}, {p.x + side, p.y + side});
        return;
    }
    const SStrokePoint centre = {p.x + side / 2, p.y + side / 2};
    const SStrokePoint top = {centre.x, p.y};
    const SStrokePoint bottom = {centre.x, p.y + side};
    StrokeJoin(top, bottom, centre);
    StrokeJoin(bottom, top, centre);
}

void SStroker::AddEdge(const SStrokePoint& from, const SStrokePoint& to)
{
    CURVE line;
    const SPOINT a = RasterPoint(from);
    const SPOINT b = RasterPoint(to);
    if (a.y == b.y)
        return;
    CurveSetLine(&a, &b, &line);
    AddCurve(&line);
}

SStrokeEnd SStroker::EndAt(const SStrokePoint& at, const SStrokePoint& normal, S64 length) const
{
    const SStrokePoint offset = Scaled(normal, half);
    return {at, normal, at + offset, at - offset, length};
}

// Begins a segment: where the last one ended, if there is one.
void SStroker::Connect(const SStrokeEnd& start)
{
    if (started)
        Join(last, start);
    else
        first = start;
    started = true;
}

// The straight edge that cuts across the inside of a turn counts the triangle behind it
// backwards. Both segments cover the triangle, unless one is too short: then a hole could show, and
// the edge goes through the centre instead.
void SStroker::Join(const SStrokeEnd& from, const SStrokeEnd& to)
{
    if (from.left == to.left && from.right == to.right)
        return;
    if (!thick) {
        AddEdge(from.left, to.left);
        AddEdge(to.right, from.right);
        return;
    }
    const S64 turn = Cross(from.normal, to.normal) / 0x10000;
    const S64 shorter = from.length < to.length ? from.length : to.length;
    const bool tight = shorter < half + half / 4;
    if (tight && turn < -kHardlyATurn) {
        AddEdge(from.left, to.at);
        AddEdge(to.at, to.left);
    } else {
        StrokeJoin(from.left, to.left, to.at);
    }
    if (tight && turn > kHardlyATurn) {
        AddEdge(to.right, to.at);
        AddEdge(to.at, from.right);
    } else {
        StrokeJoin(to.right, from.right, to.at);
    }
}

void SStroker::StrokeThickCurve(const CURVE* c)
{
    const SStrokePoint p1 = FinePoint(c->anchor1);
    const SStrokePoint p2 = FinePoint(c->anchor2);
    if (c->isLine) {
        StrokeChord(p1, p2);
        return;
    }
    const SStrokePoint control = FinePoint(c->control);
    StrokeBend({p1, control, p2, LeftNormal(p1, control == p1 ? p2 : control),
                LeftNormal(control == p2 ? p1 : control, p2)},
               0);
}

void SStroker::StrokeBend(const SBend& b, int level)
{
    const EBendFate fate = Judge(b);
    if (fate == kBendKeep)
        StrokeSides(b);
    else if (fate == kBendChord || level == kMaxLevel || !SpendSplit())
        StrokeChord(b.p1, b.p2);
    else
        SplitBend(b, level + 1);
}

// The middle of the curve lies less than about 3/8 unit off the middle of its chord.
bool SStroker::IsNearlyStraight(const SBend& b)
{
    const SStrokePoint bend = b.p1 - b.control + b.p2 - b.control;
    return LargerExtent(bend) <= 4 * kStrokeOne * 3 / 8;
}

void SStroker::StrokeChord(const SStrokePoint& p1, const SStrokePoint& p2)
{
    S64 length;
    const SStrokePoint normal = LeftOf(UnitVector(p2 - p1, &length));
    if (length == 0)
        return;
    const SStrokeEnd start = EndAt(p1, normal, length);
    Connect(start);
    last = EndAt(p2, normal, length);
    AddEdge(start.left, last.left);
    AddEdge(last.right, start.right);
}

bool SStroker::SpendSplit()
{
    U32& left = edgeDisplay->recordsLeft;
    const bool more = left != 0;
    left -= more;
    return more;
}

// Both halves share the normal at the middle, where the way is that of the curve's inner legs.
// Where it turns back on the spot there is none.
void SStroker::SplitBend(const SBend& b, int level)
{
    const SStrokePoint p = FineMiddle(b.p1, b.control);
    const SStrokePoint q = FineMiddle(b.control, b.p2);
    const SStrokePoint m = FineMiddle(p, q);
    const bool turnsBack = p == q;
    const SStrokePoint normal = LeftNormal(p, q);
    StrokeBend({b.p1, p, m, b.n1, turnsBack ? b.n1 : normal}, level);
    StrokeBend({m, q, b.p2, turnsBack ? b.n2 : normal, b.n2}, level);
}

// With t the squared tangent of half the turn, `half` the offset, and legs from the anchors to the
// control point. A curve is kept when it turns by less than a right angle; when its inner side does
// not come near to folding over, where it would run backwards: half * sqrt(t) is by how much its
// legs get shorter; and when its sides, moved as one piece each, are off by no more than a quarter
// unit. That error was measured as about half * t * (a * a + t / 8), where a is how unlike the legs
// are, from 0 to 1. What turns or folds but is nearly straight is stroked as a line.
SStroker::EBendFate SStroker::Judge(const SBend& b) const
{
    constexpr S64 kOne = 0x10000;
    const EBendFate fallback = IsNearlyStraight(b) ? kBendChord : kBendSplit;
    const S64 cosine = Dot(b.n1, b.n2) / kOne;
    const S64 leg1 = Dot(b.control - b.p1, AlongFrom(b.n1)) / kOne;
    const S64 leg2 = Dot(b.p2 - b.control, AlongFrom(b.n2)) / kOne;
    if (cosine <= 0 || leg1 < 0 || leg2 < 0 || leg1 + leg2 == 0)
        return fallback;
    const S64 t = cosine < kOne ? (kOne - cosine) * kOne / (kOne + cosine) : 0;
    const S64 shorter = Saturate32(leg1 < leg2 ? leg1 : leg2);
    if (half * half / kOne * t * 4 > shorter * shorter)
        return fallback;
    const S64 unlike = (leg1 - leg2) * kOne / (leg1 + leg2);
    const S64 error = t * (unlike * unlike / kOne + t / 8) / kOne;
    return half * error / kOne > kStrokeOne / 4 ? kBendSplit : kBendKeep;
}

void SStroker::StrokeSides(const SBend& b)
{
    // That of the inner side, at the least.
    const S64 length = LargerExtent(b.p2 - b.p1) / 2;
    const SStrokeEnd start = EndAt(b.p1, b.n1, length);
    Connect(start);
    last = EndAt(b.p2, b.n2, length);
    const CURVE left = MovedSide(b, start.left, last.left);
    CURVE right = MovedSide(b, start.right, last.right);
    CurveReverse(&right, &right);
    AddCurve(&left);
    AddCurve(&right);
}

// The curve between two offset points, in the directions of its ends. It is moved in coordinates
// from its first anchor, so that those on the fine grid stay within 32 bits.
CURVE SStroker::MovedSide(const SBend& b, const SStrokePoint& from, const SStrokePoint& to)
{
    const CURVE curve = {{0, 0}, Between(b.p1, b.control), Between(b.p1, b.p2), 0};
    const SPOINT offset1 = Between(b.p1, from);
    const SPOINT offset2 = Between(b.p1, to);
    CURVE moved;
    CurveAdjust(&curve, &offset1, &offset2, &moved);
    const SStrokePoint control = {b.p1.x + moved.control.x, b.p1.y + moved.control.y};
    return {RasterPoint(from), RasterPoint(control), RasterPoint(to), 0};
}
