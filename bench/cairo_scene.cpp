#include "bench/cairo_scene.h"

#include <algorithm>
#include <cmath>
#include <map>
#include <utility>

#include "core/shape/shape_parser.h"
#include "core/shape/text_records.h"
#include "core/stream/script_player.h"

namespace {

using Place = std::pair<S32, S32>;

struct Segment {
    Place from, control, to;
    bool line;
};

cairo_pattern_t* SolidPattern(SRGB c)
{
    return cairo_pattern_create_rgba(c.red / 255.0, c.green / 255.0, c.blue / 255.0,
                                     c.alpha / 255.0);
}

cairo_matrix_t ToCairo(const MATRIX& m)
{
    cairo_matrix_t out;
    cairo_matrix_init(&out, m.a / 65536.0, m.b / 65536.0, m.c / 65536.0, m.d / 65536.0, m.tx, m.ty);
    return out;
}

} // namespace

// The pieces around one colour, inside always on the same hand, so that they chain into loops.
struct CairoScene::Contours {
    std::vector<Segment> pieces;

    void Add(const CURVE& c, bool reversed)
    {
        Place a = {c.anchor1.x, c.anchor1.y}, b = {c.anchor2.x, c.anchor2.y};
        if (reversed)
            std::swap(a, b);
        pieces.push_back({a, {c.control.x, c.control.y}, b, c.isLine != 0});
    }

    void Trace(cairo_t* cr) const
    {
        std::multimap<Place, size_t> starts;
        for (size_t i = 0; i < pieces.size(); ++i)
            starts.insert({pieces[i].from, i});
        while (!starts.empty())
            TraceLoop(cr, &starts);
    }

private:
    void TraceLoop(cairo_t* cr, std::multimap<Place, size_t>* starts) const
    {
        auto next = starts->begin();
        cairo_move_to(cr, next->first.first, next->first.second);
        while (next != starts->end()) {
            const Segment& s = pieces[next->second];
            starts->erase(next);
            TracePiece(cr, s);
            next = starts->find(s.to);
        }
        cairo_close_path(cr);
    }

public:
    // As one open line after another, in the order drawn.
    void TraceLines(cairo_t* cr) const
    {
        const Segment* last = nullptr;
        for (const Segment& s : pieces) {
            if (!last || last->to != s.from)
                cairo_move_to(cr, s.from.first, s.from.second);
            TracePiece(cr, s);
            last = &s;
        }
    }

private:
    static void TracePiece(cairo_t* cr, const Segment& s)
    {
        auto third = [](S32 end, S32 control) { return (end + 2.0 * control) / 3; };
        if (s.line)
            cairo_line_to(cr, s.to.first, s.to.second);
        else
            cairo_curve_to(cr, third(s.from.first, s.control.first),
                           third(s.from.second, s.control.second),
                           third(s.to.first, s.control.first), third(s.to.second, s.control.second),
                           s.to.first, s.to.second);
    }
};

// All pieces of one style.
struct CairoScene::Painted {
    Contours outline;
    double width = 0; // of a line style
};

CairoScene::CairoScene(NativePlayerWnd* p) : player(p)
{
    surface = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, p->Width(), p->Height());
    cr = cairo_create(surface);
    cairo_set_line_join(cr, CAIRO_LINE_JOIN_ROUND);
    cairo_set_line_cap(cr, CAIRO_LINE_CAP_ROUND);
    STransform camera;
    camera.mat = p->scene.camera;
    camera.cxform.Clear();
    AddTree(&p->scene.root, camera);
}

CairoScene::~CairoScene()
{
    for (Item& item : items) {
        if (item.path)
            cairo_path_destroy(item.path);
        if (item.paint)
            cairo_pattern_destroy(item.paint);
    }
    cairo_destroy(cr);
    cairo_surface_destroy(surface);
}

void CairoScene::AddTree(SObject* obj, STransform xform)
{
    if (!obj->visible)
        return;
    xform.Concat(&obj->xform);
    AddShape(obj, xform, false);
    U32 clipEnd = 0;
    for (SObject* child = obj->bottomChild; child; child = child->above) {
        if (clipEnd && child->depth > clipEnd) {
            items.push_back({nullptr, nullptr, {}, true});
            clipEnd = 0;
        }
        STransform inner = xform;
        inner.Concat(&child->xform);
        if (child->IsClip() && !clipEnd && child->character->type == kCharShape) {
            AddShape(child, inner, true);
            clipEnd = child->clipDepth;
        } else {
            AddTree(child, xform);
        }
    }
    if (clipEnd)
        items.push_back({nullptr, nullptr, {}, true});
}

