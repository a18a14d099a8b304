#pragma once

#include "tests/support/movie_writer.h"

// The pixels of an image, rows from the top: palette indices (formats 0 to 3 of 1, 2, 4 and 8
// bits), 5-5-5 words (format 4) or a << 24 | r << 16 | g << 8 | b (format 5, and every JPEG image).
struct ImageSource {
    int width = 0, height = 0;
    std::vector<U32> pixels;
    int format = 5;
    std::vector<Rgba> table = {}; // of formats 0 to 3
};

// A JPEG image as two streams, tables and the rest, and as one that has both.
struct JpegStreams {
    std::vector<U8> tables, image, whole;
};

// Progressive: in several scans. Inks: the bytes of the words are four inks instead of colours.
JpegStreams MakeJpeg(const ImageSource& image, bool progressive = false, bool inks = false);

// What follows the id in image tags of codes 20 and, with alpha, 36. In codes 6 and 21 that is a
// JPEG stream alone; in 35 its size (32 bits), the stream, and an alpha plane of a byte a pixel,
// Deflated.
std::vector<U8> LosslessBody(const ImageSource& image, bool alpha);
std::vector<U8> Deflated(const std::vector<U8>& bytes);
