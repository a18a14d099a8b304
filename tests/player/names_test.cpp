#include "core/player/limits.h"
#include "core/player/object_matrix.h"
#include "core/stream/str.h"
#include "tests/player/player_scene.h"

#include <cmath>
#include <sstream>

namespace {

std::string Taken(char* text)
{
    const std::string copy = text ? text : "";
    FreeStr(text);
    return copy;
}

// Words, so many to a row; '' is the empty string.
std::vector<std::vector<std::string>> Rows(size_t columns, const char* text)
{
    std::istringstream in(text);
    std::vector<std::vector<std::string>> rows;
    for (std::string word; in >> word;) {
        if (rows.empty() || rows.back().size() == columns)
            rows.emplace_back();
        rows.back().push_back(word == "''" ? "" : word);
    }
    return rows;
}

// 200 x 200 pixels. Sprite 2 is a square of 10 pixels, sprite 3 holds two of them, "b" and, 20
// pixels to the right, "c"; the movie holds sprite 3 as "a", twice as large and turned by 90
// degrees about the pixel (50, 30). Level 5 and the movie in the place of "/home" are the same.
struct Theatre : PlayingShell {
    static std::vector<U8> Movie()
    {
        MovieWriter movie(4000, 4000), small, pair;
        small.Place(1, 1).Show().End();
        pair.Place2(1, {.character = U16(2), .name = "b"}).Place(1, 9);
        pair.Place2(2, {.character = U16(2), .matrix = Mat::Translate(400, 0), .name = "c"}).Show();
        movie.DefineShape(1, Square()).DefineSprite(2, small).DefineSprite(3, pair.End());
        const Mat turned = {0, 0x20000, -0x20000, 0, 1000, 600}, home = Mat::Translate(3000, 3000);
        movie.Place2(1, {.character = U16(3), .matrix = turned, .name = "a"});
        movie.Place2(2, {.character = U16(2), .name = std::string(127, 'n')});
        movie.Place2(3, {.character = U16(2), .name = std::string(128, 'n')});
        movie.DefineButton(4, 7, {{9, 2, 1}}).Place2(4, {.character = U16(4), .name = "btn"});
        movie.Place2(6, {.character = U16(2), .matrix = home, .name = "Home"}).Show(8).End();
        return movie.Bytes();
    }
    Theatre() : PlayingShell(Movie())
    {
        OpenLayer(6, 0);
        for (ScriptPlayer* movie : {OpenLayer(5, 0), OpenSprite(At("/home"))}) {
            movie->PushDataBuf(Movie().data(), S32(Movie().size()));
            movie->DrawFrame(0, false);
        }
    }
    ScriptThread* At(const std::string& path) { return FindTarget(nullptr, path.c_str()); }
    SObject* Object(const std::string& path) { return At(path)->rootObject; }
    std::string PathOf(const ScriptThread* thread)
    {
        SObject* obj = thread ? thread->rootObject : nullptr;
        return obj ? Taken(GetTargetPath(obj)) : thread ? "empty" : "none";
    }
    std::string Get(const char* path, int index) { return Taken(GetPropertyStr(At(path), index)); }
    // Where an object comes to when it is dragged to a pixel, roughly, and what is below it there.
    std::string Drag(S32 x, S32 y, const char* path)
    {
        const SPOINT pt = {x, y};
        RectSetEmpty(&invalidated);
        UpdateDragObject(&pt);
        const MATRIX& m = Object(path)->xform.mat;
        const S32 rough[] = {FixedNearestMultiple(m.tx, 10), FixedNearestMultiple(m.ty, 10)};
        return std::to_string(rough[0]) + " " + std::to_string(rough[1]) + " " + Get(path, 14);
    }
};

TEST(Names, LeadToTimelinesAndVariables)
{
    Theatre t;
    for (const auto& row : Rows(3, R"(
        / '' /              / A//b/ /a/b          /a/b '' /a/b        /a/b ../c /a/c
        /a/b ../.. /        /a/b ../../.. none    /a/b /a /a          /a c/x/../b none
        / a/_level5 none    / _level7 none        / _level6 empty     / _level6/a none
        /a _vexel0/a /a     /a /_LEVEL5 _level5   _level5 .. none     /a _level5/a/c _level5/a/c
        / btn none   _level5/a /a/b _level5/a/b   /home/a/b /a /Home/a   /home/a/b ../../.. /)"))
        EXPECT_EQ(row[2], t.PathOf(t.FindTarget(t.Object(row[0]), row[1].c_str()))) << row[1];
    EXPECT_TRUE(t.At(std::string(127, 'N')) && !t.At(std::string(128, 'N') + "/.."));
    // What no path reaches has that of the nearest that one reaches.
    SObject* button = t.scene.FindChild(t.rootObject, 4);
    for (SObject* obj : {button, button->bottomChild, t.scene.FindChild(t.Object("/a"), 9)})
        EXPECT_EQ(obj->depth == 9 ? "/a" : "/", Taken(t.GetTargetPath(obj)));
    t.ScriptThread::SetVariable("x.y", "1", 0); // by other means than its path
    for (const auto& row : Rows(3, R"(
        /a x /a:x   /a b:x /a/b:X   /a :y /a:y   /a/b /:z Z   /a _level6:v _vexel6:V
        /a a/b /a:a/b   _level6 :w _level6:W   / f.scroll none   / /:x.y none  / nobody:x none)")) {
        ScriptValue value;
        t.SetVariable(t.At(row[0]), row[1].c_str(), row[1].c_str(), 1);
        EXPECT_EQ(row[2] != "none", t.GetVariable(t.At(row[0]), row[1].c_str(), &value)) << row[1];
        EXPECT_EQ(value.Text(), Taken(t.GetVariable(nullptr, row[2].c_str())));
        EXPECT_EQ(nullptr, t.FindVariable("f.scroll"));
    }
    // Paths of half a megabyte end, and what they cost is told.
    std::string far;
    while (far.size() < 500000)
        far += "a/../";
    EXPECT_EQ("/", t.PathOf(t.At(far)));
    EXPECT_GE(t.scene.work, 100000u);
    gLimits.workPerRun = 160000;
    EXPECT_EQ("none", t.PathOf(t.At(far)));
    gLimits = {};
}

TEST(Properties, AreReadAndWritten)
{
    Theatre t;
    SObject* obj = t.Object("/a");
    obj->xform.mat = {0, 0x20000, -0x8000, 0, 205, -31};
    obj->xform.cxform.alphaMul = 84;
    t.sourceName = CreateStr("file.vxm");
    EXPECT_EQ("8 8 0", t.Get("/", 5) + " " + t.Get("/", 12) + " " + t.Get("_level6", 0));
    // Index, what is written, what is read then. The box: 10 pixels and, 20 to the right, 10 more,
    // through the matrix: 5 wide, 60 high.
    for (const auto& row : Rows(3, R"(
        0 x 10.25   1 x -1.55   2 x 200   3 x 50   4 x 1   5 x 1   6 x 32.8125   7 x 1   8 x 5
        9 x 60   10 x 90   11 x /a   12 x 1   13 a a   14 x ''   15 x file.vxm   16 x 1   17 x 1
        18 x 5   19 1 ''   -1 1 ''   7 -2 1   7 0 0   7 x 0   16 0 0   16 0.5 1   16 1.5 2   17 0 0
        18 2.9 2   12 7 1   4 3 1   6 33 32.8125    6 32.8125 32.8125   6 1e9 12799.609375
        0 16.15 16.15   1 -0.98 -0.95   0 1e30 107374182.35   0 x 107374182.35)")) {
        const int index = std::stoi(row[0]);
        obj->puppet = 0;
        t.SetPropertyStr(t.At("/a"), index, row[1].c_str());
        EXPECT_EQ(row[2], t.Get("/a", index)) << index << " = " << row[1];
        EXPECT_EQ((index == 0 || index == 1 || index == 6) && row[1] != "x", obj->puppet);
    }
    obj->xform.mat = {46341, 46341, 0, 0, 0, 0};
    EXPECT_EQ("99.9984741210938", t.Get("/a", 2)) << "lengths come from a table";
    // Index, value, and the matrix before and after the write.
    for (const auto& row : Rows(4, R"(
        2 150 1,0,0,1 1.5,0,0,1     2 -100 1,0,0,1 -1,0,0,1     3 300 1,0,0,1 1,0,0,3
        2 100.02 1,0,0,1 1,0,0,1    2 100.03 1,0,0,1 1.0003,0,0,1   3 50 1,0,-.8,.6 1,0,-.4,.3
        2 100 0,0,-1,0 0,1,-1,0     2 500 46e-6,61e-6,0,1 3,4,0,1   3 100 0,1,0,0 0,1,-1,0
        2 100 0,0,0,0 1,0,0,0       3 100 0,0,0,0 0,0,0,1       3 -50 2,0,1,1 2,0,-.35355,-.35355
        10 0 1,0,1,1 1,0,1,1        10 720 0,1,2,1 1,0,1,-2     10 90 1,0,0,-1 0,1,1,0
        10 180 0,0,0,1 0,0,0,-1 10 -90 1,0,0,1 0,-1,1,0 10 45 1,0,0,0 .7071,.7071,0,0)")) {
        MATRIX m[2];
        for (int k = 0; k < 2; k++) {
            double f[4];
            std::sscanf(row[size_t(2 + k)].c_str(), "%lf,%lf,%lf,%lf", f, f + 1, f + 2, f + 3);
            m[k] = {Mat::Fixed(f[0]), Mat::Fixed(f[1]), Mat::Fixed(f[2]), Mat::Fixed(f[3]), 7, 8};
        }
        obj->xform.mat = m[0];
        obj->puppet = obj->dirty = 0;
        t.SetProperty(t.At("/a"), std::stoi(row[0]), std::stod(row[1]));
        EXPECT_TRUE(MatrixEqual(&m[1], &obj->xform.mat, 3) && obj->puppet && obj->dirty)
            << row[0] << " = " << row[1];
    }
    // Turned by a script for a minute, an object is what it was.
    MATRIX m = {0x20000, 0, 0, 0x10000, 0, 0};
    for (int n = 0; n < 1000; n++)
        MatrixSetRotation(&m, MatrixRotation(&m) + 7.3);
    EXPECT_NEAR(0x20000, std::hypot(m.a, m.b), 60);
    EXPECT_NEAR(0, std::hypot(m.a - 2.0 * m.d, m.b + 2.0 * m.c), 120);
}

// Pixel (50, 30) is the origin of "/a"; a pixel to the right there is two up on its y axis.
TEST(Drag, FollowsThePointerInItsParent)
{
    Theatre t;
    const SRECT swapped = {450, 390, 60, -10};
    t.Object("_level5")->visible = 0;
    t.mousePt = {45, 35};
    t.StartDrag(t.At("/a/b"), false, nullptr);
    EXPECT_EQ("100 -100 ", t.Drag(55, 45, "/a/b"));
    EXPECT_EQ("400 0 /a/c", t.Drag(45, 75, "/a/b"));
    t.StartDrag(t.At("/a/b"), false, &swapped);
    EXPECT_EQ("450 -10 ", t.Drag(100, 160, "/a/b"));
    EXPECT_EQ("450 0 ", t.Drag(45, kS32Max, "/a/b")) << "far out is far out";
    EXPECT_EQ("400 0 /a/c", t.Drag(45, 75, "/a/b")) << "held where it was";
    t.mousePt = {5, 5};
    t.EndDrag();
    t.mousePt = {45, 75};
    t.EndDrag();
    EXPECT_EQ("/ 1", t.Get("/a/b", 14) + " " + t.Get("/a/b", 7)) << "dropped there, visible";
    t.StartDrag(t.At("/a/c"), true, nullptr);
    EXPECT_EQ("200 -200 ", t.Drag(70, 50, "/a/c"));
    EXPECT_TRUE(t.Object("/a/c")->puppet && !RectIsEmpty(&t.invalidated));
    t.scene.RemoveThisObject(t.Object("/a/c"));
    EXPECT_EQ("1000 600 ", t.Drag(1, 1, "/a"));
}

} // namespace
