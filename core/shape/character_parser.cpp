// From records to edges: which colours a curve separates, and the pieces that it is cut into.
#include "core/shape/character_parser.h"

#include "core/display/display_list.h"
#include "core/shape/edge_piece.h"

namespace {
constexpr S32 kMaxDepth = 16;
constexpr S32 kMaxRise = 0x100;  // of one curved edge, in scanlines
constexpr S32 kControlSlack = 2; // moving a control point this far beats tiny pieces

bool OutgrowsEdges(const SRECT& r)
{
    return r.xmin < -kEdgeReach || r.xmax > kEdgeReach || r.ymin < -kEdgeReach ||
           r.ymax > kEdgeReach;
}

CRaster* PaintedRaster(DisplayList* display)
{
    return display->bits && display->bits->HasBits() ? &display->raster : nullptr;
}

// Brings the control point between the rows of its anchors when it is no more than kControlSlack
// outside. False when it is farther out: the curve turns and has to be split.
bool SettleControl(CURVE* c)
{
    const bool down = c->anchor1.y <= c->anchor2.y;
    const S32 top = down ? c->anchor1.y : c->anchor2.y;
    const S32 bottom = down ? c->anchor2.y : c->anchor1.y;
    const S64 above = S64(top) - c->control.y;
    const S64 below = S64(c->control.y) - bottom;
    if (above > kControlSlack || below > kControlSlack)
        return false;
    c->control.y = above > 0 ? top : below > 0 ? bottom : c->control.y;
    return true;
}

S64 Rise(const CURVE& c)
{
    const S64 d = S64(c.anchor2.y) - c.anchor1.y;
    return d < 0 ? -d : d;
}

bool WhollyBeyond(const CURVE& c, S32 reach)
{
    const S32 y1 = c.anchor1.y, y2 = c.control.y, y3 = c.anchor2.y;
    return (y1 > reach && y2 > reach && y3 > reach) || (y1 < -reach && y2 < -reach && y3 < -reach);
}
} // namespace

SCharacterParser::SCharacterParser(SObject* object, ScriptPlayer* dictionary, const U8* data,
                                   S32 dataLen, S32 start, const MATRIX* matrix)
    : SShapeParser(dictionary, object->display, &object->colors, data, dataLen, start, matrix),
      obj(object)
{
}

bool SCharacterParser::BuildEdges(bool readStyles, const SRECT* devBounds)
{
    depth = 0;
    edgesLost = false;
    hugeCoords = OutgrowsEdges(*devBounds);
    raster = PaintedRaster(display);
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
    CURVE c;
    for (int flags = NextRecord(&c); flags != kEndOfShape; flags = NextRecord(&c)) {
        if (!SpendRecord())
            return;
        if (flags == 0) {
            if (color1)
                AddCurve(&c);
            continue;
        }
        if ((flags & kNewStyles) && obj->IsClip())
            MakeClipper();
        if (flags & (kFill0 | kFill1))
            ChangeFills();
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

// All splits work on the curve in its own direction, or the pieces would forget which way they
// wind.
void SCharacterParser::AddCurve(const CURVE* c)
{
    if (edgesLost)
        return;
    CURVE piece = *c;
    if (piece.isLine) {
        AddPiece(&piece);
        return;
    }
    // None of its pieces would show; a curve that reaches far out could have a great many.
    if (WhollyBeyond(piece, hugeCoords ? kShownReach : kEdgeReach))
        return;
    if (!SettleControl(&piece))
        SplitAtTurn(piece);
    else if (Rise(piece) > kMaxRise)
        SplitAtMiddle(piece);
    else
        AddPiece(&piece);
}

void SCharacterParser::SplitAtTurn(const CURVE& c)
{
    const S64 fromControl = S64(c.anchor1.y) - c.control.y;
    const S32 t = DivTrunc(fromControl * 0x10000, fromControl - c.control.y + c.anchor2.y);
    CURVE first, second;
    CurveDivide(&c, t, &first, &second);
    AddHalves(first, second);
}

void SCharacterParser::SplitAtMiddle(const CURVE& c)
{
    CURVE first, second;
    CurveDivide(&c, &first, &second);
    AddHalves(first, second);
}

// A piece dropped for its depth leaves the counter up on purpose: what follows in this build has
// less room to split, so that a wild outline cannot go on costing time.
void SCharacterParser::AddHalves(const CURVE& first, const CURVE& second)
{
    if (++depth > kMaxDepth)
        return;
    AddCurve(&first);
    AddCurve(&second);
    --depth;
}

void SCharacterParser::AddPiece(CURVE* c)
{
    if (c->anchor1.y == c->anchor2.y)
        return;
    if (hugeCoords || !PieceFits(*c)) {
        const EPieceFate fate = GuardPiece(c, depth < kMaxDepth);
        if (fate == kPieceSplit)
            SplitAtMiddle(*c);
        if (fate != kPieceKeep)
            return;
    }
    REdge* e = PushEdge(display, &obj->edges, *c);
    if (!e) {
        edgesLost = true;
        return;
    }
    e->fillRule = fillRule;
    e->color1 = color1;
    e->color2 = color2;
}

RColor* CreateClipColor(DisplayList* display, RColor** list)
{
    RColor* color = display->NewColor();
    if (!color)
        return nullptr;
    CRaster* raster = PaintedRaster(display);
    color->SetUp(raster);
    color->colorType = kColorClip;
    color->transparent = 1;
    color->nextColor = *list;
    *list = color;
    if (raster)
        color->BuildCache();
    return color;
}
