// The formats of 16 and 15 bits a pixel, plain and with error diffusion. A solid colour is the same
// word in both, so that flat areas stay flat.
#include <algorithm>

#include "core/raster/bit_buffer.h"

namespace {

// Of words a << 24 | r << 16 | g << 8 | b.
constexpr U16 Pack565(U32 c)
{
    return U16((c >> 8 & 0xF800) | (c >> 5 & 0x07E0) | (c >> 3 & 0x001F));
}

constexpr U16 Pack555(U32 c)
{
    return U16((c >> 9 & 0x7C00) | (c >> 6 & 0x03E0) | (c >> 3 & 0x001F));
}

// Few bits widened to eight, so that all of them set are 255.
constexpr U32 Widen(U32 v, int bits)
{
    return v << (8 - bits) | v >> (2 * bits - 8);
}

// What a channel value becomes in so many bits, nearest first, and what that shows.
template <int kBits> struct Nearest {
    U8 stored[256];
    U8 shown[256];
};

template <int kBits> constexpr Nearest<kBits> MakeNearest()
{
    Nearest<kBits> t = {};
    U32 v = 0;
    for (U32 c = 0; c < 256; ++c) {
        // The next level as soon as it is nearer.
        while (v + 1 < 1u << kBits && 2 * c > Widen(v, kBits) + Widen(v + 1, kBits))
            ++v;
        t.stored[c] = U8(v);
        t.shown[c] = U8(Widen(v, kBits));
    }
    return t;
}

constexpr Nearest<5> kNearest5 = MakeNearest<5>();
constexpr Nearest<6> kNearest6 = MakeNearest<6>();

struct Format565 {
    static constexpr U16 Pack(U32 c) { return Pack565(c); }
    static constexpr int kGreenBits = 6;
    static constexpr const Nearest<6>& kGreen = kNearest6;
};

struct Format555 {
    static constexpr U16 Pack(U32 c) { return Pack555(c); }
    static constexpr int kGreenBits = 5;
    static constexpr const Nearest<5>& kGreen = kNearest5;
};

U16* Pixels16(const CRow& row, S32 x)
{
    return reinterpret_cast<U16*>(row.bits) + x;
}

template <typename Format> U32 PackColor(const CRow&, const RGBI& c)
{
    return Format::Pack(PackLanes(ToLanes(c)));
}

template <typename Format> void ReadRow(const CRow& row, S32 x, RGBI* dst, S32 n)
{
    constexpr int kRedShift = 5 + Format::kGreenBits;
    const U16* src = Pixels16(row, x);
    for (S32 i = 0; i < n; ++i) {
        U32 green = src[i] >> 5 & ((1u << Format::kGreenBits) - 1);
        dst[i] = {U16(Widen(src[i] & 31, 5)), U16(Widen(green, Format::kGreenBits)),
                  U16(Widen(src[i] >> kRedShift & 31, 5)), 255};
    }
}

void FillRow(const CRow& row, S32 x, U32 packed, S32 n)
{
    std::fill_n(Pixels16(row, x), n, U16(packed));
}

// The three ways that pixels come as one: `pixel(i)` is pixel i as a word.
template <typename Format, typename Source>
inline void WritePlain(const CRow& row, S32 x, S32 n, Source pixel)
{
    U16* dst = Pixels16(row, x);
    for (S32 i = 0; i < n; ++i)
        dst[i] = Format::Pack(pixel(i));
}

// One channel of a pixel with its share of the errors around it. What it misses by is passed on,
// all of it, in sixteenths: 7 to the right, 3, 5 and 1 below.
template <int kBits> inline U32 Diffuse(const Nearest<kBits>& table, U32 value, S16* at, S16* below)
{
    S32 wanted = std::clamp(S32(value) * 16 + at[0], 0, 255 * 16);
    S32 c = (wanted + 8) >> 4;
    S32 miss = wanted - table.shown[c] * 16;
    S32 right = miss * 7 >> 4, belowLeft = miss * 3 >> 4, straight = miss * 5 >> 4;
    at[3] = S16(at[3] + right);
    below[-3] = S16(below[-3] + belowLeft);
    below[0] = S16(below[0] + straight);
    below[3] = S16(below[3] + miss - right - belowLeft - straight);
    return table.stored[c];
}

template <typename Format, typename Source>
inline void WriteDiffused(const CRow& row, S32 x, S32 n, Source pixel)
{
    if (!row.errors || !row.nextErrors) {
        WritePlain<Format>(row, x, n, pixel);
        return;
    }
    U16* dst = Pixels16(row, x);
    S16* at = row.errors + 3 * x;
    S16* below = row.nextErrors + 3 * x;
    for (S32 i = 0; i < n; ++i, at += 3, below += 3) {
        U32 c = pixel(i);
        U32 blue = Diffuse(kNearest5, c & 255, at, below);
        U32 green = Diffuse(Format::kGreen, c >> 8 & 255, at + 1, below + 1);
        U32 red = Diffuse(kNearest5, c >> 16 & 255, at + 2, below + 2);
        dst[i] = U16(red << (5 + Format::kGreenBits) | green << 5 | blue);
    }
}

template <typename Format, bool kDiffused, typename Source>
inline void Write(const CRow& row, S32 x, S32 n, Source pixel)
{
    if constexpr (kDiffused)
        WriteDiffused<Format>(row, x, n, pixel);
    else
        WritePlain<Format>(row, x, n, pixel);
}

template <typename Format, bool kDiffused>
void WriteRow(const CRow& row, S32 x, const RGBI* src, S32 n)
{
    Write<Format, kDiffused>(row, x, n, [=](S32 i) { return PackLanes(ToLanes(src[i])); });
}

template <typename Format, bool kDiffused>
void CopyRow(const CRow& row, S32 x, const U32* src, S32 n)
{
    Write<Format, kDiffused>(row, x, n, [=](S32 i) { return src[i]; });
}

template <typename Format, bool kDiffused>
void RampRow(const CRow& row, S32 x, const U32* ramp, const U16* index, S32 n)
{
    Write<Format, kDiffused>(row, x, n, [=](S32 i) { return ramp[index[i]]; });
}

template <typename Format, bool kDiffused>
constexpr CPixelOps kOps = {16,
                            false,
                            kDiffused,
                            PackColor<Format>,
                            ReadRow<Format>,
                            WriteRow<Format, kDiffused>,
                            FillRow,
                            CopyRow<Format, kDiffused>,
                            RampRow<Format, kDiffused>};

} // namespace

constexpr CPixelOps kOps16 = kOps<Format565, false>;
constexpr CPixelOps kOps16Diffused = kOps<Format565, true>;
constexpr CPixelOps kOps15 = kOps<Format555, false>;
constexpr CPixelOps kOps15Diffused = kOps<Format555, true>;
