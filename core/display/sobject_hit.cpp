// Hit tests: which object lies under a point.
#include "core/display/display_list.h"
#include "core/geom/curve.h"
#include "core/stream/character.h"
#include "core/text/field_record.h"

namespace {
// Units of work: an object and its transform, and how many edges are one.
constexpr U64 kObjectWork = 4;
constexpr U32 kEdgesPerUnit = 8;

bool Crosses(const REdge* e, const SPOINT* pt)
{
    if (pt->y < e->anchor1y || pt->y >= e->anchor2y)
        return false;
    const CURVE curve = {{e->anchor1x, e->anchor1y},
                         {e->controlx, e->controly},
                         {e->anchor2x, e->anchor2y},
                         e->isLine};
    return CurveXRaySect(&curve, pt, 0) & 1;
}

void Toggle(RColor* c)
{
    if (c)
        c->visible ^= 1;
}

// Notes a crossing in the colours' on bytes, by the rules of the raster.
void CountCrossing(const REdge* e)
{
    switch (e->fillRule) {
    case kRuleEdge:
        Toggle(e->color1);
        Toggle(e->color2);
        break;
    case kRuleEvenOdd:
        Toggle(e->color1);
        break;
    default:
        if (e->color1)
            e->color1->visible = U8(e->color1->visible + e->dir);
    }
}
} // namespace

bool SObject::HitTestOne(const STransform* placed, const SPOINT* pt)
{
    if (character && character->type == kCharEditText)
        return FieldContains(&placed->mat, pt);
    if (RectIsEmpty(&devBounds) || !RectPointIn(&devBounds, pt))
        return false;
    BuildNoted(placed);
    return EdgesContain(pt);
}

// Casts a ray towards +x.
bool SObject::EdgesContain(const SPOINT* pt)
{
    bool crossed = false;
    U32 edgesSeen = 0;
    for (const REdge* e = edges; e; e = e->next) {
        edgesSeen++;
        if (!Crosses(e, pt))
            continue;
        CountCrossing(e);
        crossed = true;
    }
    display->work += edgesSeen / kEdgesPerUnit;
    return crossed && TakeColorFlags();
}

// True when some colour is on; afterwards none is.
bool SObject::TakeColorFlags()
{
    bool on = false;
    for (RColor* c = colors; c; c = c->nextColor) {
        on = on || c->visible != 0;
        c->visible = 0;
    }
    return on;
}

// In its own coordinates: a field turned by a transform is not as large as its bounds on the
// device.
bool SObject::FieldContains(const MATRIX* placed, const SPOINT* pt) const
{
    const U32 flags = character->DataLen() < 2 ? 0u : character->data[0] | character->data[1] << 8u;
    if (flags & kFieldNoSelect)
        return false;
    MATRIX toField;
    SPOINT inField;
    MatrixInvert(placed, &toField);
    MatrixTransformPoint(&toField, pt, &inField);
    return !RectIsEmpty(&character->bounds) && RectPointIn(&character->bounds, &inField);
}

void SObject::HitTest(SObject*& hit, STransform placed, const SPOINT* pt)
{
    display->work += kObjectWork;
    if (!visible)
        return;
    placed.Concat(&xform);
    if (HitTestOne(&placed, pt))
        hit = this;
    for (SObject* child = bottomChild; child;) {
        if (child->IsClip()) {
            child = child->HitClipper(&placed, pt);
            continue;
        }
        child->HitTest(hit, placed, pt);
        child = child->above;
    }
}

SObject* SObject::HitClipper(const STransform* parentXform, const SPOINT* pt)
{
    STransform placed = *parentXform;
    display->work += kObjectWork;
    placed.Concat(&xform);
    return HitTestOne(&placed, pt) ? above : FirstBeyond(clipDepth);
}

SObject* SObject::FirstBeyond(U16 maskDepth) const
{
    SObject* next = above;
    for (; next && next->depth <= maskDepth; next = next->above)
        display->work++;
    return next;
}
