#include "bench/movies.h"

#include "samples/lettering.h"
#include "tests/support/image_writer.h"

#include <string>

namespace {
constexpr S32 kTwips = 20;
constexpr S32 kWidth = 1920, kHeight = 1080;

std::vector<U8> Finished(MovieWriter& movie)
{
    movie.Show().End();
    return movie.Bytes();
}

// Something with structure at every scale, and no two pixels alike.
ImageSource Photo()
{
    ImageSource photo = {kWidth, kHeight, {}};
    photo.pixels.reserve(size_t(kWidth) * kHeight);
    for (U32 y = 0; y < kHeight; ++y) {
        for (U32 x = 0; x < kWidth; ++x) {
            const U32 r = (x * x + y * 7) >> 6 & 255, g = (x + y * y) >> 7 & 255,
                      b = x * y >> 9 & 255;
            photo.pixels.push_back(0xFF000000 | r << 16 | g << 8 | b);
        }
    }
    return photo;
}

std::vector<U8> FilledWithPhoto(const Mat& mat)
{
    MovieWriter movie(kWidth * kTwips, kHeight * kTwips);
    ByteWriter body;
    body.PutU16(1).PutBytes(LosslessBody(Photo(), false));
    movie.Raw(kTagDefineBitsLossless, body);
    ShapeBuilder all;
    const int fill = all.AddFill(Fill::Bitmap(0x41, 1, mat));
    all.Styles(0, fill).Rect(0, 0, kWidth * kTwips, kHeight * kTwips);
    movie.DefineShape(2, all).Place(2, 1);
    return Finished(movie);
}

Pt Polar(S32 radius, double degrees)
{
    const Mat turn = Mat::Rotate(degrees);
    return {S32(S64(turn.a) * radius >> 16), S32(S64(turn.b) * radius >> 16)};
}

// A ring of petals around (x, y); `form` 0 or 1 says how far they reach.
ShapeBuilder Flower(S32 x, S32 y, int form)
{
    ShapeBuilder flower;
    const int fill = flower.AddFill(Rgba{U8(200 - 90 * form), 80, 160, 200});
    const int line = flower.AddLine({40, {30, 20, U8(60 * form), 255}});
    flower.Styles(0, fill, line);
    const S32 inner = 150 + 60 * form, outer = 520 - 150 * form;
    flower.MoveTo(x + outer, y);
    for (int i = 1; i <= 64; ++i) {
        const S32 reach = i & 1 ? inner : outer;
        const Pt end = Polar(reach, i * 360 / 64.0);
        const Pt control = Polar((inner + outer) / 2, (i - 0.5) * 360 / 64.0);
        flower.CurveTo(x + control.x, y + control.y, x + end.x, y + end.y);
    }
    return flower;
}
} // namespace

std::vector<U8> PageMovie()
{
    const std::string line = "The quick brown fox jumps over the lazy dog, again";
    MovieWriter movie(640 * kTwips, 480 * kTwips);
    const Font font(1, line);
    font.Define(movie, Font::kWithLayout);
    std::vector<TextLine> lines;
    for (int i = 0; i < 40; ++i)
        lines.push_back(
            {line, 20.0 + i % 5, 14 + i * 11.5, 12.0 + i % 3, Rgba{20, 20, U8(i * 3), 255}});
    DefineText(movie, 2, font, lines);
    movie.Place(2, 1);
    return Finished(movie);
}

std::vector<U8> PhotoMovie()
{
    return FilledWithPhoto(Mat::Scale(kTwips));
}

std::vector<U8> EnlargedMovie()
{
    return FilledWithPhoto(Mat::Scale(1.7 * kTwips));
}

std::vector<U8> TurnedMovie()
{
    return FilledWithPhoto(Mat::Scale(1.7 * kTwips).Then(Mat::Rotate(30)));
}

std::vector<U8> MorphMovie()
{
    MovieWriter movie(640 * kTwips, 480 * kTwips);
    for (int i = 0; i < 100; ++i) {
        const S32 x = (i % 10 * 64 + 32) * kTwips, y = (i / 10 * 48 + 24) * kTwips;
        const U16 id = U16(i + 1);
        movie.Raw(kTagDefineMorphShape, MorphBody(id, Flower(x, y, 0), Flower(x, y, 1)));
        movie.Place2(id, {.character = id, .matrix = Mat(), .ratio = 0x8000});
    }
    return Finished(movie);
}
