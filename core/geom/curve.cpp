#include "core/geom/curve.h"

namespace {
constexpr S32 kParamEnd = 0x10000;

S32 ClampParam(S32 t)
{
    return t < 0 ? 0 : t > kParamEnd ? kParamEnd : t;
}

void LerpPoint(const SPOINT& p, const SPOINT& q, S32 t, SPOINT* dst)
{
    *dst = {FixedLerp(p.x, q.x, t), FixedLerp(p.y, q.y, t)};
}

struct Range {
    S32 min;
    S32 max;
};

Range RangeOf(S32 a, S32 b)
{
    return a < b ? Range{a, b} : Range{b, a};
}

bool Outside(S32 v, const Range& r)
{
    return v < r.min || v > r.max;
}

// The range of one coordinate along the curve. Its turning value is a1 - u*u / (a1 - 2c + a2) with
// u = a1 - c, computed exactly and rounded away from the anchors.
Range TightRange(S32 a1, S32 c, S32 a2)
{
    Range r = RangeOf(a1, a2);
    if (!Outside(c, r))
        return r;
    const bool low = c < r.min;
    const U64 u = low ? static_cast<U64>(static_cast<S64>(a1) - c)
                      : static_cast<U64>(static_cast<S64>(c) - a1);
    const U64 v = low ? static_cast<U64>(static_cast<S64>(a2) - c)
                      : static_cast<U64>(static_cast<S64>(c) - a2);
    const U64 square = u * u;
    const U64 reach = square / (u + v) + (square % (u + v) != 0);
    if (low)
        r.min = static_cast<S32>(a1 - static_cast<S64>(reach));
    else
        r.max = static_cast<S32>(a1 + static_cast<S64>(reach));
    return r;
}

// A stepper's differences of one coordinate.
S64 FirstDifference(S32 a1, S32 c, S64 dt)
{
    return (2 * (static_cast<S64>(c) - a1) * (dt * 16)) >> 16;
}

S64 SecondDifference(S32 a1, S32 c, S32 a2, S64 dt)
{
    const S64 bend = static_cast<S64>(a1) - 2 * static_cast<S64>(c) + a2;
    return (bend * (((dt * dt) >> 16) << 5)) >> 16;
}

struct Vector {
    S64 x;
    S64 y;
};

Vector Between(const SPOINT& from, const SPOINT& to)
{
    return {static_cast<S64>(to.x) - from.x, static_cast<S64>(to.y) - from.y};
}

bool NeedsShortening(const Vector& v)
{
    constexpr S64 kExact = S64{1} << 30;
    return v.x >= kExact || v.x <= -kExact || v.y >= kExact || v.y <= -kExact;
}

S64 Cross(const Vector& a, const Vector& b, int shift)
{
    return (a.x >> shift) * (b.y >> shift) - (a.y >> shift) * (b.x >> shift);
}

bool SameSign(S64 a, S64 b)
{
    return (a > 0 && b > 0) || (a < 0 && b < 0);
}

S32 AverageMoved(S32 c, S64 move1, S64 move2)
{
    return Saturate32(c + ((move1 + move2) >> 1));
}
} // namespace

void CurveSet(const SPOINT* a1, const SPOINT* control, const SPOINT* a2, CURVE* dst)
{
    *dst = {*a1, *control, *a2, 0};
}

void CurveSetLine(const SPOINT* a1, const SPOINT* a2, CURVE* dst)
{
    SPOINT middle;
    PointMiddle(a1, a2, &middle);
    *dst = {*a1, middle, *a2, 1};
}

void CurveDivide(const CURVE* c, S32 t, CURVE* first, CURVE* second)
{
    const CURVE src = *c;
    SPOINT p, q, m;
    LerpPoint(src.anchor1, src.control, t, &p);
    LerpPoint(src.control, src.anchor2, t, &q);
    LerpPoint(p, q, t, &m);
    *first = {src.anchor1, p, m, src.isLine};
    *second = {m, q, src.anchor2, src.isLine};
}

void CurveDivideTwo(const CURVE* c, S32 t1, S32 t2, CURVE* first, CURVE* second, CURVE* third)
{
    const Range t = RangeOf(ClampParam(t1), ClampParam(t2));
    CURVE rest;
    CurveDivide(c, t.min, first, &rest);
    CurveDivide(&rest, FixedDiv(t.max - t.min, kParamEnd - t.min), second, third);
}

