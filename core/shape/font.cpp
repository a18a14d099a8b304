#include "core/shape/font.h"

#include "core/stream/character.h"
#include "core/stream/tags.h"

namespace {
// The flags of the information record, and of the form with layout.
enum InfoFlags : U32 { kInfoWideCodes = 1, kInfoBold = 2, kInfoItalic = 4 };
enum FontFlags : U32 {
    kFontBold = 0x01,
    kFontItalic = 0x02,
    kFontWideCodes = 0x04,
    kFontWideOffsets = 0x08,
    kFontLayout = 0x80,
};
constexpr U32 kLineMeasures = 6; // bytes of ascent, descent and leading

SBytes Block(const U8* at, S32 len)
{
    return at && len > 0 ? SBytes{at, U32(len)} : SBytes{};
}
} // namespace

SFont::SFont(const SCharacter* ch)
{
    if (!ch || ch->type != kCharFont)
        return;
    table = Block(ch->data, ch->DataLen());
    if (ch->tagCode == kTagDefineFont2)
        ReadWithLayout(ch);
    else
        ReadPlain(ch);
    // A first offset that cannot be one makes the whole table suspect.
    const U32 first = Offset(0);
    if (first == 0 || (first & 1) || first >= table.len)
        glyphCount = 0;
}

void SFont::ReadPlain(const SCharacter* ch)
{
    glyphCount = table.Word(0) / 2;
    info = Block(ch->font.info, ch->font.infoLen);
    const U32 flags = info.Byte(1 + info.Byte(0));
    style = U8((flags & kInfoBold ? kBold : 0) | (flags & kInfoItalic ? kItalic : 0) |
               (flags & kInfoWideCodes ? kWideCodes : 0));
    codes = info.From(2 + info.Byte(0));
}

void SFont::ReadWithLayout(const SCharacter* ch)
{
    const U32 flags = ch->font.flags;
    style = U8((flags & kFontBold ? kBold : 0) | (flags & kFontItalic ? kItalic : 0) |
               (flags & kFontWideCodes ? kWideCodes : 0) |
               (flags & kFontWideOffsets ? kWideOffsets : 0) | (flags & kFontLayout ? kLayout : 0));
    info = Block(ch->data - ch->font.distance, ch->font.distance);
    ownInfo = true;
    glyphCount = ch->font.glyphCount;
    const U32 tableBytes = (glyphCount + 1) * (flags & kFontWideOffsets ? 4 : 2);
    if (tableBytes > table.len) {
        glyphCount = 0;
        return;
    }
    // Behind the glyphs, where the last offset points.
    codes = table.From(Offset(glyphCount));
    if (flags & kFontLayout)
        layout = codes.From(glyphCount * CodeBytes());
}

U32 SFont::Offset(U32 index) const
{
    return style & kWideOffsets ? table.DWord(index * 4) : table.Word(index * 2);
}

SBytes SFont::Glyph(U32 glyph) const
{
    const U32 offset = glyph < glyphCount ? Offset(glyph) : 0;
    return offset != 0 ? table.From(offset) : SBytes{};
}

// The two bytes of the glyph count end the font's own block.
std::string_view SFont::Name() const
{
    const SBytes text = info.From(1);
    const U32 most = ownInfo && text.len >= 2 ? text.len - 2 : text.len;
    const U32 len = info.Byte(0) < most ? info.Byte(0) : most;
    return len > 0 ? std::string_view(reinterpret_cast<const char*>(text.at), len)
                   : std::string_view();
}

U32 SFont::CodeAt(U32 glyph) const
{
    if (glyph >= glyphCount)
        return 0;
    return style & kWideCodes ? codes.Word(glyph * 2) : codes.Byte(glyph);
}

// Zeros beyond the end of a table that is cut short are no codes.
S32 SFont::FindGlyph(U32 code) const
{
    const U32 listed = codes.len / CodeBytes();
    const U32 count = listed < glyphCount ? listed : glyphCount;
    for (U32 i = 0; i < count; ++i) {
        if (CodeAt(i) == code)
            return S32(i);
    }
    return -1;
}

S32 SFont::Advance(U32 glyph) const
{
    return glyph < glyphCount ? S16(layout.Word(kLineMeasures + glyph * 2)) : 0;
}
