#include "samples/album_pictures.h"
#include "samples/scene.h"

#include <algorithm>
#include <map>

// Photographs and prints on a table: every kind of image, tiled and clipped, turned, larger and
// smaller than its pixels, through colour transforms.

namespace {

constexpr int kFrames = 120;

enum Id : U16 {
    kLake = 1, // images
    kNebula,
    kDunes,
    kPlanet,
    kWoodcut,
    kHandheld,
    kAzulejo,
    kWood,
    kSunset,
    kFlower,
    kStripes,
    kDots,
    kLocomotive,
    kCoffee,
    kBubble,
    kTable = 20, // shapes
    kCoaster,
    kStain,
    kSticker,
    kBall,
    kFilm,
    kPrint,
    kPrints,
    kStripesTape,
    kDotsTape,
    kShade,
    kCards = 40, // and one for each picture on paper
};

// --- images -------------------------------------------------------------------------------------

// The definitions of images that a movie holds, by code and body. The header is as long as ours.
using Images = std::vector<std::pair<int, std::vector<U8>>>;

bool IsImage(int code)
{
    return code == kTagDefineJPEGTables || code == kTagDefineBits || code == kTagDefineBitsJPEG2 ||
           code == kTagDefineBitsJPEG3 || code == kTagDefineBitsLossless ||
           code == kTagDefineBitsLossless2;
}

Images ImagesOf(const std::vector<U8>& movie)
{
    Images found;
    auto word = [&](size_t i) { return i + 1 < movie.size() ? movie[i] | movie[i + 1] << 8 : 0; };
    size_t at = MovieWriter().Bytes().size();
    while (at + 2 <= movie.size()) {
        size_t code = size_t(word(at)) >> 6, length = word(at) & 0x3F;
        at += 2;
        if (length == 0x3F)
            length = size_t(word(at)) | size_t(word(at + 2)) << 16, at += 4;
        if (at > movie.size() || length > movie.size() - at)
            break;
        if (IsImage(int(code)))
            found.push_back(
                {int(code), {movie.begin() + S64(at), movie.begin() + S64(at + length)}});
        at += length;
    }
    return found;
}

class Packer {
public:
    void Lossless(U16 id, const ImageSource& image, bool alpha)
    {
        Add(alpha ? kTagDefineBitsLossless2 : kTagDefineBitsLossless, id,
            LosslessBody(image, alpha));
    }
    // Code 6 takes its tables from the movie's, which stand in a tag of their own.
    void SharedJpeg(U16 id, const ImageSource& image)
    {
        JpegStreams jpeg = MakeJpeg(image);
        if (!tablesAreOut)
            images.push_back({kTagDefineJPEGTables, jpeg.tables});
        tablesAreOut = true;
        Add(kTagDefineBits, id, jpeg.image);
    }
    void Jpeg(U16 id, const ImageSource& image)
    {
        Add(kTagDefineBitsJPEG2, id, MakeJpeg(image).whole);
    }
    void AlphaJpeg(U16 id, const ImageSource& image)
    {
        std::vector<U8> stream = MakeJpeg(image).whole, plane;
        for (U32 pixel : image.pixels)
            plane.push_back(U8(pixel >> 24));
        ByteWriter body;
        body.PutU32(U32(stream.size())).PutBytes(stream).PutBytes(Deflated(plane));
        Add(kTagDefineBitsJPEG3, id, body.Bytes());
    }

