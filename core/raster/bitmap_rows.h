// The inner loops of bitmap colours: one for each pixel format of the image, way of sampling and
// kind of fill, chosen once per colour.
#pragma once

#include "core/raster/rcolor.h"

// Sets the loops of a bitmap colour whose palette and origin are set.
void ChooseBitmapRows(RColor* color);

inline bool BitmapTiles(const RColor* color)
{
    return !(color->bitmapType & 1);
}

// For an unscaled fill with a 32-bit image: the image's row that shows in pixel row y.
const U32* UnscaledWords(const RColor* color, S32 y);
// Of an unscaled fill: the image column at pixel x, and in *n, which comes with the pixels wanted,
// how many pixels from there on are neighbours in the image. True when they all repeat that one
// column instead, beside a clipped image.
bool UnscaledSegment(const RColor* color, S32 x, S32* column, S32* n);
