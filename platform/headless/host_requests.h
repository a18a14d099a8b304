// What movies ask of the headless shell: files and pages that come back as streams, browser windows
// and commands, which are only written down.
#pragma once

#include "core/player/stream_data.h"
#include "platform/headless/access_policy.h"
#include "platform/headless/http.h"

#include <memory>
#include <string>
#include <vector>

class SPlayer;

// One request as it was made. `url` is absolute where there was something to resolve it against;
// `window` is a browser's, or the level or path that the answer is for.
struct HostRequest {
    std::string kind; // "url", "post" or "fscommand"
    std::string url;
    std::string window;
    std::string data; // what a POST sends
    std::string command;
    std::string args;
};

// The requests of one player and the streams that answer them. Nothing arrives inside a request;
// all of it comes from Deliver. Refusals are a line each on standard error, up to a number, and
// StreamFailed. The player must outlive it but for its destruction, before which Shutdown is
// called.
class HostRequests {
public:
    explicit HostRequests(SPlayer* owner) : player(owner) {}
    HostRequests(const HostRequests&) = delete;
    HostRequests& operator=(const HostRequests&) = delete;

    // `data`: null for GET; else as StreamPostURLNotify gets it, `length` bytes.
    void Ask(const char* url, const char* window, const char* data, U32 length, void* notifyData);
    void Command(const char* command, const char* args);
    void Close(const StreamData* stream);
    // Answers what was asked for before this call: files at once and whole; from the network what
    // has come, for which it waits up to kPatience for each answer in all, and up to kAllPatience
    // for all of them: however many pictures are made, servers that are silent cost no more.
    void Deliver();
    // Ends all streams and requests.
    void Shutdown();

    const std::vector<HostRequest>& All() const { return record; }
    // The movie of level 0 came through here.
    bool LoadedRoot() const { return loadedRoot; }
    void ForgetRoot() { loadedRoot = false; }

    AccessPolicy policy;

private:
    static constexpr S32 kPatience = 5000;     // milliseconds for one answer,
    static constexpr S32 kAllPatience = 60000; // and for all
    // A request that will be answered, or is being.
    struct Load {
        StreamData stream;
        HttpTransfer http;           // its url is the request's, or where that led
        void* notifyData = nullptr;  // until the stream opens
        const char* fault = nullptr; // why it was refused at once
        bool byUser = false;         // the movie of ControlOpen
        bool open = false;           // StreamInNew has been called ...
        bool closed = false;         // ... and CloseStream
        int redirects = 0;
        S64 waited = 0; // milliseconds of patience that are gone
    };
    using LoadPtr = std::unique_ptr<Load>;

    void Record(HostRequest request);
    bool TooMany();
    bool IsUsers(const void* notifyData);
    const char* Fault(const Load& load);
    void Serve(LoadPtr load);
    void ServeFile(Load* load, const std::string& path);
    void Open(Load* load);
    bool Push(Load* load, const U8* data, size_t n);
    void End(Load* load);
    void Complain(const Load& load, const std::string& why);
    void Fail(Load* load, const std::string& why);
    void ServeNet();
    bool HasPatience() const;
    bool Advance(Load* load);
    bool FinishNet(Load* load);
    bool Redirect(Load* load);

    SPlayer* player;
    HttpClient client;
    std::vector<LoadPtr> waiting; // asked for since the last Deliver
    std::vector<LoadPtr> net;     // under way
    Load* serving = nullptr;      // a file that is being fed
    std::vector<HostRequest> record;
    size_t recordBytes = 0;
    S64 second = -1; // of the clock, in which `asked` requests were made
    U32 asked = 0;
    U32 session = 0; // of the player, whose first request was the user's
    bool loadedRoot = false;
    S64 allWaited = 0; // milliseconds of patience that are gone
    int complaints = 0;
};
