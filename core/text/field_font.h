// FieldFont: the font of a text field, by character code and in twips.
#pragma once

#include "core/shape/font.h"

class ScriptPlayer;
struct SFieldRecord;
struct SFontCodes;

// What a field's text is measured and drawn with: a font of the field's own movie, or one of the
// built-in fonts, at the field's height. It holds copies of all it answers from and reads outlines
// in the buffer of the movie that the font is from, so it lasts as long as that movie, whatever
// becomes of the font's character. Codes are bytes. Lengths are in twips.
class FieldFont {
public:
    // No font: nothing to draw, every byte half the height wide.
    FieldFont() = default;

    // Finds the font of a field. `movie` is the field's, `builtIn` the movie of the built-in fonts;
    // either may be null. A font of the movie is taken when the field asks for one and it is there;
    // else a built-in one by the name of the font that the field gives.
    // True when the font was measured, which takes a while and is done once for each font, and
    // again when its information record comes later.
    bool Resolve(const SFieldRecord& field, ScriptPlayer* movie, ScriptPlayer* builtIn);
    // The field will need a built-in font.
    static bool WantsBuiltIn(const SFieldRecord& field, ScriptPlayer* movie);

    // Where the outlines are; see SFont::Glyph.
    const SFont& Font() const { return font; }
    // The glyph of a code, -1 when there is none to be drawn.
    S32 Glyph(U8 code) const { return glyphs[code] == kNoGlyph ? -1 : glyphs[code]; }
    // From one byte to the next, never negative.
    S32 Advance(U8 code) const { return advances[code]; }

    S32 Height() const { return height; }   // of the em
    S32 Ascent() const { return ascent; }   // from a line's top to its baseline
    S32 Descent() const { return descent; } // from there to its bottom
    S32 Leading() const { return leading; } // below that, to the next line
    // How far outlines reach above and below the baseline, at least 0; kFar where that is not
    // known.
    S32 Rise() const { return rise; }
    S32 Fall() const { return fall; }
    static constexpr S32 kFar = 0x3FFFFFFF;

private:
    static constexpr U16 kNoGlyph = 0xFFFF; // no font has that many glyphs

    bool Take(SCharacter* ch);
    void TakeNone();
    void Measure(const SFontCodes& codes);
    S32 Scale(S32 em) const { return (em * height + 512) >> 10; }

    SFont font;
    S32 height = 0;
    S32 ascent = 0;
    S32 descent = 0;
    S32 leading = 0;
    S32 rise = 0;
    S32 fall = 0;
    U16 glyphs[256] = {}; // by code
    S32 advances[256] = {};
};

// The built-in font that stands for a font of this name: "_sans", "_serif" or "_typewriter".
const char* DeviceFontFor(std::string_view name);
