// Quadratic Bezier pieces, the form of every outline. Parameters are 16.16: 0 at anchor1, 0x10000
// at anchor2. Results may overwrite an input. Midpoints and differences are formed in 64 bits, so
// any 32-bit coordinates are safe.
#pragma once

#include "core/geom/matrix.h"

struct CURVE {
    SPOINT anchor1; // start
    SPOINT control; // for a straight segment the midpoint of the anchors
    SPOINT anchor2; // end
    S32 isLine;     // 1: a straight segment

    bool operator==(const CURVE&) const = default;
};

// State of forward differencing over a curve.
struct CURVE_STEPPER {
    U32 steps;   // steps left
    S32 t;       // parameter of the current point
    SPOINT cur;  // current point
    SPOINT prev; // the point before it
    S32 dt;      // parameter step
    S64 dx;      // first differences, 1/16 unit
    S64 dy;
    S64 d2x; // second differences, 1/16 unit
    S64 d2y;
    S64 x; // current position, 1/16 unit
    S64 y;
};

inline S32 MidCoord(S32 v1, S32 v2)
{
    return static_cast<S32>((static_cast<S64>(v1) + v2) >> 1);
}

inline SPOINT MidPoint(const SPOINT& p, const SPOINT& q)
{
    return {MidCoord(p.x, q.x), MidCoord(p.y, q.y)};
}

inline void CurveSet(const SPOINT* a1, const SPOINT* c, const SPOINT* a2, CURVE* dst)
{
    *dst = {*a1, *c, *a2, 0};
}

inline void CurveSetLine(const SPOINT* a1, const SPOINT* a2, CURVE* dst)
{
    *dst = {*a1, MidPoint(*a1, *a2), *a2, 1};
}

// Estimate of the control point's distance from the middle of the chord; 0 for lines.
inline S32 CurveFlatness(const CURVE* c)
{
    if (c->isLine)
        return 0;
    const SPOINT mid = MidPoint(c->anchor1, c->anchor2);
    const U64 dx = Magnitude(static_cast<S64>(mid.x) - c->control.x);
    const U64 dy = Magnitude(static_cast<S64>(mid.y) - c->control.y);
    return SaturateS32(static_cast<S64>(dx + dy - ((dx < dy ? dx : dy) >> 1)));
}

// Split at t (0 to 0x10000): first covers 0 to t, second the rest. Both keep isLine.
void CurveDivide(const CURVE* c, S32 t, CURVE* first, CURVE* second);

// Split at the middle.
inline void CurveDivide(const CURVE* c, CURVE* first, CURVE* second)
{
    const CURVE src = *c;
    const SPOINT p = MidPoint(src.anchor1, src.control);
    const SPOINT q = MidPoint(src.control, src.anchor2);
    const SPOINT m = MidPoint(p, q);
    *first = {src.anchor1, p, m, src.isLine};
    *second = {m, q, src.anchor2, src.isLine};
}

// Split at two parameters, in either order, into three pieces from anchor1 on.
void CurveDivideTwo(const CURVE* c, S32 t1, S32 t2, CURVE* first, CURVE* middle, CURVE* last);

// One coordinate of the curve at t. The middle rounds toward zero, every other t down by term.
inline S32 CurveCalcCoord(S64 a1, S64 c, S64 a2, S32 t)
{
    if (t == kFixedHalf)
        return static_cast<S32>((a1 + 2 * c + a2) / 4);
    const S64 t2 = (static_cast<S64>(t) * t) >> 16;
    return static_cast<S32>(a1 - 2 * (((a1 - c) * t) >> 16) + (((a1 - 2 * c + a2) * t2) >> 16));
}

// The point at t (0 to 0x10000).
inline void CurveCalcPoint(const CURVE* c, S32 t, SPOINT* dst)
{
    *dst = {CurveCalcCoord(c->anchor1.x, c->control.x, c->anchor2.x, t),
            CurveCalcCoord(c->anchor1.y, c->control.y, c->anchor2.y, t)};
}

