#include "samples/scene.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

static const double kPi = 3.14159265358979323846;

Mat Pose(double x, double y, double scaleX, double scaleY, double degrees)
{
    return Mat::Scale(scaleX, scaleY).Then(Mat::Rotate(degrees)).Then(At(x, y));
}

Rgba Hex(U32 rgb, int alpha)
{
    return {U8(rgb >> 16), U8(rgb >> 8), U8(rgb), U8(alpha)};
}

// A linear gradient does not change along its other side. A long side keeps the direction exact
// when the shape turns: the matrix's entries are 16.16, and those of a few pixels are coarse.
static const S32 kFarAcross = 640 * 20;

Fill Down(double y0, double y1, std::vector<Stop> stops)
{
    Mat square = Mat::Gradient(0, Twips((y0 + y1) / 2), Twips(y1 - y0), kFarAcross, 90);
    return Fill::Linear(square, stops);
}

Fill Across(double x0, double x1, std::vector<Stop> stops)
{
    return Fill::Linear(Mat::Gradient(Twips((x0 + x1) / 2), 0, Twips(x1 - x0), kFarAcross), stops);
}

Fill Glow(double x, double y, double radius, std::vector<Stop> stops)
{
    return OvalGlow(x, y, radius, radius, stops);
}

Fill OvalGlow(double x, double y, double radiusX, double radiusY, std::vector<Stop> stops)
{
    Mat square = Mat::Gradient(Twips(x), Twips(y), Twips(radiusX * 2), Twips(radiusY * 2));
    return Fill::Radial(square, stops);
}

double Ease(double from, double to, double t)
{
    double u = std::clamp((t - from) / (to - from), 0.0, 1.0);
    return u * u * (3 - 2 * u);
}

double Bump(double middle, double width, double t)
{
    return Ease(middle - width, middle, t) * (1 - Ease(middle, middle + width, t));
}

double Blend(double a, double b, double t)
{
    return a + (b - a) * t;
}

double Turns(double fraction)
{
    return std::sin(fraction * 2 * kPi);
}

double Dice::Between(double low, double high)
{
    state = state * 1664525u + 1013904223u;
    return low + (high - low) * double(state >> 16) / 65536;
}

Drawing& Drawing::Paint(const Fill& fill)
{
    shape.Fill1(shape.AddFill(fill));
    return *this;
}

Drawing& Drawing::Move(double x, double y)
{
    shape.MoveTo(Twips(x), Twips(y));
    return *this;
}

Drawing& Drawing::Line(double x, double y)
{
    shape.LineTo(Twips(x), Twips(y));
    return *this;
}

Drawing& Drawing::Curve(double controlX, double controlY, double x, double y)
{
    shape.CurveTo(Twips(controlX), Twips(controlY), Twips(x), Twips(y));
    return *this;
}

Drawing& Drawing::Arc(double x, double y, double radius, double from, double to)
{
    auto place = [&](double degrees, double r) {
        return Spot{x + r * std::cos(degrees * kPi / 180), y + r * std::sin(degrees * kPi / 180)};
    };
    int pieces = std::max(1, int(std::ceil(std::fabs(to - from) / 45 - 0.001)));
    double step = (to - from) / pieces, outer = radius / std::cos(step / 2 * kPi / 180);
    Spot start = place(from, radius);
    Line(start.x, start.y);
    for (int i = 0; i < pieces; i++) {
        Spot control = place(from + (i + 0.5) * step, outer),
             end = place(from + (i + 1) * step, radius);
        Curve(control.x, control.y, end.x, end.y);
    }
    return *this;
}

Drawing& Drawing::Close()
{
    shape.Close();
    return *this;
}

Drawing& Drawing::Rect(double x0, double y0, double x1, double y1)
{
    shape.Rect(Twips(x0), Twips(y0), Twips(x1), Twips(y1));
    return *this;
}

Drawing& Drawing::RoundRect(double x0, double y0, double x1, double y1, double r)
{
    Move(x0 + r, y0).Line(x1 - r, y0).Curve(x1, y0, x1, y0 + r).Line(x1, y1 - r);
    Curve(x1, y1, x1 - r, y1).Line(x0 + r, y1).Curve(x0, y1, x0, y1 - r).Line(x0, y0 + r);
    return Curve(x0, y0, x0 + r, y0);
}

Drawing& Drawing::Ellipse(double x, double y, double radiusX, double radiusY)
{
    shape.Ellipse(Twips(x), Twips(y), Twips(radiusX), Twips(radiusY));
    return *this;
}

Drawing& Drawing::Polygon(const std::vector<Spot>& corners)
{
    Move(corners[0].x, corners[0].y);
    for (size_t i = 1; i < corners.size(); i++)
        Line(corners[i].x, corners[i].y);
    return Close();
}

static Spot Middle(Spot a, Spot b)
{
    return {(a.x + b.x) / 2, (a.y + b.y) / 2};
}

Drawing& Drawing::Blob(const std::vector<Spot>& pulls)
{
    size_t count = pulls.size();
    Spot start = Middle(pulls[count - 1], pulls[0]);
    Move(start.x, start.y);
    for (size_t i = 0; i < count; i++) {
        Spot end = Middle(pulls[i], pulls[(i + 1) % count]);
        Curve(pulls[i].x, pulls[i].y, end.x, end.y);
    }
    return *this;
}

Drawing& Drawing::Ridge(const std::vector<Spot>& spots, double base)
{
    Spot first = spots.front(), last = spots.back();
    Move(first.x, base).Line(first.x, first.y);
    for (size_t i = 1; i + 1 < spots.size(); i++) {
        Spot end = i + 2 == spots.size() ? last : Middle(spots[i], spots[i + 1]);
        Curve(spots[i].x, spots[i].y, end.x, end.y);
    }
    return Line(last.x, base).Close();
}

static bool Same(const Mat& p, const Mat& q)
{
    return p.a == q.a && p.b == q.b && p.c == q.c && p.d == q.d && p.tx == q.tx && p.ty == q.ty;
}

static bool Same(const Cx& p, const Cx& q)
{
    return std::equal(p.mul, p.mul + 4, q.mul) && std::equal(p.add, p.add + 4, q.add);
}

void Stage::Put(U16 depth, U16 character, const Mat& mat, const Cx& cx, U16 clipDepth)
{
    auto found = actors.find(depth);
    if (found != actors.end() && found->second.character != character) {
        Drop(depth);
        found = actors.end();
    }
    PlaceOptions tag{.move = found != actors.end()};
    Standing before = tag.move ? found->second : Standing{character, {}, {}};
    if (!tag.move)
        tag.character = character;
    if (!tag.move && clipDepth != 0)
        tag.clipDepth = clipDepth;
    if (!Same(before.mat, mat))
        tag.matrix = mat;
    if (!Same(before.cx, cx))
        tag.cx = cx;
    actors[depth] = {character, mat, cx};
    if (!tag.move || tag.matrix || tag.cx)
        out.Place2(depth, tag);
}

void Stage::Drop(U16 depth)
{
    if (actors.erase(depth) != 0)
        out.RemoveDepth(depth);
}

TagWriter TurningSprite(U16 character, int frames, double degrees)
{
    TagWriter tags;
    Stage stage(tags);
    for (int frame = 0; frame < frames; frame++) {
        stage.Put(1, character, Mat::Rotate(degrees * frame / frames));
        stage.Next();
    }
    return tags.End();
}
