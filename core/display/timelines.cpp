// The timelines of sprites and of movies shown in a sprite's place: how they start with their
// object and end with it.
#include <new>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/stream/movie_data.h"
#include "core/stream/script_player.h"
#include "core/stream/str.h"

namespace {
// tagEnd of a timeline that has read no tag yet.
constexpr S32 kNoTagYet = 0x20000000;

void CopyHeader(const ScriptPlayer* from, ScriptPlayer* to)
{
    to->splayer = from->splayer;
    to->sourceName = CreateStr(from->sourceName);
    to->script = from->script;
    to->limit = from->limit;
    to->len = from->len;
    to->startPos = from->startPos;
    to->scanPos = from->scanPos;
    to->scriptLen = from->scriptLen;
    to->numFrames = from->numFrames;
    to->headerBytes = from->headerBytes;
    for (size_t i = 0; i < sizeof from->header; i++)
        to->header[i] = from->header[i];
    to->gotHeader = from->gotHeader;
    to->numFramesComplete = from->numFramesComplete;
    to->frame = from->frame;
    to->frameRate = from->frameRate;
    to->frameDelay = from->frameDelay;
    to->version = from->version;
}

// Rewinds a timeline without taking its data away.
void RestartTimeline(ScriptThread* thread)
{
    const U8* script = thread->script;
    const S32 limit = thread->limit, len = thread->len, frames = thread->numFrames;
    const S32 error = thread->scriptErr;
    thread->ClearState();
    thread->script = script;
    thread->limit = limit;
    thread->len = len;
    thread->numFrames = frames;
    thread->scriptErr = error;
    thread->pos = thread->startPos;
    thread->tagEnd = kNoTagYet;
}
} // namespace

void DisplayList::AttachTimeline(SObject* obj, ScriptThread* thread)
{
    obj->thread = thread;
    thread->rootObject = obj;
    thread->layerDepth = obj->depth;
    thread->display = this;
    AddThread(thread);
}

void DisplayList::StartSprite(SObject* obj)
{
    const SCharacter* character = obj->character;
    void* memory = threadAlloc.Alloc();
    obj->thread = nullptr;
    if (!memory)
        return; // without memory the sprite stays empty
    auto* thread = new (memory) ScriptThread;
    thread->ClearState();
    thread->player = character->player;
    thread->splayer = character->player->splayer;
    thread->Attach(character->data, character->player->BytesFrom(character->data));
    thread->len =
        character->sprite.dataLen < thread->limit ? character->sprite.dataLen : thread->limit;
    thread->tagEnd = kNoTagYet;
    thread->numFrames = character->sprite.numFrames;
    AttachTimeline(obj, thread);
    thread->DrawFrame(0, false);
}

// A movie that is shown already is not shown twice; a clone needs all of its source's bytes.
// Without a movie of its own the object has no timeline.
void DisplayList::StartLoadedMovie(SObject* obj, const PlaceInfo* info)
{
    const bool clone = info->flags & PlaceInfo::kPrivateCopy;
    obj->thread = nullptr;
    ScriptPlayer* movie = clone ? CloneMovie(obj->character) : obj->character->player;
    if (clone && obj->character->privateCopy)
        obj->character->player = movie; // the source may be gone when this clone is cloned
    if (!movie || movie->rootObject)
        return;
    RestartTimeline(movie);
    AttachTimeline(obj, movie);
    movie->DrawFrame(0, false);
}

// A second player over the bytes of a loaded movie, with a dictionary of its own: running the tags
// fills it.
ScriptPlayer* DisplayList::CloneMovie(const SCharacter* character)
{
    ScriptPlayer* source = character->player;
    if (!source || !source->Complete() || clonedMovies >= gLimits.loadedMovies)
        return nullptr;
    auto* copy = new (std::nothrow) ScriptPlayer;
    if (!copy)
        return nullptr;
    CopyHeader(source, copy);
    copy->sharedScript = source->sharedScript;
    copy->sharedScript->AddRef();
    copy->sharedCopy = true;
    clonedMovies++;
    return copy;
}

bool SObject::OwnsThread() const
{
    return thread && thread->rootObject == this;
}

// A movie's root object stands for a player that lives on without it; every other timeline dies
// with its object.
void SObject::LeaveTimeline()
{
    ScriptThread* own = OwnsThread() ? thread : nullptr;
    thread = nullptr;
    if (!own)
        return;
    own->rootObject = nullptr;
    if (character->type == kCharMovieRoot)
        return;
    display->EndTimeline(own);
}

// Sprites' timelines come from the pool, movies from the heap.
void DisplayList::EndTimeline(ScriptThread* thread)
{
    if (thread->IsRoot()) {
        delete thread;
        return;
    }
    thread->~ScriptThread();
    threadAlloc.Free(thread);
}

static SCharacter* ExchangeForGone(SCharacter* ch)
{
    ReleaseCharacter(ch);
    RetainCharacter(GoneCharacter());
    return GoneCharacter();
}

void DisplayList::ForgetMovie(const ScriptPlayer* movie)
{
    for (SObject* obj = objects; obj; obj = obj->nextAlive) {
        work++;
        if (obj->character && obj->character->player == movie)
            Empty(obj);
    }
    if (buttonIdentity.character && buttonIdentity.character->player == movie)
        ForgetIdentity();
    if (pending && pending->player == movie)
        pending = ExchangeForGone(pending);
    for (ScriptThread* thread = threads; thread; thread = thread->nextThread) {
        work++;
        if (thread->player == movie && thread != movie)
            thread->LoseMovie();
    }
}

void DisplayList::Empty(SObject* obj)
{
    NoteMask(obj);
    obj->clipDepth = 0;
    obj->Modify();
    obj->FreeCache();
    obj->FreeEditText();
    if (button == obj)
        button = nullptr;
    obj->character = ExchangeForGone(obj->character);
}
