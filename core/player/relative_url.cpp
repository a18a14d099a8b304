// URLs against a base, along the lines of RFC 3986, section 5.
#include "core/player/relative_url.h"

#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/player/url_builder.h"
#include "core/stream/str.h"

namespace {

bool IsLetter(char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

bool IsSchemeChar(char c)
{
    return IsLetter(c) || (c >= '0' && c <= '9') || c == '+' || c == '-' || c == '.';
}

// The length of the scheme before a ":", 0 when there is none.
size_t SchemeLength(std::string_view url)
{
    constexpr size_t kShortest = 3;
    size_t n = 0;
    while (n < url.size() && IsSchemeChar(url[n]))
        n++;
    const bool ended = n < url.size() && url[n] == ':';
    return ended && n >= kShortest && IsLetter(url[0]) ? n : 0;
}

// Takes what stands before the first of some characters, or everything, off the front.
std::string_view TakeUpTo(std::string_view* text, const char* stops)
{
    const size_t at = text->find_first_of(stops);
    const std::string_view taken = text->substr(0, at);
    text->remove_prefix(taken.size());
    return taken;
}

bool Skip(std::string_view* text, char c)
{
    if (text->empty() || text->front() != c)
        return false;
    text->remove_prefix(1);
    return true;
}

void Append(std::string_view text, URLBuilder* out)
{
    out->AppendBytes(text.data(), static_cast<int>(text.size()));
}

void Append(char mark, std::string_view text, URLBuilder* out)
{
    out->AppendChar(mark);
    Append(text, out);
}

// Takes the last segment off; the text ends with its "/", unless it has none after `start`.
void DropSegment(int start, URLBuilder* out)
{
    int n = out->Length();
    if (n > start)
        n--;
    while (n > start && out->Text()[n - 1] != '/')
        n--;
    out->Truncate(n);
}

// Appends a path without "." and "..", of which none leads above the first segment.
void AppendFolded(std::string_view path, URLBuilder* out)
{
    if (Skip(&path, '/'))
        out->AppendChar('/');
    const int start = out->Length();
    while (!path.empty()) {
        const std::string_view segment = TakeUpTo(&path, "/");
        const bool more = Skip(&path, '/');
        if (segment == "..") {
            DropSegment(start, out);
        } else if (segment != ".") {
            Append(segment, out);
            if (more)
                out->AppendChar('/');
        }
    }
}

// The path of `to` as seen from that of `from`.
void AppendPath(const URLParts& from, const URLParts& to, URLBuilder* out)
{
    if (to.hasAuthority || (!to.path.empty() && to.path.front() == '/')) {
        AppendFolded(to.path, out);
        return;
    }
    if (to.path.empty()) {
        Append(from.path, out);
        return;
    }
    URLBuilder joined;
    Append(from.path.substr(0, from.path.rfind('/') + 1), &joined);
    if (joined.Length() == 0 && from.hasAuthority)
        joined.AppendChar('/');
    Append(to.path, &joined);
    AppendFolded({joined.Text(), static_cast<size_t>(joined.Length())}, out);
}

void AppendQuery(const URLParts& from, const URLParts& to, URLBuilder* out)
{
    const bool ofBase = to.path.empty() && !to.hasAuthority && !to.hasQuery;
    const URLParts& source = ofBase ? from : to;
    if (source.hasQuery)
        Append('?', source.query, out);
    if (to.hasFragment)
        Append('#', to.fragment, out);
}

bool EqualFolded(std::string_view a, std::string_view b)
{
    const auto fold = [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; };
    bool equal = a.size() == b.size();
    for (size_t i = 0; equal && i < a.size(); i++)
        equal = fold(a[i]) == fold(b[i]);
    return equal;
}

// Splits an authority into its host and the port, which without one is the scheme's.
void SplitAuthority(const URLParts& url, std::string_view* host, std::string_view* port)
{
    std::string_view text = url.authority;
    text.remove_prefix(text.rfind('@') + 1); // 0 without one
    const size_t colon = text.rfind(':');
    const bool hasPort = colon != text.npos && text.find(']', colon) == text.npos;
    *host = text.substr(0, hasPort ? colon : text.size());
    *port = hasPort ? text.substr(colon + 1) : std::string_view();
    while (port->size() > 1 && port->front() == '0')
        port->remove_prefix(1);
    if (port->empty())
        *port = EqualFolded(url.scheme, "https")  ? "443"
                : EqualFolded(url.scheme, "http") ? "80"
                                                  : "";
}

} // namespace

URLParts SplitURL(const char* url)
{
    URLParts parts;
    std::string_view rest(url != nullptr ? url : "");
    parts.scheme = rest.substr(0, SchemeLength(rest));
    if (!parts.scheme.empty())
        rest.remove_prefix(parts.scheme.size() + 1);
    if (rest.substr(0, 2) == "//") {
        rest.remove_prefix(2);
        parts.hasAuthority = true;
        parts.authority = TakeUpTo(&rest, "/?#");
    }
    parts.path = TakeUpTo(&rest, "?#");
    parts.hasQuery = Skip(&rest, '?');
    if (parts.hasQuery)
        parts.query = TakeUpTo(&rest, "#");
    parts.hasFragment = Skip(&rest, '#');
    parts.fragment = rest;
    return parts;
}

bool MachineEqual(const char* a, const char* b)
{
    const URLParts first = SplitURL(a), second = SplitURL(b);
    std::string_view host, port, otherHost, otherPort;
    SplitAuthority(first, &host, &port);
    SplitAuthority(second, &otherHost, &otherPort);
    return EqualFolded(first.scheme, second.scheme) && EqualFolded(host, otherHost) &&
           port == otherPort;
}

char* SPlayer::BuildRelative(const char* base, char* url)
{
    const URLParts from = SplitURL(base), to = SplitURL(url);
    if (base == nullptr || *base == 0 || !to.scheme.empty())
        return url;
    if (*url == 0)
        return CreateStr(base);
    URLBuilder out;
    if (!from.scheme.empty()) {
        Append(from.scheme, &out);
        out.AppendChar(':');
    }
    if (from.hasAuthority || to.hasAuthority)
        Append("//", &out);
    Append(to.hasAuthority ? to.authority : from.authority, &out);
    AppendPath(from, to, &out);
    AppendQuery(from, to, &out);
    // Cut, it would be the URL of something else.
    if (static_cast<U32>(out.Length()) >= gLimits.stringBytes)
        return nullptr;
    return CreateStr(out.Text(), out.Length());
}
