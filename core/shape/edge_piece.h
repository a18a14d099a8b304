// The last step before the raster: device-space curves are cut into pieces that an edge can hold.
#pragma once

#include "core/geom/curve.h"
#include "core/raster/edge.h"

class DisplayList;

// Coordinates that the builders let into an edge without a second look, and how far from the
// origin a shape can still show.
constexpr S32 kEdgeReach = 32000;
constexpr S32 kShownReach = 16000;

enum EPieceFate {
    kPieceKeep,  // fits an edge now, cut to its 16 bits where that had to be
    kPieceDrop,  // cannot show
    kPieceSplit, // to be halved
};

// True when the three points lie within kEdgeReach of both axes.
inline bool PieceFits(const CURVE& c)
{
    // Numbers rather than truths: one test for all six.
    const auto inside = [](S32 v) { return int(U32(v) + U32(kEdgeReach) <= U32(2 * kEdgeReach)); };
    return (inside(c.anchor1.x) & inside(c.anchor1.y) & inside(c.control.x) & inside(c.control.y) &
            inside(c.anchor2.x) & inside(c.anchor2.y)) != 0;
}

// Decides about a y-monotonic piece that may not fit. One that lies wholly left or right of all
// that shows becomes a vertical line on that side, so that the fills between still begin and end
// on its scanlines. With `mayHalve` false kPieceSplit is never the answer.
EPieceFate GuardPiece(CURVE* c, bool mayHalve);

// Makes an edge of a y-monotonic piece that fits and pushes it on `list`; fill rule and colours
// are left to the caller. Null when the pool is exhausted. The piece must not be level.
REdge* PushEdge(DisplayList* display, REdge** list, const CURVE& c);

// Cuts every curve into pieces that are monotonic in y, short enough for the scanline stepper and
// inside the 16 bits of an edge, and pushes them on one edge list with a rule and two colours that
// the caller sets. Once the edge pool is exhausted nothing is cut any more.
class CEdgeCutter {
public:
    bool hugeCoords = false;  // what is cut reaches beyond what an edge can hold
    U8 fillRule = 0;          // of the edges being added
    RColor* color1 = nullptr; // of the edges being added
    RColor* color2 = nullptr;
    S32 depth = 0; // of curve splitting

    CEdgeCutter(DisplayList* display, REdge** list) : edgeDisplay(display), edgeList(list) {}

    // Adds one curve, in its direction.
    void AddCurve(const CURVE* c);

protected:
    bool edgesLost = false; // the edge pool is exhausted
    // Where a curve runs flat the anti-aliasing raster's steps along it are wide. By splitting they
    // are kept to a unit or so for strokes, whose two sides must not seem to cross.
    bool exact = false;
    DisplayList* edgeDisplay; // owner of the edge pool

private:
    void SplitAtTurn(const CURVE& c);
    void SplitAtMiddle(const CURVE& c);
    void AddHalves(const CURVE& first, const CURVE& second);
    void AddPiece(CURVE* c);

    REdge** edgeList;
};
