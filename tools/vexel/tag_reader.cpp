#include "tools/vexel/tag_reader.h"

#include "core/stream/tags.h"
#include "tools/vexel/message.h"

TagReader::TagReader(const U8* data, S32 start, S32 dataEnd) : next(start), end(dataEnd)
{
    Attach(data, dataEnd, start);
}

bool TagReader::Next()
{
    limit = end;
    pos = next;
    if (GetTag(end) < 0)
        return false;
    bodyStart = pos;
    next = tagEnd;
    limit = tagEnd;
    return true;
}

std::string TagReader::Text()
{
    std::string text;
    while (pos < limit) {
        const U8 c = GetByte();
        if (c == 0)
            break;
        text += static_cast<char>(c);
    }
    return text;
}

std::string TagTitle(S32 code)
{
    const char* name = TagName(code);
    return name != nullptr ? name : Format("Tag%d", code);
}
