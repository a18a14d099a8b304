// Anti-aliasing: four sub-scanlines are recorded as spans of colour stacks, then merged into runs
// of one pixel row and resolved to pixels of 4 x 4 samples.
#include <algorithm>

#include "core/raster/bitmap_fill.h"
#include "core/raster/gradient.h"
#include "core/raster/raster.h"

void CRaster::PaintAARuns()
{
    if (rowLost)
        return;
    SetYCoord(y >> 2);
    const RSpan* at[4];
    for (int i = 0; i < 4; ++i) {
        if (sublines[i].size() == 0)
            return;
        at[i] = sublines[i].data();
    }
    RRun run;
    for (run.xmin = areaDev.xmin; run.xmin < areaDev.xmax; run.xmin = run.xmax) {
        run.xmax = std::min(std::min(at[0]->xmax, at[1]->xmax), std::min(at[2]->xmax, at[3]->xmax));
        MakeRun(&run, at);
        PaintRun(run);
        for (int i = 0; i < 4; ++i)
            at[i] += at[i]->xmax == run.xmax;
    }
    EmitCoverage();
    FlushPixels();
}

void CRaster::MakeRun(RRun* run, const RSpan* const* at) const
{
    const RStack& first = stacks[at[0]->stack];
    run->stacks[0] = at[0]->stack;
    run->weights[0] = 4;
    run->kinds = 1;
    run->isSolid = first.isSolid;
    run->sum = first.solid * 4;
    U32 s = at[0]->stack;
    if (s == at[1]->stack && s == at[2]->stack && s == at[3]->stack)
        return;
    run->weights[0] = 1;
    run->sum = first.solid;
    for (int i = 1; i < 4; ++i)
        AddToRun(run, at[i]->stack);
}

void CRaster::AddToRun(RRun* run, U32 stack) const
{
    run->isSolid = run->isSolid && stacks[stack].isSolid;
    run->sum += stacks[stack].solid;
    int k = 0;
    while (k < run->kinds && run->stacks[k] != stack)
        ++k;
    if (k == run->kinds) {
        run->stacks[k] = stack;
        run->weights[k] = 0;
        ++run->kinds;
    }
    ++run->weights[k];
}

void CRaster::PaintRun(const RRun& run)
{
    if (run.kinds == 1 && run.stacks[0] == 0)
        return;
    S32 first = run.xmin >> 2;
    S32 last = run.xmax >> 2;
    if (first == last) {
        AddCoverage(first, CalcColor(run, first) * (run.xmax - run.xmin));
        return;
    }
    if (run.xmin & 3) {
        AddCoverage(first, CalcColor(run, first) * (4 - (run.xmin & 3)));
        ++first;
    }
    if (first < last)
        PaintInterior(run, first, last);
    if (run.xmax & 3)
        AddCoverage(last, CalcColor(run, last) * (run.xmax & 3));
}

// The run's colour at a pixel: the sum over its four contributions.
Lanes CRaster::CalcColor(const RRun& run, S32 x)
{
    if (run.isSolid)
        return run.sum;
    Lanes sum = 0;
    for (int k = 0; k < run.kinds; ++k)
        sum += StackColor(run.stacks[k], x) * run.weights[k];
    return sum;
}

// Blended from the bottom up. Every stack keeps its last pixel: neighbouring runs ask for it again,
// and stacks with the same lower part share its value. As deep as the stack, which is bounded.
Lanes CRaster::StackColor(U32 stack, S32 x)
{
    RStack& s = stacks[stack];
    if (s.isSolid)
        return s.solid;
    if (s.pixelX != x) {
        s.pixel = BlendLanes(StackColor(s.below, x), PixelColor(s.color, x));
        s.pixelX = x;
    }
    return s.pixel;
}

// A colour's own pixel; each keeps the last one, because neighbouring runs ask for it again.
Lanes CRaster::PixelColor(RColor* c, S32 x)
{
    static constexpr RPixelProc kPixelProcs[] = {CalcSolidPixel, CalcBitmapPixel,
                                                 CalcGradientPixel};
    if (c->flatRow)
        return c->flatValue;
    U32 key = U32(rowY) << 16 | (U32(x) & 0xFFFF);
    if (!c->pixValid || c->pixKey != key) {
        kPixelProcs[c->colorType](c, x, &c->pixValue);
        c->pixKey = key;
        c->pixValid = 1;
    }
    return ToLanes(c->pixValue);
}

void CRaster::AddCoverage(S32 x, Lanes value)
{
    if (!covering || coverX != x) {
        EmitCoverage();
        covering = true;
        coverX = x;
        cover = 0;
    }
    cover += value;
}

void CRaster::EmitCoverage()
{
    if (covering)
        EmitPixel(coverX, cover >> 4 & kLaneMask);
    covering = false;
}

// A finished pixel; those that lie side by side are written together.
void CRaster::EmitPixel(S32 x, Lanes value)
{
    if (LaneAlpha(value) == 0)
        return;
    if (pendingCount == kPiece || x != pendingX + pendingCount)
        FlushPixels();
    if (pendingCount == 0)
        pendingX = x;
    pending[pendingCount++] = FromLanes(value);
    pendingOpaque = pendingOpaque && LaneAlpha(value) == 255;
}

void CRaster::FlushPixels()
{
    if (pendingCount)
        EmitPixels(pendingX, pending, pendingCount, pendingOpaque);
    pendingCount = 0;
    pendingOpaque = true;
}

