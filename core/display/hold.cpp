// The bracket around a timeline's rebuild: objects that exist before and after it survive.
#include "core/display/display_list.h"
#include "core/display/edit_text.h"

#include "core/stream/character.h"

namespace {
bool IsTimelineType(const SObject* obj)
{
    const U8 type = obj->character->type;
    return type == kCharSprite || type == kCharLoadedMovie;
}

bool SameTransform(const SObject* a, const SObject* b)
{
    return MatrixEqual(&a->xform.mat, &b->xform.mat, 0) &&
           Equal(&a->xform.cxform, &b->xform.cxform);
}
} // namespace

void DisplayList::BeginHold(SObject* parent)
{
    FinishHold();
    holdParent = parent;
    holdList = parent->bottomChild;
    holdSerial = nextSerial;
    parent->bottomChild = nullptr;
    parent->passedChild = nullptr;
}

void DisplayList::FinishHold()
{
    if (!holdParent)
        return;
    SObject** link = &holdParent->bottomChild;
    while (holdList)
        link = MergeHeld(link);
    SObject* child = holdParent->bottomChild;
    holdParent = nullptr;
    for (; child; child = child->above) {
        work++;
        if (child->serial >= holdSerial)
            NoteMask(child);
        if (child->editText)
            child->editText->UpdateFromVariable();
    }
}

// Settles the lowest held object against the new object at *link, or moves on to the next new one.
// Returns the link to go on from.
SObject** DisplayList::MergeHeld(SObject** link)
{
    SObject* old = holdList;
    SObject* fresh = *link;
    work++;
    if (!fresh || old->depth < fresh->depth) {
        if (old->depth <= kMaxTimelineDepth) {
            DoRemove(&holdList);
            return link;
        }
        holdList = old->above;
        old->above = fresh;
        *link = old;
        return link;
    }
    if (old->depth == fresh->depth) {
        if (KeepsOld(old, fresh)) {
            KeepOld(link);
            return link;
        }
        DoRemove(&holdList);
    }
    return &fresh->above;
}

// For two objects at one depth. Two timelines with one ratio are taken for the same thing even when
// their characters or clip depths differ, but not one movie that moved: that is an oddity to keep.
bool DisplayList::KeepsOld(const SObject* old, const SObject* fresh) const
{
    if (old->ratio != fresh->ratio)
        return false;
    if (old->character == fresh->character && old->clipDepth == fresh->clipDepth)
        return old->character->type == kCharSprite || SameTransform(old, fresh);
    return IsTimelineType(old) && IsTimelineType(fresh);
}

void DisplayList::TakeTransform(SObject* old, const SObject* fresh)
{
    if (old->puppet || SameTransform(old, fresh))
        return;
    old->Modify();
    old->xform = fresh->xform;
}

// Puts the lowest held object in the place of the new one. When several objects share a depth, the
// new one may be one that was kept before and stands on the screen.
void DisplayList::KeepOld(SObject** freshLink)
{
    SObject* old = holdList;
    SObject* fresh = *freshLink;
    TakeTransform(old, fresh);
    if (button == fresh)
        button = old;
    holdList = old->above;
    old->above = fresh;
    *freshLink = old;
    DoRemove(&old->above);
}

// Gives the hold up: what it held goes.
void DisplayList::DropHeld()
{
    while (holdList)
        DoRemove(&holdList);
    holdParent = nullptr;
}
