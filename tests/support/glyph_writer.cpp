#include "tests/support/glyph_writer.h"

static void PutName(ByteWriter& out, const std::string& name)
{
    out.PutU8(U32(name.size())).PutBytes({name.begin(), name.end()});
}

static U32 Listed(const std::vector<U16>& list, size_t i)
{
    return i < list.size() ? list[i] : 0;
}

ByteWriter FontInfoBody(U16 id, const FontText& text)
{
    ByteWriter out;
    PutName(out.PutU16(id), text.name);
    out.PutU8(U32(text.wideCodes) | U32(text.bold) << 1 | U32(text.italic) << 2);
    for (U16 code : text.codes)
        text.wideCodes ? out.PutU16(code) : out.PutU8(code);
    return out;
}

// The table of glyph offsets from its own start, with the end of the glyphs behind them where there
// is one entry more than glyphs; then the glyphs.
static void PutGlyphs(ByteWriter& out, const Glyphs& glyphs, size_t entries, bool wide)
{
    ByteWriter outlines;
    const size_t table = entries * (wide ? 4 : 2);
    for (size_t i = 0; i < entries; i++) {
        const U32 offset = U32(table + outlines.Size());
        wide ? out.PutU32(offset) : out.PutU16(offset);
        if (i < glyphs.size())
            glyphs[i].WriteGlyph(outlines);
    }
    out.PutBytes(outlines.Bytes());
}

ByteWriter FontBody(U16 id, const Glyphs& glyphs)
{
    ByteWriter out;
    PutGlyphs(out.PutU16(id), glyphs, glyphs.size(), false);
    return out;
}

ByteWriter Font2Body(U16 id, const Glyphs& glyphs, const FontText& text)
{
    ByteWriter out;
    out.PutU16(id).PutU16(0x80u | U32(text.bold) | U32(text.italic) << 1 |
                          U32(text.wideCodes) << 2 | U32(text.wideOffsets) << 3);
    PutName(out, text.name);
    PutGlyphs(out.PutU16(U32(glyphs.size())), glyphs, glyphs.size() + 1, text.wideOffsets);
    for (size_t i = 0; i < glyphs.size(); i++)
        text.wideCodes ? out.PutU16(Listed(text.codes, i)) : out.PutU8(Listed(text.codes, i));
    out.PutU16(U32(text.ascent)).PutU16(U32(text.descent)).PutU16(U32(text.leading));
    for (size_t i = 0; i < glyphs.size(); i++)
        out.PutU16(i < text.advances.size() ? U32(text.advances[i]) : 0);
    for (const ShapeBuilder& glyph : glyphs)
        out.PutRect(glyph.Bounds());
    return out.PutU16(0); // no kerning
}

ByteWriter MorphBody(U16 id, const ShapeBuilder& start, const ShapeBuilder& end)
{
    ByteWriter out, body;
    out.PutU16(id).PutRect(start.Bounds()).PutRect(end.Bounds());
    start.WriteMorph(body, end);
    out.PutU32(U32(body.Size()));
    end.WriteMorphEnd(out.PutBytes(body.Bytes()));
    return out;
}

TextBuilder::TextBuilder(bool alpha, const Mat& mat, U32 glyphBits, U32 advanceBits)
    : hasAlpha(alpha), glyphWidth(glyphBits), advanceWidth(advanceBits)
{
    records.PutMatrix(mat).PutU8(glyphBits).PutU8(advanceBits);
}

TextBuilder& TextBuilder::Set(const Style& s)
{
    records.PutU8(0x80u | U32(s.font.has_value()) << 3 | U32(s.color.has_value()) << 2 |
                  U32(s.y.has_value()) << 1 | U32(s.x.has_value()));
    if (s.font)
        records.PutU16(s.font->first);
    if (s.color)
        records.PutColor(*s.color, hasAlpha);
    if (s.x)
        records.PutU16(U32(*s.x));
    if (s.y)
        records.PutU16(U32(*s.y));
    if (s.font)
        records.PutU16(s.font->second);
    return *this;
}

TextBuilder& TextBuilder::Run(const std::vector<std::pair<U32, S32>>& glyphs)
{
    records.PutU8(U32(glyphs.size()));
    for (const auto& [glyph, advance] : glyphs)
        records.UB(int(glyphWidth), glyph).SB(int(advanceWidth), advance);
    records.Align();
    return *this;
}

ByteWriter TextBuilder::Body(U16 id, const Box& bounds) const
{
    ByteWriter out;
    return out.PutU16(id).PutRect(bounds).PutBytes(records.Bytes()).PutU8(0);
}
