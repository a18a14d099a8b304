// A scene for raster tests: colours and edges by hand, painted into a small buffer.
#pragma once

#include <deque>
#include <vector>

#include "core/raster/raster.h"

struct Corner {
    S32 x, y;
};

class RasterScene {
public:
    CRaster raster;
    CBitBuffer bits;
    int antialias;

    RasterScene(S32 width, S32 height, int aa) : antialias(aa)
    {
        raster.SetAntialias(aa);
        bits.CreateScreenBits(width, height);
        SRECT all = {0, width, 0, height};
        raster.Attach(&bits, &all, aa);
    }

    // A premultiplied solid colour; transparent when its alpha is below 255.
    RColor* Solid(U32 argb)
    {
        RColor* c = New();
        c->rgb = {U16(argb & 255), U16(argb >> 8 & 255), U16(argb >> 16 & 255), U16(argb >> 24)};
        Premultiply(&c->rgb);
        c->transparent = c->rgb.alpha < 255;
        c->BuildCache();
        return c;
    }
    RColor* Clip()
    {
        RColor* c = New();
        c->colorType = kColorClip;
        c->transparent = 1;
        c->BuildCache();
        return c;
    }
    RColor* New()
    {
        colors.emplace_back();
        colors.back().SetUp(&raster);
        return &colors.back();
    }

    // One object: polygons and curves added since the last one become its edges.
    struct Object {
        std::deque<REdge> edges;
        std::vector<RColor*> colors;
        RColor* clip = nullptr;
    };
    Object& NewObject(RColor* clip = nullptr)
    {
        objects.emplace_back();
        objects.back().clip = clip;
        return objects.back();
    }
    static void Line(Object& o, Corner a, Corner b, RColor* c1, RColor* c2, U8 rule)
    {
        Curve(o, a, {(a.x + b.x) / 2, (a.y + b.y) / 2}, b, c1, c2, rule);
        if (a.y != b.y)
            o.edges.back().isLine = 1;
    }
    static void Curve(Object& o, Corner a, Corner c, Corner b, RColor* c1, RColor* c2, U8 rule)
    {
        if (a.y == b.y)
            return;
        S8 dir = 1;
        if (a.y > b.y) {
            std::swap(a, b);
            dir = -1;
        }
        o.edges.push_back({nullptr, nullptr, c1, c2, S16(a.x), S16(a.y), S16(c.x), S16(c.y),
                           S16(b.x), S16(b.y), 0, rule, dir});
    }
    static void Polygon(Object& o, const std::vector<Corner>& p, RColor* c, U8 rule)
    {
        for (size_t i = 0; i < p.size(); ++i)
            Line(o, p[i], p[(i + 1) % p.size()], c, nullptr, rule);
        Own(o, c);
    }
    static void Box(Object& o, SRECT r, RColor* c)
    {
        Polygon(o, {{r.xmin, r.ymin}, {r.xmax, r.ymin}, {r.xmax, r.ymax}, {r.xmin, r.ymax}}, c,
                kRuleEvenOdd);
    }
    // The colour joins the object's table with the next style number.
    static void Own(Object& o, RColor* c)
    {
        for (RColor* have : o.colors)
            if (have == c)
                return;
        o.colors.push_back(c);
    }

    // Paints all objects inside `area` (pixels).
    void Paint(SRECT area, bool alpha = false)
    {
        raster.Attach(&bits, &area, antialias);
        if (alpha)
            raster.UseAlphaChannel();
        raster.BeginPaint();
        for (Object& o : objects)
            Add(o);
        raster.PaintBits();
    }
    void Paint(bool alpha = false) { Paint({0, bits.Width(), 0, bits.Height()}, alpha); }
    U32 At(S32 x, S32 y) const { return bits.Row32(y)[x]; }
    // Words, whatever the format.
    std::vector<U32> Pixels()
    {
        std::vector<U32> all;
        RGBI c;
        for (S32 i = 0, w = bits.Width(); i < w * bits.Height(); ++i) {
            bits.Ops()->readRow(bits.Row(i / w), i % w, &c, 1);
            all.push_back(PackLanes(ToLanes(c)));
        }
        return all;
    }

    std::deque<Object> objects;

private:
    void Add(Object& o)
    {
        REdge* edges = nullptr;
        for (REdge& e : o.edges) {
            e.next = edges;
            edges = &e;
        }
        RColor* list = nullptr;
        for (size_t i = 0; i < o.colors.size(); ++i) {
            o.colors[i]->order = U32(i + 1);
            o.colors[i]->nextColor = list;
            list = o.colors[i];
        }
        raster.AddEdges(edges, list, o.clip);
    }

    std::deque<RColor> colors;
};

// A gradient over the whole buffer: `inv` maps pixels << 8 to the gradient square << 8.
struct GradientScene : RasterScene {
    RColor* c;
    GradientScene(S32 w, S32 h, int aa, U8 type, const MATRIX& inv,
                  std::initializer_list<U8> ratios, std::initializer_list<SRGB> stops)
        : RasterScene(w, h, aa), c(New())
    {
        c->colorType = kColorGradient;
        c->gradientType = type;
        c->gradientInv = inv;
        std::copy(ratios.begin(), ratios.end(), c->ramp.ratios);
        std::copy(stops.begin(), stops.end(), c->ramp.colors);
        c->ramp.count = U8(ratios.size());
        for (const SRGB& s : stops)
            c->transparent |= s.alpha < 255;
        c->BuildCache();
        S32 k = aa ? 4 : 1;
        Box(NewObject(), {0, w * k, 0, h * k}, c);
    }
};

constexpr SRGB kBlack = {0, 0, 0, 255}, kWhite = {255, 255, 255, 255};
