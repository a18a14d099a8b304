// Placing, moving and removing display objects.
#include <algorithm>
#include <cstdio>

#include "core/display/display_list.h"
#include "core/display/edit_text.h"
#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/stream/script_player.h"
#include "core/stream/str.h"

namespace {
// Siblings passed over in a search that count as much work as one tag.
constexpr U32 kSiblingsPerTag = 64;

// Whether a move may show `fresh` in place of `old`. A sprite or button never becomes another type,
// nor anything else one of them; a loaded movie and a movie's root stay what they are.
bool MayReplace(const SCharacter* old, const SCharacter* fresh)
{
    if (!old || !fresh)
        return false;
    const auto fixed = [](U8 type) { return type == kCharLoadedMovie || type == kCharMovieRoot; };
    if (fixed(old->type) || fixed(fresh->type))
        return false;
    const auto keepsType = [](U8 type) { return type == kCharSprite || type == kCharButton; };
    return old->type == fresh->type || (!keepsType(old->type) && !keepsType(fresh->type));
}
} // namespace

void PlaceInfo::Clear()
{
    *this = {};
    MatrixIdentity(&mat);
    cxform.Clear();
}

bool DisplayList::MayPlace(const SObject* parent, const SCharacter* character) const
{
    if (!character || parent->nesting >= gLimits.nesting)
        return false;
    if (character->type != kCharSprite && character->type != kCharButton)
        return true;
    while (parent && parent->character != character)
        parent = parent->parent;
    return parent == nullptr;
}

// The link to the first child at or above the depth. Tags mostly come by ascending depth, so a
// search goes on from where the last one ended if it can. Long ones use up the tick's budget of
// tags, so that crowded depths cannot stall it.
SObject** DisplayList::FindLink(SObject* parent, U16 depth)
{
    U32 passed = 0;
    SObject* last = parent->passedChild;
    SObject** link = last && last->depth < depth ? &last->above : &parent->bottomChild;
    while (*link && (*link)->depth < depth) {
        parent->passedChild = *link;
        link = &(*link)->above;
        passed++;
    }
    ChargeTags(passed / kSiblingsPerTag);
    work += passed;
    return link;
}

// The link of that list to the object, or the one at the list's end.
SObject** DisplayList::FindLink(SObject** list, const SObject* obj)
{
    for (; *list && *list != obj; list = &(*list)->above)
        work++;
    return list;
}

SObject* DisplayList::FindChild(SObject* parent, U16 depth)
{
    U32 passed = 0;
    SObject* child = parent->bottomChild;
    for (; child && child->depth < depth; passed++)
        child = child->above;
    work += passed;
    ChargeTags(passed / kSiblingsPerTag);
    return child && child->depth == depth ? child : nullptr;
}

// Before anything is searched: loading the fonts places and removes an object.
void DisplayList::PrepareField(const SCharacter* character)
{
    if (character->type != kCharEditText || !splayer ||
        splayer->fontState != SPlayer::kFontsUntried)
        return;
    const SFieldRecord record(character);
    ChargeText(U32(record.variable.size() + record.text.size()));
    if (FieldFont::WantsBuiltIn(record, character->player))
        splayer->LoadBuiltInFonts();
}

// A second object at an occupied depth lands below the one that is there.
SObject* DisplayList::PlaceObject(SObject* parent, const PlaceInfo* info)
{
    if (!parent)
        parent = &root;
    if (!MayPlace(parent, info->character))
        return nullptr;
    PrepareField(info->character);
    SObject* obj = static_cast<SObject*>(objectAlloc.Alloc());
    if (!obj)
        return nullptr;
    SObject** link = FindLink(parent, info->depth);
    SetPlacement(obj, parent, info);
    obj->above = *link;
    *link = obj;
    NameObject(obj, info);
    NoteMask(obj);
    obj->Modify();
    StartObject(obj, info);
    return obj;
}

void DisplayList::SetPlacement(SObject* obj, SObject* parent, const PlaceInfo* info)
{
    obj->display = this;
    obj->parent = parent;
    obj->character = info->character;
    RetainCharacter(obj->character);
    obj->depth = info->depth;
    obj->ratio = info->ratio;
    obj->xform = {info->mat, info->cxform};
    obj->puppet = info->puppet;
    obj->clipDepth = (info->flags & PlaceInfo::kClipDepth) ? info->clipDepth : U16(0);
    obj->visible = 1;
    obj->thread = parent->thread;
    obj->serial = nextSerial++;
    obj->nesting = U16(parent->nesting + 1);
    obj->nextAlive = objects;
    obj->aliveLink = &objects;
    if (objects)
        objects->aliveLink = &obj->nextAlive;
    objects = obj;
    RectSetEmpty(&obj->devBounds);
    RectSetEmpty(&obj->reservedRect);
}

