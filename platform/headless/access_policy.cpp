#include "platform/headless/access_policy.h"

#include "core/player/relative_url.h"
#include "core/stream/str.h"

#include <algorithm>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <limits.h>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>

namespace {

Access Refuse(const char* why)
{
    Access access;
    access.refusal = why;
    return access;
}

bool IsScheme(std::string_view scheme, const char* name)
{
    return StrEqual(std::string(scheme).c_str(), name);
}

bool IsNet(const URLParts& url)
{
    return IsScheme(url.scheme, "http") || IsScheme(url.scheme, "https");
}

// The real path of what is there; empty when nothing is.
std::string RealPath(const std::string& path)
{
    char* real = realpath(path.c_str(), nullptr);
    const std::string result = real != nullptr ? real : "";
    std::free(real);
    return result;
}

// An absolute path without "." and "..", as it is written: nothing is looked up.
std::string Fold(const std::string& path)
{
    return std::filesystem::path(path).lexically_normal().string();
}

bool IsBelow(const std::string& path, const std::string& dir)
{
    if (dir.empty())
        return false;
    const std::string start = dir.back() == '/' ? dir : dir + "/";
    return path.size() > start.size() && path.compare(0, start.size(), start) == 0;
}

int HexValue(char c)
{
    const char* const digits = "0123456789abcdef";
    const size_t at = std::string_view(digits).find(c >= 'A' && c <= 'F' ? char(c + 32) : c);
    return at == std::string_view::npos ? -1 : int(at);
}

// The path of a file's URL; a "%" that encodes nothing stands for itself.
std::string Decode(std::string_view text)
{
    std::string path;
    for (size_t i = 0; i < text.size(); i++) {
        const int high = i + 2 < text.size() && text[i] == '%' ? HexValue(text[i + 1]) : -1;
        const int low = high >= 0 ? HexValue(text[i + 2]) : -1;
        path += low >= 0 ? char(high << 4 | low) : text[i];
        i += low >= 0 ? 2 : 0;
    }
    return path;
}

bool HasControls(std::string_view text)
{
    for (const char c : text)
        if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F)
            return true;
    return false;
}

std::string DirName(const std::string& path)
{
    const size_t slash = path.rfind('/');
    return slash == std::string::npos ? "." : path.substr(0, slash + 1);
}

} // namespace

bool AccessPolicy::AllowDir(const std::string& dir)
{
    const std::string real = RealPath(dir);
    struct stat info = {};
    if (real.empty() || stat(real.c_str(), &info) != 0 || !S_ISDIR(info.st_mode))
        return false;
    std::error_code error;
    dirs.push_back(real);
    namedDirs.push_back(real);
    namedDirs.push_back(Fold(std::filesystem::absolute(dir, error).string()));
    return true;
}

void AccessPolicy::SetOrigin(const std::string& url)
{
    const URLParts parts = SplitURL(url.c_str());
    const std::string dir = IsScheme(parts.scheme, "file") ? DirName(Decode(parts.path)) : "";
    netMovie = false;
    origins.clear();
    NoteMovie(url);
    folder = RealPath(dir);
    namedFolder = Fold(dir);
}

void AccessPolicy::NoteMovie(const std::string& url)
{
    if (!IsNet(SplitURL(url.c_str())))
        return;
    netMovie = true;
    if (!IsOrigin(url))
        origins.push_back(url);
}

bool AccessPolicy::IsOrigin(const std::string& url) const
{
    return std::any_of(origins.begin(), origins.end(), [&url](const std::string& each) {
        return MachineEqual(each.c_str(), url.c_str());
    });
}

