// Lengths, directions, nearest points and intersections of curves.
#include "core/geom/curve.h"
#include "core/geom/trig.h"

namespace {
constexpr S32 kParamEnd = 0x10000;
constexpr int kChords = 64;
constexpr int kChordParam = kParamEnd / kChords;
constexpr int kNearestDepth = 12;
constexpr S32 kSectPairs = 4096;

S64 AbsOf(S64 v)
{
    return v < 0 ? -v : v;
}

S64 MaxOf(S64 a, S64 b)
{
    return a > b ? a : b;
}

S64 ShiftBy(S64 v, int shift)
{
    return shift >= 0 ? v * (S64{1} << shift) : v >> -shift;
}

// A curve relative to its first anchor and scaled by a power of two to about 2^25, so that short
// curves are measured in fractions of a unit and long ones do not overflow.
struct ScaledCurve {
    S64 cx, cy; // control point
    S64 ex, ey; // second anchor
    int shift;  // a unit is 2^shift
};

ScaledCurve ScaleCurve(const CURVE* c)
{
    const S64 ex = static_cast<S64>(c->anchor2.x) - c->anchor1.x;
    const S64 ey = static_cast<S64>(c->anchor2.y) - c->anchor1.y;
    const S64 cx = static_cast<S64>(c->control.x) - c->anchor1.x;
    const S64 cy = static_cast<S64>(c->control.y) - c->anchor1.y;
    const S64 extent = MaxOf(MaxOf(AbsOf(ex), AbsOf(ey)), MaxOf(AbsOf(cx), AbsOf(cy)));
    int shift = 25;
    while (ShiftBy(extent, shift) >= S64{1} << 26)
        shift--;
    ScaledCurve s = {ShiftBy(cx, shift), ShiftBy(cy, shift), ShiftBy(ex, shift), ShiftBy(ey, shift),
                     shift};
    if (c->isLine) {
        s.cx = s.ex >> 1;
        s.cy = s.ey >> 1;
    }
    return s;
}

S64 CoordAfterChords(S64 control, S64 end, int chords)
{
    return (2 * control * chords * (kChords - chords) + end * chords * chords) /
           (kChords * kChords);
}

// Length of chord number i, 0 to kChords - 1, in scaled units.
S64 ChordLength(const ScaledCurve& s, int i)
{
    const S64 dx = CoordAfterChords(s.cx, s.ex, i + 1) - CoordAfterChords(s.cx, s.ex, i);
    const S64 dy = CoordAfterChords(s.cy, s.ey, i + 1) - CoordAfterChords(s.cy, s.ey, i);
    return VectorLength(static_cast<U32>(AbsOf(dx)), static_cast<U32>(AbsOf(dy)));
}

// Twice the derivative in 16.16: the control polygon's legs mixed by t.
S64 TangentCoord(S32 a1, S32 c, S32 a2, S32 t)
{
    return (static_cast<S64>(c) - a1) * (kParamEnd - t) + (static_cast<S64>(a2) - c) * t;
}

struct NearestSearch {
    const CURVE* curve; // the whole of it
    SPOINT p;           // what to be near to
    S32 tolerance;      // pieces this flat are straight
    U64 best;           // squared distance, halved, of the best point yet
    S32 t;              // its parameter
    SPOINT point;       // the point
};

// Half the squared length: the halves of two squares of 32 bits fit into 64.
U64 HalfSquare(U64 dx, U64 dy)
{
    return (dx * dx >> 1) + (dy * dy >> 1);
}

U64 AxisGap(S32 v, S32 min, S32 max)
{
    const S64 gap = v < min ? static_cast<S64>(min) - v : v > max ? static_cast<S64>(v) - max : 0;
    return static_cast<U64>(gap);
}

void TryParam(NearestSearch* s, S32 t)
{
    SPOINT point;
    CurveCalcPoint(s->curve, t, &point);
    const U64 distance =
        HalfSquare(AxisGap(s->p.x, point.x, point.x), AxisGap(s->p.y, point.y, point.y));
    if (distance >= s->best)
        return;
    s->best = distance;
    s->t = t;
    s->point = point;
}

U64 BoxDistance(const NearestSearch* s, const CURVE* piece)
{
    SRECT box;
    CurveBounds(piece, &box);
    return HalfSquare(AxisGap(s->p.x, box.xmin, box.xmax), AxisGap(s->p.y, box.ymin, box.ymax));
}

void SearchNearest(NearestSearch* s, const CURVE* piece, S32 middle, S32 half, int depth)
{
    if (BoxDistance(s, piece) >= s->best)
        return;
    if (depth == 0 || CurveFlatness(piece) <= s->tolerance) {
        const S32 along = PointLineParam(&s->p, &piece->anchor1, &piece->anchor2);
        TryParam(s, CurveParamInterpolate(middle, half, along));
        return;
    }
    CURVE first, second;
    CurveDivide(piece, &first, &second);
    const bool swap = BoxDistance(s, &second) < BoxDistance(s, &first);
    const S32 quarter = half / 2;
    SearchNearest(s, swap ? &second : &first, swap ? middle + quarter : middle - quarter, quarter,
                  depth - 1);
    SearchNearest(s, swap ? &first : &second, swap ? middle - quarter : middle + quarter, quarter,
                  depth - 1);
}

// A piece of a curve with its place on the whole.
struct Piece {
    CURVE curve;
    S32 middle; // parameter of its middle
    S32 half;   // half its width in parameter
};

struct SectSearch {
    S32 tolerance; // coordinate units
    S32 pairs;     // pairs that may still be tried
    S32 t1, t2;    // the answer
};

bool IsSmall(const SRECT& box, S32 tolerance)
{
    return static_cast<S64>(box.xmax) - box.xmin <= tolerance &&
           static_cast<S64>(box.ymax) - box.ymin <= tolerance;
}

void HalvePiece(const Piece& piece, Piece halves[2])
{
    CurveDivide(&piece.curve, &halves[0].curve, &halves[1].curve);
    for (int i = 0; i < 2; i++) {
        halves[i].middle = CurveParamInterpolate(piece.middle, piece.half, i ? 0xC000 : 0x4000);
        halves[i].half = piece.half / 2;
    }
}

bool SearchSect(SectSearch* s, const Piece& p1, const Piece& p2, int depth)
{
    SRECT box1, box2;
    CurveBounds(&p1.curve, &box1);
    CurveBounds(&p2.curve, &box2);
    if (--s->pairs < 0 || !RectTestIntersect(&box1, &box2))
        return false;
    if (depth == 0 || (IsSmall(box1, s->tolerance) && IsSmall(box2, s->tolerance))) {
        s->t1 = p1.middle;
        s->t2 = p2.middle;
        return true;
    }
    Piece halves1[2], halves2[2];
    HalvePiece(p1, halves1);
    HalvePiece(p2, halves2);
    for (int i = 0; i < 4; i++)
        if (SearchSect(s, halves1[i >> 1], halves2[i & 1], depth - 1))
            return true;
    return false;
}
} // namespace

