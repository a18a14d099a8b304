// Levels: the movies beside the root.
#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/stream/str.h"

#include <new>

namespace {

} // namespace

ScriptPlayer* FindLayer(ScriptPlayer* first, S32 layer)
{
    while (first != nullptr && first->layerNum != layer)
        first = first->nextLayer;
    return first;
}

S32 LayerNum(const char* name)
{
    if (name == nullptr)
        return -1;
    const char* digits = SkipPrefix(name, "_vexel");
    if (digits == nullptr)
        digits = SkipPrefix(name, "_level");
    return digits == nullptr ? -1 : ToInt(digits);
}

ScriptPlayer* SPlayer::OpenLayer(S32 layer, int keep)
{
    ScriptPlayer* movie = this;
    if (layer != 0) {
        movie = FindLayer(layers, layer);
        if (movie == nullptr)
            movie = NewLayer(layer);
        else if (!keep)
            movie->ClearScript();
    } else if (!keep && (headerBytes > 0 || stream != nullptr)) {
        ClearScript();
    }
    if (movie != nullptr)
        SetVersionVariable(movie);
    return movie;
}

ScriptPlayer* SPlayer::NewLayer(S32 layer)
{
    ScriptPlayer* movie = layer < 0 || layer > kLastLayer ? nullptr : NewMovie();
    if (movie == nullptr)
        return nullptr;
    movie->display = &scene;
    movie->layerNum = layer;
    movie->layerDepth = static_cast<U16>(layer);
    movie->nextLayer = layers;
    layers = movie;
    scene.AddThread(movie);
    return movie;
}

// Every movie beside the root: in levels, in sprites, and variables that are arriving.
U32 SPlayer::CountMovies() const
{
    U32 n = 0;
    for (const ScriptThread* thread = scene.threads; thread != nullptr; thread = thread->nextThread)
        n += thread->IsRoot() && thread != this && thread != &fontPlayer;
    for (const ScriptPlayer* loader = loaders; loader != nullptr; loader = loader->nextLayer)
        n++;
    return n;
}

// Of no list yet; null when there are too many or memory is exhausted.
ScriptPlayer* SPlayer::NewMovie()
{
    if (CountMovies() >= gLimits.loadedMovies)
        return nullptr;
    ScriptPlayer* movie = new (std::nothrow) ScriptPlayer;
    if (movie != nullptr)
        movie->splayer = this;
    return movie;
}

// The timeline is the root of a level, and not of a movie in a sprite.
bool SPlayer::IsLevel(const ScriptThread* thread) const
{
    return thread == this || (thread->IsRoot() && FindLayer(layers, thread->layerNum) == thread);
}

void SPlayer::ClearLayer(S32 layer)
{
    if (layer == 0) {
        ClearScript();
        return;
    }
    for (ScriptPlayer** link = &layers; *link != nullptr; link = &(*link)->nextLayer) {
        ScriptPlayer* movie = *link;
        if (movie->layerNum != layer)
            continue;
        *link = movie->nextLayer;
        delete movie;
        return;
    }
}

void SPlayer::FreeLayers()
{
    while (layers != nullptr) {
        ScriptPlayer* movie = layers;
        layers = movie->nextLayer;
        delete movie;
    }
    ScriptPlayer::ClearScript();
}
