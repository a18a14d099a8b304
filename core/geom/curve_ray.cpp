// Crossings of a curve with a horizontal ray. The curve is taken relative to the ray's start as two
// polynomials with whole coefficients, evaluated without rounding at parameters k / 2^bits; a
// crossing is found by bisection, so that no square root is needed and no parity is ever lost.
#include "core/geom/curve.h"

namespace {
constexpr S64 kExactLimit = S64{1} << 28;
constexpr int kMaxBits = 24;

struct Quadratic {
    S64 bend;  // a1 - 2c + a2
    S64 slope; // c - a1
    S64 start; // a1
};

struct RayCurve {
    Quadratic x, y; // relative to the ray's start
    int bits;       // fraction bits of the parameters tried
    S64 step;       // stretches this short are taken as straight, 1/2^bits
};

S64 MagnitudeOf(S64 v)
{
    return v < 0 ? -v : v;
}

// v / 16 rounded up, which leaves "is it above 0" unchanged.
S64 SixteenthUp(S64 v)
{
    return (v + 15) >> 4;
}

// The value at k / 2^bits, times 2^(2 * bits).
S64 ValueAt(const Quadratic& q, S64 k, int bits)
{
    const S64 one = S64{1} << bits;
    return (q.bend * k + 2 * q.slope * one) * k + q.start * one * one;
}

// The side of the ray: with its own height counting as below, a monotonic stretch crosses exactly
// when its ends differ.
bool IsLow(S64 y)
{
    return y <= 0;
}

bool IsLowAt(const RayCurve& c, S64 k)
{
    return IsLow(ValueAt(c.y, k, c.bits));
}

void Shorten(S64* a, S64* b)
{
    while (MagnitudeOf(*a) > kExactLimit || MagnitudeOf(*b) > kExactLimit) {
        *a /= 2;
        *b /= 2;
    }
}

// Whether the straight line between two points on different sides of the ray meets it right of its
// start.
bool LineCrosses(S64 x1, S64 y1, S64 x2, S64 y2)
{
    if ((x1 > 0) == (x2 > 0))
        return x1 > 0;
    Shorten(&x1, &x2);
    Shorten(&y1, &y2);
    const S64 side = x1 * y2 - x2 * y1;
    return y2 > y1 ? side > 0 : side < 0;
}

// The same for a y-monotonic stretch of the curve; 0 when both ends are on one side.
int CountStretch(const RayCurve& c, S64 from, S64 to)
{
    const bool low = IsLowAt(c, from);
    if (low == IsLowAt(c, to))
        return 0;
    while (to - from > c.step) {
        const S64 middle = (from + to) / 2;
        if (IsLowAt(c, middle) == low)
            from = middle;
        else
            to = middle;
    }
    return LineCrosses(ValueAt(c.x, from, c.bits), ValueAt(c.y, from, c.bits),
                       ValueAt(c.x, to, c.bits), ValueAt(c.y, to, c.bits));
}

// The stretch between an end of the curve and its turning point, which lies just beyond `turn`.
int CountToTurn(const RayCurve& c, S64 end, S64 turn, bool turnLow)
{
    if (IsLowAt(c, end) == turnLow)
        return 0;
    if (IsLowAt(c, turn) != turnLow)
        return ValueAt(c.x, turn, c.bits) > 0; // crosses between `turn` and the turning point
    return end < turn ? CountStretch(c, end, turn) : CountStretch(c, turn, end);
}

bool TurnsInside(const Quadratic& q)
{
    const S64 arriving = q.bend + q.slope; // a2 - c
    return (q.slope < 0 && arriving > 0) || (q.slope > 0 && arriving < 0);
}

int CountCurve(const RayCurve& c)
{
    const S64 end = S64{1} << c.bits;
    if (!TurnsInside(c.y))
        return CountStretch(c, 0, end);
    // The turning value is start - slope^2 / bend: its sign without the division.
    const S64 scaled = c.y.start * c.y.bend - c.y.slope * c.y.slope;
    const bool turnLow = c.y.bend > 0 ? scaled <= 0 : scaled >= 0;
    const S64 turn = -c.y.slope * end / c.y.bend;
    return CountToTurn(c, 0, turn, turnLow) + CountToTurn(c, end, turn + 1, turnLow);
}

int BitsFor(S64 extent)
{
    int bits = kMaxBits;
    while (bits > 0 && extent >= S64{1} << (59 - 2 * bits))
        bits--;
    return bits;
}

// The longest stretch that is at most `tolerance` wide.
S64 StepFor(const RayCurve& c, U16 tolerance)
{
    const S64 leaving = MagnitudeOf(c.x.slope);
    const S64 arriving = MagnitudeOf(c.x.bend + c.x.slope);
    const S64 speed = 2 * (leaving > arriving ? leaving : arriving);
    const S64 step = speed == 0 ? S64{1} << c.bits : (S64{tolerance} << c.bits) / speed;
    return step < 1 ? 1 : step;
}

// The coordinates of anchor 1, control and anchor 2 relative to the ray's start.
struct Relative {
    S64 v[6]; // three x, three y
};

Relative RelativeTo(const CURVE* c, const SPOINT* p, S64* extent)
{
    const S64 px = p->x;
    const S64 py = p->y;
    Relative r = {{c->anchor1.x - px, c->control.x - px, c->anchor2.x - px, c->anchor1.y - py,
                   c->control.y - py, c->anchor2.y - py}};
    *extent = 0;
    for (S64 v : r.v)
        *extent = *extent < MagnitudeOf(v) ? MagnitudeOf(v) : *extent;
    if (*extent < kExactLimit)
        return r;
    for (S64& v : r.v)
        v = SixteenthUp(v);
    *extent = kExactLimit;
    return r;
}

bool NoneAbove(S64 a, S64 b, S64 c)
{
    return a <= 0 && b <= 0 && c <= 0;
}

bool AllAbove(S64 a, S64 b, S64 c)
{
    return a > 0 && b > 0 && c > 0;
}
} // namespace

int CurveXRaySect(const CURVE* c, const SPOINT* p, U16 tolerance)
{
    S64 extent;
    const Relative r = RelativeTo(c, p, &extent);
    const S64* x = r.v;
    const S64* y = r.v + 3;
    if (c->isLine)
        return IsLow(y[0]) != IsLow(y[2]) && LineCrosses(x[0], y[0], x[2], y[2]);
    if (NoneAbove(x[0], x[1], x[2]) || NoneAbove(y[0], y[1], y[2]) || AllAbove(y[0], y[1], y[2]))
        return 0;
    RayCurve ray = {{x[0] - 2 * x[1] + x[2], x[1] - x[0], x[0]},
                    {y[0] - 2 * y[1] + y[2], y[1] - y[0], y[0]},
                    BitsFor(extent),
                    1};
    ray.step = AllAbove(x[0], x[1], x[2]) ? S64{1} << ray.bits : StepFor(ray, tolerance);
    return CountCurve(ray);
}
