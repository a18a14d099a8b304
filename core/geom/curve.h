// Quadratic Bezier pieces, of which all outlines are made, and the integer operations on them.
// Parameters t are 16.16, 0 at anchor 1 and 0x10000 at anchor 2. Results may be written over an
// input curve. Everything accepts any 32-bit coordinates; intermediate values are held in 64 bits.
#pragma once

#include "core/geom/matrix.h"
#include "core/geom/point.h"
#include "core/geom/rect.h"

struct CURVE {
    SPOINT anchor1; // start
    SPOINT control; // for a straight segment the middle of the anchors
    SPOINT anchor2; // end
    S32 isLine;     // not 0: a straight segment
};

// Forward differencing along a curve. Positions and differences are in 1/16 unit.
struct CURVE_STEPPER {
    S32 count;    // steps left
    S32 t;        // parameter of `point`
    SPOINT point; // where the curve is now, coordinate units
    SPOINT prev;  // where it was one step ago
    S32 dt;       // parameter step, 0x10000 / n
    S64 dx, dy;   // first differences
    S64 ddx, ddy; // second differences
    S64 x, y;     // position
};

inline void PointMiddle(const SPOINT* p, const SPOINT* q, SPOINT* dst)
{
    *dst = {MiddleOf(p->x, q->x), MiddleOf(p->y, q->y)};
}

void CurveSet(const SPOINT* a1, const SPOINT* control, const SPOINT* a2, CURVE* dst);
void CurveSetLine(const SPOINT* a1, const SPOINT* a2, CURVE* dst);

// An estimate of the control point's distance from the middle of the chord, in coordinate units,
// at most kS32Max; 0 for a straight segment.
inline S32 CurveFlatness(const CURVE* c)
{
    if (c->isLine)
        return 0;
    const S64 ex = static_cast<S64>(MiddleOf(c->anchor1.x, c->anchor2.x)) - c->control.x;
    const S64 ey = static_cast<S64>(MiddleOf(c->anchor1.y, c->anchor2.y)) - c->control.y;
    const S64 dx = ex < 0 ? -ex : ex;
    const S64 dy = ey < 0 ? -ey : ey;
    return Saturate32(dx + dy - ((dx < dy ? dx : dy) >> 1));
}

// Splits at t; `first` covers 0 to t. Both halves keep isLine.
void CurveDivide(const CURVE* c, S32 t, CURVE* first, CURVE* second);

// Splits at the middle by halving, which rounds differently from CurveDivide at 0x8000.
inline void CurveDivide(const CURVE* c, CURVE* first, CURVE* second)
{
    const CURVE src = *c;
    SPOINT p, q, m;
    PointMiddle(&src.anchor1, &src.control, &p);
    PointMiddle(&src.control, &src.anchor2, &q);
    PointMiddle(&p, &q, &m);
    *first = {src.anchor1, p, m, src.isLine};
    *second = {m, q, src.anchor2, src.isLine};
}

// Splits at t1 and t2, in either order, into three pieces.
void CurveDivideTwo(const CURVE* c, S32 t1, S32 t2, CURVE* first, CURVE* second, CURVE* third);

inline S32 CurveCalcCoord(S32 a1, S32 c, S32 a2, S32 t)
{
    const S64 from1 = static_cast<S64>(a1) - c;
    const S64 bend = from1 - c + a2;
    if (t == 0x8000)
        return static_cast<S32>((static_cast<S64>(a1) + 2 * static_cast<S64>(c) + a2) / 4);
    const S32 t2 = FixedMul(t, t);
    return static_cast<S32>(a1 - 2 * ((from1 * t) >> 16) + ((bend * t2) >> 16));
}

// The point at t. The exact middle is rounded toward zero, all others down.
inline void CurveCalcPoint(const CURVE* c, S32 t, SPOINT* dst)
{
    const S32 x = CurveCalcCoord(c->anchor1.x, c->control.x, c->anchor2.x, t);
    const S32 y = CurveCalcCoord(c->anchor1.y, c->control.y, c->anchor2.y, t);
    *dst = {x, y};
}

// The box around anchors and control point: it holds the curve but is deliberately not tight.
void CurveBounds(const CURVE* c, SRECT* r);
// The box around the curve itself, rounded outwards to whole units.
void CurveTightBounds(const CURVE* c, SRECT* r);

