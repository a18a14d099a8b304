#include "tools/vexel/output_file.h"

#include "tools/vexel/message.h"
#include "tools/vexel/tidy_up.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <poll.h>
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

std::string FollowLinks(const std::string& path)
{
    char* resolved = realpath(path.c_str(), nullptr);
    const std::string target = resolved != nullptr ? resolved : path;
    std::free(resolved);
    return target;
}

} // namespace

// Standard output may have been made one that does not wait, by whoever else has it.
static bool WaitForRoom(int fd)
{
    pollfd room = {fd, POLLOUT, 0};
    return poll(&room, 1, -1) > 0 || errno == EINTR;
}

bool WriteAll(int fd, std::span<const U8> bytes)
{
    while (!bytes.empty()) {
        const ssize_t n = write(fd, bytes.data(), bytes.size());
        if (n < 0 && (errno == EINTR || (errno == EAGAIN && WaitForRoom(fd))))
            continue;
        if (n <= 0)
            return false;
        bytes = bytes.subspan(static_cast<size_t>(n));
    }
    return true;
}

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

OutputPlace::OutputPlace(const std::string& name) : path(name), part(name)
{
    struct stat info = {};
    const bool there = stat(name.c_str(), &info) == 0;
    if (there && !S_ISREG(info.st_mode))
        return;
    if (there) {
        path = FollowLinks(name);
        mode = (info.st_mode & 0777) | S_IWUSR;
    }
    part = path + Format(".%d.part", static_cast<int>(getpid()));
    SetDoomedFile(part);
}

// What is in the way goes: a part of a program that was killed, or a link that somebody laid there
// for us to follow.
int OutputPlace::Open() const
{
    const int making = Beside() ? O_CREAT | O_EXCL : 0;
    if (Beside())
        unlink(part.c_str());
    const int fd = open(part.c_str(), O_WRONLY | O_CLOEXEC | making, mode);
    if (fd < 0)
        Drop();
    return fd;
}

bool OutputPlace::Keep() const
{
    const bool kept = !Beside() || std::rename(part.c_str(), path.c_str()) == 0;
    if (!kept)
        Drop();
    SetDoomedFile("");
    return kept;
}

void OutputPlace::Drop() const
{
    const int why = errno;
    if (Beside())
        unlink(part.c_str());
    SetDoomedFile("");
    errno = why;
}

OutputFile::~OutputFile()
{
    if (fd < 0)
        return;
    Close();
    place.Drop();
}

bool OutputFile::Fail()
{
    error = Format("cannot write: %s", std::strerror(errno));
    return false;
}

bool OutputFile::Close()
{
    const int closing = fd;
    fd = -1;
    return borrowed || close(closing) == 0;
}

bool OutputFile::Open(const std::string& path)
{
    if (path == "-") {
        Borrow(STDOUT_FILENO);
        return true;
    }
    place = OutputPlace(path);
    fd = place.Open();
    return fd >= 0 || Fail();
}

void OutputFile::Borrow(int descriptor)
{
    fd = descriptor;
    borrowed = true;
}

bool OutputFile::Write(std::span<const U8> bytes)
{
    constexpr size_t kEnough = 64 * 1024;
    waiting.insert(waiting.end(), bytes.begin(), bytes.end());
    return waiting.size() < kEnough || Flush();
}

bool OutputFile::Flush()
{
    const bool written = WriteAll(fd, waiting);
    waiting.clear();
    return written || Fail();
}

// Closing can report what writing did not, so its result counts.
bool OutputFile::Commit()
{
    if (!Flush())
        return false;
    if (Close())
        return place.Keep() || Fail();
    place.Drop();
    return Fail();
}

bool WriteWhole(const std::string& path, std::span<const U8> bytes, std::string* error)
{
    OutputFile file;
    const bool written = file.Open(path) && file.Write(bytes) && file.Commit();
    if (!written)
        *error = file.error;
    return written;
}
