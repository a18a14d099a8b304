// Movies that exist only for the benchmarks: one class of paint each, as much of it as a page
// holds.
#pragma once

#include "core/geom/types.h"

#include <vector>

// 2000 letters of static text, all outlines different in size or place.
std::vector<U8> PageMovie();
// A photograph of 1920 x 1080 pixels over the whole stage: pixel for pixel at that size, and
// smoothed at any other.
std::vector<U8> PhotoMovie();
// A part of the same, enlarged 1.7 times, or turned by 30 degrees as well.
std::vector<U8> EnlargedMovie();
std::vector<U8> TurnedMovie();
// 100 flowers of 64 curves and strokes each, halfway to their other form.
std::vector<U8> MorphMovie();
