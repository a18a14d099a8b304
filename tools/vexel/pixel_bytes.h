// The player's pixels as the bytes that files hold.
#pragma once

#include "core/geom/types.h"

// A premultiplied word a << 24 | r << 16 | g << 8 | b with its colours divided by alpha and rounded
// to the nearest; 0 where nothing shows.
U32 StraightPixel(U32 pixel);

// Puts n pixels as R, G, B; alpha is left out. Returns the end of what was put.
U8* PutRgb(const U32* from, S32 n, U8* to);
// Puts n pixels as R, G, B, A, colours not premultiplied. Returns the end of what was put.
U8* PutRgba(const U32* from, S32 n, U8* to);
