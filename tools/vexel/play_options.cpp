#include "tools/vexel/play_options.h"

#include "core/raster/bit_buffer.h"
#include "platform/headless/access_policy.h"
#include "tools/vexel/message.h"

bool ParsePair(const std::string& text, char mark, int high, int* a, int* b)
{
    const size_t at = text.find(mark);
    return at != std::string::npos && ParseNumber(text.substr(0, at), 1, high, a) &&
           ParseNumber(text.substr(at + 1), 1, high, b);
}

std::string PlayOptions::ParsePlay(const Arguments& args)
{
    const std::string* size = args.Find("--size");
    if (size != nullptr && !ParsePair(*size, 'x', CBitBuffer::kMaxSide, &width, &height))
        return Format("--size takes WxH, each from 1 to %d", CBitBuffer::kMaxSide);
    const std::string* directory = args.Find("--allow-dir");
    if (directory != nullptr && directory->empty())
        return "--allow-dir takes a directory";
    const std::string* events = args.Find("--input");
    if (events != nullptr && events->empty())
        return "--input takes a file";
    allowDir = directory != nullptr ? *directory : "";
    inputFile = events != nullptr ? *events : "";
    allowNet = args.Has("--allow-net");
    trace = args.Has("--trace");
    movie = args.Rest()[0];
    return "";
}

int PlayOptions::Prepare()
{
    if (!allowDir.empty() && !AccessPolicy().AllowDir(allowDir))
        return ComplainUsage("--allow-dir: no such folder: " + allowDir);
    return inputFile.empty() ? kExitDone : input.Load(inputFile);
}
