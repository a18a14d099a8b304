// Affine transforms: x' = a*x + c*y + tx, y' = b*x + d*y + ty. Every product is rounded down on its
// own. Results may be written over an input.
#pragma once

#include "core/geom/point.h"
#include "core/geom/rect.h"

struct MATRIX {
    S32 a;  // x to x, 16.16
    S32 b;  // x to y, 16.16
    S32 c;  // y to x, 16.16
    S32 d;  // y to y, 16.16
    S32 tx; // coordinate units
    S32 ty; // coordinate units
};

inline void MatrixIdentity(MATRIX* m)
{
    *m = {0x10000, 0, 0, 0x10000, 0, 0};
}

void MatrixScale(S32 sx, S32 sy, MATRIX* m);
void MatrixTranslate(S32 dx, S32 dy, MATRIX* m);
// Rotation about the origin by 16.16 degrees.
void MatrixRotate(S32 angle, MATRIX* m);

bool MatrixIsIdentity(const MATRIX* m);
// True when both scales are positive and the skews are within 16/65536.
bool MatrixIsScaleOnly(const MATRIX* m);
// True when every field is within tol.
bool MatrixEqual(const MATRIX* m1, const MATRIX* m2, S32 tol);

// A vector: without the translation.
inline void MatrixDeltaTransformPoint(const MATRIX* m, const SPOINT* p, SPOINT* dst)
{
    const S32 x = FixedMul(m->a, p->x) + FixedMul(m->c, p->y);
    const S32 y = FixedMul(m->d, p->y) + FixedMul(m->b, p->x);
    *dst = {x, y};
}

inline void MatrixTransformPoint(const MATRIX* m, const SPOINT* p, SPOINT* dst)
{
    MatrixDeltaTransformPoint(m, p, dst);
    dst->x += m->tx;
    dst->y += m->ty;
}

// The bounding box of the four transformed corners; an empty r gives an empty dst.
void MatrixTransformRect(const MATRIX* m, const SRECT* r, SRECT* dst);

// m1 followed by m2.
void MatrixConcat(const MATRIX* m1, const MATRIX* m2, MATRIX* dst);

// The inverse, or the identity (and false) when there is none. Without skews each scale is inverted
// alone (0 stays 0). With skews it is right when the largest of |a| to |d| is below 2^22 or at
// least 2^29, and deliberately distorted in between: pictures depend on exactly these numbers.
bool MatrixInvert(const MATRIX* m, MATRIX* dst);

// Scale and translation that take src onto dst. x is anchored at the minimum edges, y deliberately
// at the maximum edges.
void MatrixMap(const SRECT* src, const SRECT* dst, MATRIX* m);
// The same with the smaller of the two scales on both axes and the centres matched.
void MatrixMapAspect(const SRECT* src, const SRECT* dst, MATRIX* m);

// The lengths of the images of the two axes (16.16) and the direction of the x axis's (16.16
// degrees).
void MatrixDecompose(const MATRIX* m, SPOINT* scale, S32* rot);

// A line width under m: a width of 1 or more stays at least 1.
S32 MatrixTransformThickness(const MATRIX* m, S32 t);

// Every field from m0 (t = 0) to m1 (t = 0x10000).
void Interpolate(const MATRIX* m0, const MATRIX* m1, S32 t, MATRIX* dst);
