#include "samples/scene.h"
#include "tests/support/glyph_writer.h"

#include <algorithm>
#include <cmath>
#include <utility>

// A flower becomes a bird, the bird a fish, the fish a flower. All three are made of the same
// number of leaves: petals, feathers and fins, with fills, gradients, outlines and ribs that all
// turn into those of the next.

namespace {

constexpr int kRest = 8, kChange = 24; // frames

enum Id : U16 { kMorph = 1 };

// Two ends, a belly to either side, an outline and a rib along the middle.
struct Leaf {
    Spot base, tip;
    double width;
    U32 dark, light;                    // at the base, at the tip
    double belly = 0.5;                 // where the widest place is, 0 at the base to 1
    double bend = 0;                    // of the middle line, to the left when positive
    double roundBase = 0, roundTip = 0; // 0 pointed, 1 round
    int alpha = 255;
    double outline = 1.6, rib = 0; // thickness in pixels

    Leaf(Spot from, Spot to, double wide, U32 darkColor, U32 lightColor)
        : base(from), tip(to), width(wide), dark(darkColor), light(lightColor)
    {
    }
    Leaf& Form(double widest, double bent) { return belly = widest, bend = bent, *this; }
    Leaf& Round(double first, double last) { return roundBase = first, roundTip = last, *this; }
    Leaf& Lines(double round, double along) { return outline = round, rib = along, *this; }
    Leaf& Opacity(int value) { return alpha = value, *this; }
};

struct Scene {
    U32 top, middle, bottom; // the ground's colours
    U32 ink;
    std::vector<Leaf> leaves;
};

class LeafShape {
public:
    explicit LeafShape(const Leaf& l) : leaf(l), way{l.tip.x - l.base.x, l.tip.y - l.base.y}
    {
        length = std::sqrt(way.x * way.x + way.y * way.y);
    }

    // A place `along` the leaf, 0..1, and so many pixels aside. The bend is that of the place
    // `from`, gone on straight: places that curves are drawn towards lie on tangents.
    Spot At(double along, double aside, double from) const
    {
        double bend = 4 * from * (1 - from) + (4 - 8 * from) * (along - from);
        double off = (aside + leaf.bend * bend) / length;
        return {leaf.base.x + way.x * along + way.y * off,
                leaf.base.y + way.y * along - way.x * off};
    }
    Spot At(double along, double aside) const { return At(along, aside, along); }
    Fill Paint(bool round) const;
    void Draw(Drawing& d, int line, int ribLine) const;

private:
    void Quarter(Drawing& d, double end, double roundness, double aside, bool back) const;

