// CBitBuffer: the pixels a player draws into, and the pixel formats they can have.
//
// The raster knows nothing of formats: it produces premultiplied RGBI rows and hands them to the
// operations of the buffer's format. A further format is a further table of these operations.
#pragma once

#include "core/raster/color.h"

// Words are native. Formats without alpha drop it, so that a premultiplied colour shows over black.
enum CPixelFormat : S32 {
    kPixel32 = 0, // a word a << 24 | r << 16 | g << 8 | b, premultiplied
    kPixel16 = 1, // a word of 16 bits, 5-6-5 from red down
    kPixel15 = 2, // a word of 16 bits, 5-5-5 from red down; its highest bit is 0
    kPixel8 = 3,  // an index into the buffer's palette
};

struct CPalette;
struct SColorTable;

// How a screen is made. `dither`: in palette pixels an ordered pattern of 2 x 2, in 15 and 16 bits
// error diffusion along and down what is not one flat colour; nothing in 32 bits.
struct CScreenFormat {
    CPixelFormat pixels = kPixel32;
    bool bottomUp = false;
    bool dither = false;
    const SColorTable* palette = nullptr; // of kPixel8, see CBitBuffer::SetPalette; not owned
    S32 transparentIndex = -1;
};

// A row of pixels and what writing it takes besides.
struct CRow {
    U8* bits = nullptr; // column 0
    S32 y = 0;          // row of the picture, from the top: dither patterns hang on it
    const CPalette* palette = nullptr; // of a palette format; null: the default one
    // With error diffusion what the row above left for column 0, in 16ths: blue, green, red, then
    // the next column, from one before the first to one after the last. Null: nothing diffuses.
    S16* errors = nullptr;
    S16* nextErrors = nullptr; // ... and what this row leaves for the one below
};

// What a format can do with `n` pixels from column x of a row. Sources are premultiplied.
struct CPixelOps {
    int bitsPerPixel;
    bool isWords;  // rows hold the words that copyRow takes as they are
    bool diffuses; // writeRow, copyRow and rampRow use the row's errors, from left to right
    // A colour as fillRow takes it: the pixel, or four of them in a dithered format. Of `row` only
    // the palette counts.
    U32 (*pack)(const CRow& row, const RGBI& c);
    void (*readRow)(const CRow& row, S32 x, RGBI* dst, S32 n);
    void (*writeRow)(const CRow& row, S32 x, const RGBI* src, S32 n);
    void (*fillRow)(const CRow& row, S32 x, U32 packed, S32 n);
    // `n` opaque pixels given as words a << 24 | r << 16 | g << 8 | b.
    void (*copyRow)(const CRow& row, S32 x, const U32* src, S32 n);
    // The same through an index row: pixel i is ramp[index[i]].
    void (*rampRow)(const CRow& row, S32 x, const U32* ramp, const U16* index, S32 n);
};

// The operations of a format; never null, and the 32-bit ones for a format that does not exist.
const CPixelOps* PixelOps(CPixelFormat format, bool dither = false);

// The tables behind that.
extern const CPixelOps kOps16, kOps16Diffused, kOps15, kOps15Diffused; // pixels16.cpp
extern const CPixelOps kOps8, kOps8Dithered;                           // pixels8.cpp

// Pixels in memory, owned, with a palette of their own where the format has one. Rows are stored
// top down or bottom up; RowAddr hides which.
class CBitBuffer {
public:
    // Greatest width and height, and greatest number of pixels, of a buffer.
    static constexpr S32 kMaxSide = 8192;

    CBitBuffer() = default;
    ~CBitBuffer();
    CBitBuffer(const CBitBuffer&) = delete;
    CBitBuffer& operator=(const CBitBuffer&) = delete;

    // Allocates width x height zeroed pixels in place of what was there. False (and no pixels) when
    // a side is not positive or above kMaxSide, or when the heap is exhausted.
    bool CreateScreenBits(S32 width, S32 height, CPixelFormat format = kPixel32,
                          bool bottomUp = false);
    bool CreateScreenBits(S32 width, S32 height, const CScreenFormat& screen);
    void FreeBits();

    // The colours that a palette format has from now on: a copy of the table's valid entries,
    // taken as opaque, or of the default palette (a cube of 6 x 6 x 6, then greys) when there are
    // none. Pixels keep their indices. `transparentIndex` (none: -1) stands for alpha below 128 and
    // for no colour. False, with the palette as it was, when the heap is exhausted.
    bool SetPalette(const SColorTable* table, S32 transparentIndex = -1);
    // See CScreenFormat.
    void SetDither(bool on) { dither = on; }

    bool HasBits() const { return base != nullptr; }
    S32 Width() const { return width; }
    S32 Height() const { return height; }
    S32 RowBytes() const { return rowBytes; }
    CPixelFormat Format() const { return format; }
    const CPixelOps* Ops() const { return PixelOps(format, dither); }
    // The palette in use; null: the default one.
    const CPalette* Palette() const { return palette; }
    // Row y counted from the top of the picture, 0 <= y < Height().
    U8* RowAddr(S32 y) { return base + size_t(bottomUp ? height - 1 - y : y) * rowBytes; }
    const U8* RowAddr(S32 y) const { return const_cast<CBitBuffer*>(this)->RowAddr(y); }
    // The same with what the operations need besides; without error diffusion.
    CRow Row(S32 y) { return {RowAddr(y), y, palette}; }
    // Row y of a 32-bit buffer.
    const U32* Row32(S32 y) const { return reinterpret_cast<const U32*>(RowAddr(y)); }

private:
    U8* base = nullptr;
    S32 width = 0;
    S32 height = 0;
    S32 rowBytes = 0;
    CPixelFormat format = kPixel32;
    bool bottomUp = false;
    bool dither = false;
    CPalette* palette = nullptr;
};
