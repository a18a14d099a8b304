// Web transfers through libcurl.
#include "platform/headless/http.h"

#include "core/player/limits.h"

#include <curl/curl.h>

namespace {

constexpr long kConnectSeconds = 15;
constexpr long kSilentSeconds = 30; // without a byte a transfer fails,
constexpr long kMostSeconds = 600;  // and after so many in any case
constexpr U64 kPageBytes = 65536;   // of a page that goes with an error or a redirect

// What is not allowed in a request line is encoded; a movie writes spaces as they are.
std::string CleanURL(const std::string& url)
{
    static const char kDigits[] = "0123456789ABCDEF";
    std::string clean;
    for (const char c : url.substr(0, url.find('#'))) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte > 0x20 && byte < 0x7F)
            clean += c;
        else
            clean += {'%', kDigits[byte >> 4], kDigits[byte & 15]};
    }
    return clean;
}

S32 StatusOf(const HttpTransfer& transfer)
{
    long code = 0;
    curl_easy_getinfo(transfer.handle, CURLINFO_RESPONSE_CODE, &code);
    return static_cast<S32>(code);
}

bool IsSuccess(S32 status)
{
    return status >= 200 && status <= 299;
}

// Pages that go with an error or a redirect are not what was asked for, and are not read to their
// end. The transfer ends when the movie gets too long.
size_t TakeData(char* data, size_t size, size_t count, void* context)
{
    auto* transfer = static_cast<HttpTransfer*>(context);
    const size_t n = size * count;
    transfer->status = StatusOf(*transfer);
    transfer->received += n;
    if (!IsSuccess(transfer->status))
        return transfer->received > kPageBytes ? 0 : n;
    if (transfer->received > gLimits.movieBytes)
        return 0;
    transfer->body.insert(transfer->body.end(), data, data + n);
    return n;
}

void LimitToWeb(CURL* easy)
{
#if LIBCURL_VERSION_NUM >= 0x075500
    curl_easy_setopt(easy, CURLOPT_PROTOCOLS_STR, "http,https");
#else
    curl_easy_setopt(easy, CURLOPT_PROTOCOLS, CURLPROTO_HTTP | CURLPROTO_HTTPS);
#endif
}

// Not waiting for the name of a machine to be found.
void LeaveQuickly(CURL* easy)
{
#if LIBCURL_VERSION_NUM >= 0x075700
    curl_easy_setopt(easy, CURLOPT_QUICK_EXIT, 1L);
#else
    static_cast<void>(easy);
#endif
}

void SetUp(CURL* easy, HttpTransfer* transfer)
{
    LimitToWeb(easy);
    curl_easy_setopt(easy, CURLOPT_URL, CleanURL(transfer->url).c_str());
    curl_easy_setopt(easy, CURLOPT_FOLLOWLOCATION, 0L);
    curl_easy_setopt(easy, CURLOPT_NOSIGNAL, 1L);
    curl_easy_setopt(easy, CURLOPT_CONNECTTIMEOUT, kConnectSeconds);
    curl_easy_setopt(easy, CURLOPT_TIMEOUT, kMostSeconds);
    curl_easy_setopt(easy, CURLOPT_LOW_SPEED_LIMIT, 1L);
    curl_easy_setopt(easy, CURLOPT_LOW_SPEED_TIME, kSilentSeconds);
    LeaveQuickly(easy);
    curl_easy_setopt(easy, CURLOPT_WRITEFUNCTION, TakeData);
    curl_easy_setopt(easy, CURLOPT_WRITEDATA, transfer);
    curl_easy_setopt(easy, CURLOPT_PRIVATE, transfer);
    if (!transfer->post)
        return;
    curl_easy_setopt(easy, CURLOPT_POSTFIELDSIZE, static_cast<long>(transfer->form.size()));
    curl_easy_setopt(easy, CURLOPT_POSTFIELDS, transfer->form.data());
    curl_slist* fields = curl_slist_append(nullptr, "Expect:");
    transfer->fields = curl_slist_append(fields, "Content-type: application/x-www-form-urlencoded");
    curl_easy_setopt(easy, CURLOPT_HTTPHEADER, transfer->fields);
}

void Finish(CURL* easy, CURLcode result)
{
    HttpTransfer* transfer = nullptr;
    char* location = nullptr;
    curl_easy_getinfo(easy, CURLINFO_PRIVATE, &transfer);
    transfer->status = StatusOf(*transfer);
    if (curl_easy_getinfo(easy, CURLINFO_REDIRECT_URL, &location) == CURLE_OK && location)
        transfer->location = location;
    const bool pageLeft = result == CURLE_WRITE_ERROR && !IsSuccess(transfer->status);
    if (result != CURLE_OK && !pageLeft)
        transfer->failure = curl_easy_strerror(result);
    transfer->done = true;
}

} // namespace

HttpClient::~HttpClient()
{
    if (multi != nullptr)
        curl_multi_cleanup(multi);
}

bool HttpClient::Supported()
{
    return true;
}

void HttpClient::Start(HttpTransfer* transfer)
{
    transfer->status = 0;
    transfer->received = 0;
    transfer->done = false;
    transfer->location.clear();
    if (multi == nullptr && curl_global_init(CURL_GLOBAL_DEFAULT) == CURLE_OK)
        multi = curl_multi_init();
    transfer->handle = multi != nullptr ? curl_easy_init() : nullptr;
    if (transfer->handle != nullptr)
        SetUp(transfer->handle, transfer);
    if (transfer->handle != nullptr && curl_multi_add_handle(multi, transfer->handle) == CURLM_OK)
        return;
    transfer->failure = "it cannot be asked for";
    transfer->done = true;
}

void HttpClient::Stop(HttpTransfer* transfer)
{
    if (transfer->handle != nullptr) {
        curl_multi_remove_handle(multi, transfer->handle);
        curl_easy_cleanup(transfer->handle);
    }
    curl_slist_free_all(static_cast<curl_slist*>(transfer->fields));
    transfer->handle = nullptr;
    transfer->fields = nullptr;
}

void HttpClient::Run(int milliseconds)
{
    int running = 0, left = 0;
    if (multi == nullptr)
        return;
    curl_multi_poll(multi, nullptr, 0, milliseconds, nullptr);
    curl_multi_perform(multi, &running);
    while (const CURLMsg* message = curl_multi_info_read(multi, &left))
        if (message->msg == CURLMSG_DONE)
            Finish(message->easy_handle, message->data.result);
}
