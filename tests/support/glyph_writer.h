#pragma once

#include "tests/support/movie_writer.h"

#include <utility>

// What a font says besides its outlines. Lists shorter than the glyphs leave zeros.
struct FontText {
    std::string name = "";
    bool bold = false, italic = false;
    bool wideCodes = false;   // 16 bits each
    bool wideOffsets = false; // 32 bits each; with layout only
    std::vector<U16> codes = {};
    S32 ascent = 0, descent = 0, leading = 0; // with layout only, as what follows
    std::vector<S32> advances = {};
};

// Bodies of definition tags. Glyphs are drawn in a square of 1024, y down, with fill selector 1 and
// no styles of their own.
using Glyphs = std::vector<ShapeBuilder>;
ByteWriter FontBody(U16 id, const Glyphs& glyphs);                        // code 10
ByteWriter FontInfoBody(U16 id, const FontText& text);                    // code 13
ByteWriter Font2Body(U16 id, const Glyphs& glyphs, const FontText& text); // code 48

// Code 46. The start builder's styles and selectors count; the end builder gives the end values of
// the same styles, block by block, and its edges.
ByteWriter MorphBody(U16 id, const ShapeBuilder& start, const ShapeBuilder& end);

// Grows the records of a static text: styles, then runs of glyph indices with their advances.
class TextBuilder {
public:
    // `alpha` for code 33, whose colours have it. Glyphs and advances have the given widths.
    explicit TextBuilder(bool alpha, const Mat& mat = {}, U32 glyphBits = 8, U32 advanceBits = 16);

    // One style record of the parts that are set.
    struct Style {
        std::optional<std::pair<U16, U16>> font = {}; // id and height in twips
        std::optional<Rgba> color = {};
        std::optional<S32> x = {}, y = {};
    };
    TextBuilder& Set(const Style& style);
    TextBuilder& Run(const std::vector<std::pair<U32, S32>>& glyphs); // at most 127
    // The whole body, closed with its zero byte.
    ByteWriter Body(U16 id, const Box& bounds) const;

private:
    bool hasAlpha;
    U32 glyphWidth, advanceWidth;
    ByteWriter records;
};