S32 CurveTangentAngle(const CURVE* c, S32 t)
{
    S64 x = TangentCoord(c->anchor1.x, c->control.x, c->anchor2.x, t);
    S64 y = TangentCoord(c->anchor1.y, c->control.y, c->anchor2.y, t);
    if (c->isLine || (x == 0 && y == 0)) {
        x = static_cast<S64>(c->anchor2.x) - c->anchor1.x;
        y = static_cast<S64>(c->anchor2.y) - c->anchor1.y;
    }
    while (AbsOf(x) > kS32Max || AbsOf(y) > kS32Max) {
        x /= 2;
        y /= 2;
    }
    const SPOINT direction = {static_cast<S32>(x), static_cast<S32>(y)};
    return PointAngle(&direction, nullptr);
}

S32 CurveLength(const CURVE* c)
{
    const ScaledCurve s = ScaleCurve(c);
    S64 length = 0;
    for (int i = 0; i < kChords; i++)
        length += ChordLength(s, i);
    if (s.shift > 0)
        length += S64{1} << (s.shift - 1);
    return Saturate32(ShiftBy(length, -s.shift));
}

S32 CurveFindLength(const CURVE* c, S32 length)
{
    const ScaledCurve s = ScaleCurve(c);
    S64 rest = ShiftBy(length, s.shift);
    if (rest <= 0)
        return 0;
    for (int i = 0; i < kChords; i++) {
        const S64 chord = ChordLength(s, i);
        if (rest < chord)
            return i * kChordParam + static_cast<S32>(rest * kChordParam / chord);
        rest -= chord;
    }
    return kParamEnd;
}

S32 CurveNearestPoint(const CURVE* c, const SPOINT* p, S32 tolerance, SPOINT* dst)
{
    NearestSearch s = {c, *p, tolerance < 1 ? 1 : tolerance, static_cast<U64>(-1), 0, c->anchor1};
    TryParam(&s, 0);
    TryParam(&s, kParamEnd);
    SearchNearest(&s, c, 0x8000, 0x8000, kNearestDepth);
    *dst = s.point;
    return s.t;
}

bool CurveBoundsSect(const CURVE* c1, const CURVE* c2, S32 tolerance, S32 maxDepth, S32* t1,
                     S32* t2)
{
    SectSearch s = {tolerance, kSectPairs, 0, 0};
    const int depth = maxDepth < 0 ? 0 : maxDepth > 16 ? 16 : maxDepth;
    if (!SearchSect(&s, {*c1, 0x8000, 0x8000}, {*c2, 0x8000, 0x8000}, depth))
        return false;
    *t1 = s.t1;
    *t2 = s.t2;
    return true;
}

S32 CurveLineCalcParam(const CURVE* c, const SPOINT* p)
{
    return PointLineParam(p, &c->anchor1, &c->anchor2);
}
