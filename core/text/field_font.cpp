#include "core/text/field_font.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "core/shape/shape_parser.h"
#include "core/stream/script_player.h"
#include "core/text/field_record.h"

// What is asked of a font by code, worked out once and kept with its character. Plain memory from
// malloc, which the dictionary frees.
struct SFontCodes {
    const U8* info;  // the information record at that time: one may arrive later
    U16 glyphs[256]; // 0xFFFF: none
    S16 widths[256]; // in the em's units: of the layout, or how far the outline reaches
    S32 rise;        // of all outlines, in the em's units; kUnknown: one was not measured
    S32 fall;
};

namespace {
constexpr U16 kNone = 0xFFFF;
constexpr U32 kFirstCode = 32;         // of a font that does not say its codes
constexpr U32 kOutlineRecords = 16384; // read of one font to measure its glyphs
constexpr U16 kBuiltInIds = 256;       // the built-in fonts have lower ones
constexpr S32 kUnknown = -1;
constexpr S32 kMostReach = 0x7FFF; // of an outline that is measured, in the em's units

char Folded(char c)
{
    return c >= 'A' && c <= 'Z' ? char(c + 32) : c;
}

bool Same(std::string_view a, std::string_view b)
{
    return a.size() == b.size() && std::equal(a.begin(), a.end(), b.begin(), [](char x, char y) {
               return Folded(x) == Folded(y);
           });
}

// `part` is in small letters.
bool Contains(std::string_view name, std::string_view part)
{
    return std::search(name.begin(), name.end(), part.begin(), part.end(),
                       [](char x, char y) { return Folded(x) == y; }) != name.end();
}

template <size_t N> bool ContainsAny(std::string_view name, const char* const (&parts)[N])
{
    return std::any_of(parts, parts + N, [&](const char* part) { return Contains(name, part); });
}

// Of several glyphs with one code the first counts, so they are entered from the last one on.
void EnterCodes(const SFont& font, SFontCodes* codes)
{
    std::fill_n(codes->glyphs, 256, kNone);
    bool listed = false;
    for (U32 glyph = font.GlyphCount(); glyph-- > 0;) {
        const U32 code = font.Code(glyph);
        listed = listed || code != 0;
        if (code != 0 && code < 256)
            codes->glyphs[code] = U16(glyph);
    }
    for (U32 code = kFirstCode; !listed && code < 256 && code - kFirstCode < font.GlyphCount();
         ++code)
        codes->glyphs[code] = U16(code - kFirstCode);
}

// Where an outline lies. `left` is the number of records that may be read.
SRECT OutlineBounds(const SBytes& outline, U32* left)
{
    const MATRIX same = {0x10000, 0, 0, 0x10000, 0, 0};
    RColor* none = nullptr;
    SShapeParser parser(nullptr, nullptr, &none, outline.at, S32(outline.len), 0, &same);
    parser.GetSelectorWidths();
    SRECT all = {0, 0, 0, 0};
    CURVE c;
    for (int what = 0; what != SShapeParser::kEndOfShape && *left > 0; --*left) {
        what = parser.GetShapeEdge(&c);
        SRECT r;
        RectSetEmpty(&r);
        if (what == 0)
            CurveTightBounds(&c, &r);
        RectUnion(&all, &r, &all);
    }
    return all;
}

void Measure(const SFont& font, SFontCodes* codes)
{
    U32 left = kOutlineRecords;
    codes->rise = codes->fall = 0;
    for (int code = 0; code < 256; ++code) {
        const U32 glyph = codes->glyphs[code];
        codes->widths[code] = 0;
        if (glyph == kNone)
            continue;
        const SRECT r = OutlineBounds(font.Glyph(glyph), &left);
        const S32 width = font.HasLayout() ? font.Advance(glyph) : r.xmax;
        codes->widths[code] = S16(std::min(width, kMostReach));
        codes->rise = std::max(codes->rise, -S32(std::max(r.ymin, -kMostReach)));
        codes->fall = std::max(codes->fall, std::min(r.ymax, kMostReach));
    }
    if (left == 0 || codes->rise == kMostReach || codes->fall == kMostReach)
        codes->rise = codes->fall = kUnknown;
}

// Kept in the character when there is memory for it, else in `spare`.
const SFontCodes& CodesOf(SCharacter* ch, const SFont& font, SFontCodes* spare, bool* measured)
{
    auto* codes = static_cast<SFontCodes*>(ch->font.cache);
    *measured = !codes || codes->info != ch->font.info;
    if (!*measured)
        return *codes;
    if (!codes)
        ch->font.cache = codes = static_cast<SFontCodes*>(std::malloc(sizeof(SFontCodes)));
    if (!codes)
        codes = spare;
    codes->info = ch->font.info;
    EnterCodes(font, codes);
    Measure(font, codes);
    return *codes;
}

SCharacter* FindFont(ScriptPlayer* movie, U16 id)
{
    SCharacter* ch = movie ? movie->FindCharacter(id) : nullptr;
    return ch && ch->type == kCharFont ? ch : nullptr;
}

SCharacter* FindNamed(ScriptPlayer* movie, std::string_view name)
{
    for (U16 id = 0; id < kBuiltInIds; ++id) {
        SCharacter* ch = FindFont(movie, id);
        if (ch && Same(SFont(ch).Name(), name))
            return ch;
    }
    return nullptr;
}
} // namespace

