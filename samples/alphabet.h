#pragma once

#include "core/geom/types.h"

#include <vector>

// The lettering of the samples: an upright sans with a little contrast, drawn for this project. It
// is one table (alphabet.cpp) of what a broad pen does for each letter; outlines come from it in
// integers, the same on every machine. Nothing here knows movies.
//
// Units are 1024ths of the em, x to the right from the glyph's origin, y down from the baseline.
// Contours of one glyph run the same way round, counters the other way, and pieces overlap: fill
// them by the winding rule.

constexpr S32 kAlphabetEm = 1024;
constexpr S32 kAlphabetAscent = 930, kAlphabetDescent = 250; // of a line of text
constexpr S32 kAlphabetCapHeight = 720, kAlphabetXHeight = 510;

struct GlyphEdge {
    bool curved = false;
    S32 controlX = 0, controlY = 0; // of a curve
    S32 x = 0, y = 0;               // where it ends
};

struct GlyphContour { // ends where it starts
    S32 x = 0, y = 0;
    std::vector<GlyphEdge> edges;
};

// The codes that have a glyph, ascending: printable ASCII, most letters of Latin-1, quotation marks
// and dashes.
const std::vector<U16>& AlphabetCodes();

// A code without a glyph has no advance and an empty outline; so has an empty outline the space.
S32 AlphabetAdvance(U16 code);
std::vector<GlyphContour> AlphabetOutline(U16 code);
