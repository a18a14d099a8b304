#include "tests/support/glyph_writer.h"

static ByteWriter PutName(ByteWriter out, const std::string& name)
{
    return out.PutU8(U32(name.size())).PutBytes({name.begin(), name.end()});
}

static ByteWriter PutNumbers(ByteWriter out, const std::vector<S32>& numbers, bool wide)
{
    for (S32 n : numbers)
        wide ? out.PutU16(U32(n)) : out.PutU8(U32(n));
    return out;
}

// The offsets of the glyphs from the table's own start, and that of what follows the glyphs where
// there is an entry more; then the glyphs.
static ByteWriter PutGlyphs(ByteWriter out, const Glyphs& glyphs, size_t entries, bool wide)
{
    ByteWriter outlines;
    for (size_t i = 0; i < entries; i++) {
        const U32 offset = U32(entries * (wide ? 4 : 2) + outlines.Size());
        wide ? out.PutU32(offset) : out.PutU16(offset);
        if (i < glyphs.size())
            glyphs[i].WriteGlyph(outlines);
    }
    return out.PutBytes(outlines.Bytes());
}

ByteWriter FontBody(U16 id, const Glyphs& glyphs)
{
    return PutGlyphs(ByteWriter().PutU16(id), glyphs, glyphs.size(), false);
}

ByteWriter FontInfoBody(U16 id, const FontText& text)
{
    ByteWriter out = PutName(ByteWriter().PutU16(id), text.name).PutU8(text.flags);
    return PutNumbers(out, text.codes, text.flags & 1);
}

ByteWriter Font2Body(U16 id, const Glyphs& glyphs, const FontText& text)
{
    ByteWriter out = PutName(ByteWriter().PutU16(id).PutU16(text.flags), text.name);
    out.PutU16(U32(glyphs.size()));
    out = PutGlyphs(out, glyphs, glyphs.size() + 1, text.flags & 8);
    return PutNumbers(PutNumbers(out, text.codes, text.flags & 4), text.layout, true);
}

ByteWriter TextBody(U16 id, const Box& bounds, const Mat& mat, const std::vector<TextRun>& runs,
                    bool alpha)
{
    ByteWriter out;
    out.PutU16(id).PutRect(bounds).PutMatrix(mat).PutU8(9).PutU8(15);
    for (const auto& [font, color, x, y, glyphs] : runs) {
        out.PutU8(0x80u | U32(!!font) << 3 | U32(!!color) << 2 | U32(!!y) << 1 | U32(!!x));
        if (font)
            out.PutU16(font->first);
        if (color)
            out.PutColor(*color, alpha);
        for (const auto& offset : {x, y})
            if (offset)
                out.PutU16(U32(*offset));
        if (font)
            out.PutU16(font->second);
        out.PutU8(U32(glyphs.size()));
        for (const auto& [glyph, advance] : glyphs)
            out.UB(9, glyph).SB(15, advance);
    }
    return out.PutU8(0);
}

ByteWriter FieldBody(U16 id, const FieldText& field)
{
    ByteWriter out = ByteWriter().PutU16(id).PutRect(field.box).PutU16(field.flags);
    if (field.flags & 0x0001)
        out.PutU16(field.font).PutU16(field.height);
    if (field.flags & 0x0004)
        out.PutColor(field.color, true);
    if (field.flags & 0x0002)
        out.PutU16(field.maxLen);
    if (field.flags & 0x2000) {
        out.PutU8(U32(field.layout[0]));
        out = PutNumbers(out, {field.layout.begin() + 1, field.layout.end()}, true);
    }
    out.PutString(field.variable);
    return field.flags & 0x0080 ? out.PutString(field.text) : out;
}

ByteWriter MorphBody(U16 id, const ShapeBuilder& start, const ShapeBuilder& end)
{
    ByteWriter out;
    start.WriteMorph(out.PutU16(id).PutRect(start.Bounds()).PutRect(end.Bounds()), end);
    return out;
}
