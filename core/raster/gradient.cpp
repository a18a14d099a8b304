#include "core/raster/gradient.h"

#include <algorithm>

#include "core/geom/point.h"
#include "core/raster/raster.h"

namespace {

constexpr S32 kPiece = 256; // pixels handled at once
constexpr S32 kLastEntry = kRampEntries - 1;

// kSquares[i] = min(i * i, 65535), for radial gradients without square roots.
U16 kSquares[kRampEntries + 1];

SRGB Mix(SRGB c0, SRGB c1, S32 w0, S32 w1)
{
    S32 span = w0 + w1;
    auto channel = [=](U8 a, U8 b) { return U8((a * w0 + b * w1) / span); };
    return {channel(c0.red, c1.red), channel(c0.green, c1.green), channel(c0.blue, c1.blue),
            channel(c0.alpha, c1.alpha)};
}

U32 PremultipliedPixel(SRGB c)
{
    RGBI v = {c.blue, c.green, c.red, c.alpha};
    Premultiply(&v);
    return PackLanes(ToLanes(v));
}

// The first colour reaches from entry 0 to the first stop, the last one from the last stop to the
// end.
void BuildRamp(const GradColorRamp& ramp, U32* built)
{
    S32 r0 = 0;
    S32 r1 = ramp.ratios[0];
    SRGB c0 = ramp.colors[0];
    SRGB c1 = c0;
    int stop = 0;
    for (S32 i = 0; i < kRampEntries; ++i) {
        while (i > r1) {
            r0 = r1;
            c0 = c1;
            ++stop;
            r1 = stop < ramp.count ? ramp.ratios[stop] : kLastEntry;
            c1 = stop < ramp.count ? ramp.colors[stop] : c0;
        }
        built[i] = PremultipliedPixel(r1 > r0 ? Mix(c0, c1, r1 - i, i - r0) : c0);
    }
}

SPOINT GradientPoint(const RColor* color, S32 x)
{
    SPOINT device = {S32(U32(x) << 8), S32(U32(color->raster->CurrentRow()) << 8)};
    SPOINT u;
    MatrixTransformPoint(&color->gradientInv, &device, &u);
    return u;
}

S32 LinearIndex(S32 ux)
{
    return std::clamp((ux >> 15) + 128, 0, kLastEntry);
}

// u.x at pixel x is the x term, exactly floor(a * x / 256), plus what is the same for the whole
// row; stepping the product before the shift gives each pixel what it has when computed by itself.
void LinearIndices(const RColor* color, S32 x, S32 n, U16* index)
{
    S32 a = color->gradientInv.a;
    S64 product = S64(a) * x;
    S32 rest = GradientPoint(color, x).x - S32(product >> 8);
    S64 last = product + S64(a) * n;
    if (product != S32(product) || last != S32(last)) {
        for (S32 i = 0; i < n; ++i, product += a)
            index[i] = U16(LinearIndex(S32(product >> 8) + rest));
        return;
    }
    S32 narrow = S32(product);
    for (S32 i = 0; i < n; ++i) {
        index[i] = U16(LinearIndex(((narrow + a * i) >> 8) + rest));
    }
}

S32 RadialIndex(const SPOINT& u)
{
    return std::min(PointLength(&u) >> 14, kLastEntry);
}

// The index is a length, and the length table is good to 1/32768 of it. So the square of the true
// length settles the index wherever it is further than twice that from a ring's border; near a
// border the length itself decides.
struct RingSquares {
    U64 low, high;   // between these entry i is certain
    U64 previousEnd; // below this the entry before is certain
    U64 nextStart;   // from this on the next entry is certain
};
RingSquares kRings[kRampEntries];

U64 InnerSquare(U64 i)
{
    U64 border = i << 14;
    border += border / 16384 + 8;
    return i ? border * border : 0;
}

U64 OuterSquare(U64 i)
{
    U64 border = (i + 1) << 14;
    border -= border / 16384 + 8;
    return border * border;
}

void BuildRingSquares()
{
    for (U64 i = 0; i < kRampEntries; ++i) {
        bool last = i == kLastEntry;
        kRings[i] = {InnerSquare(i), last ? ~U64(0) : OuterSquare(i),
                     i ? OuterSquare(i - 1) + 1 : 0, last ? ~U64(0) : InnerSquare(i + 1)};
    }
}

// Walks single pixels of a row: u at a pixel is the pixel's own product, floored, plus what is the
// same for the whole row.
class RingWalk {
public:
    RingWalk(const RColor* color, S32 x) : a(color->gradientInv.a), b(color->gradientInv.b)
    {
        SPOINT u = GradientPoint(color, x);
        ax = a * x;
        bx = b * x;
        restX = u.x - S32(ax >> 8);
        restY = u.y - S32(bx >> 8);
        at = RadialIndex(u);
    }

