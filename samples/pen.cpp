#include "samples/pen.h"

#include "tests/support/byte_writer.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <string>

namespace {

struct Vec {
    double x = 0, y = 0;
};

Vec operator+(Vec a, Vec b)
{
    return {a.x + b.x, a.y + b.y};
}

Vec operator-(Vec a, Vec b)
{
    return {a.x - b.x, a.y - b.y};
}

Vec operator*(Vec a, double k)
{
    return {a.x * k, a.y * k};
}

double Cross(Vec a, Vec b)
{
    return a.x * b.y - a.y * b.x;
}

// A part of a stroke's middle line and the pen's width at both ends.
struct Part {
    Vec p[4]; // a cubic
    double from, to;
    bool straight;

    Vec At(double t) const
    {
        double s = 1 - t;
        return p[0] * (s * s * s) + p[1] * (3 * s * s * t) + p[2] * (3 * s * t * t) +
               p[3] * (t * t * t);
    }
    Vec Heading(double t) const
    {
        double s = 1 - t;
        return (p[1] - p[0]) * (s * s) + (p[2] - p[1]) * (2 * s * t) + (p[3] - p[2]) * (t * t);
    }
};

// How far a quarter turn's handles reach: a little squarer than an oval.
constexpr double kReach = 0.58;
// A curve of the middle line becomes so many edges on either side.
constexpr int kSteps = 3;

// One side of a stroke or a whole contour while it is being made.
struct Side {
    std::vector<Vec> ends;     // one more than there are edges
    std::vector<Vec> controls; // the middle of a straight edge
    std::vector<bool> curved;
};

class Pen {
public:
    Pen(const PenPlace& where, std::vector<GlyphContour>* contours) : place(where), out(contours) {}
    void Draw(std::string_view text);

private:
    double Number();
    Vec Place();
    bool AtNumber();
    void Word(char word);
    void SetDown(Vec to);
    void Add(Vec a, Vec b, Vec c, bool straight);
    void Quarter(bool level);
    void Ring(Vec middle, Vec radius);
    static Side Oval(Vec middle, Vec radius, double sense);
    void Lift();
    Vec Rim(const Part& part, double t, double side) const;
    Vec RimHeading(const Part& part, double t, double side) const;
    Side Trace(double side) const;
    void Emit(const Side& side);
    void EmitPolygon(std::vector<Vec> corners);

