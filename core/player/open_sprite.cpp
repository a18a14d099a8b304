// Movies in the place of sprites.
#include "core/display/display_list.h"
#include "core/player/player.h"

// The record is that of one object, which takes the movie with it when it goes. Until it is placed
// the movie is ours.
ScriptPlayer* SPlayer::OpenSprite(ScriptThread* sprite)
{
    SObject* old = sprite->rootObject;
    if (old == nullptr || old->parent == nullptr || old->character == nullptr || IsLevel(sprite))
        return nullptr;
    ScriptPlayer* movie = NewMovie();
    SCharacter* ch = movie != nullptr ? movie->NewPrivateCharacter() : nullptr;
    if (ch == nullptr) {
        delete movie;
        return nullptr;
    }
    ch->type = kCharLoadedMovie;
    ch->tag = kIdLoadedMovie;
    ch->bounds = old->character->bounds;
    if (ScriptThread::ReplaceObject(old, ch) == nullptr) {
        delete movie;
        return nullptr;
    }
    return movie;
}
