// REdge: what shapes are made of when they reach the raster.
#pragma once

#include "core/geom/types.h"

struct RColor;

// How a crossing changes the colours that are on; index into the raster's crossing procedures.
enum RFillRule : U8 {
    kRuleEdge = 0,    // color1 and color2 lie on the two sides: both toggle
    kRuleEvenOdd = 1, // color1 toggles
    kRuleWinding = 2, // color1 counts directions
};

// One y-monotonic quadratic piece in raster coordinates (pixels, or quarter pixels when the raster
// is anti-aliased). Owned by the list of the object that built it and allocated from the display
// list's edge pool; the raster only links it into its buckets while it paints.
struct REdge {
    REdge* next;    // next edge of the owner's list
    REdge* nextObj; // link of the raster's bucket; meaningful only while painting
    RColor* color1;
    RColor* color2; // null unless fillRule is kRuleEdge
    S16 anchor1x;   // upper end
    S16 anchor1y;
    S16 controlx;
    S16 controly;
    S16 anchor2x; // lower end: anchor2y > anchor1y, and controly lies between the two
    S16 anchor2y;
    S32 isLine;  // straight: the control point is ignored
    U8 fillRule; // RFillRule
    S8 dir;      // +1 or -1
};
