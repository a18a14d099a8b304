#include "tests/shape/shape_scene.h"

#include <gtest/gtest.h>

#include <random>

namespace {

// Every edge and style change of the shape, as numbers that can be compared; the pen's coordinates
// are those of `mat`.
std::vector<S32> Trace(ShapeScene& scene, const MATRIX& mat, S32 len)
{
    SCharacterParser p = scene.Parser(mat, len);
    std::vector<S32> seen = {p.GetStyles()};
    CURVE c;
    int flags = 0;
    while ((flags = p.GetEdge(&c)) != SShapeParser::kEndOfShape) {
        if (flags == 0)
            seen.insert(seen.end(), {c.anchor1.x, c.anchor1.y, c.control.x, c.control.y,
                                     c.anchor2.x, c.anchor2.y, c.isLine});
        else
            seen.insert(seen.end(), {flags, S32(p.fill0), S32(p.fill1), S32(p.line)});
        seen.insert(seen.end(), {p.curPt.x, p.curPt.y, p.pos, p.bitPos, S32(p.bitBuf)});
    }
    return seen;
}

ShapeBuilder RandomShape(std::mt19937& random)
{
    ShapeBuilder shape;
    shape.AddFill(Rgba{1, 1, 1});
    auto coord = [&] { return S32(random() % 30000) >> (random() % 16); };
    for (int i = 0; i < 12; ++i) {
        if (random() % 4 == 0)
            shape.Fill1(int(random() % 2)).MoveTo(coord(), -coord());
        if (random() % 2)
            shape.LineTo(random() % 3 ? coord() : 5, random() % 3 ? coord() : 5);
        else
            shape.CurveTo(coord(), coord(), -coord(), coord());
    }
    return shape;
}

TEST(Records, MovesAreAbsoluteAndEdgesRelative)
{
    ShapeScene scene;
    ByteWriter out;
    out.PutU16(0).UB(4, 0).UB(4, 0);
    out.UB(6, 0x01).UB(5, 8).SB(8, 100).SB(8, -100);
    out.UB(2, 3).UB(4, 0).UB(1, 1).SB(2, 1).SB(2, -2); // width field 0: two bits
    out.UB(2, 2).UB(4, 4).SB(6, 10).SB(6, 0).SB(6, 0).SB(6, -20);
    out.UB(2, 3).UB(4, 3).UB(2, 1).SB(5, 7); // vertical
    out.UB(2, 3).UB(4, 3).UB(2, 0).SB(5, 9); // horizontal
    out.UB(6, 0x01).UB(5, 0);
    out.UB(2, 3).UB(4, 0).UB(2, 0).SB(2, -1);
    out.UB(6, 0);
    scene.data = out.Bytes();
    const MATRIX mat = {0x20000, 0, 0, 0x8000, 1, 0};
    const std::vector<std::vector<S32>> expected = {{201, -50, 202, -51, 203, -51, 1},
                                                    {203, -51, 223, -51, 223, -61, 0},
                                                    {223, -61, 223, -60, 223, -58, 1},
                                                    {223, -58, 232, -58, 241, -58, 1},
                                                    {1, 0, 0, 0, -1, 0, 1}};
    std::vector<std::vector<S32>> got;
    SCharacterParser p = scene.Parser(mat);
    ASSERT_TRUE(p.GetStyles());
    CURVE c;
    for (int flags = p.GetEdge(&c); flags != SShapeParser::kEndOfShape; flags = p.GetEdge(&c))
        if (flags == 0)
            got.push_back({c.anchor1.x, c.anchor1.y, c.control.x, c.control.y, c.anchor2.x,
                           c.anchor2.y, c.isLine});
    EXPECT_EQ(got, expected);
}

// Near its end the data is read by another, careful reader; what follows must not matter.
TEST(Records, NothingBehindTheDataIsSeen)
{
    std::mt19937 random(7);
    for (int i = 0; i < 300; ++i) {
        ShapeScene scene;
        scene.Load(RandomShape(random));
        const S32 len = S32(scene.data.size());
        const MATRIX mat = {0x9000, S32(random() % 0x8000), -0x3000, 0x11000, 5, -5};
        scene.data.resize(size_t(len) + 1); // the zero byte that data always carries
        const std::vector<S32> exact = Trace(scene, mat, len);
        scene.data.resize(size_t(len) + 40, 0xFF);
        EXPECT_EQ(exact, Trace(scene, mat, len + 40));
    }
}

// Whatever the bytes, every edge that reaches the raster obeys the raster's terms.
TEST(Records, ArbitraryBytesMakeOnlySoundEdges)
{
    std::mt19937 random(11);
    size_t made = 0;
    for (int i = 0; i < 3000; ++i) {
        ShapeScene scene;
        scene.Load(RandomShape(random), i & 1);
        for (U32 n = random() % 8; n > 0; --n)
            scene.data[random() % scene.data.size()] = U8(random());
        const S32 len = S32(scene.data.size() - random() % 4);
        const int shift = int(random() % 16);
        const MATRIX mat = {S32(random()) >> shift, S32(random()) >> 18,    S32(random()) >> 16,
                            S32(random()) >> shift, S32(random()) >> shift, S32(random()) >> 8};
        scene.obj.clipDepth = i % 3 == 0;
        scene.Build(i & 4 ? kHugeBounds : kSmallBounds, mat, len);
        for (const REdge* e : scene.Edges()) {
            ++made;
            ASSERT_LT(e->anchor1y, e->anchor2y);
            ASSERT_LE(e->anchor1y, e->controly);
            ASSERT_LE(e->controly, e->anchor2y);
            ASSERT_TRUE(e->color1);
            ASSERT_EQ(e->color2 != nullptr, e->fillRule == kRuleEdge);
        }
    }
    EXPECT_GT(made, 10000u);
}

} // namespace
