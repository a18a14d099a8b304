// SCharacterParser: a shape's curves into the raster's edges.
#pragma once

#include "core/shape/shape_parser.h"

struct REdge;
struct SObject;

// Cuts every curve into pieces that are monotonic in y, short enough for the scanline stepper and
// inside the 16 bits of an edge, and pushes them on an object's edge list with the colours of their
// two sides. One parser builds one shape (or one glyph) once.
class SCharacterParser : public SShapeParser {
public:
    bool hugeCoords = false;  // the instance reaches beyond what an edge can hold
    U8 fillRule = 0;          // of the edges being added
    RColor* color1 = nullptr; // of the edges being added
    RColor* color2 = nullptr;
    bool useWinding = false; // one-sided edges follow the winding rule: glyphs
    S32 depth = 0;           // of curve splitting
    SObject* obj;            // whose edge and colour lists are built

    SCharacterParser(SObject* obj, ScriptPlayer* player, const U8* data, S32 dataLen, S32 start,
                     const MATRIX* mat);

    // Builds all edges; `devBounds` are the instance's. Without `readStyles` only the selector
    // widths are read. False when the styles could not be read.
    bool BuildEdges(bool readStyles, const SRECT* devBounds);
    // The same for a morph shape at `ratio`, from the distance to its end edges on.
    bool BuildMorphEdges(const SRECT* devBounds);
    // Adds one curve.
    void AddCurve(const CURVE* c);
    // Turns the style tables into a mask: one clip colour in place of every fill, no lines.
    void MakeClipper();

private:
    void Walk();
    int NextRecord(CURVE* c) { return endEdges ? NextMorphRecord(c) : GetEdge(c); }
    int NextMorphRecord(CURVE* c);
    bool NextEndEdge(CURVE* c);
    void ChangeFills();
    void SplitAtTurn(const CURVE& c);
    void SplitAtMiddle(const CURVE& c);
    void AddHalves(const CURVE& first, const CURVE& second);
    void AddPiece(CURVE* c);

    bool edgesLost = false;           // the edge pool is exhausted: nothing is split any more
    RColor* clipColor = nullptr;      // of the whole mask, made once
    SShapeParser* endEdges = nullptr; // of a morph: the end list, while both are walked
};

// Makes a clip colour and pushes it on `list`; null when the colour pool is exhausted.
RColor* CreateClipColor(DisplayList* display, RColor** list);

// Adds the sides of a rectangle, or one side, in one colour to an edge list: filled boxes of
// objects that are no shapes. The rectangle goes through `mat` first; horizontal sides make no
// edges.
void AddRect(const SRECT* r, const MATRIX* mat, RColor* color, DisplayList* display, REdge** list);
void AddRectEdge(const SPOINT* p1, const SPOINT* p2, RColor* color, DisplayList* display,
                 REdge** list);
