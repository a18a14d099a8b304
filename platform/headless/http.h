// Transfers from web servers, without blocking.
#pragma once

#include "core/geom/types.h"

#include <string>
#include <vector>

// One request, and what has come of it. It stays where it is from Start to Stop.
struct HttpTransfer {
    std::string url;
    bool post = false;
    std::string form; // what a POST sends, URL-encoded

    S32 status = 0;       // of the answer; 0: none yet
    std::vector<U8> body; // of an answer of status 200 to 299: what has come and not been taken
    std::string location; // where the server sends the request on to; empty: nowhere
    bool done = false;
    std::string failure; // why it could not be done; empty: it could

    void* handle = nullptr; // the client's
    void* fields = nullptr;
    U64 received = 0; // bytes
};

// Runs transfers side by side. Only http and https; redirects are not followed, but reported. When
// the program was built without a library for this, every transfer fails at once.
class HttpClient {
public:
    HttpClient() = default;
    ~HttpClient();
    HttpClient(const HttpClient&) = delete;
    HttpClient& operator=(const HttpClient&) = delete;

    static bool Supported();
    void Start(HttpTransfer* transfer);
    // Ends it wherever it is; it may be started again.
    void Stop(HttpTransfer* transfer);
    // Moves what can be moved; waits for the first of it, up to so many milliseconds.
    void Run(int milliseconds);

private:
    void* multi = nullptr;
};