void CairoScene::AddShape(SObject* obj, const STransform& xform, bool clip)
{
    SCharacter* ch = obj->character;
    if (ch && ch->type == kCharText)
        return AddText(obj, xform);
    if (!ch || ch->type != kCharShape)
        return;
    RColor* colors = nullptr;
    MATRIX identity;
    MatrixIdentity(&identity);
    SShapeParser parser(ch->player, &player->scene, &colors, ch->data, ch->DataLen(), 0, &identity);
    parser.getAlpha = ch->tagCode == 32;
    parser.cxform = xform.cxform;
    std::map<std::pair<U32, RColor*>, Painted> outlines;
    Contours mask;
    CURVE c;
    bool good = parser.GetStyles();
    for (int flags = 0; good && flags != SShapeParser::kEndOfShape;) {
        flags = parser.GetEdge(&c);
        if (flags)
            continue;
        const SLineStyle line = parser.LineStyle(parser.line);
        if (line.color && !clip) {
            Painted& stroke = outlines[{line.color->order, line.color}];
            stroke.width = line.thickness;
            stroke.outline.Add(c, false);
        }
        RColor* f0 = parser.Fill(parser.fill0);
        RColor* f1 = parser.Fill(parser.fill1);
        if (f0 == f1)
            continue;
        if (f0)
            (clip ? mask : outlines[{f0->order, f0}].outline).Add(c, true);
        if (f1)
            (clip ? mask : outlines[{f1->order, f1}].outline).Add(c, false);
    }
    if (clip)
        AddItem(mask, nullptr, xform.mat);
    for (auto& [key, painted] : outlines) {
        AddItem(painted.outline, PatternOf(key.second), xform.mat);
        if (painted.width > 0)
            MakeStroke(&items.back(), painted);
    }
    Free(colors);
}

void CairoScene::Free(RColor* colors)
{
    while (RColor* gone = colors) {
        colors = gone->nextColor;
        ReleaseCharacter(gone->bitmapCharacter);
        player->scene.colorAlloc.Free(gone);
    }
}

// Lines as the player draws them: never thinner than a pixel, round at joins and ends.
void CairoScene::MakeStroke(Item* item, const Painted& painted)
{
    cairo_path_destroy(item->path);
    cairo_new_path(cr);
    painted.outline.TraceLines(cr);
    item->path = cairo_copy_path(cr);
    double x = 1, y = 1;
    cairo_matrix_transform_distance(&item->matrix, &x, &y);
    item->width = std::max(painted.width, 1.414 / std::hypot(x, y));
}

// All letters of one colour are one path.
void CairoScene::AddText(SObject* obj, const STransform& xform)
{
    STextRecords records(obj->character);
    Contours letters;
    SRGB value = records.color;
    const auto flush = [&] {
        if (!letters.pieces.empty())
            AddItem(letters, SolidPattern(value), xform.mat);
        if (!letters.pieces.empty())
            items.back().winding = true;
        letters.pieces.clear();
        value = records.color;
    };
    for (auto what = records.Next(); what != STextRecords::kEnd; what = records.Next()) {
        if (what == STextRecords::kGlyph)
            AddGlyph(records, &letters);
        else if (!(records.color == value))
            flush();
    }
    flush();
}

void CairoScene::AddGlyph(const STextRecords& text, Contours* letters)
{
    const SBytes glyph = text.font.Glyph(text.glyph);
    if (glyph.len == 0)
        return;
    MATRIX mat = text.GlyphMatrix();
    MatrixConcat(&mat, &text.mat, &mat);
    RColor* none = nullptr;
    SShapeParser parser(nullptr, &player->scene, &none, glyph.at, S32(glyph.len), 0, &mat);
    parser.GetSelectorWidths();
    CURVE c;
    for (int flags = 0; flags != SShapeParser::kEndOfShape;) {
        flags = parser.GetEdge(&c);
        if (flags == 0)
            letters->Add(c, false);
    }
}

cairo_matrix_t CairoScene::DeviceMatrix(const MATRIX& mat) const
{
    cairo_matrix_t m = ToCairo(mat);
    if (player->scene.antialias) {
        cairo_matrix_t quarter;
        cairo_matrix_init_scale(&quarter, 0.25, 0.25);
        cairo_matrix_multiply(&m, &m, &quarter);
    }
    return m;
}

