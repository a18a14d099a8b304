// Walking the tags of a movie without playing it.
#pragma once

#include "core/stream/parser.h"

#include <string>

// Goes from tag to tag between two places of a movie. Offsets count from the start of the movie.
class TagReader : public SParser {
public:
    // Reads `data`, which has bytes up to `end`, from `start`.
    TagReader(const U8* data, S32 start, S32 end);

    // Moves to the next tag: its code is in tagCode, its body runs from bodyStart to tagEnd, and
    // bytes beyond read as 0. False when no further tag is all there.
    bool Next();
    // Bytes of the body.
    S32 Length() const { return tagEnd - bodyStart; }
    // Where the tags that are all there end; `end` when nothing is left over.
    S32 Stopped() const { return next; }
    // The string at `pos`, which ends at a zero byte or with the tag.
    std::string Text();

    S32 bodyStart = 0;

private:
    S32 next;
    S32 end;
};

// The tag's name, or "Tag" and its number for one that the player skips.
std::string TagTitle(S32 code);
