// Morph shapes: two edge lists walked in step.
#include "core/display/display_list.h"
#include "core/shape/character_parser.h"

namespace {
SPOINT Between(const SPOINT& start, const SPOINT& end, U16 ratio)
{
    return {FixedLerp(start.x, end.x, ratio), FixedLerp(start.y, end.y, ratio)};
}

// At ratio 0 the start counts alone, so that a straight edge that becomes curved later is drawn
// exactly as in a shape.
CURVE Between(const CURVE& start, const CURVE& end, U16 ratio)
{
    return {Between(start.anchor1, end.anchor1, ratio), Between(start.control, end.control, ratio),
            Between(start.anchor2, end.anchor2, ratio), start.isLine && (end.isLine || ratio == 0)};
}
} // namespace

// The end list is named by its distance from the end of the number that gives it. One that lies
// outside the tag is empty: no edges.
bool SCharacterParser::BuildMorphEdges(const SRECT* devBounds)
{
    const U32 distance = GetDWord();
    const U32 left = U32(limit - pos);
    const S32 endStart = distance < left ? pos + S32(distance) : limit;
    SShapeParser end(player, display, colorList, script, limit, endStart, &mat);
    end.GetSelectorWidths();
    endEdges = &end;
    const bool ok = BuildEdges(true, devBounds);
    endEdges = nullptr;
    return ok;
}

// The start list's next record, its edges paired with those of the end list and interpolated.
int SCharacterParser::NextMorphRecord(CURVE* c)
{
    const int flags = GetShapeEdge(c);
    if (flags != 0)
        return flags;
    CURVE end;
    if (!NextEndEdge(&end))
        return kEndOfShape;
    *c = Between(*c, end, ratio);
    MatrixTransformPoint(&mat, &c->anchor1, &c->anchor1);
    MatrixTransformPoint(&mat, &c->anchor2, &c->anchor2);
    if (c->isLine)
        PointMiddle(&c->anchor1, &c->anchor2, &c->control);
    else
        MatrixTransformPoint(&mat, &c->control, &c->control);
    return 0;
}

// Of all else in the end list only the move-tos matter, which the reader has followed already.
bool SCharacterParser::NextEndEdge(CURVE* c)
{
    int flags = endEdges->GetShapeEdge(c);
    for (; flags != 0 && flags != kEndOfShape; flags = endEdges->GetShapeEdge(c)) {
        if (!SpendRecord())
            return false;
    }
    return flags == 0 && SpendRecord();
}
