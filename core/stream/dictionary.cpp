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

void Chain(SCharacter** head, SCharacter* ch)
{
    ch->next = *head;
    ch->link = head;
    if (ch->next)
        ch->next->link = &ch->next;
    *head = ch;
}

void Unchain(SCharacter* ch)
{
    *ch->link = ch->next;
    if (ch->next)
        ch->next->link = ch->link;
    ch->next = nullptr;
    ch->link = nullptr;
}
} // namespace

SCharacter* ScriptPlayer::CreateCharacter(U16 id)
{
    if (characterCount >= gLimits.characters || FindCharacter(id))
        return nullptr;
    auto* ch = static_cast<SCharacter*>(charAlloc.Alloc());
    if (!ch)
        return nullptr;
    if (!IndexCharacter(id, ch)) {
        charAlloc.Free(ch);
        return nullptr;
    }
    characterCount++;
    ch->tag = id;
    ch->player = this;
    ch->type = kCharNone;
    RectSetEmpty(&ch->bounds);
    Chain(&charIndex[ChainOf(id)], ch);
    return ch;
}

// False when there is no memory for the page.
bool ScriptPlayer::IndexCharacter(U16 id, SCharacter* ch)
{
    SCharacter**& page = idPages[id / kIdsPerPage];
    if (!page)
        page = static_cast<SCharacter**>(std::calloc(kIdsPerPage, sizeof(SCharacter*)));
    if (page)
        page[id % kIdsPerPage] = ch;
    return page != nullptr;
}

void ScriptPlayer::FreeIdPages()
{
    for (SCharacter**& page : idPages) {
        std::free(page);
        page = nullptr;
    }
}

SCharacter* ScriptPlayer::FindCharacter(U16 id)
{
    SCharacter** page = idPages[id / kIdsPerPage];
    return page ? page[id % kIdsPerPage] : nullptr;
}

void ScriptPlayer::FreeCharacter(U16 id)
{
    SCharacter* ch = FindCharacter(id);
    if (!ch)
        return;
    idPages[id / kIdsPerPage][id % kIdsPerPage] = nullptr;
    Unchain(ch);
    FreeCharacter(ch);
}

void ScriptPlayer::FreeCharacter(SCharacter* ch)
{
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
            Unchain(ch);
            FreeCharacter(ch);
        }
    }
    FreeIdPages();
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
