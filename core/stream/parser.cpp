#include "core/stream/parser.h"

#include <cstring>

#include "core/stream/str.h"

void SParser::Attach(const U8* data, S32 size, S32 start)
{
    script = data;
    limit = data && size > 0 ? size : 0;
    pos = start < 0 ? 0 : start > limit ? limit : start;
    tagStart = pos;
    tagEnd = limit;
    tagCode = 0;
    InitBits();
}

U32 SParser::GetBits(S32 n)
{
    U32 result = 0;
    n = n < 0 ? 0 : n > 32 ? 32 : n;
    while (n > bitPos) {
        n -= bitPos;
        if (bitPos > 0)
            result |= bitBuf << n;
        bitBuf = GetByte();
        bitPos = 8;
    }
    result |= bitBuf >> (bitPos - n);
    bitPos -= n;
    bitBuf &= 0xFFu >> (8 - bitPos);
    return result;
}

S32 SParser::GetSBits(S32 n)
{
    const U32 bits = GetBits(n);
    if (n <= 0 || n >= 32)
        return static_cast<S32>(bits);
    const U32 sign = 1u << (n - 1);
    return static_cast<S32>((bits ^ sign) - sign);
}

U16 SParser::GetWord()
{
    const U32 low = GetByte();
    return static_cast<U16>(low | static_cast<U32>(GetByte()) << 8);
}

U32 SParser::GetDWord()
{
    const U32 low = GetWord();
    return low | static_cast<U32>(GetWord()) << 16;
}

void SParser::GetRect(SRECT* r)
{
    InitBits();
    const S32 bits = static_cast<S32>(GetBits(5));
    r->xmin = GetSBits(bits);
    r->xmax = GetSBits(bits);
    r->ymin = GetSBits(bits);
    r->ymax = GetSBits(bits);
}

void SParser::GetMatrix(MATRIX* m)
{
    MatrixIdentity(m);
    InitBits();
    if (GetBits(1)) {
        const S32 bits = static_cast<S32>(GetBits(5));
        m->a = GetSBits(bits);
        m->d = GetSBits(bits);
    }
    if (GetBits(1)) {
        const S32 bits = static_cast<S32>(GetBits(5));
        m->b = GetSBits(bits);
        m->c = GetSBits(bits);
    }
    const S32 bits = static_cast<S32>(GetBits(5));
    m->tx = GetSBits(bits);
    m->ty = GetSBits(bits);
}

void SParser::GetColorTransform(ColorTransform* cx, int alpha)
{
    *cx = ColorTransform();
    InitBits();
    cx->flags = GetBits(2);
    const S32 bits = static_cast<S32>(GetBits(4));
    // The add flag is the first bit on the wire, but the multiply terms are the first terms.
    if (cx->flags & ColorTransform::kMultiplies) {
        cx->redMul = static_cast<S16>(GetSBits(bits));
        cx->greenMul = static_cast<S16>(GetSBits(bits));
        cx->blueMul = static_cast<S16>(GetSBits(bits));
        if (alpha)
            cx->alphaMul = static_cast<S16>(GetSBits(bits));
    }
    if (cx->flags & ColorTransform::kAdds) {
        cx->redAdd = static_cast<S16>(GetSBits(bits));
        cx->greenAdd = static_cast<S16>(GetSBits(bits));
        cx->blueAdd = static_cast<S16>(GetSBits(bits));
        if (alpha)
            cx->alphaAdd = static_cast<S16>(GetSBits(bits));
    }
}

SRGB SParser::GetColor(int alpha)
{
    SRGB color;
    color.red = GetByte();
    color.green = GetByte();
    color.blue = GetByte();
    color.alpha = alpha ? GetByte() : 255;
    return color;
}

void SParser::GetColor(RGBI* c, int alpha)
{
    const SRGB color = GetColor(alpha);
    c->red = color.red;
    c->green = color.green;
    c->blue = color.blue;
    c->alpha = color.alpha;
}

const char* SParser::PeekString() const
{
    return script ? reinterpret_cast<const char*>(script + pos) : "";
}

const char* SParser::GetStringP()
{
    const char* s = PeekString();
    while (pos < limit && script[pos++] != 0) {
    }
    return s;
}

char* SParser::GetString()
{
    return CreateStr(GetStringP());
}

S32 SParser::GetData(void* dst, S32 n)
{
    const S32 end = tagEnd < limit ? tagEnd : limit;
    const S32 left = end > pos ? end - pos : 0;
    const S32 count = n < 0 ? 0 : n < left ? n : left;
    if (count > 0)
        std::memcpy(dst, script + pos, static_cast<size_t>(count));
    pos += count;
    return count;
}

S32 SParser::GetTag(S32 len)
{
    tagStart = pos;
    const S32 end = len < limit ? len : limit;
    if (end < pos || end - pos < 2)
        return -1;
    const U32 head = GetWord();
    tagCode = static_cast<S32>(head);
    U32 bodyLen = head & 0x3F;
    if (bodyLen == 0x3F) {
        if (end - pos < 4)
            return Incomplete();
        bodyLen = GetDWord();
    }
    // Compared as what is left, never added first: a length near 4 GiB must not wrap round.
    if (bodyLen > static_cast<U32>(end - pos))
        return Incomplete();
    tagEnd = pos + static_cast<S32>(bodyLen);
    tagCode = static_cast<S32>(head >> 6);
    return tagCode;
}

S32 SParser::Incomplete()
{
    pos = tagStart;
    return -1;
}

void SParser::Skip(S32 n)
{
    if (n > 0)
        pos = n < limit - pos ? pos + n : limit;
}
