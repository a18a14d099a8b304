// `vexel dump`: every tag and action of a movie, one a line.
#include "core/stream/tags.h"
#include "tools/vexel/action_dump.h"
#include "tools/vexel/arguments.h"
#include "tools/vexel/commands.h"
#include "tools/vexel/message.h"
#include "tools/vexel/movie_file.h"
#include "tools/vexel/tag_fields.h"
#include "tools/vexel/text_form.h"

#include <cstdio>

namespace {

// Sprites inside sprites are listed this deep; the player enters none of them anyway.
constexpr int kDeepest = 16;

void PrintTags(TagReader reader, int depth)
{
    while (reader.Next()) {
        std::printf("%8d  %*s%s code=%d length=%d%s\n", reader.tagStart, 2 * depth, "",
                    TagTitle(reader.tagCode).c_str(), reader.tagCode, reader.Length(),
                    TagFields(&reader).c_str());
        PrintActions(&reader, 2 * depth + 2);
        constexpr S32 kSpriteHead = 4; // id and frame count
        if (reader.tagCode == kTagDefineSprite && depth < kDeepest && reader.Length() > kSpriteHead)
            PrintTags(TagReader(reader.script, reader.bodyStart + kSpriteHead, reader.tagEnd),
                      depth + 1);
    }
    const S32 left = reader.limit - reader.Stopped();
    if (left > 0)
        std::printf("%8d  %*sincomplete: %d bytes\n", reader.Stopped(), 2 * depth, "", left);
}

void PrintHeader(const ScriptPlayer& movie)
{
    std::printf("%8d  header version=%u length=%d frame=%s rate=%.11g frames=%d\n", 0,
                movie.version, movie.scriptLen, RectText(movie.frame).c_str(),
                movie.frameRate / 65536.0, movie.numFrames);
}

} // namespace

int DumpCommand(std::span<char* const> words)
{
    Arguments args;
    if (!args.Parse(words, {}))
        return ComplainUsage(args.error);
    if (args.Rest().size() != 1)
        return ComplainUsage("dump takes one movie");
    MovieFile file;
    const int code = file.Load(args.Rest()[0]);
    if (code != kExitDone)
        return code;
    PrintHeader(file.movie);
    PrintTags(TagReader(file.movie.script, file.movie.startPos, file.movie.len), 0);
    if (file.Truncated())
        file.input.ComplainTruncated(file.movie);
    return kExitDone;
}
