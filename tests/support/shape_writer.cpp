#include "tests/support/shape_writer.h"

#include <algorithm>
#include <cstdlib>
#include <utility>

int ShapeBuilder::AddFill(const Fill& fill)
{
    blocks.back().fills.push_back(fill);
    return Raise(kFill0, blocks.back().fills.size());
}

int ShapeBuilder::AddLine(const Line& line)
{
    blocks.back().lines.push_back(line);
    return Raise(kLine, blocks.back().lines.size());
}

int ShapeBuilder::Raise(Selector which, size_t selector)
{
    int& top = blocks.back().top[which == kLine];
    top = std::max(top, int(selector));
    return int(selector);
}

// Neighbouring changes are one record. On the wire new styles come last in it, so a selector set
// after them needs another.
ShapeBuilder::Record& ShapeBuilder::Change(U32 part)
{
    U32 open = records.empty() ? 0 : records.back().parts;
    if (open == 0 || (part != kMove && (open & kNewStyles)))
        records.emplace_back();
    records.back().parts |= part;
    return records.back();
}

ShapeBuilder& ShapeBuilder::NewStyles()
{
    Change(kNewStyles).block = blocks.size();
    blocks.emplace_back();
    return *this;
}

ShapeBuilder& ShapeBuilder::Select(Selector which, int selector)
{
    Change(kSelector << which).selectors[which] = Raise(which, size_t(selector));
    return *this;
}

ShapeBuilder& ShapeBuilder::MoveTo(S32 x, S32 y)
{
    Change(kMove).move = pen = start = {x, y};
    return *this;
}

ShapeBuilder& ShapeBuilder::LineTo(S32 x, S32 y)
{
    S32 dx = x - pen.x, dy = y - pen.y;
    if (std::max(std::abs(dx), std::abs(dy)) > 0xFFFF)
        return LineTo(pen.x + dx / 2, pen.y + dy / 2).LineTo(x, y);
    return AddEdge({dx, dy}, {x, y});
}

ShapeBuilder& ShapeBuilder::CurveTo(S32 controlX, S32 controlY, S32 x, S32 y)
{
    Reach({controlX, controlY});
    return AddEdge({controlX - pen.x, controlY - pen.y, x - controlX, y - controlY}, {x, y});
}

ShapeBuilder& ShapeBuilder::AddEdge(const std::vector<S32>& deltas, Pt end)
{
    records.emplace_back().deltas = deltas;
    Reach(pen);
    Reach(end);
    pen = end;
    return *this;
}

ShapeBuilder& ShapeBuilder::Close()
{
    return pen.x == start.x && pen.y == start.y ? *this : LineTo(start.x, start.y);
}

