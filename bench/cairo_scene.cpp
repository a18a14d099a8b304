#include "bench/cairo_scene.h"

#include <algorithm>
#include <map>
#include <utility>

#include "core/shape/shape_parser.h"
#include "core/stream/character.h"

namespace {

using Place = std::pair<S32, S32>;

struct Segment {
    Place from, control, to;
    bool line;
};

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

CairoScene::CairoScene(NativePlayerWnd* p) : player(p)
{
    surface = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, p->Width(), p->Height());
    cr = cairo_create(surface);
    cairo_set_fill_rule(cr, CAIRO_FILL_RULE_EVEN_ODD);
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
    if (!ch || ch->type != kCharShape)
        return;
    RColor* colors = nullptr;
    MATRIX identity;
    MatrixIdentity(&identity);
    SShapeParser parser(ch->player, &player->scene, &colors, ch->data, ch->DataLen(), 0, &identity);
    parser.getAlpha = ch->tagCode == 32;
    parser.cxform = xform.cxform;
    std::map<std::pair<U32, RColor*>, Contours> outlines;
    Contours mask;
    CURVE c;
    bool good = parser.GetStyles();
    for (int flags = 0; good && flags != SShapeParser::kEndOfShape;) {
        flags = parser.GetEdge(&c);
        if (flags)
            continue;
        RColor* f0 = parser.Fill(parser.fill0);
        RColor* f1 = parser.Fill(parser.fill1);
        if (f0 == f1)
            continue;
        if (f0)
            (clip ? mask : outlines[{f0->order, f0}]).Add(c, true);
        if (f1)
            (clip ? mask : outlines[{f1->order, f1}]).Add(c, false);
    }
    if (clip)
        AddItem(mask, nullptr, xform.mat);
    for (auto& [key, outline] : outlines)
        AddItem(outline, PatternOf(key.second), xform.mat);
    while (RColor* gone = colors) {
        colors = gone->nextColor;
        player->scene.colorAlloc.Free(gone);
    }
}

void CairoScene::AddItem(const Contours& outline, cairo_pattern_t* paint, const MATRIX& mat)
{
    Item item = {nullptr, paint, ToCairo(mat), false};
    if (player->scene.antialias) {
        cairo_matrix_t quarter;
        cairo_matrix_init_scale(&quarter, 0.25, 0.25);
        cairo_matrix_multiply(&item.matrix, &item.matrix, &quarter);
    }
    cairo_identity_matrix(cr);
    cairo_new_path(cr);
    outline.Trace(cr);
    item.path = cairo_copy_path(cr);
    items.push_back(item);
}

cairo_pattern_t* CairoScene::PatternOf(const RColor* color) const
{
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
        cairo_fill(cr);
    }
    cairo_surface_flush(surface);
}

bool CairoScene::Save(const char* path)
{
    return cairo_surface_write_to_png(surface, path) == CAIRO_STATUS_SUCCESS;
}
