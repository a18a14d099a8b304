// The object tree: change tracking, bounds, and the end of an object.
#include "core/display/sobject.h"

#include <algorithm>

#include "core/display/display_list.h"
#include "core/display/edit_text.h"
#include "core/player/limits.h"
#include "core/shape/character_parser.h"
#include "core/shape/text_records.h"
#include "core/stream/script_player.h"
#include "core/stream/str.h"
#include "core/stream/tags.h"

// Units of work: an object transformed, and one that is recalculated besides.
constexpr U64 kTransformWork = 4;
constexpr U64 kRecalculateWork = 8;

static bool Inside(const SRECT& r, const SRECT& outer)
{
    return r.xmin >= outer.xmin && r.xmax <= outer.xmax && r.ymin >= outer.ymin &&
           r.ymax <= outer.ymax;
}

void STransform::Concat(const STransform* inner)
{
    MatrixConcat(&inner->mat, &mat, &mat);
    cxform.Concat(&inner->cxform);
}

void SObject::Modify()
{
    dirty = 1;
    display->needCalcUpdate = 1;
}

void SObject::SetName(const char* newName)
{
    char* copy = CreateStr(newName);
    FreeStr(name);
    name = copy;
    nameHash = copy ? StrHash(copy) : 0;
}

void SObject::CalcUpdate(const MATRIX* parentMat, bool forced)
{
    MATRIX mat;
    MatrixConcat(&xform.mat, parentMat, &mat);
    forced = forced || dirty;
    display->work += forced ? kRecalculateWork : kTransformWork;
    if (remaskTo != 0)
        InvalidateRemasked(); // while the children still know their old places
    if (forced)
        Recalculate(&mat);
    else if (editText)
        RecalculateText(&mat);
    for (SObject* child = bottomChild; child; child = child->above)
        child->CalcUpdate(&mat, forced);
}

void SObject::Recalculate(const MATRIX* mat)
{
    if (drawn)
        display->InvalidateRect(DrawnPlace());
    FreeCache();
    drawn = 0;
    CalcDevBounds(mat);
    display->InvalidateRect(&devBounds);
    dirty = 0;
    if (editText)
        editText->TakeDirt();
}

// A field whose text alone has changed. Where its lines do not run with the raster's rows, what a
// row spills may leave the strip.
void SObject::RecalculateText(const MATRIX* mat)
{
    SRECT changed = editText->TakeDirt();
    if (RectIsEmpty(&changed))
        return;
    MatrixTransformRect(mat, &changed, &changed);
    Unbuild();
    const bool turned = mat->b != 0 || mat->c != 0;
    display->InvalidateRect(turned ? &devBounds : &changed);
}

// A mask in the range that reaches beyond it is drawn itself, and what it masks shows inside it
// only.
void SObject::InvalidateRemasked()
{
    for (SObject* child = bottomChild; child && child->depth <= remaskTo; child = child->above) {
        if (child->depth >= remaskFrom)
            child->InvalidateDrawn();
    }
    remaskFrom = remaskTo = 0;
}

void SObject::InvalidateDrawn()
{
    display->work++;
    if (drawn)
        display->InvalidateRect(DrawnPlace());
    for (SObject* child = bottomChild; child; child = child->above)
        child->InvalidateDrawn();
}

void SObject::CalcDevBounds(const MATRIX* mat)
{
    RectSetEmpty(&devBounds);
    if (!character)
        return;
    SRECT bounds = character->bounds;
    if (character->type == kCharMorphShape && !RectIsEmpty(&bounds) &&
        !RectIsEmpty(&character->endBounds))
        Interpolate(&character->bounds, &character->endBounds, ratio, &bounds);
    MatrixTransformRect(mat, &bounds, &devBounds);
}

// Half a shape would bleed over the picture, so one that the budget cuts short is not drawn at all;
// one that a whole budget or the pool of colours is too small for is not tried again.
void SObject::BuildEdges(const STransform* placed)
{
    if (built || !character || display->recordsLeft == 0)
        return;
    const bool wholeBudget = display->recordsLeft == gLimits.shapeRecords;
    display->colorsLost = false;
    switch (character->type) {
    case kCharShape:
    case kCharMorphShape:
        BuildShapeEdges(placed);
        break;
    case kCharText:
        BuildTextEdges(this, placed);
        break;
    case kCharEditText:
        if (editText)
            editText->Build(placed);
        break;
    default:
        return;
    }
    const bool complete = display->recordsLeft != 0 && !display->colorsLost;
    if (!complete)
        FreeCache();
    built = complete || wholeBudget || display->colorsLost;
    FindReach();
}

