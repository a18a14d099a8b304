#include "platform/headless/host_requests.h"

#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/player/relative_url.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <unistd.h>

namespace {

constexpr size_t kBlock = 64 * 1024;       // bytes handed to the player at once
constexpr size_t kRecordBytes = 16u << 20; // of all requests that are written down,
constexpr size_t kMostRecorded = 65536;    // and how many
constexpr size_t kShown = 300;             // bytes of a URL in a message
constexpr int kMostComplaints = 64;
constexpr int kRedirects = 5;
constexpr int kStep = 50; // milliseconds of one wait

std::string OrEmpty(const char* s)
{
    return s != nullptr ? s : "";
}

// What a POST of form data sends: behind the blank line, without the newline and the zero byte at
// the end.
std::string FormOf(const char* data, U32 length)
{
    const std::string all(data, length);
    const size_t head = all.find("\n\n");
    const size_t start = head == std::string::npos ? 0 : head + 2;
    const size_t end = all.size() - start >= 2 ? all.size() - 2 : start;
    return all.substr(start, end - start);
}

// Where the answer goes.
std::string WindowOf(const char* window, const void* notifyData)
{
    const auto* info = static_cast<const LoadInfo*>(notifyData);
    if (window != nullptr || info == nullptr)
        return OrEmpty(window);
    return info->target != nullptr ? info->target : "_level" + std::to_string(info->layer);
}

size_t SizeOf(const HostRequest& r)
{
    return r.url.size() + r.window.size() + r.data.size() + r.command.size() + r.args.size();
}

// A movie's words must not control the terminal.
std::string Shown(const std::string& url)
{
    std::string text = url.substr(0, kShown);
    for (char& c : text)
        if (static_cast<unsigned char>(c) < 0x20 || static_cast<unsigned char>(c) >= 0x7F)
            c = '?';
    return text;
}

// A user names a file by its path, too.
std::string UsersURL(const char* url)
{
    const URLParts parts = SplitURL(url);
    if (!parts.scheme.empty())
        return url;
    const std::string path(parts.path);
    return FileURL(path) + (url + path.size());
}

S64 Milliseconds()
{
    const auto now = std::chrono::steady_clock::now().time_since_epoch();
    return std::chrono::duration_cast<std::chrono::milliseconds>(now).count();
}

} // namespace

void HostRequests::Record(HostRequest request)
{
    const size_t size = SizeOf(request);
    if (record.size() >= kMostRecorded || size > kRecordBytes - recordBytes)
        return;
    recordBytes += size;
    record.push_back(std::move(request));
}

bool HostRequests::TooMany()
{
    const S64 now = real_time_clock_usecs();
    if (second < 0 || now < second || now - second >= 1000000) {
        second = now;
        asked = 0;
    }
    return ++asked > gLimits.requestsPerSecond;
}

// ControlOpen begins a session, and what is asked for first in it is the user's movie.
bool HostRequests::IsUsers(const void* notifyData)
{
    const bool first = notifyData != nullptr && player->firstLoad && player->session != session;
    if (first)
        session = player->session;
    return first;
}

const char* HostRequests::Fault(const Load& load)
{
    const bool tooMany = TooMany();
    if (tooMany && !load.byUser)
        return "refused: too many requests in a second";
    const size_t streams = waiting.size() + net.size() + (serving != nullptr ? 1 : 0);
    if (streams >= gLimits.openStreams && !load.byUser)
        return "refused: too many streams at once";
    if (load.http.form.size() > gLimits.postBytes)
        return "refused: too much data to send";
    return nullptr;
}

void HostRequests::Ask(const char* url, const char* window, const char* data, U32 length,
                       void* notifyData)
{
    auto load = std::make_unique<Load>();
    load->byUser = IsUsers(notifyData);
    load->notifyData = notifyData;
    load->http.url = load->byUser ? UsersURL(url) : url;
    load->http.post = data != nullptr;
    if (load->http.post)
        load->http.form = FormOf(data, length);
    if (window != nullptr || !load->byUser)
        Record({load->http.post ? "post" : "url", url, WindowOf(window, notifyData),
                load->http.form, "", ""});
    if (window != nullptr) {
        TooMany();
        return; // a browser's affair
    }
    load->fault = Fault(*load);
    if (load->fault != nullptr) { // it only waits to be told so
        load->http.url = Shown(load->http.url);
        load->http.form.clear();
    }
    waiting.push_back(std::move(load));
}

void HostRequests::Command(const char* command, const char* args)
{
    Record({"fscommand", "", "", "", OrEmpty(command), OrEmpty(args)});
}

void HostRequests::Close(const StreamData* stream)
{
    if (serving != nullptr && &serving->stream == stream)
        serving->closed = true;
    for (const LoadPtr& load : net)
        if (load != nullptr && &load->stream == stream)
            load->closed = true;
}

// What is asked for meanwhile waits for the next time, so that a movie that loads itself goes on
// for ever, but never here.
void HostRequests::Deliver()
{
    if (waiting.empty() && net.empty())
        return;
    std::vector<LoadPtr> loads;
    loads.swap(waiting);
    for (LoadPtr& load : loads)
        Serve(std::move(load));
    ServeNet();
}

void HostRequests::Shutdown()
{
    for (const LoadPtr& load : waiting)
        player->StreamFailed(load->notifyData);
    for (const LoadPtr& load : net) {
        client.Stop(&load->http);
        if (load->open)
            player->StreamInDestroy(&load->stream);
        else
            player->StreamFailed(load->notifyData);
    }
    waiting.clear();
    net.clear();
}

