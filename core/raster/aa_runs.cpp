// Anti-aliasing: four sub-scanlines are recorded as spans of colour stacks, then merged into runs
// of one pixel row and resolved to pixels of 4 x 4 samples.
#include <algorithm>

#include "core/raster/raster.h"

void CRaster::BeginRow()
{
    ++rowSerial;
    rowLost = false;
    for (GrowBuffer<RSpan>& line : sublines)
        line.Clear();
    stackColors.Clear();
    stacks.Clear();
    RStack nothing = {};
    nothing.isSolid = true;
    rowLost = !stacks.Push(nothing);
}

void CRaster::RecordSpan(S32 xmax)
{
    PushSpan(xmax, InternStack(Collect()));
}

void CRaster::PushSpan(S32 xmax, U32 stack)
{
    GrowBuffer<RSpan>& line = sublines[y & 3];
    size_t n = line.size();
    if (n && line[n - 1].stack == stack)
        line[n - 1].xmax = xmax;
    else if (!line.Push({xmax, stack}))
        rowLost = true;
}

// What is right of the last crossing shows nothing.
void CRaster::EndSubline()
{
    if (paintX < areaDev.xmax)
        PushSpan(areaDev.xmax, 0);
}

bool CRaster::SameStack(const RStack& s, int count) const
{
    return s.count == U32(count) &&
           std::equal(collected, collected + count, stackColors.data() + s.first);
}

// The row's stack with the collected colours. Those with the same top colour are linked, and only a
// few are compared: a stack that is entered twice costs time, never a wrong pixel.
U32 CRaster::InternStack(int count)
{
    if (count == 0)
        return 0;
    RColor* top = collected[0];
    U32 newest = top->spanRow == rowSerial ? top->spanStack : 0;
    int tries = 8;
    for (U32 i = newest; i && tries-- > 0; i = stacks[i].next)
        if (SameStack(stacks[i], count))
            return i;
    U32 made = NewStack(count, newest);
    if (made) {
        top->spanRow = rowSerial;
        top->spanStack = made;
    }
    return made;
}

U32 CRaster::NewStack(int count, U32 next)
{
    RStack s = {U32(stackColors.size()), U32(count), next, 0, true};
    for (int i = 0; i < count; ++i) {
        if (!stackColors.Push(collected[i])) {
            rowLost = true;
            return 0;
        }
    }
    for (int i = count - 1; i >= 0; --i) {
        s.isSolid = s.isSolid && collected[i]->colorType == kColorSolid;
        s.solid = BlendLanes(s.solid, ToLanes(collected[i]->rgb));
    }
    if (stacks.Push(s))
        return U32(stacks.size() - 1);
    rowLost = true;
    return 0;
}

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
        for (int i = 0; i < 4; ++i)
            run.stacks[i] = at[i]->stack;
        MakeRun(&run);
        PaintRun(run);
        for (int i = 0; i < 4; ++i)
            at[i] += at[i]->xmax == run.xmax;
    }
    EmitCoverage();
    FlushPixels();
}

void CRaster::MakeRun(RRun* run) const
{
    const U32* s = run->stacks;
    run->same = s[0] == s[1] && s[0] == s[2] && s[0] == s[3];
    if (run->same) {
        run->isSolid = stacks[s[0]].isSolid;
        run->sum = stacks[s[0]].solid * 4;
        return;
    }
    run->isSolid = true;
    run->sum = 0;
    for (int i = 0; i < 4; ++i) {
        run->isSolid = run->isSolid && stacks[s[i]].isSolid;
        run->sum += stacks[s[i]].solid;
    }
}

void CRaster::PaintRun(const RRun& run)
{
    if ((run.stacks[0] | run.stacks[1] | run.stacks[2] | run.stacks[3]) == 0)
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
    if (run.same)
        return StackColor(stacks[run.stacks[0]], x) * 4;
    Lanes sum = 0;
    for (U32 stack : run.stacks)
        sum += StackColor(stacks[stack], x);
    return sum;
}

Lanes CRaster::StackColor(const RStack& stack, S32 x)
{
    if (stack.isSolid)
        return stack.solid;
    Lanes sum = 0;
    for (U32 i = stack.count; i-- > 0;)
        sum = BlendLanes(sum, PixelColor(stackColors[stack.first + i], x));
    return sum;
}

// A colour's own pixel; each keeps the last one, because neighbouring runs ask for it again.
Lanes CRaster::PixelColor(RColor* c, S32 x)
{
    static constexpr RPixelProc kPixelProcs[] = {CalcSolidPixel, CalcBitmapPixel,
                                                 CalcGradientPixel};
    if (c->colorType == kColorSolid)
        return ToLanes(c->rgb);
    U32 key = U32(rowY) << 16 | (U32(x) & 0xFFFF);
    if (!c->pixValid || c->pixKey != key) {
        kPixelProcs[c->colorType](c, x, &c->pixValue);
        c->pixKey = key;
        c->pixValid = 1;
    }
    return ToLanes(c->pixValue);
}

RGBI CRaster::BitmapPixel(RColor* c, S32 x)
{
    RGBI value = {};
    CalcBitmapPixel(c, x, &value);
    return value;
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
    if (pendingCount && pendingOpaque)
        ops->writeRow(rowBits, pendingX, pending, pendingCount);
    else if (pendingCount)
        BlendToOutput(pendingX, pending, pendingCount);
    pendingCount = 0;
    pendingOpaque = true;
}

// Whole pixels x0..x1 of one run.
void CRaster::PaintInterior(const RRun& run, S32 x0, S32 x1)
{
    if (run.same && stacks[run.stacks[0]].count == 1) {
        RColor* const* c = stackColors.data() + stacks[run.stacks[0]].first;
        for (S32 x = x0; x < x1; x += kPiece)
            DrawCollected(x, std::min(x + kPiece, x1), c, 1);
        return;
    }
    if (run.isSolid) {
        PaintFlat(run.sum >> 2 & kLaneMask, x0, x1);
        return;
    }
    if (run.same) {
        PaintStackInterior(stacks[run.stacks[0]], x0, x1);
        return;
    }
    for (S32 x = x0; x < x1; ++x)
        EmitPixel(x, CalcColor(run, x) >> 2 & kLaneMask);
}

void CRaster::PaintFlat(Lanes value, S32 x0, S32 x1)
{
    if (LaneAlpha(value) == 255) {
        ops->fillRow(rowBits, x0, ops->pack(FromLanes(value)), x1 - x0);
        return;
    }
    for (S32 x = x0; x < x1; ++x)
        EmitPixel(x, value);
}

// The same as single pixels, a row at a time.
void CRaster::PaintStackInterior(const RStack& stack, S32 x0, S32 x1)
{
    RColor* const* colors = stackColors.data() + stack.first;
    for (S32 x = x0; x < x1; x += kPiece) {
        S32 n = std::min(kPiece, x1 - x);
        for (U32 i = stack.count; i-- > 0;)
            BuildPixelRow(colors[i], x, n, piece, i + 1 < stack.count);
        if (colors[stack.count - 1]->transparent)
            BlendToOutput(x, piece, n);
        else
            ops->writeRow(rowBits, x, piece, n);
    }
}
