// SStroker: lines of a shape into filled outlines.
#pragma once

#include "core/shape/edge_piece.h"
#include "core/shape/stroke_point.h"

// Takes the device-space curves of stroked paths one after another and adds the edges around each
// stroke to an edge list: winding rule, one colour, so that a stroke paints once where it overlaps
// itself. All pieces of an outline run clockwise on the screen. Thick strokes are the two offset
// sides of the path with round joins and ends; thin ones (without anti-aliasing, below four
// pixels) an outline one unit wide. Works on any coordinates; once the edge pool is exhausted it
// does nothing more. Halving a curve counts as a record, since a curve that leaves no edges would
// cost its time unseen; when no records are left, curves become lines.
class SStroker : public CEdgeCutter {
public:
    // Edges come from `display`'s pool and go to the front of `list`.
    SStroker(DisplayList* display, REdge** list);

    // Begins a path of so many raster units' thickness.
    void BeginStroke(S32 thickness, RColor* color);
    // Strokes one segment of the path, which begins where the one before ended.
    void AddStrokeCurve(const CURVE* c);
    // Closes the path or gives it ends. Without a path open it does nothing.
    void EndStroke();
    bool IsOpen() const { return isOpen; }

    void AddEdge(const SStrokePoint& from, const SStrokePoint& to);
    // Joins two offset points, clockwise around a centre: by an arc up to half a turn, else or when
    // there is hardly a turn by a straight edge.
    void StrokeJoin(const SStrokePoint& from, const SStrokePoint& to, const SStrokePoint& centre);
    void StrokeThickCurve(const CURVE* c);
    void StrokeThinLine(const CURVE* c);
    void StrokeThinCurve(const CURVE* c);

private:
    // A curve on the fine grid, and the unit normals at its ends.
    struct SBend {
        SStrokePoint p1, control, p2;
        SStrokePoint n1, n2;
    };
    enum EBendFate { kBendKeep, kBendChord, kBendSplit };

    SStrokeEnd EndAt(const SStrokePoint& at, const SStrokePoint& normal, S64 length) const;
    void Connect(const SStrokeEnd& start);
    void Join(const SStrokeEnd& from, const SStrokeEnd& to);
    void StrokeDot();
    EBendFate Judge(const SBend& b) const;
    bool SpendSplit();
    void StrokeBend(const SBend& b, int level);
    void SplitBend(const SBend& b, int level);
    void StrokeSides(const SBend& b);
    void StrokeChord(const SStrokePoint& p1, const SStrokePoint& p2);
    static bool IsNearlyStraight(const SBend& b);
    static CURVE MovedSide(const SBend& b, const SStrokePoint& from, const SStrokePoint& to);
    void AddArc(const SStrokePoint& u, const SStrokePoint& v, const SStrokePoint& centre);
    void StrokeThinBend(const SBend& b, int level);

    bool antialias; // coordinates are quarter pixels
    bool isOpen = false;
    bool thick = false;
    bool started = false; // a segment of the path has been stroked
    S32 thickness = 0;    // raster units
    S64 half = 0;         // of the thickness, in 1/256 raster unit
    SPOINT startPt;       // of the path, before anything was snapped
    SPOINT lastPt;        // end of the last curve, of a path that has one
    bool hasLast = false;
    SStrokeEnd first; // start of the first segment
    SStrokeEnd last;  // end of the last one
};