// Bounds of the anchors and, for curves, the control point: a hull, on purpose not tight.
void CurveBounds(const CURVE* c, SRECT* dst);
// Bounds of the curve itself, rounded outward.
void CurveTightBounds(const CURVE* c, SRECT* dst);

// Parameter of the extremum of one coordinate (anchor, control, anchor), rounded toward zero; -1
// when none lies strictly between the ends.
S32 CurveCalcExtreme(S32 a1, S32 c, S32 a2);
// The same for x and y; -1 twice for a line.
void CurveExtrema(const CURVE* c, S32* tx, S32* ty);
// True when the control point lies outside the anchors' range in x or in y; never for lines.
bool CurveIsExtreme(const CURVE* c);

// Prepares n steps. The first difference has no half-second-difference term, so the last point is
// off anchor2 by (anchor1 - 2 control + anchor2) / n; that is intended.
void CurveInitStepper(const CURVE* c, U16 n, CURVE_STEPPER* s);
// Moves to the next point; false when no steps are left.
bool CurveStep(CURVE_STEPPER* s);

inline void CurveReverse(const CURVE* c, CURVE* dst)
{
    *dst = {c->anchor2, c->control, c->anchor1, c->isLine};
}

void CurveTransform(const CURVE* c, const MATRIX* m, CURVE* dst);

// Direction of travel at t, 16.16 degrees, -180 to 180. Where the derivative is nothing (a control
// point on an anchor) the direction of the curve next to it; 90 for a curve that is a single point.
S32 CurveTangentAngle(const CURVE* c, S32 t);

// Arc length, saturated at kS32Max; the parameter at which the curve is len long, 0 to 0x10000.
S32 CurveLength(const CURVE* c);
S32 CurveFindLength(const CURVE* c, S32 len);

// Sets dst to the point of the curve nearest to p. Returns its parameter, or -1 when it is farther
// away than tolerance.
S32 CurveNearestPoint(const CURVE* c, const SPOINT* p, S32 tolerance, SPOINT* dst);

// How often (0 to 2) the curve crosses the horizontal ray that goes from p toward +x, at x strictly
// greater than p->x. Each piece that is monotonic in y owns its upper end but not its lower one
// (ymin <= y < ymax), so that chained pieces count a shared point once, and a tangent touch counts
// 0 or 2. Pieces whose control point is within tolerance of the chord's middle are taken as their
// chord; 0 asks for full precision, which is exact for coordinates of 16 bits up to crossings less
// than 2^-20 units from p.
int CurveXRaySect(const CURVE* c, const SPOINT* p, U16 tolerance);

// Looks for an intersection of c1 at or after parameter from1 with c2 at or after from2, by halving
// both as long as their bounds meet. True with the two parameters of the one found first along c1;
// false when there is none or the bounded search gives up (long stretches closer than a unit).
bool CurveBoundsSect(const CURVE* c1, const CURVE* c2, S32 from1, S32 from2, S32* t1, S32* t2);

// Moves the anchors to a1 and a2. The control point goes where the tangents at both ends, moved
// along, meet; where they are nearly parallel or meet behind an anchor it moves by the average of
// the two shifts. A line stays a line.
void CurveAdjust(const CURVE* c, const SPOINT* a1, const SPOINT* a2, CURVE* dst);

// The parameter of a point on (or next to) a straight curve, 0 to 0x10000; 0 without extent.
S32 CurveLineCalcParam(const CURVE* c, const SPOINT* p);

// t0 + 2 dt * (t - 0x8000), rounded down: t = 0 gives t0 - dt and t = 0x10000 gives t0 + dt.
inline S32 CurveParamInterpolate(S32 t0, S32 dt, S32 t)
{
    return static_cast<S32>(t0 +
                            ((2 * static_cast<S64>(dt) * (static_cast<S64>(t) - 0x8000)) >> 16));
}

// Makes the curve a vertical straight segment at x between its anchors' y, in the same direction.
void MakeVertLine(CURVE* c, S32 x);
