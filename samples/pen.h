#pragma once

#include "samples/alphabet.h"

#include <string_view>

// Draws what a line of the alphabet says, in a plane of its own where y points up. The words of
// that little language, each with its numbers behind it:
//
//   M x y              sets the pen down; a stroke follows, cut off straight at both ends
//   L x y              a straight stroke, in the direction that the pen already has
//   h x y              a quarter turn that leaves level and arrives upright
//   v x y              a quarter turn that leaves upright and arrives level
//   c x y x y x y      a cubic curve
//   w percent          the pen's width at the places named next, gliding in between
//   O x y rx ry        a closed ring round (x, y)
//   D x y r            a disc
//   B x y x y          a bar between two corners
//   / x y x y w        a slanted bar from one height to another, w wide along the level
//   P x y x y x y ...  any straight-sided piece
//
// The pen's nib is an oval: upright strokes come out kNibWidth thick, level ones kNibHeight, both
// times `percent`.
constexpr double kNibWidth = 88, kNibHeight = 76;

struct PenPlace {
    S32 dx = 0, dy = 0; // where the plane's origin comes to stand, y up
    S32 percent = 100;  // of the nib
};

void DrawWithPen(std::string_view words, const PenPlace& place, std::vector<GlyphContour>* out);
