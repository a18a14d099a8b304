// SCharacterParser: a shape's curves into the raster's edges.
#pragma once

#include "core/shape/edge_piece.h"
#include "core/shape/shape_parser.h"

class SStroker;
struct SObject;

// Finds the colours on the two sides of every curve and cuts it into the edges of an object; curves
// with a line style go to a stroker besides. One parser builds one shape (or one glyph) once.
class SCharacterParser : public SShapeParser, public CEdgeCutter {
public:
    bool useWinding = false; // one-sided edges follow the winding rule: glyphs
    SObject* obj;            // whose edge and colour lists are built

    SCharacterParser(SObject* obj, ScriptPlayer* player, const U8* data, S32 dataLen, S32 start,
                     const MATRIX* mat);

    // Builds all edges; `devBounds` are the instance's. Without `readStyles` only the selector
    // widths are read. False when the styles could not be read.
    bool BuildEdges(bool readStyles, const SRECT* devBounds);
    // The same for a morph shape at `ratio`, from the distance to its end edges on.
    bool BuildMorphEdges(const SRECT* devBounds);
    // Turns the style tables into a mask: one clip colour in place of every fill, no lines.
    void MakeClipper();

private:
    void Walk();
    int NextRecord(CURVE* c) { return endEdges ? NextMorphRecord(c) : GetEdge(c); }
    int NextMorphRecord(CURVE* c);
    bool NextEndEdge(CURVE* c);
    void ChangeStyles(int flags, SStroker* stroker);
    void ChangeFills();

    RColor* clipColor = nullptr;      // of the whole mask, made once
    SShapeParser* endEdges = nullptr; // of a morph: the end list, while both are walked
};

// Makes a clip colour and pushes it on `list`; null when the colour pool is exhausted.
RColor* CreateClipColor(DisplayList* display, RColor** list);

// Adds the sides of a rectangle, or one side, to an edge list: boxes of objects that are no shapes.
// They are filled in `color`, unless it is null; a stroker, which may be null and in which the
// caller has begun a stroke that it ends, gets them besides. The rectangle goes through `mat`
// first.
void AddRect(const SRECT* r, const MATRIX* mat, RColor* color, DisplayList* display, REdge** list,
             SStroker* stroker);
void AddRectEdge(const SPOINT* p1, const SPOINT* p2, RColor* color, DisplayList* display,
                 REdge** list, SStroker* stroker);