void DisplayList::NameObject(SObject* obj, const PlaceInfo* info)
{
    if (obj->character->type != kCharSprite || info->name) {
        obj->SetName(info->name);
        return;
    }
    char name[24];
    std::snprintf(name, sizeof name, "instance%d", static_cast<int>(++instanceCount));
    obj->SetName(name);
}

void DisplayList::StartObject(SObject* obj, const PlaceInfo* info)
{
    switch (obj->character->type) {
    case kCharSprite:
        StartSprite(obj);
        break;
    case kCharButton:
        StartButton(obj);
        break;
    case kCharLoadedMovie:
        StartLoadedMovie(obj, info);
        break;
    case kCharEditText:
        obj->MakeEditText();
        break;
    default:
        break;
    }
}

void DisplayList::StartButton(SObject* obj)
{
    const SButtonIdentity& saved = buttonIdentity;
    const bool tracked = saved.parent == obj->parent && saved.parentSerial == obj->parent->serial &&
                         saved.character == obj->character && saved.depth == obj->depth &&
                         saved.ratio == obj->ratio;
    if (tracked)
        button = obj;
    UpdateButton(obj, tracked ? buttonState : 1);
}

SObject* DisplayList::MoveObject(SObject* parent, const PlaceInfo* info)
{
    if (!parent)
        parent = &root;
    if ((info->flags & PlaceInfo::kCharacter) && info->character)
        PrepareField(info->character);
    SObject* obj = *FindLink(parent, info->depth);
    if (!obj || obj->depth != info->depth || obj->puppet)
        return nullptr;
    obj->Modify();
    if ((info->flags & PlaceInfo::kCharacter) && obj->character != info->character &&
        MayReplace(obj->character, info->character)) {
        obj->SetCharacter(info->character);
        NoteMask(obj);
    }
    if (info->flags & PlaceInfo::kMatrix)
        obj->xform.mat = info->mat;
    if (info->flags & PlaceInfo::kCxform)
        obj->xform.cxform = info->cxform;
    if (info->flags & PlaceInfo::kRatio)
        obj->ratio = info->ratio;
    return obj;
}

// A mask shows and hides its siblings far outside its own bounds: when it comes or goes, those in
// its range are to be repainted where they stand. A mask that an open hold has made has masked
// nothing yet; FinishHold notes it if it stays.
void DisplayList::NoteMask(const SObject* mask)
{
    SObject* parent = mask->parent;
    if (!mask->IsClip() || (parent == holdParent && mask->serial >= holdSerial))
        return;
    if (parent->remaskTo == 0 || mask->depth < parent->remaskFrom)
        parent->remaskFrom = mask->depth;
    parent->remaskTo = std::max(parent->remaskTo, mask->clipDepth);
    needCalcUpdate = 1;
}

void DisplayList::RemoveObject(SObject* parent, U16 depth)
{
    SObject** link = FindLink(parent ? parent : &root, depth);
    if (*link && (*link)->depth == depth)
        DoRemove(link);
}

void DisplayList::DoRemove(SObject** link)
{
    SObject* obj = *link;
    if (obj->drawn)
        InvalidateRect(obj->DrawnPlace());
    NoteMask(obj);
    Discard(Unlink(link));
}

// Takes the object that *link points at out of its list.
SObject* DisplayList::Unlink(SObject** link)
{
    SObject* obj = *link;
    *link = obj->above;
    if (obj->parent->passedChild == obj)
        obj->parent->passedChild = nullptr;
    return obj;
}

void DisplayList::RemoveThisObject(SObject* obj)
{
    if (!obj || !obj->parent)
        return;
    SObject** link = FindLink(&obj->parent->bottomChild, obj);
    if (!*link && obj->parent == holdParent)
        link = FindLink(&holdList, obj);
    if (*link)
        DoRemove(link);
}

// Ends an object that is in no list any more.
void DisplayList::Discard(SObject* obj)
{
    obj->FreeChildren();
    if (button == obj)
        button = nullptr;
    if (splayer)
        splayer->BeforeRemoval(obj);
    ClearRefs(obj);
    obj->Free();
    *obj->aliveLink = obj->nextAlive;
    if (obj->nextAlive)
        obj->nextAlive->aliveLink = obj->aliveLink;
    objectAlloc.Free(obj);
}
