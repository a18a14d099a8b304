#include "samples/scene.h"

#include <cmath>
#include <cstdlib>

// A sea chart with compass roses, drawn with lines alone but for the paper: hairlines, engraved
// shading, thick lines with round joins and ends, dots, dashes; under matrices that turn, scale,
// mirror and squeeze them.

namespace {

constexpr int kFrames = 96;

enum Id : U16 {
    kPaper = 1,
    kRhumbs,
    kBorder,
    kRose,
    kDial,
    kNeedle,
    kFern,
    kFan,
    kWave,
    kShip,
};

const Rgba kInk = Hex(0x33261a), kRed = Hex(0xa5302a), kBlue = Hex(0x2b5f82), kGold = Hex(0xb07d24),
           kPale = Hex(0xfaf1d8);

// A place by its distance from the middle and its direction in turns, clockwise from above.
Spot Polar(double radius, double turn)
{
    return {radius * Turns(turn), -radius * Turns(turn + 0.25)};
}

Spot Mix(Spot a, Spot b, double t)
{
    return {Blend(a.x, b.x, t), Blend(a.y, b.y, t)};
}

class Engraving : public Drawing {
public:
    // What follows is drawn with such a pen.
    Engraving& Pen(double pixels, Rgba color)
    {
        Builder().Styles(0, 0, Builder().AddLine({U16(Twips(pixels)), color}));
        return *this;
    }
    // As Pen, and what follows is also filled.
    Engraving& Pen(double pixels, Rgba color, Rgba fill)
    {
        Paint(fill);
        Builder().Stroke(Builder().AddLine({U16(Twips(pixels)), color}));
        return *this;
    }
    void Stroke(Spot a, Spot b) { Move(a.x, a.y).Line(b.x, b.y); }
    void Dot(Spot at) { Stroke(at, at); }
    // Open and smooth, from the first spot to the last.
    void Path(const std::vector<Spot>& spots);
    // Closed, round the middle: the distance is given by `radius`, the direction in turns.
    template <class Radius> void Orbit(int steps, Radius radius);
};

void Engraving::Path(const std::vector<Spot>& spots)
{
    Move(spots[0].x, spots[0].y);
    for (size_t i = 1; i + 1 < spots.size(); i++) {
        Spot end = i + 2 == spots.size() ? spots.back() : Mix(spots[i], spots[i + 1], 0.5);
        Curve(spots[i].x, spots[i].y, end.x, end.y);
    }
}

template <class Radius> void Engraving::Orbit(int steps, Radius radius)
{
    std::vector<Spot> pulls;
    for (int i = 0; i < steps; i++)
        pulls.push_back(Polar(radius(i / double(steps)), i / double(steps)));
    Blob(pulls);
}

// One half of a ray is left plain, the other is shaded by lines across it.
void DrawRay(Engraving& d, double turn, double length, double side, double spread, Rgba color)
{
    Spot tip = Polar(length, turn), left = Polar(side, turn - spread),
         right = Polar(side, turn + spread);
    d.Pen(1.6, kInk, kPale).Polygon({{0, 0}, left, tip, right});
    d.Pen(0.6, color);
    const int lines = int(length / 4);
    for (int i = 1; i < lines; i++) {
        double t = i / double(lines), at = side / length;
        Spot edge = t < at ? Mix({0, 0}, right, t / at) : Mix(right, tip, (t - at) / (1 - at));
        d.Stroke(Mix({0, 0}, tip, t), edge);
    }
    d.Pen(1.6, kInk).Stroke({0, 0}, tip);
}

// The rose looks the same after an eighth of a turn.
void DefineRose(TagWriter& movie)
{
    Engraving d;
    for (int phase = 0; phase < 4; phase++) { // a woven band
        d.Pen(0.8, phase % 2 ? kBlue : kRed);
        d.Orbit(192, [&](double turn) { return 138 + 13 * Turns(turn * 24 + phase * 0.25); });
    }
    for (double radius : {120.0, 156.0})
        d.Pen(2.4, kInk).Circle(0, 0, radius);
    d.Pen(0.5, kInk).Circle(0, 0, 117).Circle(0, 0, 159);
    for (int i = 0; i < 8; i++)
        DrawRay(d, (i + 0.5) / 8, 112, 34, 1 / 16.0, kBlue);
    for (int i = 0; i < 4; i++)
        DrawRay(d, (i + 0.5) / 4, 132, 36, 1 / 16.0, kGold);
    for (int i = 0; i < 4; i++)
        DrawRay(d, i / 4.0, 152, 38, 1 / 16.0, kRed);
    for (int i = 0; i < 16; i++) { // dots from small to large and back
        d.Pen(i % 2 ? 3 : 6, i % 2 ? kGold : kRed);
        d.Dot(Polar(101, (i + 0.5) / 16));
    }
    movie.DefineShape(kRose, d.Shape());
}

// The four letters, as a hand writes them.
void DrawLetters(Engraving& d)
{
    const std::vector<Spot> letters[] = {{{-6, 8}, {-6, -8}, {6, 8}, {6, -8}},
                                         {{6, -8}, {-5, -8}, {-5, 8}, {6, 8}},
                                         {},
                                         {{-9, -8}, {-5, 8}, {0, -4}, {5, 8}, {9, -8}}};
    d.Pen(3, kRed);
    for (int i = 0; i < 4; i++) {
        Spot at = Polar(206, i / 4.0);
        if (i == 1)
            d.Stroke({at.x - 5, at.y}, {at.x + 4, at.y});
        if (i == 2)
            d.Path({{at.x + 6, at.y - 6},
                    {at.x - 2, at.y - 12},
                    {at.x - 10, at.y - 2},
                    {at.x + 10, at.y + 2},
                    {at.x + 3, at.y + 12},
                    {at.x - 6, at.y + 6}});
        for (size_t n = 0; n + 1 < letters[i].size(); n++) {
            Spot to = letters[i][n + 1];
            if (n == 0)
                d.Move(at.x + letters[i][0].x, at.y + letters[i][0].y);
            d.Line(at.x + to.x, at.y + to.y);
        }
    }
}

// The ring round the rose stands still: degrees, dashes, beads.
void DefineDial(TagWriter& movie)
{
    Engraving d;
    d.Pen(0.5, kInk).Circle(0, 0, 164);
    for (int i = 0; i < 120; i++) {
        d.Pen(i % 10 == 0 ? 2.2 : i % 5 == 0 ? 1.2 : 0.4, kInk);
        d.Stroke(Polar(164, i / 120.0), Polar(i % 10 == 0  ? 176
                                              : i % 5 == 0 ? 172
                                                           : 169,
                                              i / 120.0));
    }
    d.Pen(5, kInk);
    for (int i = 0; i < 36; i++) { // dashes along the ring, with dots between them
        Spot from = Polar(184, (i - 0.22) / 36), to = Polar(184, (i + 0.22) / 36),
             pull = Polar(184.3, i / 36.0);
        d.Move(from.x, from.y).Curve(pull.x, pull.y, to.x, to.y);
    }
    d.Pen(2.2, kGold, kPale);
    for (int i = 0; i < 36; i++) {
        Spot at = Polar(184, (i + 0.5) / 36);
        d.Circle(at.x, at.y, 2.6);
    }
    d.Pen(1.2, kInk).Circle(0, 0, 191);
    DrawLetters(d);
    movie.DefineShape(kDial, d.Shape());
}

void DefineNeedle(TagWriter& movie)
{
    Engraving d;
    d.Pen(9, Hex(0x33261a, 70)).Stroke({3, 100}, {3, -96});
    d.Pen(7, kInk).Stroke({0, 96}, {0, 0});
    d.Pen(7, kRed).Stroke({0, 0}, {0, -100});
    d.Pen(1.4, Hex(0xffffff, 170)).Stroke({-1.4, 94}, {-1.4, -98});
    d.Pen(14, kInk).Dot({0, 0});
    d.Pen(9, kGold).Dot({0, 0});
    d.Pen(3, kInk).Dot({0, 0});
    movie.DefineShape(kNeedle, d.Shape());
}

// A frond that rolls in: the stem thins from piece to piece, every leaf is one line.
void DefineFern(TagWriter& movie)
{
    Engraving d;
    const int kPieces = 44;
    auto stem = [](double t) { // a spiral, opening towards the corner of the sheet
        Spot way = Polar(96 * std::pow(1 - t, 1.35), 0.30 + 1.5 * t);
        return Spot{72 + way.x * 0.86, 66 - way.y * 0.74};
    };
    for (int i = 1; i < kPieces; i++) {
        double t = i / double(kPieces), length = 26 * std::pow(1 - t, 0.8) + 2;
        Spot at = stem(t), next = stem(t + 0.01);
        double x = next.x - at.x, y = next.y - at.y, size = std::sqrt(x * x + y * y);
        for (int side : {1, -1}) {
            double reach = side > 0 ? length : length * 0.6;
            Spot out = {at.x + (x * 0.5 + y * side) / size * reach,
                        at.y + (y * 0.5 - x * side) / size * reach};
            Spot pull = {at.x + y * side / size * reach * 0.6,
                         at.y - x * side / size * reach * 0.6};
            d.Pen(Blend(2.4, 0.6, t), i % 2 ? Hex(0x3f6b3a) : Hex(0x5f8a3f));
            d.Move(at.x, at.y).Curve(pull.x, pull.y, out.x, out.y);
        }
    }
    for (int i = 0; i < kPieces; i++) {
        d.Pen(Blend(5, 1.2, i / double(kPieces)), Hex(0x2c4a28));
        d.Stroke(stem(i / double(kPieces)), stem((i + 1.0) / kPieces));
    }
    d.Pen(6, kRed);
    for (double t : {0.12, 0.3, 0.46, 0.6})
        d.Dot({stem(t).x + 9, stem(t).y + 12});
    movie.DefineShape(kFern, d.Shape());
}

// Every width from a hairline up, with round ends.
void DefineFan(TagWriter& movie)
{
    Engraving d;
    const Rgba colors[] = {kInk, kBlue, kRed, kGold};
    for (int i = 0; i < 15; i++) {
        double turn = (i - 7) / 40.0;
        int rank = 7 - std::abs(i - 7); // the thickest in the middle
        d.Pen(rank * rank * 0.15, colors[rank % 4]);
        d.Stroke(Polar(30, turn), Polar(66 - rank % 2 * 12, turn));
    }
    movie.DefineShape(kFan, d.Shape());
}

void DefineShip(TagWriter& movie)
{
    Engraving d;
    d.Pen(2.4, kInk, Hex(0xdcb878)).Move(-34, 0).Line(36, -2).Curve(30, 16, 18, 17).Line(-22, 17);
    d.Curve(-32, 14, -34, 0);
    d.Pen(0.6, kInk);
    for (int i = 1; i < 5; i++)
        d.Move(-33 + i * 2, i * 3.4).Curve(0, 2 + i * 3.4, 34 - i * 2.4, i * 3.4 - 1.4);
    d.Pen(2.4, kInk).Stroke({0, 0}, {0, -62});
    d.Pen(1.6, kInk, kPale).Move(-26, -14).Curve(-4, -22, 24, -14).Curve(32, -30, 20, -44);
    d.Curve(-2, -48, -20, -44).Curve(-14, -28, -26, -14);
    d.Pen(1.6, kInk, kPale).Move(-17, -46).Curve(0, -50, 16, -46).Curve(20, -54, 12, -60);
    d.Curve(0, -62, -12, -60).Curve(-8, -52, -17, -46);
    d.Pen(3, kRed).Stroke({0, -34}, {0, -20});
    d.Stroke({-7, -28}, {7, -28});
    d.Pen(0.5, kInk).Stroke({-32, 0}, {0, -60});
    d.Stroke({34, -2}, {0, -60});
    d.Pen(1.8, kRed).Move(0, -62).Curve(6, -68, 11, -63).Curve(15, -59, 20, -63);
    movie.DefineShape(kShip, d.Shape());

    Engraving wave;
    for (int row = 0; row < 4; row++) {
        wave.Pen(1.8 - row * 0.4, kBlue).Move(-80, row * 8);
        for (int i = 0; i < 8; i++)
            wave.Curve(-75 + i * 20, row * 8 - 9, -70 + i * 20, row * 8)
                .Curve(-65 + i * 20, row * 8 + 5, -60 + i * 20, row * 8);
    }
    movie.DefineShape(kWave, wave.Shape());
}

void DefineSheet(TagWriter& movie)
{
    Drawing paper;
    paper.Paint(
        Glow(320, 220, 440, {{0, Hex(0xfdf6e0)}, {150, Hex(0xf2e2bc)}, {255, Hex(0xcfae78)}}));
    movie.DefineShape(kPaper, paper.Rect(kLeft, kTop, kRight, kBottom).Shape());

    Engraving rhumbs;
    for (int i = 0; i < 32; i++) { // the thinnest line there is
        rhumbs.Pen(i % 4 ? 0 : 0.05, Hex(0x33261a, i % 4 ? 90 : 150));
        Spot from = Polar(214, i / 32.0), to = Polar(420, i / 32.0);
        rhumbs.Stroke(from, to);
    }
    movie.DefineShape(kRhumbs, rhumbs.Shape());

    Engraving border;
    border.Pen(5, kInk).Rect(12, 12, 628, 468);
    border.Pen(1, kInk).Rect(20, 20, 620, 460);
    border.Pen(4, kRed);
    for (int i = 0; i < 30; i++) // a dash and two dots, along both long sides
        for (double y : {28.0, 452.0}) {
            border.Stroke({32 + i * 19.86, y}, {38 + i * 19.86, y});
            border.Dot({44.9 + i * 19.86, y});
        }
    movie.DefineShape(kBorder, border.Shape());
}

} // namespace

