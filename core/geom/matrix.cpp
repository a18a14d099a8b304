#include "core/geom/matrix.h"

#include "core/geom/trig.h"

namespace {
constexpr S32 kOne = 0x10000;
constexpr S32 kHalfSqrt2 = 46341; // 1/sqrt(2)
constexpr S32 kSkewTolerance = 16;

S32 AtLeastOne(S32 v)
{
    return v < 1 ? 1 : v;
}

S32 Reciprocal(S32 v)
{
    return DivTrunc(S64{1} << 32, v);
}

void InvertScales(const MATRIX& m, MATRIX* dst)
{
    const S32 a = Reciprocal(m.a);
    const S32 d = Reciprocal(m.d);
    *dst = {a, 0, 0, d, -FixedMul(m.tx, a), -FixedMul(d, m.ty)};
}

// The precision that the determinant can afford: the shift of its products, 0 to 32. The search
// runs on unsigned magnitudes, or the most negative entry would never end it.
int DeterminantShift(const MATRIX& m)
{
    U32 bits = Magnitude(m.a) | Magnitude(m.b) | Magnitude(m.c) | Magnitude(m.d);
    int shift = 32;
    for (; bits < 0x1000000; bits <<= 6)
        shift -= 12;
    for (; bits < 0x20000000; bits <<= 1)
        shift -= 2;
    return shift > 0 ? shift : 0;
}

S32 Determinant(const MATRIX& m, int shift)
{
    const S32 ad = static_cast<S32>((static_cast<S64>(m.a) * m.d) >> shift);
    const S32 cb = static_cast<S32>((static_cast<S64>(m.c) * m.b) >> shift);
    return ad - cb;
}

// One entry brought to the determinant's scale. Below zero the count is taken modulo 32, which is
// right only for -16 and distorts the inverses in between; they must come out like this.
S32 ScaleEntry(S32 v, int q)
{
    return q >= 0 ? static_cast<S32>(static_cast<U32>(v) << q) : v >> (32 + q);
}

S32 InverseEntry(S32 v, int q, S32 det)
{
    return DivTrunc(static_cast<S64>(ScaleEntry(v, q)) * kOne, det);
}
} // namespace

void MatrixScale(S32 sx, S32 sy, MATRIX* m)
{
    *m = {sx, 0, 0, sy, 0, 0};
}

void MatrixTranslate(S32 dx, S32 dy, MATRIX* m)
{
    *m = {kOne, 0, 0, kOne, dx, dy};
}

void MatrixRotate(S32 angle, MATRIX* m)
{
    const S32 sine = _FPSin(angle, 16, 16);
    const S32 cosine = _FPCos(angle, 16, 16);
    *m = {cosine, sine, -sine, cosine, 0, 0};
}

bool MatrixIsIdentity(const MATRIX* m)
{
    return m->a == kOne && m->b == 0 && m->c == 0 && m->d == kOne && m->tx == 0 && m->ty == 0;
}

bool MatrixIsScaleOnly(const MATRIX* m)
{
    return IsWithin(m->b, 0, kSkewTolerance) && IsWithin(m->c, 0, kSkewTolerance) && m->a > 0 &&
           m->d > 0;
}

bool MatrixEqual(const MATRIX* m1, const MATRIX* m2, S32 tol)
{
    return IsWithin(m1->a, m2->a, tol) && IsWithin(m1->b, m2->b, tol) &&
           IsWithin(m1->c, m2->c, tol) && IsWithin(m1->d, m2->d, tol) &&
           IsWithin(m1->tx, m2->tx, tol) && IsWithin(m1->ty, m2->ty, tol);
}

void MatrixTransformRect(const MATRIX* m, const SRECT* r, SRECT* dst)
{
    const SRECT src = *r;
    RectSetEmpty(dst);
    if (RectIsEmpty(&src))
        return;
    SPOINT corners[] = {
        {src.xmin, src.ymax}, {src.xmax, src.ymax}, {src.xmax, src.ymin}, {src.xmin, src.ymin}};
    for (SPOINT& p : corners) {
        MatrixTransformPoint(m, &p, &p);
        RectUnionPoint(&p, dst);
    }
}