    // Most steps stay or go to a neighbour; written without branches, which would be guessed wrong.
    U16 Next()
    {
        SPOINT u = {S32(ax >> 8) + restX, S32(bx >> 8) + restY};
        ax += a;
        bx += b;
        U64 square = U64(S64(u.x) * u.x) + U64(S64(u.y) * u.y);
        const RingSquares& ring = kRings[at];
        at += S32(square >= ring.nextStart) - S32(square < ring.previousEnd);
        if (square < kRings[at].low || square > kRings[at].high)
            at = RadialIndex(u);
        return U16(at);
    }

private:
    S64 a, b, ax, bx;
    S32 restX, restY, at;
};

// Two halves at once: each step waits for the one before it, so one walk alone leaves the machine
// idle.
void RadialPixelIndices(const RColor* color, S32 x, S32 n, U16* index)
{
    S32 half = n / 2;
    RingWalk left(color, x), right(color, x + half);
    for (S32 i = 0; i < half; ++i) {
        index[i] = left.Next();
        index[half + i] = right.Next();
    }
    if (n & 1)
        index[n - 1] = right.Next();
}

void UnpackRamp(const RColor* color, const U16* index, S32 n, RGBI* dst)
{
    for (S32 i = 0; i < n; ++i)
        dst[i] = FromLanes(UnpackLanes(color->builtRamp[index[i]]));
}

// Along a slab the index is carried from pixel to pixel and corrected against the squares, so it
// starts anew with each slab and can differ by one from a single pixel's.
class RadialWalk {
public:
    RadialWalk(const RColor* color, S32 x)
        : u(GradientPoint(color, x)), dx(color->gradientInv.a >> 8), dy(color->gradientInv.b >> 8)
    {
    }

    void Indices(S32 n, U16* dst)
    {
        for (S32 i = 0; i < n; ++i) {
            S32 before = at;
            at = Settle(Distance(), std::clamp(at + change, 0, kLastEntry));
            change = at - before;
            dst[i] = U16(at);
            u.x += dx;
            u.y += dy;
        }
    }

private:
    // Squares past the table's end compare alike, so the coordinates can be bounded.
    S32 Distance() const
    {
        S32 gx = std::clamp(u.x >> 14, -512, 512);
        S32 gy = std::clamp(u.y >> 14, -512, 512);
        return gx * gx + gy * gy;
    }

    S32 Settle(S32 d, S32 i)
    {
        if (fresh) {
            fresh = false;
            return First(d);
        }
        while (i > 0 && d < kSquares[i])
            --i;
        while (i < kLastEntry && d > kSquares[i + 1])
            ++i;
        return i;
    }

    // Where walking up from 0 would stop: the first i whose next square is not below d.
    static S32 First(S32 d)
    {
        const U16* squares = kSquares;
        const U16* next = std::lower_bound(squares + 1, squares + kRampEntries, d);
        return S32(next - squares) - 1;
    }

