// SBitmapCore: the store of one decoded bitmap. Only its life cycle is here so far: a store begins
// empty, and whoever decodes the image attaches the pixels.
#pragma once

#include "core/geom/types.h"

// Colour table of a colour-mapped bitmap; an entry is alpha << 24 | red << 16 | green << 8 | blue.
struct SColorTable {
    U32 count; // valid entries, at most 256
    U32 colors[256];
};

struct SBitmapCore {
    U8* baseAddr;      // pixel rows, heap memory owned by the bitmap; null when there are none
    SColorTable* cTab; // owned colour table of the colour-mapped formats, else null
    S32 bmFormat;      // 0 to 3: 1, 2, 4, 8 bit colour-mapped; 4: 5-5-5; 5: 32 bit with alpha
    S32 width;         // pixels per row
    S32 height;        // rows
    S32 rowBytes;      // bytes from one row to the next
    S32 useCount;      // users while the pixels are being built
    S32 transparent;   // 1 when some pixel may have an alpha below 255

    // Empties the store without freeing anything: for a record that has never held pixels.
    void PIInit();
    // Frees the pixels and the colour table; safe to call twice.
    void PIFree();
};
