// Life of a paint: area, buckets, layers, and the walk over the scanlines.
#include "core/raster/raster.h"

#include <algorithm>

#include "core/raster/active_edge.h"

static constexpr int kRampsPerBlock = 16;

CRaster::CRaster()
    : ops(PixelOps(kPixel32)), activeAlloc(sizeof(RActiveEdge), 64, 1, 0x33333333),
      rampAlloc(kRampEntries * sizeof(U32), kRampsPerBlock, 1, 0xEEEEEEEE)
{
    BuildRenderTables();
}

CRaster::~CRaster() = default;

void CRaster::Attach(CBitBuffer* to, const SRECT* r, int aa)
{
    output = to;
    ops = to ? to->Ops() : PixelOps(kPixel32);
    outRow = CRow();
    outRow.palette = to ? to->Palette() : nullptr;
    antialias = aa;
    alphaOutput = false;
    area = {};
    if (BitsValid() && !RectIsEmpty(r)) {
        S32 side = aa ? kMaxAntialiasSide : CBitBuffer::kMaxSide;
        S32 right = std::min(to->Width(), side), bottom = std::min(to->Height(), side);
        area.xmin = std::clamp(r->xmin, 0, right);
        area.xmax = std::clamp(r->xmax, area.xmin, right);
        area.ymin = std::clamp(r->ymin, 0, bottom);
        area.ymax = std::clamp(r->ymax, area.ymin, bottom);
    }
    S32 scale = aa ? 4 : 1;
    areaDev = {area.xmin * scale, area.xmax * scale, area.ymin * scale, area.ymax * scale};
    PrepareErrors();
}

// Without memory nothing diffuses.
void CRaster::PrepareErrors()
{
    errorRows.Clear();
    if (ops->diffuses && BitsValid())
        errorRows.Resize(2 * ErrorRowLength());
}

// A column more on both sides.
size_t CRaster::ErrorRowLength() const
{
    return 3 * size_t(output->Width() + 2);
}

void CRaster::SetBackgroundBits(CBitBuffer* background)
{
    backgroundBits = background;
}

void CRaster::UseAlphaChannel()
{
    alphaOutput = true;
}

bool CRaster::BitsValid() const
{
    return output && output->HasBits();
}

void CRaster::BeginPaint()
{
    FreeActive();
    stackTop = nullptr;
    needsSort = false;
    layer = 0;
    layersFull = false;
    buckets.Clear();
    size_t scanlines = size_t(areaDev.ymax - areaDev.ymin);
    // Room for crowded pictures of any size, and an end for those that only mean to take time.
    work = 0;
    workLimit = (1ull << 25) + (scanlines << 15);
    if (areaDev.xmax <= areaDev.xmin || !buckets.Reserve(scanlines))
        return;
    for (size_t i = 0; i < scanlines; ++i)
        buckets.Push(nullptr);
}

void CRaster::AddEdges(REdge* edges)
{
    if (buckets.size() == 0 || !edges)
        return;
    for (REdge* e = edges; e; e = e->next) {
        if (e->anchor1y >= areaDev.ymax || e->anchor2y <= areaDev.ymin ||
            e->anchor1y >= e->anchor2y)
            continue;
        REdge*& bucket = buckets[size_t(std::max(0, e->anchor1y - areaDev.ymin))];
        e->nextObj = bucket;
        bucket = e;
    }
}

// The layer number has 16 bits; what does not fit above the others is not painted.
void CRaster::AddEdges(REdge* edges, RColor* colors, RColor* clip)
{
    if (layersFull)
        return;
    AddEdges(edges);
    for (RColor* c = colors; c; c = c->nextColor) {
        c->order = (c->order & 0xFFFF) | layer;
        c->clipColor = c == clip ? nullptr : clip;
        c->visible = 0;
        c->nextActive = nullptr;
        c->pixValid = 0;
        c->spanRow = 0;
        // Only now the output is sure: the colour may have been built for a hit test, or for
        // pixels of another format or palette.
        if (c->colorType == kColorSolid)
            c->rgbPixel = ops->pack(outRow, c->rgb);
    }
    layer += 0x10000;
    layersFull = layer == 0;
}

void CRaster::SetYCoord(S32 y0)
{
    rowY = y0;
    outRow = output->Row(y0);
    if (errorRows.size() == 0)
        return;
    S16* first = errorRows.data() + 3;
    S16* second = first + ErrorRowLength();
    oddErrors = !oddErrors;
    outRow.errors = oddErrors ? second : first;
    outRow.nextErrors = oddErrors ? first : second;
    std::fill_n(outRow.nextErrors - 3, ErrorRowLength(), S16(0));
}

void CRaster::FillBackground(SRGB color)
{
    RGBI value = {color.blue, color.green, color.red, color.alpha};
    Premultiply(&value);
    U32 packed = ops->pack(outRow, value);
    for (S32 y0 = area.ymin; y0 < area.ymax; ++y0)
        ops->fillRow(output->Row(y0), area.xmin, packed, area.xmax - area.xmin);
}

void CRaster::PaintBits()
{
    if (!BitsValid() || buckets.size() == 0)
        return;
    if (alphaOutput)
        FillBackground(SRGB());
    for (y = areaDev.ymin; y < areaDev.ymax && work < workLimit; ++y) {
        if (antialias && (y & 3) == 0)
            BeginRow();
        AddActive();
        SortActive();
        if (!antialias)
            SetYCoord(y);
        PaintActive();
        if (antialias)
            EndSubline();
        if (antialias && (y & 3) == 3)
            PaintAARuns();
    }
    ClearStack();
    FreeActive();
    buckets.Clear(); // the edges belong to others, who may free them now
}

// The output is in memory: there is nothing to hand over.
void CRaster::Flush() {}

void CRaster::FreeEmpties()
{
    errorRows.Release();
    activeAlloc.FreeEmpties();
    rampAlloc.FreeEmpties();
    stacks.Release();
    stackIndex.Release();
    for (GrowBuffer<RSpan>& line : sublines)
        line.Release();
}

void CRaster::SetRampBudget(U32 ramps)
{
    rampAlloc.SetBudget((ramps + kRampsPerBlock - 1) / kRampsPerBlock);
}

U32* CRaster::AllocRamp()
{
    return static_cast<U32*>(rampAlloc.Alloc());
}

void CRaster::FreeRamp(U32* ramp)
{
    rampAlloc.Free(ramp);
}
