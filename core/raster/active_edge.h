// RActiveEdge: an edge that crosses the scanline being painted, and how it moves to the next one.
#pragma once

#include "core/raster/edge.h"

enum RStepKind : U8 {
    kStepLine,
    kStepCurve,
    kStepCurveInterpolate, // corrected along the chord: for painting without anti-aliasing
};

// Positions are 16.16, differences have 24 fractional bits; kept in 64 bits so that flat wide
// curves do not wrap.
struct RActiveEdge {
    S32 x;    // crossing of the current scanline, rounded
    S32 ymax; // lower end: the edge leaves before this scanline
    S64 xl;   // current position
    S64 yl;
    S64 dx; // first differences; for a line the x step of one scanline, 16.16
    S64 dy;
    S64 d2x; // second differences
    S64 d2y;
    S32 stepsLeft;
    RColor* color1;
    RColor* color2;
    U8 stepKind; // RStepKind
    U8 fillRule; // RFillRule
    S8 dir;

    // Starts at scanline y, at or below the edge's upper end. Edges wholly outside [xmin, xmax)
    // cannot be seen and become vertical at that border; the colours they switch are what counts.
    void SetUp(const REdge* edge, S32 y, bool interpolate, S32 xmin, S32 xmax);
    // Moves to scanline y, the one after the current.
    void Step(S32 y);

private:
    void StepLine();
    void SetUpLine(const REdge* edge, S32 y);
    void SetUpCurve(const REdge* edge, S32 y);
    void SetUpVertical(S32 atX);
    void StepCurve(S32 y);
    void StepCurveInterpolate(S32 y);
    S32 RoundedX() const { return S32((xl + 0x8000) >> 16); }
};

inline void RActiveEdge::StepLine()
{
    xl += dx;
    x = RoundedX();
}

inline void RActiveEdge::Step(S32 y)
{
    if (stepKind == kStepLine) {
        StepLine();
    } else if (stepKind == kStepCurve) {
        StepCurve(y);
    } else {
        StepCurveInterpolate(y);
    }
}
