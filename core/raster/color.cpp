#include "core/raster/color.h"

#include "core/geom/fixed.h"

// Only bits 8 to 15 decide whether a value is out of range, deliberately: a sum whose bits 8 to 15
// happen to be zero counts as its low byte however large it is.
static S32 ClampChannel(S32 v)
{
    if ((v & 0xFF00) == 0)
        return v & 0xFF;
    return v <= 0 ? 0 : 255;
}

static S32 MulAdd(S32 c, S32 mul, S32 add)
{
    return ClampChannel((c * mul >> 8) + add);
}

void Premultiply(RGBI* c)
{
    if (c->alpha >= 255)
        return;
    U32 scale = c->alpha ? c->alpha + 1u : 0;
    c->red = U16(c->red * scale >> 8);
    c->green = U16(c->green * scale >> 8);
    c->blue = U16(c->blue * scale >> 8);
}

void ColorTransform::Clear()
{
    *this = ColorTransform();
}

void ColorTransform::CalcFlags()
{
    bool multiplies = alphaMul != 256 || redMul != 256 || greenMul != 256 || blueMul != 256;
    bool adds = (alphaAdd | redAdd | greenAdd | blueAdd) != 0;
    flags = (multiplies ? U32(kMultiplies) : 0) | (adds ? U32(kAdds) : 0);
}

// The offset uses the multiplier from before, so it is computed first.
static void ConcatChannel(S16* mul, S16* add, S16 cMul, S16 cAdd)
{
    *add = S16(*add + (*mul * cAdd >> 8));
    *mul = S16(*mul * cMul >> 8);
}

void ColorTransform::Concat(const ColorTransform* c)
{
    if (c->flags == 0)
        return;
    if (flags == 0) {
        *this = *c;
        return;
    }
    ConcatChannel(&alphaMul, &alphaAdd, c->alphaMul, c->alphaAdd);
    ConcatChannel(&redMul, &redAdd, c->redMul, c->redAdd);
    ConcatChannel(&greenMul, &greenAdd, c->greenMul, c->greenAdd);
    ConcatChannel(&blueMul, &blueAdd, c->blueMul, c->blueAdd);
    CalcFlags();
}

static void ApplyAdds(const ColorTransform* t, RGBI* c)
{
    c->red = U16(ClampChannel(c->red + t->redAdd));
    c->green = U16(ClampChannel(c->green + t->greenAdd));
    c->blue = U16(ClampChannel(c->blue + t->blueAdd));
    c->alpha = U16(ClampChannel(c->alpha + t->alphaAdd));
}

static void ApplyFull(const ColorTransform* t, RGBI* c)
{
    c->red = U16(MulAdd(c->red, t->redMul, t->redAdd));
    c->green = U16(MulAdd(c->green, t->greenMul, t->greenAdd));
    c->blue = U16(MulAdd(c->blue, t->blueMul, t->blueAdd));
    c->alpha = U16(MulAdd(c->alpha, t->alphaMul, t->alphaAdd));
}

void ColorTransform::Apply(RGBI* colors, int n) const
{
    if (flags == 0)
        return;
    for (int i = 0; i < n; ++i) {
        if (flags & kMultiplies)
            ApplyFull(this, &colors[i]);
        else
            ApplyAdds(this, &colors[i]);
    }
}

SRGB ColorTransform::Apply(SRGB c) const
{
    if (flags == 0)
        return c;
    return {U8(MulAdd(c.red, redMul, redAdd)), U8(MulAdd(c.green, greenMul, greenAdd)),
            U8(MulAdd(c.blue, blueMul, blueAdd)), U8(MulAdd(c.alpha, alphaMul, alphaAdd))};
}

void ColorTransform::Apply(GradColorRamp* ramp) const
{
    for (int i = 0; i < ramp->count && i < GradColorRamp::kMaxStops; ++i)
        ramp->colors[i] = Apply(ramp->colors[i]);
}

bool Equal(const ColorTransform* a, const ColorTransform* b)
{
    return a->flags == b->flags && a->alphaMul == b->alphaMul && a->alphaAdd == b->alphaAdd &&
           a->redMul == b->redMul && a->redAdd == b->redAdd && a->greenMul == b->greenMul &&
           a->greenAdd == b->greenAdd && a->blueMul == b->blueMul && a->blueAdd == b->blueAdd;
}

void Interpolate(const SRGB* c0, const SRGB* c1, S32 t, SRGB* dst)
{
    if (t < 1) {
        *dst = *c0;
        return;
    }
    if (t >= 0x10000) {
        *dst = *c1;
        return;
    }
    auto between = [t](U8 a, U8 b) { return U8(a + (t * (S32(b) - a) >> 16)); };
    *dst = {between(c0->red, c1->red), between(c0->green, c1->green), between(c0->blue, c1->blue),
            between(c0->alpha, c1->alpha)};
}

void Interpolate(const RGBI* c0, const RGBI* c1, S32 t, RGBI* dst)
{
    auto between = [t](U16 a, U16 b) { return U16(a + S32((S64(b) - a) * t >> 16)); };
    *dst = {between(c0->blue, c1->blue), between(c0->green, c1->green), between(c0->red, c1->red),
            between(c0->alpha, c1->alpha)};
}
