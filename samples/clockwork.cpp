#include "samples/scene.h"

#include <cmath>

// A skeleton clock. Every gear is a sprite in a sprite: a mask of the gear's outline turns over a
// disc of metal that does not, so the teeth move and the light on them stays; a shadow turns below.

namespace {

enum Id : U16 {
    kWall = 1,
    kPlate,
    kRing,
    kMarks,
    kHourHand,
    kMinuteHand,
    kSecondHand,
    kSeconds,
    kPin,
    kGlass,
    kGlint,
    kRod,
    kBob,
    kCogs = 40, // each cog takes five numbers: outline, metal, hub, turning shadow, gear
};

enum CogPart { kOutline, kMetal, kHub, kShadow, kGear, kPartsOfCog };

constexpr double kModule = 2.5; // pixels of pitch radius for a tooth
constexpr int kToothFrames = 8; // frames in which every gear moves on by one tooth

struct Cog {
    int teeth, spokes;
    U32 dark, mid, bright; // metal
    double x, y;           // middle, in pixels of the stage
    int sense;             // 1 turns clockwise
    double start;          // degrees, so that teeth meet gaps
};

// The train of wheels. Neighbours stand as far apart as their pitch radii add up to.
constexpr int kCogCount = 7;

double Radius(const Cog& cog)
{
    return cog.teeth * kModule;
}

Spot OnCircle(double radius, double degrees)
{
    return {radius * Turns(degrees / 360 + 0.25), radius * Turns(degrees / 360)};
}

// Sets a cog beside another in the given direction and turns it so that the two mesh there.
Cog Beside(const Cog& other, Cog cog, double degrees)
{
    Spot way = OnCircle(Radius(other) + Radius(cog), degrees);
    cog.x = other.x + way.x;
    cog.y = other.y + way.y;
    cog.sense = -other.sense;
    double pitch = 360.0 / cog.teeth, otherPitch = 360.0 / other.teeth;
    // How far past a tooth's middle the other wheel meets the line between the axles, in teeth.
    double phase = (degrees - other.start) / otherPitch;
    cog.start = degrees + 180 + (phase + 0.5) * pitch;
    return cog;
}

std::vector<Cog> Wheels()
{
    const U32 brass[] = {0x6e4312, 0xd9a441, 0xfff0b8}, steel[] = {0x3c4654, 0x98a6b8, 0xf4f8ff};
    const U32 copper[] = {0x5c2414, 0xc76a42, 0xffd9bc};
    auto make = [](int teeth, int spokes, const U32* metal) {
        return Cog{teeth, spokes, metal[0], metal[1], metal[2], 0, 0, 1, 0};
    };
    Cog great = make(30, 6, brass);
    great.x = 247, great.y = 186;
    Cog pinion = Beside(great, make(12, 4, steel), 20);
    Cog third = Beside(pinion, make(24, 6, copper), -33);
    Cog low = Beside(great, make(20, 5, steel), 62);
    Cog small = Beside(low, make(15, 5, brass), 2);
    Cog escape = Beside(low, make(18, 6, copper), 124);
    Cog idler = Beside(great, make(16, 4, copper), 146);
    return {great, pinion, third, low, small, escape, idler};
}

// A ring of rounded teeth; each rises and falls in two curves.
void DrawTeeth(Drawing& d, const Cog& cog)
{
    double outer = Radius(cog) + 3.4, inner = Radius(cog) - 4, step = 360.0 / cog.teeth;
    for (int i = 0; i < cog.teeth; i++) {
        double at = i * step;
        auto place = [&](double radius, double part) { return OnCircle(radius, at + part * step); };
        const Spot spots[] = {place(inner, -0.33), place(outer - 2.6, -0.21), place(outer, -0.13),
                              place(outer, 0.13),  place(outer - 2.6, 0.21),  place(inner, 0.33),
                              place(inner, 0.67)};
        i == 0 ? d.Move(spots[0].x, spots[0].y) : d.Line(spots[0].x, spots[0].y);
        d.Curve(spots[1].x, spots[1].y, spots[2].x, spots[2].y).Line(spots[3].x, spots[3].y);
        d.Curve(spots[4].x, spots[4].y, spots[5].x, spots[5].y).Line(spots[6].x, spots[6].y);
    }
    d.Close();
}

// The openings between the spokes, drawn into the same paint and so cut out of it.
void DrawOpenings(Drawing& d, const Cog& cog)
{
    double outer = Radius(cog) - 12, inner = Radius(cog) * 0.3, step = 360.0 / cog.spokes;
    double thinOuter = 4.0 / outer * 57.3, thinInner = 5.0 / inner * 57.3;
    for (int i = 0; i < cog.spokes && outer > inner + 4; i++) {
        double from = i * step, to = from + step;
        Spot start = OnCircle(inner, from + thinInner);
        d.Move(start.x, start.y).Arc(0, 0, outer, from + thinOuter, to - thinOuter);
        d.Arc(0, 0, inner, to - thinInner, from + thinInner);
    }
}

std::vector<Stop> Brushed(const Cog& cog)
{
    return {{0, Hex(cog.dark)},   {50, Hex(cog.mid)},  {100, Hex(cog.bright)}, {128, Hex(cog.mid)},
            {170, Hex(cog.dark)}, {205, Hex(cog.mid)}, {228, Hex(cog.bright)}, {255, Hex(cog.mid)}};
}

void DefineCogShapes(TagWriter& movie, const Cog& cog, U16 base)
{
    Drawing outline, metal, hub;
    outline.Paint(Hex(0x000000));
    DrawTeeth(outline, cog);
    DrawOpenings(outline, cog);
    movie.DefineShape(U16(base + kOutline), outline.Shape());

    double radius = Radius(cog), size = radius + 6;
    metal.Paint(
        Fill::Linear(Mat::Gradient(0, 0, Twips(2 * size), Twips(2 * size), 52), Brushed(cog)));
    metal.Circle(0, 0, size);
    metal.Paint(Hex(cog.dark, 90)).Circle(0, 0, radius - 6).Circle(0, 0, radius - 7.4);
    metal.Paint(Hex(cog.bright, 110)).Circle(0, 0, radius - 7.4).Circle(0, 0, radius - 8.4);
    movie.DefineShape(U16(base + kMetal), metal.Shape());

    double boss = radius * 0.2;
    hub.Paint(Glow(-boss * 0.4, -boss * 0.5, boss * 1.6,
                   {{0, Hex(cog.bright)}, {120, Hex(cog.mid)}, {255, Hex(cog.dark)}}));
    hub.Circle(0, 0, boss);
    hub.Paint(Hex(0x1d140c, 150)).Circle(0, 0, boss).Circle(0, 0, boss - 0.8);
    hub.Paint(Glow(-1, -1.6, 5, {{0, Hex(0xffb0c8)}, {90, Hex(0xd0204a)}, {255, Hex(0x5a0018)}}));
    hub.Circle(0, 0, 3.6);
    movie.DefineShape(U16(base + kHub), hub.Shape());
}

// The gear turns until a spoke stands where the next one stood: then it looks as at the start.
void DefineCog(TagWriter& movie, const Cog& cog, U16 base)
{
    DefineCogShapes(movie, cog, base);
    int frames = cog.teeth / cog.spokes * kToothFrames;
    double sweep = cog.sense * 360.0 / cog.spokes;
    TagWriter shadow, gear;
    gear.Place2(
        1, {.character = U16(base + kOutline), .matrix = Mat::Rotate(cog.start), .clipDepth = 2});
    gear.Place(U16(base + kMetal), 2).Place(U16(base + kHub), 3);
    shadow.Place(U16(base + kOutline), 1, Mat::Rotate(cog.start));
    for (int frame = 0; frame < frames; frame++) {
        Mat turned = Mat::Rotate(cog.start + sweep * frame / frames);
        if (frame > 0)
            shadow.Move(1, turned), gear.Move(1, turned);
        shadow.Show(), gear.Show();
    }
    movie.DefineSprite(U16(base + kShadow), shadow.End());
    movie.DefineSprite(U16(base + kGear), gear.End());
}

void DefineWallAndPlate(TagWriter& movie)
{
    Drawing wall, plate;
    wall.Paint(
        Glow(300, 190, 460, {{0, Hex(0x2f6a6c)}, {120, Hex(0x17434a)}, {255, Hex(0x071a22)}}));
    wall.Rect(kLeft, kTop, kRight, kBottom);
    for (int i = 0; i < 16; i++) // a paper of faint stripes
        wall.Paint(Hex(0xffffff, 7)).Rect(i * 40, kTop, i * 40 + 20, kBottom);
    movie.DefineShape(kWall, wall.Shape());

    plate.Paint(Hex(0x000000, 90)).Circle(8, 12, 214);
    plate.Paint(
        Glow(-60, -70, 330, {{0, Hex(0x3b3029)}, {150, Hex(0x1c1613)}, {255, Hex(0x0a0807)}}));
    plate.Circle(0, 0, 208);
    for (int i = 0; i < 9; i++) // engine-turned rings
        plate.Paint(Hex(0xffe0b0, 14)).Circle(0, 0, 190 - i * 20).Circle(0, 0, 180 - i * 20);
    movie.DefineShape(kPlate, plate.Shape());
}

void DefineRing(TagWriter& movie)
{
    Drawing ring;
    ring.Paint(
        Fill::Linear(Mat::Gradient(0, 0, Twips(430), Twips(430), 55), {{0, Hex(0xfff2c0)},
                                                                       {60, Hex(0xd09a38)},
                                                                       {110, Hex(0x7a4a14)},
                                                                       {150, Hex(0xe8bc5c)},
                                                                       {190, Hex(0xfff0b8)},
                                                                       {255, Hex(0x6a3e10)}}));
    ring.Circle(0, 0, 213).Circle(0, 0, 196);
    ring.Paint(Hex(0x3a2208, 160)).Circle(0, 0, 213).Circle(0, 0, 211.6);
    ring.Paint(Fill::Linear(Mat::Gradient(0, 0, Twips(400), Twips(400), 235),
                            {{0, Hex(0xfff2c0)}, {120, Hex(0x9a6a22)}, {255, Hex(0x4a2c0a)}}));
    ring.Circle(0, 0, 197).Circle(0, 0, 193);
    ring.Paint(Glow(-40, -60, 250, {{0, Hex(0xfffcf0)}, {255, Hex(0xe2d2b0)}}));
    ring.Circle(0, 0, 193).Circle(0, 0, 156);
    ring.Paint(Hex(0xb98a35)).Circle(0, 0, 157).Circle(0, 0, 154);
    ring.Paint(Hex(0x000000, 80)).Circle(0, 0, 154).Circle(2, 4, 151);
    movie.DefineShape(kRing, ring.Shape());
}

void DefineMarks(TagWriter& movie)
{
    Drawing marks;
    for (int i = 0; i < 60; i++) {
        double length = i % 5 ? 5 : 22, half = i % 15 == 0 ? 3.4 : i % 5 == 0 ? 2.2 : 0.7;
        marks.Paint(i % 15 == 0 ? Hex(0x9c2a22) : Hex(0x2a2420));
        Mat turn = Mat::Rotate(i * 6);
        std::vector<Pt> corners;
        const Spot box[] = {
            {-half, -188}, {half, -188}, {half * 0.55, length - 188}, {-half * 0.55, length - 188}};
        for (Spot spot : box) {
            Mat moved = At(spot.x, spot.y).Then(turn);
            corners.push_back({moved.tx, moved.ty});
        }
        marks.Builder().Polygon(corners);
    }
    movie.DefineShape(kMarks, marks.Shape());
}

void DrawHand(Drawing& d, double length, double width)
{
    d.Paint(Across(
        -width, width,
        {{0, Hex(0x6c8cff)}, {126, Hex(0x3048b0)}, {130, Hex(0x182870)}, {255, Hex(0x0c1440)}}));
    d.Move(-width * 0.35, 26).Line(-width * 0.5, -length * 0.5);
    d.Curve(-width * 1.6, -length * 0.64, 0, -length)
        .Curve(width * 1.6, -length * 0.64, width * 0.5, -length * 0.5);
    d.Line(width * 0.35, 26).Close();
    d.Move(0, -length * 0.86).Curve(width * 0.7, -length * 0.66, 0, -length * 0.56);
    d.Curve(-width * 0.7, -length * 0.66, 0, -length * 0.86); // an opening in the blade
}

// A tick a second: the hand leaps past its mark, swings back and stands.
void DefineSecondHand(TagWriter& movie)
{
    Drawing hand;
    hand.Paint(Hex(0xd8342c)).Polygon({{-1.6, 46}, {1.6, 46}, {0.5, -178}, {-0.5, -178}});
    hand.Circle(0, 40, 8).Circle(0, 40, 4.6);
    hand.Paint(Hex(0xd8342c)).Circle(0, 0, 5);
    movie.DefineShape(kSecondHand, hand.Shape());

    TagWriter ticks;
    ticks.Place2(1, {.character = U16(kSecondHand), .matrix = Mat::Identity()}).Show(20);
    const double swing[] = {-4.2, 0.9, -0.4, 0};
    for (int second = 1; second <= 60; second++) {
        for (double past : swing)
            ticks.Move(1, Mat::Rotate(second * 6 + past)).Show();
        if (second < 60)
            ticks.Show(20);
    }
    movie.DefineSprite(kSeconds, ticks.End());
}

void DefineHands(TagWriter& movie)
{
    Drawing hour, minute, pin;
    DrawHand(hour, 104, 9);
    DrawHand(minute, 158, 7);
    movie.DefineShape(kHourHand, hour.Shape());
    movie.DefineShape(kMinuteHand, minute.Shape());
    DefineSecondHand(movie);
    pin.Paint(Glow(-2, -3, 9, {{0, Hex(0xffffff)}, {120, Hex(0xd9a441)}, {255, Hex(0x5a3410)}}));
    movie.DefineShape(kPin, pin.Circle(0, 0, 6).Shape());
}

void DefinePendulum(TagWriter& movie)
{
    Drawing rod, bob, shine;
    rod.Paint(Across(-4, 4, {{0, Hex(0x5a3410)}, {90, Hex(0xffe9a8)}, {255, Hex(0x6e4312)}}));
    rod.Rect(-3, -6, 3, 400);
    rod.Paint(Hex(0x8a98a8)).Rect(-10, 100, -7, 320).Rect(7, 100, 10, 320);
    rod.Paint(Hex(0xd9a441)).RoundRect(-14, 96, 14, 104, 3).RoundRect(-14, 316, 14, 324, 3);
    movie.DefineShape(kRod, rod.Shape());

    bob.Paint(Hex(0x000000, 80)).Circle(6, 10, 46);
    bob.Paint(Fill::Radial(
        Mat::Gradient(Twips(-14), Twips(-18), Twips(130), Twips(130)),
        {{0, Hex(0xfffbe0)}, {70, Hex(0xf2c860)}, {170, Hex(0xb0741e)}, {255, Hex(0x4a2808)}}));
    bob.Circle(0, 0, 46);
    bob.Paint(Hex(0x6e4312, 170)).Circle(0, 0, 38).Circle(0, 0, 36.4);
    for (int i = 0; i < 8; i++) { // a rosette
        Spot tip = OnCircle(33, i * 45), left = OnCircle(17, i * 45 - 24),
             right = OnCircle(17, i * 45 + 24);
        bob.Paint(Hex(0xfff4c8, 120)).Move(0, 0).Curve(left.x, left.y, tip.x, tip.y);
        bob.Curve(right.x, right.y, 0, 0);
    }
    movie.DefineShape(kBob, bob.Shape());
}

// A bar of light passes over the glass; the mask keeps it inside the ring.
void DefineGlass(TagWriter& movie)
{
    Drawing glass, glint;
    glass.Paint(Hex(0xffffff)).Circle(0, 0, 196);
    movie.DefineShape(kGlass, glass.Shape());
    glint.Paint(Across(-70, 70,
                       {{0, Hex(0xffffff, 0)},
                        {100, Hex(0xffffff, 60)},
                        {128, Hex(0xffffff, 105)},
                        {156, Hex(0xffffff, 60)},
                        {255, Hex(0xffffff, 0)}}));
    glint.Rect(-70, -300, 70, 300);
    movie.DefineShape(kGlint, glint.Shape());
}

constexpr int kFrames = 96;
constexpr double kMiddleX = 300, kMiddleY = 232;

void PlaceStill(TagWriter& movie, const std::vector<Cog>& wheels)
{
    movie.Place(kWall, 1).Place(kPlate, 2, At(kMiddleX, kMiddleY));
    for (U16 i = 0; i < kCogCount; i++) {
        const Cog& cog = wheels[i];
        U16 base = U16(kCogs + i * kPartsOfCog), depth = U16(10 + i * 2);
        movie.Place2(depth, {.character = U16(base + kShadow),
                             .matrix = At(cog.x + 5, cog.y + 8),
                             .cx = Cx::Alpha(0.5)});
        movie.Place(U16(base + kGear), U16(depth + 1), At(cog.x, cog.y));
    }
    movie.Place(kRing, 30, At(kMiddleX, kMiddleY)).Place(kMarks, 31, At(kMiddleX, kMiddleY));
    const Cx shade{{0, 0, 0, 80}, {0, 0, 0, 0}};
    Mat hour = Pose(kMiddleX, kMiddleY, 1, 1, 304), minute = Pose(kMiddleX, kMiddleY, 1, 1, 48);
    movie.Place2(32, {.character = U16(kHourHand), .matrix = hour.Then(At(3, 5)), .cx = shade});
    movie.Place(kHourHand, 33, hour);
    movie.Place2(34, {.character = U16(kMinuteHand), .matrix = minute.Then(At(4, 7)), .cx = shade});
    movie.Place(kMinuteHand, 35, minute);
    movie.Place2(
        36, {.character = U16(kSeconds), .matrix = At(kMiddleX + 5, kMiddleY + 9), .cx = shade});
    movie.Place(kSeconds, 37, At(kMiddleX, kMiddleY)).Place(kPin, 38, At(kMiddleX, kMiddleY));
}

void PlaceMoving(Stage& stage, int frame)
{
    double swing = 6.5 * Turns(frame / 48.0);
    Mat hung = Pose(566, -24, 1, 1, swing);
    stage.Put(3, kRod, hung);
    stage.Put(4, kBob, At(0, 412).Then(hung));
    stage.Put(40, kGlass, At(kMiddleX, kMiddleY), Cx(), 41);
    stage.Put(41, kGlint, Pose(Blend(-200, 1400, frame / double(kFrames)), kMiddleY, 1, 1, 28));
}

} // namespace

std::vector<U8> MakeClockwork()
{
    MovieWriter movie(640 * 20, 480 * 20, Fps(24));
    movie.Background(Hex(0x17434a));
    DefineWallAndPlate(movie);
    DefineRing(movie);
    DefineMarks(movie);
    DefineHands(movie);
    DefinePendulum(movie);
    DefineGlass(movie);
    std::vector<Cog> wheels = Wheels();
    for (U16 i = 0; i < kCogCount; i++)
        DefineCog(movie, wheels[i], U16(kCogs + i * kPartsOfCog));
    PlaceStill(movie, wheels);
    Stage stage(movie);
    for (int frame = 0; frame < kFrames; frame++) {
        PlaceMoving(stage, frame);
        stage.Next();
    }
    movie.End();
    return movie.Bytes();
}
