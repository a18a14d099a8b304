#include "core/player/object_matrix.h"

#include <cmath>

#include "core/geom/trig.h"
#include "core/player/numbers.h"

namespace {

constexpr int kUnitBits = 30; // fraction bits of directions
constexpr S64 kUnitHalf = S64{1} << (kUnitBits - 1);
constexpr S32 kLeastChange = 16;

// A direction as a vector of length 1; two zeros for none.
struct Direction {
    S64 x;
    S64 y;
};

U32 NearestRoot(U64 square)
{
    U64 root = 0;
    for (U64 bit = U64{1} << 31; bit != 0; bit >>= 1) {
        if ((root + bit) * (root + bit) <= square)
            root += bit;
    }
    return static_cast<U32>(square - root * root > root ? root + 1 : root);
}

Direction DirectionOf(S64 x, S64 y)
{
    if (x == 0 && y == 0)
        return {0, 0};
    while (x < kUnitHalf && x > -kUnitHalf && y < kUnitHalf && y > -kUnitHalf) {
        x *= 2;
        y *= 2;
    }
    const S64 length = NearestRoot(static_cast<U64>(x * x) + static_cast<U64>(y * y));
    return {x * (S64{1} << kUnitBits) / length, y * (S64{1} << kUnitBits) / length};
}

S32 FromUnits(S64 v)
{
    return Saturate32((v + kUnitHalf) >> kUnitBits);
}

SPOINT Column(const MATRIX* m, SAxis axis)
{
    return axis == kAxisX ? SPOINT{m->a, m->b} : SPOINT{m->c, m->d};
}

void SetColumn(MATRIX* m, SAxis axis, SPOINT column)
{
    (axis == kAxisX ? m->a : m->c) = column.x;
    (axis == kAxisX ? m->b : m->d) = column.y;
}

// The direction of a column; of one without length that at a right angle to the other.
Direction ColumnDirection(const MATRIX* m, SAxis axis)
{
    const SPOINT x = Column(m, kAxisX), y = Column(m, kAxisY);
    const SPOINT own = axis == kAxisX ? x : y;
    if (own.x != 0 || own.y != 0)
        return DirectionOf(own.x, own.y);
    if (axis == kAxisX)
        return y.x == 0 && y.y == 0 ? DirectionOf(1, 0) : DirectionOf(y.y, -S64{y.x});
    return x.x == 0 && x.y == 0 ? DirectionOf(0, 1) : DirectionOf(-S64{x.y}, x.x);
}

// The column turned by the angle of `turn`.
SPOINT Turned(SPOINT column, Direction turn)
{
    return {FromUnits(column.x * turn.x - column.y * turn.y),
            FromUnits(column.x * turn.y + column.y * turn.x)};
}

} // namespace

double MatrixScalePercent(const MATRIX* m, SAxis axis)
{
    const SPOINT column = Column(m, axis);
    return PointLength(&column) * 100.0 / 65536.0;
}

void MatrixSetScalePercent(MATRIX* m, SAxis axis, double percent)
{
    const SPOINT column = Column(m, axis);
    const S32 length = TruncateToInt(percent / 100.0 * 65536.0);
    if (IsWithin(length, PointLength(&column), kLeastChange))
        return;
    const Direction dir = ColumnDirection(m, axis);
    SetColumn(m, axis, {FromUnits(dir.x * length), FromUnits(dir.y * length)});
}

double MatrixRotation(const MATRIX* m)
{
    return _FPATan2(m->b, m->a, 16, 16) / 65536.0;
}

// Not by way of the present angle: it is rounded, and an object that a script turns a little in
// every frame would grow crooked. The vector of a table's sine and cosine is not quite of length 1
// either.
void MatrixSetRotation(MATRIX* m, double degrees)
{
    const double inCircle = std::fmod(degrees, 360.0); // exact, unlike most of its library
    const S32 angle = TruncateToInt(inCircle * 65536.0 + (inCircle < 0 ? -0.5 : 0.5));
    if (angle == _FPATan2(m->b, m->a, 16, 16))
        return;
    const Direction to = DirectionOf(_FPCos(angle, 16, kUnitBits), _FPSin(angle, 16, kUnitBits));
    const Direction from = ColumnDirection(m, kAxisX);
    const Direction turn = {(to.x * from.x + to.y * from.y + kUnitHalf) >> kUnitBits,
                            (to.y * from.x - to.x * from.y + kUnitHalf) >> kUnitBits};
    SetColumn(m, kAxisX, Turned(Column(m, kAxisX), turn));
    SetColumn(m, kAxisY, Turned(Column(m, kAxisY), turn));
}
