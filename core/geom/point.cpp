#include "core/geom/point.h"

#include "core/geom/tables.h"
#include "core/geom/trig.h"

namespace {
// Differences up to here have products whose sum fits into 62 bits.
constexpr S64 kDiffLimit = S64{1} << 30;

SPOINT Minus(const SPOINT* p, const SPOINT* origin)
{
    return {p->x - origin->x, p->y - origin->y};
}

// How far along a-b the foot of the perpendicular from p lies, as the fraction num / den.
struct Foot {
    S64 num;
    S64 den; // 0 when a and b coincide
};

bool IsLong(S64 diff)
{
    return diff > kDiffLimit || diff < -kDiffLimit;
}

Foot FootOnLine(const SPOINT* p, const SPOINT* a, const SPOINT* b)
{
    S64 diffs[] = {static_cast<S64>(p->x) - a->x, static_cast<S64>(p->y) - a->y,
                   static_cast<S64>(b->x) - a->x, static_cast<S64>(b->y) - a->y};
    const auto& [px, py, dx, dy] = diffs;
    if (IsLong(px) || IsLong(py) || IsLong(dx) || IsLong(dy))
        for (S64& diff : diffs)
            diff >>= 2; // the fraction hardly changes
    return {px * dx + py * dy, dx * dx + dy * dy};
}

SPOINT PointAtFoot(const Foot& foot, const SPOINT* a, const SPOINT* b)
{
    const S64 dx = static_cast<S64>(b->x) - a->x;
    const S64 dy = static_cast<S64>(b->y) - a->y;
    return {Saturate32(S64{a->x} + ScaleByRatio(dx, foot.num, foot.den)),
            Saturate32(S64{a->y} + ScaleByRatio(dy, foot.num, foot.den))};
}
} // namespace

bool PointEqual(const SPOINT* p1, const SPOINT* p2, S32 tol)
{
    return IsWithin(p1->x, p2->x, tol) && IsWithin(p1->y, p2->y, tol);
}

S32 ShiftRounded(S32 v, int n)
{
    if (n >= 0)
        return n > 31 ? 0 : static_cast<S32>(static_cast<U32>(v) << n);
    const int right = n < -31 ? 31 : -n;
    return static_cast<S32>((v + (S64{1} << (right - 1))) >> right);
}

void PointShift(const SPOINT* p, int n, SPOINT* dst)
{
    *dst = {ShiftRounded(p->x, n), ShiftRounded(p->y, n)};
}

void PointScale(const SPOINT* p, S32 s, SPOINT* dst)
{
    *dst = {FixedMul(p->x, s), FixedMul(p->y, s)};
}

S32 VectorLength(U32 dx, U32 dy)
{
    const U32 hi = dx > dy ? dx : dy;
    const U32 lo = dx > dy ? dy : dx;
    if (hi == 0)
        return 0;
    const U32 ratio = static_cast<U32>((static_cast<U64>(lo) << 16) / hi);
    const U32 i = ratio >> 10;
    const U32 f = ratio & 0x3FF;
    const U32 scale = ((1024 - f) * kLengthTable[i] + f * kLengthTable[i + 1]) >> 14;
    return Saturate32(static_cast<S64>((static_cast<U64>(scale) * hi) >> 16));
}

S32 PointLength(const SPOINT* p)
{
    return VectorLength(Magnitude(p->x), Magnitude(p->y));
}

S32 PointDistance(const SPOINT* p1, const SPOINT* p2)
{
    const SPOINT diff = Minus(p2, p1);
    return PointLength(&diff);
}

S32 PointFastLength(const SPOINT* p)
{
    const S64 x = Magnitude(p->x);
    const S64 y = Magnitude(p->y);
    return Saturate32(x + y - ((x < y ? x : y) >> 1));
}

S32 PointFastDistance(const SPOINT* p1, const SPOINT* p2)
{
    const SPOINT diff = Minus(p2, p1);
    const U32 x = Magnitude(diff.x);
    const U32 y = Magnitude(diff.y);
    return static_cast<S32>((x > y ? x : y) >> 1);
}

void PointNormalize(SPOINT* p, S32 len)
{
    const S32 length = PointLength(p);
    if (length < 1)
        return;
    PointScale(p, FixedDiv(len, length), p);
}

void PointPolar(S32 r, S32 angle, const SPOINT* origin, SPOINT* dst)
{
    SPOINT p = {FixedMul(_FPCos(angle, 16, 16), r), FixedMul(_FPSin(angle, 16, 16), r)};
    if (origin) {
        p.x += origin->x;
        p.y += origin->y;
    }
    *dst = p;
}

S32 PointAngle(const SPOINT* p, const SPOINT* origin)
{
    const SPOINT v = origin ? Minus(p, origin) : *p;
    return _FPATan2(v.y, v.x, 16, 16);
}

void PointNearestLine(const SPOINT* p, const SPOINT* a, const SPOINT* b, SPOINT* dst)
{
    const Foot foot = FootOnLine(p, a, b);
    if (foot.num <= 0)
        *dst = *a;
    else if (foot.num >= foot.den)
        *dst = *b;
    else
        *dst = PointAtFoot(foot, a, b);
}

void PointPerpNearestLine(const SPOINT* p, const SPOINT* a, const SPOINT* b, SPOINT* dst)
{
    *dst = PointAtFoot(FootOnLine(p, a, b), a, b);
}

S32 PointLineParam(const SPOINT* p, const SPOINT* a, const SPOINT* b)
{
    const Foot foot = FootOnLine(p, a, b);
    if (foot.num <= 0)
        return 0;
    return foot.num >= foot.den ? 0x10000 : ScaleByRatio(0x10000, foot.num, foot.den);
}
