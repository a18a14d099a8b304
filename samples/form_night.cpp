#include "samples/form.h"

// Behind the page: a clear night over the observatory, and the empty page itself.

namespace form {

static void DefineSky(TagWriter& movie)
{
    Drawing sky, band, star;
    sky.Paint(Down(0, 330,
                   {{0, Hex(0x060a24)},
                    {120, Hex(0x16255a)},
                    {200, Hex(0x44508c)},
                    {240, Hex(0x8a7aa0)},
                    {255, Hex(0xd0a090)}}));
    movie.DefineShape(kNight, sky.Rect(kLeft, kTop, kRight, kBottom).Shape(), 2);
    for (double wide : {1.0, 0.55}) {
        band.Paint(
            OvalGlow(0, 0, 330, 64 * wide,
                     {{0, Hex(0xb8c4ff, 70)}, {120, Hex(0x90a0f0, 30)}, {255, Hex(0x8090e0, 0)}}));
        band.Ellipse(0, 0, 330, 64 * wide);
    }
    movie.DefineShape(kMilkyWay, band.Shape());
    star.Paint(Glow(0, 0, 5, {{0, Hex(0xdfe9ff, 120)}, {255, Hex(0xdfe9ff, 0)}})).Circle(0, 0, 5);
    star.Paint(Hex(0xffffff, 240));
    star.Move(0, -3.4).Curve(0.2, -0.2, 3.4, 0).Curve(0.2, 0.2, 0, 3.4);
    star.Curve(-0.2, 0.2, -3.4, 0).Curve(-0.2, -0.2, 0, -3.4);
    movie.DefineShape(kStar, star.Shape());
}

// The last ones twinkle, each beginning a few frames later than the one before.
static void DefineStars(TagWriter& movie)
{
    TagWriter twinkle, stars;
    Stage stage(twinkle);
    for (int frame = 0; frame < 48; frame += 3) {
        double pulse = 0.5 + 0.5 * Turns(frame / 48.0);
        stage.Put(1, kStar, Mat::Scale(0.7 + 0.4 * pulse), Cx::Alpha(0.4 + 0.6 * pulse));
        stage.Next(), stage.Next(), stage.Next();
    }
    movie.DefineSprite(kTwinkle, twinkle.End());
    Dice dice(31);
    constexpr U16 kSteady = 72, kAll = 84;
    for (U16 i = 1; i <= kAll; i++) {
        double x = dice.Between(2, i % 3 ? 152 : 478), y = dice.Between(3, i % 3 ? 210 : 60);
        double size = dice.Between(0.25, 0.85);
        stars.Place(i > kSteady ? kTwinkle : kStar, i, Pose(x, y, size, size));
        if (i > kSteady)
            stars.Show(5);
    }
    stars.DoAction({0x07, 0x00}); // Stop
    movie.DefineSprite(kStars, stars.Show().End());
}

// Half of the rings, drawn round; they are laid down flat where they are placed.
static void DefineSaturn(TagWriter& movie)
{
    Drawing ring, planet;
    auto band = [&](double inner, double outer, Rgba color) {
        ring.Paint(color).Move(outer, 0).Arc(0, 0, outer, 0, 180).Line(-inner, 0);
        ring.Arc(0, 0, inner, 180, 0).Close();
    };
    band(25, 30, Hex(0xb8a078, 190));
    band(30, 38, Hex(0xf0dcae, 235));
    band(39.6, 45, Hex(0xd6bc8c, 215));
    movie.DefineShape(kRing, ring.Shape());
    planet.Paint(Glow(0, 0, 60, {{0, Hex(0xffe8b0, 80)}, {255, Hex(0xffe8b0, 0)}}));
    planet.Circle(0, 0, 60);
    planet.Paint(Down(-20, 20,
                      {{0, Hex(0xd8b684)},
                       {60, Hex(0xf4dca8)},
                       {100, Hex(0xdcb47c)},
                       {150, Hex(0xf8e6b8)},
                       {200, Hex(0xcfa268)},
                       {255, Hex(0xa87848)}}));
    planet.Ellipse(0, 0, 21, 19.5);
    planet.Paint(Glow(
        -8, -7, 34, {{0, Hex(0x1a1030, 0)}, {120, Hex(0x1a1030, 20)}, {255, Hex(0x1a1030, 190)}}));
    planet.Ellipse(0, 0, 21, 19.5);
    movie.DefineShape(kPlanet, planet.Shape());
    TagWriter saturn;
    saturn.Place(kRing, 1, Mat::Scale(1, -0.3))
        .Place(kPlanet, 2)
        .Place(kRing, 3, Mat::Scale(1, 0.3));
    movie.DefineSprite(kSaturn, saturn.Show().End());
}

static void DefineMeteors(TagWriter& movie)
{
    Drawing trail;
    trail.Paint(Across(-58, 2, {{0, Hex(0xffffff, 0)}, {255, Hex(0xffffff, 230)}}));
    trail.Move(-58, 0).Line(0, -1.2).Curve(2, 0, 0, 1.2).Close();
    movie.DefineShape(kMeteor, trail.Shape());
    TagWriter meteors;
    Stage stage(meteors);
    const Spot starts[] = {{20, 18}, {88, 34}, {4, 120}};
    for (const Spot& start : starts) {
        meteors.Show(60);
        for (int i = 0; i <= 12; i++) {
            double t = i / 12.0;
            stage.Put(1, kMeteor, Pose(start.x + 70 * t, start.y + 34 * t, 0.4 + t * 0.6, 1, 26),
                      Cx::Alpha(Turns(t / 2)));
            stage.Next();
        }
        stage.Drop(1);
    }
    movie.DefineSprite(kMeteors, meteors.Show(40).End());
}

static void DrawFirs(Drawing& d, double x, double y, double size)
{
    d.Paint(Hex(0x080d1c));
    for (int row = 0; row < 3; row++) {
        double top = y - size * (1 - 0.24 * row), half = size * (0.14 + 0.08 * row);
        double low = top + size * 0.5;
        d.Move(x, top).Curve(x + half * 0.3, low - size * 0.1, x + half, low);
        d.Curve(x, low + size * 0.06, x - half, low)
            .Curve(x - half * 0.3, low - size * 0.1, x, top);
    }
}

static void DefineHill(TagWriter& movie)
{
    Drawing hill;
    hill.Paint(Down(262, 330, {{0, Hex(0x2e3566)}, {255, Hex(0x232a54)}}));
    hill.Ridge(
        {{kLeft, 292}, {60, 296}, {130, 268}, {240, 296}, {330, 280}, {420, 300}, {kRight, 284}},
        kBottom);
    hill.Paint(Down(258, 360, {{0, Hex(0x1a2148)}, {255, Hex(0x0a0f26)}}));
    hill.Ridge(
        {{kLeft, 316}, {28, 274}, {72, 256}, {120, 276}, {170, 324}, {300, 330}, {kRight, 326}},
        kBottom);
    hill.Paint(Down(272, 360, {{0, Hex(0xd8b080, 170)}, {255, Hex(0x6a5a58, 60)}})); // the path
    hill.Move(72, 272).Line(79, 272).Curve(84, 296, 62, 312).Curve(40, 330, 58, 364).Line(30, 364);
    hill.Curve(20, 328, 50, 308).Curve(76, 294, 72, 272);
    const Spot firs[] = {{12, 306},  {27, 298}, {124, 300}, {141, 314},
                         {108, 292}, {4, 330},  {128, 346}};
    for (size_t i = 0; i < std::size(firs); i++)
        DrawFirs(hill, firs[i].x, firs[i].y, 26 + double(i * 7 % 15));
    movie.DefineShape(kHill, hill.Shape());
}

// Its origin is the middle of the dome; the slit is open towards Saturn.
static void DefineDome(TagWriter& movie)
{
    Drawing dome;
    dome.Paint(Across(-34, 34, {{0, Hex(0x5a6694)}, {90, Hex(0xc8d0ea)}, {255, Hex(0x3c4676)}}));
    dome.Rect(-34, 4, 34, 42);
    dome.Paint(Hex(0x2c3464, 90));
    for (double x : {-24, -8, 8, 24})
        dome.Rect(x - 0.6, 4, x + 0.6, 42);
    dome.Paint(
        Glow(-14, -18, 58, {{0, Hex(0xffffff)}, {110, Hex(0xb6c0e2)}, {255, Hex(0x38427a)}}));
    dome.Move(-37, 0).Arc(0, 0, 37, 180, 360).Close();
    dome.Paint(Glow(-3, -14, 36, {{0, Hex(0xffe9a8)}, {130, Hex(0xe89a48)}, {255, Hex(0x5a2c34)}}));
    dome.Move(-13, -3).Line(-15, -20).Arc(0, 0, 37, 246, 288).Line(8, -20).Line(7, -3).Close();
    dome.Paint(Across(-9, 4, {{0, Hex(0x8a94b8)}, {100, Hex(0x3a4270)}, {255, Hex(0x141a3c)}}));
    dome.Polygon({{-5.5, -6}, {2.5, -5.5}, {-0.5, -47}, {-9.5, -47.6}}); // the telescope
    dome.Polygon({{-11, -47}, {0.8, -46.2}, {1.2, -52.2}, {-10.8, -53}});
    dome.Paint(Down(-3, 6, {{0, Hex(0x9aa6cc)}, {255, Hex(0x39426e)}}))
        .RoundRect(-39, -3, 39, 5, 2);
    dome.Paint(Glow(3, 34, 22, {{0, Hex(0xfff2c0)}, {140, Hex(0xf2b050)}, {255, Hex(0xb06a30)}}));
    dome.Move(-4, 43).Line(-4, 27).Arc(3, 27, 7, 180, 360).Line(10, 43).Close();
    for (double x : {-20, 25}) {
        dome.Paint(
            Glow(x, 22, 9, {{0, Hex(0xffe9a8)}, {120, Hex(0xf2b458)}, {255, Hex(0xc87a38)}}));
        dome.Circle(x, 21, 5);
    }
    dome.Paint(Glow(3, 36, 40, {{0, Hex(0xffd890, 90)}, {255, Hex(0xffd890, 0)}}))
        .Circle(3, 36, 40);
    movie.DefineShape(kDome, dome.Shape());
}

void DefineNight(TagWriter& movie)
{
    DefineSky(movie);
    DefineStars(movie);
    DefineSaturn(movie);
    DefineMeteors(movie);
    DefineHill(movie);
    DefineDome(movie);
}

void PlaceNight(TagWriter& movie)
{
    movie.Place(kNight, 1).Place(kMilkyWay, 2, Pose(110, 96, 1, 1, -58)).Place(kStars, 3);
    movie.Place(kMeteors, 4).Place(kSaturn, 5, Pose(70, 98, 0.95, 0.95, -17));
    movie.Place(kDome, 6, At(75, 226)).Place(kHill, 7);
}

static void DrawCorner(Drawing& d, double x, double y)
{
    d.Move(x, y - 6).Curve(x + 0.6, y - 0.6, x + 6, y).Curve(x + 0.6, y + 0.6, x, y + 6);
    d.Curve(x - 0.6, y + 0.6, x - 6, y).Curve(x - 0.6, y - 0.6, x, y - 6);
}

// A frame `width` wide, drawn as one ring.
static void DrawFrame(Drawing& d, double inset, double width)
{
    for (double in : {inset, inset + width})
        d.Rect(kPageLeft + in, kPageTop + in, kPageRight - in, kPageBottom - in);
}

void DefinePage(TagWriter& movie)
{
    Drawing page;
    for (double far : {7.0, 5.0, 3.0}) // its shadow
        page.Paint(Hex(0x04061a, 60))
            .RoundRect(kPageLeft - 4 + far, kPageTop + far, kPageRight + far, kPageBottom + far + 2,
                       6);
    page.Paint(Hex(0x6a2f34))
        .RoundRect(kPageLeft - 5, kPageTop - 4, kPageRight + 5, kPageBottom + 5, 5);
    page.Paint(Hex(0x8a4a48)).RoundRect(kPageLeft - 5, kPageTop - 4, kPageRight + 5, kPageTop, 3);
    for (int sheet = 3; sheet >= 1; sheet--) // those below
        page.Paint(sheet % 2 ? Hex(0xd8c8a4) : Hex(0xf0e4c8))
            .Rect(kPageLeft, kPageTop, kPageRight + sheet, kPageBottom + sheet);
    page.Paint(
        Glow(290, 130, 330, {{0, Hex(0xfffaec)}, {150, Hex(0xfaf1d9)}, {255, Hex(0xead9b4)}}));
    page.Rect(kPageLeft, kPageTop, kPageRight, kPageBottom);
    page.Paint(Across(kPageLeft, kPageLeft + 26,
                      {{0, Hex(0x5a3c20, 110)}, {90, Hex(0x5a3c20, 30)}, {255, Hex(0x5a3c20, 0)}}));
    page.Rect(kPageLeft, kPageTop, kPageLeft + 26, kPageBottom);
    page.Paint(Hex(0xb08c4c, 150));
    DrawFrame(page, 6, 0.7);
    page.Paint(Hex(0xb08c4c, 90));
    DrawFrame(page, 8.4, 0.5);
    page.Paint(Hex(0xb08c4c));
    for (double x : {kPageLeft + 7.4, kPageRight - 7.4})
        for (double y : {kPageTop + 7.4, kPageBottom - 7.4})
            DrawCorner(page, x, y);
    movie.DefineShape(kPage, page.Shape());
}

} // namespace form