    Images images;

private:
    void Add(int code, U16 id, const std::vector<U8>& body)
    {
        images.push_back({code, ByteWriter().PutU16(id).PutBytes(body).Bytes()});
    }
    bool tablesAreOut = false;
};

Images PackImages()
{
    Packer packer;
    packer.Jpeg(kLake, PaintLake());
    packer.SharedJpeg(kNebula, PaintNebula());
    packer.SharedJpeg(kDunes, PaintDunes());
    packer.AlphaJpeg(kPlanet, PaintPlanet());
    packer.Lossless(kWoodcut, PaintWoodcut(), false);
    packer.Lossless(kHandheld, PaintHandheld(), false);
    packer.Lossless(kAzulejo, PaintAzulejo(), false);
    packer.Lossless(kWood, PaintWood(), false);
    packer.Lossless(kSunset, PaintSunset(), false);
    packer.Lossless(kFlower, PaintFlower(), false);
    packer.Lossless(kStripes, PaintStripes(), true);
    packer.Lossless(kDots, PaintDots(), true);
    packer.Lossless(kLocomotive, PaintLocomotive(), true);
    packer.Lossless(kCoffee, PaintCoffee(), true);
    packer.Lossless(kBubble, PaintBubble(), true);
    return packer.images;
}

// --- shapes -------------------------------------------------------------------------------------

enum FillType : U8 { kTiled = 0x40, kClipped = 0x41 };

// An image whose first pixel begins at (x, y), so many pixels of the stage to one of its own.
Fill Image(FillType type, U16 id, double x, double y, double scale, double degrees = 0)
{
    return Fill::Bitmap(type, id, Mat::Scale(20 * scale).Then(Mat::Rotate(degrees)).Then(At(x, y)));
}

// A picture in the middle of its paper, which leaves a wider margin below.
struct Card {
    U16 image;
    double width, height, scale; // of the picture in its own pixels, and how large those are
    double margin, foot;
    U32 paper;
};

void DefineCard(TagWriter& movie, U16 id, const Card& card)
{
    double w = card.width * card.scale / 2, h = card.height * card.scale / 2, m = card.margin;
    Drawing d;
    for (int i = 0; i < 4; i++) // a soft shadow in layers
        d.Paint(Hex(0x000000, 28))
            .RoundRect(-w - m + i, -h - m + 3 + i, w + m + 5 - i, h + card.foot + 7 - i, 4);
    d.Paint(Hex(card.paper)).RoundRect(-w - m, -h - m, w + m, h + card.foot, 2.5);
    d.Paint(Image(kClipped, card.image, -w, -h, card.scale)).Rect(-w, -h, w, h);
    d.Paint(Hex(0x000000, 50)).Rect(-w, -h, w, h).Rect(-w + 0.7, -h + 0.7, w - 0.7, h - 0.7);
    movie.DefineShape(id, d.Shape());
}

void DefineTable(TagWriter& movie)
{
    Drawing table, shade;
    table.Paint(Image(kTiled, kWood, 0, 0, 1.25)).Rect(kLeft, kTop, kRight, kBottom);
    movie.DefineShape(kTable, table.Shape());
    shade.Paint(Glow(300, 190, 470,
                     {{0, Hex(0xffe8b8, 70)}, {120, Hex(0x000000, 0)}, {255, Hex(0x100804, 190)}}));
    movie.DefineShape(kShade, shade.Rect(kLeft, kTop, kRight, kBottom).Shape());
}

void DefineThings(TagWriter& movie)
{
    Drawing coaster, stain, sticker, ball, bubble;
    coaster.Paint(Hex(0x000000, 70)).Circle(3, 4, 58);
    coaster.Paint(Hex(0xe8dcc0)).Circle(0, 0, 56);
    coaster.Paint(Image(kTiled, kAzulejo, -20, -20, 1)).Circle(0, 0, 52);
    coaster.Paint(Hex(0x163f8a)).Circle(0, 0, 52).Circle(0, 0, 50);
    movie.DefineShape(kCoaster, coaster.Shape());
    movie.DefineShape(
        kStain, stain.Paint(Image(kClipped, kCoffee, -48, -48, 1)).Rect(-48, -48, 48, 48).Shape());
    sticker.Paint(Image(kClipped, kLocomotive, -40, -30, 4)).Rect(-40, -30, 40, 30);
    movie.DefineShape(kSticker, sticker.Shape());
    ball.Paint(OvalGlow(8, 42, 44, 14, {{0, Hex(0x000000, 150)}, {255, Hex(0x000000, 0)}}));
    ball.Ellipse(8, 42, 44, 14);
    ball.Paint(Image(kClipped, kPlanet, -50, -50, 1)).Rect(-50, -50, 50, 50);
    movie.DefineShape(kBall, ball.Shape());
    bubble.Paint(Image(kClipped, kBubble, -40, -40, 1)).Rect(-40, -40, 40, 40);
    movie.DefineShape(kFilm, bubble.Shape());
}

void DefineTapes(TagWriter& movie)
{
    const std::pair<U16, U16> tapes[] = {{kStripesTape, kStripes}, {kDotsTape, kDots}};
    for (const auto& [id, image] : tapes) {
        Drawing d;
        d.Paint(Image(kTiled, image, -28, -8, 1)).Move(-28, -8).Line(28, -8);
        for (int i = 1; i <= 4; i++) // torn ends
            d.Line(i % 2 ? 25 : 28, -8 + i * 4);
        d.Line(-28, 8);
        for (int i = 3; i >= 1; i--)
            d.Line(i % 2 ? -25 : -28, -8 + i * 4);
        movie.DefineShape(id, d.Close().Shape());
    }
}

// One small print, and eight of them in eight inks.
void DefinePrints(TagWriter& movie)
{
    Drawing print;
    print.Paint(Image(kClipped, kFlower, -32, -32, 1)).Rect(-32, -32, 32, 32);
    movie.DefineShape(kPrint, print.Shape());
    Drawing paper;
    paper.Paint(Hex(0x000000, 60)).Rect(-84, -44, 92, 52);
    paper.Paint(Hex(0xfffaf0)).Rect(-88, -48, 88, 48);
    movie.DefineShape(kPrints, paper.Shape());
    const Cx inks[] = {Cx(),
                       Cx::Multiply(80, 200, 256),
                       Cx::Tint(Hex(0xffd23a), 0.55),
                       Cx{{-256, -256, -256, 256}, {255, 255, 255, 0}},
                       Cx::Add(-80, 60, 120),
                       Cx::Multiply(256, 120, 256),
                       Cx::Multiply(256, 256, 256, 110),
                       Cx{{256, 0, 0, 256}, {0, 60, 90, 0}}};
    TagWriter sheet;
    sheet.Place(kPrints, 1);
    for (U16 i = 0; i < 8; i++)
        sheet.Place2(U16(i + 2), {.character = U16(kPrint),
                                  .matrix = Pose(-63 + i % 4 * 42, i < 4 ? -21 : 21, 0.62, 0.62),
                                  .cx = inks[i]});
    movie.DefineSprite(kPrints + 20, sheet.Show().End());
}

const Card kCardsOfAlbum[] = {
    {kLake, 176, 132, 1, 9, 26, 0xfffdf6},        {kDunes, 176, 132, 0.8, 8, 8, 0xf4ecd8},
    {kWoodcut, 176, 132, 0.75, 10, 18, 0xfbf4e2}, {kHandheld, 80, 72, 1.4, 9, 22, 0xc9ccd4},
    {kSunset, 112, 84, 1.2, 7, 7, 0x1c1a26},      {kNebula, 176, 132, 1, 9, 26, 0xfffdf6},
};

struct Rest { // where a card lies
    double x, y, degrees, sway;
};
const Rest kRests[] = {{128, 108, -9, 2.5}, {520, 96, 8, -3},    {112, 322, 6, -2.5},
                       {282, 366, -7, 3},   {548, 272, -5, 2.5}, {326, 178, 4, 3}};

// The last card is taken up from the table, looked at closely, and put back.
void LayCards(Stage& stage, double t)
{
    for (U16 i = 0; i < 6; i++) {
        const Rest& rest = kRests[i];
        double lift = i == 5 ? Bump(0.5, 0.36, t) : 0;
        double x = Blend(rest.x, 320, lift), y = Blend(rest.y, 232, lift);
        double scale = 1 + 1.1 * lift, sway = rest.sway * Turns(t + i * 0.17);
        double degrees = Blend(rest.degrees + sway, 0, lift);
        S32 mul = RoundSteadily(256 - 110 * (i < 5 ? Bump(0.5, 0.36, t) : 0));
        U16 depth = i == 5 ? 40 : U16(10 + i);
        stage.Put(depth, U16(kCards + i), Pose(x, y, scale, scale, degrees),
                  Cx::Multiply(mul, mul, mul));
    }
}

} // namespace

