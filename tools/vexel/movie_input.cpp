#include "tools/vexel/movie_input.h"

#include "core/player/limits.h"
#include "tools/vexel/message.h"

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <memory>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

MovieInput::~MovieInput()
{
    if (fd > STDIN_FILENO)
        close(fd);
}

bool MovieInput::Open(const std::string& movieName)
{
    name = movieName;
    fd = name == "-" ? STDIN_FILENO : open(name.c_str(), O_RDONLY | O_CLOEXEC);
    struct stat info = {};
    if (fd < 0 || fstat(fd, &info) != 0) {
        Complain(name, std::strerror(errno));
        return false;
    }
    if (S_ISDIR(info.st_mode)) {
        Complain(name, std::strerror(EISDIR));
        return false;
    }
    if (S_ISREG(info.st_mode))
        size = info.st_size;
    return true;
}

int MovieInput::MakeRepeatable()
{
    start = lseek(fd, 0, SEEK_CUR);
    if (start >= 0)
        return kExitDone;
    std::FILE* copy = std::tmpfile();
    const int code = copy != nullptr ? CopyTo(copy) : kExitFailed;
    if (copy == nullptr || (code == kExitDone && std::fflush(copy) != 0)) {
        Complain(name, Format("no temporary file for it: %s", std::strerror(errno)));
        return kExitFailed;
    }
    const int copied = dup(fileno(copy));
    std::fclose(copy);
    if (fd > STDIN_FILENO)
        close(fd);
    fd = copied;
    start = 0;
    size = lseek(fd, 0, SEEK_END);
    Rewind();
    return code;
}

// No more than the movie, whose header says how long it is: what follows may have no end. A failed
// write shows when the file is flushed.
int MovieInput::CopyTo(std::FILE* copy)
{
    const auto movie = std::make_unique<ScriptPlayer>();
    std::vector<U8> block(64 * 1024);
    int code = kExitDone;
    while (code == kExitDone && !ended && !movie->Complete()) {
        const S64 n = Read(block.data(), block.size());
        if (n < 0)
            return kExitUnreadable;
        std::fwrite(block.data(), 1, static_cast<size_t>(n), copy);
        movie->PushDataBuf(block.data(), static_cast<S32>(n));
        code = CheckMovie(*movie);
    }
    return code;
}

void MovieInput::Rewind()
{
    lseek(fd, start, SEEK_SET);
    ended = false;
}

S64 MovieInput::Read(U8* buffer, size_t capacity)
{
    ssize_t n;
    do
        n = read(fd, buffer, capacity);
    while (n < 0 && errno == EINTR);
    if (n < 0)
        Complain(name, std::strerror(errno));
    if (n == 0)
        ended = true;
    return n;
}

bool MovieInput::HasMore() const
{
    pollfd waiting = {fd, POLLIN, 0};
    return !ended && poll(&waiting, 1, 0) > 0;
}

static std::string HeaderFault(const ScriptPlayer& movie)
{
    if (std::memcmp(movie.header, "MVX", 3) != 0)
        return "not a VXM movie";
    const U8* length = movie.header + 4;
    const U32 declared =
        length[0] | U32(length[1]) << 8 | U32(length[2]) << 16 | U32(length[3]) << 24;
    return Format("not a VXM movie: it declares a length of %u bytes", declared);
}

int MovieInput::CheckMovie(const ScriptPlayer& movie) const
{
    if (movie.scriptErr == kErrNoMemory) {
        Complain(name, Format("its length of %d bytes is beyond the limit of %u", movie.scriptLen,
                              gLimits.movieBytes));
        return kExitLimit;
    }
    if (movie.scriptErr != kErrNone) {
        Complain(name, HeaderFault(movie));
        return kExitUnreadable;
    }
    if (movie.gotHeader || !(ended || movie.Complete()))
        return kExitDone;
    if (movie.headerBytes == 0)
        Complain(name, "not a VXM movie: it is empty");
    else if (std::memcmp(movie.header, "MVX", movie.headerBytes < 3 ? movie.headerBytes : 3) != 0)
        Complain(name, "not a VXM movie");
    else
        Complain(name, Format("not a VXM movie: its header ends after %d bytes",
                              movie.headerBytes < 8 ? movie.headerBytes : movie.len));
    return kExitUnreadable;
}

void MovieInput::ComplainTruncated(const ScriptPlayer& movie) const
{
    Complain(name, Format("truncated: %d of %d frames are complete (%d of %d bytes)",
                          movie.CountFrames(), movie.numFrames, movie.len, movie.scriptLen));
}
