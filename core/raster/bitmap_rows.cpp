#include "core/raster/bitmap_rows.h"

#include <algorithm>
#include <bit>
#include <cstring>

#include "core/raster/lanes8.h"
#include "core/raster/raster.h"

namespace {
// v modulo m, never negative; m > 0.
S64 Wrap(S64 v, S64 m)
{
    const S64 rest = v % m;
    return rest < 0 ? rest + m : rest;
}

// The same for a v that is rarely more than one m away.
S64 Tile(S64 v, S64 m)
{
    const S64 next = v < 0 ? v + m : v >= m ? v - m : v;
    return next >= 0 && next < m ? next : Wrap(v, m);
}

// One pixel of an image as a word, by format: column x of a row.
struct Source {
    const U8* base;
    S64 rowBytes;
    const U32* palette;

    explicit Source(const RColor* c)
        : base(c->bitmap->baseAddr), rowBytes(c->bitmap->rowBytes), palette(c->bitmapPalette)
    {
    }
    const U8* Row(S64 y) const { return base + y * rowBytes; }
};

template <int bits> struct IndexedSource : Source {
    using Source::Source;
    U32 In(const U8* row, S64 x) const
    {
        constexpr int perByte = 8 / bits;
        const int shift = bits * int(perByte - 1 - (x & (perByte - 1)));
        return palette[U32(row[x / perByte]) >> shift & ((1u << bits) - 1)];
    }
};

struct Source16 : Source {
    using Source::Source;
    U32 In(const U8* row, S64 x) const
    {
        U16 v;
        std::memcpy(&v, row + 2 * x, sizeof v);
        return 0xFF000000 | U32(pix16Expand[v >> 10 & 31]) << 16 |
               U32(pix16Expand[v >> 5 & 31]) << 8 | pix16Expand[v & 31];
    }
};

struct Source32 : Source {
    using Source::Source;
    U32 In(const U8* row, S64 x) const
    {
        U32 v;
        std::memcpy(&v, row + 4 * x, sizeof v);
        return v;
    }
};

template <typename S> U32 At(const S& source, S64 x, S64 y)
{
    return source.In(source.Row(y), x);
}

// The loops write channels to be blended, or finished words.
void Put(RGBI* dst, U32 word)
{
    *dst = FromLanes(UnpackLanes(word));
}
void Put(U32* dst, U32 word)
{
    *dst = word;
}
void PutLanes(RGBI* dst, Lanes v)
{
    *dst = FromLanes(v);
}
void PutLanes(U32* dst, Lanes v)
{
    *dst = PackLanes(v);
}

// Where a row's pixels lie in the image, 16.16. Kept in 64 bits: far out the tiles go on.
struct RowWalk {
    S64 u, v, du, dv;
    S64 width, height; // 16.16
    bool tiled;

    RowWalk(const RColor* c, S32 x) : tiled(BitmapTiles(c))
    {
        const MATRIX& m = c->bitmapInv;
        const S64 y = c->raster->CurrentRow();
        u = S64(m.a) * x + S64(m.c) * y + c->bitmapStart.x;
        v = S64(m.b) * x + S64(m.d) * y + c->bitmapStart.y;
        du = m.a;
        dv = m.b;
        width = S64(c->bitmap->width) << 16;
        height = S64(c->bitmap->height) << 16;
        Skip(0);
    }

    // How many of the next n pixels lie inside the image less `border` pixels at its right and
    // lower sides, without a gap.
    S32 Inside(S32 n, S64 border) const
    {
        return Steps(v, dv, height - border, Steps(u, du, width - border, n));
    }