std::vector<U8> MakeGallery()
{
    MovieWriter movie(640 * 20, 480 * 20, Fps(24));
    movie.Background(Hex(0xf2e2bc));
    DefineSheet(movie);
    DefineRose(movie);
    DefineDial(movie);
    DefineNeedle(movie);
    DefineFern(movie);
    DefineFan(movie);
    DefineShip(movie);
    Stage stage(movie);
    for (int frame = 0; frame < kFrames; frame++) {
        double t = frame / double(kFrames), breath = 1 + 0.03 * Turns(t);
        double swing = 9 * Turns(t * 2) + 3 * Turns(t * 5);
        stage.Put(1, kPaper, {});
        stage.Put(2, kRhumbs, At(320, 240));
        stage.Put(3, kWave, At(130 + 20 * t, 424));
        stage.Put(4, kShip, Pose(132, 398 + 3 * Turns(t * 2), 1, 1, 5 * Turns(t * 2 + 0.2)));
        stage.Put(5, kWave, At(130 - 20 * t, 418));
        stage.Put(6, kFern, Pose(30, 36, breath, breath));
        stage.Put(7, kFern, Pose(610, 36, -breath, breath));
        stage.Put(9, kFan, Pose(6, 240, 1, 1.1 + 0.2 * Turns(t), 90));
        stage.Put(10, kFan, Pose(634, 240, 1, 1.1 + 0.2 * Turns(t + 0.5), -90));
        stage.Put(11, kRose, Pose(320, 240, 0.94 * breath, 0.94 * breath, 45 * t));
        stage.Put(12, kDial, Pose(320, 240, 0.94, 0.94));
        stage.Put(13, kNeedle, Pose(320, 240, 1, 1, 24 + swing));
        stage.Put(14, kRose, Mat::Rotate(-45 * t).Then(Pose(528, 392, 0.44, 0.27)));
        stage.Put(15, kBorder, {});
        stage.Next();
    }
    movie.End();
    return movie.Bytes();
}
