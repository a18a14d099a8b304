#include "samples/viaduct.h"

// Everything that is above the horizon and far away.

namespace viaduct {

static void DefineHeavens(TagWriter& movie)
{
    Drawing day, dusk, night;
    day.Paint(Down(
        0, kShore,
        {{0, Hex(0x2a78d0)}, {110, Hex(0x6db8ee)}, {200, Hex(0xbfe6f7)}, {255, Hex(0xfff6dc)}}));
    day.Rect(kLeft, kTop, kRight, kShore);
    dusk.Paint(Down(0, kShore,
                    {{0, Hex(0x2b2364)},
                     {80, Hex(0x7a3f8f)},
                     {140, Hex(0xd9577f)},
                     {200, Hex(0xff9a5a)},
                     {255, Hex(0xffe6a0)}}));
    dusk.Rect(kLeft, kTop, kRight, kShore);
    night.Paint(Down(
        0, kShore,
        {{0, Hex(0x040720)}, {140, Hex(0x10204f)}, {220, Hex(0x2a4a80)}, {255, Hex(0x4a6f9c)}}));
    night.Rect(kLeft, kTop, kRight, kShore);
    movie.DefineShape(kSkyDay, day.Shape(), 2);
    movie.DefineShape(kSkyDusk, dusk.Shape());
    movie.DefineShape(kSkyNight, night.Shape());
}

// Four crossing arcs make a star with a soft halo; it pulses, and the sky holds many out of step.
static void DefineStars(TagWriter& movie)
{
    Drawing star;
    star.Paint(Glow(0, 0, 5, {{0, Hex(0xdfe9ff, 120)}, {255, Hex(0xdfe9ff, 0)}})).Circle(0, 0, 5);
    star.Paint(Hex(0xffffff, 240));
    star.Move(0, -3.4).Curve(0.2, -0.2, 3.4, 0).Curve(0.2, 0.2, 0, 3.4);
    star.Curve(-0.2, 0.2, -3.4, 0).Curve(-0.2, -0.2, 0, -3.4);
    movie.DefineShape(kStar, star.Shape());

    TagWriter twinkle;
    Stage stage(twinkle);
    for (int frame = 0; frame < 40; frame += 2) {
        double pulse = 0.5 + 0.5 * Turns(frame / 40.0);
        stage.Put(1, kStar, Mat::Scale(0.7 + 0.35 * pulse), Cx::Alpha(0.35 + 0.65 * pulse));
        stage.Next(), stage.Next();
    }
    movie.DefineSprite(kTwinkle, twinkle.End());

    TagWriter stars;
    Dice dice(7);
    for (U16 i = 1; i <= 60; i++) {
        double x = dice.Between(6, 634), y = dice.Between(6, 215), size = dice.Between(0.35, 1.1);
        stars.Place(i % 3 == 0 ? kTwinkle : kStar, i, Pose(x, y, size, size));
        if (i % 12 == 0) // stars that come a few frames later twinkle out of step
            stars.Show(7);
    }
    stars.Show(600).End();
    movie.DefineSprite(kStars, stars);
}

static void DefineSunAndMoon(TagWriter& movie)
{
    Drawing sun;
    sun.Paint(Glow(0, 0, 130,
                   {{0, Hex(0xfff2c0, 190)},
                    {60, Hex(0xffe0a0, 110)},
                    {140, Hex(0xffc080, 40)},
                    {255, Hex(0xffb070, 0)}}));
    sun.Circle(0, 0, 130);
    sun.Paint(Glow(0, 0, 27, {{0, Hex(0xffffff)}, {170, Hex(0xfff4c4)}, {255, Hex(0xffd766)}}));
    sun.Circle(0, 0, 26);
    movie.DefineShape(kSun, sun.Shape());

    Drawing moon;
    moon.Paint(Glow(0, 0, 84,
                    {{0, Hex(0xcfe0ff, 130)}, {90, Hex(0xa9c4ff, 50)}, {255, Hex(0x90b0ff, 0)}}));
    moon.Circle(0, 0, 84);
    moon.Paint(Glow(-7, -7, 34, {{0, Hex(0xffffff)}, {160, Hex(0xe6ecf8)}, {255, Hex(0xa9b8d6)}}));
    moon.Circle(0, 0, 22);
    moon.Paint(Hex(0x8fa0c4, 110)).Circle(-7, -5, 5).Circle(6, 4, 6.5).Circle(-6, 9, 3.5);
    moon.Paint(Hex(0x8fa0c4, 80)).Circle(7, -10, 3).Circle(-14, 3, 2.2).Circle(3, 15, 2.4);
    movie.DefineShape(kMoon, moon.Shape());
}

static void DefineCloud(TagWriter& movie)
{
    Drawing cloud;
    auto bank = [](double dy) {
        return std::vector<Spot>{{-78, 12 + dy}, {-74, -8 + dy}, {-46, -10 + dy}, {-42, -34 + dy},
                                 {-6, -44 + dy}, {14, -24 + dy}, {30, -32 + dy},  {52, -20 + dy},
                                 {52, -2 + dy},  {80, -4 + dy},  {84, 13 + dy},   {0, 15 + dy}};
    };
    cloud.Paint(Down(-40, 22,
                     {{0, Hex(0xffffff, 0)}, {160, Hex(0xb4c8e0, 40)}, {255, Hex(0x9fb8d6, 120)}}));
    cloud.Blob(bank(6));
    cloud.Paint(Down(
        -40, 14, {{0, Hex(0xffffff, 250)}, {150, Hex(0xfdfdff, 225)}, {255, Hex(0xcfdcee, 120)}}));
    cloud.Blob(bank(0));
    cloud.Paint(Glow(-20, -14, 21, {{0, Hex(0xffffff, 190)}, {255, Hex(0xffffff, 0)}}));
    cloud.Circle(-20, -14, 21);
    movie.DefineShape(kCloud, cloud.Shape());
}

static void DefineBirds(TagWriter& movie)
{
    Drawing up, down;
    up.Paint(Hex(0x2b3444)).Move(0, 0).Curve(-4, -8, -13, -8).Curve(-5, -5, 0, 2.6);
    up.Curve(5, -5, 13, -8).Curve(4, -8, 0, 0);
    down.Paint(Hex(0x2b3444)).Move(0, -1).Curve(-6, -3, -12, 4).Curve(-5, 0, 0, 2.6);
    down.Curve(5, 0, 12, 4).Curve(6, -3, 0, -1);
    movie.DefineShape(kWingsUp, up.Shape(), 22);
    movie.DefineShape(kWingsDown, down.Shape(), 22);

    TagWriter bird;
    bird.Place(kWingsUp, 1).Show(4).Remove(kWingsUp, 1);
    bird.Place(kWingsUp, 1, Mat::Scale(1, 0.4)).Show(2).Remove(kWingsUp, 1);
    bird.Place(kWingsDown, 1).Show(4).Remove(kWingsDown, 1);
    bird.Place(kWingsUp, 1, Mat::Scale(1, 0.4)).Show(2).End();
    movie.DefineSprite(kBird, bird);

    TagWriter flock; // each bird joins some frames after the one before, so no two beat together
    const Spot places[] = {{0, 0}, {-22, -9}, {-24, 12}, {-46, -16}, {-50, 22}};
    for (U16 i = 0; i < 5; i++) {
        double size = 0.85 - 0.07 * i;
        flock.Place(kBird, U16(i + 1), Pose(places[i].x, places[i].y, size, size)).Show(1 + i % 3);
    }
    movie.DefineSprite(kFlock, flock.Show(200).End());
}

void DefineSky(TagWriter& movie)
{
    DefineHeavens(movie);
    DefineStars(movie);
    DefineSunAndMoon(movie);
    DefineCloud(movie);
    DefineBirds(movie);
}

} // namespace viaduct
