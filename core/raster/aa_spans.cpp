// Anti-aliasing, first half: four sub-scanlines of a pixel row are recorded as spans of colour
// stacks.
#include "core/raster/raster.h"

void CRaster::BeginRow()
{
    ++rowSerial;
    for (GrowBuffer<RSpan>& line : sublines)
        line.Clear();
    stacks.Clear();
    RStack nothing = {};
    nothing.isSolid = true;
    nothing.pixelX = -1;
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

// The row's stack with the collected colours, found or made from the lowest up.
U32 CRaster::InternStack(int count)
{
    U32 stack = 0;
    for (int i = count - 1; i >= 0; --i)
        stack = FindStack(collected[i], stack);
    work += U64(count);
    return stack;
}

// Only a few are compared: a stack that is entered twice costs time, never a wrong pixel.
U32 CRaster::FindStack(RColor* top, U32 below)
{
    U32 newest = top->spanRow == rowSerial ? top->spanStack : 0;
    int tries = 16;
    for (U32 i = newest; i && tries-- > 0; i = stacks[i].next)
        if (stacks[i].below == below)
            return i;
    return NewStack(top, below, newest);
}

U32 CRaster::NewStack(RColor* top, U32 below, U32 next)
{
    const RStack& base = stacks[below];
    RStack s = {};
    s.color = top;
    s.below = below;
    s.next = next;
    s.count = base.count + 1;
    s.isSolid = base.isSolid && top->colorType == kColorSolid;
    s.covers = below ? base.covers : !top->transparent;
    s.solid = BlendLanes(base.solid, ToLanes(top->rgb));
    s.pixelX = -1;
    if (!stacks.Push(s)) {
        rowLost = true;
        return 0;
    }
    U32 made = U32(stacks.size() - 1);
    top->spanRow = rowSerial;
    top->spanStack = made;
    return made;
}
