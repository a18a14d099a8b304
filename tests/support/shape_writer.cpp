#include "tests/support/shape_writer.h"

#include <algorithm>
#include <cstdlib>
#include <utility>

Fill Fill::Solid(Rgba color)
{
    return {0x00, color, 0, {}, {}};
}

Fill Fill::Linear(const Mat& mat, std::vector<Stop> stops)
{
    return {0x10, {}, 0, mat, std::move(stops)};
}

Fill Fill::Radial(const Mat& mat, std::vector<Stop> stops)
{
    return {0x12, {}, 0, mat, std::move(stops)};
}

Fill Fill::Bitmap(U8 type, U16 id, const Mat& mat)
{
    return {type, {}, id, mat, {}};
}

int ShapeBuilder::AddFill(const Fill& fill)
{
    blocks.back().fills.push_back(fill);
    return int(blocks.back().fills.size());
}

int ShapeBuilder::AddLine(const Line& line)
{
    blocks.back().lines.push_back(line);
    return int(blocks.back().lines.size());
}

ShapeBuilder& ShapeBuilder::NewStyles()
{
    blocks.emplace_back();
    Add(Record::kNewStyles, S32(blocks.size()) - 1);
    return *this;
}

ShapeBuilder& ShapeBuilder::Fill0(int selector)
{
    blocks.back().topFill = std::max(blocks.back().topFill, selector);
    Add(Record::kFill0, selector);
    return *this;
}

ShapeBuilder& ShapeBuilder::Fill1(int selector)
{
    blocks.back().topFill = std::max(blocks.back().topFill, selector);
    Add(Record::kFill1, selector);
    return *this;
}

ShapeBuilder& ShapeBuilder::Stroke(int selector)
{
    blocks.back().topLine = std::max(blocks.back().topLine, selector);
    Add(Record::kLine, selector);
    return *this;
}

ShapeBuilder& ShapeBuilder::Styles(int fill0, int fill1, int line)
{
    return Fill0(fill0).Fill1(fill1).Stroke(line);
}

ShapeBuilder& ShapeBuilder::MoveTo(S32 x, S32 y)
{
    Add(Record::kMove, x, y);
    pen = start = {x, y};
    return *this;
}

ShapeBuilder& ShapeBuilder::LineTo(S32 x, S32 y)
{
    S32 dx = x - pen.x, dy = y - pen.y;
    if (std::max(std::abs(dx), std::abs(dy)) > 0xFFFF) {
        S32 middleX = pen.x + dx / 2, middleY = pen.y + dy / 2;
        return LineTo(middleX, middleY).LineTo(x, y);
    }
    Reach(pen);
    Add(Record::kStraight, dx, dy);
    pen = {x, y};
    Reach(pen);
    return *this;
}

ShapeBuilder& ShapeBuilder::CurveTo(S32 controlX, S32 controlY, S32 x, S32 y)
{
    Reach(pen);
    Add(Record::kCurve, controlX - pen.x, controlY - pen.y, x - controlX, y - controlY);
    pen = {x, y};
    Reach({controlX, controlY});
    Reach(pen);
    return *this;
}

ShapeBuilder& ShapeBuilder::Close()
{
    return pen.x == start.x && pen.y == start.y ? *this : LineTo(start.x, start.y);
}

ShapeBuilder& ShapeBuilder::Rect(S32 xmin, S32 ymin, S32 xmax, S32 ymax)
{
    return Polygon({{xmin, ymin}, {xmax, ymin}, {xmax, ymax}, {xmin, ymax}});
}

ShapeBuilder& ShapeBuilder::Ellipse(S32 x, S32 y, S32 radiusX, S32 radiusY)
{
    // 65536 times cos 45 and tan 22.5: the corners of the octagon round the circle are controls.
    const S64 kDiagonal = 46341, kSide = 27146;
    auto part = [](S64 factor, S32 radius) { return S32((factor * radius + 0x8000) >> 16); };
    S32 diagonalX = part(kDiagonal, radiusX), diagonalY = part(kDiagonal, radiusY);
    S32 sideX = part(kSide, radiusX), sideY = part(kSide, radiusY);
    MoveTo(x + radiusX, y);
    CurveTo(x + radiusX, y + sideY, x + diagonalX, y + diagonalY);
    CurveTo(x + sideX, y + radiusY, x, y + radiusY);
    CurveTo(x - sideX, y + radiusY, x - diagonalX, y + diagonalY);
    CurveTo(x - radiusX, y + sideY, x - radiusX, y);
    CurveTo(x - radiusX, y - sideY, x - diagonalX, y - diagonalY);
    CurveTo(x - sideX, y - radiusY, x, y - radiusY);
    CurveTo(x + sideX, y - radiusY, x + diagonalX, y - diagonalY);
    return CurveTo(x + radiusX, y - sideY, x + radiusX, y);
}

ShapeBuilder& ShapeBuilder::Polygon(const std::vector<Pt>& corners)
{
    MoveTo(corners[0].x, corners[0].y);
    for (size_t i = 1; i < corners.size(); i++)
        LineTo(corners[i].x, corners[i].y);
    return Close();
}

Box ShapeBuilder::Bounds() const
{
    S32 half = 0;
    for (const Block& block : blocks)
        for (const Line& line : block.lines)
            half = std::max(half, (line.width + 1) / 2);
    return {reach.xmin - half, reach.xmax + half, reach.ymin - half, reach.ymax + half};
}

void ShapeBuilder::Add(Record::Kind kind, S32 x1, S32 y1, S32 x2, S32 y2)
{
    records.push_back({kind, x1, y1, x2, y2});
}