const char* DeviceFontFor(std::string_view name)
{
    static const char* const kExact[] = {"_sans", "_serif", "_typewriter"};
    for (const char* device : kExact) {
        if (Same(name, device))
            return device;
    }
    static const char* const kTypewriters[] = {"mono", "cour", "type", "fixed"};
    static const char* const kSerifs[] = {"times", "roman", "georgia"};
    if (ContainsAny(name, kTypewriters))
        return "_typewriter";
    if ((Contains(name, "serif") && !Contains(name, "sans")) || ContainsAny(name, kSerifs))
        return "_serif";
    return "_sans";
}

bool FieldFont::WantsBuiltIn(const SFieldRecord& field, ScriptPlayer* movie)
{
    return !field.Has(kFieldOwnGlyphs) || !field.Has(kFieldFont) || !FindFont(movie, field.fontId);
}

bool FieldFont::Resolve(const SFieldRecord& field, ScriptPlayer* movie, ScriptPlayer* builtIn)
{
    height = field.height;
    SCharacter* named = field.Has(kFieldFont) ? FindFont(movie, field.fontId) : nullptr;
    if (named && field.Has(kFieldOwnGlyphs))
        return Take(named);
    SCharacter* device = FindNamed(builtIn, DeviceFontFor(SFont(named).Name()));
    if (device)
        return Take(device);
    TakeNone();
    return false;
}

void FieldFont::TakeNone()
{
    font = SFont();
    std::fill_n(glyphs, 256, kNoGlyph);
    std::fill_n(advances, 256, height / 2);
    ascent = height * 4 / 5;
    descent = height - ascent;
    leading = 0;
    rise = fall = 0;
}

bool FieldFont::Take(SCharacter* ch)
{
    SFontCodes spare;
    bool measured;
    TakeNone();
    font = SFont(ch);
    if (font.HasLayout()) {
        ascent = Scale(font.Ascent());
        descent = Scale(font.Descent());
        leading = Scale(font.Leading());
    }
    Measure(CodesOf(ch, font, &spare, &measured));
    return measured;
}

// A font without a layout gets a little room beside each outline, and spaces of a quarter.
void FieldFont::Measure(const SFontCodes& codes)
{
    std::memcpy(glyphs, codes.glyphs, sizeof glyphs);
    rise = codes.rise == kUnknown ? kFar : Scale(codes.rise) + 1;
    fall = codes.fall == kUnknown ? kFar : Scale(codes.fall) + 1;
    for (int code = 0; code < 256; ++code) {
        const bool space = code == ' ';
        if (glyphs[code] == kNoGlyph)
            advances[code] = space ? height / 4 : height / 2;
        else if (font.HasLayout())
            advances[code] = std::max(0, Scale(codes.widths[code]));
        else
            advances[code] = space ? height / 4 : (codes.widths[code] * height >> 10) + height / 16;
    }
}
