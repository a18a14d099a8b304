// Pictures as PNG.
#pragma once

#include "core/geom/grow_buffer.h"
#include "core/raster/bit_buffer.h"

// Puts the picture into `png` in place of what was there. With `alpha` as RGBA, the colours divided
// by their alpha and rounded to the nearest; else as RGB. False when memory is exhausted.
bool EncodePng(const CBitBuffer& picture, bool alpha, GrowBuffer<U8>* png);
