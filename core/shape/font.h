// SFont: what a font character holds: glyph outlines, and the codes and measures that go with them.
#pragma once

#include <string_view>

#include "core/geom/types.h"

struct SCharacter;

// A stretch of a movie's bytes, read by index as little-endian numbers. What lies beyond its end
// reads as 0.
struct SBytes {
    const U8* at = nullptr;
    U32 len = 0;

    U32 Byte(U32 i) const { return i < len ? at[i] : 0; }
    U32 Word(U32 i) const { return Byte(i) | Byte(i + 1) << 8; }
    U32 DWord(U32 i) const { return Word(i) | Word(i + 2) << 16; }
    // The same stretch without its first `start` bytes; empty when it has no more.
    SBytes From(U32 start) const
    {
        return start < len ? SBytes{at + start, len - start} : SBytes{};
    }
};

// Reads both forms of a font in place and owns nothing: good for as long as the character stands in
// its dictionary, and cheap to make. Measures are in 1/1024 of the em. A glyph is named by its
// index; every question about one that the font does not have is answered with none or 0.
class SFont {
public:
    // A font without glyphs.
    SFont() = default;
    // The font that a character defines; without glyphs when it is null or of another type.
    explicit SFont(const SCharacter* character);

    // 0 when the table of glyphs does not fit into its tag.
    U32 GlyphCount() const { return glyphCount; }
    // From the selector widths of a glyph's records to the end of the font's tag; empty for a glyph
    // that is not there.
    SBytes Glyph(U32 glyph) const;

    // The name, byte for byte and not zero-terminated; empty when nothing says it.
    std::string_view Name() const;
    bool Bold() const { return style & kBold; }
    bool Italic() const { return style & kItalic; }

    // The character code of a glyph, 0 when there is none.
    U32 Code(U32 glyph) const { return CodeAt(glyph); }
    // The first glyph of a character code, -1 when there is none. Looks at one glyph after another.
    S32 FindGlyph(U32 code) const;

    // The font says how wide its glyphs and how high its lines are; the rest is 0 without.
    bool HasLayout() const { return style & kLayout; }
    S32 Ascent() const { return S16(layout.Word(0)); }
    S32 Descent() const { return S16(layout.Word(2)); }
    S32 Leading() const { return S16(layout.Word(4)); }
    S32 Advance(U32 glyph) const;

private:
    enum Style : U8 { kBold = 1, kItalic = 2, kWideCodes = 4, kWideOffsets = 8, kLayout = 16 };

    void ReadPlain(const SCharacter* ch);
    void ReadWithLayout(const SCharacter* ch);
    U32 Offset(U32 index) const;
    U32 CodeBytes() const { return style & kWideCodes ? 2 : 1; }
    U32 CodeAt(U32 glyph) const;

    SBytes table;         // the offsets, and all that follows them in the tag
    SBytes info;          // from the name's length on: the information record's, or the font's own
    SBytes codes;         // of the glyphs, in their order
    SBytes layout;        // from the ascent on; empty when the font has none
    U32 glyphCount = 0;   // all with an offset
    U8 style = 0;         // Style bits
    bool ownInfo = false; // `info` is the font's own and ends with the glyph count
};
