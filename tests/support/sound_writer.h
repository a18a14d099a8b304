#pragma once

#include "tests/support/movie_writer.h"

// A movie of 10 frames a second with a stream of so many samples a frame in that format (14 is
// 16-bit mono at 44100 Hz, + 16 ADPCM, + 32 MPEG), from words, so often, and an end: "/" shows a
// frame; "b5" is a block that begins with sample 5, "b" with 1, 2, 3 in turn; "m9,-5" is an MPEG
// block with that count and seek and no data; "d3,50" defines sound 3 as that one sample, "s3,0"
// starts it with those flags, "f3" frees it.
std::vector<U8> SoundMovie(const std::string& words, U16 samples, U8 format = 14, int times = 1);
