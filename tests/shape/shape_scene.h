// One object of a display list and the parsers that a test runs on it.
#pragma once

#include "core/display/display_list.h"
#include "core/shape/character_parser.h"
#include "core/stream/script_player.h"
#include "tests/support/shape_writer.h"

#include <vector>

inline constexpr MATRIX kUnitMatrix = {0x10000, 0, 0, 0x10000, 0, 0};
inline constexpr SRECT kSmallBounds = {-1000, 1000, -1000, 1000};
inline constexpr SRECT kHugeBounds = {-40000, 40000, -40000, 40000};

struct ShapeScene {
    DisplayList display;
    CBitBuffer bits;
    ScriptPlayer movie;
    SObject obj = {};
    std::vector<U8> data;

    ShapeScene()
    {
        bits.CreateScreenBits(16, 16);
        display.bits = &bits;
        obj.display = &display;
    }

    void Load(const ShapeBuilder& shape, bool alpha = false)
    {
        ByteWriter out;
        shape.Write(out, alpha);
        data = out.Bytes();
    }

    // A parser over the first `len` bytes of `data`; all of them by default.
    SCharacterParser Parser(const MATRIX& mat = kUnitMatrix, S32 len = -1)
    {
        return SCharacterParser(&obj, &movie, data.data(), len < 0 ? S32(data.size()) : len, 0,
                                &mat);
    }

    bool Build(const SRECT& bounds = kSmallBounds, const MATRIX& mat = kUnitMatrix, S32 len = -1)
    {
        obj.edges = nullptr;
        return Parser(mat, len).BuildEdges(true, &bounds);
    }

    std::vector<REdge*> Edges() const
    {
        std::vector<REdge*> all;
        for (REdge* e = obj.edges; e; e = e->next)
            all.push_back(e);
        return all;
    }
};

inline MATRIX ToMatrix(const Mat& m)
{
    return {m.a, m.b, m.c, m.d, m.tx, m.ty};
}
