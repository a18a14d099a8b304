// Requests: host commands, browser windows, and what is to be loaded into levels and sprites.
#include <cstdlib>

#include "core/player/player.h"
#include "core/player/stream_data.h"
#include "core/player/url_builder.h"
#include "core/stream/str.h"

namespace {

enum RequestFlags { kIntoTarget = 0x40, kLoadVariables = 0x80 };

const char* OrEmpty(const char* s)
{
    return s != nullptr ? s : "";
}

// Longer than strings may be: what is left of it would ask for something else.
bool IsCut(const char* s)
{
    return s != nullptr && s[StrLength(s)] != 0;
}

} // namespace

void SPlayer::GetURL(const char* url, const char* window, const char* postData, int flags)
{
    url = OrEmpty(url);
    window = OrEmpty(window);
    if (const char* command = SkipPrefix(url, "FSCommand:")) {
        firstLoad = 0; // nothing comes of it
        ProcessFSCommand(command, window);
        return;
    }
    const S32 layer = LayerNum(window);
    const bool intoTarget = flags & kIntoTarget;
    if (layer >= 0 || intoTarget) {
        LoadLayer(url, layer, postData, intoTarget ? window : nullptr, flags);
        return;
    }
    char* resolved = ResolveURL(url);
    NetscapeDoURL(resolved, *window != 0 ? window : "_self", postData, nullptr);
    if (resolved != url)
        FreeStr(resolved);
}

// A base of "." stands for the movie's own URL. The result is `url` itself, a new string, or null.
char* SPlayer::ResolveURL(const char* url)
{
    const bool own = baseURL != nullptr && baseURL[0] == '.' && baseURL[1] == 0;
    return BuildRelative(own ? sourceName : baseURL, const_cast<char*>(url));
}

void SPlayer::LoadLayer(const char* url, S32 layer, const char* postData, const char* target,
                        int flags)
{
    url = OrEmpty(url);
    const bool intoTarget = flags & kIntoTarget;
    if (!PrepareLoad(url, layer, target, flags))
        return;
    LoadInfo* info =
        NewLoadInfo(intoTarget ? -1 : layer, intoTarget ? target : nullptr, flags & kLoadVariables);
    char* resolved = info != nullptr ? ResolveURL(url) : nullptr;
    NetscapeDoURL(resolved, nullptr, postData, info);
    if (resolved != url)
        FreeStr(resolved);
}

// A movie takes the place of what is there already when it is asked for, not when it arrives, and
// an empty URL only clears the place. False when nothing is to be asked for.
bool SPlayer::PrepareLoad(const char* url, S32 layer, const char* target, int flags)
{
    const bool variables = flags & kLoadVariables;
    if (flags & kIntoTarget) {
        ScriptThread* thread = FindTarget(rootObject, target);
        if (thread != nullptr && !variables)
            UnloadTarget(thread);
        return thread != nullptr && (variables || *url != 0);
    }
    if (layer < 0 || layer > kLastLayer || layer == kFontLayer)
        return false;
    if (!variables)
        ClearLayer(layer);
    return variables || *url != 0;
}

void SPlayer::UnloadTarget(ScriptThread* target)
{
    if (IsLevel(target))
        ClearLayer(target->layerNum);
    else
        target->RemoveSprite(target, true);
}

LoadInfo* SPlayer::NewLoadInfo(S32 layer, const char* target, bool loadVars)
{
    auto* info = static_cast<LoadInfo*>(std::calloc(1, sizeof(LoadInfo)));
    if (info == nullptr)
        return nullptr;
    info->layer = layer;
    info->target = CreateStr(target);
    info->loadVars = loadVars;
    info->session = session;
    if (target == nullptr || info->target != nullptr)
        return info;
    std::free(info);
    return nullptr;
}

void SPlayer::NetscapeDoURL(const char* url, const char* window, const char* postData,
                            LoadInfo* info)
{
    if (url == nullptr || IsCut(url) || IsCut(postData)) { // memory may be exhausted
        if (info == nullptr && window == nullptr)
            firstLoad = 0;
        StreamFailed(info);
        return;
    }
    if (postData == nullptr || *postData == 0) {
        StreamGetURLNotify(url, window, info);
        return;
    }
    URLBuilder body;
    const int size = StrLength(postData);
    body.AppendString("Content-type: application/x-www-form-urlencoded\nContent-length: ");
    body.AppendInt(size);
    body.AppendString("\n\n");
    body.AppendBytes(postData, size);
    body.AppendString("\n");
    // The zero byte is counted: platforms pass that many bytes on.
    StreamPostURLNotify(url, window, static_cast<U32>(body.Length()) + 1, body.Text(), info);
}
