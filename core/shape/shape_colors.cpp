// Finishing colours: from the device back into the bitmap or the gradient square.
#include "core/shape/shape_parser.h"

namespace {
constexpr S32 kQuarter = 0x4000;
constexpr int kBitmapShift = 16; // fraction bits that bitmap coordinates carry
constexpr int kGradientShift = 8;

// (v << shift) * f >> 16, without forming the large first factor. shift is 0 to 16.
S64 ScaleShifted(S32 v, S32 f, int shift)
{
    return S64(v) * f >> (16 - shift);
}

// v * f >> 16 for a v that may need 48 bits.
S64 WideMul(S64 v, S32 f)
{
    return (v >> 16) * f + ((v & 0xFFFF) * f >> 16);
}

MATRIX WithoutTranslation(const MATRIX& m)
{
    return {m.a, m.b, m.c, m.d, 0, 0};
}
} // namespace

// The inverse of `fillMat` followed by the base matrix, both with translations that carry `shift`
// fraction bits. Those leave 32 bits a few hundred pixels from the origin, so they are kept in 64
// until the inverse is there. Returns the inverse's translation, which `inverse` has cut to 32
// bits.
RWidePoint SShapeParser::InvertFill(const MATRIX* fillMat, int shift, MATRIX* inverse) const
{
    MATRIX base = mat;
    if (raster->Antialias()) {
        MATRIX quarter;
        MatrixScale(kQuarter, kQuarter, &quarter);
        MatrixConcat(&base, &quarter, &base);
    }
    const S64 tx = ScaleShifted(fillMat->tx, base.a, shift) + S64(base.tx) * (S64(1) << shift) +
                   ScaleShifted(fillMat->ty, base.c, shift);
    const S64 ty = ScaleShifted(fillMat->ty, base.d, shift) + S64(base.ty) * (S64(1) << shift) +
                   ScaleShifted(fillMat->tx, base.b, shift);

    const MATRIX first = WithoutTranslation(*fillMat);
    MATRIX whole = WithoutTranslation(base);
    MatrixConcat(&first, &whole, &whole);
    // What has no inverse gives the identity, and that without a translation.
    if (!MatrixInvert(&whole, inverse))
        return {0, 0};
    const RWidePoint moved = {-(WideMul(tx, inverse->a) + WideMul(ty, inverse->c)),
                              -(WideMul(ty, inverse->d) + WideMul(tx, inverse->b))};
    inverse->tx = S32(moved.x);
    inverse->ty = S32(moved.y);
    return moved;
}

void SShapeParser::SetupColor(RColor* color)
{
    if (!raster)
        return;
    if (color->colorType == kColorBitmap) {
        color->bitmapStart = InvertFill(&color->bitmapMat, kBitmapShift, &color->bitmapInv);
        color->transparent = color->bitmap->transparent || cxform.LowersAlpha();
        if (!color->bitmap->baseAddr) {
            color->colorType = kColorSolid;
            color->bitmap = nullptr;
        }
    } else if (color->colorType == kColorGradient) {
        InvertFill(&color->gradientMat, kGradientShift, &color->gradientInv);
    }
    color->BuildCache();
}
