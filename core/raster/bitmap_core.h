// SBitmapCore: the store of one decoded image, and the two ways of fetching a pixel from it.
#pragma once

#include <cstddef>

#include "core/geom/types.h"
#include "core/raster/color.h"

// Colour table of a colour-mapped image; an entry is alpha << 24 | red << 16 | green << 8 | blue.
struct SColorTable {
    U32 count; // valid entries, at most 256
    U32 colors[256];
};

// The pixels of one image, in one of six formats:
//   0 to 3  1, 2, 4 and 8 bits: index into the colour table, the leftmost pixel in the high bits
//   4       16 bits, a native word: red in bits 10-14, green 5-9, blue 0-4
//   5       32 bits, a native word laid out like a colour table entry
// Rows are padded to 32 bits. A store begins empty with PIInit; who decodes the image creates it
// and writes the pixels. Colours are those of a premultiplied picture: who writes them keeps every
// channel at or below the pixel's alpha. No side is longer than kMaxSide.
struct SBitmapCore {
    static constexpr S32 kMaxSide = 65535;

    U8* baseAddr;      // pixel rows, heap memory owned by the bitmap; null when there are none
    SColorTable* cTab; // owned colour table of formats 0 to 3, unused entries zero; else null
    S32 bmFormat;      // 0 to 5
    S32 width;         // pixels per row
    S32 height;        // rows
    S32 rowBytes;      // bytes from one row to the next
    S32 useCount;      // cached colours that paint with the pixels, which must stay meanwhile
    S32 transparent;   // 1 when some pixel may have an alpha below 255
    U8 buildFailed;    // there are no pixels to be had: not tried again until FreeCache

    // Empties the store without freeing anything: for a record that has never held pixels.
    void PIInit();
    // Makes a store of zeroed pixels, with a copy of the first `count` entries of `ctab` (at most
    // 256) for formats 0 to 3. Returns 1, or 0 when a side is not 1..kMaxSide, the format is
    // unknown or has no table, the pixels are more than gLimits.bitmapPixels, or memory is
    // exhausted; then PIFree frees what was allocated. The store must be empty; `flag` is ignored.
    int PICreate(int format, int w, int h, const SColorTable* ctab, int flag);
    // Frees the pixels and the colour table; safe to call twice.
    void PIFree();

    // What w x h pixels count for in the budgets of all who keep images: no less than a colour
    // table takes.
    static U64 PixelCost(S32 w, S32 h)
    {
        const U64 pixels = U64(w) * U64(h);
        return pixels > 512 ? pixels : 512;
    }
    // The same of this store, 0 when there are none.
    U64 PixelCost() const { return baseAddr ? PixelCost(width, height) : 0; }

    // The colour at (x, y); outside the image the nearest edge pixel's. The store must have pixels.
    void GetRGBPixel(int x, int y, RGBI* dst) const;
    // The colour at a 16.16 position, weighted from the four pixels around it.
    void GetSSRGBPixel(S32 x, S32 y, RGBI* dst) const;

    // The colour of a pixel inside the image as a word laid out like a colour table entry.
    U32 PixelWord(S32 x, S32 y) const;
};

// Bytes of a row of `width` pixels, its padding included; 0 for an unknown format.
S32 SBitmapCalcRowbytes(int format, int width);
// 0 for an unknown format.
S32 SBitmapBitsPerPixel(int format);
// Some valid entry has an alpha below 255. Null is allowed.
bool HasTransparent(const SColorTable* ctab);
// Reverses the bytes of every 16-bit (format 4) or 32-bit (format 5) unit, in groups of four bytes;
// a rest of fewer than four, and other formats, stay as they are.
void SBitmapSwapBits(void* bits, size_t byteCount, int format);

// 5-bit channels widened to 8 bits. 12 and 28 repeat their predecessors: movies were drawn so.
extern const U8 pix16Expand[32];

// The sets of weights: bits 3-5 of the index are the eighths of x, bits 0-2 those of y.
struct SPixCoverage {
    U8 sets[64][4];
};
extern const SPixCoverage kPixCoverage;

// The weights, in eighths, of the pixels (ix, iy), (ix + 1, iy), (ix, iy + 1), (ix + 1, iy + 1) for
// a 16.16 position: by the eighths of a pixel in its fractions.
inline const U8* PixCoverage(S32 x, S32 y)
{
    return kPixCoverage.sets[(x >> 10 & 0x38) | (y >> 13 & 7)];
}

// At the borders of the image: moves the weights of pixels beyond it to their neighbours inside,
// and (ix, iy) with them. Pixels left without weight may lie outside: they are not to be fetched.
void FoldCoverage(const SBitmapCore* bitmap, S64* ix, S64* iy, U32* w);
