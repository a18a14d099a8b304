// What is on the screen, and what lies under a point.
#include <map>
#include <sstream>

#include "tests/display/scene.h"

namespace {

// Besides the cast 5: a disc with a hole; 6: two colours with an edge in common.
Cast Shapes()
{
    Cast movie;
    ShapeBuilder disc, pair;
    disc.Styles(disc.AddFill(Rgba{255}), 0).Circle(600, 600, 500).Circle(600, 600, 200);
    const int left = pair.AddFill(Rgba{255}), right = pair.AddFill(Rgba{0, 0, 255});
    pair.Styles(0, left).MoveTo(400, 0).LineTo(400, 1200);
    pair.Styles(right, left).MoveTo(800, 0).LineTo(800, 1200);
    pair.Styles(right, 0).MoveTo(1200, 1200).LineTo(1200, 0);
    movie.DefineShape(5, disc).DefineShape(6, 32, {0, 1200, 0, 1200}, pair);
    return movie;
}

// The area counts as three times three places. An actor is a depth, a character, its place and a
// clip depth; the answer is the colour in the middle of each place, and the depth of what is hit.
TEST(Paint, Table)
{
    const struct {
        const char *what, *actors, *colors, *hits;
    } cases[] = {
        {"depth decides", "9 1 00 0  5 2 00 0", "rg.gg....", "95.55...."},
        {"later ones are below", "5 1 00 0  5 2 00 0", "rg.gg....", "55.55...."},
        {"a sprite's child is hit", "7 12 11 0", "....r....", "....5...."},
        {"a hole", "5 5 00 0", ".r.r.r.r.", ".5.5.5.5."},
        {"an edge of two colours", "5 6 00 0", ".rb.rb.rb", ".55.55.55"},
        {"a mask's range", "5 2 00 0  6 1 10 0  7 1 22 0  3 1 00 6", "g.......r", "5.......7"},
        {"two masks", "3 2 00 9  4 2 11 7  6 3 00 0  8 1 00 0", "r...b....", "8...6...."},
        {"the inner one reaches further", "3 1 00 7  5 2 00 9  8 3 00 0", "b........", "888888888"},
        {"a mask without colours", "3 4 00 9  5 2 00 0", "gg.gg....", "........."},
        {"a mask that is no shape", "3 10 00 9  5 2 00 0", "gg.gg....", "........."},
    };
    const std::map<U32, char> letters = {{kRed, 'r'}, {kGreen, 'g'}, {kBlue, 'b'}, {kWhite, '.'}};
    for (int i = 0; i < 2 * int(std::size(cases)); i++) {
        const auto& c = cases[i / 2];
        Scene s(Shapes(), 60, i % 2);
        std::istringstream actors(c.actors);
        for (U16 depth, id, place, clip; actors >> depth >> id >> place >> clip;)
            s.Place(depth, id, AtPixel(place / 10 * 20, place % 10 * 20), clip);
        const Picture p = s.Shown();
        std::string colors, hits;
        for (int at = 0; at < 9; at++) {
            const SPOINT pt = {at % 3 * 20 + 10, at / 3 * 20 + 10};
            const SObject* hit = s.list.HitTest(&pt);
            colors += letters.at(p.At(pt.x, pt.y));
            hits += hit ? char('0' + hit->depth) : '.';
        }
        EXPECT_EQ(colors, c.colors) << c.what;
        EXPECT_EQ(hits, c.hits) << c.what;
        s.list.InvalidateRect(&s.list.devViewRect);
        EXPECT_EQ("", ExpectSame(s.Shown(), p, "hits-leave-no-trace"));
    }
}

TEST(Paint, OnlyDirtyPixelsAreTouched)
{
    Scene s((Cast()));
    s.Place(5, 1, AtPixel(10, 10));
    s.Shown();
    RectSetEmpty(&s.list.bitsDirty);
    s.list.RemoveObject(s.Root(), 5);
    s.Shown();
    const SRECT want = {8, 32, 8, 32};
    EXPECT_TRUE(RectEqual(&s.list.bitsDirty, &want, 1)) << s.list.bitsDirty.xmax;
}

// Masks nested among siblings are as deep a recursion as a movie likes.
TEST(Paint, ManyMasksAreSafe)
{
    Scene s((Cast()));
    for (U32 depth = 20000; depth > 0; depth--)
        s.Place(U16(depth), 1, {}, 30000);
    const SPOINT pt = {5, 5};
    EXPECT_EQ(s.list.HitTest(&pt), nullptr);
    SObject* top = s.Place(25000, 2);
    EXPECT_EQ(s.Shown().At(5, 5), kGreen);
    EXPECT_EQ(s.list.HitTest(&pt), top);
}

TEST(Paint, BackgroundAndFocus)
{
    for (const S32 unit : {1, 4}) {
        Scene s(Cast(), 60, unit == 4);
        s.list.SetBackgroundColor({0, 0, 255, 0}, 1);   // painted opaque whatever its alpha
        s.list.SetBackgroundColor({255, 0, 0, 255}, 1); // no higher: too late
        EXPECT_EQ(s.Shown().At(5, 5), kBlue);
        s.list.SetBackgroundColor({}, 2);
        s.list.Reset();
        s.list.tabFocusRect = {20 * unit, 50 * unit, 30 * unit, 40 * unit};
        const Picture p = s.Repainted();
        const auto count = [&p](U32 pixel) {
            return std::count(p.pixels.begin(), p.pixels.end(), pixel);
        };
        EXPECT_EQ(count(0xFFFFFF00), 30 * 10 - 24 * 4);
        EXPECT_EQ(count(0), 60 * 60 - 30 * 10 + 24 * 4);
        EXPECT_TRUE(p.At(20, 30) != 0 && p.At(49, 39) != 0 && p.At(22, 36) != 0);
    }
}

} // namespace
