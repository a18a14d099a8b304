#pragma once

#include "core/raster/bit_buffer.h"

#include <algorithm>
#include <string>
#include <vector>

// A picture in memory: rows from the top, no padding, each pixel a << 24 | r << 16 | g << 8 | b
// with colours already multiplied by alpha.
struct Picture {
    int width = 0, height = 0;
    std::vector<U32> pixels;

    Picture() = default;
    Picture(int w, int h, U32 pixel = 0) : width(w), height(h), pixels(size_t(w) * size_t(h), pixel)
    {
    }
    U32 At(int x, int y) const { return pixels[size_t(y) * size_t(width) + size_t(x)]; }
    U32& At(int x, int y) { return pixels[size_t(y) * size_t(width) + size_t(x)]; }
};

// The pixels as a player holds them.
inline Picture PictureOf(const CBitBuffer& bits)
{
    Picture p(bits.Width(), bits.Height());
    for (int y = 0; y < p.height; y++)
        std::copy_n(bits.Row32(y), p.width, &p.At(0, y));
    return p;
}

// What Compare found. Pictures of unlike sizes differ in every pixel, by 255.
struct PictureDiff {
    int count = 0;         // pixels that differ
    int largest = 0;       // greatest distance in any channel of any pixel
    int x = 0, y = 0;      // the first of those pixels in row order,
    U32 got = 0, want = 0; // and what stands there
};

// Reads a PNG file; false leaves the picture empty.
bool LoadPng(const std::string& path, Picture* picture);
PictureDiff Compare(const Picture& got, const Picture& want);

// For EXPECT_EQ("", ExpectSame(...)): empty when the pictures are equal. Otherwise a sentence about
// the difference, after writing NAME-got.png and NAME-want.png into the folder that the environment
// variable VEXEL_TEST_OUT names, or test-out below the current one.
std::string ExpectSame(const Picture& got, const Picture& want, const std::string& name);
