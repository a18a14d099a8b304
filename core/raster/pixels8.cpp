// Palette pixels, plain and dithered. A dithered pixel depends on its colour and its place alone,
// so that a row of single pixels is the same as a fill, and a repaint the same as the first paint.
#include <algorithm>
#include <cstring>

#include "core/raster/bit_buffer.h"
#include "core/raster/palette.h"

namespace {

constexpr U32 kAllFour = 0x01010101;

const CPalette& PaletteOf(const CRow& row)
{
    return row.palette ? *row.palette : DefaultPalette();
}

// With an index for "no colour" a pixel is either that or opaque: a premultiplied colour gets back
// what alpha took.
U32 Opaque(U32 c)
{
    U32 alpha = c >> 24;
    auto whole = [=](U32 v) { return std::min((v * 255 + alpha / 2) / alpha, 255u); };
    return whole(c >> 16 & 255) << 16 | whole(c >> 8 & 255) << 8 | whole(c & 255);
}

// `look(colour)` for a colour given as a word with alpha; `none` where it does not show.
template <typename Look> inline U32 Find(const CPalette& palette, U32 c, U32 none, Look look)
{
    if (palette.transparent < 0 || c >= 0xFF000000)
        return look(c);
    return c < 0x80000000 ? none : look(Opaque(c));
}

template <bool kDithered> U32 PackColor(const CRow& row, const RGBI& c)
{
    const CPalette& palette = PaletteOf(row);
    U32 none = U32(palette.transparent) * kAllFour;
    return Find(palette, PackLanes(ToLanes(c)), none, [&](U32 rgb) {
        return kDithered ? palette.Pattern(rgb) : palette.Nearest(rgb) * kAllFour;
    });
}

void ReadRow(const CRow& row, S32 x, RGBI* dst, S32 n)
{
    const CPalette& palette = PaletteOf(row);
    for (S32 i = 0; i < n; ++i) {
        U8 index = row.bits[x + i];
        U32 alpha = index == palette.transparent ? 0 : 0xFF000000;
        dst[i] = alpha ? FromLanes(UnpackLanes(palette.colors[index] | alpha)) : RGBI();
    }
}

// Two by two from column x, whose place in the pattern is the row's.
void FillRow(const CRow& row, S32 x, U32 packed, S32 n)
{
    U32 pair = packed >> (row.y & 1 ? 16 : 0);
    U8* dst = row.bits + x;
    if (((pair ^ pair >> 8) & 255) == 0) {
        std::memset(dst, int(pair & 255), size_t(n));
        return;
    }
    U8 block[16];
    for (U32 i = 0; i < sizeof block; ++i)
        block[i] = U8(pair >> (8 * ((U32(x) + i) & 1)));
    S32 done = 0;
    for (; done + S32(sizeof block) <= n; done += S32(sizeof block))
        std::memcpy(dst + done, block, sizeof block);
    std::memcpy(dst + done, block, size_t(n - done));
}

// The three ways that pixels come as one: `pixel(i)` is pixel i as a word.
template <bool kDithered, typename Source>
inline void Write(const CRow& row, S32 x, S32 n, Source pixel)
{
    const CPalette& palette = PaletteOf(row);
    U32 none = U32(palette.transparent);
    S32 rowShift = row.y & 1 ? 16 : 0;
    U8* dst = row.bits + x;
    for (S32 i = 0; i < n; ++i) {
        S32 shift = rowShift + ((x + i) & 1) * 8;
        dst[i] = U8(Find(palette, pixel(i), none, [&](U32 rgb) {
            return kDithered ? palette.Pattern(rgb) >> shift & 255 : palette.Nearest(rgb);
        }));
    }
}

template <bool kDithered> void WriteRow(const CRow& row, S32 x, const RGBI* src, S32 n)
{
    Write<kDithered>(row, x, n, [=](S32 i) { return PackLanes(ToLanes(src[i])); });
}

template <bool kDithered> void CopyRow(const CRow& row, S32 x, const U32* src, S32 n)
{
    Write<kDithered>(row, x, n, [=](S32 i) { return src[i] | 0xFF000000; });
}

template <bool kDithered>
void RampRow(const CRow& row, S32 x, const U32* ramp, const U16* index, S32 n)
{
    Write<kDithered>(row, x, n, [=](S32 i) { return ramp[index[i]] | 0xFF000000; });
}

template <bool kDithered>
constexpr CPixelOps kOps = {8,
                            false,
                            false,
                            PackColor<kDithered>,
                            ReadRow,
                            WriteRow<kDithered>,
                            FillRow,
                            CopyRow<kDithered>,
                            RampRow<kDithered>};

} // namespace

constexpr CPixelOps kOps8 = kOps<false>;
constexpr CPixelOps kOps8Dithered = kOps<true>;
