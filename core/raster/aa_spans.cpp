// Anti-aliasing, first half: four sub-scanlines of a pixel row are recorded as spans of colour
// stacks.
#include "core/raster/gradient.h"
#include "core/raster/raster.h"

void CRaster::BeginRow()
{
    ++rowSerial;
    for (GrowBuffer<RSpan>& line : sublines)
        line.Clear();
    stacks.Clear();
    rowLost = !stacks.Push({nullptr, 0, 0, 0, 0, -1, 0, true, false});
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
    if (top->spanRow != rowSerial)
        EnterRow(top);
    int tries = 16;
    for (U32 i = top->spanStack; i && tries-- > 0; i = stacks[i].next)
        if (stacks[i].below == below)
            return i;
    return NewStack(top, below, top->spanStack);
}

// The first time that a colour is seen in a pixel row. Gradients that run down the picture have one
// colour in each row and then cost no more than solid ones.
void CRaster::EnterRow(RColor* c)
{
    c->spanRow = rowSerial;
    c->spanStack = 0;
    c->flatValue = ToLanes(c->rgb);
    c->flatRow = c->colorType == kColorSolid;
    if (c->colorType == kColorGradient) {
        rowY = y >> 2;
        c->flatRow = GradientIsFlat(c, area.xmin, area.xmax, &c->flatValue);
    }
}

U32 CRaster::NewStack(RColor* top, U32 below, U32 next)
{
    if (!stacks.Reserve(stacks.size() + 1)) {
        rowLost = true;
        return 0;
    }
    const RStack& base = stacks[below];
    bool isSolid = base.isSolid && top->flatRow;
    bool covers = below ? base.covers : !top->transparent;
    Lanes solid = isSolid ? BlendLanes(base.solid, top->flatValue) : 0;
    stacks.Push({top, solid, 0, below, next, -1, U16(base.count + 1), isSolid, covers});
    U32 made = U32(stacks.size() - 1);
    top->spanStack = made;
    return made;
}