void MatrixConcat(const MATRIX* m1, const MATRIX* m2, MATRIX* dst)
{
    const MATRIX m = *m1;
    const MATRIX n = *m2;
    if ((m.b | m.c | n.b | n.c) == 0) {
        *dst = {FixedMul(m.a, n.a),        0, 0, FixedMul(m.d, n.d), FixedMul(m.tx, n.a) + n.tx,
                FixedMul(m.ty, n.d) + n.ty};
        return;
    }
    dst->a = FixedMul(m.a, n.a) + FixedMul(m.b, n.c);
    dst->b = FixedMul(m.a, n.b) + FixedMul(m.b, n.d);
    dst->c = FixedMul(m.c, n.a) + FixedMul(m.d, n.c);
    dst->d = FixedMul(m.d, n.d) + FixedMul(m.c, n.b);
    dst->tx = FixedMul(m.tx, n.a) + n.tx + FixedMul(m.ty, n.c);
    dst->ty = FixedMul(m.ty, n.d) + n.ty + FixedMul(m.tx, n.b);
}

bool MatrixInvert(const MATRIX* m, MATRIX* dst)
{
    const MATRIX src = *m;
    MatrixIdentity(dst);
    if ((src.a | src.b | src.c | src.d) == 0)
        return false;
    if ((src.b | src.c) == 0) {
        InvertScales(src, dst);
        return true;
    }
    const int shift = DeterminantShift(src);
    const S32 det = Determinant(src, shift);
    if (det == 0)
        return false;
    const int q = 16 - shift;
    dst->a = InverseEntry(src.d, q, det);
    dst->b = -InverseEntry(src.b, q, det);
    dst->c = -InverseEntry(src.c, q, det);
    dst->d = InverseEntry(src.a, q, det);
    dst->tx = -(FixedMul(dst->a, src.tx) + FixedMul(src.ty, dst->c));
    dst->ty = -(FixedMul(dst->d, src.ty) + FixedMul(src.tx, dst->b));
    return true;
}

void MatrixMap(const SRECT* src, const SRECT* dst, MATRIX* m)
{
    SPOINT from, to;
    RectSizePoint(src, &from);
    RectSizePoint(dst, &to);
    const S32 a = FixedDiv(to.x, AtLeastOne(from.x));
    const S32 d = FixedDiv(to.y, AtLeastOne(from.y));
    *m = {a, 0, 0, d, dst->xmin - FixedMul(src->xmin, a), dst->ymax - FixedMul(src->ymax, d)};
}

void MatrixMapAspect(const SRECT* src, const SRECT* dst, MATRIX* m)
{
    MatrixMap(src, dst, m);
    const S32 s = m->a < m->d ? m->a : m->d;
    const S32 tx = MiddleOf(dst->xmin, dst->xmax) - FixedMul(MiddleOf(src->xmin, src->xmax), s);
    const S32 ty = MiddleOf(dst->ymin, dst->ymax) - FixedMul(MiddleOf(src->ymin, src->ymax), s);
    *m = {s, 0, 0, s, tx, ty};
}

void MatrixDecompose(const MATRIX* m, SPOINT* scale, S32* rot)
{
    const SPOINT xAxis = {m->a, m->b};
    const SPOINT yAxis = {m->c, m->d};
    *scale = {PointLength(&xAxis), PointLength(&yAxis)};
    *rot = _FPATan2(m->b, m->a, 16, 16);
}

S32 MatrixTransformThickness(const MATRIX* m, S32 t)
{
    SPOINT diagonal = {t, t};
    MatrixDeltaTransformPoint(m, &diagonal, &diagonal);
    const S32 width = FixedMul(PointLength(&diagonal), kHalfSqrt2);
    return t >= 1 ? AtLeastOne(width) : width;
}

void Interpolate(const MATRIX* m0, const MATRIX* m1, S32 t, MATRIX* dst)
{
    *dst = {FixedLerp(m0->a, m1->a, t), FixedLerp(m0->b, m1->b, t),   FixedLerp(m0->c, m1->c, t),
            FixedLerp(m0->d, m1->d, t), FixedLerp(m0->tx, m1->tx, t), FixedLerp(m0->ty, m1->ty, t)};
}
