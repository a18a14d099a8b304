#include "core/raster/bit_buffer.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "core/player/limits.h"
#include "core/raster/palette.h"

static U32 Pack32(const CRow&, const RGBI& c)
{
    return PackLanes(ToLanes(c));
}

static U32* Pixels32(const CRow& row, S32 x)
{
    return reinterpret_cast<U32*>(row.bits) + x;
}

static void ReadRow32(const CRow& row, S32 x, RGBI* dst, S32 n)
{
    const U32* src = Pixels32(row, x);
    for (S32 i = 0; i < n; ++i)
        dst[i] = FromLanes(UnpackLanes(src[i]));
}

static void WriteRow32(const CRow& row, S32 x, const RGBI* src, S32 n)
{
    U32* dst = Pixels32(row, x);
    for (S32 i = 0; i < n; ++i)
        dst[i] = PackLanes(ToLanes(src[i]));
}

static void FillRow32(const CRow& row, S32 x, U32 packed, S32 n)
{
    std::fill_n(Pixels32(row, x), n, packed);
}

static void CopyRow32(const CRow& row, S32 x, const U32* src, S32 n)
{
    std::memcpy(Pixels32(row, x), src, size_t(n) * sizeof(U32));
}

static void RampRow32(const CRow& row, S32 x, const U32* ramp, const U16* index, S32 n)
{
    U32* dst = Pixels32(row, x);
    for (S32 i = 0; i < n; ++i)
        dst[i] = ramp[index[i]];
}

static const CPixelOps kOps32 = {32,         true,      false,     Pack32,   ReadRow32,
                                 WriteRow32, FillRow32, CopyRow32, RampRow32};

const CPixelOps* PixelOps(CPixelFormat format, bool dither)
{
    static constexpr const CPixelOps* kTables[][2] = {{&kOps32, &kOps32},
                                                      {&kOps16, &kOps16Diffused},
                                                      {&kOps15, &kOps15Diffused},
                                                      {&kOps8, &kOps8Dithered}};
    return kTables[U32(format) <= kPixel8 ? format : kPixel32][dither];
}

CBitBuffer::~CBitBuffer()
{
    FreeBits();
    std::free(palette);
}

bool CBitBuffer::CreateScreenBits(S32 w, S32 h, CPixelFormat pixelFormat, bool rowsBottomUp)
{
    FreeBits();
    if (w <= 0 || h <= 0 || w > kMaxSide || h > kMaxSide || U32(w) * U32(h) > gLimits.surfacePixels)
        return false;
    // Rows start at multiples of 16 bytes.
    S32 bytes = ((w * PixelOps(pixelFormat)->bitsPerPixel + 127) >> 7) << 4;
    base = static_cast<U8*>(std::calloc(size_t(h), size_t(bytes)));
    if (!base)
        return false;
    width = w;
    height = h;
    rowBytes = bytes;
    format = pixelFormat;
    bottomUp = rowsBottomUp;
    return true;
}

bool CBitBuffer::CreateScreenBits(S32 w, S32 h, const CScreenFormat& screen)
{
    dither = screen.dither;
    if (screen.pixels == kPixel8 && !SetPalette(screen.palette, screen.transparentIndex))
        return false;
    return CreateScreenBits(w, h, screen.pixels, screen.bottomUp);
}

bool CBitBuffer::SetPalette(const SColorTable* table, S32 transparentIndex)
{
    if (!palette)
        palette = static_cast<CPalette*>(std::malloc(sizeof(CPalette)));
    if (palette)
        palette->Build(table, transparentIndex);
    return palette != nullptr;
}

void CBitBuffer::FreeBits()
{
    std::free(base);
    base = nullptr;
    width = height = rowBytes = 0;
}
