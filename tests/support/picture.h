#pragma once

#include "core/geom/types.h"

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

// What Compare found. Pictures of unlike sizes differ in every pixel, by 255.
struct PictureDiff {
    int count = 0;                // pixels with a channel further apart than the tolerance
    int largest = 0;              // greatest distance in any channel of any pixel
    int firstX = -1, firstY = -1; // the first of the counted pixels in row order
};

// Reads a PNG file; false leaves the picture empty.
bool LoadPng(const std::string& path, Picture* picture);
// Writes a PNG file; false when it cannot be written.
bool SavePng(const std::string& path, const Picture& picture);

PictureDiff Compare(const Picture& got, const Picture& want, int tolerance = 0);

// For EXPECT_EQ("", ExpectSame(...)): empty when at most `allowed` pixels differ by more than the
// tolerance. Otherwise a sentence about the difference, after writing NAME-got.png, NAME-want.png
// and NAME-diff.png (differing pixels in red on a dimmed grey) into the folder that the environment
// variable VEXEL_TEST_OUT names, or test-out below the current one.
std::string ExpectSame(const Picture& got, const Picture& want, const std::string& name,
                       int tolerance = 0, int allowed = 0);
// The same against a picture file; a file that cannot be read is a difference.
std::string ExpectSamePng(const Picture& got, const std::string& wantPath, const std::string& name,
                          int tolerance = 0, int allowed = 0);
