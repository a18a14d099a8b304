#include "core/geom/fixed.h"

namespace {
constexpr S64 kRatioLimit = S64{1} << 30;

U64 Magnitude64(S64 v)
{
    return v < 0 ? 0u - static_cast<U64>(v) : static_cast<U64>(v);
}
} // namespace

S32 ScaleByRatio(S64 x, S64 num, S64 den)
{
    // A shorter denominator leaves room for the products below; the ratio hardly changes.
    while (Magnitude64(den) >= kRatioLimit) {
        den >>= 1;
        num >>= 1;
    }
    if (den == 0 || x == 0)
        return 0;
    if (den < 0) {
        den = -den;
        num = -num;
    }
    const S64 whole = num / den;
    if (whole > kRatioLimit || whole < -kRatioLimit)
        return (whole < 0) == (x < 0) ? kS32Max : kS32Min;
    const S64 part = x * (num % den);
    const S64 half = part < 0 ? -(den / 2) : den / 2;
    return Saturate32(x * whole + (part + half) / den);
}