    PenPlace place;
    std::vector<GlyphContour>* out;
    std::string words;
    const char* at = nullptr;
    std::vector<Part> parts;
    Vec pen;
    double width = 1, last = 1;
};

double Pen::Number()
{
    char* end;
    double value = double(std::strtol(at, &end, 10));
    at = end;
    return value;
}

Vec Pen::Place()
{
    double x = Number(), y = Number();
    return {x, y};
}

bool Pen::AtNumber()
{
    while (*at == ' ')
        at++;
    return *at == '-' || (*at >= '0' && *at <= '9');
}

void Pen::Draw(std::string_view text)
{
    words = text;
    at = words.c_str();
    while (AtNumber() || *at)
        Word(*at++);
    Lift();
}

void Pen::Word(char word)
{
    switch (word) {
    case 'w':
        width = Number() / 100;
        break;
    case 'M':
        SetDown(Place());
        break;
    case 'L': {
        Vec to = Place(), third = (to - pen) * (1 / 3.0);
        Add(pen + third, to - third, to, true);
        break;
    }
    case 'c': {
        Vec a = Place(), b = Place(), c = Place();
        Add(a, b, c, false);
        break;
    }
    case 'h':
    case 'v':
        Quarter(word == 'h');
        break;
    case 'O': {
        Vec middle = Place(), radius = Place();
        Ring(middle, radius);
        break;
    }
    case 'D': {
        Vec middle = Place();
        double radius = Number() / 2, saved = width;
        width = 2 * radius / kNibWidth * 100 / place.percent; // so wide that no hole is left
        Ring(middle, {radius, radius});
        width = saved;
        break;
    }
    case 'B': {
        Vec a = Place(), b = Place();
        EmitPolygon({a, {b.x, a.y}, b, {a.x, b.y}});
        break;
    }
    case '/': {
        Vec a = Place(), b = Place(), half = {Number() / 2, 0};
        EmitPolygon({a - half, a + half, b + half, b - half});
        break;
    }
    case 'P': {
        std::vector<Vec> corners;
        while (AtNumber())
            corners.push_back(Place());
        EmitPolygon(corners);
        break;
    }
    }
}

void Pen::SetDown(Vec to)
{
    Lift();
    pen = to;
    last = width;
}

void Pen::Add(Vec a, Vec b, Vec c, bool straight)
{
    parts.push_back({{pen, a, b, c}, last, width, straight});
    pen = c;
    last = width;
}

void Pen::Quarter(bool level)
{
    Vec to = Place(), way = (to - pen) * kReach;
    Vec leave = level ? Vec{way.x, 0} : Vec{0, way.y};
    Vec arrive = level ? Vec{0, way.y} : Vec{way.x, 0};
    Add(pen + leave, to - arrive, to, false);
}

// Both rims are closed contours; the inner one, if there is room for it, is a hole.
void Pen::Ring(Vec middle, Vec radius)
{
    Lift();
    Vec nib = Vec{kNibWidth, kNibHeight} * (width * place.percent / 200);
    if (nib.x > radius.x - 1) // a disc: as high as wide
        nib.y = nib.x;
    Emit(Oval(middle, radius + nib, 1));
    if (nib.x < radius.x - 1 && nib.y < radius.y - 1)
        Emit(Oval(middle, radius - nib, -1));
}

// Four quarter turns, the way strokes go round when `sense` is 1, else the other.
Side Pen::Oval(Vec middle, Vec radius, double sense)
{
    const Vec tips[] = {
        {radius.x, 0}, {0, sense * radius.y}, {-radius.x, 0}, {0, -sense * radius.y}};
    Side whole;
    whole.ends = {middle + tips[0]};
    for (int i = 0; i < 4 * kSteps; i++) {
        Vec a = tips[i / kSteps], c = tips[(i / kSteps + 1) % 4], corner = a + c;
        Part turn = {{a, a + (corner - a) * kReach, c + (corner - c) * kReach, c}, 1, 1, false};
        double t0 = i % kSteps / double(kSteps), t1 = (i % kSteps + 1) / double(kSteps);
        Vec h0 = turn.Heading(t0), h1 = turn.Heading(t1), gap = turn.At(t1) - turn.At(t0);
        whole.controls.push_back(middle + turn.At(t0) + h0 * (Cross(gap, h1) / Cross(h0, h1)));
        whole.ends.push_back(middle + turn.At(t1));
        whole.curved.push_back(true);
    }
    return whole;
}

// The place on the nib's edge that lies farthest to one side of where the pen is heading.
Vec Pen::Rim(const Part& part, double t, double side) const
{
    Vec heading = part.Heading(t), normal = Vec{heading.y, -heading.x} * side;
    double half = (part.from + (part.to - part.from) * t) * place.percent / 200;
    Vec reach = {kNibWidth * kNibWidth * normal.x, kNibHeight * kNibHeight * normal.y};
    double length = std::sqrt(reach.x * normal.x + reach.y * normal.y);
    return part.At(t) + reach * (half / length);
}

Vec Pen::RimHeading(const Part& part, double t, double side) const
{
    const double kStep = 1 / 256.0;
    double before = std::max(0.0, t - kStep), after = std::min(1.0, t + kStep);
    return Rim(part, after, side) - Rim(part, before, side);
}

Side Pen::Trace(double side) const
{
    Side trace;
    trace.ends.push_back(Rim(parts[0], 0, side));
    for (const Part& part : parts) {
        int steps = part.straight ? 1 : kSteps;
        for (int i = 0; i < steps; i++) {
            double t0 = i / double(steps), t1 = (i + 1) / double(steps);
            Vec from = trace.ends.back(), to = Rim(part, t1, side);
            Vec h0 = RimHeading(part, t0, side), h1 = RimHeading(part, t1, side);
            double turn = Cross(h0, h1), along = turn != 0 ? Cross(to - from, h1) / turn : 0;
            Vec control = from + h0 * along, gap = to - from;
            double size = std::fabs(gap.x) + std::fabs(gap.y);
            Vec off = control - (from + gap * 0.5);
            // Nearly straight pieces have no crossing of their tangents worth using.
            bool usable = along > 0 && std::fabs(off.x) + std::fabs(off.y) < size;
            trace.controls.push_back(usable ? control : from + gap * 0.5);
            trace.curved.push_back(usable && !part.straight);
            trace.ends.push_back(to);
        }
    }
    return trace;
}

// A stroke's outline: one side forwards, the other one back.
void Pen::Lift()
{
    if (parts.empty())
        return;
    Side whole = Trace(1), back = Trace(-1);
    whole.ends.push_back(back.ends.back());
    whole.controls.push_back(back.ends.back());
    whole.curved.push_back(false);
    for (size_t i = back.controls.size(); i-- > 0;) {
        whole.ends.push_back(back.ends[i]);
        whole.controls.push_back(back.controls[i]);
        whole.curved.push_back(back.curved[i]);
    }
    Emit(whole);
    parts.clear();
}

void Pen::Emit(const Side& side)
{
    auto x = [&](Vec v) { return RoundSteadily(v.x + place.dx); };
    auto y = [&](Vec v) { return -RoundSteadily(v.y + place.dy); };
    GlyphContour contour = {x(side.ends[0]), y(side.ends[0]), {}};
    for (size_t i = 0; i < side.controls.size(); i++)
        contour.edges.push_back({side.curved[i], x(side.controls[i]), y(side.controls[i]),
                                 x(side.ends[i + 1]), y(side.ends[i + 1])});
    GlyphEdge& end = contour.edges.back();
    if (end.x != contour.x || end.y != contour.y)
        contour.edges.push_back({false, 0, 0, contour.x, contour.y});
    out->push_back(contour);
}

// Corners may come either way round; they go out the way strokes do.
void Pen::EmitPolygon(std::vector<Vec> corners)
{
    Lift();
    double area = 0;
    for (size_t i = 0; i < corners.size(); i++)
        area += Cross(corners[i], corners[(i + 1) % corners.size()]);
    if (area < 0)
        std::reverse(corners.begin(), corners.end());
    Side whole;
    whole.ends = {corners[0]};
    for (size_t i = 1; i < corners.size(); i++) {
        whole.ends.push_back(corners[i]);
        whole.controls.push_back(corners[i]);
        whole.curved.push_back(false);
    }
    Emit(whole);
}

} // namespace

void DrawWithPen(std::string_view words, const PenPlace& place, std::vector<GlyphContour>* out)
{
    Pen(place, out).Draw(words);
}
