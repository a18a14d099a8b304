#include "tools/vexel/movie_file.h"

#include "tools/vexel/message.h"

#include <vector>

int MovieFile::Load(const std::string& name)
{
    if (!input.Open(name))
        return kExitUnreadable;
    std::vector<U8> block(256 * 1024);
    int code = kExitDone;
    while (code == kExitDone && !input.Ended()) {
        const S64 n = input.Read(block.data(), block.size());
        if (n < 0)
            return kExitUnreadable;
        movie.PushDataBuf(block.data(), static_cast<S32>(n));
        code = input.CheckMovie(movie);
    }
    return code;
}
