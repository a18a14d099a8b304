#include "samples/viaduct.h"

// The balloon and the sailing boat: sprites that rock, holding sprites that flicker.

namespace viaduct {

static void DefineFlicker(TagWriter& movie)
{
    Drawing flame;
    flame.Paint(Glow(
        0, -4, 14, {{0, Hex(0xfff4b0, 230)}, {110, Hex(0xffb040, 110)}, {255, Hex(0xff7a20, 0)}}));
    flame.Circle(0, -4, 14);
    flame.Paint(Down(-11, 1, {{0, Hex(0xff9a2a)}, {160, Hex(0xfff0a0)}, {255, Hex(0xffffff)}}));
    flame.Move(0, -11).Curve(3.4, -4, 2.4, -1).Curve(0, 2, -2.4, -1).Curve(-3.4, -4, 0, -11);
    movie.DefineShape(kFlame, flame.Shape());

    TagWriter flicker;
    Stage stage(flicker);
    const double heights[] = {1, 1.25, 0.85, 1.1, 0.7, 1.3, 0.95, 1.15};
    for (double height : heights) {
        stage.Put(1, kFlame, Mat::Scale(0.9, height));
        stage.Next(), stage.Next();
    }
    movie.DefineSprite(kFlicker, flicker.End());
}

// Six gores between seven meridians. Every meridian is drawn once, with the gore on its left and
// the one on its right as its two paints.
static void DrawGores(Drawing& d)
{
    ShapeBuilder& shape = d.Builder();
    const U32 colors[] = {0xd93a3a, 0xf7a52c, 0xfbe14a, 0x3fae6a, 0x2f7fd0, 0x6b4bb5};
    int first = 0;
    for (U32 color : colors) {
        int selector = shape.AddFill(Hex(color));
        first = first ? first : selector;
    }
    for (int i = 0; i <= 6; i++) {
        const double spread[] = {-1, -0.82, -0.4, 0, 0.4, 0.82, 1};
        double s = spread[i];
        shape.Styles(i < 6 ? first + i : 0, i > 0 ? first + i - 1 : 0);
        d.Move(0, -118).Curve(38 * s, -116, 44 * s, -76).Curve(44 * s, -44, 9 * s, -20);
    }
    for (int i = 0; i < 6; i++) { // the hem closes each gore
        const double hem[] = {-9, -7.38, -3.6, 0, 3.6, 7.38, 9};
        shape.Styles(first + i, 0);
        d.Move(hem[i], -20).Line(hem[i + 1], -20);
    }
    shape.Styles(0, 0);
}

static void DefineBalloon(TagWriter& movie)
{
    Drawing envelope;
    DrawGores(envelope);
    envelope.Paint(Glow(-14, -88, 70,
                        {{0, Hex(0xffffff, 150)},
                         {90, Hex(0xffffff, 20)},
                         {150, Hex(0x101030, 20)},
                         {255, Hex(0x101030, 140)}}));
    envelope.Move(0, -118).Curve(38, -116, 44, -76).Curve(44, -44, 9, -20).Line(-9, -20);
    envelope.Curve(-44, -44, -44, -76).Curve(-38, -116, 0, -118);
    movie.DefineShape(kEnvelope, envelope.Shape());

    Drawing basket;
    basket.Paint(Hex(0x5a4632));
    basket.Polygon({{-9, -20}, {-8.2, -20}, {-5.4, -4}, {-6.2, -4}});
    basket.Polygon({{9, -20}, {8.2, -20}, {5.4, -4}, {6.2, -4}});
    basket.Paint(Across(-7, 7, {{0, Hex(0x8a5f34)}, {90, Hex(0xd9a866)}, {255, Hex(0x5a3c20)}}));
    basket.Move(-7, -5).Line(7, -5).Line(6, 6).Curve(0, 8.4, -6, 6).Close();
    basket.Paint(Hex(0x5a3c20)).RoundRect(-8, -6.4, 8, -4, 1);
    basket.Paint(Hex(0x3a2a4a)).Circle(-2.4, -9, 2.2).RoundRect(-4.4, -7.4, -0.6, -5, 1);
    basket.Paint(Hex(0xb04a3a)).Circle(3, -8.6, 2).RoundRect(1, -7, 5, -5, 1);
    movie.DefineShape(kBasket, basket.Shape());

    TagWriter balloon;
    Stage stage(balloon);
    for (int frame = 0; frame < 60; frame += 2) {
        Mat rock = Mat::Translate(0, Twips(60)).Then(Mat::Rotate(3 * Turns(frame / 60.0)));
        stage.Put(1, kBasket, rock);
        stage.Put(2, kFlicker, At(0, -17).Then(rock));
        stage.Put(3, kEnvelope, rock);
        stage.Next(), stage.Next();
    }
    movie.DefineSprite(kBalloon, balloon.End());
}

static void DefineBoat(TagWriter& movie)
{
    Drawing hull;
    hull.Paint(Down(-10, 8, {{0, Hex(0xb4673a)}, {120, Hex(0x7a3d22)}, {255, Hex(0x43200f)}}));
    hull.Move(-34, -9)
        .Curve(0, -2, 38, -12)
        .Curve(30, 6, 16, 7)
        .Line(-20, 7)
        .Curve(-32, 4, -34, -9);
    hull.Paint(Hex(0xf4e2b8)).Move(-34, -9).Curve(0, -2, 38, -12).Line(37, -9.4);
    hull.Curve(0, 0.6, -33.6, -6.4).Close();
    hull.Paint(Hex(0x5a3a22)).Rect(-1.2, -92, 1.2, -4);
    movie.DefineShape(kHull, hull.Shape());

    Drawing sail;
    sail.Paint(Across(2, 44, {{0, Hex(0xfffaf0)}, {140, Hex(0xf6e6cc)}, {255, Hex(0xd8b890)}}));
    sail.Move(2, -88).Curve(32, -54, 36, -16).Curve(18, -10, 2, -13).Close();
    sail.Paint(Across(-28, -2, {{0, Hex(0xb5372c)}, {255, Hex(0xe86a4a)}}));
    sail.Move(-2, -84).Curve(-12, -44, -29, -15).Curve(-16, -10, -2, -14).Close();
    sail.Paint(Hex(0xd8452f)).Move(0, -92).Curve(8, -97, 15, -91).Curve(8, -91, 0, -86).Close();
    movie.DefineShape(kSail, sail.Shape());

    Drawing lantern;
    lantern.Paint(
        Glow(0, 0, 18, {{0, Hex(0xfff6c8)}, {40, Hex(0xffd070, 190)}, {255, Hex(0xffa030, 0)}}));
    movie.DefineShape(kLantern, lantern.Circle(0, 0, 18).Shape());

    TagWriter boat;
    Stage stage(boat);
    for (int frame = 0; frame < 60; frame += 2) {
        double roll = 3.2 * Turns(frame / 60.0), heave = 1.6 * Turns(frame / 30.0);
        stage.Put(1, kHull, Pose(0, heave, 1, 1, roll));
        stage.Put(2, kSail, Pose(0, heave, 1 + 0.05 * Turns(frame / 60.0 + 0.2), 1, roll));
        stage.Next(), stage.Next();
    }
    movie.DefineSprite(kBoat, boat.End());
}

void DefineVessels(TagWriter& movie)
{
    DefineFlicker(movie);
    DefineBalloon(movie);
    DefineBoat(movie);
}

} // namespace viaduct