    void Skip(S32 n)
    {
        u += n * du;
        v += n * dv;
        if (tiled && (U64(u) >= U64(width) || U64(v) >= U64(height))) {
            u = Tile(u, width);
            v = Tile(v, height);
        }
    }

private:
    static S32 Steps(S64 at, S64 step, S64 end, S32 n)
    {
        if (n == 0 || at < 0 || at >= end)
            return 0;
        const S64 last = at + (n - 1) * step;
        if (last >= 0 && last < end)
            return n;
        return S32((step > 0 ? (end - 1 - at) / step : at / -step) + 1);
    }
};

template <typename S, typename Out> void PlainRow(const RColor* c, S32 x, S32 n, Out* dst)
{
    const S source(c);
    const S64 lastX = c->bitmap->width - 1, lastY = c->bitmap->height - 1;
    RowWalk at(c, x);
    for (S32 run; n > 0; at.Skip(run), dst += run, n -= run) {
        run = at.Inside(n, 0);
        S64 u = at.u, v = at.v;
        if (run > 0 && at.dv == 0) {
            const U8* row = source.Row(v >> 16);
            for (S32 i = 0; i < run; ++i, u += at.du)
                Put(dst + i, source.In(row, u >> 16));
            continue;
        }
        for (S32 i = 0; i < run; ++i, u += at.du, v += at.dv)
            Put(dst + i, At(source, u >> 16, v >> 16));
        if (run > 0)
            continue;
        Put(dst,
            At(source, std::clamp<S64>(u >> 16, 0, lastX), std::clamp<S64>(v >> 16, 0, lastY)));
        run = 1;
    }
}

// The weights of PixCoverage, each once for every channel of its pixel: the upper two pixels of the
// four, then the lower two.
struct PairWeights {
    Lanes8 upper;
    Lanes8 lower;
};

PairWeights kPairWeights[8][8]; // by the eighths of y, then of x

void FillPairWeights()
{
    for (S32 i = 0; i < 64; ++i) {
        const U8* w = PixCoverage(i >> 3 << 13, (i & 7) << 13);
        PairWeights& pair = kPairWeights[i & 7][i >> 3];
        for (int k = 0; k < 8; ++k) {
            pair.upper[k] = w[k / 4];
            pair.lower[k] = w[2 + k / 4];
        }
    }
}

using Bytes8 = U8 __attribute__((vector_size(8)));
using Bytes16 = U8 __attribute__((vector_size(16)));
using Words2 = U64 __attribute__((vector_size(16)));

// Two neighbouring words as channels.
Lanes8 LoadTwoWords(const U8* p)
{
    U64 words;
    std::memcpy(&words, p, sizeof words);
    const Bytes16 bytes = Bytes16(Words2{words, 0});
    const Bytes16 wide = __builtin_shufflevector(bytes, Bytes16{}, 0, 16, 1, 17, 2, 18, 3, 19, 4,
                                                 20, 5, 21, 6, 22, 7, 23);
    return Lanes8(wide);
}

void StoreTwo(RGBI* dst, Lanes8 v)
{
    StorePair(dst, v);
}
void StoreTwo(U32* dst, Lanes8 v)
{
    const Bytes8 bytes = __builtin_convertvector(v, Bytes8);
    std::memcpy(dst, &bytes, sizeof bytes);
}

// The sums of two pixels from their columns: the left one in the lower half, the right one in the
// upper half of each.
Lanes8 AddColumns(Lanes8 a, Lanes8 b)
{
    const Lanes8 left = __builtin_shufflevector(a, b, 0, 1, 2, 3, 8, 9, 10, 11);
    const Lanes8 right = __builtin_shufflevector(a, b, 4, 5, 6, 7, 12, 13, 14, 15);
    return (left + right) >> 3;
}

// Walks over pixels whose four neighbours exist. A level row, the usual case, stays on the same two
// rows of the image.
template <bool level> struct ColumnWalk {
    const Source32& source;
    U32 u, v, du, dv;
    const U8* upper;
    const U8* lower;
    const U8* weights;

    ColumnWalk(const Source32& s, const RowWalk& at)
        : source(s), u(U32(at.u)), v(U32(at.v)), du(U32(at.du)), dv(U32(at.dv))
    {
        FindRows();
    }
    Lanes8 Next()
    {
        if (!level)
            FindRows();
        const size_t x = 4 * size_t(u >> 16);
        // In bytes: the index needs no multiplication then.
        constexpr int shift = 13 - std::countr_zero(sizeof(PairWeights));
        constexpr U32 mask = 7 * sizeof(PairWeights);
        const auto& w = *reinterpret_cast<const PairWeights*>(weights + (u >> shift & mask));
        const Lanes8 sum = LoadTwoWords(upper + x) * w.upper + LoadTwoWords(lower + x) * w.lower;
        u += du;
        if (!level)
            v += dv;
        return sum;
    }

private:
    void FindRows()
    {
        upper = source.Row(v >> 16);
        lower = upper + source.rowBytes;
        weights = reinterpret_cast<const U8*>(kPairWeights[v >> 13 & 7]);
    }
};

// Two pixels at a time.
template <bool level, typename Out>
void SmoothWords(const Source32& source, const RowWalk& at, S32 n, Out* dst)
{
    ColumnWalk<level> walk(source, at);
    for (; n >= 2; n -= 2, dst += 2) {
        const Lanes8 first = walk.Next();
        StoreTwo(dst, AddColumns(first, walk.Next()));
    }
    if (n > 0) {
        const Lanes8 last = AddColumns(walk.Next(), Lanes8{});
        PutLanes(dst, Lanes(last[0]) | Lanes(last[1]) << 16 | Lanes(last[2]) << 32 |
                          Lanes(last[3]) << 48);
    }
}

template <typename Out> void SmoothRun(const Source32& source, const RowWalk& at, S32 n, Out* dst)
{
    if (n > 0 && at.dv == 0)
        SmoothWords<true>(source, at, n, dst);
    else if (n > 0)
        SmoothWords<false>(source, at, n, dst);
}

template <typename S> Lanes WeighFour(const S& source, S64 u, S64 v)
{
    const S64 ix = u >> 16, iy = v >> 16;
    const U8* w = PixCoverage(S32(u), S32(v));
    const Lanes sum =
        UnpackLanes(At(source, ix, iy)) * w[0] + UnpackLanes(At(source, ix + 1, iy)) * w[1] +
        UnpackLanes(At(source, ix, iy + 1)) * w[2] + UnpackLanes(At(source, ix + 1, iy + 1)) * w[3];
    return sum >> 3 & kLaneMask;
}

template <typename S, typename Out>
void SmoothRun(const S& source, const RowWalk& at, S32 n, Out* dst)
{
    S64 u = at.u, v = at.v;
    for (S32 i = 0; i < n; ++i, u += at.du, v += at.dv)
        PutLanes(dst + i, WeighFour(source, u, v));
}

// At the borders the weights of the pixels beyond go to their neighbours; pixels without weight,
// which may not exist, are not fetched.
template <typename S> Lanes WeighFolded(const S& source, const SBitmapCore* bitmap, S64 u, S64 v)
{
    S64 ix = u >> 16, iy = v >> 16;
    U32 w[4];
    std::copy_n(PixCoverage(S32(u), S32(v)), 4, w);
    FoldCoverage(bitmap, &ix, &iy, w);
    Lanes sum = 0;
    for (int k = 0; k < 4; ++k)
        sum += w[k] ? UnpackLanes(At(source, ix + (k & 1), iy + (k >> 1))) * w[k] : 0;
    return sum >> 3 & kLaneMask;
}

template <typename S, typename Out> void SmoothRow(const RColor* c, S32 x, S32 n, Out* dst)
{
    const S source(c);
    RowWalk at(c, x);
    for (S32 run; n > 0; at.Skip(run), dst += run, n -= run) {
        run = at.Inside(n, 0x10000);
        SmoothRun(source, at, run, dst);
        if (run > 0)
            continue;
        PutLanes(dst, WeighFolded(source, c->bitmap, at.u, at.v));
        run = 1;
    }
}

S64 UnscaledLine(const RColor* c, S32 y)
{
    const S64 line = S64(y) - c->bitmapOrigin.y, height = c->bitmap->height;
    return BitmapTiles(c) ? Wrap(line, height) : std::clamp<S64>(line, 0, height - 1);
}

template <typename S, typename Out> void UnscaledRow(const RColor* c, S32 x, S32 n, Out* dst)
{
    const S source(c);
    const S64 line = UnscaledLine(c, c->raster->CurrentRow());
    while (n > 0) {
        S32 column, count = n;
        const S32 step = UnscaledSegment(c, x, &column, &count) ? 0 : 1;
        for (S32 i = 0; i < count; ++i)
            Put(dst + i, At(source, column + i * step, line));
        x += count;
        dst += count;
        n -= count;
    }
}

// An image of one pixel is that colour everywhere.
template <typename S, typename Out> void OnePixelRow(const RColor* c, S32, S32 n, Out* dst)
{
    const U32 word = At(S(c), 0, 0);
    for (S32 i = 0; i < n; ++i)
        Put(dst + i, word);
}

template <typename S> void ChooseRows(RColor* c)
{
    if (c->bitmap->width == 1 && c->bitmap->height == 1) {
        c->bitmapRow = OnePixelRow<S, RGBI>;
        c->bitmapWords = OnePixelRow<S, U32>;
    } else if (c->bitmapUnscaled) {
        c->bitmapRow = UnscaledRow<S, RGBI>;
        c->bitmapWords = UnscaledRow<S, U32>;
    } else if (c->raster->Smoothing()) {
        c->bitmapRow = SmoothRow<S, RGBI>;
        c->bitmapWords = SmoothRow<S, U32>;
    } else {
        c->bitmapRow = PlainRow<S, RGBI>;
        c->bitmapWords = PlainRow<S, U32>;
    }
}
} // namespace

