#include "samples/album_pictures.h"

#include "samples/scene.h"

#include <algorithm>
#include <cmath>

namespace {

struct Tone { // channels 0..1
    double r = 0, g = 0, b = 0;
};

Tone operator+(Tone p, Tone q)
{
    return {p.r + q.r, p.g + q.g, p.b + q.b};
}

Tone operator*(Tone p, double k)
{
    return {p.r * k, p.g * k, p.b * k};
}

Tone Mix(Tone p, Tone q, double t)
{
    t = std::clamp(t, 0.0, 1.0);
    return p * (1 - t) + q * t;
}

Tone Of(U32 rgb)
{
    return {(rgb >> 16) / 255.0, (rgb >> 8 & 255) / 255.0, (rgb & 255) / 255.0};
}

U32 Byte(double v)
{
    return U32(std::clamp(RoundSteadily(v * 255), 0, 255));
}

U32 Packed(Tone tone, double alpha = 1)
{
    tone = tone * alpha;
    return Byte(alpha) << 24 | Byte(tone.r) << 16 | Byte(tone.g) << 8 | Byte(tone.b);
}

double Light(U32 pixel)
{
    Tone tone = Of(pixel & 0xFFFFFF);
    return tone.r * 0.3 + tone.g * 0.59 + tone.b * 0.11;
}

// Calls paint(x, y) for every pixel.
template <class Paint>
ImageSource Make(int width, int height, int format, std::vector<Rgba> table, Paint paint)
{
    ImageSource image{width, height, {}, format, table};
    for (int y = 0; y < height; y++)
        for (int x = 0; x < width; x++)
            image.pixels.push_back(paint(x, y));
    return image;
}

// --- noise ------------------------------------------------------------------------------------

double Grain(int x, int y)
{
    U32 h = U32(x) * 0x9E3779B1u ^ U32(y) * 0x85EBCA6Bu;
    h = (h ^ h >> 15) * 0x2C1B3C6Du;
    h = (h ^ h >> 12) * 0x297A2D39u;
    return double((h ^ h >> 15) >> 8) / double(1 << 24);
}

// Smooth, 0..1, with a grain at every whole place; repeats after `period` when there is one.
double Noise(double x, double y, int period = 0)
{
    double left = std::floor(x), top = std::floor(y);
    double u = Ease(0, 1, x - left), v = Ease(0, 1, y - top);
    auto at = [&](int dx, int dy) {
        int column = int(left) + dx, row = int(top) + dy;
        return period ? Grain((column % period + period) % period, (row % period + period) % period)
                      : Grain(column, row);
    };
    return Blend(Blend(at(0, 0), at(1, 0), u), Blend(at(0, 1), at(1, 1), u), v);
}

double Clouds(double x, double y, int octaves = 5, int period = 0)
{
    double sum = 0, weight = 0.5;
    for (int i = 0; i < octaves; i++, weight /= 2) {
        sum += weight * Noise(x, y, period);
        x *= 2, y *= 2, period *= 2;
    }
    return sum / (1 - 2 * weight);
}

// --- photographs ------------------------------------------------------------------------------

constexpr int kWide = 176, kHigh = 132;

Tone DawnSky(double x, double y)
{
    Tone sky = y < 0.3 ? Mix(Of(0x29407c), Of(0x8a6fa8), y / 0.3)
                       : Mix(Of(0x8a6fa8), Of(0xffb98a), (y - 0.3) / 0.28);
    double dx = x - 0.64, dy = (y - 0.47) * 0.75, glow = std::exp(-(dx * dx + dy * dy) * 30);
    double cloud = Clouds(x * 3, y * 14 + 3);
    sky = Mix(sky, Of(0xffd9c0), Ease(0.5, 0.8, cloud) * 0.7);
    return sky + Of(0xffc070) * (glow * 0.75);
}

// Ranges one behind the other; the farther, the hazier.
Tone DawnLand(double x, double y, double shore)
{
    Tone tone = DawnSky(x, y);
    const U32 colors[] = {0x9a86b0, 0x6a5f94, 0x3f4674, 0x1d2c40};
    for (int i = 0; i < 4; i++) {
        double peak = Clouds(x * (2.2 + i) + i * 9.3, i * 5.0, 6), height = 0.34 - 0.075 * i;
        if (y > shore - height * peak - 0.012)
            tone = Mix(Of(colors[i]), Of(0xe8b8a8), (y - shore + height * peak) * (1.5 - i * 0.4));
    }
    return tone;
}

Tone Lake(double x, double y)
{
    const double shore = 0.6;
    if (y < shore)
        return DawnLand(x, y, shore);
    double depth = y - shore, ripple = Noise(x * 7, depth * 90 / (depth + 0.25)) - 0.5;
    Tone mirrored =
        DawnLand(x + ripple * 0.03 * depth, shore - depth * 1.05 + ripple * 0.05, shore);
    return Mix(mirrored, Of(0x22304e), 0.16 + depth * 0.9) + Of(0xffc890) * (ripple * depth * 0.5);
}

Tone Nebula(double x, double y)
{
    double px = x * 3.2, py = y * 2.4;
    double warp = Clouds(px + 4, py + 1), twist = Clouds(px + 3 * warp, py + 9);
    double gas = Clouds(px + 2.6 * twist, py + 2.2 * warp, 6);
    Tone tone = Mix(Of(0x070a24), Of(0x3a1a68), Ease(0.25, 0.55, gas));
    tone = Mix(tone, Of(0xd0407a), Ease(0.45, 0.72, gas) * Ease(0.3, 0.7, twist));
    tone = tone + Of(0x2a9ab8) * (Ease(0.42, 0.8, warp) * Ease(0.3, 0.7, gas) * 0.9);
    tone = tone + Of(0xffd8a0) * Ease(0.6, 0.82, gas);
    for (int i = 0; i < 70; i++) {
        double dx = (x - Grain(i, 1)) * kWide, dy = (y - Grain(i, 2)) * kHigh,
               far = dx * dx + dy * dy;
        double size = Grain(i, 3) * Grain(i, 4) * 1.6 + 0.3;
        if (far < 120)
            tone = tone + Mix(Of(0xffe8c8), Of(0xc8dcff), Grain(i, 5)) * std::exp(-far / size);
        if (size > 1.1 && far < 120) // the large ones have rays
            tone = tone + Tone{1, 1, 1} * (0.8 * std::exp(-std::fabs(dx * dy) - far / 26));
    }
    return tone;
}

Tone Dunes(double x, double y)
{
    Tone tone = Mix(Of(0x2f7fc0), Of(0xf6d9b0), y * 2.6);
    for (int i = 0; i < 5; i++) {
        double foot = 0.34 + i * 0.15, wave = Clouds(x * 1.6 + i * 3.7, i * 2.0, 3);
        double crest = foot - 0.22 * wave + 0.05 * Turns(x * 0.9 + i * 0.31);
        if (y < crest)
            continue;
        // The wind side is lit; behind the crest's edge lies the shadow.
        double edge = x + 0.5 * (y - crest) + 0.12 * Turns(y * 1.3 + i * 0.4);
        double lit = Ease(0.0, 0.05, std::fabs(edge * 1.7 - std::floor(edge * 1.7) - 0.5) - 0.2);
        double ripples = 0.03 * Turns((y - crest) * 22 + 5 * wave + 2 * x);
        tone = Mix(Of(0x8a4a34), Of(0xf4b46a), 0.25 + 0.75 * lit) * (0.9 + 0.03 * i + ripples);
        tone = Mix(tone, Of(0xf6d9b0), 0.4 - 0.1 * i);
    }
    return tone;
}

ImageSource Photograph(Tone (*paint)(double x, double y))
{
    return Make(kWide, kHigh, 5, {},
                [&](int x, int y) { return Packed(paint((x + 0.5) / kWide, (y + 0.5) / kHigh)); });
}

// How much of a pixel lies inside an edge that is `inside` pixels away.
double Coverage(double inside)
{
    return std::clamp(inside + 0.5, 0.0, 1.0);
}

std::vector<Rgba> Ramp(U32 from, U32 to, int count)
{
    std::vector<Rgba> table;
    for (int i = 0; i < count; i++) {
        U32 c = Packed(Mix(Of(from), Of(to), i / (count - 1.0)));
        table.push_back({U8(c >> 16), U8(c >> 8), U8(c)});
    }
    return table;
}

} // namespace