// Parameter at which one coordinate (anchor, control, anchor) turns, or -1 when none lies inside
// the piece.
S32 CurveCalcExtreme(S32 a1, S32 c, S32 a2);
// The same for x and for y.
void CurveExtrema(const CURVE* c, S32* tx, S32* ty);
// True when the control point lies outside the anchors' range on either axis, that is when the
// piece is not monotonic on both.
bool CurveIsExtreme(const CURVE* c);

// Starts differencing in n steps; with n = 0 there is no step to take. The first difference
// deliberately carries no half of the second: after n steps the position differs from anchor 2 by
// (a1 - 2c + a2) / n.
void CurveInitStepper(const CURVE* c, U16 n, CURVE_STEPPER* s);

// Moves one step on; false when no steps are left.
inline bool CurveStep(CURVE_STEPPER* s)
{
    if (s->count <= 0)
        return false;
    s->count--;
    s->x += s->dx;
    s->y += s->dy;
    s->dx += s->ddx;
    s->dy += s->ddy;
    s->t += s->dt;
    s->prev = s->point;
    s->point = {static_cast<S32>(s->x >> 4), static_cast<S32>(s->y >> 4)};
    return true;
}

void CurveReverse(const CURVE* c, CURVE* dst);
void CurveTransform(const CURVE* c, const MATRIX* m, CURVE* dst);

// Direction of travel at t in 16.16 degrees. Where the curve stands still (a control point on an
// anchor, a cusp) that of the chord.
S32 CurveTangentAngle(const CURVE* c, S32 t);

// Arc length in coordinate units, by 64 chords; good to about 0.02%.
S32 CurveLength(const CURVE* c);
// Parameter of the point `length` along the curve, from 0 to 0x10000.
S32 CurveFindLength(const CURVE* c, S32 length);

// The point of the curve nearest to p, its distance found to within `tolerance` + 2 units (a
// tolerance below 1 counts as 1); returns its parameter.
S32 CurveNearestPoint(const CURVE* c, const SPOINT* p, S32 tolerance, SPOINT* dst);

// How often the curve crosses the horizontal ray from p towards +x: 0, 1 or 2. A crossing counts
// when it lies strictly right of p. A y-monotonic stretch crosses when ymin <= p.y < ymax, so that
// the counts of a closed outline add up whatever vertices lie on the ray; this part is exact for
// all coordinates. Whether a crossing lies left or right of p is exact for straight segments and
// resolved to 1/65536 unit for curves, both within +-2^27 and +-32768 units of p, and more coarsely
// farther away. A tolerance above 0 lets the search end when the rest is that narrow, in units.
int CurveXRaySect(const CURVE* c, const SPOINT* p, U16 tolerance);

// Looks for an intersection of two curves by halving both while their boxes meet, until both boxes
// are at most `tolerance` units wide and high or have been halved `maxDepth` times (0 to 16). Gives
// the parameters on both curves of the intersection found, the first one along c1. False when there
// is none or when 4096 pairs have been tried.
bool CurveBoundsSect(const CURVE* c1, const CURVE* c2, S32 tolerance, S32 maxDepth, S32* t1,
                     S32* t2);

// The curve moved to new anchors: it keeps the directions at both ends, with the control point
// where the end tangents then meet. Where they do not meet ahead of the curve the control point
// moves by the average of the anchors' moves. A straight segment stays one.
void CurveAdjust(const CURVE* c, const SPOINT* a1, const SPOINT* a2, CURVE* dst);

// Parameter, 0 to 0x10000, of the point of a straight curve nearest to p.
S32 CurveLineCalcParam(const CURVE* c, const SPOINT* p);

// Parameter on the whole curve of the parameter t of a piece of it whose middle is t0 and whose
// half width is dt.
inline S32 CurveParamInterpolate(S32 t0, S32 dt, S32 t)
{
    return static_cast<S32>(t0 +
                            ((2 * static_cast<S64>(dt) * (static_cast<S64>(t) - 0x8000)) >> 16));
}

// Makes c the vertical straight segment at x between its anchors' heights, in its direction.
void MakeVertLine(CURVE* c, S32 x);