    SPOINT u;
    S32 dx;
    S32 dy;
    S32 at = 0;
    S32 change = 0;
    bool fresh = true;
};

// Calls `use(index row, offset, count)` for pieces of the span x0..x1 with their slab indices.
template <typename Use> void ForPieces(const RColor* color, S32 x0, S32 x1, Use use)
{
    U16 index[kPiece];
    bool radial = color->gradientType == kFillRadial;
    RadialWalk walk(color, x0);
    for (S32 x = x0; x < x1; x += kPiece) {
        S32 n = std::min(kPiece, x1 - x);
        if (radial)
            walk.Indices(n, index);
        else
            LinearIndices(color, x, n, index);
        use(index, x, n);
    }
}

void DrawGradientSlab(RColor* color, S32 x0, S32 x1)
{
    CRaster* raster = color->raster;
    ForPieces(color, x0, x1, [=](const U16* index, S32 x, S32 n) {
        raster->Ops()->rampRow(raster->Row(), x, color->builtRamp, index, n);
    });
}

void BuildGradientSlab(RColor* color, S32 x0, S32 x1, RGBI* dst)
{
    ForPieces(color, x0, x1,
              [=](const U16* index, S32 x, S32 n) { UnpackRamp(color, index, n, dst + (x - x0)); });
}

void CompositeGradientSlab(RColor* color, S32 x0, S32 x1, RGBI* dst)
{
    ForPieces(color, x0, x1, [=](const U16* index, S32 x, S32 n) {
        RGBI* at = dst + (x - x0);
        for (S32 i = 0; i < n; ++i) {
            Lanes src = UnpackLanes(color->builtRamp[index[i]]);
            at[i] = FromLanes(BlendLanes(ToLanes(at[i]), src));
        }
    });
}

} // namespace

void BuildRenderTables()
{
    if (kSquares[1])
        return;
    for (S32 i = 0; i <= kRampEntries; ++i)
        kSquares[i] = U16(std::min(i * i, 65535));
    BuildRingSquares();
    BuildBitmapTables();
}

bool BuildGradientCache(RColor* color)
{
    color->ramp.count = std::min<U8>(color->ramp.count, GradColorRamp::kMaxStops);
    if (color->ramp.count == 0)
        return false;
    if (!color->builtRamp)
        color->builtRamp = color->raster->AllocRamp();
    if (!color->builtRamp)
        return false;
    BuildRamp(color->ramp, color->builtRamp);
    color->drawSlabProc = DrawGradientSlab;
    color->buildSlabProc = color->transparent ? CompositeGradientSlab : BuildGradientSlab;
    return true;
}

void BuildGradientPixels(const RColor* color, S32 x, S32 n, RGBI* dst)
{
    if (!color->builtRamp) {
        std::fill_n(dst, n, RGBI());
        return;
    }
    U16 index[kPiece];
    for (S32 done = 0; done < n; done += kPiece) {
        S32 count = std::min(kPiece, n - done);
        if (color->gradientType == kFillRadial)
            RadialPixelIndices(color, x + done, count, index);
        else
            LinearIndices(color, x + done, count, index);
        UnpackRamp(color, index, count, dst + done);
    }
}

void CalcGradientPixel(RColor* color, S32 x, RGBI* dst)
{
    if (!color->builtRamp) {
        *dst = RGBI();
        return;
    }
    SPOINT u = GradientPoint(color, x);
    S32 index = color->gradientType == kFillRadial ? RadialIndex(u) : LinearIndex(u.x);
    *dst = FromLanes(UnpackLanes(color->builtRamp[index]));
}

// The index never turns back along a row, so both ends tell.
bool GradientIsFlat(const RColor* color, S32 x0, S32 x1, Lanes* value)
{
    if (color->gradientType == kFillRadial || !color->builtRamp || x0 >= x1)
        return false;
    S64 a = color->gradientInv.a;
    S64 first = a * x0 >> 8, last = a * (x1 - 1) >> 8;
    S64 rest = S64(GradientPoint(color, x0).x) - S32(first);
    if (first + rest != S32(first + rest) || last + rest != S32(last + rest))
        return false;
    S32 index = LinearIndex(S32(first + rest));
    *value = UnpackLanes(color->builtRamp[index]);
    return index == LinearIndex(S32(last + rest));
}
