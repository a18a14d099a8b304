// Gradient colours: the built ramp and the walk along a row of pixels.
#pragma once

#include "core/raster/rcolor.h"

// Builds the ramp of a gradient colour and chooses its procedures. Without memory for the ramp, or
// without stops, the colour draws nothing.
void BuildGradientCache(RColor* color);

// The ramp index of each of n pixels from x in the raster's current row, each computed by itself:
// what single pixels have. Rows made of single pixels use it too, so that both always agree.
void GradientPixelIndices(const RColor* color, S32 x, S32 n, U16* index);
