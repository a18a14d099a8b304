#include "samples/orchard.h"

// What frames the picture: the boughs with their leaves, the lantern, fireflies, grass in front.

namespace orchard {

// One leaf from its stem's end, `degrees` clockwise from the right.
static void Leaf(Drawing& d, double x, double y, double length, double degrees)
{
    auto at = [&](double along, double aside) {
        double c = Turns(degrees / 360 + 0.25), s = Turns(degrees / 360);
        return Spot{x + length * (along * c - aside * s), y + length * (along * s + aside * c)};
    };
    Spot left = at(0.42, -0.46), right = at(0.42, 0.46), tip = at(1, 0);
    d.Move(x, y).Curve(left.x, left.y, tip.x, tip.y).Curve(right.x, right.y, x, y);
}

// Leaves on a twig that grows to the right. Each is a colour of its own, for they overlap.
static void DefineSprig(TagWriter& movie)
{
    Drawing d;
    d.Paint(Hex(0x5b4a30)).Move(-4, -1.2).Curve(20, 0, 36, -2).Curve(20, 2.4, -4, 1.2).Close();
    const struct {
        double x, y, length, angle;
        U32 light, dark;
    } leaves[] = {{2, 0, 20, -70, 0x86ab4c, 0x3c6c30},   {6, 0, 21, 62, 0x6f9a44, 0x2f5c2c},
                  {15, 0, 22, -48, 0xa5c25a, 0x4a7c36},  {18, 0, 22, 46, 0x7ea548, 0x356430},
                  {27, -1, 21, -30, 0xb7cc66, 0x568840}, {29, -1, 20, 32, 0x8bb04e, 0x3f7034},
                  {35, -2, 22, 2, 0xc4d672, 0x649246}};
    for (const auto& leaf : leaves) {
        d.Paint(Glow(leaf.x + 12, leaf.y - 6, 24, {{0, Hex(leaf.light)}, {255, Hex(leaf.dark)}}));
        Leaf(d, leaf.x, leaf.y, leaf.length, leaf.angle);
    }
    movie.DefineShape(kSprig, d.Shape());
}

static void DefineBoughs(TagWriter& movie)
{
    Drawing d;
    d.Paint(Across(
        500, 600,
        {{0, Hex(0xa9764c)}, {60, Hex(0x7d5238)}, {170, Hex(0x4a3026)}, {255, Hex(0x2e1e1c)}}));
    d.Move(498, 444).Curve(532, 420, 530, 350).Curve(528, 250, 516, 190).Curve(470, 130, 380, 112);
    d.Curve(280, 92, 150, 104).Curve(120, 100, 90, 80).Curve(200, 86, 300, 70);
    d.Curve(420, 66, 500, 110).Curve(470, 60, 420, 20).Curve(500, 40, 548, 110);
    d.Curve(566, 60, 610, 10).Curve(612, 70, 590, 150).Curve(584, 220, 588, 350);
    d.Curve(592, 420, 636, 446).Curve(600, 438, 578, 448).Curve(566, 440, 546, 450);
    d.Curve(530, 442, 498, 444).Close();
    d.Paint(Hex(0x2a1a18, 120));
    d.Move(552, 420).Curve(546, 320, 540, 220).Curve(552, 320, 552, 420);
    d.Move(570, 410).Curve(572, 320, 564, 200).Curve(577, 320, 570, 410);
    d.Move(538, 300).Curve(531, 270, 534, 240).Curve(537, 270, 538, 300);
    d.Paint(Hex(0xd9a468, 110));
    d.Move(534, 400).Curve(537, 300, 524, 210).Curve(531, 300, 534, 400);
    d.Paint(Hex(0x2a1a1a)).Ellipse(561, 262, 9, 13); // a knothole, and who lives there
    d.Paint(Hex(0xffe08a)).Circle(557.6, 260, 2).Circle(564.4, 260, 2);
    movie.DefineShape(kBoughs, d.Shape());
}

// How far down the leaves reach.
static double Fringe(double x)
{
    return 88 + 16 * Turns(x / 270 + 0.1) + 10 * Turns(x / 96) + 30 * Ease(470, 640, x) +
           18 * Ease(120, 0, x);
}

// Three tiers of sprigs: dark ones behind, bright ones in front, apples between them.
static void DefineCanopy(TagWriter& movie)
{
    TagWriter canopy;
    Dice dice(41);
    U16 depth = 1;
    const Cx tiers[] = {Cx::Multiply(104, 124, 118), Cx::Multiply(176, 186, 160), Cx{}};
    for (int tier = 0; tier < 3; tier++) {
        for (int i = 0; i < 62; i++) {
            double x = -14 + 670 * (i + dice.Between(0, 1)) / 62;
            double low = Fringe(x) - 14 * tier, y = dice.Between(-12, low);
            double size = dice.Between(0.9, 1.35) - 0.1 * tier, angle = dice.Between(15, 165);
            Cx cx = tiers[tier];
            cx.mul[0] += RoundSteadily(dice.Between(-24, 40));
            canopy.Place2(depth++,
                          {.character = kSprig, .matrix = Pose(x, y, size, size, angle), .cx = cx});
            if (i % 7 != 3 || tier == 2)
                continue;
            U16 apple = dice.Between(0, 1) < 0.6 ? kRedApple : kBlushApple;
            Cx dim = tier == 0 ? Cx::Multiply(150, 140, 150) : Cx::Multiply(220, 214, 214);
            canopy.Place2(depth++,
                          {.character = apple, .matrix = Pose(x, low - 8, 0.72, 0.72), .cx = dim});
        }
    }
    movie.DefineSprite(kCanopy, canopy.Show().End());
}

static void DefineLantern(TagWriter& movie)
{
    Drawing d, glow;
    d.Paint(Hex(0x2b2328)).Rect(-0.8, -60, 0.8, -20).RoundRect(-10, -20, 10, -15, 2);
    d.Polygon({{-6, -20}, {0, -28}, {6, -20}}).RoundRect(-11, 15, 11, 20, 2);
    d.Paint(Down(-15, 15, {{0, Hex(0xffe7a8)}, {140, Hex(0xffc65c)}, {255, Hex(0xe28c34)}}));
    d.RoundRect(-9, -15, 9, 15, 3);
    d.Paint(Hex(0x2b2328)).Rect(-4, -15, -3, 15).Rect(3, -15, 4, 15);
    movie.DefineShape(kLantern, d.Shape());
    glow.Paint(Glow(0, 0, 170,
                    {{0, Hex(0xffe2a0, 235)},
                     {28, Hex(0xffcc78, 150)},
                     {110, Hex(0xffb050, 54)},
                     {255, Hex(0xff9a40, 0)}}));
    movie.DefineShape(kLanternGlow, glow.Circle(0, 0, 170).Shape());
}

// Each wanders round its own loop and goes dark now and then.
static void DefineFireflies(TagWriter& movie)
{
    Drawing fly;
    fly.Paint(
        Glow(0, 0, 11, {{0, Hex(0xfbffc0)}, {40, Hex(0xd8f070, 190)}, {255, Hex(0xa8e050, 0)}}));
    movie.DefineShape(kFirefly, fly.Circle(0, 0, 11).Shape());
    TagWriter flies;
    Stage stage(flies);
    for (int frame = 0; frame < 144; frame++) {
        if (frame % 2 == 0)
            for (U16 i = 0; i < 9; i++) {
                double t = frame / 144.0 + i * 0.137, home = 40 + i * 68;
                stage.Put(U16(1 + i), kFirefly,
                          At(home + 34 * Turns(t), 380 - 13 * (i % 4) + 18 * Turns(2 * t + 0.2)),
                          Cx::Alpha(0.2 + 0.8 * Bump(0.5, 0.5, 3 * t - int(3 * t))));
            }
        stage.Next();
    }
    movie.DefineSprite(kFireflies, flies.End());
}

static void DefineGrass(TagWriter& movie)
{
    Drawing d;
    Dice dice(77);
    d.Paint(Down(-34, 4, {{0, Hex(0xb3c653)}, {120, Hex(0x5f9038)}, {255, Hex(0x28542a)}}));
    for (int i = 0; i < 13; i++) {
        double x = -26 + i * 4.3, tip = x + dice.Between(-12, 12), top = -dice.Between(14, 32);
        d.Paint(Down(top, 4, {{0, Hex(i % 3 ? 0xa9c04e : 0xcdd26c)}, {255, Hex(0x28542a)}}));
        d.Move(x - 2, 4).Curve(x - 1, top * 0.5, tip, top).Curve(x + 2, top * 0.4, x + 2.4, 4);
        d.Close();
    }
    movie.DefineShape(kTuft, d.Shape());
    TagWriter tufts;
    for (U16 i = 0; i < 27; i++) {
        double x = -6 + i * 25.5 + dice.Between(-9, 9), size = dice.Between(0.7, 1.15);
        double flip = dice.Between(0, 1) < 0.5 ? -size : size;
        tufts.Place2(U16(1 + i), {.character = kTuft,
                                  .matrix = Pose(x, 482, flip, size),
                                  .cx = Cx::Multiply(200, 220, 200)});
    }
    movie.DefineSprite(kTufts, tufts.Show().End());
}

void DefineTree(TagWriter& movie)
{
    DefineSprig(movie);
    DefineBoughs(movie);
    DefineCanopy(movie);
    DefineLantern(movie);
    DefineFireflies(movie);
    DefineGrass(movie);
}

} // namespace orchard