ImageSource PaintLake()
{
    return Photograph(Lake);
}

ImageSource PaintNebula()
{
    return Photograph(Nebula);
}

ImageSource PaintDunes()
{
    return Photograph(Dunes);
}

ImageSource PaintPlanet()
{
    const double radius = 46, middle = 50;
    return Make(100, 100, 5, {}, [&](int px, int py) {
        double x = (px + 0.5 - middle) / radius, y = (py + 0.5 - middle) / radius;
        double far = x * x + y * y, z = std::sqrt(std::max(0.0, 1 - far));
        double swirl = Clouds(x * 2 + z * 2 + 5, y * 3 + 2);
        double band = 0.5 + 0.5 * Turns(y * 1.7 + 0.35 * swirl + 0.1 * x);
        Tone tone = Mix(Of(0xb8643a), Of(0xf6dfb4), band + 0.5 * (Clouds(x * 7, y * 24) - 0.5));
        double sx = (x - 0.2) / 0.26, sy = (y - 0.32) / 0.13;
        tone = Mix(tone, Of(0xc03a24), Ease(1.2, 0.2, sx * sx + sy * sy));
        double light = std::clamp(-0.55 * x - 0.5 * y + 0.67 * z, 0.0, 1.0);
        return Packed(tone * (0.12 + 1.0 * light), Coverage(radius * (1 - std::sqrt(far))));
    });
}

