// The dictionary: who is defined, who still uses a definition, and when its record dies.
#include <cstdlib>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/stream/script_player.h"

namespace {
S32 ChainOf(U16 id)
{
    return id & (ScriptPlayer::kChains - 1);
}
} // namespace

SCharacter* ScriptPlayer::CreateCharacter(U16 id)
{
    if (characterCount >= gLimits.characters || FindCharacter(id))
        return nullptr;
    auto* ch = static_cast<SCharacter*>(charAlloc.Alloc());
    if (!ch)
        return nullptr;
    characterCount++;
    ch->tag = id;
    ch->player = this;
    ch->type = kCharNone;
    RectSetEmpty(&ch->bounds);
    ch->next = charIndex[ChainOf(id)];
    charIndex[ChainOf(id)] = ch;
    return ch;
}

SCharacter* ScriptPlayer::FindCharacter(U16 id)
{
    SCharacter* ch = charIndex[ChainOf(id)];
    while (ch && ch->tag != id)
        ch = ch->next;
    return ch;
}

void ScriptPlayer::FreeCharacter(U16 id)
{
    for (SCharacter** link = &charIndex[ChainOf(id)]; *link;) {
        SCharacter* ch = *link;
        if (ch->tag != id) {
            link = &ch->next;
            continue;
        }
        *link = ch->next;
        FreeCharacter(ch);
    }
}

void ScriptPlayer::FreeCharacter(SCharacter* ch)
{
    ch->next = nullptr;
    if (ch->users == 0) {
        DestroyCharacter(ch);
        return;
    }
    ch->orphan = true;
    orphanCount++;
}

void ScriptPlayer::DestroyCharacter(SCharacter* ch)
{
    if (ch->type == kCharBitmap)
        ch->bitmap.PIFree();
    characterCount--;
    charAlloc.Free(ch);
}

void ScriptPlayer::ReleaseOrphan(SCharacter* ch)
{
    orphanCount--;
    DestroyCharacter(ch);
}

// From the heap and not from the pool: the object that owns it may outlive the movie by a moment,
// and the record of a loaded movie names that movie as its player, not the one that made it.
SCharacter* ScriptPlayer::NewPrivateCharacter()
{
    auto* ch = static_cast<SCharacter*>(std::calloc(1, sizeof(SCharacter)));
    if (!ch)
        return nullptr;
    ch->player = this;
    ch->type = kCharNone;
    ch->privateCopy = true;
    RectSetEmpty(&ch->bounds);
    return ch;
}

void RetainCharacter(SCharacter* ch)
{
    if (ch)
        ch->users++;
}

void ReleaseCharacter(SCharacter* ch)
{
    if (!ch || ch->users == 0 || --ch->users > 0)
        return;
    if (ch->privateCopy)
        std::free(ch);
    else if (ch->orphan)
        ch->player->ReleaseOrphan(ch);
}

namespace {
// The first object of the subtree that shows an orphan of the movie, or null.
SObject* FindStray(SObject* obj, const ScriptPlayer* movie)
{
    const SCharacter* ch = obj->character;
    if (ch && ch->orphan && ch->player == movie)
        return obj;
    for (SObject* child = obj->bottomChild; child; child = child->above) {
        if (SObject* stray = FindStray(child, movie))
            return stray;
    }
    return nullptr;
}
} // namespace

// Records and bytes go away with the movie, so no object may go on showing them, wherever it hangs.
void ScriptPlayer::RemoveStrays()
{
    while (orphanCount > 0 && display) {
        SObject* stray = FindStray(&display->root, this);
        if (!stray)
            return;
        display->RemoveThisObject(stray);
    }
}

void ScriptPlayer::FreeAll()
{
    if (rootObject && display)
        display->RemoveThisObject(rootObject);
    rootObject = nullptr;
    for (SCharacter*& head : charIndex) {
        while (SCharacter* ch = head) {
            head = ch->next;
            FreeCharacter(ch);
        }
    }
    RemoveStrays();
    Rewind();
}

void ScriptPlayer::FreeCache()
{
    for (SCharacter* ch : charIndex) {
        for (; ch; ch = ch->next) {
            if (ch->type == kCharBitmap && ch->bitmap.useCount == 0)
                ch->bitmap.PIFree();
        }
    }
    charAlloc.FreeEmpties();
}
