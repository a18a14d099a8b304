// From records to edges: which colours a curve separates, and which lines follow it.
#include "core/shape/character_parser.h"

#include "core/display/display_list.h"
#include "core/shape/stroker.h"

namespace {
bool OutgrowsEdges(const SRECT& r)
{
    return r.xmin < -kEdgeReach || r.xmax > kEdgeReach || r.ymin < -kEdgeReach ||
           r.ymax > kEdgeReach;
}
} // namespace

SCharacterParser::SCharacterParser(SObject* object, ScriptPlayer* dictionary, const U8* data,
                                   S32 dataLen, S32 start, const MATRIX* matrix)
    : SShapeParser(dictionary, object->display, &object->colors, data, dataLen, start, matrix),
      CEdgeCutter(object->display, &object->edges), obj(object)
{
}

bool SCharacterParser::BuildEdges(bool readStyles, const SRECT* devBounds)
{
    depth = 0;
    edgesLost = false;
    hugeCoords = OutgrowsEdges(*devBounds);
    raster = display->PaintedRaster();
    if (readStyles) {
        if (!(endEdges ? GetMorphStyles() : GetStyles()))
            return false;
        if (obj->IsClip())
            MakeClipper();
    } else {
        GetSelectorWidths();
    }
    Walk();
    return true;
}

void SCharacterParser::Walk()
{
    SStroker stroker(display, &obj->edges);
    CURVE c;
    for (int flags = NextRecord(&c); flags != kEndOfShape; flags = NextRecord(&c)) {
        if (!SpendRecord())
            break;
        if (flags != 0) {
            ChangeStyles(flags, &stroker);
            continue;
        }
        if (color1)
            AddCurve(&c);
        if (stroker.IsOpen())
            stroker.AddStrokeCurve(&c);
    }
    stroker.EndStroke();
}

// New styles alone neither end a stroke nor change its colour.
void SCharacterParser::ChangeStyles(int flags, SStroker* stroker)
{
    if ((flags & kNewStyles) && obj->IsClip())
        MakeClipper();
    if (flags & (kFill0 | kFill1))
        ChangeFills();
    if (flags & (kMoveTo | kLineStyle)) {
        stroker->EndStroke();
        const SLineStyle style = LineStyle(line);
        if (style.color)
            stroker->BeginStroke(style.thickness, style.color);
    }
}

// New styles alone change no colours; one changed selector looks both of them up again.
void SCharacterParser::ChangeFills()
{
    color1 = Fill(fill0);
    color2 = Fill(fill1);
    if (!color1) {
        color1 = color2;
        color2 = nullptr;
    }
    fillRule = color2 ? kRuleEdge : useWinding ? kRuleWinding : kRuleEvenOdd;
}

// A mask of several style blocks keeps its one colour through all of them. A shape without any
// styles has no colours and so is no mask: what it would have hidden is drawn. One with lines but
// no fills keeps their colours, which no edge carries, and hides its whole range.
void SCharacterParser::MakeClipper()
{
    if (!clipColor && nFills > 0)
        clipColor = CreateClipColor(display, colorList);
    for (U32 i = 1; i <= nFills; ++i)
        fillIndex[i] = clipColor;
    for (U32 i = 1; i <= nLines; ++i)
        lineIndex[i].color = nullptr;
}

RColor* CreateClipColor(DisplayList* display, RColor** list)
{
    RColor* color = display->NewColor();
    if (!color)
        return nullptr;
    CRaster* raster = display->PaintedRaster();
    color->SetUp(raster);
    color->colorType = kColorClip;
    color->transparent = 1;
    color->nextColor = *list;
    *list = color;
    if (raster)
        color->BuildCache();
    return color;
}
