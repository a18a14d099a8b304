#include "core/shape/text_records.h"

#include "core/stream/script_player.h"
#include "core/stream/tags.h"

namespace {
enum StyleFlags : U32 {
    kOffsetX = 0x01,
    kOffsetY = 0x02,
    kColor = 0x04,
    kFont = 0x08,
    kIsStyle = 0x80,
};
constexpr S32 kHeightToScale = 0x10000 / 1024; // a height of 1024 draws the em square 1:1
} // namespace

STextRecords::STextRecords(const SCharacter* text)
    : player(text->player), alpha(text->tagCode == kTagDefineText2)
{
    Attach(text->data, text->DataLen());
    GetMatrix(&mat);
    glyphBits = GetByte();
    advanceBits = GetByte();
}

// The advance waits until here, so that the caller sees where the last glyph stood.
STextRecords::ERecord STextRecords::Next()
{
    pen.x += advance;
    advance = 0;
    if (glyphsLeft > 0)
        return ReadGlyph();
    const U32 first = GetByte();
    if (first & kIsStyle)
        return ReadStyle(first);
    if (first == 0)
        return kEnd;
    glyphsLeft = first;
    InitBits();
    return ReadGlyph();
}

STextRecords::ERecord STextRecords::ReadGlyph()
{
    --glyphsLeft;
    const bool ended = pos >= limit && bitPos == 0;
    if (ended && glyphBits + advanceBits > 0)
        return kEnd; // a run that is cut short
    glyph = GetBits(glyphBits);
    advance = GetSBits(advanceBits);
    return kGlyph;
}

STextRecords::ERecord STextRecords::ReadStyle(U32 flags)
{
    if (flags & kFont) {
        const U16 id = GetWord();
        font = SFont(player ? player->FindCharacter(id) : nullptr);
    }
    if (flags & kColor)
        color = GetColor(alpha);
    if (flags & kOffsetX)
        pen.x = S16(GetWord());
    if (flags & kOffsetY)
        pen.y = S16(GetWord());
    if (flags & kFont)
        height = GetWord();
    return kStyle;
}

MATRIX STextRecords::GlyphMatrix() const
{
    const S32 scale = height * kHeightToScale;
    return {scale, 0, 0, scale, pen.x, pen.y};
}
