// Drawing text fields: box, selection, glyphs and caret.
#include "core/display/edit_text.h"

#include <algorithm>

#include "core/display/display_list.h"
#include "core/player/player.h"
#include "core/shape/character_parser.h"
#include "core/shape/stroker.h"

namespace {
constexpr U32 kGlyphCost = 8;       // records that setting up for an outline is worth
constexpr S32 kScalePerHeight = 64; // of an em of 1024 units, in 16.16
constexpr SRGB kBlack = {0, 0, 0, 255};
constexpr SRGB kWhite = {255, 255, 255, 255};

// How the colours of one list lie above one another.
enum EFieldLayer : U32 { kFill = 1, kBorder, kBar, kGlyphs = 1, kChosen, kCaret };
} // namespace

// Builds one field's edges once.
class FieldPainter {
public:
    FieldPainter(EditText* editText, const STransform* transform)
        : field(*editText), obj(editText->obj), display(obj->display), placed(transform),
          from(std::min(field.anchor, field.caret)), to(std::max(field.anchor, field.caret))
    {
    }

    void Paint();

private:
    void PaintBounds();
    U32 LinesInView() const;
    bool IsInView(U32 line) const
    {
        const U32 first = field.layout.FirstLine();
        return line >= first && line - first < LinesInView();
    }
    void PaintLines();
    void PaintBox();
    void PaintBars();
    SRECT BarOf(U32 line) const;
    void PaintLine(U32 line);
    void PaintGlyph(const LineWalk& at, S32 baseline);
    void PaintCaret();
    RColor* GlyphColor(bool chosen);
    RColor* BackColor(SRGB value, U32 order)
    {
        return CreateSolidColor(display, &field.backColors, value, placed->cxform, order);
    }

    EditText& field;
    SObject* obj;
    DisplayList* display;
    const STransform* placed;
    U32 from; // of the selection
    U32 to;
};

// The bounds come first: without them, in a list that is full of edges, nothing shows. A mask has
// neither box nor selection, and its colour before all glyphs, for it hides its range even while it
// shows no text.
void FieldPainter::Paint()
{
    if (!field.maskColors)
        PaintBounds();
    if (obj->IsClip()) {
        GlyphColor(false);
    } else {
        PaintBox();
        PaintBars();
    }
    PaintLines();
    if (field.caretOn && field.ShowsCaret() && IsInView(field.layout.LineOf(to)))
        PaintCaret();
}

void FieldPainter::PaintBounds()
{
    RColor* inside = CreateClipColor(display, &field.maskColors);
    if (inside)
        AddRect(&field.record.bounds, &placed->mat, inside, display, &field.maskEdges, nullptr);
}

U32 FieldPainter::LinesInView() const
{
    const TextLayout& text = field.layout;
    const S64 height = S64(field.record.bounds.ymax) - text.LineTop(text.FirstLine());
    const S64 room = (std::max<S64>(height, 0) + text.LineHeight() - 1) / text.LineHeight();
    return U32(std::min<S64>(room, text.LineCount() - text.FirstLine()));
}

// Lines that have their edges keep them. What the parser makes goes to the object first.
void FieldPainter::PaintLines()
{
    const U32 count = LinesInView();
    field.FreeLines(count, TextLayout::kLastLine);
    if (!field.lineEdges.Resize(count))
        return;
    for (U32 i = 0; i < count && display->recordsLeft > 0; i++) {
        if (field.lineEdges[i])
            continue;
        PaintLine(field.layout.FirstLine() + i);
        field.lineEdges[i] = obj->edges;
        obj->edges = nullptr;
    }
}

void FieldPainter::PaintBox()
{
    if (!field.record.Has(kFieldBorder))
        return;
    RColor* fill = BackColor(kWhite, kFill);
    RColor* line = fill ? BackColor(kBlack, kBorder) : nullptr;
    if (!line)
        return;
    SStroker stroker(display, &field.backEdges);
    stroker.BeginStroke(0, line);
    AddRect(&field.record.bounds, &placed->mat, fill, display, &field.backEdges, &stroker);
    stroker.EndStroke();
}

void FieldPainter::PaintBars()
{
    RColor* bar = from < to ? BackColor(kBlack, kBar) : nullptr;
    const U32 first = field.layout.FirstLine(), count = bar ? LinesInView() : 0;
    for (U32 i = 0; i < count && display->recordsLeft > 0; i++) {
        const SRECT r = BarOf(first + i);
        display->recordsLeft--;
        if (r.xmin < r.xmax && r.ymin < r.ymax)
            AddRect(&r, &placed->mat, bar, display, &field.backEdges, nullptr);
    }
}

