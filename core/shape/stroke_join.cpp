// Round joins and ends: arcs of up to four quadratic pieces, found without trigonometry.
#include <bit>

#include "core/shape/stroker.h"

namespace {
constexpr S64 kOne = 0x10000;
constexpr S64 kTan1 = 1144; // tangents of 1 and of 46 degrees in 16.16
constexpr S64 kTan46 = 67864;
constexpr S64 kNoArc = 3 * kStrokeOne / 2; // a chord that an arc hardly leaves

U64 Size(S64 v)
{
    return v < 0 ? U64(-v) : U64(v);
}

SStrokePoint WithLength(const SStrokePoint& v, S64 length)
{
    const SStrokePoint unit = UnitVector(v, nullptr);
    return Scaled(unit, length);
}

S64 LengthOf(const SStrokePoint& v)
{
    S64 length;
    UnitVector(v, &length);
    return length;
}

// The vector halfway around from u to v, clockwise. Its direction is that of the sum, or, where
// the sum is short, that of the difference turned by a right angle.
SStrokePoint Halfway(const SStrokePoint& u, const SStrokePoint& v, S64 radius)
{
    if (Dot(u, v) >= 0)
        return WithLength(u + v, radius);
    return WithLength({v.y - u.y, u.x - v.x}, radius);
}

// Pieces of at most 45 degrees, with one degree's grace: (sweep + 44) / 45 rounded down. 0 when the
// sweep is at most 1 degree or more than half a turn.
int ArcPieces(const SStrokePoint& u, const SStrokePoint& v)
{
    const S64 cross = Cross(u, v);
    const S64 dot = Dot(u, v);
    if (cross < 0 || (dot >= 0 && cross * kOne <= dot * kTan1))
        return 0;
    if (dot > 0 && cross * kOne < dot * kTan46)
        return 1;
    if (dot * kOne > -cross * kTan1)
        return 2;
    return -dot * kOne < cross * kTan46 ? 3 : 4;
}
} // namespace

SStrokePoint UnitVector(const SStrokePoint& v, S64* length)
{
    const U64 x = Size(v.x);
    const U64 y = Size(v.y);
    if (length)
        *length = 0;
    if ((x | y) == 0)
        return {0, 0};
    // The longer side gets 29 bits.
    const int shift = std::countl_zero(x | y) - 35;
    const U64 sx = shift >= 0 ? x << shift : x >> -shift;
    const U64 sy = shift >= 0 ? y << shift : y >> -shift;
    const U64 l = U64(VectorLength(U32(sx), U32(sy)));
    if (length)
        *length = S64(shift >= 0 ? l >> shift : l << -shift);
    constexpr U64 kHalf = U64{1} << 43;
    const U64 inverse = (U64{1} << 60) / l;
    const S64 ux = S64((sx * inverse + kHalf) >> 44);
    const S64 uy = S64((sy * inverse + kHalf) >> 44);
    return {v.x < 0 ? -ux : ux, v.y < 0 ? -uy : uy};
}

void SStroker::StrokeJoin(const SStrokePoint& from, const SStrokePoint& to,
                          const SStrokePoint& centre)
{
    const SStrokePoint u = from - centre;
    const SStrokePoint v = to - centre;
    const SStrokePoint chord = to - from;
    const bool tiny = Size(chord.x) < kNoArc && Size(chord.y) < kNoArc;
    const int pieces = tiny ? 0 : ArcPieces(u, v);
    if (pieces == 0) {
        AddEdge(from, to);
        return;
    }
    SStrokePoint on[5];
    on[0] = u;
    on[pieces] = v;
    const S64 radius = LengthOf(u);
    const SStrokePoint middle = Halfway(u, v, radius);
    if (pieces == 2)
        on[1] = middle;
    if (pieces == 3) {
        on[1] = WithLength(u + middle + middle, radius);
        on[2] = WithLength(v + middle + middle, radius);
    }
    if (pieces == 4) {
        on[1] = Halfway(u, middle, radius);
        on[2] = middle;
        on[3] = Halfway(middle, v, radius);
    }
    for (int i = 0; i < pieces; ++i)
        AddArc(on[i], on[i + 1], centre);
}

// One piece: its control point is where the tangents at both ends meet.
void SStroker::AddArc(const SStrokePoint& u, const SStrokePoint& v, const SStrokePoint& centre)
{
    const S64 square = Dot(u, u);
    const S64 sum = square + Dot(u, v);
    if (sum <= 0)
        return;
    const SStrokePoint control = centre + Scaled(u + v, square * kOne / sum);
    const CURVE arc = {RasterPoint(centre + u), RasterPoint(control), RasterPoint(centre + v), 0};
    AddCurve(&arc);
}
