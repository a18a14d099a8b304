#pragma once

#include "samples/alphabet.h"
#include "samples/scene.h"
#include "tests/support/glyph_writer.h"

#include <string>
#include <string_view>

// Fonts and static texts in the alphabet of the samples. Strings are UTF-8; what the alphabet lacks
// is passed over.

// One font of a movie with just the letters of a sample of text, in either form. A font is defined
// once; texts then name it. `bold` widens every stroke to both sides, in 1024ths of the em.
class Font {
public:
    enum Form { kPlain, kWithLayout }; // code 10 with an information record, and code 48
    Font(U16 id, std::string_view letters, S32 bold = 0);

    void Define(TagWriter& movie, Form form) const;
    U16 Id() const { return id; }
    U32 Glyph(U16 code) const; // its index
    S32 Advance(U16 code) const { return AlphabetAdvance(code) + 2 * bold; }
    // In pixels, for letters `size` pixels to the em with `spacing` pixels between them.
    double Width(std::string_view text, double size, double spacing = 0) const;

private:
    ShapeBuilder Outline(U16 code) const;

    U16 id;
    std::vector<U16> codes;
    S32 bold;
};

// One line of a text: where it starts (or, by `align`, its middle or end) on its baseline, in
// pixels. Up to 127 letters.
struct TextLine {
    std::string_view text;
    double x = 0, y = 0, size = 12;
    Rgba color;
    double align = 0;   // 0 starts there, 0.5 is centred there, 1 ends there
    double spacing = 0; // pixels between letters
};

// Breaks text at its blanks into lines as wide as may be; the first `indented` lines are narrower.
std::vector<std::string_view> BreakLines(const Font& font, std::string_view text, double size,
                                         double width, size_t indented = 0, double indent = 0);

// A static text of several lines; code 33 when `alpha`, else 11.
void DefineText(TagWriter& movie, U16 id, const Font& font, const std::vector<TextLine>& lines,
                bool alpha = true);
