// Requests for URLs that scripts make: recorded while they run, sent off afterwards.
#include "core/player/action_runner.h"

#include <cstring>

#include "core/player/url_builder.h"
#include "core/stream/str.h"

namespace {

// Flags of a request.
constexpr U8 kMethodMask = 0x03;
constexpr U8 kMethodGet = 0x01;
constexpr U8 kMethodPost = 0x02;
constexpr U8 kIntoTarget = 0x40; // the window is a path in the movie

constexpr char kRootLevel[] = "_level0";

bool IsRootPath(const char* path)
{
    return std::strcmp(path, "/") == 0;
}

// A level with nothing below it.
bool IsBareLevel(const char* path)
{
    const char* slash = std::strchr(path, '/');
    return LayerNum(path) >= 0 && (!slash || slash[1] == 0);
}

// A machine's name without a path gets one, so that the query does not become part of the name.
void AppendQuery(URLBuilder* url, const ScriptThread* thread)
{
    const char* machine = std::strstr(url->Text(), "://");
    if (machine && !std::strchr(machine + 3, '/'))
        url->AppendChar('/');
    url->AppendChar('?');
    url->EncodeVariables(thread->vars);
}

char* CopyOf(const URLBuilder& text)
{
    return CreateStr(text.Text(), text.Length());
}

void SetText(ScriptValue* value, const char* text)
{
    value->SetText(text, StrLength(text));
}

} // namespace

ActionRunner::~ActionRunner()
{
    for (int i = 0; i < requestCount; i++) {
        FreeStr(requests[i].url);
        FreeStr(requests[i].window);
        FreeStr(requests[i].postData);
    }
}

void ActionRunner::SendRequests()
{
    for (int i = 0; i < requestCount; i++) {
        const SURLRequest& r = requests[i];
        if (r.url && r.window)
            player->GetURL(r.url, r.window, r.postData, r.flags);
    }
}

// Takes the strings over; there is room.
void ActionRunner::AddRequest(char* url, char* window, char* postData, U8 flags)
{
    requests[requestCount] = {url, window, postData, flags};
    requestCount++;
}

void ActionRunner::RecordURL(const SActionRecord& record)
{
    if (requestCount >= kMaxRequests)
        return;
    S32 urlSize = 0, windowSize = 0, after = 0;
    const char* url = record.String(0, &urlSize, &after);
    const char* window = record.String(after, &windowSize);
    AddRequest(CreateStr(url, urlSize), CreateStr(window, windowSize), nullptr, 0);
}

void ActionRunner::RecordURLExpr(ScriptThread* thread, U8 flags)
{
    ScriptValue window = stack.Pop();
    ScriptValue url = stack.Pop();
    if (requestCount >= kMaxRequests || !ResolveWindow(thread, &window, &flags))
        return;
    const U8 method = flags & kMethodMask;
    URLBuilder fullURL, postData;
    fullURL.AppendString(url.Text());
    if (method == kMethodGet && thread)
        AppendQuery(&fullURL, thread);
    if (method == kMethodPost && thread)
        postData.EncodeVariables(thread->vars);
    ChargeText(static_cast<S64>(fullURL.Length()) + postData.Length());
    const char* windowText = window.Text();
    const bool post = method == kMethodPost && thread;
    char* data = post ? CopyOf(postData) : nullptr;
    if (post && !data)
        return; // without its data it would become another request
    AddRequest(CopyOf(fullURL), CreateStr(windowText, window.Length()), data, flags);
}

// For a window that is a path: what it names now is what is loaded into later, wherever the path
// was relative to. False when there is no such timeline.
bool ActionRunner::ResolveWindow(ScriptThread* thread, ScriptValue* window, U8* flags)
{
    if (!(*flags & kIntoTarget))
        return true;
    const U8 intoLevel = *flags & static_cast<U8>(~kIntoTarget);
    if (IsBareLevel(window->Text())) {
        *flags = intoLevel;
        return true;
    }
    const ScriptThread* target = FindFrom(thread, window->Text());
    if (IsRootPath(window->Text())) {
        *flags = intoLevel;
        SetText(window, kRootLevel);
        // A movie shown in a sprite counts as on layer 0 here, whatever level the sprite lies in.
        return !target || target->layerNum == 0 || SetToPath(target, window);
    }
    if (!target || !SetToPath(target, window))
        return false;
    if (IsRootPath(window->Text()))
        SetText(window, kRootLevel);
    if (IsBareLevel(window->Text()))
        *flags = intoLevel;
    return true;
}

bool ActionRunner::SetToPath(const ScriptThread* target, ScriptValue* window) const
{
    char* path = player->GetTargetPath(target->rootObject);
    if (!path)
        return false;
    SetText(window, path);
    FreeStr(path);
    return true;
}