    const Leaf& leaf;
    Spot way;
    double length;
};

Fill LeafShape::Paint(bool round) const
{
    Rgba dark = Hex(leaf.dark, leaf.alpha), light = Hex(leaf.light, leaf.alpha);
    if (round) {
        Spot lit = At(0.6, leaf.width * 0.16);
        return Glow(lit.x, lit.y, std::max(length, leaf.width) * 0.6, {{0, light}, {255, dark}});
    }
    Spot middle = At(0.5, 0);
    double degrees = std::atan2(way.y, way.x) * 180 / 3.14159265358979323846;
    return Fill::Linear(
        Mat::Gradient(Twips(middle.x), Twips(middle.y), Twips(length), 640 * 20, degrees),
        {{0, dark}, {255, light}});
}

// From the widest place on one side to an end, or back: two curves that meet between.
void LeafShape::Quarter(Drawing& d, double end, double roundness, double aside, bool back) const
{
    double reach = leaf.belly - end;
    Spot tip = At(end, 0), belly = At(leaf.belly, aside);
    Spot nearTip = At(end + reach * 0.2 * (1 - roundness), aside * 0.42, end);
    Spot nearBelly = At(end + reach * 0.57, aside, leaf.belly);
    Spot between = {(nearTip.x + nearBelly.x) / 2, (nearTip.y + nearBelly.y) / 2};
    if (back)
        std::swap(nearTip, nearBelly), std::swap(tip, belly);
    d.Curve(nearBelly.x, nearBelly.y, between.x, between.y)
        .Curve(nearTip.x, nearTip.y, tip.x, tip.y);
}

void LeafShape::Draw(Drawing& d, int line, int ribLine) const
{
    double half = leaf.width / 2;
    Spot base = At(0, 0), end = At(0.82, 0), bend = At(0.41, 0, 0);
    d.Builder().Stroke(line);
    d.Move(base.x, base.y);
    Quarter(d, 0, leaf.roundBase, half, true);
    Quarter(d, 1, leaf.roundTip, half, false);
    Quarter(d, 1, leaf.roundTip, -half, true);
    Quarter(d, 0, leaf.roundBase, -half, false);
    d.Builder().Styles(0, 0, ribLine);
    d.Move(base.x, base.y).Curve(bend.x, bend.y, end.x, end.y);
    d.Builder().Stroke(0);
}

// Leaves painted as balls, in all three scenes. Before the creatures there are twelve others.
constexpr size_t kBody = 12 + 7, kEye = 12 + 15;

// The two scenes of a morph are drawn alike, edge for edge.
ShapeBuilder Draw(const Scene& scene)
{
    Drawing d;
    d.Paint(
        Down(0, 480, {{0, Hex(scene.top)}, {150, Hex(scene.middle)}, {255, Hex(scene.bottom)}}));
    d.Rect(kLeft, kTop, kRight, kBottom);
    for (size_t i = 0; i < scene.leaves.size(); i++) {
        const Leaf& leaf = scene.leaves[i];
        LeafShape shape(leaf);
        d.Builder().NewStyles(); // what lies higher covers the lines below it
        auto pen = [&](double thick, int alpha) {
            return d.Builder().AddLine({U16(Twips(thick)), Hex(scene.ink, thick > 0 ? alpha : 0)});
        };
        int line = pen(leaf.outline, 255), rib = pen(leaf.rib, 130);
        d.Paint(shape.Paint(i == kBody || i == kEye));
        shape.Draw(d, line, rib);
    }
    return d.Shape();
}

Leaf Ball(double x, double y, double radius, U32 dark, U32 light)
{
    return Leaf({x - radius, y}, {x + radius, y}, 2 * radius, dark, light).Round(1, 1);
}

Leaf Petal(double x, double y, double turn, double from, double to, double width, U32 dark,
           U32 light)
{
    auto place = [&](double r) { return Spot{x + r * Turns(turn + 0.25), y + r * Turns(turn)}; };
    Leaf petal(place(from), place(to), width, dark, light);
    return petal.Form(0.66, 0).Round(0, 1).Lines(1.6, 1.1);
}

// Behind everything: six large things and six small ones.
void AddGrass(std::vector<Leaf>* out)
{
    const double x[] = {60, 104, 178, 470, 540, 590}, lean[] = {-26, 22, -14, 18, -24, 20};
    const double top[] = {352, 396, 420, 414, 372, 404};
    for (int i = 0; i < 6; i++) {
        Leaf blade({x[i], 486}, {x[i] + lean[i], top[i]}, 22, 0x3d7a45, 0x9cc95e);
        out->push_back(blade.Form(0.4, lean[i] * 0.4).Round(0.3, 0).Lines(1.4, 1));
    }
    Dice dice(5);
    for (int i = 0; i < 6; i++) {
        double y = dice.Between(60, 350), radius = dice.Between(3, 5);
        out->push_back(Ball(70 + i * 100, y, radius, 0xe8a020, 0xfff2a0));
    }
}

void AddClouds(std::vector<Leaf>* out)
{
    const double x[] = {90, 190, 40, 560, 610, 500}, y[] = {120, 96, 400, 330, 300, 420};
    const double half[] = {85, 65, 95, 85, 65, 105};
    for (int i = 0; i < 6; i++) {
        Spot left = {x[i] - half[i], y[i]}, right = {x[i] + half[i], y[i]};
        Leaf cloud(left, right, half[i] * 0.6, 0xffffff, 0xe6f2fb);
        out->push_back(cloud.Form(0.5, 6).Round(0.8, 0.8).Opacity(235).Lines(0, 0));
    }
    for (int i = 0; i < 6; i++) { // birds far away
        double left = 500 + i * 16, top = 96 + i * 9;
        Leaf bird({left, top}, {left + 12, top - 4}, 3, 0x2c4a78, 0x2c4a78);
        out->push_back(bird.Form(0.5, 2).Lines(0, 0));
    }
}

void AddWeeds(std::vector<Leaf>* out)
{
    const double x[] = {40, 96, 150, 500, 560, 606}, height[] = {230, 150, 90, 110, 210, 150};
    for (int i = 0; i < 6; i++) {
        Leaf weed({x[i], 490}, {x[i] + (i % 2 ? 14 : -10), 490 - height[i]}, 30, 0x0d4a54,
                  0x3fae86);
        out->push_back(weed.Form(0.45, i % 2 ? 22 : -22).Round(0.2, 0.1).Lines(1.4, 1));
    }
    for (int i = 0; i < 6; i++) {
        double x0 = 520 + i % 3 * 26 - i * 4, radius = 5 + i * 5 % 9;
        out->push_back(Ball(x0, 190 - i * 30, radius, 0x7fd4e6, 0xf2feff).Opacity(150));
    }
}

Scene Flower()
{
    Scene scene = {0xfff6e0, 0xfde6c4, 0xcfe3a4, 0x4a2a3a, {}};
    std::vector<Leaf>& all = scene.leaves;
    AddGrass(&all);
    const double x = 320, y = 186;
    Leaf stem({330, 486}, {320, 210}, 17, 0x2f6a3a, 0x6fae4a);
    Leaf left({322, 400}, {196, 318}, 62, 0x2f7a44, 0xa8d468);
    Leaf right({328, 430}, {452, 352}, 58, 0x2f7a44, 0xa8d468);
    all.push_back(stem.Form(0.5, -18).Round(0.8, 0.8));
    all.push_back(left.Form(0.5, 16).Lines(1.6, 1.4));
    all.push_back(right.Form(0.5, -16).Lines(1.6, 1.4));
    for (int i = 0; i < 8; i++) // opposite petals lie above each other
        all.push_back(Petal(x, y, i * 3 / 8.0 + 0.06, 16, i % 2 ? 142 : 130, 84,
                            i % 2 ? 0xb81e5c : 0xd0306a, i % 2 ? 0xff8fa8 : 0xffb4ae));
    for (int i = 0; i < 4; i++)
        all.push_back(Petal(x, y, i / 4.0 + 0.19, 8, 70, 56, 0xe8641e, 0xffd65a));
    all.push_back(Ball(x, y, 27, 0x8a4a12, 0xffdf6a));
    all.push_back(Ball(x, y, 9, 0x6a2f0a, 0xc8801e));
    // The petal that becomes a body is painted round: dark and light change places.
    all[kBody].dark = 0xffa8b0, all[kBody].light = 0xe24a7c;
    return scene;
}

Scene Bird()
{
    Scene scene = {0x8fc9f2, 0xd4ecfb, 0xfdf3dc, 0x14284a, {}};
    std::vector<Leaf>& all = scene.leaves;
    AddClouds(&all);
    auto feather = [&](Spot base, Spot tip, double width, U32 dark, U32 light) {
        Leaf leaf(base, tip, width, dark, light);
        all.push_back(leaf.Form(0.62, 8).Round(0, 0.45).Lines(1.4, 1.2));
    };
    feather({240, 292}, {92, 346}, 34, 0x1d4f9a, 0x7fc4f0);
    feather({244, 298}, {118, 388}, 32, 0x1d4f9a, 0x5aa6e6);
    feather({240, 286}, {84, 304}, 32, 0x1d4f9a, 0x9ad6f6);
    feather({338, 236}, {470, 96}, 42, 0x16407e, 0x4f8fd0);
    feather({334, 234}, {438, 66}, 44, 0x16407e, 0x5a9ad8);
    feather({328, 234}, {398, 48}, 44, 0x16407e, 0x6aa8e0);
    Leaf beak({428, 186}, {482, 192}, 22, 0xe8801e, 0xffc84a);
    Leaf body({206, 308}, {412, 206}, 104, 0x1f6ac0, 0xbfe6ff);
    Leaf head({366, 226}, {446, 172}, 72, 0x2f7ad0, 0xd8f2ff);
    all.push_back(beak.Form(0.2, 4).Round(0.3, 0));
    all.push_back(body.Form(0.6, -14).Round(0, 1));
    all.push_back(head.Form(0.55, 0).Round(0.8, 1).Lines(1.4, 0));
    const Spot tips[] = {{118, 176}, {112, 128}, {128, 84}, {164, 50}, {210, 30}, {258, 34}};
    const U32 lights[] = {0x8fd0f4, 0xa4daf6, 0xb8e4f8, 0xcaecfa, 0xdaf3fc, 0xe8f8ff};
    for (int i = 0; i < 6; i++)
        feather({318.0 - i * 3, 250.0 - i * 4}, tips[i], 50, 0x1f66bc, lights[i]);
    all.push_back(Ball(416, 192, 10, 0xe6f0f4, 0xffffff));
    all.push_back(Ball(418, 192, 5, 0x0a1020, 0x24365a));
    return scene;
}

Scene Fish()
{
    Scene scene = {0x7fe0dc, 0x1f8fb0, 0x0a3a66, 0x3a1414, {}};
    std::vector<Leaf>& all = scene.leaves;
    AddWeeds(&all);
    auto fin = [&](Spot base, Spot tip, double width, double bend) {
        Leaf leaf(base, tip, width, 0xd8401e, 0xffd24a);
        all.push_back(leaf.Form(0.6, bend).Round(0, 0.3).Lines(1.8, 1.4));
    };
    fin({176, 252}, {58, 146}, 78, 14);
    fin({176, 256}, {58, 364}, 78, -14);
    fin({186, 254}, {84, 256}, 56, 0);
    fin({290, 196}, {196, 116}, 62, -10);
    fin({336, 182}, {254, 92}, 66, -10);
    fin({382, 180}, {322, 96}, 62, -10);
    Leaf mouth({462, 262}, {496, 262}, 30, 0xb8301a, 0xff9a5a);
    Leaf body({148, 254}, {486, 252}, 186, 0xd8401e, 0xffc456);
    Leaf head({352, 254}, {488, 253}, 158, 0xff8a3a, 0xffd88a);
    all.push_back(mouth.Round(0.8, 1));
    all.push_back(body.Form(0.58, 6).Round(0, 0.72));
    all.push_back(head.Form(0.42, 4).Round(0.7, 0.72));
    const Spot scales[] = {{250, 254}, {296, 218}, {296, 290}, {342, 190}, {346, 254}};
    for (Spot s : scales) {
        Leaf scale({s.x + 26, s.y}, {s.x - 34, s.y}, 58, 0xf0602a, 0xffe08a);
        all.push_back(scale.Form(0.55, 0).Round(0.6, 1).Lines(1.5, 0));
    }
    fin({366, 292}, {276, 372}, 62, 12);
    all.push_back(Ball(436, 226, 19, 0xe8e0c8, 0xffffff));
    all.push_back(Ball(440, 227, 10, 0x0a0a14, 0x3a3a5a));
    return scene;
}

} // namespace

std::vector<U8> MakeMetamorphosis()
{
    MovieWriter movie(640 * 20, 480 * 20, Fps(24));
    movie.Background(Hex(0xfff6e0));
    const ShapeBuilder scenes[] = {Draw(Flower()), Draw(Bird()), Draw(Fish())};
    for (U16 i = 0; i < 3; i++)
        movie.Raw(kTagDefineMorphShape, MorphBody(U16(kMorph + i), scenes[i], scenes[(i + 1) % 3]));
    for (U16 i = 0; i < 3; i++)
        for (int frame = 0; frame < kRest + kChange; frame++) {
            double t = Ease(kRest, kRest + kChange, frame);
            PlaceOptions tag{.move = i + frame > 0, .ratio = U16(RoundSteadily(t * 65535))};
            if (frame == 0)
                tag.character = U16(kMorph + i);
            movie.Place2(1, tag);
            movie.Show();
        }
    movie.End();
    return movie.Bytes();
}
