#include "core/player/multibyte.h"

#include "core/stream/str.h"

namespace {
// A lead byte at the very end of the string stands alone.
const char* NextCharacter(const char* s)
{
    return s + (PlayerIsLeadByte(static_cast<U8>(s[0])) && s[1] ? 2 : 1);
}
} // namespace

bool PlayerIsLeadByte(U8 c)
{
    return (c >= 0x81 && c <= 0x9F) || (c >= 0xE0 && c <= 0xFC);
}

bool PlayerIsMultiByte(const char* s)
{
    for (; *s; s++) {
        if (PlayerIsLeadByte(static_cast<U8>(s[0])) && s[1])
            return true;
    }
    return false;
}

int PlayerStringLength(const char* s, int multibyte)
{
    if (!multibyte)
        return StrLength(s);
    int n = 0;
    for (; *s; s = NextCharacter(s))
        n++;
    return n;
}

int PlayerStringIndex(const char* s, int index, int multibyte)
{
    if (!multibyte) {
        const int n = StrLength(s);
        return index < 0 ? 0 : index < n ? index : n;
    }
    const char* at = s;
    for (int i = 0; i < index && *at; i++)
        at = NextCharacter(at);
    return static_cast<int>(at - s);
}

int PlayerStringExtract(const char* s, int start, int count, int multibyte, int* from)
{
    *from = PlayerStringIndex(s, start, multibyte);
    const char* rest = s + *from;
    return count < 0 ? StrLength(rest) : PlayerStringIndex(rest, count, multibyte);
}
