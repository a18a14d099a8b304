// Bitmap colours: how an image is sampled along a row of pixels.
#pragma once

#include "core/raster/rcolor.h"

// What a colour transform makes of each channel value, premultiplying included. Made once with the
// colour's cache.
struct RChannelMaps {
    U8 red[256];
    U8 green[256];
    U8 blue[256];
    U8 alpha[256];
    U8 transparent; // the result may be transparent
};

// Chooses how a bitmap colour is sampled and builds its palette or its channel maps; the pixels
// count one user more. False, and nothing to draw with, when there is no memory or no image.
bool BuildBitmapCache(RColor* color);
// Gives all that back.
void FreeBitmapCache(RColor* color);

// n pixels of a bitmap colour from x in the raster's current row, each as if computed singly.
void BuildBitmapPixels(const RColor* color, S32 x, S32 n, RGBI* dst);