void ShapeBuilder::Reach(Pt place)
{
    if (!reached)
        reach = {place.x, place.x, place.y, place.y};
    reached = true;
    reach.xmin = std::min(reach.xmin, place.x);
    reach.xmax = std::max(reach.xmax, place.x);
    reach.ymin = std::min(reach.ymin, place.y);
    reach.ymax = std::max(reach.ymax, place.y);
}

// Turns the recorded verbs into wire records: neighbouring changes of style, selector and pen
// become one record, written when an edge (or the same kind of change) follows.
class ShapeRecordWriter {
public:
    ShapeRecordWriter(const ShapeBuilder& source, ByteWriter& to, bool withAlpha)
        : shape(source), out(to), alpha(withAlpha)
    {
    }

    void WriteStyles(size_t index)
    {
        const ShapeBuilder::Block& block = shape.blocks[index];
        WriteCount(block.fills.size());
        for (const Fill& fill : block.fills)
            WriteFill(fill);
        WriteCount(block.lines.size());
        for (const Line& line : block.lines)
            out.PutU16(line.width).PutColor(line.color, alpha);
        WriteWidths(index);
    }

    void WriteWidths(size_t index)
    {
        const ShapeBuilder::Block& block = shape.blocks[index];
        fillBits = UnsignedBits(std::max(U32(block.fills.size()), U32(block.topFill)));
        lineBits = UnsignedBits(std::max(U32(block.lines.size()), U32(block.topLine)));
        out.Align().UB(4, U32(fillBits)).UB(4, U32(lineBits));
    }

    void WriteRecords()
    {
        for (const Record& record : shape.records)
            WriteRecord(record);
        Flush();
        out.UB(6, 0).Align();
    }

private:
    using Record = ShapeBuilder::Record;

    void WriteRecord(const Record& record)
    {
        if (record.kind == Record::kStraight || record.kind == Record::kCurve) {
            Flush();
            record.kind == Record::kStraight ? WriteStraight(record) : WriteCurve(record);
            return;
        }
        U32 bit = 1u << record.kind;
        // On the wire new styles come last in a record, so a selector set after them needs another.
        if (record.kind != Record::kMove && (pendingFlags & (1u << Record::kNewStyles)))
            Flush();
        pendingFlags |= bit;
        pending[record.kind] = record;
    }

    void Flush()
    {
        if (pendingFlags == 0)
            return;
        out.UB(1, 0).UB(5, pendingFlags);
        if (pendingFlags & 0x01)
            WriteMove(pending[Record::kMove]);
        if (pendingFlags & 0x02)
            out.UB(fillBits, U32(pending[Record::kFill0].x1));
        if (pendingFlags & 0x04)
            out.UB(fillBits, U32(pending[Record::kFill1].x1));
        if (pendingFlags & 0x08)
            out.UB(lineBits, U32(pending[Record::kLine].x1));
        if (pendingFlags & 0x10)
            WriteStyles(size_t(pending[Record::kNewStyles].x1));
        pendingFlags = 0;
    }

    void WriteMove(const Record& move)
    {
        int bits = std::max(SignedBits(move.x1), SignedBits(move.y1));
        out.UB(5, U32(bits)).SB(bits, move.x1).SB(bits, move.y1);
    }

    void WriteStraight(const Record& edge)
    {
        int bits = std::max({2, SignedBits(edge.x1), SignedBits(edge.y1)});
        out.UB(2, 3).UB(4, U32(bits - 2));
        if (edge.x1 != 0 && edge.y1 != 0)
            out.UB(1, 1).SB(bits, edge.x1).SB(bits, edge.y1);
        else if (edge.x1 == 0)
            out.UB(2, 1).SB(bits, edge.y1);
        else
            out.UB(2, 0).SB(bits, edge.x1);
    }

    void WriteCurve(const Record& edge)
    {
        int bits = std::max({2, SignedBits(edge.x1), SignedBits(edge.y1), SignedBits(edge.x2),
                             SignedBits(edge.y2)});
        out.UB(2, 2).UB(4, U32(bits - 2));
        out.SB(bits, edge.x1).SB(bits, edge.y1).SB(bits, edge.x2).SB(bits, edge.y2);
    }

    void WriteCount(size_t count)
    {
        if (count < 0xFF)
            out.PutU8(U32(count));
        else
            out.PutU8(0xFF).PutU16(U32(count));
    }

    void WriteFill(const Fill& fill)
    {
        out.PutU8(fill.type);
        if (fill.type & 0x10) {
            out.PutMatrix(fill.mat).PutU8(U32(fill.stops.size()));
            for (const Stop& stop : fill.stops)
                out.PutU8(stop.ratio).PutColor(stop.color, alpha);
        } else if (fill.type & 0x40) {
            out.PutU16(fill.bitmap).PutMatrix(fill.mat);
        } else {
            out.PutColor(fill.color, alpha);
        }
    }

    const ShapeBuilder& shape;
    ByteWriter& out;
    bool alpha;
    int fillBits = 0, lineBits = 0;
    U32 pendingFlags = 0;
    Record pending[5] = {};
};

void ShapeBuilder::Write(ByteWriter& out, bool alpha) const
{
    ShapeRecordWriter writer(*this, out, alpha);
    writer.WriteStyles(0);
    writer.WriteRecords();
}

void ShapeBuilder::WriteGlyph(ByteWriter& out) const
{
    ShapeRecordWriter writer(*this, out, false);
    writer.WriteWidths(0);
    writer.WriteRecords();
}