// Pixels without alpha are left as they are.
void CRaster::EmitPixels(S32 x, const RGBI* src, S32 n, bool opaque)
{
    if (opaque) {
        ops->writeRow(outRow, x, src, n);
        return;
    }
    for (S32 i = 0, end; i < n; i = end + 1) {
        for (end = i; end < n && src[end].alpha; ++end) {
        }
        if (end > i)
            BlendToOutput(x + i, src + i, end - i);
    }
}

// Whole pixels x0..x1 of one run.
void CRaster::PaintInterior(const RRun& run, S32 x0, S32 x1)
{
    const RStack& first = stacks[run.stacks[0]];
    bool single = run.kinds == 1 && first.count == 1;
    if (run.isSolid && !(single && first.color->transparent)) {
        PaintFlat(run.sum >> 2 & kLaneMask, x0, x1);
        return;
    }
    // Where a piece begins makes no difference to an image.
    const bool whole = single && first.color->colorType == kColorBitmap;
    const S32 longest = whole ? x1 - x0 : kPiece;
    for (S32 x = x0; x < x1; x += longest) {
        S32 n = std::min(longest, x1 - x);
        if (single)
            DrawCollected(x, x + n, &first.color, 1);
        else
            PaintMixed(run, x, n);
    }
}

void CRaster::PaintFlat(Lanes value, S32 x0, S32 x1)
{
    // A few pixels go along with their neighbours.
    if (LaneAlpha(value) == 255 && x1 - x0 > 4) {
        ops->fillRow(outRow, x0, ops->pack(outRow, FromLanes(value)), x1 - x0);
        return;
    }
    for (S32 x = x0; x < x1; ++x)
        EmitPixel(x, value);
}

// The same as single pixels, a row at a time.
void CRaster::PaintMixed(const RRun& run, S32 x, S32 n)
{
    bool covers = true;
    for (int k = 0; k < run.kinds; ++k)
        covers = covers && stacks[run.stacks[k]].covers;
    work += U64(n) * stacks[run.stacks[0]].count / 8;
    if (run.kinds == 1) {
        BuildStackRow(run.stacks[0], x, n);
    } else {
        BuildRunRows(run, x, n);
        SumRows(run, n);
    }
    EmitPixels(x, rows[0], n, covers);
}

// One stack's pixels in the first row: the lowest colour, then the others over it.
void CRaster::BuildStackRow(U32 stack, S32 x, S32 n)
{
    RColor* list[kMaxCollected];
    int left = 0;
    for (U32 s = stack; s; s = stacks[s].below)
        list[left++] = stacks[s].color;
    BuildPixelRow(list[--left], x, n, rows[0]);
    while (left-- > 0) {
        if (!list[left]->flatRow)
            BuildPixelRow(list[left], x, n, piece);
        BlendPixelRow(list[left], rows[0], n);
    }
}

// Leaves the rows' average over the four sub-scanlines in the first row.
void CRaster::SumRows(const RRun& run, S32 n)
{
    for (S32 i = 0; i < n; ++i) {
        Lanes sum = 0;
        for (int k = 0; k < run.kinds; ++k)
            sum += ToLanes(rows[k][i]) * run.weights[k];
        rows[0][i] = FromLanes(sum >> 2 & kLaneMask);
    }
}

// Builds a row of pixels for each of the run's stacks. The stacks are walked together from the
// bottom, so that a colour that stands in several is computed once.
void CRaster::BuildRunRows(const RRun& run, S32 x, S32 n)
{
    RColor* lists[4][kMaxCollected];
    int left[4];
    for (int k = 0; k < run.kinds; ++k) {
        left[k] = 0;
        for (U32 s = run.stacks[k]; s; s = stacks[s].below)
            lists[k][left[k]++] = stacks[s].color;
        std::fill_n(rows[k], n, RGBI());
    }
    for (;;) {
        RColor* lowest = nullptr;
        for (int k = 0; k < run.kinds; ++k)
            if (left[k] && (!lowest || lists[k][left[k] - 1]->order < lowest->order))
                lowest = lists[k][left[k] - 1];
        if (!lowest)
            return;
        bool built = false;
        for (int k = 0; k < run.kinds; ++k) {
            if (left[k] == 0 || lists[k][left[k] - 1] != lowest)
                continue;
            --left[k];
            if (!built && !lowest->flatRow)
                BuildPixelRow(lowest, x, n, piece);
            built = true;
            BlendPixelRow(lowest, rows[k], n);
        }
    }
}

// A colour's pixels from x on, each as if computed singly.
void CRaster::BuildPixelRow(RColor* c, S32 x, S32 n, RGBI* dst)
{
    if (c->flatRow) {
        std::fill_n(dst, n, FromLanes(c->flatValue));
    } else if (c->colorType == kColorGradient) {
        BuildGradientPixels(c, x, n, dst);
    } else {
        BuildBitmapPixels(c, x, n, dst);
    }
}

// Blends what `piece` holds, or the row's only colour, over a row.
void CRaster::BlendPixelRow(RColor* c, RGBI* row, S32 n)
{
    RGBI flat = FromLanes(c->flatValue);
    if (c->flatRow)
        CompositeRGBSolid(&flat, row, n);
    else
        CompositeRGB(piece, row, n);
}