// Each pixel's error goes on to those that follow, so that greys become patterns.
ImageSource PaintWoodcut()
{
    ImageSource lake = PaintLake();
    std::vector<double> light;
    for (U32 pixel : lake.pixels)
        light.push_back(Ease(0.12, 0.86, Light(pixel)));
    ImageSource image =
        Make(kWide, kHigh, 0, {{0x2a, 0x1e, 0x18}, {0xfb, 0xf4, 0xe2}}, [&](int x, int y) {
            size_t at = size_t(y * kWide + x);
            bool bright = light[at] > 0.5;
            double error = light[at] - bright;
            const int spread[4][3] = {{1, 0, 7}, {-1, 1, 3}, {0, 1, 5}, {1, 1, 1}};
            for (const auto& [dx, dy, part] : spread)
                if (x + dx >= 0 && x + dx < kWide && y + dy < kHigh)
                    light[at + size_t(dy * kWide + dx)] += error * part / 16;
            return U32(bright);
        });
    return image;
}

ImageSource PaintHandheld()
{
    const std::vector<Rgba> greens = {
        {0x14, 0x34, 0x24}, {0x34, 0x64, 0x3c}, {0x84, 0xa4, 0x2c}, {0xc4, 0xd4, 0x54}};
    const int order[4][4] = {{0, 8, 2, 10}, {12, 4, 14, 6}, {3, 11, 1, 9}, {15, 7, 13, 5}};
    return Make(80, 72, 1, greens, [&](int x, int y) {
        double light = Light(Packed(Dunes((x + 0.5) / 80, (y + 0.5) / 72))) * 1.25 - 0.12;
        double step = std::clamp(light * 3 + (order[y % 4][x % 4] + 0.5) / 16 - 0.5, 0.0, 3.0);
        return U32(RoundSteadily(step));
    });
}

ImageSource PaintAzulejo()
{
    const int size = 40;
    return Make(size, size, 2, Ramp(0x163f8a, 0xf8f4ea, 16), [&](int px, int py) {
        double x = (px + 0.5) / size * 2 - 1, y = (py + 0.5) / size * 2 - 1;
        double far = std::sqrt(x * x + y * y), turn = std::atan2(y, x) / 6.283185307179586;
        double corner = std::sqrt((1 - std::fabs(x)) * (1 - std::fabs(x)) +
                                  (1 - std::fabs(y)) * (1 - std::fabs(y)));
        double petals = 0.42 + 0.2 * std::fabs(Turns(turn * 4)) - far;
        double rings = std::max(0.07 - std::fabs(corner - 0.62), 0.24 - corner);
        double ink = std::max({std::min(petals, far - 0.26), rings, 0.13 - far});
        double joint = 0.97 - std::max(std::fabs(x), std::fabs(y));
        return U32(RoundSteadily(15 - 15 * Ease(-0.05, 0.05, std::max(ink, -joint * 3))));
    });
}

