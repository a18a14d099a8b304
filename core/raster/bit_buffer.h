// CBitBuffer: the pixels a player draws into, and the pixel formats they can have.
//
// The raster knows nothing of formats: it produces premultiplied RGBI rows and hands them to the
// operations of the buffer's format. A further format is a further table of these operations.
#pragma once

#include "core/raster/color.h"

enum CPixelFormat : S32 {
    kPixel32 = 0, // one native word a << 24 | r << 16 | g << 8 | b, premultiplied
};

struct CPalette;

// A row of pixels and what writing it takes besides.
struct CRow {
    U8* bits = nullptr; // column 0
    S32 y = 0;          // row of the picture, from the top: dither patterns hang on it
    const CPalette* palette = nullptr; // of a palette format
    S16* errors = nullptr;     // with error diffusion: what the row above left for each channel of
                               // each column, blue first, one pixel more on both sides
    S16* nextErrors = nullptr; // ... and what this row leaves for the one below
};

// What a format can do with `n` pixels from column x of a row. Sources are premultiplied.
struct CPixelOps {
    int bitsPerPixel;
    // A colour as the format stores it, for fillRow. Of `row` only the palette counts.
    U32 (*pack)(const CRow& row, const RGBI& c);
    void (*readRow)(const CRow& row, S32 x, RGBI* dst, S32 n);
    void (*writeRow)(const CRow& row, S32 x, const RGBI* src, S32 n);
    void (*fillRow)(const CRow& row, S32 x, U32 packed, S32 n);
    // `n` opaque pixels given as words a << 24 | r << 16 | g << 8 | b.
    void (*copyRow)(const CRow& row, S32 x, const U32* src, S32 n);
    // The same through an index row: pixel i is ramp[index[i]].
    void (*rampRow)(const CRow& row, S32 x, const U32* ramp, const U16* index, S32 n);
};

// The operations of a format; never null.
const CPixelOps* PixelOps(CPixelFormat format);

// Pixels in memory, owned. Rows are stored top down or bottom up; RowAddr hides which.
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
    void FreeBits();

    bool HasBits() const { return base != nullptr; }
    S32 Width() const { return width; }
    S32 Height() const { return height; }
    S32 RowBytes() const { return rowBytes; }
    CPixelFormat Format() const { return format; }
    const CPixelOps* Ops() const { return PixelOps(format); }
    // Row y counted from the top of the picture, 0 <= y < Height().
    U8* RowAddr(S32 y) { return base + size_t(bottomUp ? height - 1 - y : y) * rowBytes; }
    const U8* RowAddr(S32 y) const { return const_cast<CBitBuffer*>(this)->RowAddr(y); }
    // The same with what the operations need besides; without error diffusion.
    CRow Row(S32 y) { return {RowAddr(y), y}; }
    // Row y of a 32-bit buffer.
    const U32* Row32(S32 y) const { return reinterpret_cast<const U32*>(RowAddr(y)); }

private:
    U8* base = nullptr;
    S32 width = 0;
    S32 height = 0;
    S32 rowBytes = 0;
    CPixelFormat format = kPixel32;
    bool bottomUp = false;
};
