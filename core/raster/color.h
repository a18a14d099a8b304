// Colour values and the colour transform. Everything that a movie paints goes through these types:
// SRGB for what the file says and for gradient stops, RGBI inside the renderer (premultiplied
// there).
#pragma once

#include "core/geom/types.h"

// A colour as read from a movie: not premultiplied, each channel 0..255.
struct SRGB {
    U8 red = 0;
    U8 green = 0;
    U8 blue = 0;
    U8 alpha = 0;

    bool operator==(const SRGB&) const = default;
};

// The colour as one word: red in bits 0-7, green 8-15, blue 16-23, alpha 24-31.
constexpr U32 SRGBWord(SRGB c)
{
    return c.red | U32(c.green) << 8 | U32(c.blue) << 16 | U32(c.alpha) << 24;
}

// A colour inside the renderer: four 16-bit channels, each holding 0..255, so that sums and
// products of several pixels fit. Premultiplied by alpha wherever the raster sees it.
struct RGBI {
    U16 blue = 0;
    U16 green = 0;
    U16 red = 0;
    U16 alpha = 0;

    bool operator==(const RGBI&) const = default;
};

// All four channels of an RGBI in one word: blue in bits 0-15, green 16-31, red 32-47, alpha 48-63.
// One multiplication or addition then serves four channels; a product by up to 256 stays in its
// lane.
using Lanes = U64;

constexpr Lanes kLaneMask = 0x00FF00FF00FF00FFull;

constexpr Lanes ToLanes(const RGBI& c)
{
    return Lanes(c.blue) | Lanes(c.green) << 16 | Lanes(c.red) << 32 | Lanes(c.alpha) << 48;
}

constexpr RGBI FromLanes(Lanes v)
{
    return {U16(v), U16(v >> 16), U16(v >> 32), U16(v >> 48)};
}

// Alpha of packed lanes, 0..255.
constexpr U32 LaneAlpha(Lanes v)
{
    return U32(v >> 48);
}

// A pixel of the 32-bit output format: a << 24 | r << 16 | g << 8 | b.
constexpr U32 PackLanes(Lanes v)
{
    v = (v | v >> 8) & 0x0000FFFF0000FFFFull;
    return U32(v | v >> 16);
}

constexpr Lanes UnpackLanes(U32 pixel)
{
    Lanes v = (pixel | Lanes(pixel) << 16) & 0x0000FFFF0000FFFFull;
    return (v | v << 8) & kLaneMask;
}

// src over dst, both premultiplied: dst * (256 - alpha) >> 8 + src in each channel.
constexpr Lanes BlendLanes(Lanes dst, Lanes src)
{
    return ((dst * (256 - LaneAlpha(src)) >> 8) & kLaneMask) + src;
}

// The premultiplied form of a colour: channels become channel * (alpha + 1) >> 8 when alpha is
// below 255, and stay as they are otherwise.
void Premultiply(RGBI* c);

// Stops of a gradient as the file gives them, not premultiplied. Ratios do not decrease.
struct GradColorRamp {
    static constexpr int kMaxStops = 8;

    U8 count = 0;
    U8 ratios[kMaxStops] = {};
    SRGB colors[kMaxStops] = {};
};

// Multiply-and-add on each channel; multipliers are 8.8 fixed point (256 = 1.0), offsets are in
// channel units. The field order is alpha first, unlike the order in a movie file.
struct ColorTransform {
    enum Flags : U32 { kMultiplies = 1, kAdds = 2 };

    U32 flags = 0; // kMultiplies, kAdds: which terms are not the default
    S16 alphaMul = 256;
    S16 alphaAdd = 0;
    S16 redMul = 256;
    S16 redAdd = 0;
    S16 greenMul = 256;
    S16 greenAdd = 0;
    S16 blueMul = 256;
    S16 blueAdd = 0;

    // Becomes the identity.
    void Clear();
    // Recomputes `flags` from the terms.
    void CalcFlags();
    // Becomes the transform that applies `c` first and then what this was.
    void Concat(const ColorTransform* c);
    // Transforms n colours in place.
    void Apply(RGBI* colors, int n) const;
    // Transforms the stops of a ramp in place.
    void Apply(GradColorRamp* ramp) const;
    SRGB Apply(SRGB color) const;
    // The transform can turn an opaque colour transparent.
    bool LowersAlpha() const { return flags != 0 && (alphaMul < 256 || alphaAdd < 0); }
};

// Same flags and same terms.
bool Equal(const ColorTransform* a, const ColorTransform* b);

// Colour between c0 (t below 1) and c1 (t at or above 0x10000), t in 16.16.
void Interpolate(const SRGB* c0, const SRGB* c1, S32 t, SRGB* dst);
// The same for renderer colours; t is not clamped and each channel is kept to 16 bits.
void Interpolate(const RGBI* c0, const RGBI* c1, S32 t, RGBI* dst);
