#pragma once

#include "tests/support/byte_writer.h"

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

    using Stops = std::vector<Stop>;
    static Fill Solid(Rgba color) { return {0x00, color, 0, {}, {}}; }
    static Fill Linear(const Mat& mat, const Stops& stops) { return {0x10, {}, 0, mat, stops}; }
    static Fill Radial(const Mat& mat, const Stops& stops) { return {0x12, {}, 0, mat, stops}; }
    static Fill Bitmap(U8 type, U16 id, const Mat& mat) { return {type, {}, id, mat, {}}; }
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

    ShapeBuilder& Fill0(int selector) { return Select(kFill0, selector); }
    ShapeBuilder& Fill1(int selector) { return Select(kFill1, selector); }
    ShapeBuilder& Stroke(int selector) { return Select(kLine, selector); }
    // All three selectors at once, the usual way to begin an outline.
    ShapeBuilder& Styles(int fill0, int fill1, int line = 0)
    {
        return Fill0(fill0).Fill1(fill1).Stroke(line);
    }

    ShapeBuilder& MoveTo(S32 x, S32 y);
    ShapeBuilder& LineTo(S32 x, S32 y);
    ShapeBuilder& CurveTo(S32 controlX, S32 controlY, S32 x, S32 y);
    ShapeBuilder& Close(); // a line back to the last MoveTo, unless the pen is there
    ShapeBuilder& Rect(S32 xmin, S32 ymin, S32 xmax, S32 ymax)
    {
        return Polygon({{xmin, ymin}, {xmax, ymin}, {xmax, ymax}, {xmin, ymax}});
    }
    ShapeBuilder& Circle(S32 x, S32 y, S32 radius) { return Ellipse(x, y, radius, radius); }
    ShapeBuilder& Ellipse(S32 x, S32 y, S32 radiusX, S32 radiusY); // eight pieces
    ShapeBuilder& Polygon(const std::vector<Pt>& corners);

    // What the drawing covers, control points and half the widest stroke included.
    Box Bounds() const;
    // The style block and the records with their end mark. With `end` all styles are those of a
    // morph shape, each with the value that the other builder has in its place.
    void Write(ByteWriter& out, bool alpha, const ShapeBuilder* end = nullptr) const;
    // The records alone behind two 4-bit selector widths, as glyphs keep them.
    void WriteGlyph(ByteWriter& out) const { WriteRecords(out, false, nullptr); }
    // A morph shape's body from the distance on: styles and selectors of this builder, the end
    // values of the same styles from the other, and the moves and edges of both.
    void WriteMorph(ByteWriter& out, const ShapeBuilder& end) const;

private:
    enum Selector { kFill0, kFill1, kLine };
    // The parts of a record that changes something, in the order of the wire. Those between are
    // the selectors, kSelector << kFill0 and so on.
    enum Part : U32 { kMove = 1, kSelector = 2, kNewStyles = 16 };
    // One record as it goes out: a change of what its parts say, or an edge when it has none.
    struct Record {
        U32 parts = 0;
        Pt move;
        int selectors[3] = {0, 0, 0};
        size_t block = 0;        // that follows, when there are new styles
        std::vector<S32> deltas; // of a straight edge 2, of a curve 4
    };
    struct Block {
        std::vector<Fill> fills;
        std::vector<Line> lines;
        int top[2] = {0, 0}; // greatest fill and line selector, used or in the table

        int Bits(Selector which) const { return UnsignedBits(U32(top[which == kLine])); }
        void WriteWidths(ByteWriter& out) const
        {
            out.Align().UB(4, U32(Bits(kFill0))).UB(4, U32(Bits(kLine)));
        }
        void WriteChange(ByteWriter& out, const Record& change) const;
    };

    int Raise(Selector which, size_t selector);
    Record& Change(U32 part);
    ShapeBuilder& Select(Selector which, int selector);
    ShapeBuilder& AddEdge(const std::vector<S32>& deltas, Pt end);
    void Reach(Pt place);
    void WriteStyles(ByteWriter& out, size_t at, bool alpha, const ShapeBuilder* end) const;
    void WriteRecords(ByteWriter& out, bool alpha, const ShapeBuilder* end) const;

    std::vector<Block> blocks{1};
    std::vector<Record> records;
    Pt pen, start;
    Box reach;
    bool reached = false;
};
