#pragma once

#include "tests/support/byte_writer.h"

#include <vector>

// One stop of a gradient: its place on the ramp, 0..255, and its colour there.
struct Stop {
    U8 ratio = 0;
    Rgba color;
};

// How an area is painted. Made by the four named constructors.
struct Fill {
    U8 type = 0; // 0x00 solid, 0x10 linear, 0x12 radial, 0x40 tiled bitmap, 0x41 clipped bitmap
    Rgba color;
    U16 bitmap = 0; // character id
    Mat mat;        // gradient square or bitmap pixels to shape twips
    std::vector<Stop> stops;

    static Fill Solid(Rgba color);
    static Fill Linear(const Mat& mat, std::vector<Stop> stops);
    static Fill Radial(const Mat& mat, std::vector<Stop> stops);
    static Fill Bitmap(U8 type, U16 id, const Mat& mat);
};

// A stroke of the given width in twips.
struct Line {
    U16 width = 20;
    Rgba color;
};

// Draws one shape: add styles, choose selectors, move the pen. A selector is the number that
// AddFill or AddLine gave, 0 for none; a choice holds until changed and survives MoveTo. Colours
// keep their alpha only where the shape is written with an alpha flag. A line too long for one
// record becomes several; a curve must fit (deltas below 65536).
class ShapeBuilder {
public:
    int AddFill(const Fill& fill);
    int AddFill(Rgba color) { return AddFill(Fill::Solid(color)); }
    int AddLine(const Line& line);
    // Begins a new style block at the next edge: earlier selectors end, numbers start at 1 again.
    ShapeBuilder& NewStyles();

    ShapeBuilder& Fill0(int selector);
    ShapeBuilder& Fill1(int selector);
    ShapeBuilder& Stroke(int selector);
    // All three selectors at once, the usual way to begin an outline.
    ShapeBuilder& Styles(int fill0, int fill1, int line = 0);

    ShapeBuilder& MoveTo(S32 x, S32 y);
    ShapeBuilder& LineTo(S32 x, S32 y);
    ShapeBuilder& CurveTo(S32 controlX, S32 controlY, S32 x, S32 y);
    ShapeBuilder& Close(); // a line back to the last MoveTo, unless the pen is there
    ShapeBuilder& Rect(S32 xmin, S32 ymin, S32 xmax, S32 ymax);
    ShapeBuilder& Circle(S32 x, S32 y, S32 radius) { return Ellipse(x, y, radius, radius); }
    ShapeBuilder& Ellipse(S32 x, S32 y, S32 radiusX, S32 radiusY); // eight pieces
    ShapeBuilder& Polygon(const std::vector<Pt>& corners);

    // What the drawing covers, control points and half the widest stroke included.
    Box Bounds() const;
    // The style block and the records with their end mark.
    void Write(ByteWriter& out, bool alpha) const;
    // The records alone behind two 4-bit selector widths, as glyphs keep them.
    void WriteGlyph(ByteWriter& out) const;

private:
    struct Block {
        std::vector<Fill> fills;
        std::vector<Line> lines;
        int topFill = 0, topLine = 0; // greatest selector used, table or not
    };
    struct Record {
        enum Kind { kMove, kFill0, kFill1, kLine, kNewStyles, kStraight, kCurve } kind;
        S32 x1 = 0, y1 = 0, x2 = 0, y2 = 0; // a selector or block number stands in x1
    };
    friend class ShapeRecordWriter;

    void Add(Record::Kind kind, S32 x1, S32 y1 = 0, S32 x2 = 0, S32 y2 = 0);
    void Reach(Pt place);

    std::vector<Block> blocks{1};
    std::vector<Record> records;
    Pt pen, start;
    Box reach;
    bool reached = false;
};
