// The dictionary: who is defined, who still uses a definition, and when its record dies.
#include <algorithm>
#include <cstdlib>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/sound/sound_mix.h"
#include "core/stream/script_player.h"
#include "core/stream/sounds.h"

namespace {
U64 allPixels = 0; // decoded, of all movies

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
    StopPlaying(ch);
    if (ch->users == 0) {
        DestroyCharacter(ch);
        return;
    }
    ch->orphan = true;
}

// A sound that leaves the dictionary falls silent.
void ScriptPlayer::StopPlaying(const SCharacter* ch)
{
    CSound sound;
    CSoundMix* mix = Mixer();
    if (mix && SoundOf(ch, &sound))
        mix->FreeSound(&sound);
}

void ScriptPlayer::DestroyCharacter(SCharacter* ch)
{
    if (ch->type == kCharBitmap)
        DropPixels(ch);
    if (ch->type == kCharFont)
        std::free(ch->font.cache);
    characterCount--;
    charAlloc.Free(ch);
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
        ch->player->DestroyCharacter(ch);
}

SCharacter* GoneCharacter()
{
    static SCharacter gone = {};
    gone.type = kCharNone;
    RectSetEmpty(&gone.bounds);
    return &gone;
}

// The object of a movie that is shown in a sprite's place would take this movie along: it is cut
// loose first.
void ScriptPlayer::RemoveRootObject()
{
    SObject* obj = rootObject;
    rootObject = nullptr;
    if (!obj || !display)
        return;
    if (obj->thread == this)
        obj->thread = nullptr;
    display->RemoveThisObject(obj);
}

void ScriptPlayer::FreeAll()
{
    RemoveRootObject();
    if (display)
        display->ForgetMovie(this);
    for (SCharacter*& head : charIndex) {
        while (SCharacter* ch = head) {
            Unchain(ch);
            FreeCharacter(ch);
        }
    }
    FreeIdPages();
    jpegInfo = nullptr;
    jpegInfoLen = 0;
    Rewind();
}

bool ScriptPlayer::HasRoomFor(U64 pixels) const
{
    return livePixels + pixels <= gLimits.movieBitmapPixels &&
           allPixels + pixels <= gLimits.allBitmapPixels;
}

bool ScriptPlayer::CreatePixels(SCharacter* ch, int format, S32 width, S32 height,
                                const SColorTable* ctab)
{
    const U64 pixels = SBitmapCore::PixelCost(width, height);
    if (pixels > gLimits.bitmapPixels)
        return false;
    retryImage = display && display->pixelsLeft < pixels;
    if (!retryImage && !HasRoomFor(pixels)) {
        MakeRoom();
        retryImage = !HasRoomFor(pixels);
    }
    if (retryImage)
        return false;
    if (!ch->bitmap.PICreate(format, width, height, ctab, 1)) {
        ch->bitmap.PIFree();
        return false;
    }
    livePixels += pixels;
    allPixels += pixels;
    if (display)
        display->pixelsLeft -= pixels;
    ChargePixels(pixels);
    return true;
}

void ScriptPlayer::ChargePixels(U64 pixels)
{
    constexpr U64 kPixelsPerUnit = 4;
    if (display)
        display->work += pixels / kPixelsPerUnit;
}

// Looking through the whole dictionary is paid for like reading as many records.
void ScriptPlayer::MakeRoom()
{
    if (display)
        display->recordsLeft -= std::min(display->recordsLeft, characterCount);
    DropUnusedPixels();
}

void ScriptPlayer::DropPixels(SCharacter* ch)
{
    const U64 pixels = ch->bitmap.PixelCost();
    livePixels -= pixels;
    allPixels -= pixels;
    ch->bitmap.PIFree();
}

void ScriptPlayer::DropUnusedPixels()
{
    for (SCharacter* ch : charIndex) {
        for (; ch; ch = ch->next) {
            if (ch->type == kCharBitmap && ch->bitmap.useCount == 0)
                DropPixels(ch);
        }
    }
}

void ScriptPlayer::FreeCache()
{
    DropUnusedPixels();
    for (SCharacter* ch : charIndex) {
        for (; ch; ch = ch->next) {
            if (ch->type == kCharBitmap)
                ch->bitmap.buildFailed = 0;
        }
    }
    charAlloc.FreeEmpties();
}