// What is selected of a line; a selected break shows as a narrow space.
SRECT FieldPainter::BarOf(U32 line) const
{
    const TextLayout& text = field.layout;
    const STextLine& l = text.Line(line);
    const SRECT& b = field.record.bounds;
    if (from > l.end || to <= l.start)
        return {};
    const S32 beyond = l.hard && to > l.end ? field.font.Height() / 4 : 0;
    SRECT r = {text.XOf(line, std::max(from, l.start)),
               text.XOf(line, std::min(to, l.end)) + beyond, text.LineTop(line),
               text.LineTop(line) + text.LineHeight()};
    r.xmin = std::max(r.xmin, b.xmin), r.xmax = std::min(r.xmax, b.xmax);
    r.ymin = std::max(r.ymin, b.ymin), r.ymax = std::min(r.ymax, b.ymax);
    return r;
}

// An outline may reach beside its advance, but hardly by more than its height.
void FieldPainter::PaintLine(U32 line)
{
    const S32 baseline = field.layout.Baseline(line), reach = field.font.Height();
    const SRECT& bounds = field.record.bounds;
    for (LineWalk at(field.layout, line); at.Next() && at.x <= S64(bounds.xmax) + reach;) {
        if (at.code == 0 || at.x + at.advance < S64(bounds.xmin) - reach)
            continue;
        if (display->recordsLeft == 0)
            return;
        PaintGlyph(at, baseline);
    }
}

void FieldPainter::PaintGlyph(const LineWalk& at, S32 baseline)
{
    const S32 glyph = field.font.Glyph(at.code);
    const SBytes outline = glyph >= 0 ? field.font.Font().Glyph(U32(glyph)) : SBytes{};
    RColor* color = outline.len > 0 ? GlyphColor(at.offset >= from && at.offset < to) : nullptr;
    if (!color)
        return;
    display->recordsLeft -= std::min(display->recordsLeft, kGlyphCost);
    const S32 scale = field.font.Height() * kScalePerHeight;
    MATRIX mat = {scale, 0, 0, scale, S32(at.x), baseline};
    MatrixConcat(&mat, &placed->mat, &mat);
    SCharacterParser parser(obj, obj->character->player, outline.at, S32(outline.len), 0, &mat);
    parser.SetOnlyFill(color);
    parser.useWinding = true;
    parser.BuildEdges(false, &obj->devBounds);
}

// Made when the first glyph needs it. A mask has one colour for all.
RColor* FieldPainter::GlyphColor(bool chosen)
{
    chosen = chosen && !obj->IsClip();
    RColor*& color = field.glyphColors[chosen];
    if (color)
        return color;
    color = obj->IsClip()
                ? CreateClipColor(display, &obj->colors)
                : CreateSolidColor(display, &obj->colors, chosen ? kWhite : field.record.color,
                                   placed->cxform, chosen ? kChosen : kGlyphs);
    return color;
}

// As thin as can be, whatever the scale.
void FieldPainter::PaintCaret()
{
    RColor*& color = field.caretColor;
    if (!color)
        color = CreateSolidColor(display, &obj->colors, field.record.color, placed->cxform, kCaret);
    if (!color)
        return;
    const U32 line = field.layout.LineOf(to);
    const S32 top = field.layout.LineTop(line);
    SPOINT ends[2] = {{field.layout.XOf(line, to), top}, {0, top + field.layout.LineHeight()}};
    ends[1].x = ends[0].x;
    for (SPOINT& p : ends)
        MatrixTransformPoint(&placed->mat, &p, &p);
    SStroker stroker(display, &field.caretEdges);
    stroker.BeginStroke(0, color);
    AddRectEdge(&ends[0], &ends[1], nullptr, display, &field.caretEdges, &stroker);
    stroker.EndStroke();
}

void EditText::Build(const STransform* placed)
{
    FieldPainter(this, placed).Paint();
}

// The text goes in before what it is clipped to, like everything under a mask.
void EditText::Draw(CRaster* raster, RColor* clip)
{
    raster->AddEdges(backEdges, backColors, clip);
    DrawMask(raster, clip);
}

void EditText::DrawMask(CRaster* raster, RColor* clip)
{
    for (REdge* line : lineEdges)
        raster->AddEdges(line);
    raster->AddEdges(caretEdges, obj->colors, maskColors);
    raster->AddEdges(maskEdges, maskColors, clip ? clip : ClipMarker());
}

// By their place in view.
void EditText::FreeLines(U32 from, U32 to)
{
    DisplayList* display = obj->display;
    for (size_t i = from; i <= to && i < lineEdges.size(); i++) {
        display->FreeEdges(lineEdges[i]);
        lineEdges[i] = nullptr;
    }
}

// With box and caret.
void EditText::FreeSelection()
{
    DisplayList* display = obj->display;
    display->FreeEdges(backEdges);
    display->FreeColors(backColors);
    display->FreeEdges(caretEdges);
    backEdges = caretEdges = nullptr;
    backColors = nullptr;
}

// The colours of the glyphs go with the object's.
void EditText::FreeCache()
{
    FreeLines(0, kLastLine);
    FreeSelection();
    lineEdges.Clear();
    obj->display->FreeEdges(maskEdges);
    obj->display->FreeColors(maskColors);
    maskEdges = nullptr;
    maskColors = nullptr;
    glyphColors[0] = glyphColors[1] = caretColor = nullptr;
}
