#pragma once

#include "tests/support/movie_writer.h"

#include <map>
#include <vector>

// What the sample scenes share: drawing in pixels, a stage that writes only what changed from frame
// to frame, and small mathematics of motion. Everything ends rounded to twips or 1/65536, so the
// movies come out the same on every machine.

struct Spot {
    double x = 0, y = 0; // pixels
};

// What fills the stage reaches a little over its edge, which players may round either way.
constexpr double kLeft = -4, kTop = -4, kRight = 644, kBottom = 484;

inline S32 Twips(double pixels)
{
    return RoundSteadily(pixels * 20);
}

inline Mat At(double x, double y)
{
    return Mat::Translate(Twips(x), Twips(y));
}

// Scaled, then turned, then moved to (x, y).
Mat Pose(double x, double y, double scaleX, double scaleY, double degrees = 0);

// 0xRRGGBB and an opacity of 0..255.
Rgba Hex(U32 rgb, int alpha = 255);

// Gradients over pixel areas: downwards from y0 to y1, rightwards from x0 to x1, and round ones.
Fill Down(double y0, double y1, std::vector<Stop> stops);
Fill Across(double x0, double x1, std::vector<Stop> stops);
Fill Glow(double x, double y, double radius, std::vector<Stop> stops);
Fill OvalGlow(double x, double y, double radiusX, double radiusY, std::vector<Stop> stops);

// 0 before `from`, 1 after `to`, smooth between.
double Ease(double from, double to, double t);
// A smooth bump: 0 outside `middle` +- `width`, 1 at the middle.
double Bump(double middle, double width, double t);
double Blend(double a, double b, double t);
double Turns(double fraction); // sine of that part of a whole turn

// A fixed sequence of numbers that look random, the same in every run.
class Dice {
public:
    explicit Dice(U32 seed) : state(seed) {}
    double Between(double low, double high);

private:
    U32 state;
};

// Draws one shape in pixels. Each Paint begins a colour that lies above the earlier ones; outlines
// that follow belong to it, and where they overlap each other they cut holes.
class Drawing {
public:
    Drawing& Paint(const Fill& fill);
    Drawing& Paint(Rgba color) { return Paint(Fill::Solid(color)); }

    Drawing& Move(double x, double y);
    Drawing& Line(double x, double y);
    Drawing& Curve(double controlX, double controlY, double x, double y);
    // A line to the arc's start, then along it; angles in degrees, clockwise from the right.
    Drawing& Arc(double x, double y, double radius, double from, double to);
    Drawing& Close();

    Drawing& Rect(double x0, double y0, double x1, double y1);
    Drawing& RoundRect(double x0, double y0, double x1, double y1, double radius);
    Drawing& Circle(double x, double y, double radius) { return Ellipse(x, y, radius, radius); }
    Drawing& Ellipse(double x, double y, double radiusX, double radiusY);
    Drawing& Polygon(const std::vector<Spot>& corners);
    Drawing& Blob(const std::vector<Spot>& pulls); // smooth and closed, drawn towards each spot
    // Smooth from the first spot to the last, then straight down to the base and back.
    Drawing& Ridge(const std::vector<Spot>& spots, double base);

    ShapeBuilder& Builder() { return shape; }
    const ShapeBuilder& Shape() const { return shape; }

private:
    ShapeBuilder shape;
};

// Keeps what stands at each depth of a timeline and writes the place, move and remove tags that
// lead from one frame to the next. Call Put for every actor of the frame, then Next.
class Stage {
public:
    explicit Stage(TagWriter& timeline) : out(timeline) {}

    void Put(U16 depth, U16 character, const Mat& mat, const Cx& cx = {}, U16 clipDepth = 0);
    void Drop(U16 depth); // no effect when nothing stands there
    void Next() { out.Show(); }

private:
    struct Standing {
        U16 character = 0;
        Mat mat;
        Cx cx;
    };
    TagWriter& out;
    std::map<U16, Standing> actors;
};

// A sprite of `frames` frames in which one character turns about its own origin; `degrees` is the
// whole way, a full turn or a part after which the character looks the same again.
TagWriter TurningSprite(U16 character, int frames, double degrees);

// The movies, one file each.
std::vector<U8> MakeViaduct();
std::vector<U8> MakeClockwork();
std::vector<U8> MakeShapes();
std::vector<U8> MakePoster();
std::vector<U8> MakeGallery();
std::vector<U8> MakeMetamorphosis();
std::vector<U8> MakeOrchard();
std::vector<U8> MakeOrchardEnd(); // which the orchard loads
std::vector<U8> MakeForm();
// Takes the packed images out of the movie as it was written before, when there is one: packing
// libraries need not give the same bytes everywhere.
std::vector<U8> MakeAlbum(const std::vector<U8>& earlier);