ImageSource PaintWood()
{
    const int size = 128, plank = 32;
    return Make(size, size, 3, Ramp(0x52301a, 0xc08a54, 64), [&](int x, int y) {
        int row = y / plank, start = int(Grain(row, 77) * size);
        double u = (x + row * 51) % size / double(size), v = y % plank / double(plank);
        double knot = Noise(u * 4, row * 3 + 0.5, 4), fibre = Noise(u * 8, y * 1.0, 128);
        double rings = 0.5 + 0.5 * Turns((v * 2 + knot * 2.4 + row * 0.37) * 1.5);
        double tone = 0.34 + 0.22 * Grain(row, 9) + 0.2 * rings + 0.24 * fibre;
        bool gap = y % plank == 0 || (x + start) % size == 0;
        return U32(RoundSteadily(gap ? 2.0 : 63 * std::clamp(tone - 0.1, 0.0, 1.0)));
    });
}

ImageSource PaintSunset()
{
    return Make(112, 84, 4, {}, [](int px, int py) {
        double x = px / 112.0, y = py / 84.0;
        Tone tone = y < 0.5 ? Mix(Of(0x30206a), Of(0xe8486a), y * 2)
                            : Mix(Of(0xe8486a), Of(0xffc84a), (y - 0.5) * 3.2);
        double dx = (x - 0.5) * 112, dy = (y - 0.5) * 84;
        double stripe = std::fmod(y * 16, 1.0), gap = Ease(0.42, 0.8, y) * 0.6;
        if (stripe > gap)
            tone = Mix(tone, Mix(Of(0xfff27a), Of(0xff6a5a), (y - 0.2) * 1.6),
                       Coverage(27 - std::sqrt(dx * dx + dy * dy)));
        if (y > 0.78) { // a floor of lines that run to the horizon
            double depth = 0.06 / (y - 0.76), column = (x - 0.5) * (y - 0.7) * -20 / (y - 0.76);
            double line = std::max(std::fabs(std::fmod(depth * 6, 1.0) - 0.5),
                                   std::fabs(std::fmod(std::fabs(column / 6), 1.0) - 0.5));
            tone = Mix(Of(0x1a0f3a), Of(0xff5ad0), Ease(0.38, 0.5, line));
        }
        U32 p = Packed(tone);
        return (p >> 19 & 31) << 10 | (p >> 11 & 31) << 5 | (p >> 3 & 31);
    });
}

ImageSource PaintFlower()
{
    return Make(64, 64, 5, {}, [](int px, int py) {
        double x = (px - 31.5) / 30, y = (py - 31.5) / 30, far = std::sqrt(x * x + y * y);
        double turn = std::atan2(y, x) / 6.283185307179586;
        Tone tone = Mix(Of(0x2f6a4a), Of(0x17402f), far * 0.8);
        double rim = 0.62 + 0.3 * std::fabs(Turns(turn * 2.5 + 0.05));
        double vein = 0.8 + 0.2 * Turns(turn * 40);
        Tone petal = Mix(Of(0xfff0a0), Of(0xe83a6a), Ease(0.1, 0.5, far)) * (0.86 + 0.14 * vein);
        tone = Mix(tone, Mix(petal, Of(0xffd0e0), Ease(rim - 0.2, rim, far)),
                   Coverage((rim - far) * 30));
        Tone heart = Mix(Of(0xffd23a), Of(0x8a4a10), Clouds(x * 14 + 7, y * 14 + 7, 2) + far - 0.3);
        return Packed(Mix(tone, heart, Coverage((0.2 - far) * 30)));
    });
}

ImageSource PaintStripes()
{
    return Make(16, 16, 0, {{170, 60, 60, 190}, {160, 150, 130, 170}},
                [](int x, int y) { return U32((x + y) / 8 % 2); });
}

ImageSource PaintDots()
{
    const std::vector<Rgba> table = {
        {40, 110, 120, 180}, {90, 140, 140, 190}, {200, 200, 180, 210}, {230, 228, 215, 235}};
    return Make(16, 16, 1, table, [](int x, int y) {
        double far = 1e3;
        const int places[5][2] = {{4, 4}, {12, 12}, {12, -4}, {-4, 12}, {20, 4}};
        for (const auto& place : places)
            far = std::min(far, std::hypot(x + 0.5 - place[0], y + 0.5 - place[1]));
        return U32(RoundSteadily(3 * Coverage((3.2 - far) * 0.7)));
    });
}

