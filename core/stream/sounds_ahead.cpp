#include "core/stream/sounds_ahead.h"

#include <algorithm>

#include "core/player/player.h"
#include "core/sound/sound_mix.h"
#include "core/stream/movie_data.h"
#include "core/stream/sounds.h"
#include "core/stream/tags.h"

SoundsAhead::SoundsAhead(const ScriptThread& timeline) : tags(timeline, timeline.tagStart)
{
    std::fill(chains, chains + kChains, kNone);
}

SoundsAhead::~SoundsAhead()
{
    ReleaseTaken();
    while (released != made.load(std::memory_order_relaxed))
        ready[released++ % kMostReady].channel->Release();
}

U32 SoundsAhead::Prepare(const ScriptThread& timeline)
{
    ReleaseTaken();
    ForgetChanges(timeline.pos);
    work = 0;
    for (U32 i = 0; i < kTagsPerGo && tags.GetTag(timeline.len) > kTagEnd; i++) {
        work++;
        if (!ReadTag(timeline)) {
            tags.pos = tags.tagStart;
            return work;
        }
        tags.pos = tags.tagEnd;
    }
    if (tags.tagCode == kTagEnd)
        tags.pos = tags.tagStart;
    return work;
}

// False: no room for it yet; it is to be read again.
bool SoundsAhead::ReadTag(const ScriptThread& timeline)
{
    switch (tags.tagCode) {
    case kTagDefineSound:
        return Define(timeline, tags.GetWord());
    case kTagFreeCharacter:
        return Free(timeline, tags.GetWord());
    case kTagStartSound:
        return Start(timeline, tags.GetWord());
    default:
        return true;
    }
}

// The first definition of an id counts, as in the dictionary.
bool SoundsAhead::Define(const ScriptThread& timeline, U16 id)
{
    const SChange* change = FindChange(id);
    const bool known = change ? change->defined : timeline.player->FindCharacter(id) != nullptr;
    CSound sound;
    if (known || id >= kIdFirstReserved || !GetSoundBody(&tags, &sound))
        return true;
    sound.movie = timeline.player->soundTag;
    return Change(id, true, sound);
}

bool SoundsAhead::Free(const ScriptThread& timeline, U16 id)
{
    CSound sound;
    return !Find(timeline, id, &sound) || Change(id, false, CSound());
}

bool SoundsAhead::Start(const ScriptThread& timeline, U16 id)
{
    const U32 next = made.load(std::memory_order_relaxed);
    CSound sound;
    if (!Find(timeline, id, &sound))
        return true;
    if (next - released == kMostReady)
        return false;
    CSoundChannel* channel =
        NewEventSound(sound, timeline.player->sharedScript, timeline.soundTag, &tags);
    if (!channel)
        return true;
    if (!(channel->syncFlags & kSyncStop) && !channel->Prepare()) {
        channel->Release();
        return true;
    }
    work += channel->StartCost();
    ready[next % kMostReady] = {tags.tagStart, channel};
    made.store(next + 1, std::memory_order_release);
    return true;
}

bool SoundsAhead::Find(const ScriptThread& timeline, U16 id, CSound* sound) const
{
    const SChange* change = FindChange(id);
    if (!change)
        return SoundOf(timeline.player->FindCharacter(id), sound);
    *sound = change->sound;
    return change->defined;
}

bool SoundsAhead::Change(U16 id, bool defined, const CSound& sound)
{
    if (SChange* change = FindChange(id)) {
        *change = {tags.tagStart, id, defined, change->next, sound};
        return true;
    }
    const size_t count = changes.size();
    if (count >= kMostChanges || !changes.Push({tags.tagStart, id, defined, kNone, sound}))
        return false;
    Chain(static_cast<U16>(count));
    return true;
}

void SoundsAhead::Chain(U16 change)
{
    U16& first = chains[changes[change].id % kChains];
    changes[change].next = first;
    first = change;
}

SoundsAhead::SChange* SoundsAhead::FindChange(U16 id)
{
    for (U16 i = chains[id % kChains]; i != kNone; i = changes[i].next)
        if (changes[i].id == id)
            return &changes[i];
    return nullptr;
}

const SoundsAhead::SChange* SoundsAhead::FindChange(U16 id) const
{
    return const_cast<SoundsAhead*>(this)->FindChange(id);
}

// The timeline has run these tags itself by now.
void SoundsAhead::ForgetChanges(S32 before)
{
    std::fill(chains, chains + kChains, kNone);
    U16 kept = 0;
    for (const SChange& change : changes) {
        if (change.place < before)
            continue;
        changes[kept] = change;
        Chain(kept++);
    }
    changes.Truncate(kept);
}

void SoundsAhead::ReleaseTaken()
{
    const U32 end = taken.load(std::memory_order_acquire);
    while (released != end)
        ready[released++ % kMostReady].channel->Release();
}

// A channel counts as taken only when the mixer holds it, since the other thread then lets go.
void SoundsAhead::StartAt(S32 place, CSoundMix* mix)
{
    U32 next = taken.load(std::memory_order_relaxed);
    const U32 end = made.load(std::memory_order_acquire);
    for (; next != end && ready[next % kMostReady].place <= place; next++) {
        if (ready[next % kMostReady].place == place)
            mix->AddSoundLocked(ready[next % kMostReady].channel);
    }
    taken.store(next, std::memory_order_release);
}