// What goes wrong may go wrong in every frame.
void HostRequests::Complain(const Load& load, const std::string& why)
{
    if (!load.byUser && ++complaints > kMostComplaints)
        return;
    std::fprintf(stderr, "vexel: %s: %s\n", Shown(load.http.url).c_str(), why.c_str());
    if (complaints == kMostComplaints)
        std::fprintf(stderr, "vexel: further failures of the movie's requests are not told\n");
}

void HostRequests::Fail(Load* load, const std::string& why)
{
    Complain(*load, why);
    player->StreamFailed(load->notifyData);
    load->notifyData = nullptr;
}

void HostRequests::Serve(LoadPtr load)
{
    const std::string& url = load->http.url;
    if (load->fault != nullptr)
        return Fail(load.get(), load->fault);
    const Access access = load->byUser ? policy.CheckOpen(url) : policy.Check(url);
    if (access.refusal != nullptr)
        return Fail(load.get(), std::string("refused: ") + access.refusal);
    if (access.isFile && load->http.post)
        return Fail(load.get(), "refused: a file takes no data");
    if (access.isFile)
        return ServeFile(load.get(), access.path);
    client.Start(&load->http);
    net.push_back(std::move(load));
}

void HostRequests::ServeFile(Load* load, const std::string& path)
{
    const char* refusal = nullptr;
    const int fd = OpenRegular(path, gLimits.movieBytes, &refusal);
    if (fd < 0)
        return Fail(load, std::string("refused: ") + refusal);
    serving = load;
    Open(load);
    std::vector<U8> block(kBlock);
    U64 left = gLimits.movieBytes; // it may grow meanwhile
    ssize_t n = 0;
    do {
        n = read(fd, block.data(), std::min<U64>(block.size(), left));
        left -= n > 0 ? static_cast<U64>(n) : 0;
    } while (n > 0 && Push(load, block.data(), static_cast<size_t>(n)));
    close(fd);
    if (n < 0)
        Complain(*load, "it cannot be read to its end");
    End(load);
    serving = nullptr;
}

void HostRequests::Open(Load* load)
{
    const std::string& url = load->http.url;
    player->StreamInNew(&load->stream, url.c_str(), load->notifyData);
    load->notifyData = nullptr;
    load->open = true;
    const ScriptPlayer* receiver = load->stream.player;
    if (receiver == nullptr || receiver->varsMode)
        return;
    if (receiver == player)
        loadedRoot = true;
    if (load->byUser)
        policy.SetOrigin(url);
    else
        policy.NoteMovie(url);
}

// False when nobody wants more.
bool HostRequests::Push(Load* load, const U8* data, size_t n)
{
    while (n > 0 && !load->closed) {
        const size_t count = std::min(n, kBlock);
        if (player->StreamInWrite(&load->stream, data, static_cast<S32>(count)) < 0)
            return false;
        data += count;
        n -= count;
    }
    return !load->closed;
}

void HostRequests::End(Load* load)
{
    player->StreamInDestroy(&load->stream);
}

bool HostRequests::HasPatience() const
{
    return allWaited < kAllPatience && std::any_of(net.begin(), net.end(), [](const LoadPtr& load) {
               return load->waited < kPatience;
           });
}

void HostRequests::ServeNet()
{
    bool goOn = !net.empty();
    while (goOn) {
        const S64 start = Milliseconds();
        client.Run(HasPatience() ? kStep : 0);
        const S64 gone = Milliseconds() - start;
        allWaited += gone;
        for (const LoadPtr& load : net)
            load->waited += gone;
        // The player may close any of them meanwhile: each stays in its place until all have had
        // their turn.
        for (LoadPtr& load : net)
            if (!Advance(load.get()))
                load.reset();
        net.erase(std::remove(net.begin(), net.end(), nullptr), net.end());
        goOn = !net.empty() && HasPatience();
    }
}

// False when it has come to its end.
bool HostRequests::Advance(Load* load)
{
    HttpTransfer& http = load->http;
    bool wanted = !load->closed;
    if (wanted && !http.body.empty()) {
        std::vector<U8> data;
        data.swap(http.body);
        if (!load->open)
            Open(load);
        wanted = Push(load, data.data(), data.size());
    }
    if (wanted && !http.done)
        return true;
    client.Stop(&http);
    return wanted ? FinishNet(load) : (End(load), false);
}

bool HostRequests::FinishNet(Load* load)
{
    const HttpTransfer& http = load->http;
    if (http.failure.empty() && !http.location.empty())
        return Redirect(load);
    const bool success = http.status >= 200 && http.status <= 299;
    if (!http.failure.empty() && load->open)
        Complain(*load, http.failure);
    else if (!http.failure.empty())
        Fail(load, http.failure);
    else if (!success)
        Fail(load, "the server says " + std::to_string(http.status));
    else if (!load->open)
        Open(load); // an empty answer is one, too
    if (load->open)
        End(load);
    return false;
}

// Other than with 307 and 308, what is sent on is asked for by GET.
bool HostRequests::Redirect(Load* load)
{
    HttpTransfer& http = load->http;
    const std::string target = http.location;
    const Access access = policy.CheckRedirect(target, load->byUser);
    const char* refusal = access.refusal;
    if (++load->redirects > kRedirects)
        refusal = "it leads from one place to another";
    if (refusal != nullptr) {
        Fail(load, "refused: sent on to " + Shown(target) + ": " + refusal);
        return false;
    }
    http.post = http.post && (http.status == 307 || http.status == 308);
    http.url = target;
    client.Start(&http);
    return true;
}
