#pragma once

#include "tests/support/movie_writer.h"

// What a font says besides its outlines, as it goes out.
struct FontText {
    std::string name = "";
    U32 flags = 0;                // of the tag in question
    std::vector<S32> codes = {};  // of the glyphs, in their order
    std::vector<S32> layout = {}; // ascent, descent, leading, the glyphs' advances; with flag 0x80
};

// Part of a static text: changes of style, then glyph indices below 512 with their advances.
struct TextRun {
    std::optional<std::pair<U16, U16>> font = {}; // id and height in twips
    std::optional<Rgba> color = {};
    std::optional<S32> x = {}, y = {};
    std::vector<std::pair<U32, S32>> glyphs = {}; // 1 to 127
};

// Bodies of definition tags. Glyphs are drawn in a square of 1024, y down, with fill selector 1 and
// no styles of their own. What could follow a font's layout is left out.
using Glyphs = std::vector<ShapeBuilder>;
ByteWriter FontBody(U16 id, const Glyphs& glyphs); // code 10
ByteWriter FontInfoBody(U16 id, const FontText& text);
ByteWriter Font2Body(U16 id, const Glyphs& glyphs, const FontText& text);
ByteWriter TextBody(U16 id, const Box& bounds, const Mat& mat, const std::vector<TextRun>& runs,
                    bool alpha = true); // code 33; 11 without alpha
// A text field; what the flags do not announce is left out.
struct FieldText {
    Box box;
    U32 flags = 0;
    U16 font = 1, height = 400; // twips
    Rgba color = {0, 0, 0, 255};
    U16 maxLen = 0;
    std::vector<S32> layout = {0, 0, 0, 0, 0}; // alignment, margins, indent, leading
    std::string variable = "", text = "";
};
ByteWriter FieldBody(U16 id, const FieldText& field); // code 37
// Code 46; see ShapeBuilder::WriteMorph.
ByteWriter MorphBody(U16 id, const ShapeBuilder& start, const ShapeBuilder& end);
