// For builds without a library that fetches from the web.
#include "platform/headless/http.h"

HttpClient::~HttpClient()
{
    multi = nullptr; // there never was one
}

bool HttpClient::Supported()
{
    return false;
}

void HttpClient::Start(HttpTransfer* transfer)
{
    transfer->done = true;
    transfer->failure = "this program was built without network access";
}

void HttpClient::Stop(HttpTransfer*) {}

void HttpClient::Run(int) {}
