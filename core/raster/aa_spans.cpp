// Anti-aliasing, first half: four sub-scanlines of a pixel row are recorded as spans of colour
// stacks.
#include "core/raster/gradient.h"
#include "core/raster/raster.h"

void CRaster::BeginRow()
{
    if (++rowSerial == 0) { // all slots look filled after the count has gone round
        stackIndex.Clear();
        rowSerial = 1;
    }
    rowColors = 0;
    lastCount = 0;
    for (GrowBuffer<RSpan>& line : sublines)
        line.Clear();
    stacks.Clear();
    rowLost = !stacks.Push({nullptr, 0, 0, 0, -1, 0, true, false});
}

void CRaster::RecordSpan(S32 xmax)
{
    if (!rowLost)
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

// The row's stack with the collected colours. Neighbouring spans mostly differ in one colour, so
// the part below it is taken from the last one.
U32 CRaster::InternStack(int count)
{
    U32 stack = 0;
    bool shared = true;
    for (int i = 0; i < count; ++i) {
        RColor* c = collected[count - 1 - i];
        if (rowLost)
            return 0;
        shared = shared && i < lastCount && lastColors[i] == c;
        stack = shared ? lastStacks[i] : FindStack(c, stack);
        lastColors[i] = c;
        lastStacks[i] = stack;
    }
    lastCount = count;
    return stack;
}

// One stack, one entry: whether sub-scanlines show the same is told by their numbers.
U32 CRaster::FindStack(RColor* top, U32 below)
{
    if (top->spanRow != rowSerial)
        EnterRow(top);
    else if (top->lastBelow == below && top->lastStack)
        return top->lastStack;
    top->lastBelow = below;
    top->lastStack = LookUpStack(top, below);
    return top->lastStack;
}

U32 CRaster::LookUpStack(RColor* top, U32 below)
{
    if (stacks.size() * 2 > stackIndex.size() && !GrowIndex()) {
        rowLost = true;
        return 0;
    }
    RStackSlot* slot = FindSlot(top, below);
    if (slot->row == rowSerial)
        return slot->stack;
    U32 made = NewStack(top, below);
    if (made)
        *slot = {rowSerial, made};
    return made;
}

// The slot of that stack, or the free one where it belongs.
RStackSlot* CRaster::FindSlot(const RColor* top, U32 below)
{
    U32 hash = below * 0x9E3779B1u + top->rowNumber * 0x85EBCA6Bu;
    size_t mask = stackIndex.size() - 1;
    for (size_t i = (hash ^ hash >> 15) & mask;; i = (i + 1) & mask) {
        RStackSlot& slot = stackIndex[i];
        if (slot.row != rowSerial)
            return &slot;
        if (stacks[slot.stack].color == top && stacks[slot.stack].below == below)
            return &slot;
    }
}

// Doubles the table and enters the row's stacks again.
bool CRaster::GrowIndex()
{
    size_t size = stackIndex.size() ? stackIndex.size() * 2 : 256;
    if (!stackIndex.Reserve(size))
        return false;
    stackIndex.Clear();
    stackIndex.Resize(size);
    for (U32 i = 1; i < stacks.size(); ++i)
        *FindSlot(stacks[i].color, stacks[i].below) = {rowSerial, i};
    return true;
}

// The first time that a colour is seen in a pixel row. Gradients that run down the picture have one
// colour in each row and then cost no more than solid ones.
void CRaster::EnterRow(RColor* c)
{
    c->spanRow = rowSerial;
    c->rowNumber = rowColors++;
    c->lastStack = 0;
    c->flatValue = ToLanes(c->rgb);
    c->flatRow = c->colorType == kColorSolid;
    if (c->colorType == kColorGradient) {
        rowY = y >> 2;
        c->flatRow = GradientIsFlat(c, area.xmin, area.xmax, &c->flatValue);
    }
}

U32 CRaster::NewStack(RColor* top, U32 below)
{
    if (stacks.size() >= kMaxStacks || !stacks.Reserve(stacks.size() + 1)) {
        rowLost = true;
        return 0;
    }
    const RStack& base = stacks[below];
    bool isSolid = base.isSolid && top->flatRow;
    bool covers = below ? base.covers : !top->transparent;
    Lanes solid = isSolid ? BlendLanes(base.solid, top->flatValue) : 0;
    stacks.Push({top, solid, 0, below, -1, U16(base.count + 1), isSolid, covers});
    return U32(stacks.size() - 1);
}