void ChooseBitmapRows(RColor* c)
{
    switch (c->bitmap->bmFormat) {
    case 0:
        return ChooseRows<IndexedSource<1>>(c);
    case 1:
        return ChooseRows<IndexedSource<2>>(c);
    case 2:
        return ChooseRows<IndexedSource<4>>(c);
    case 3:
        return ChooseRows<IndexedSource<8>>(c);
    case 4:
        return ChooseRows<Source16>(c);
    default:
        return ChooseRows<Source32>(c);
    }
}

const U32* UnscaledWords(const RColor* c, S32 y)
{
    return reinterpret_cast<const U32*>(Source(c).Row(UnscaledLine(c, y)));
}

bool UnscaledSegment(const RColor* c, S32 x, S32* column, S32* n)
{
    const S64 width = c->bitmap->width;
    S64 at = S64(x) - c->bitmapOrigin.x;
    if (BitmapTiles(c))
        at = Wrap(at, width);
    *column = S32(std::clamp<S64>(at, 0, width - 1));
    const bool left = at < 0, right = at >= width;
    if (!right)
        *n = S32(std::min<S64>(*n, left ? -at : width - at));
    return left || right;
}

void BuildBitmapTables()
{
    if (kPairWeights[0][0].upper[0] == 0)
        FillPairWeights();
}
