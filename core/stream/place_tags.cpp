// Tags and script operations that put objects on the display list and take them off.
#include "core/display/display_list.h"
#include "core/stream/script_player.h"
#include "core/stream/script_thread.h"
#include "core/stream/str.h"
#include "core/stream/tags.h"

// A character that a tag may place: reserved ids count as unknown.
SCharacter* ScriptThread::PlacedCharacter(U16 id)
{
    return player && id < kIdFirstReserved ? player->FindCharacter(id) : nullptr;
}

void ScriptThread::SetBackgroundColor()
{
    if (display)
        display->SetBackgroundColor(GetColor(0), 1);
}

void ScriptThread::PlaceObject()
{
    PlaceInfo info;
    info.Clear();
    info.flags = PlaceInfo::kCharacter | PlaceInfo::kMatrix;
    info.character = PlacedCharacter(GetWord());
    info.depth = GetWord();
    if (!info.character || !display)
        return;
    GetMatrix(&info.mat);
    if (pos < tagEnd) {
        GetColorTransform(&info.cxform, 0);
        info.flags |= PlaceInfo::kCxform;
    }
    display->PlaceObject(rootObject, &info);
}

void ScriptThread::PlaceObject2()
{
    PlaceInfo info;
    info.Clear();
    // The clone mark is ours alone and must not come from a file.
    info.flags = GetByte() & ~static_cast<U32>(PlaceInfo::kPrivateCopy);
    info.depth = GetWord();
    if (info.flags & PlaceInfo::kCharacter) {
        info.character = PlacedCharacter(GetWord());
        if (!info.character)
            return;
    }
    if (info.flags & PlaceInfo::kMatrix)
        GetMatrix(&info.mat);
    if (info.flags & PlaceInfo::kCxform)
        GetColorTransform(&info.cxform, 1);
    if (info.flags & PlaceInfo::kRatio)
        info.ratio = GetWord();
    // The name is looked at but not read past, so that a clip depth after it comes from the name's
    // own first two bytes. Movies depend on this.
    if (info.flags & PlaceInfo::kName)
        info.name = PeekString();
    // A new object copies its name, however far the data goes on without a zero byte.
    if (info.name && !(info.flags & PlaceInfo::kMove))
        ChargeWork(StrLength(info.name));
    if (info.flags & PlaceInfo::kClipDepth)
        info.clipDepth = GetWord();
    PlaceOrMove(info);
}

void ScriptThread::PlaceOrMove(const PlaceInfo& info)
{
    if (!display)
        return;
    if (info.flags & PlaceInfo::kMove)
        display->MoveObject(rootObject, &info);
    else if (info.character)
        display->PlaceObject(rootObject, &info);
}

void ScriptThread::RemoveObject()
{
    if (tagCode == kTagRemoveObject)
        GetWord(); // the character's id: the depth alone decides
    const U16 depth = GetWord();
    if (display)
        display->RemoveObject(rootObject, depth);
}

namespace {
// The placement of an object as it stands; the name is not among it.
void CopyPlacement(const SObject* obj, PlaceInfo* info)
{
    info->Clear();
    info->flags = PlaceInfo::kCharacter | PlaceInfo::kMatrix;
    info->mat = obj->xform.mat;
    info->cxform = obj->xform.cxform;
    info->depth = obj->depth;
    info->ratio = obj->ratio;
    info->clipDepth = obj->clipDepth;
    if (info->cxform.flags != 0)
        info->flags |= PlaceInfo::kCxform;
    if (info->clipDepth != 0)
        info->flags |= PlaceInfo::kClipDepth;
}

void SetName(PlaceInfo* info, const char* name)
{
    info->name = name;
    if (name)
        info->flags |= PlaceInfo::kName;
}

SCharacter* TakePending(DisplayList* list)
{
    SCharacter* ch = list->pending;
    list->pending = nullptr;
    return ch;
}

// A sprite without frames in the place of `old`, for one object; null when memory is exhausted.
SCharacter* NewEmptySprite(ScriptPlayer* movie, const SCharacter* old)
{
    SCharacter* empty = movie->NewPrivateCharacter();
    if (!empty)
        return nullptr;
    empty->type = kCharSprite;
    empty->tag = kIdEmptySprite;
    empty->bounds = old->bounds;
    return empty;
}
} // namespace

// A private record of the same movie, for a clone of the object that shows it.
SCharacter* ScriptThread::CopyMovieCharacter(const SCharacter* source)
{
    SCharacter* copy = player->NewPrivateCharacter();
    if (!copy)
        return nullptr;
    *copy = *source;
    copy->next = nullptr;
    copy->link = nullptr;
    copy->users = 0;
    copy->orphan = false;
    copy->privateCopy = true;
    copy->data = script;
    copy->dataLen = limit;
    return copy;
}

void ScriptThread::CloneSprite(ScriptThread* src, const char* name, S32 depth)
{
    const SObject* source = src ? src->rootObject : nullptr;
    if (!source || !source->character || !rootObject || !display || !player)
        return;
    PlaceInfo info;
    CopyPlacement(source, &info);
    info.depth = static_cast<U16>(depth);
    info.ratio = 0xFFFF;
    info.character = source->character;
    if (info.character->type == kCharLoadedMovie) {
        info.character = CopyMovieCharacter(source->character);
        info.flags |= PlaceInfo::kPrivateCopy;
        if (!info.character)
            return;
    }
    // What stands at the depth may be the source itself, and the name may be its own: nothing of
    // them is looked at from here on.
    char* nameCopy = CreateStr(name);
    SetName(&info, nameCopy);
    RetainCharacter(info.character);
    display->pending = info.character;
    display->RemoveObject(rootObject, info.depth);
    info.character = TakePending(display); // its movie may have gone with what stood there
    display->PlaceObject(rootObject, &info);
    ReleaseCharacter(info.character);
    FreeStr(nameCopy);
}

void ScriptThread::RemoveSprite(ScriptThread* sprite, bool keep)
{
    SObject* old = sprite ? sprite->rootObject : nullptr;
    if (!old || !old->parent || !old->character || !display || !player)
        return;
    if (!keep) {
        display->RemoveThisObject(old);
        return;
    }
    const ScriptThread* around = old->parent->thread;
    ReplaceObject(old, NewEmptySprite(around ? around->player : player, old->character));
}

// Removing the old object ends its timeline, and with it perhaps the caller's.
SObject* ScriptThread::ReplaceObject(SObject* old, SCharacter* fresh)
{
    DisplayList* list = old->display;
    SObject* parent = old->parent;
    PlaceInfo info;
    CopyPlacement(old, &info);
    info.puppet = old->puppet;
    char* nameCopy = CreateStr(old->name);
    SetName(&info, nameCopy);
    RetainCharacter(fresh);
    list->pending = fresh;
    list->RemoveThisObject(old);
    info.character = TakePending(list);
    SObject* placed = info.character ? list->PlaceObject(parent, &info) : nullptr;
    ReleaseCharacter(info.character);
    FreeStr(nameCopy);
    return placed;
}