ShapeBuilder& ShapeBuilder::Ellipse(S32 x, S32 y, S32 radiusX, S32 radiusY)
{
    // The corners of the octagon round the circle are control points: in 65536ths, cos 45 and
    // tan 22.5. One list serves both coordinates, a quarter turn apart.
    const S32 kOne = 65536, kCos = 46341, kTan = 27146;
    const S32 kTurn[16] = {kOne,  kOne,  kCos,  kTan,  0, -kTan, -kCos, -kOne,
                           -kOne, -kOne, -kCos, -kTan, 0, kTan,  kCos,  kOne};
    auto along = [&](int i, S32 radius) { return (S64(kTurn[i % 16]) * radius + 0x8000) >> 16; };
    auto at = [&](int i) {
        return Pt{x + S32(along(i, radiusX)), y + S32(along(i + 12, radiusY))};
    };
    MoveTo(at(0).x, at(0).y);
    for (int i = 1; i < 16; i += 2)
        CurveTo(at(i).x, at(i).y, at(i + 1).x, at(i + 1).y);
    return *this;
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

void ShapeBuilder::Reach(Pt place)
{
    if (!reached)
        reach = {place.x, place.x, place.y, place.y};
    reached = true;
    reach = {std::min(reach.xmin, place.x), std::max(reach.xmax, place.x),
             std::min(reach.ymin, place.y), std::max(reach.ymax, place.y)};
}

static void WriteCount(ByteWriter& out, size_t count)
{
    count < 0xFF ? out.PutU8(U32(count)) : out.PutU8(0xFF).PutU16(U32(count));
}

void ShapeBuilder::WriteStyles(ByteWriter& out, size_t at, bool alpha,
                               const ShapeBuilder* end) const
{
    const Block& own = blocks[at];
    std::vector<const Block*> all = {&own}; // whatever a style says is said for each of these
    if (end)
        all.push_back(&end->blocks[at]);
    WriteCount(out, own.fills.size());
    for (size_t i = 0; i < own.fills.size(); i++) {
        const Fill& fill = own.fills[i];
        out.PutU8(fill.type);
        if (fill.type & 0x40)
            out.PutU16(fill.bitmap);
        for (const Block* b : all)
            fill.type ? out.PutMatrix(b->fills[i].mat) : out.PutColor(b->fills[i].color, alpha);
        if (fill.type & 0x10)
            out.PutU8(U32(fill.stops.size()));
        for (size_t n = 0; n < fill.stops.size(); n++)
            for (const Block* b : all)
                out.PutU8(b->fills[i].stops[n].ratio).PutColor(b->fills[i].stops[n].color, alpha);
    }
    WriteCount(out, own.lines.size());
    for (size_t i = 0; i < own.lines.size(); i++) {
        for (const Block* b : all)
            out.PutU16(b->lines[i].width);
        for (const Block* b : all)
            out.PutColor(b->lines[i].color, alpha);
    }
}

void ShapeBuilder::Block::WriteChange(ByteWriter& out, const Record& change) const
{
    out.UB(1, 0).UB(5, change.parts);
    if (change.parts & kMove)
        out.Fields(5, {change.move.x, change.move.y});
    for (Selector which : {kFill0, kFill1, kLine}) {
        if (change.parts & kSelector << which)
            out.UB(Bits(which), U32(change.selectors[which]));
    }
}

static void WriteEdge(ByteWriter& out, const std::vector<S32>& deltas)
{
    int bits = std::max(2, SignedBits(deltas));
    bool straight = deltas.size() == 2;
    out.UB(2, straight ? 3 : 2).UB(4, U32(bits - 2));
    if (straight && deltas[0] == 0) {
        out.UB(2, 1).SB(bits, deltas[1]);
    } else if (straight && deltas[1] == 0) {
        out.UB(2, 0).SB(bits, deltas[0]);
    } else {
        out.UB(straight, 1);
        for (S32 delta : deltas)
            out.SB(bits, delta);
    }
}

void ShapeBuilder::WriteRecords(ByteWriter& out, bool alpha, const ShapeBuilder* end) const
{
    const Block* block = &blocks[0];
    block->WriteWidths(out);
    for (const Record& record : records) {
        if (record.parts == 0)
            WriteEdge(out, record.deltas);
        else
            block->WriteChange(out, record);
        if (record.parts & kNewStyles) {
            block = &blocks[record.block];
            WriteStyles(out, record.block, alpha, end);
            block->WriteWidths(out);
        }
    }
    out.UB(6, 0).Align();
}

void ShapeBuilder::Write(ByteWriter& out, bool alpha, const ShapeBuilder* end) const
{
    WriteStyles(out, 0, alpha, end);
    WriteRecords(out, alpha, end);
}

void ShapeBuilder::WriteMorph(ByteWriter& out, const ShapeBuilder& end) const
{
    ByteWriter first;
    Write(first, true, &end);
    ShapeBuilder bare = end;
    bare.blocks = {Block()};
    for (Record& record : bare.records) // moves, and selectors of no bits, which say nothing
        record.parts = record.parts ? (record.parts & ~U32(kNewStyles)) | kSelector : 0;
    bare.WriteGlyph(out.PutU32(U32(first.Size())).PutBytes(first.Bytes()));
}
