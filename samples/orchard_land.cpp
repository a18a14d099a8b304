#include "samples/orchard.h"

// The evening: three skies over one another, sun and moon, hills with a village, the meadow.

namespace orchard {

static void DefineSkies(TagWriter& movie)
{
    Drawing day, dusk, night;
    day.Paint(Down(
        0, 330,
        {{0, Hex(0x5f93d0)}, {110, Hex(0xa9c4dc)}, {190, Hex(0xf6dcae)}, {255, Hex(0xffe9b8)}}));
    dusk.Paint(Down(0, 330,
                    {{0, Hex(0x2f2f68)},
                     {80, Hex(0x7d4a86)},
                     {140, Hex(0xd8657a)},
                     {185, Hex(0xff9a5c)},
                     {255, Hex(0xffd884)}}));
    night.Paint(Down(
        0, 330,
        {{0, Hex(0x050a22)}, {120, Hex(0x111f4e)}, {215, Hex(0x2b3c78)}, {255, Hex(0x4c5690)}}));
    movie.DefineShape(kSky, day.Rect(kLeft, kTop, kRight, 340).Shape());
    movie.DefineShape(kDuskSky, dusk.Rect(kLeft, kTop, kRight, 340).Shape());

    Drawing star;
    star.Paint(Glow(0, 0, 5, {{0, Hex(0xdfe8ff, 150)}, {255, Hex(0xdfe8ff, 0)}})).Circle(0, 0, 5);
    star.Paint(Hex(0xffffff)).Circle(0, 0, 1.1);
    movie.DefineShape(kStar, star.Shape());
    TagWriter twinkle;
    Stage stage(twinkle);
    for (int i = 0; i < 48; i++) {
        stage.Put(1, kStar, Mat(), Cx::Alpha(0.62 + 0.38 * Turns((i & ~3) / 48.0)));
        stage.Next();
    }
    movie.DefineSprite(kTwinkle, twinkle.End());
    movie.DefineShape(kNightSky, night.Rect(kLeft, kTop, kRight, 340).Shape());

    TagWriter stars;
    stars.Place(kNightSky, 1);
    Dice dice(5);
    for (U16 i = 0; i < 44; i++) {
        double x = dice.Between(4, 636), y = dice.Between(110, 285), size = dice.Between(0.3, 1);
        stars.Place(kTwinkle, U16(2 + i), Pose(x, y, size, size));
        if (i % 11 == 0)
            stars.Show(9);
    }
    movie.DefineSprite(kStarlight, stars.Show(600).End());
}

static void DefineSunMoonAndCloud(TagWriter& movie)
{
    Drawing sun, moon, cloud;
    sun.Paint(Glow(0, 0, 150,
                   {{0, Hex(0xfff0b8, 200)},
                    {70, Hex(0xffd890, 100)},
                    {150, Hex(0xffb070, 34)},
                    {255, Hex(0xff9a60, 0)}}));
    sun.Circle(0, 0, 150);
    sun.Paint(Glow(0, 0, 30, {{0, Hex(0xfffdf0)}, {180, Hex(0xfff0b0)}, {255, Hex(0xffcf6a)}}));
    movie.DefineShape(kSun, sun.Circle(0, 0, 29).Shape());

    moon.Paint(Glow(0, 0, 90,
                    {{0, Hex(0xdfe6ff, 120)}, {80, Hex(0xaabcf0, 44)}, {255, Hex(0x90a8e0, 0)}}));
    moon.Circle(0, 0, 90);
    moon.Paint(Glow(-6, -7, 32, {{0, Hex(0xffffff)}, {170, Hex(0xf2efe0)}, {255, Hex(0xc4c2c8)}}));
    moon.Circle(0, 0, 19);
    moon.Paint(Hex(0xa9a8b4, 90)).Circle(-6, -4, 4.4).Circle(5, 3, 5.6).Circle(-4, 9, 3);
    movie.DefineShape(kMoon, moon.Shape());

    cloud.Paint(Down(
        -16, 14, {{0, Hex(0xfff6e6, 230)}, {140, Hex(0xffd9b8, 190)}, {255, Hex(0xf09a8a, 0)}}));
    cloud.Blob({{-96, 12},
                {-92, -2},
                {-60, -3},
                {-46, -15},
                {-12, -16},
                {0, -6},
                {20, -13},
                {52, -11},
                {60, 0},
                {98, 0},
                {102, 12},
                {0, 14}});
    movie.DefineShape(kCloud, cloud.Shape());
}

// An orchard's tree far away: a round crown on a short trunk, lit from the left.
static void FarTree(Drawing& d, double x, double y, double size)
{
    d.Paint(Hex(0x5a4436)).Rect(x - 1.3 * size, y - 6 * size, x + 1.3 * size, y);
    d.Paint(Glow(x - 4 * size, y - 15 * size, 15 * size,
                 {{0, Hex(0xc3c765)}, {120, Hex(0x7f9c48)}, {255, Hex(0x3f6a3c)}}));
    d.Blob({{x - 10 * size, y - 3 * size},
            {x - 12 * size, y - 13 * size},
            {x - 6 * size, y - 21 * size},
            {x + 4 * size, y - 22 * size},
            {x + 12 * size, y - 14 * size},
            {x + 10 * size, y - 3 * size},
            {x, y - 6 * size}});
    d.Paint(Hex(0xd9402f));
    const Spot fruit[] = {{-5, -9}, {4, -12}, {-1, -15}, {7, -8}};
    for (Spot f : fruit)
        d.Circle(x + f.x * size, y + f.y * size, 1.2 * size);
}

static void DefineHills(TagWriter& movie)
{
    Drawing d, lamps;
    d.Paint(Down(232, 320, {{0, Hex(0x93a3c8)}, {255, Hex(0xe9cfc0)}}));
    d.Ridge({{-10, 262},
             {70, 232},
             {150, 272},
             {250, 236},
             {350, 278},
             {450, 244},
             {560, 268},
             {650, 240}},
            330);
    d.Paint(Down(250, 330, {{0, Hex(0x7fa07c)}, {255, Hex(0xd8c88a)}}));
    d.Ridge({{-10, 290}, {90, 262}, {200, 296}, {300, 268}, {420, 300}, {520, 266}, {650, 292}},
            340);
    const Spot houses[] = {{96, 280}, {114, 276}, {134, 280}, {78, 284}};
    for (Spot h : houses) {
        d.Paint(Hex(0xf2dfc4)).Rect(h.x, h.y - 7, h.x + 13, h.y + 7);
        d.Paint(Hex(0xb4523e));
        d.Polygon(
            {{h.x - 2, h.y - 6}, {h.x + 3, h.y - 14}, {h.x + 10, h.y - 14}, {h.x + 15, h.y - 6}});
        lamps.Paint(Hex(0xffdc80)).Rect(h.x + 2.5, h.y - 3, h.x + 5.5, h.y + 1);
        lamps.Rect(h.x + 8, h.y - 3, h.x + 11, h.y + 1);
    }
    d.Paint(Hex(0xf6ead4)).Rect(150, 256, 160, 288);
    d.Paint(Hex(0x58607c)).Polygon({{148, 257}, {155, 230}, {162, 257}});
    lamps.Circle(155, 264, 2);
    lamps.Paint(OvalGlow(122, 280, 70, 24, {{0, Hex(0xffc468, 110)}, {255, Hex(0xffb050, 0)}}));
    lamps.Ellipse(122, 280, 70, 24);
    d.Paint(Down(280, 350, {{0, Hex(0x6f9a52)}, {255, Hex(0xb4b95c)}}));
    d.Ridge({{-10, 306}, {110, 296}, {240, 314}, {380, 294}, {500, 312}, {650, 296}}, 360);
    Dice dice(11);
    for (int row = 0; row < 3; row++)
        for (int i = 0; i < 13 - 2 * row; i++) {
            double size = 0.62 + 0.28 * row, step = 660.0 / (12 - 2 * row);
            FarTree(d, -8 + i * step + dice.Between(-5, 5) + 14 * row,
                    312 + 13 * row + dice.Between(-2, 2), size);
        }
    movie.DefineShape(kHills, d.Shape());
    movie.DefineShape(kLamps, lamps.Shape());
}

static void DefineMeadow(TagWriter& movie)
{
    Drawing d;
    d.Paint(Down(330, 480, {{0, Hex(0x9fb24e)}, {70, Hex(0x6f9a41)}, {255, Hex(0x2c5a2c)}}));
    d.Ridge({{-10, 346}, {120, 336}, {300, 348}, {470, 336}, {650, 344}}, 490);
    d.Paint(OvalGlow(150, 352, 330, 60, {{0, Hex(0xffe9a0, 120)}, {255, Hex(0xffe090, 0)}}));
    d.Ellipse(150, 352, 330, 60);
    d.Paint(OvalGlow(470, 436, 250, 44, {{0, Hex(0x163a22, 150)}, {255, Hex(0x163a22, 0)}}));
    d.Ellipse(470, 436, 250, 44);
    const U32 colors[] = {0xfff4d8, 0xf7c6d8, 0xffd85c, 0xd9b8f0};
    Dice dice(23);
    for (U32 color : colors) {
        d.Paint(Hex(color, 220));
        for (int i = 0; i < 26; i++) {
            double y = dice.Between(356, 470), size = (y - 300) / 170 * dice.Between(1.2, 2.8);
            double x = dice.Between(0, 640);
            d.Ellipse(x, y, size, size * 0.7);
        }
    }
    movie.DefineShape(kMeadow, d.Shape());

    Drawing shade;
    shade.Paint(Down(
        225, 480, {{0, Hex(0x10143c, 170)}, {80, Hex(0x0a1036, 195)}, {255, Hex(0x050a24, 212)}}));
    movie.DefineShape(kShade, shade.Rect(kLeft, kTop, kRight, kBottom).Shape());
}

void DefineEvening(TagWriter& movie)
{
    DefineSkies(movie);
    DefineSunMoonAndCloud(movie);
    DefineHills(movie);
    DefineMeadow(movie);
}

} // namespace orchard
