// Small movies and a shell that keeps count, for the tests of the player.
#pragma once

#include "platform/headless/native_player.h"
#include "tests/support/movie_writer.h"
#include "tests/support/picture.h"

#include <gtest/gtest.h>

// A square of 10 pixels with its corner at the origin.
inline ShapeBuilder Square(Rgba color = {200, 30, 30, 255})
{
    ShapeBuilder shape;
    shape.Styles(0, shape.AddFill(color)).Rect(0, 0, 200, 200);
    return shape;
}

// 100 x 80 pixels at 10 frames a second: the square starts at (10, 10) pixels and goes 4 to the
// right and 2 down with every frame.
inline std::vector<U8> MovingSquare(int frames, U16 rate = Fps(10))
{
    MovieWriter movie(100 * 20, 80 * 20, rate);
    movie.Background({240, 250, 255, 255}).DefineShape(1, Square());
    movie.Place(1, 1, Mat::Translate(200, 200)).Show();
    for (int i = 1; i < frames; i++)
        movie.Move(1, Mat::Translate(200 + 80 * i, 200 + 40 * i)).Show();
    movie.End();
    return movie.Bytes();
}

// The headless shell, playing a movie that is all there, with a paint that takes its time.
class PlayingShell : public NativePlayerWnd {
public:
    explicit PlayingShell(const std::vector<U8>& movie, S32 w = 0, S32 h = 0)
        : NativePlayerWnd(w, h)
    {
        Feed(movie.data(), movie.size());
        EndOfData();
    }
    void BltToScreen(const SRECT* r) override
    {
        AdvanceHeadlessClock(blitCost * 1000);
        blitted = *r;
    }
    void ClearScreen() override { cleared = true; }

    S64 blitCost = 0; // milliseconds
    bool cleared = false;
};

inline Picture Shot(NativePlayerWnd* player)
{
    const CBitBuffer* bits = player->Picture();
    if (bits == nullptr)
        return {};
    Picture picture(bits->Width(), bits->Height());
    for (S32 y = 0; y < bits->Height(); y++)
        std::copy_n(bits->Row32(y), bits->Width(), &picture.At(0, y));
    return picture;
}
