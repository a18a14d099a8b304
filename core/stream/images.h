// Decoding of image tags into the pixels of their characters.
#pragma once

#include "core/geom/types.h"

struct SCharacter;

// A stretch of movie data.
struct SByteBlock {
    const U8* data;
    S32 size;
};

// Creates the pixels of `ch` and decodes the JPEG image into them. Its tables may come first in
// `image`, as a stream of their own, or in `tables` (which may be empty or broken). Returns how
// many rows were decoded, all of them opaque; the rows after them are zero. 0 when there is no
// image, none of one or three components, or no room for it; pixels may exist all the same.
S32 ReadJPEGImage(SByteBlock tables, SByteBlock image, SCharacter* ch);
