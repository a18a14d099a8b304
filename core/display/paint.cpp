// Repainting: the dirty rectangles, and what is painted into one of them.
#include <algorithm>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/shape/character_parser.h"

namespace {
constexpr S32 kFocusBar = 3; // thickness of the focus highlight, pixels

void SetUpSolid(RColor* color, CRaster* raster, SRGB value)
{
    color->SetUp(raster);
    color->rgb = {value.blue, value.green, value.red, 255};
    color->BuildCache();
}

S16 Coord(S32 v)
{
    return static_cast<S16>(std::clamp(v, -32768, 32767));
}

REdge VerticalEdge(RColor* color, S32 x, S32 ymin, S32 ymax)
{
    REdge e = {};
    e.color1 = color;
    e.anchor1x = e.controlx = e.anchor2x = Coord(x);
    e.anchor1y = e.controly = Coord(ymin);
    e.anchor2y = Coord(ymax);
    e.isLine = 1;
    e.fillRule = kRuleEvenOdd;
    e.dir = 1;
    return e;
}
} // namespace

void DisplayList::Update()
{
    CalcUpdate();
    recordsLeft = gLimits.shapeRecords;
    pixelsLeft = gLimits.decodedPixels;
    if (nDirty > 0 && bits) {
        if (bits->HasBits())
            root.BuildNew({camera, cameraCxform});
        while (MergeDirtyList(false)) {
        }
        MakeDisjoint();
        for (int i = 0; i < nDirty; i++) {
            SRECT pix;
            CalcBitsDirty(&dirtyList[i], &pix);
            RectUnion(&bitsDirty, &pix, &bitsDirty);
            UpdateRect(&pix);
        }
    }
    RectSetEmpty(&devDirtyRgn);
    nDirty = 0;
}

void DisplayList::UpdateRect(const SRECT* r)
{
    if (!bits || !bits->HasBits() || r->xmin >= r->xmax || r->ymin >= r->ymax)
        return;
    RColor background = {}, focus = {};
    REdge edges[2];
    REdge* bars = nullptr;

    raster.Attach(bits, r, antialias);
    if (SRGBWord(backgroundColor) == 0)
        raster.UseAlphaChannel();
    raster.BeginPaint();
    if (SRGBWord(backgroundColor) != 0)
        PaintBackground(&background, edges);
    root.Draw(&raster, {camera, cameraCxform}, nullptr);
    if (useFocusRect && !RectIsEmpty(&tabFocusRect))
        PaintFocus(&focus, &bars);
    raster.PaintBits();
    raster.Flush();
    FreeEdges(bars);
    focus.FreeCache();
    background.FreeCache();
}

// Two edges at the sides of the area, so that all of it lies inside.
void DisplayList::PaintBackground(RColor* color, REdge edges[2])
{
    const SRECT* area = raster.AreaDev();
    SetUpSolid(color, &raster, backgroundColor);
    edges[0] = VerticalEdge(color, area->xmin, area->ymin, area->ymax);
    edges[1] = VerticalEdge(color, area->xmax, area->ymin, area->ymax);
    edges[0].next = &edges[1];
    raster.AddEdges(edges, color, nullptr);
}

void DisplayList::PaintFocus(RColor* color, REdge** edges)
{
    const SRECT& f = tabFocusRect;
    const S32 t = antialias ? 4 * kFocusBar : kFocusBar;
    const SRECT bars[] = {{f.xmin, f.xmin + t, f.ymin, f.ymax},
                          {f.xmax - t, f.xmax, f.ymin, f.ymax},
                          {f.xmin, f.xmax, f.ymin, f.ymin + t},
                          {f.xmin, f.xmax, f.ymax - t, f.ymax}};
    MATRIX identity;
    MatrixIdentity(&identity);
    SetUpSolid(color, &raster, {255, 255, 0, 255});
    for (const SRECT& bar : bars)
        AddRect(&bar, &identity, color, this, edges, nullptr);
    // The bars share their corners, where even-odd crossings would leave holes.
    for (REdge* e = *edges; e; e = e->next)
        e->fillRule = kRuleWinding;
    raster.AddEdges(*edges, color, nullptr);
}