void CairoScene::AddItem(const Contours& outline, cairo_pattern_t* paint, const MATRIX& mat)
{
    Item item = {nullptr, paint, DeviceMatrix(mat), false};
    cairo_identity_matrix(cr);
    cairo_new_path(cr);
    outline.Trace(cr);
    item.path = cairo_copy_path(cr);
    items.push_back(item);
}

cairo_pattern_t* CairoScene::PatternOf(const RColor* color) const
{
    if (color->colorType == kColorBitmap)
        return ImagePattern(color);
    if (color->colorType != kColorGradient) {
        double a = color->rgb.alpha ? color->rgb.alpha : 1;
        return cairo_pattern_create_rgba(color->rgb.red / a, color->rgb.green / a,
                                         color->rgb.blue / a, color->rgb.alpha / 255.0);
    }
    cairo_pattern_t* p = color->gradientType == kFillRadial
                             ? cairo_pattern_create_radial(0, 0, 0, 0, 0, 1)
                             : cairo_pattern_create_linear(-1, 0, 1, 0);
    for (int i = 0; i < color->ramp.count; ++i) {
        SRGB s = color->ramp.colors[i];
        cairo_pattern_add_color_stop_rgba(p, color->ramp.ratios[i] / 255.0, s.red / 255.0,
                                          s.green / 255.0, s.blue / 255.0, s.alpha / 255.0);
    }
    // A matrix that cairo cannot take both ways leaves the plain pattern.
    cairo_matrix_t m = ToCairo(color->gradientMat), back, unit;
    cairo_matrix_init_scale(&unit, 16384, 16384); // cairo's own numbers would not hold the square's
    cairo_matrix_multiply(&m, &unit, &m);
    bool usable = cairo_matrix_invert(&m) == CAIRO_STATUS_SUCCESS;
    back = m;
    if (usable && cairo_matrix_invert(&back) == CAIRO_STATUS_SUCCESS)
        cairo_pattern_set_matrix(p, &m);
    return p;
}

// The player's own pixels, which have cairo's layout when they are 32 bits wide.
cairo_pattern_t* CairoScene::ImagePattern(const RColor* color) const
{
    SBitmapCore* image = color->bitmap;
    if (!player->BuildBits(color->bitmapCharacter) || image->bmFormat != 5)
        return cairo_pattern_create_rgb(1, 0, 0);
    const auto format = image->transparent ? CAIRO_FORMAT_ARGB32 : CAIRO_FORMAT_RGB24;
    cairo_surface_t* pixels = cairo_image_surface_create_for_data(
        image->baseAddr, format, image->width, image->height, image->rowBytes);
    cairo_pattern_t* p = cairo_pattern_create_for_surface(pixels);
    cairo_surface_destroy(pixels);
    cairo_pattern_set_extend(p, color->bitmapType & 1 ? CAIRO_EXTEND_PAD : CAIRO_EXTEND_REPEAT);
    cairo_pattern_set_filter(p, CAIRO_FILTER_BILINEAR);
    cairo_matrix_t m = ToCairo(color->bitmapMat);
    if (cairo_matrix_invert(&m) == CAIRO_STATUS_SUCCESS)
        cairo_pattern_set_matrix(p, &m);
    return p;
}

void CairoScene::Draw()
{
    SRGB stage = player->scene.backgroundColor;
    cairo_identity_matrix(cr);
    cairo_set_source_rgb(cr, stage.red / 255.0, stage.green / 255.0, stage.blue / 255.0);
    cairo_paint(cr);
    for (const Item& item : items) {
        if (item.endClip) {
            cairo_reset_clip(cr);
            continue;
        }
        cairo_set_matrix(cr, &item.matrix);
        cairo_new_path(cr);
        cairo_append_path(cr, item.path);
        if (!item.paint) {
            cairo_clip(cr);
            continue;
        }
        cairo_set_source(cr, item.paint);
        cairo_set_fill_rule(cr, item.winding ? CAIRO_FILL_RULE_WINDING : CAIRO_FILL_RULE_EVEN_ODD);
        cairo_set_line_width(cr, item.width);
        if (item.width > 0)
            cairo_stroke(cr);
        else
            cairo_fill(cr);
    }
    cairo_surface_flush(surface);
}

bool CairoScene::Save(const char* path)
{
    return cairo_surface_write_to_png(surface, path) == CAIRO_STATUS_SUCCESS;
}
