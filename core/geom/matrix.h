// Affine transforms: x' = a x + c y + tx, y' = b x + d y + ty. a to d are 16.16, tx and ty are in
// coordinate units. Every product is rounded down by itself. Results may overwrite an input.
#pragma once

#include "core/geom/rect.h"

struct MATRIX {
    S32 a;
    S32 b;
    S32 c;
    S32 d;
    S32 tx;
    S32 ty;

    bool operator==(const MATRIX&) const = default;
};

inline void MatrixIdentity(MATRIX* m)
{
    *m = {kFixedOne, 0, 0, kFixedOne, 0, 0};
}
// Scales are 16.16.
inline void MatrixScale(S32 sx, S32 sy, MATRIX* m)
{
    *m = {sx, 0, 0, sy, 0, 0};
}
inline void MatrixTranslate(S32 dx, S32 dy, MATRIX* m)
{
    *m = {kFixedOne, 0, 0, kFixedOne, dx, dy};
}
// angle in 16.16 degrees.
void MatrixRotate(S32 angle, MATRIX* m);

bool MatrixIsIdentity(const MATRIX* m);
// True without mirroring and with a skew of at most 16/65536.
bool MatrixIsScaleOnly(const MATRIX* m);
// Every field within tol.
bool MatrixEqual(const MATRIX* m1, const MATRIX* m2, S32 tol);

// The transform without the translation.
inline void MatrixDeltaTransformPoint(const MATRIX* m, const SPOINT* p, SPOINT* dst)
{
    S32 x = FixedMul(m->a, p->x);
    S32 y = FixedMul(m->d, p->y);
    if (m->c != 0)
        x += FixedMul(m->c, p->y);
    if (m->b != 0)
        y += FixedMul(m->b, p->x);
    *dst = {x, y};
}

inline void MatrixTransformPoint(const MATRIX* m, const SPOINT* p, SPOINT* dst)
{
    MatrixDeltaTransformPoint(m, p, dst);
    dst->x += m->tx;
    dst->y += m->ty;
}

// The bounding box of the transformed corners; empty stays empty.
void MatrixTransformRect(const MATRIX* m, const SRECT* r, SRECT* dst);

// m1 followed by m2.
void MatrixConcat(const MATRIX* m1, const MATRIX* m2, MATRIX* dst);

// The inverse. A matrix without one gives the identity, but a pure scale with a zero gives a zero
// there. Matrices with skew whose largest entry lies between about 32.0 and 8192.0 come out
// distorted; that is the required behaviour.
void MatrixInvert(const MATRIX* m, MATRIX* dst);

// The scale and translation that take src to dst. x is anchored at the minimum edges, y at the
// maximum edges; a source without extent counts as 1 wide or high.
void MatrixMap(const SRECT* src, const SRECT* dst, MATRIX* m);
// The same with the smaller of the two scales for both axes, centre on centre.
void MatrixMapAspect(const SRECT* src, const SRECT* dst, MATRIX* m);

// Lengths of the two axes (16.16) and the direction of the first one (16.16 degrees).
void MatrixDecompose(const MATRIX* m, SPOINT* scale, S32* rot);

// The width that a line of width t has after the transform; at least 1 when t is.
S32 MatrixTransformThickness(const MATRIX* m, S32 t);

// Every field m0 + (m1 - m0) * t, t in 16.16.
void Interpolate(const MATRIX* m0, const MATRIX* m1, S32 t, MATRIX* dst);
