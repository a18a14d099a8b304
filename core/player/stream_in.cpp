// Streams as they arrive: who receives them, and what becomes of that when they end.
#include <cstdlib>
#include <cstring>

#include "core/player/player.h"
#include "core/player/stream_data.h"
#include "core/player/url_builder.h"
#include "core/stream/str.h"

namespace {

void FreeLoadInfo(LoadInfo* info)
{
    if (info == nullptr)
        return;
    FreeStr(info->target);
    std::free(info);
}

void ReplaceStr(char** owned, const char* s)
{
    char* copy = CreateStr(s); // before the old one goes: it may be the same
    FreeStr(*owned);
    *owned = copy;
}

void DecodeQueryOf(const char* url, ScriptThread* thread)
{
    const char* mark = std::strchr(url, '?');
    if (mark != nullptr)
        DecodeQueryString(thread, mark + 1);
}

} // namespace

void SPlayer::StreamInNew(StreamData* in, const char* url, void* notifyData)
{
    if (url == nullptr)
        url = "";
    in->url = CreateStr(url);
    in->player = nullptr;
    in->reportSize = 0;
    if (notifyData == kNotForPlayer)
        return;
    LoadInfo* info = static_cast<LoadInfo*>(notifyData);
    if (info != nullptr && info->session != session) {
        FreeLoadInfo(info);
        return;
    }
    const int first = firstLoad;
    firstLoad = 0;
    in->reportSize = first;
    // Whatever was noted about it, the first movie is that of level 0.
    ScriptPlayer* receiver = first || info == nullptr ? OpenLayer(0, 0) : OpenReceiver(info);
    FreeLoadInfo(info);
    if (receiver != nullptr && !receiver->varsMode)
        DecodeQueryOf(url, receiver);
    if (receiver != nullptr)
        LinkStream(in, receiver);
    if (first)
        ReplaceStr(&baseURL, url);
}

ScriptPlayer* SPlayer::OpenReceiver(LoadInfo* info)
{
    if (info->loadVars)
        return NewLoader(info);
    if (info->target == nullptr)
        return OpenLayer(info->layer, 0);
    ScriptThread* sprite = FindTarget(rootObject, info->target);
    return sprite != nullptr ? OpenSprite(sprite) : nullptr;
}

ScriptPlayer* SPlayer::NewLoader(LoadInfo* info)
{
    ScriptPlayer* loader = NewMovie();
    if (loader == nullptr)
        return nullptr;
    loader->varsMode = true;
    loader->varsLayer = info->layer;
    loader->varsTarget = info->target;
    info->target = nullptr;
    loader->nextLayer = loaders;
    loaders = loader;
    return loader;
}

void SPlayer::LinkStream(StreamData* in, ScriptPlayer* receiver)
{
    in->player = receiver;
    receiver->stream = in;
    ReplaceStr(&receiver->sourceName, in->url);
}

// Actions of the first frame may unload the receiver and close this very stream.
S32 SPlayer::StreamInWrite(StreamData* in, const void* data, S32 length)
{
    ScriptPlayer* receiver = in->player;
    if (receiver == nullptr)
        return -1;
    receiver->PushDataBuf(static_cast<const U8*>(data), length);
    receiver->PushDataComplete();
    if (in->player == receiver && in->reportSize && receiver->gotHeader) {
        in->reportSize = 0;
        OfferWindow();
    }
    return length;
}

void SPlayer::StreamInDestroy(StreamData* in)
{
    ScriptPlayer* receiver = in->player;
    FreeStr(in->url);
    in->url = nullptr;
    if (receiver == nullptr)
        return;
    in->player = nullptr;
    receiver->stream = nullptr;
    if (in->reportSize)
        OfferWindow();
    in->reportSize = 0;
    receiver->SetDataComplete(); // a loader is gone after it
}

void SPlayer::StreamFailed(void* notifyData)
{
    LoadInfo* info = static_cast<LoadInfo*>(notifyData);
    if (info == nullptr || notifyData == kNotForPlayer)
        return;
    if (info->session == session)
        firstLoad = 0;
    FreeLoadInfo(info);
}

void SPlayer::DeliverVariables(ScriptPlayer* loader)
{
    ScriptThread* target = nullptr;
    if (loader->varsTarget != nullptr)
        target = FindTarget(rootObject, loader->varsTarget);
    else
        target = loader->varsLayer == 0 ? this : FindLayer(layers, loader->varsLayer);
    const char* text = loader->VariablesText();
    if (target != nullptr && text != nullptr)
        DecodeQueryString(target, text);
    FreeLoader(loader);
}

void SPlayer::FreeLoader(ScriptPlayer* loader)
{
    ScriptPlayer** link = &loaders;
    while (*link != nullptr && *link != loader)
        link = &(*link)->nextLayer;
    if (*link != nullptr)
        *link = loader->nextLayer;
    delete loader;
}

void SPlayer::ForgetRequests()
{
    session++;
    firstLoad = 0;
    while (loaders != nullptr)
        FreeLoader(loaders);
}
