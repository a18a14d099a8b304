#include "platform/headless/host_text.h"

#include "core/geom/types.h"

namespace {

// Bytes that a first byte begins a character of; 1 for what stands alone.
size_t SequenceLength(U8 first)
{
    if (first >= 0xC2 && first <= 0xDF)
        return 2;
    if (first >= 0xE0 && first <= 0xEF)
        return 3;
    return first >= 0xF0 && first <= 0xF4 ? 4 : 1;
}

bool Continues(std::string_view text, size_t from, size_t to)
{
    for (size_t at = from; at < to; at++) {
        if (at >= text.size() || (static_cast<U8>(text[at]) & 0xC0) != 0x80)
            return false;
    }
    return true;
}

} // namespace

std::string Latin1FromUtf8(std::string_view text)
{
    std::string latin;
    for (size_t at = 0; at < text.size();) {
        const U8 first = static_cast<U8>(text[at]);
        const size_t length = SequenceLength(first);
        if (length == 1 || !Continues(text, at + 1, at + length)) {
            latin += text[at++];
            continue;
        }
        const bool fits = first <= 0xC3;
        latin += fits ? static_cast<char>((first << 6) | (text[at + 1] & 0x3F)) : '?';
        at += length;
    }
    return latin;
}
