// Writes the movie of the built-in fonts: make_fonts MOVIE SANS SERIF TYPEWRITER, each font a
// TrueType file. Outlines and measures come from the files' own units by integers, unhinted, so
// that a file gives the same movie on every machine.
#include "tests/support/glyph_writer.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>

#include <ft2build.h>
#include FT_FREETYPE_H
#include FT_OUTLINE_H

namespace {

constexpr S64 kEm = 1024;
constexpr U32 kWithLayout = 0x80;
constexpr size_t kLargestTable = 0xFFFF; // bytes that a 16-bit offset reaches

[[noreturn]] void Fail(const char* what, const char* detail)
{
    std::fprintf(stderr, "make_fonts: %s: %s\n", detail, what);
    std::exit(1);
}

// A measure of the file in units of the movie; halves go up.
S32 Scaled(S64 value, S64 unitsPerEm)
{
    const S64 twice = 2 * value * kEm + unitsPerEm;
    const S64 below = twice % (2 * unitsPerEm);
    return S32((twice - (below < 0 ? below + 2 * unitsPerEm : below)) / (2 * unitsPerEm));
}

// Where the pieces of an outline go. They come in half units of the file: the points between two
// control points, which the file leaves out, are then whole numbers too.
struct Pen {
    ShapeBuilder* shape;
    S64 unitsPerEm;

    Pt At(const FT_Vector* v) const
    {
        return {Scaled(v->x, 2 * unitsPerEm), -Scaled(v->y, 2 * unitsPerEm)};
    }
};

int MoveTo(const FT_Vector* to, void* user)
{
    const Pen* pen = static_cast<Pen*>(user);
    const Pt end = pen->At(to);
    pen->shape->MoveTo(end.x, end.y);
    return 0;
}

int LineTo(const FT_Vector* to, void* user)
{
    const Pen* pen = static_cast<Pen*>(user);
    const Pt end = pen->At(to);
    pen->shape->LineTo(end.x, end.y);
    return 0;
}

int ConicTo(const FT_Vector* control, const FT_Vector* to, void* user)
{
    const Pen* pen = static_cast<Pen*>(user);
    const Pt middle = pen->At(control), end = pen->At(to);
    pen->shape->CurveTo(middle.x, middle.y, end.x, end.y);
    return 0;
}

// Not in TrueType files; there is no record for it.
int CubicTo(const FT_Vector*, const FT_Vector*, const FT_Vector*, void*)
{
    return 1;
}

ShapeBuilder Outline(FT_Face face)
{
    constexpr int kHalfUnits = 1;
    const FT_Outline_Funcs verbs = {MoveTo, LineTo, ConicTo, CubicTo, kHalfUnits, 0};
    ShapeBuilder shape;
    shape.Fill1(1);
    Pen pen = {&shape, face->units_per_EM};
    if (FT_Outline_Decompose(&face->glyph->outline, &verbs, &pen) != 0)
        Fail("an outline that is no TrueType outline", face->family_name);
    return shape;
}

std::vector<S32> Codes()
{
    std::vector<S32> codes;
    for (S32 code = 0x20; code <= 0xFF; code++)
        if (code < 0x7F || code >= 0xA0)
            codes.push_back(code);
    return codes;
}

void LoadGlyph(FT_Face face, S32 code)
{
    const FT_UInt index = FT_Get_Char_Index(face, FT_ULong(code));
    if (index == 0 || FT_Load_Glyph(face, index, FT_LOAD_NO_SCALE) != 0 ||
        face->glyph->format != FT_GLYPH_FORMAT_OUTLINE)
        Fail("a character is missing", face->family_name);
}

ByteWriter Font(U16 id, const char* name, FT_Face face)
{
    const S64 em = face->units_per_EM;
    const S32 ascent = Scaled(face->ascender, em), descent = Scaled(-face->descender, em);
    FontText text = {name, kWithLayout, Codes(), {ascent, descent}};
    text.layout.push_back(std::max(0, Scaled(face->height, em) - ascent - descent));
    Glyphs glyphs;
    for (S32 code : text.codes) {
        LoadGlyph(face, code);
        glyphs.push_back(Outline(face));
        text.layout.push_back(Scaled(face->glyph->advance.x, em));
    }
    ByteWriter body = Font2Body(id, glyphs, text);
    for (const ShapeBuilder& glyph : glyphs)
        body.PutRect(glyph.Bounds());
    if (body.Size() > kLargestTable)
        Fail("too many bytes", face->family_name);
    return body.PutU16(0); // no kerning
}

bool Save(const char* path, const std::vector<U8>& bytes)
{
    FILE* file = std::fopen(path, "wb");
    if (!file)
        return false;
    const bool whole = std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
    return std::fclose(file) == 0 && whole;
}

} // namespace

int main(int argc, char** argv)
{
    const char* const names[] = {"_sans", "_serif", "_typewriter"};
    if (argc != 5) {
        std::fprintf(stderr, "usage: make_fonts MOVIE SANS SERIF TYPEWRITER\n");
        return 2;
    }
    FT_Library library;
    if (FT_Init_FreeType(&library) != 0)
        Fail("does not start", "FreeType");
    MovieWriter movie;
    for (int i = 0; i < 3; i++) {
        FT_Face face;
        if (FT_New_Face(library, argv[i + 2], 0, &face) != 0 || !FT_IS_SCALABLE(face))
            Fail("not an outline font", argv[i + 2]);
        movie.Raw(kTagDefineFont2, Font(U16(i + 1), names[i], face));
        FT_Done_Face(face);
    }
    FT_Done_FreeType(library);
    movie.Show().End();
    if (!Save(argv[1], movie.Bytes()))
        Fail("cannot be written", argv[1]);
    return 0;
}
