#include "samples/lettering.h"

#include <algorithm>

// The next character of a UTF-8 string of ours, which has nothing beyond 16 bits.
static U16 NextCode(std::string_view* text)
{
    U32 first = U8(text->front()), more = first < 0xC0 ? 0 : first < 0xE0 ? 1 : 2;
    U32 code = more == 0 ? first : more == 1 ? first & 0x1F : first & 0x0F;
    for (U32 i = 1; i <= more; i++)
        code = code << 6 | (U8((*text)[i]) & 0x3F);
    text->remove_prefix(more + 1);
    return U16(code);
}

static std::vector<U16> Codes(std::string_view text)
{
    std::vector<U16> codes;
    while (!text.empty())
        codes.push_back(NextCode(&text));
    return codes;
}

// To which side of an edge the letter ends: 1 right or below, -1 left or
// above, 0 for one that does not say.
static Pt Outside(Pt from, const GlyphEdge& e)
{
    auto sign = [](S32 v) { return (v > 0) - (v < 0); };
    return {sign(from.y - e.y), sign(e.x - from.x)};
}

// Swept over by a small upright rectangle: every edge moves to its outer side, and where neighbours
// part a straight edge joins them. Where they cross instead the winding rule hides the loop.
static void AddWidened(ShapeBuilder* shape, const GlyphContour& contour, S32 bold)
{
    const size_t count = contour.edges.size();
    std::vector<Pt> starts = {{contour.x, contour.y}}, sides;
    for (const GlyphEdge& e : contour.edges) {
        sides.push_back(Outside(starts.back(), e));
        starts.push_back({e.x, e.y});
    }
    auto moved = [&](S32 x, S32 y, Pt side, Pt beside) {
        S32 right = side.x ? side.x : beside.x, below = side.y ? side.y : beside.y;
        return Pt{x + bold + right * bold, y + below * bold / 2};
    };
    for (size_t i = 0; i < count; i++) {
        const GlyphEdge& e = contour.edges[i];
        const Pt start = moved(starts[i].x, starts[i].y, sides[i], sides[(i + count - 1) % count]);
        const Pt end = moved(e.x, e.y, sides[i], sides[(i + 1) % count]);
        const Pt control = moved(e.controlX, e.controlY, sides[i], sides[(i + 1) % count]);
        i == 0 ? shape->MoveTo(start.x, start.y) : shape->LineTo(start.x, start.y);
        e.curved ? shape->CurveTo(control.x, control.y, end.x, end.y) : shape->LineTo(end.x, end.y);
    }
    shape->Close();
}

ShapeBuilder Font::Outline(U16 code) const
{
    ShapeBuilder shape;
    shape.Fill1(1);
    for (const GlyphContour& contour : AlphabetOutline(code))
        AddWidened(&shape, contour, bold);
    return shape;
}

Font::Font(U16 fontId, std::string_view letters, S32 boldness)
    : id(fontId), codes(Codes(letters)), bold(boldness)
{
    std::sort(codes.begin(), codes.end());
    codes.erase(std::unique(codes.begin(), codes.end()), codes.end());
    const auto& known = AlphabetCodes();
    std::erase_if(codes,
                  [&](U16 code) { return !std::binary_search(known.begin(), known.end(), code); });
}

void Font::Define(TagWriter& movie, Form form) const
{
    FontText text = {"Viaduct Sans", 0, {codes.begin(), codes.end()}, {}};
    Glyphs glyphs;
    for (U16 code : codes)
        glyphs.push_back(Outline(code));
    if (form == kPlain) {
        text.flags = 1;
        movie.Raw(kTagDefineFont, FontBody(id, glyphs));
        movie.Raw(kTagDefineFontInfo, FontInfoBody(id, text));
        return;
    }
    text.flags = 0x84;
    text.layout = {kAlphabetAscent, kAlphabetDescent, 0};
    for (U16 code : codes)
        text.layout.push_back(Advance(code));
    ByteWriter body = Font2Body(id, glyphs, text);
    for (const ShapeBuilder& glyph : glyphs)
        body.PutRect(glyph.Bounds());
    movie.Raw(kTagDefineFont2, body.PutU16(0)); // no kerning
}

U32 Font::Glyph(U16 code) const
{
    return U32(std::lower_bound(codes.begin(), codes.end(), code) - codes.begin());
}

double Font::Width(std::string_view text, double size, double spacing) const
{
    double width = 0;
    for (U16 code : Codes(text))
        width += Advance(code) * size / kAlphabetEm + spacing;
    return width - spacing;
}

static Box Around(const Font& font, const std::vector<TextLine>& lines)
{
    double left = 1e6, right = -1e6, top = 1e6, bottom = -1e6;
    for (const TextLine& line : lines) {
        double width = font.Width(line.text, line.size, line.spacing);
        double start = line.x - width * line.align;
        left = std::min(left, start - line.size * 0.1);
        right = std::max(right, start + width + line.size * 0.1);
        top = std::min(top, line.y - line.size);
        bottom = std::max(bottom, line.y + line.size * 0.3);
    }
    return {Twips(left), Twips(right), Twips(top), Twips(bottom)};
}

// Advances are rounded so that the sum stays right: each glyph stands within half a twip.
static TextRun Run(const Font& font, const TextLine& line)
{
    double x = line.x - font.Width(line.text, line.size, line.spacing) * line.align;
    TextRun run = {.font = {{font.Id(), U16(Twips(line.size))}},
                   .color = line.color,
                   .x = Twips(x),
                   .y = Twips(line.y)};
    for (U16 code : Codes(line.text)) {
        double next = x + font.Advance(code) * line.size / kAlphabetEm + line.spacing;
        run.glyphs.push_back({font.Glyph(code), Twips(next) - Twips(x)});
        x = next;
    }
    return run;
}

void DefineText(TagWriter& movie, U16 id, const Font& font, const std::vector<TextLine>& lines,
                bool alpha)
{
    std::vector<TextRun> runs;
    for (const TextLine& line : lines)
        runs.push_back(Run(font, line));
    movie.Raw(alpha ? kTagDefineText2 : kTagDefineText,
              TextBody(id, Around(font, lines), {}, runs, alpha));
}

std::vector<std::string_view> BreakLines(const Font& font, std::string_view text, double size,
                                         double width, size_t indented, double indent)
{
    std::vector<std::string_view> lines;
    while (!text.empty()) {
        double room = width - (lines.size() < indented ? indent : 0);
        size_t end = 0;
        for (size_t next = 0; end < text.size(); end = next) {
            next = std::min(text.find(' ', end + 1), text.size());
            if (font.Width(text.substr(0, next), size) > room)
                break;
        }
        lines.push_back(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return lines;
}
