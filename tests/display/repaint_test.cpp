// The law of the dirty rectangles: painting what is dirty gives what making everything anew gives.
#include <random>

#include "tests/display/scene.h"

namespace {

constexpr S32 kSide = 96;

// Small numbers from a fixed seed, the same with every library.
struct Dice {
    std::mt19937 engine{20240817};

    S32 Upto(S32 n) { return S32(engine() % U32(n)); }
    bool OneIn(S32 n) { return Upto(n) == 0; }
    Rgba Color() { return {U8(Upto(256)), U8(Upto(256)), U8(Upto(256)), U8(Upto(3) ? 255 : 120)}; }
    Mat Place()
    {
        const double scale = (20 + Upto(200)) / 100.0, squash = OneIn(3) ? 0.2 : 1;
        const Mat turn = Mat::Rotate(Upto(360)).Then(Mat::Scale(scale, scale * squash));
        return turn.ThenTranslate(Upto(kSide * 24) - kSide * 2, Upto(kSide * 24) - kSide * 2);
    }
    ShapeBuilder Shape(bool radial)
    {
        ShapeBuilder shape;
        const Fill::Stops stops = {{0, Color()}, {200, Color()}};
        const Mat over = Mat::Gradient(400, 400, 900, 700, Upto(360));
        const Fill fills[] = {Fill::Solid(Color()), Fill::Linear(over, stops),
                              Fill::Radial(over, stops)};
        const int line = OneIn(2) ? shape.AddLine({U16(Upto(300)), Color()}) : 0;
        shape.Styles(shape.AddFill(fills[Upto(radial ? 3 : 2)]), 0, line);
        if (OneIn(2))
            return shape.Ellipse(400, 400, 100 + Upto(300), 100 + Upto(300));
        return shape.Polygon({{0, Upto(400)}, {800, Upto(300)}, {Upto(800), 800}});
    }
};

Cast AnyCast(Dice& dice, bool radial)
{
    Cast movie(kSide);
    for (U16 id = 101; id <= 112; id++) {
        const ShapeBuilder shape = id == 111 ? ShapeBuilder() : dice.Shape(radial);
        const Box lie = {300, 500, 300, 500};
        movie.DefineShape(id, kTagDefineShape3, id % 4 ? shape.Bounds() : lie, shape);
    }
    for (U16 id = 113; id <= 116; id++) {
        TagWriter tags;
        tags.Place(U16(id - 12), 1).Place(U16(id - 8), 2, dice.Place());
        if (id > 114)
            tags.Place2(3, {.character = U16(id - 3), .clipDepth = U16(9)}).Place(U16(id - 6), 5);
        movie.DefineSprite(id, tags.Show().End());
    }
    return movie;
}

void Edit(Scene& s, Dice& dice)
{
    const U16 depth = U16(1 + dice.Upto(14));
    SObject* there = s.At(depth);
    const U16 clip = !there && dice.OneIn(4) ? U16(depth + dice.Upto(6)) : U16(0);
    PlaceInfo info = s.Info(depth, U16(101 + dice.Upto(there ? 12 : 16)), dice.Place(), clip);
    info.cxform.redMul = info.cxform.alphaMul = S16(dice.OneIn(2) ? 256 : dice.Upto(300));
    info.cxform.greenAdd = S16(dice.Upto(100) - 50);
    info.cxform.CalcFlags();
    if (!there) {
        s.list.PlaceObject(s.Root(), &info);
    } else if (dice.OneIn(4)) {
        s.list.RemoveObject(s.Root(), depth);
    } else if (dice.OneIn(10)) {
        there->Modify();
        there->visible ^= 1;
    } else {
        info.flags = PlaceInfo::kMove | (1u << (1 + dice.Upto(3)));
        s.list.MoveObject(s.Root(), &info);
    }
}

// A radial span finds its place on the ramp by walking from its start, so that where it starts can
// cost one step of 256: at most a unit or two of a channel under these transforms and ramps.
TEST(Repaint, PartialEqualsFull)
{
    for (const int kind : {0, 1, 2, 3}) {
        const bool smooth = kind & 1, radial = kind & 2;
        Dice dice;
        Scene s(AnyCast(dice, radial), kSide, smooth);
        for (int step = 0; step < 400; step++) {
            for (S32 edits = 1 + dice.Upto(3); edits > 0; edits--)
                Edit(s, dice);
            const Picture partial = s.Shown(), full = s.Repainted();
            if (radial)
                ASSERT_LE(Compare(partial, full).largest, 3) << "step " << step;
            else
                ASSERT_EQ("", ExpectSame(partial, full, "repaint")) << "step " << step;
        }
        s.list.FreeCache();
        EXPECT_EQ(s.list.edgeAlloc.BlockCount() + s.list.colorAlloc.BlockCount(), 0u);
    }
}

} // namespace