// Lines are as wide as their shape is scaled on the average, and never thinner than a pixel: under
// some transforms they lie outside the bounds, as does all of a shape whose bounds are wrong. What
// a text field draws is kept inside its bounds.
void SObject::FindReach()
{
    SRECT all = devBounds;
    for (const REdge* e = editText ? nullptr : edges; e; e = e->next) {
        const SRECT piece = {std::min({e->anchor1x, e->controlx, e->anchor2x}),
                             std::max({e->anchor1x, e->controlx, e->anchor2x}),
                             std::min(e->anchor1y, e->controly),
                             std::max(e->anchor2y, e->controly)};
        RectUnion(&all, &piece, &all);
    }
    SRECT repainted;
    display->Grow(&devBounds, &repainted);
    reach = RectIsEmpty(&all) || Inside(all, repainted) ? devBounds : all;
}

// Not while painting: it adds to the dirt.
void SObject::BuildNoted(const STransform* placed)
{
    if (built)
        return;
    BuildEdges(placed);
    if (built && !RectEqual(&reach, &devBounds, 0))
        display->InvalidateRect(&reach);
}

// Somewhere near the area: dirt is grown by as much when it is noted.
bool SObject::MayShowIn(const SRECT* area) const
{
    SRECT near;
    display->Grow(DrawnPlace(), &near);
    return RectTestIntersect(&near, area);
}

void SObject::BuildNew(STransform placed)
{
    if (!visible)
        return;
    placed.Concat(&xform);
    if (MayShowIn(&display->devViewRect))
        BuildNoted(&placed);
    if (!unbuiltBelow)
        return;
    unbuiltBelow = 0;
    for (SObject* child = bottomChild; child; child = child->above)
        child->BuildNew(placed);
}

// Kept apart from Draw: the parser's tables would stand on the stack once per level of the tree.
void SObject::BuildShapeEdges(const STransform* placed)
{
    SCharacterParser parser(this, character->player, character->data, character->DataLen(), 0,
                            &placed->mat);
    const bool isMorph = character->type == kCharMorphShape;
    parser.getAlpha = isMorph || character->tagCode == kTagDefineShape3;
    parser.cxform = placed->cxform;
    parser.ratio = ratio;
    if (isMorph)
        parser.BuildMorphEdges(&devBounds);
    else
        parser.BuildEdges(true, &devBounds);
}

void SObject::Unbuild()
{
    built = 0;
    for (SObject* p = parent; p && !p->unbuiltBelow; p = p->parent)
        p->unbuiltBelow = 1;
}

void SObject::FreeCache()
{
    Unbuild();
    display->FreeEdges(edges);
    edges = nullptr;
    display->FreeColors(colors);
    colors = nullptr;
    if (editText)
        editText->FreeCache();
}

void SObject::FreeCacheTree()
{
    FreeCache();
    for (SObject* child = bottomChild; child; child = child->above)
        child->FreeCacheTree();
}

void SObject::FreeChildren()
{
    while (bottomChild) {
        SObject* child = display->Unlink(&bottomChild);
        child->FreeChildren();
        if (child->drawn)
            display->InvalidateRect(child->DrawnPlace());
        display->Discard(child);
    }
}

// A hold on this object's children ends with it.
void SObject::Free()
{
    if (display->holdParent == this)
        display->DropHeld();
    FreeCache();
    FreeEditText();
    LeaveTimeline();
    ReleaseCharacter(character);
    character = nullptr;
    FreeStr(dropTarget);
    FreeStr(name);
    dropTarget = nullptr;
    name = nullptr;
}

static void UniteBounds(SObject* obj, const MATRIX* parentMat, SRECT* r)
{
    MATRIX mat;
    SRECT own;
    obj->display->work += kTransformWork;
    MatrixConcat(&obj->xform.mat, parentMat, &mat);
    if (obj->character) {
        MatrixTransformRect(&mat, &obj->character->bounds, &own);
        RectUnion(r, &own, r);
    }
    for (SObject* child = obj->bottomChild; child; child = child->above)
        UniteBounds(child, &mat, r);
}

void GetBoundingBox(SObject* obj, const MATRIX* mat, SRECT* r)
{
    RectSetEmpty(r);
    UniteBounds(obj, mat, r);
}

void GetBoundingBox(SObject* obj, SRECT* r)
{
    MATRIX identity;
    MatrixIdentity(&identity);
    GetBoundingBox(obj, &identity, r);
}