std::vector<U8> MakeAlbum(const std::vector<U8>& earlier)
{
    MovieWriter movie(640 * 20, 480 * 20, Fps(24));
    movie.Background(Hex(0x4a2a16));
    Images images = ImagesOf(earlier);
    for (const auto& [code, body] : images.empty() ? PackImages() : images)
        movie.Raw(code, body);
    DefineTable(movie);
    DefineThings(movie);
    DefineTapes(movie);
    DefinePrints(movie);
    for (U16 i = 0; i < 6; i++)
        DefineCard(movie, U16(kCards + i), kCardsOfAlbum[i]);
    Stage stage(movie);
    for (int frame = 0; frame < kFrames; frame++) {
        double t = frame / double(kFrames);
        stage.Put(1, kTable, {});
        stage.Put(2, kStain, Pose(424, 292, 1.3, 1.3, 20));
        stage.Put(3, kCoaster, Pose(418, 398, 1, 1, 360 * t));
        stage.Put(20, kPrints + 20, Pose(548, 420, 1, 1, -4 + 2 * Turns(t)));
        LayCards(stage, t);
        stage.Put(21, kStripesTape, Pose(60, 44, 1, 1, -48));
        stage.Put(22, kDotsTape, Pose(586, 34, 1, 1, 40));
        stage.Put(23, kSticker, Pose(66, 438, 1, 1, 10 * Turns(t)));
        stage.Put(24, kBall, Pose(178 + 10 * Turns(t), 428, 0.74, 0.74));
        stage.Put(30, kShade, {});
        for (U16 i = 0; i < 3; i++) {
            double rise = t + i / 3.0 - (t + i / 3.0 >= 1), size = 0.5 + 0.22 * i + 0.06 * Turns(t);
            stage.Put(U16(50 + i), kFilm,
                      Pose(90 + 210 * i + 24 * Turns(rise * 2), 540 - 640 * rise, size, size),
                      Cx::Alpha(0.95));
        }
        stage.Next();
    }
    movie.End();
    return movie.Bytes();
}