ImageSource PaintLocomotive()
{
    static const char* const rows[] = {
        "....sss.............", "..sssSSs............", "...sS.....kkkkkkkkk.",
        "....kk....kkkkkkkkk.", "....kk.....bbbbbbb..", "....kk..y..bwwbwwb..",
        "...kkkk.yy.bwWbwWb..", "..grrrrrrrrbbbbbbb..", ".grrGGrrrrrbbbbbbb..",
        "ygrGrrrrrrrbdbbbdb..", "ygrrrrrrrrrbbbbbbb..", ".kkkkkkkkkkkkkkkkkkk",
        "kk.oooo.oooo..oooo..", "k..okko.okko..okko..", "...oooo.oooo..oooo.."};
    static const char letters[] = ".ksSrgGbdwWyo";
    const std::vector<Rgba> table = {
        {0, 0, 0, 0},       {34, 30, 44, 255},    {120, 120, 120, 130}, {150, 150, 150, 170},
        {200, 52, 44, 255}, {240, 190, 80, 255},  {255, 150, 130, 255}, {40, 90, 160, 255},
        {24, 60, 120, 255}, {250, 240, 190, 255}, {255, 250, 230, 255}, {255, 210, 70, 255},
        {96, 84, 110, 255}};
    return Make(20, 15, 2, table,
                [](int x, int y) { return U32(std::string_view(letters).find(rows[y][x])); });
}

// The table's entries are one brown, less and less translucent.
ImageSource PaintCoffee()
{
    std::vector<Rgba> table;
    for (U32 a = 0; a < 160; a++)
        table.push_back({U8(a * 70 / 255), U8(a * 36 / 255), U8(a * 14 / 255), U8(a)});
    return Make(96, 96, 3, table, [](int px, int py) {
        double x = px - 47.5, y = py - 47.5, turn = std::atan2(y, x) / 6.283185307179586;
        double wobble = 1.5 * Turns(turn * 3) + 2 * (Clouds(px / 12.0, py / 12.0) - 0.5);
        double far = std::sqrt(x * x + y * y) - 40 - wobble;
        double stain = std::exp(-far * far / 3) * (0.5 + 0.5 * Noise(px / 9.0, py / 9.0));
        double inner = Ease(-16, -2, far) * Ease(2, -2, far) * 0.3;
        for (int i = 0; i < 4; i++) { // drops
            double dx = px - 96 * Grain(i, 41), dy = py - 96 * Grain(i, 42);
            stain += 0.7 * Coverage(1.5 + 2 * Grain(i, 43) - std::sqrt(dx * dx + dy * dy));
        }
        return U32(RoundSteadily(159 * std::clamp(stain * 1.2 + inner * 1.3, 0.0, 1.0)));
    });
}

ImageSource PaintBubble()
{
    const double radius = 38, middle = 40;
    return Make(80, 80, 5, {}, [&](int px, int py) {
        double x = (px + 0.5 - middle) / radius, y = (py + 0.5 - middle) / radius;
        double far = std::sqrt(x * x + y * y);
        double film = std::clamp(far, 0.0, 1.0), hue = film * film * 1.3 + 0.15 * x - 0.2 * y;
        Tone tone = {0.6 + 0.4 * Turns(hue), 0.6 + 0.4 * Turns(hue + 0.33),
                     0.6 + 0.4 * Turns(hue + 0.67)};
        double alpha = 0.08 + 0.75 * film * film * film;
        double dx = x + 0.42, dy = y + 0.46, shine = std::exp(-(dx * dx * 18 + dy * dy * 34));
        double ex = x - 0.5, ey = y - 0.5, echo = 0.6 * std::exp(-(ex * ex + ey * ey) * 40);
        tone = Mix(tone, {1, 1, 1}, shine + echo);
        alpha = std::min(1.0, alpha + shine + echo);
        return Packed(tone, alpha * Coverage((1 - far) * radius));
    });
}
