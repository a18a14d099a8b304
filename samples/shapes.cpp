#include "samples/scene.h"

#include <cmath>

// A card of twelve tiles, one for each way of painting that shapes have. One frame, no motion.

namespace {

constexpr double kTileWidth = 148, kTileHeight = 144, kStep = 156;

enum Id : U16 {
    kCard = 1,
    kTile,
    kPetal,
    kFlower,
    kHeart,
    kView,
    kViewSun,
    kRound,
    kLeaf,
    kSpiral = 20, // and one more for every level
    kDrawings = 60,
};

// A bright colour of the wheel; hue counts once round.
Rgba Rainbow(double hue, int alpha = 255)
{
    auto channel = [&](double shift) {
        double v = 0.56 + 0.44 * Turns(hue + shift);
        return U8(RoundSteadily(255 * v));
    };
    return {channel(0.25), channel(0.25 - 1.0 / 3), channel(0.25 + 1.0 / 3), U8(alpha)};
}

Spot Around(double radius, double turn)
{
    return {radius * Turns(turn + 0.25), radius * Turns(turn)};
}

void DefineCard(TagWriter& movie)
{
    Drawing card, tile;
    card.Paint(Down(0, 480, {{0, Hex(0x2b3a55)}, {255, Hex(0x131b2c)}}))
        .Rect(kLeft, kTop, kRight, kBottom);
    for (int i = 0; i < 17; i++)
        card.Paint(Hex(0xffffff, 8)).Circle(320, 240, 20 + i * 26).Circle(320, 240, 33 + i * 26);
    movie.DefineShape(kCard, card.Shape());

    double w = kTileWidth / 2, h = kTileHeight / 2;
    for (int i = 0; i < 4; i++) // a soft shadow in layers
        tile.Paint(Hex(0x000000, 36)).RoundRect(-w - 1 + i, -h + 4 + i, w + 4 - i, h + 7 - i, 14);
    tile.Paint(Down(-h, h, {{0, Hex(0xfffdf6)}, {255, Hex(0xefe6d2)}})).RoundRect(-w, -h, w, h, 12);
    tile.Paint(Hex(0xffffff, 190))
        .RoundRect(-w, -h, w, h, 12)
        .RoundRect(-w + 1.4, -h + 1.4, w - 1.4, h - 1.4, 11);
    movie.DefineShape(kTile, tile.Shape());
}

// One outline that crosses itself leaves a hole; so do outlines inside outlines.
Drawing StarTile()
{
    Drawing d;
    d.Paint(Hex(0x24436e)).Circle(0, 0, 62).Circle(0, 0, 56).Circle(0, 0, 53).Circle(0, 0, 51.4);
    d.Paint(Glow(-10, -16, 74, {{0, Hex(0xffe680)}, {150, Hex(0xf5a623)}, {255, Hex(0xd4632a)}}));
    std::vector<Spot> corners;
    for (int i = 0; i < 7; i++)
        corners.push_back(Around(47, i * 3 / 7.0 - 0.25));
    return d.Polygon(corners);
}

// Holes with islands in them, all in two paints.
Drawing StencilTile()
{
    Drawing d;
    d.Paint(Down(-60, 60, {{0, Hex(0x19a08c)}, {255, Hex(0x0d5c6b)}}));
    d.RoundRect(-58, -56, 58, 56, 16);
    for (int i = 0; i < 8; i++) {
        Spot root = Around(13, i / 8.0), tip = Around(50, i / 8.0);
        Spot left = Around(34, i / 8.0 - 0.075), right = Around(34, i / 8.0 + 0.075);
        d.Move(root.x, root.y)
            .Curve(left.x, left.y, tip.x, tip.y)
            .Curve(right.x, right.y, root.x, root.y);
        Spot seed = Around(34, i / 8.0);
        d.Circle(seed.x, seed.y, 3.2);
        Spot dot = Around(45, (i + 0.5) / 8);
        d.Circle(dot.x, dot.y, 3.4);
    }
    d.Circle(0, 0, 9);
    d.Paint(Hex(0xf2643d)).Circle(0, 0, 6);
    return d;
}

// Neighbours share each edge: it is drawn once, with a paint on either side.
Drawing GlassTile()
{
    const int kWedges = 10;
    const double kRings[] = {14, 36, 60};
    Drawing d;
    ShapeBuilder& shape = d.Builder();
    int middle = shape.AddFill(Hex(0xfff3c4)), first[3] = {middle, 0, 0};
    for (int ring = 1; ring <= 2; ring++)
        for (int i = 0; i < kWedges; i++) {
            int selector = shape.AddFill(Rainbow(i / double(kWedges) + 0.09 * ring, 255));
            first[ring] = i == 0 ? selector : first[ring];
        }
    for (int ring = 1; ring <= 3; ring++) // arcs: paint inside, paint outside
        for (int i = 0; i < kWedges; i++) {
            int inside = ring == 1 ? middle : first[ring - 1] + i,
                outside = ring == 3 ? 0 : first[ring] + i;
            Spot from = Around(kRings[ring - 1], i / double(kWedges));
            shape.Styles(outside, inside);
            d.Move(from.x, from.y);
            d.Arc(0, 0, kRings[ring - 1], 360.0 * i / kWedges, 360.0 * (i + 1) / kWedges);
        }
    for (int ring = 1; ring <= 2; ring++) // spokes: the wedge before, the wedge after
        for (int i = 0; i < kWedges; i++) {
            Spot from = Around(kRings[ring - 1], i / double(kWedges)),
                 to = Around(kRings[ring], i / double(kWedges));
            shape.Styles(first[ring] + (i + kWedges - 1) % kWedges, first[ring] + i);
            d.Move(from.x, from.y).Line(to.x, to.y);
        }
    shape.Styles(0, 0);
    d.Paint(Hex(0x2a2438, 255)).Circle(0, 0, 62).Circle(0, 0, 59.4);
    d.Paint(Glow(-22, -28, 60, {{0, Hex(0xffffff, 150)}, {255, Hex(0xffffff, 0)}}))
        .Circle(0, 0, 60);
    return d;
}

// Translucent discs over opaque stripes.
Drawing DiscsTile()
{
    Drawing d;
    d.Paint(Hex(0x3a4664));
    for (int i = 0; i < 6; i++)
        d.Rect(-60, -52 + i * 19, 60, -43 + i * 19);
    const U32 colors[] = {0xff2d55, 0x18c964, 0x1f8fff};
    for (int i = 0; i < 3; i++) {
        Spot at = Around(24, i / 3.0 - 0.25);
        d.Paint(Hex(colors[i], 165)).Circle(at.x, at.y + 4, 34);
    }
    return d;
}

// Linear gradients at eight angles: a pinwheel of folded paper.
Drawing PinwheelTile()
{
    Drawing d;
    for (int i = 0; i < 8; i++) {
        double turn = i / 8.0;
        Spot far = Around(60, turn), side = Around(42, turn + 0.125),
             middle = Around(36, turn + 0.03);
        Rgba light = Rainbow(turn), dark = Rainbow(turn + 0.04);
        for (U8* channel : {&dark.r, &dark.g, &dark.b})
            *channel = U8(*channel * 5 / 9);
        Mat along =
            Mat::Gradient(Twips(middle.x), Twips(middle.y), Twips(48), Twips(48), i * 45 + 100);
        d.Paint(Fill::Linear(along, {{0, dark}, {110, light}, {170, Hex(0xffffff)}, {255, light}}));
        d.Move(0, 0)
            .Line(far.x, far.y)
            .Curve(far.x * 0.9 + side.x * 0.3, far.y * 0.9 + side.y * 0.3, side.x, side.y)
            .Close();
    }
    d.Paint(Glow(-1.5, -2, 8, {{0, Hex(0xffffff)}, {255, Hex(0x8f6a2a)}})).Circle(0, 0, 6);
    return d;
}

void DrawBall(Drawing& d, double x, double y, double radius, Rgba light, Rgba color, Rgba dark)
{
    d.Paint(OvalGlow(x + radius * 0.2, y + radius * 0.98, radius * 1.1, radius * 0.28,
                     {{0, Hex(0x1a1430, 130)}, {255, Hex(0x1a1430, 0)}}));
    d.Ellipse(x + radius * 0.2, y + radius * 0.98, radius * 1.1, radius * 0.28);
    d.Paint(Glow(x - radius * 0.35, y - radius * 0.4, radius * 1.5,
                 {{0, Hex(0xffffff)}, {38, light}, {130, color}, {225, dark}, {255, color}}));
    d.Circle(x, y, radius);
}

Drawing BallsTile()
{
    Drawing d;
    DrawBall(d, 24, -26, 24, Hex(0xd0f5ff), Hex(0x2f9fd8), Hex(0x0c3560));
    DrawBall(d, -26, -6, 30, Hex(0xffe0d0), Hex(0xe8503a), Hex(0x6a1020));
    DrawBall(d, 22, 28, 27, Hex(0xfff6c0), Hex(0xf0b020), Hex(0x7a4208));
    DrawBall(d, -22, 42, 14, Hex(0xe6ffd8), Hex(0x58b848), Hex(0x12491e));
    return d;
}

// A gradient that fades away shows the squares behind it.
Drawing FadeTile()
{
    Drawing d;
    d.Paint(Hex(0xffffff)).Rect(-60, -56, 60, 56);
    d.Paint(Hex(0xb9bfcc));
    for (int i = 0; i < 15 * 14; i++)
        if ((i % 15 + i / 15) % 2 == 0)
            d.Rect(-60 + i % 15 * 8, -56 + double(i / 15) * 8, -52 + i % 15 * 8,
                   -48 + double(i / 15) * 8);
    std::vector<Stop> rings;
    const U8 places[] = {0, 50, 95, 140, 185, 225, 255},
             alphas[] = {255, 235, 210, 180, 130, 70, 0};
    for (int i = 0; i < 7; i++)
        rings.push_back({places[i], Rainbow(0.82 - i * 0.13, alphas[i])});
    d.Paint(Glow(0, 0, 58, rings)).Rect(-60, -56, 60, 56);
    return d;
}

// Twelve translucent loops of pure curves; where two meet they darken.
Drawing LoopsTile()
{
    Drawing d;
    for (int i = 0; i < 12; i++) {
        double turn = i / 12.0;
        Spot a = Around(66, turn - 0.1), tip = Around(62, turn), b = Around(66, turn + 0.1),
             back = Around(-22, turn);
        d.Paint(Rainbow(turn, 122));
        d.Move(back.x, back.y).Curve(a.x * 0.62, a.y * 0.62, tip.x, tip.y);
        d.Curve(b.x * 0.62, b.y * 0.62, back.x, back.y);
    }
    return d;
}

// A new table of styles for every row, as large drawings have them.
Drawing MosaicTile()
{
    Drawing d;
    for (int row = 0; row < 11; row++) {
        if (row > 0)
            d.Builder().NewStyles();
        for (int column = 0; column < 11; column++) {
            double x = (column - 5) * 11.2, y = (row - 5) * 10.4;
            double far = std::sqrt(x * x + y * y) / 80, hole = 4.6 * far;
            d.Paint(Rainbow(0.62 + 0.42 * far + 0.04 * Turns(column * 0.13 + row * 0.19)));
            d.RoundRect(x - 5, y - 4.7, x + 5, y + 4.7, 2.6);
            d.Move(x, y - hole).Curve(x, y, x + hole, y).Curve(x, y, x, y + hole);
            d.Curve(x, y, x - hole, y).Curve(x, y, x, y - hole);
        }
    }
    return d;
}

// A window in the form of a heart onto a landscape larger than it.
TagWriter MaskTile(TagWriter& movie)
{
    Drawing heart, view, sun;
    heart.Paint(Hex(0xff0000)).Move(0, 52).Curve(-62, 8, -58, -24).Curve(-54, -54, -26, -52);
    heart.Curve(-6, -50, 0, -30).Curve(6, -50, 26, -52).Curve(54, -54, 58, -24).Curve(62, 8, 0, 52);
    movie.DefineShape(kHeart, heart.Shape());
    view.Paint(Down(-60, 40, {{0, Hex(0x3b2a7a)}, {120, Hex(0xe0567a)}, {255, Hex(0xffd27a)}}));
    view.Rect(-80, -70, 80, 70);
    view.Paint(Down(-10, 40, {{0, Hex(0x7a3a78)}, {255, Hex(0xb8607e)}}));
    view.Ridge({{-80, 20}, {-50, -14}, {-20, 22}, {14, -26}, {44, 16}, {62, -4}, {80, 14}}, 70);
    view.Paint(Down(6, 60, {{0, Hex(0x3a2458)}, {255, Hex(0x170d2c)}}));
    view.Ridge({{-80, 22}, {-40, 12}, {0, 34}, {40, 14}, {80, 26}}, 70);
    movie.DefineShape(kView, view.Shape());
    sun.Paint(Glow(0, 0, 26,
                   {{0, Hex(0xffffff)},
                    {110, Hex(0xfff0a8)},
                    {120, Hex(0xffe08a, 120)},
                    {255, Hex(0xffb070, 0)}}));
    movie.DefineShape(kViewSun, sun.Circle(0, 0, 26).Shape());
    TagWriter tile;
    tile.Place2(1, {.character = U16(kHeart), .clipDepth = 3});
    return tile.Place(kView, 2).Place(kViewSun, 3, At(-14, -12)).Show().End();
}

// One flower, six colour transforms.
TagWriter TransformTile(TagWriter& movie)
{
    Drawing petal;
    petal.Paint(Down(-20, 0, {{0, Hex(0xff8fb4)}, {255, Hex(0xc2185b)}}));
    petal.Move(0, -2).Curve(-12, -14, 0, -20).Curve(12, -14, 0, -2);
    movie.DefineShape(kPetal, petal.Shape());
    Drawing heart;
    heart.Paint(Glow(-1, -1, 7, {{0, Hex(0xfff2a0)}, {255, Hex(0xe8a020)}})).Circle(0, 0, 5);
    movie.DefineShape(kRound, heart.Shape());
    TagWriter flower;
    for (U16 i = 0; i < 7; i++)
        flower.Place(kPetal, U16(i + 1), Mat::Rotate(i * 360.0 / 7));
    movie.DefineSprite(kFlower, flower.Place(kRound, 8).Show().End());

    const Cx paints[] = {Cx(),
                         Cx::Multiply(60, 150, 256),
                         Cx::Tint(Hex(0xffe14a), 0.6),
                         Cx::Multiply(256, 256, 256, 96),
                         Cx::Add(-60, 90, -40),
                         Cx{{-256, -256, -256, 256}, {255, 255, 255, 0}}};
    TagWriter tile;
    for (U16 i = 0; i < 6; i++)
        tile.Place2(U16(i + 1), {.character = U16(kFlower),
                                 .matrix = At((i % 3 - 1) * 43.0, i < 3 ? -27 : 28),
                                 .cx = paints[i]});
    return tile.Show().End();
}

// Every level holds a leaf and the level below, smaller and turned: sixteen sprites deep.
TagWriter NestTile(TagWriter& movie)
{
    Drawing leaf;
    leaf.Paint(Across(0, 52, {{0, Hex(0xd9f06a)}, {120, Hex(0x4caf50)}, {255, Hex(0x0f5a4a)}}));
    leaf.Move(6, 0).Curve(28, -24, 58, 2).Curve(26, 16, 6, 0);
    leaf.Paint(Hex(0xffffff, 90)).Move(6, 0).Curve(28, -6, 58, 2).Curve(28, -2, 6, 0);
    movie.DefineShape(kLeaf, leaf.Shape());
    const U16 kLevels = 16;
    for (U16 level = 0; level < kLevels; level++) {
        TagWriter tags;
        tags.Place(kLeaf, 1);
        if (level > 0)
            tags.Place(U16(kSpiral + level - 1), 2, Pose(0, 0, 0.94, 0.94, 47),
                       Cx::Multiply(256, 250, 256));
        movie.DefineSprite(U16(kSpiral + level), tags.Show().End());
    }
    TagWriter tile;
    return tile.Place(kSpiral + kLevels - 1, 1, Pose(-3, 3, 1.04, 1.04, -30)).Show().End();
}

} // namespace

std::vector<U8> MakeShapes()
{
    MovieWriter movie(640 * 20, 480 * 20, Fps(12));
    movie.Background(Hex(0x1b2438));
    DefineCard(movie);
    const Drawing drawings[] = {StarTile(),  StencilTile(),  GlassTile(),
                                DiscsTile(), PinwheelTile(), BallsTile(),
                                FadeTile(),  LoopsTile(),    MosaicTile()};
    U16 id = kDrawings;
    for (const Drawing& drawing : drawings)
        movie.DefineShape(id++, drawing.Shape());
    for (auto* make : {MaskTile, TransformTile, NestTile}) {
        TagWriter tile = make(movie);
        movie.DefineSprite(id++, tile);
    }
    movie.Place(kCard, 1);
    for (U16 i = 0; i < 12; i++) {
        Mat place =
            At(12 + kTileWidth / 2 + i % 4 * kStep, 12 + kTileHeight / 2 + double(i / 4) * kStep);
        movie.Place(kTile, U16(2 + 2 * i), place).Place(U16(kDrawings + i), U16(3 + 2 * i), place);
    }
    movie.Label("card").Show().End();
    return movie.Bytes();
}
