#include "samples/viaduct.h"

// Peaks, hills and village, the lake, the bridge and the near bank.

namespace viaduct {

static void DefinePeaks(TagWriter& movie)
{
    Drawing d;
    d.Paint(Down(150, 310, {{0, Hex(0x7f93c4)}, {140, Hex(0xa9bfe0)}, {255, Hex(0xdfeaf2)}}));
    d.Polygon({{-10, 316},
               {-10, 246},
               {38, 214},
               {74, 232},
               {132, 172},
               {170, 204},
               {196, 190},
               {262, 250},
               {316, 208},
               {352, 228},
               {420, 158},
               {470, 206},
               {498, 186},
               {560, 240},
               {604, 214},
               {650, 244},
               {650, 316}});
    d.Paint(Hex(0xffffff, 215));
    d.Move(132, 172).Line(160, 196).Curve(152, 194, 148, 204).Curve(142, 190, 134, 206);
    d.Curve(126, 188, 112, 192).Close();
    d.Move(420, 158).Line(452, 189).Curve(442, 186, 438, 200).Curve(428, 180, 418, 202);
    d.Curve(408, 180, 394, 184).Close();
    d.Move(498, 186).Line(516, 201).Curve(506, 198, 500, 208).Curve(492, 196, 484, 197).Close();
    d.Paint(Down(160, 300, {{0, Hex(0x5a6ca6, 110)}, {255, Hex(0x8ca4cc, 0)}})); // shaded flanks
    d.Polygon({{132, 172}, {170, 204}, {196, 190}, {262, 250}, {300, 300}, {180, 300}, {150, 240}});
    d.Polygon({{420, 158}, {470, 206}, {498, 186}, {560, 240}, {590, 300}, {470, 300}, {436, 230}});
    movie.DefineShape(kPeaks, d.Shape());
}

static void Fir(Drawing& d, double x, double y, double size)
{
    d.Move(x, y - 30 * size).Curve(x + 3 * size, y - 20 * size, x + 7 * size, y - 16 * size);
    d.Line(x + 3 * size, y - 16 * size)
        .Curve(x + 6 * size, y - 8 * size, x + 10 * size, y - 4 * size);
    d.Line(x + 1.5 * size, y - 4 * size).Line(x + 1.5 * size, y + 1).Line(x - 1.5 * size, y + 1);
    d.Line(x - 1.5 * size, y - 4 * size).Line(x - 10 * size, y - 4 * size);
    d.Curve(x - 6 * size, y - 8 * size, x - 3 * size, y - 16 * size)
        .Line(x - 7 * size, y - 16 * size);
    d.Curve(x - 3 * size, y - 20 * size, x, y - 30 * size);
}

static void DrawVillage(Drawing& d)
{
    const Spot houses[] = {{388, 306}, {408, 303}, {430, 307}, {468, 306}, {488, 304}};
    for (Spot h : houses) {
        d.Paint(Hex(0xf4e6cf)).Rect(h.x, h.y - 10, h.x + 15, h.y + 6);
        d.Paint(Hex(0xc2563f))
            .Polygon({{h.x - 2, h.y - 9},
                      {h.x + 4, h.y - 17},
                      {h.x + 11, h.y - 17},
                      {h.x + 17, h.y - 9}});
        d.Paint(Hex(0x6b5a58)).Rect(h.x + 3, h.y - 5, h.x + 6, h.y - 1);
        d.Paint(Hex(0x6b5a58)).Rect(h.x + 9, h.y - 5, h.x + 12, h.y - 1);
    }
    d.Paint(Hex(0xfaf1e0)).Rect(449, 280, 461, 312);
    d.Paint(Hex(0x51658c)).Polygon({{447, 281}, {455, 256}, {463, 281}});
    d.Paint(Hex(0xd9b04a)).Circle(455, 255, 1.6);
    d.Paint(Hex(0x6b5a58)).Circle(455, 288, 2.6);
}

static void DefineHills(TagWriter& movie)
{
    Drawing d;
    d.Paint(Down(236, 316, {{0, Hex(0x7fb08a)}, {255, Hex(0xa8cf9a)}}));
    d.Ridge({{-10, 262},
             {60, 240},
             {150, 282},
             {260, 246},
             {360, 290},
             {470, 262},
             {560, 244},
             {650, 272}},
            318);
    d.Paint(Down(258, 318, {{0, Hex(0x4f9460)}, {255, Hex(0x86bd6a)}}));
    d.Ridge({{-10, 284},
             {70, 264},
             {170, 302},
             {280, 272},
             {350, 306},
             {430, 300},
             {520, 300},
             {600, 262},
             {650, 276}},
            318);
    d.Paint(Down(250, 312, {{0, Hex(0x2f6d50)}, {255, Hex(0x1f5240)}}));
    Dice dice(21);
    for (int i = 0; i < 26; i++) {
        double x = i < 15 ? 8 + i * 19 + dice.Between(-4, 4) : 518 + (i - 15) * 12;
        double y = dice.Between(302, 310), size = dice.Between(0.6, 1.05);
        Fir(d, x, y, size);
    }
    DrawVillage(d);
    d.Paint(Down(304, 318, {{0, Hex(0x78ad58)}, {255, Hex(0x557f45)}}));
    d.Ridge({{-10, 311}, {120, 306}, {300, 313}, {420, 308}, {560, 313}, {650, 308}}, 318);
    movie.DefineShape(kHills, d.Shape());

    Drawing lights;
    lights.Paint(Hex(0xffd27a));
    for (double x : {391.0, 397.0, 411.0, 433.0, 439.0, 477.0, 491.0, 497.0})
        lights.Rect(x, 299, x + 3, 303);
    lights.Circle(455, 288, 2.2);
    lights.Paint(OvalGlow(440, 302, 78, 26, {{0, Hex(0xffc060, 100)}, {255, Hex(0xffb050, 0)}}));
    lights.Ellipse(440, 302, 78, 26);
    movie.DefineShape(kShoreLights, lights.Shape());
}

static void DefineWater(TagWriter& movie)
{
    Drawing mask, day, dusk, night;
    mask.Paint(Hex(0xffffff)).Rect(-10, kShore, 650, 490);
    movie.DefineShape(kWaterMask, mask.Shape());
    day.Paint(Down(kShore, 480,
                   {{0, Hex(0xbfe3ee, 70)}, {90, Hex(0x5aa9d0, 110)}, {255, Hex(0x1b5f9e, 215)}}));
    dusk.Paint(Down(kShore, 480,
                    {{0, Hex(0xffc98a, 60)}, {100, Hex(0xd0687e, 80)}, {255, Hex(0x3b2a66, 205)}}));
    night.Paint(
        Down(kShore, 480,
             {{0, Hex(0x4a6f9c, 60)}, {100, Hex(0x16305e, 110)}, {255, Hex(0x060e2a, 205)}}));
    U16 id = kWaterDay;
    for (Drawing* sheet : {&day, &dusk, &night})
        movie.DefineShape(id++, sheet->Rect(kLeft, kShore, kRight, kBottom).Shape());

    Drawing streak; // the light of sun or moon on the water, white so that it can be tinted
    streak.Paint(OvalGlow(0, -20, 60, 92, {{0, Hex(0xffffff, 130)}, {255, Hex(0xffffff, 0)}}));
    streak.Ellipse(0, -20, 60, 92);
    streak.Paint(
        OvalGlow(0, -30, 70, 110,
                 {{0, Hex(0xffffff, 255)}, {140, Hex(0xffffff, 170)}, {255, Hex(0xffffff, 0)}}));
    for (int i = 0; i < 17; i++) {
        double y = -78 + i * 8.4, half = 15 + 8 * Turns(i * 0.37) + i * 1.5;
        streak.Move(-half, y).Curve(0, y - 5, half, y).Curve(0, y + 5, -half, y);
    }
    movie.DefineShape(kStreak, streak.Shape());
}

static void DefineRipples(TagWriter& movie)
{
    Drawing ripple;
    ripple.Paint(Across(
        -40, 40, {{0, Hex(0xffffff, 0)}, {128, Hex(0xffffff, 130)}, {255, Hex(0xffffff, 0)}}));
    ripple.Move(-40, 0).Curve(0, -2.4, 40, 0).Curve(0, 1.2, -40, 0);
    movie.DefineShape(kRipple, ripple.Shape());

    const int kCycle = 60;
    TagWriter ripples;
    Stage stage(ripples);
    for (int frame = 0; frame < kCycle; frame += 3) {
        Dice dice(5);
        for (U16 i = 1; i <= 12; i++) {
            double near = dice.Between(0, 1), x = dice.Between(0, 640), phase = dice.Between(0, 1);
            double age = frame / double(kCycle) + phase, swell = 0.5 - 0.5 * Turns(age + 0.25);
            stage.Put(i, kRipple,
                      Pose(x + 10 * Turns(age), 326 + near * 140, 0.3 + near, 0.6 + near),
                      Cx::Alpha(swell * 0.8));
        }
        stage.Next(), stage.Next(), stage.Next();
    }
    movie.DefineSprite(kRipples, ripples.End());
}

static void DefineBridge(TagWriter& movie)
{
    Drawing d;
    d.Paint(Down(252, 356, {{0, Hex(0xe2cdae)}, {110, Hex(0xc4a684)}, {255, Hex(0x8c7360)}}));
    d.Move(-20, kRail).Line(660, kRail).Line(660, kFoot);
    for (int bay = 8; bay >= 0; bay--) {
        double x = bay * 80 - 20; // the arch's middle
        d.Line(x + 32, kFoot).Arc(x, 298, 32, 0, -180).Line(x - 32, kFoot);
    }
    d.Close();
    for (int bay = 0; bay <= 8; bay++) { // the ring of cut stones and the shade beneath it
        double x = bay * 80 - 20;
        d.Paint(Down(262, 300, {{0, Hex(0xf2e2c6)}, {255, Hex(0xb09476)}}));
        d.Move(x + 32, 300).Arc(x, 298, 32, 0, -180).Line(x - 37, 300).Arc(x, 298, 37, -180, 0);
        d.Close();
        d.Paint(
            Across(x - 48, x - 32,
                   {{0, Hex(0xfff2da, 60)}, {110, Hex(0x4a3a3a, 20)}, {255, Hex(0x33262c, 150)}}));
        d.Rect(x - 48, 298, x - 32, kFoot);
    }
    d.Paint(Hex(0x5d4a44, 60));
    Dice dice(3);
    for (int i = 0; i < 54; i++) { // single stones
        double x = -20 + 80 * double(i / 6) + 33 + dice.Between(0, 9), y = 300 + (i % 6) * 8.4;
        d.Rect(x, y, x + 6, y + 4);
    }
    d.Paint(Down(
        248, 262,
        {{0, Hex(0x6d6660)}, {40, Hex(0xf0dfc2)}, {160, Hex(0xcbb08e)}, {255, Hex(0x927a64)}}));
    d.Rect(-20, kRail - 1, 660, kRail + 8);
    d.Paint(Hex(0x3a2c2c, 90)).Rect(-20, kRail + 8, 660, kRail + 10.5);
    movie.DefineShape(kBridge, d.Shape());
}

static void DefineBank(TagWriter& movie)
{
    Drawing d;
    d.Paint(Down(408, 480, {{0, Hex(0x4d7d3a)}, {255, Hex(0x1c3a22)}}));
    d.Ridge({{-10, 412},
             {50, 410},
             {120, 452},
             {210, 470},
             {300, 482},
             {380, 480},
             {470, 474},
             {560, 444},
             {610, 424},
             {650, 420}},
            490);
    const U32 colors[] = {0xf5d547, 0xe86a92, 0xfdf6ff};
    Dice dice(11);
    for (int i = 0; i < 36; i++) {
        bool left = i % 2 == 0;
        double x = left ? dice.Between(0, 130) : dice.Between(540, 640);
        double y = left ? 432 + x * 0.26 + dice.Between(0, 30)
                        : 452 - (x - 540) * 0.18 + dice.Between(2, 30);
        d.Paint(Hex(colors[i % 3], 235)).Circle(x, y, 1.8);
    }
    movie.DefineShape(kBank, d.Shape());
}

static void DefineReeds(TagWriter& movie)
{
    Drawing reed; // stands at the origin and bends as a sprite
    reed.Paint(Hex(0x2f5a30));
    reed.Move(-1.4, 0).Curve(-2, -40, 4, -78).Curve(1.6, -40, 1.4, 0).Close();
    reed.Move(0, 0).Curve(6, -28, 22, -48).Curve(10, -24, 3, 0).Close();
    reed.Move(0, 0).Curve(-6, -30, -18, -56).Curve(-3, -30, 1, 0).Close();
    reed.Paint(Across(0, 7, {{0, Hex(0x8a5a34)}, {255, Hex(0x4a2c18)}}));
    reed.RoundRect(1.2, -82, 6.4, -60, 2.4);
    movie.DefineShape(kReed, reed.Shape());

    TagWriter reeds;
    Stage stage(reeds);
    const double stands[] = {8, 26, 40, 58, 78, 96, 574, 592, 606, 622, 636};
    for (int frame = 0; frame < 60; frame += 3) {
        for (U16 i = 0; i < 11; i++) {
            double x = stands[i], size = 0.8 + 0.35 * Turns(i * 0.31);
            double sway = 5 * Turns(frame / 60.0 + x / 300);
            stage.Put(U16(i + 1), kReed, Pose(x, 478 - (x < 320 ? x * 0.05 : 0), size, size, sway));
        }
        stage.Next(), stage.Next(), stage.Next();
    }
    movie.DefineSprite(kReeds, reeds.End());
}

static void DefineFireflies(TagWriter& movie)
{
    Drawing fly;
    fly.Paint(
        Glow(0, 0, 9, {{0, Hex(0xf6ffb0)}, {50, Hex(0xd8ff70, 190)}, {255, Hex(0x9cff40, 0)}}));
    movie.DefineShape(kFirefly, fly.Circle(0, 0, 9).Shape());
    TagWriter flies;
    Stage air(flies);
    for (int frame = 0; frame < 96; frame += 3) {
        for (U16 i = 0; i < 7; i++) {
            double t = frame / 96.0 + i * 0.29, x = i < 4 ? 30 + i * 34 : 500 + (i - 4) * 46;
            double glow = 0.5 + 0.5 * Turns(2 * t + i * 0.13);
            air.Put(U16(i + 1), kFirefly, At(x + 22 * Turns(t), 416 + 16 * Turns(2 * t + 0.2)),
                    Cx::Alpha(glow));
        }
        air.Next(), air.Next(), air.Next();
    }
    movie.DefineSprite(kFireflies, flies.End());
}

void DefineLand(TagWriter& movie)
{
    DefinePeaks(movie);
    DefineHills(movie);
    DefineWater(movie);
    DefineRipples(movie);
    DefineBridge(movie);
    DefineBank(movie);
    DefineReeds(movie);
    DefineFireflies(movie);
}

} // namespace viaduct
