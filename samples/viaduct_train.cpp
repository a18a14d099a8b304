#include "samples/viaduct.h"

#include <algorithm>

// The train, drawn with its front at the origin and the rail at y = 0, pulling to the right.

namespace viaduct {

static std::vector<Stop> Iron(U32 shade, U32 shine, U32 dark)
{
    return {{0, Hex(shade)}, {70, Hex(shine)}, {130, Hex(shade)}, {255, Hex(dark)}};
}

static void DefineWheels(TagWriter& movie)
{
    Drawing wheel;
    wheel.Paint(Hex(0x20242c)).Circle(0, 0, 10).Circle(0, 0, 8);
    wheel.Paint(Hex(0xa23b32));
    wheel.Circle(0, 0, 8.2).Circle(0, 0, 6.6);
    for (int spoke = 0; spoke < 4; spoke++) {
        double s = Turns(spoke / 8.0), c = Turns(spoke / 8.0 + 0.25);
        wheel.Paint(Hex(0xa23b32))
            .Polygon({{c * 7 - s * 0.6, s * 7 + c * 0.6},
                      {c * 7 + s * 0.6, s * 7 - c * 0.6},
                      {-c * 7 + s * 0.6, -s * 7 - c * 0.6},
                      {-c * 7 - s * 0.6, -s * 7 + c * 0.6}});
    }
    wheel.Paint(Hex(0xd9b46a)).Circle(0, 0, 2);
    movie.DefineShape(kWheel, wheel.Shape());
    movie.DefineSprite(kRolling, TurningSprite(kWheel, 16, 360));

    Drawing rod;
    rod.Paint(Hex(0xc9ced6)).RoundRect(-50, -1.3, 3, 1.3, 1);
    rod.Paint(Hex(0x6b7078)).Circle(0, 0, 1.6).Circle(-23, 0, 1.6).Circle(-46, 0, 1.6);
    movie.DefineShape(kRod, rod.Shape());
    TagWriter circling; // in step with the driving wheels
    Stage stage(circling);
    for (int frame = 0; frame < 16; frame++) {
        stage.Put(1, kRod, At(5 * Turns(frame / 16.0 + 0.25), 5 * Turns(frame / 16.0)));
        stage.Next();
    }
    movie.DefineSprite(kRods, circling.End());
}

static void DefineSmoke(TagWriter& movie)
{
    Drawing puff;
    puff.Paint(Glow(-2, -3, 13,
                    {{0, Hex(0xffffff, 235)}, {110, Hex(0xf2f2f6, 175)}, {255, Hex(0xd4d8e4, 0)}}));
    puff.Circle(0, 0, 12);
    movie.DefineShape(kPuff, puff.Shape());

    const int kPuffs = 9, kAge = 27; // a new puff every third frame, each living all the cycle
    TagWriter tags;
    Stage stage(tags);
    for (int frame = 0; frame < kAge; frame++) {
        for (int i = 0; i < kPuffs; i++) {
            double age = ((frame + 3 * i) % kAge) / double(kAge);
            double size = 0.45 + 2.1 * age, fade = std::min(1.0, age * 9) * (1 - age * age) * 0.9;
            double rise = 44 * age * (1.6 - 0.6 * age);
            stage.Put(U16(i + 1), kPuff,
                      Pose(-112 * age + 3 * Turns(age * 2 + i * 0.37), -rise, size, size * 0.9),
                      Cx::Alpha(fade));
        }
        stage.Next();
    }
    movie.DefineSprite(kSmoke, tags.End());
}

static void DrawBoiler(Drawing& d)
{
    d.Paint(Down(-43, -33, Iron(0x9a6a22, 0xffe6a0, 0x5b3c12)));
    d.Move(-42, -33).Curve(-41, -43, -35, -43).Curve(-29, -43, -28, -33).Close();
    d.Paint(Down(-36, -14, Iron(0x1f5a45, 0x7fc9a2, 0x0f2d24)));
    d.RoundRect(-66, -35, -16, -14, 2);
    d.Paint(Down(-36, -14, Iron(0x33363d, 0x8b919c, 0x15171c)));
    d.RoundRect(-22, -36, -6, -13, 2);
    d.Paint(Down(-36, -14, Iron(0xb98a35, 0xffedb0, 0x6a4614)));
    d.Rect(-58, -35.4, -56, -13.6).Rect(-42.5, -35.4, -40.5, -13.6).Rect(-26, -35.4, -24, -13.6);
    d.Paint(Across(-20, -6, Iron(0x2a2c33, 0x8b919c, 0x101216)));
    d.Polygon({{-17.5, -36}, {-8.5, -36}, {-9.5, -48}, {-16.5, -48}});
    d.RoundRect(-19, -52, -7, -47, 1.5);
}

static void DrawCab(Drawing& d)
{
    d.Paint(Down(-48, -12, {{0, Hex(0x2d7a5d)}, {255, Hex(0x123b2d)}}));
    d.Rect(-92, -47, -64, -12);
    d.RoundRect(-87, -42, -79, -30, 1.5).RoundRect(-76, -42, -68, -30, 1.5); // open windows
    d.Paint(Hex(0xd9b46a));
    d.Rect(-92, -26, -64, -25).Rect(-92, -15, -64, -14);
    d.Paint(Down(-54, -46, {{0, Hex(0x8a8f99)}, {255, Hex(0x2c3038)}}));
    d.Move(-96, -46.5).Curve(-78, -55, -60, -46.5).Close();
}

static void DefineEngine(TagWriter& movie)
{
    Drawing d;
    DrawBoiler(d);
    DrawCab(d);
    d.Paint(Hex(0x1b1d22)).Rect(-94, -14, -4, -10);
    d.Paint(Down(-17, -2, {{0, Hex(0xd8483a)}, {255, Hex(0x7d1f18)}}));
    d.Rect(-7, -16, -3, -8).Polygon({{-8, -8}, {-3, -8}, {4, -1}, {-8, -1}});
    d.Paint(Hex(0xc9ced6)).Rect(-3, -14, 1, -12).Rect(0, -15.5, 1.5, -10.5);
    d.Paint(Hex(0x2a2c33)).RoundRect(-8, -43, -1, -35, 2);
    d.Paint(Glow(-2.5, -39, 4, {{0, Hex(0xfffbe0)}, {255, Hex(0xffc94a)}}));
    d.Ellipse(-2, -39, 2, 3.2);
    movie.DefineShape(kEngineBody, d.Shape());

    TagWriter engine;
    engine.Place(kSmoke, 1, At(-13, -54)).Place(kEngineBody, 2);
    engine.Place(kRolling, 3, At(-78, -10)).Place(kRolling, 4, At(-55, -10));
    engine.Place(kRolling, 5, At(-32, -10)).Place(kRolling, 6, Pose(-13, -6, 0.6, 0.6));
    engine.Place(kRods, 7, At(-32, -10)).Show().End();
    movie.DefineSprite(kEngine, engine);
}

static void DefineCoach(TagWriter& movie)
{
    Drawing d;
    d.Paint(Hex(0x1b1d22)).Rect(-84, -12, 4, -8).Rect(-80, -9, -8, -5);
    d.Paint(Down(-40, -10,
                 {{0, Hex(0xf7ead0)},
                  {110, Hex(0xe6d2ac)},
                  {112, Hex(0xa83a30)},
                  {190, Hex(0x8a2a24)},
                  {255, Hex(0x5a1816)}}));
    d.RoundRect(-84, -40, 0, -10, 3);
    d.Paint(Down(-36, -25, {{0, Hex(0x9fc6d8)}, {130, Hex(0x46687c)}, {255, Hex(0x2d4656)}}));
    for (int i = 0; i < 6; i++)
        d.RoundRect(-79 + i * 13, -36, -70 + i * 13, -25, 1.5);
    d.Paint(Hex(0xe0b65a)).Rect(-84, -22.6, 0, -21.8).Rect(-84, -13, 0, -12.4);
    d.Paint(Down(-46, -39, {{0, Hex(0xb3b7bf)}, {255, Hex(0x4a4e57)}}));
    d.Move(-86, -39).Curve(-84, -45, -74, -45).Line(-10, -45).Curve(0, -45, 2, -39).Close();
    movie.DefineShape(kCoachBody, d.Shape());

    TagWriter coach;
    coach.Place(kCoachBody, 5);
    const double axles[] = {-70, -56, -28, -14};
    for (U16 i = 0; i < 4; i++)
        coach.Place(kRolling, U16(i + 1), Pose(axles[i], -5.5, 0.55, 0.55));
    movie.DefineSprite(kCoach, coach.Show().End());
}

static void DefineLights(TagWriter& movie)
{
    Drawing glow;
    glow.Paint(
        OvalGlow(-42, -30, 66, 38,
                 {{0, Hex(0xffc868, 130)}, {120, Hex(0xffa848, 50)}, {255, Hex(0xff9a3c, 0)}}));
    glow.Ellipse(-42, -30, 66, 38);
    glow.Paint(Down(-36, -25, {{0, Hex(0xfff3c4)}, {255, Hex(0xffb54a)}}));
    for (int i = 0; i < 6; i++)
        glow.RoundRect(-79 + i * 13, -36, -70 + i * 13, -25, 1.5);
    movie.DefineShape(kCoachLights, glow.Shape());

    Drawing beam;
    beam.Paint(Across(0, 190,
                      {{0, Hex(0xfff2c0, 190)}, {90, Hex(0xffe9a8, 80)}, {255, Hex(0xffe9a8, 0)}}));
    beam.Move(-2, -41).Line(190, -66).Curve(200, -30, 190, -4).Line(-2, -37).Close();
    beam.Paint(Glow(-2, -39, 16,
                    {{0, Hex(0xffffff, 240)}, {70, Hex(0xffe9a0, 150)}, {255, Hex(0xffc860, 0)}}));
    beam.Circle(-2, -39, 16);
    movie.DefineShape(kBeam, beam.Shape());
}

void DefineTrain(TagWriter& movie)
{
    DefineWheels(movie);
    DefineSmoke(movie);
    DefineEngine(movie);
    DefineCoach(movie);
    DefineLights(movie);

    TagWriter train, lights;
    const Cx paints[] = {Cx(), Cx(), Cx::Multiply(150, 230, 256), Cx::Multiply(150, 256, 190)};
    for (U16 i = 3; i >= 1; i--) {
        Mat place = At(-100 - (i - 1) * 88.0, 0);
        train.Place(kCoach, U16(4 - i), place, paints[i]);
        lights.Place(kCoachLights, U16(4 - i), place);
    }
    train.Place(kEngine, 4).Show().End();
    lights.Place(kBeam, 4).Show().End();
    movie.DefineSprite(kTrain, train);
    movie.DefineSprite(kTrainLights, lights);
}

} // namespace viaduct
