#include "tools/vexel/output_file.h"

#include "tools/vexel/message.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

// The length of a number's mark at `i`, or 0; sets the least count of digits.
size_t NumberMark(const std::string& text, size_t i, int* digits)
{
    size_t end = i + 1;
    *digits = 0;
    if (end < text.size() && text[end] == '0') {
        end++;
        while (end < text.size() && text[end] >= '0' && text[end] <= '9' && *digits < 10)
            *digits = *digits * 10 + (text[end++] - '0');
    }
    return end < text.size() && text[end] == 'd' ? end + 1 - i : 0;
}

bool WriteAll(int fd, std::span<const U8> bytes)
{
    while (!bytes.empty()) {
        const ssize_t n = write(fd, bytes.data(), bytes.size());
        if (n < 0 && errno == EINTR)
            continue;
        if (n <= 0)
            return false;
        bytes = bytes.subspan(static_cast<size_t>(n));
    }
    return true;
}

// Closing can report what writing did not, so its result counts.
bool WriteAndClose(int fd, std::span<const U8> bytes)
{
    const bool written = WriteAll(fd, bytes);
    const int why = errno;
    const bool closed = close(fd) == 0;
    if (!written)
        errno = why;
    return written && closed;
}

bool WriteInPlace(const std::string& path, std::span<const U8> bytes)
{
    const int fd = open(path.c_str(), O_WRONLY | O_CLOEXEC);
    return fd >= 0 && WriteAndClose(fd, bytes);
}

bool WriteBeside(const std::string& path, std::span<const U8> bytes)
{
    const std::string temporary = path + Format(".%d.part", static_cast<int>(getpid()));
    const int fd = open(temporary.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666);
    if (fd < 0)
        return false;
    if (WriteAndClose(fd, bytes) && std::rename(temporary.c_str(), path.c_str()) == 0)
        return true;
    const int why = errno;
    unlink(temporary.c_str());
    errno = why;
    return false;
}

// A link is followed, so that it is the file that gets replaced and not the link.
std::string FollowLinks(const std::string& path)
{
    char* resolved = realpath(path.c_str(), nullptr);
    const std::string target = resolved != nullptr ? resolved : path;
    std::free(resolved);
    return target;
}

} // namespace

bool OutputName::Parse(const std::string& text)
{
    for (size_t i = 0; i < text.size(); i++) {
        std::string& part = numbered ? after : before;
        int count = 0;
        const size_t mark = text[i] == '%' ? NumberMark(text, i, &count) : 0;
        if (mark == 0) {
            part += text[i];
            i += text.compare(i, 2, "%%") == 0;
            continue;
        }
        if (numbered || count > 9)
            return false;
        numbered = true;
        digits = count;
        i += mark - 1;
    }
    return true;
}

std::string OutputName::For(int number) const
{
    return numbered ? before + Format("%0*d", digits, number) + after : before;
}

std::string OutputName::Extension() const
{
    const std::string name = For(0);
    const size_t dot = name.rfind('.');
    const size_t slash = name.rfind('/');
    if (dot == std::string::npos || (slash != std::string::npos && dot < slash))
        return "";
    std::string extension = name.substr(dot);
    for (char& c : extension)
        c = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
    return extension;
}

bool WriteWhole(const std::string& path, std::span<const U8> bytes, std::string* error)
{
    struct stat info = {};
    bool written;
    if (path == "-")
        written = WriteAll(STDOUT_FILENO, bytes);
    else if (stat(path.c_str(), &info) != 0)
        written = WriteBeside(path, bytes);
    else if (S_ISREG(info.st_mode))
        written = WriteBeside(FollowLinks(path), bytes);
    else
        written = WriteInPlace(path, bytes);
    if (!written)
        *error = Format("cannot write: %s", std::strerror(errno));
    return written;
}