// What the form of a URL allows.
Access AccessPolicy::Split(const std::string& url) const
{
    const URLParts parts = SplitURL(url.c_str());
    if (parts.scheme.empty())
        return Refuse("it is relative to nothing");
    if (HasControls(url))
        return Refuse("control characters in a URL");
    if (IsNet(parts)) {
        if (parts.authority.empty())
            return Refuse("no machine is named");
        const bool named = parts.authority.find('@') != std::string_view::npos;
        return named ? Refuse("a user's name in a URL") : Access();
    }
    if (!IsScheme(parts.scheme, "file"))
        return Refuse("neither a file nor on the web");
    Access access;
    access.isFile = true;
    if (!parts.authority.empty() && !IsScheme(parts.authority, "localhost"))
        return Refuse("a file of another machine");
    access.path = Decode(parts.path);
    if (HasControls(access.path))
        return Refuse("control characters in a path");
    if (access.path.rfind('/', 0) != 0 || access.path.size() >= PATH_MAX)
        return Refuse("there is no such file");
    return access;
}

// A path that is not even written as one below an allowed folder is not looked up: that alone can
// reach other machines, or wait for them.
bool AccessPolicy::IsNamedWell(const std::string& path) const
{
    for (const std::string& dir : namedDirs)
        if (IsBelow(path, dir))
            return true;
    return !netMovie && (IsBelow(path, folder) || IsBelow(path, namedFolder));
}

bool AccessPolicy::MayReadFile(const std::string& path) const
{
    for (const std::string& dir : dirs)
        if (IsBelow(path, dir))
            return true;
    return !netMovie && IsBelow(path, folder);
}

Access AccessPolicy::CheckFile(Access access) const
{
    const char* const kOutside = "outside the movie's folder";
    access.path = Fold(access.path);
    if (!IsNamedWell(access.path))
        return Refuse(kOutside);
    access.path = RealPath(access.path);
    if (access.path.empty())
        return Refuse("there is no such file");
    return MayReadFile(access.path) ? access : Refuse(kOutside);
}

Access AccessPolicy::Check(const std::string& url) const
{
    const Access access = Split(url);
    if (access.refusal != nullptr)
        return access;
    if (access.isFile)
        return CheckFile(access);
    if (netMovie)
        return IsOrigin(url) ? access : Refuse("a movie from the web reaches its own machine only");
    return netAllowed ? access : Refuse("the network is not allowed");
}

Access AccessPolicy::CheckOpen(const std::string& url) const
{
    Access access = Split(url);
    if (access.refusal != nullptr)
        return access;
    if (!access.isFile)
        return netAllowed ? access : Refuse("the network is not allowed");
    access.path = RealPath(access.path);
    return access.path.empty() ? Refuse("there is no such file") : access;
}

Access AccessPolicy::CheckRedirect(const std::string& url, bool byUser) const
{
    const Access access = byUser ? CheckOpen(url) : Check(url);
    return access.isFile ? Refuse("the web leads to a file") : access;
}

std::string FileURL(const std::string& path)
{
    const std::string dir = RealPath(DirName(path));
    if (dir.empty())
        return "";
    const std::string name = path.substr(path.rfind('/') + 1); // from 0 without one
    std::string url = "file://";
    for (const char c : dir + (dir.back() == '/' ? "" : "/") + name) {
        static const char kDigits[] = "0123456789ABCDEF";
        const auto byte = static_cast<unsigned char>(c);
        if (byte > 0x20 && byte < 0x7F && std::string_view("%?#").find(c) == std::string_view::npos)
            url += c;
        else
            url += {'%', kDigits[byte >> 4], kDigits[byte & 15]};
    }
    return url;
}

// Opening a pipe or a device must neither wait nor have an effect, so it is looked at before; and
// again after, as another may have come in its place.
int OpenRegular(const std::string& path, unsigned long long mostBytes, const char** refusal)
{
    constexpr int kFlags = O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY;
    struct stat info = {};
    const bool other = lstat(path.c_str(), &info) == 0 && !S_ISREG(info.st_mode);
    const int fd = other ? -1 : open(path.c_str(), kFlags);
    *refusal = nullptr;
    if (!other && (fd < 0 || fstat(fd, &info) != 0))
        *refusal = "it cannot be read";
    else if (!S_ISREG(info.st_mode))
        *refusal = "it is no regular file";
    else if (static_cast<unsigned long long>(info.st_size) > mostBytes)
        *refusal = "it is too large";
    if (*refusal == nullptr)
        return fd;
    if (fd >= 0)
        close(fd);
    return -1;
}
