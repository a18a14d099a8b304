// Gradient colours: the built ramp and the walk along a row of pixels.
#pragma once

#include "core/raster/rcolor.h"

// Builds the ramp of a gradient colour and chooses its procedures. False, and nothing to draw with,
// when the colour has no stops or there is no memory for the ramp.
bool BuildGradientCache(RColor* color);

// n pixels of a gradient colour from x in the raster's current row, each with the value that it has
// when computed singly.
void BuildGradientPixels(const RColor* color, S32 x, S32 n, RGBI* dst);

// The pixels x0..x1 of the raster's current row all have one colour, `value`. Never true for a
// radial gradient.
bool GradientIsFlat(const RColor* color, S32 x0, S32 x1, Lanes* value);
