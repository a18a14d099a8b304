// Drawing the object tree with its masks.
#include "core/display/display_list.h"
#include "core/display/edit_text.h"
#include "core/player/limits.h"

void SObject::Draw(CRaster* raster, STransform placed, RColor* clip)
{
    if (!visible)
        return;
    placed.Concat(&xform);
    if (MayShowIn(raster->AreaDev())) {
        BuildEdges(&placed);
        AddOwnEdges(raster, clip);
        drawn = 1;
    }
    for (SObject* child = bottomChild; child;)
        child = child->DrawInOrder(raster, &placed, clip);
}

void SObject::AddOwnEdges(CRaster* raster, RColor* clip)
{
    if (editText)
        DrawEditText(raster, clip);
    else
        raster->AddEdges(edges, colors, clip);
}

void SObject::DrawEditText(CRaster* raster, RColor* clip)
{
    editText->Draw(raster, clip);
}

// Draws this object, and what it masks when it is a mask; returns the sibling to go on with.
SObject* SObject::DrawInOrder(CRaster* raster, const STransform* parentXform, RColor* clip)
{
    if (IsClip())
        return DrawClipBracket(raster, parentXform, clip);
    Draw(raster, *parentXform, clip);
    return above;
}

// What is masked goes in before the mask itself: the raster has to know all clipped edges when the
// mask's arrive. A mask without colours is passed over, and its range shows unmasked; so is one
// inside too many others, because every open mask is a level of recursion.
SObject* SObject::DrawClipBracket(CRaster* raster, const STransform* parentXform, RColor* clip)
{
    if (display->openMasks >= gLimits.nesting)
        return above;
    STransform placed = *parentXform;
    placed.Concat(&xform);
    BuildEdges(&placed);
    if (!colors)
        return above;
    drawn = 1;
    RColor* mask = MaskColor();
    SObject* next = above;
    display->openMasks++;
    while (next && next->depth <= clipDepth)
        next = next->DrawInOrder(raster, parentXform, mask);
    display->openMasks--;
    if (editText)
        editText->DrawMask(raster, clip);
    else
        raster->AddEdges(edges, colors, clip ? clip : ClipMarker());
    return next;
}

// The one clip colour of the mask. Fill colours that it replaced may stand before it; without it
// (the pool was exhausted) the first of them, which no edge carries, hides the whole range.
RColor* SObject::MaskColor() const
{
    for (RColor* c = colors; c; c = c->nextColor) {
        if (c->colorType == kColorClip)
            return c;
    }
    return colors;
}
