// The law of the dirty rectangles: painting what is dirty gives what painting everything gives.
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
        const Mat turn = Mat::Rotate(Upto(360)).Then(Mat::Scale((20 + Upto(200)) / 100.0));
        return turn.ThenTranslate(Upto(kSide * 24) - kSide * 2, Upto(kSide * 24) - kSide * 2);
    }
    Cx Transform()
    {
        Cx cx;
        for (S32& m : cx.mul)
            m = Upto(300);
        for (S32& a : cx.add)
            a = Upto(100) - 50;
        return cx;
    }
};

Fill AnyFill(Dice& dice, bool radial)
{
    const std::vector<Stop> stops = {{0, dice.Color()}, {200, dice.Color()}};
    const Mat over = Mat::Gradient(400, 400, 900, 700, dice.Upto(360));
    const S32 kind = dice.Upto(3);
    if (kind == 0)
        return Fill::Solid(dice.Color());
    return kind == 1 && radial ? Fill::Radial(over, stops) : Fill::Linear(over, stops);
}

ShapeBuilder AnyShape(Dice& dice, bool radial)
{
    ShapeBuilder shape;
    const int line = dice.OneIn(2) ? shape.AddLine({U16(dice.Upto(80)), dice.Color()}) : 0;
    shape.Styles(shape.AddFill(AnyFill(dice, radial)), 0, line);
    if (dice.OneIn(2))
        shape.Ellipse(400, 400, 100 + dice.Upto(300), 100 + dice.Upto(300));
    else
        shape.Polygon({{0, dice.Upto(400)}, {800, dice.Upto(300)}, {dice.Upto(800), 800}});
    return shape;
}

MovieWriter AnyCast(Dice& dice, bool radial)
{
    MovieWriter movie(kSide * 20, kSide * 20);
    for (U16 id = 1; id <= 12; id++)
        movie.DefineShape(id, AnyShape(dice, radial));
    for (U16 id = 13; id <= 16; id++) {
        TagWriter tags;
        tags.Place(U16(id - 12), 1).Place(U16(id - 8), 2, dice.Place());
        if (id > 14)
            tags.Place2(3, {.character = U16(id - 3), .clipDepth = U16(9)}).Place(U16(id - 6), 5);
        movie.DefineSprite(id, tags.Show().End());
    }
    movie.Show().End();
    return movie;
}

void Edit(Scene& s, Dice& dice)
{
    const U16 depth = U16(1 + dice.Upto(14));
    SObject* there = s.At(depth);
    if (!there) {
        const U16 clip = dice.OneIn(4) ? U16(depth + dice.Upto(6)) : U16(0);
        PlaceInfo info = s.Info(depth, U16(1 + dice.Upto(16)), dice.Place(), clip);
        if (dice.OneIn(3))
            info.cxform = ToTransform(dice.Transform());
        s.list.PlaceObject(s.Root(), &info);
    } else if (dice.OneIn(4)) {
        s.Remove(depth);
    } else if (dice.OneIn(10)) {
        there->Modify();
        there->visible ^= 1;
    } else {
        PlaceInfo info = s.Info(depth, U16(1 + dice.Upto(12)), dice.Place());
        info.cxform = ToTransform(dice.Transform());
        info.flags = PlaceInfo::kMove | (1u << (1 + dice.Upto(3)));
        s.list.MoveObject(s.Root(), &info);
    }
}

// Greatest distance of a channel between partial and full repaints over many edits.
int WorstDifference(bool smooth, bool radial, int steps)
{
    Dice dice;
    Scene s(AnyCast(dice, radial), kSide, kSide, smooth);
    int worst = 0;
    for (int step = 0; step < steps; step++) {
        for (S32 edits = 1 + dice.Upto(3); edits > 0; edits--)
            Edit(s, dice);
        const Picture partial = s.Shown();
        const PictureDiff diff = Compare(partial, s.Repainted());
        worst = std::max(worst, diff.largest);
        if (!radial && diff.count > 0) {
            ADD_FAILURE() << "step " << step << ": "
                          << ExpectSame(partial, s.Repainted(), "repaint");
            break;
        }
    }
    return worst;
}

TEST(Repaint, PartialEqualsFull)
{
    EXPECT_EQ(WorstDifference(false, false, 400), 0);
    EXPECT_EQ(WorstDifference(true, false, 400), 0);
}

// A radial span finds its place on the ramp by walking from its start, so that where it starts can
// cost one step of 256: at most a unit or two of a channel under these transforms and ramps.
TEST(Repaint, RadialWithinARampStep)
{
    EXPECT_LE(WorstDifference(false, true, 300), 3);
    EXPECT_LE(WorstDifference(true, true, 300), 3);
}

// Edges and colours are a cache, and nothing more.
TEST(Repaint, FreeingCachesChangesNoPixel)
{
    Dice dice;
    Scene s(AnyCast(dice, false), kSide, kSide, true);
    for (int step = 0; step < 60; step++)
        Edit(s, dice);
    const Picture before = s.Shown();
    s.list.FreeCache();
    const size_t blocks = s.list.edgeAlloc.BlockCount() + s.list.colorAlloc.BlockCount();
    EXPECT_EQ(blocks, 0u);
    EXPECT_EQ("", ExpectSame(s.Repainted(), before, "free-cache"));
}

} // namespace