void CurveBounds(const CURVE* c, SRECT* r)
{
    RectSetPoint2(&c->anchor1, &c->anchor2, r);
    if (!c->isLine)
        RectUnionPoint(&c->control, r);
}

void CurveTightBounds(const CURVE* c, SRECT* r)
{
    RectSetPoint2(&c->anchor1, &c->anchor2, r);
    if (c->isLine)
        return;
    const Range x = TightRange(c->anchor1.x, c->control.x, c->anchor2.x);
    const Range y = TightRange(c->anchor1.y, c->control.y, c->anchor2.y);
    *r = {x.min, x.max, y.min, y.max};
}

S32 CurveCalcExtreme(S32 a1, S32 c, S32 a2)
{
    const S64 slope = static_cast<S64>(a1) - c;
    const S64 bend = slope - c + a2;
    const S32 t = Outside(c, RangeOf(a1, a2)) ? DivTrunc(slope * kParamEnd, bend) : -1;
    return t > 0 && t < kParamEnd ? t : -1;
}

void CurveExtrema(const CURVE* c, S32* tx, S32* ty)
{
    *tx = CurveCalcExtreme(c->anchor1.x, c->control.x, c->anchor2.x);
    *ty = CurveCalcExtreme(c->anchor1.y, c->control.y, c->anchor2.y);
}

bool CurveIsExtreme(const CURVE* c)
{
    return Outside(c->control.x, RangeOf(c->anchor1.x, c->anchor2.x)) ||
           Outside(c->control.y, RangeOf(c->anchor1.y, c->anchor2.y));
}

void CurveInitStepper(const CURVE* c, U16 n, CURVE_STEPPER* s)
{
    const S32 dt = n == 0 ? 0 : kParamEnd / n;
    s->count = n;
    s->t = 0;
    s->point = c->anchor1;
    s->prev = c->anchor1;
    s->dt = dt;
    s->dx = FirstDifference(c->anchor1.x, c->control.x, dt);
    s->dy = FirstDifference(c->anchor1.y, c->control.y, dt);
    s->ddx = SecondDifference(c->anchor1.x, c->control.x, c->anchor2.x, dt);
    s->ddy = SecondDifference(c->anchor1.y, c->control.y, c->anchor2.y, dt);
    s->x = static_cast<S64>(c->anchor1.x) * 16;
    s->y = static_cast<S64>(c->anchor1.y) * 16;
}

void CurveReverse(const CURVE* c, CURVE* dst)
{
    *dst = {c->anchor2, c->control, c->anchor1, c->isLine};
}

void CurveTransform(const CURVE* c, const MATRIX* m, CURVE* dst)
{
    MatrixTransformPoint(m, &c->anchor1, &dst->anchor1);
    MatrixTransformPoint(m, &c->control, &dst->control);
    MatrixTransformPoint(m, &c->anchor2, &dst->anchor2);
    dst->isLine = c->isLine;
}

void CurveAdjust(const CURVE* c, const SPOINT* a1, const SPOINT* a2, CURVE* dst)
{
    if (c->isLine) {
        CurveSetLine(a1, a2, dst);
        return;
    }
    const Vector out = Between(c->anchor1, c->control);
    const Vector in = Between(c->control, c->anchor2);
    const Vector chord = Between(*a1, *a2);
    // One shift for all three products, as their ratios count.
    const int shift = NeedsShortening(out) || NeedsShortening(in) || NeedsShortening(chord) ? 3 : 0;
    const S64 turn = Cross(out, in, shift);
    const S64 alongOut = Cross(chord, in, shift);
    const S64 alongIn = Cross(out, chord, shift);
    SPOINT control;
    if (SameSign(turn, alongOut) && SameSign(turn, alongIn)) {
        control = {Saturate32(S64{a1->x} + ScaleByRatio(out.x, alongOut, turn)),
                   Saturate32(S64{a1->y} + ScaleByRatio(out.y, alongOut, turn))};
    } else {
        const Vector move1 = Between(c->anchor1, *a1);
        const Vector move2 = Between(c->anchor2, *a2);
        control = {AverageMoved(c->control.x, move1.x, move2.x),
                   AverageMoved(c->control.y, move1.y, move2.y)};
    }
    CurveSet(a1, &control, a2, dst);
}

void MakeVertLine(CURVE* c, S32 x)
{
    const SPOINT top = {x, c->anchor1.y};
    const SPOINT bottom = {x, c->anchor2.y};
    CurveSetLine(&top, &bottom, c);
}
