// Mouse and keyboard. A pixel is 16 twips here, so that device coordinates come out exactly.
#include "tests/player/player_scene.h"

#include <array>

namespace {

constexpr S32 kPixel = 16;
constexpr int kTab = 18, kEnter = 13, kLeft = 1, kRight = 2, kUp = 14, kDown = 15, kShift = 1;
constexpr U32 kOnK = 'k' << 9, kOnTab = kTab << 9; // in a button's conditions
using Spots = std::vector<std::array<S32, 3>>;     // left, top, size; 0: 20

// Adds a text to the variable "log" of the button's timeline.
std::vector<U8> Say(const std::string& text)
{
    const auto push = [](const std::string& s) {
        return ByteWriter().PutU8(0x96).PutU16(U32(s.size() + 2)).PutU8(0).PutString(s).Bytes();
    };
    ByteWriter out;
    out.PutBytes(push("log")).PutBytes(push("log")).PutU8(0x1C).PutBytes(push(text));
    return out.PutU8(0x21).PutU8(0x1D).PutU8(0).Bytes();
}

Mat At(S32 x, S32 y, S32 size = 20)
{
    return Mat::Scale(size / 20.0).ThenTranslate(x * kPixel, y * kPixel);
}

// Stands still; character 1 is a square of 20 pixels, and every button is one.
struct Stage : MovieWriter {
    Stage() : MovieWriter(200 * kPixel, 200 * kPixel, Fps(10))
    {
        ShapeBuilder square;
        square.Styles(0, square.AddFill(Rgba{9, 9, 9})).Rect(0, 0, 20 * kPixel, 20 * kPixel);
        Background({255, 255, 255, 255}).DefineShape(1, square).DoAction({0x07, 0});
    }
    Stage& Button(U16 id, const ButtonBlocks& blocks = {})
    {
        return static_cast<Stage&>(DefineButton(id, kTagDefineButton2, {{0x0F, 1, 1}}, blocks));
    }
    // Says its name and the number of every transition.
    Stage& Teller(U16 id, const std::string& name)
    {
        ButtonBlocks blocks;
        for (U32 i = 0; i < 9; i++)
            blocks.push_back({1u << i, Say(name + std::to_string(i))});
        return Button(id, blocks);
    }
    // Button 2 at many places, from depth 1 up, and a frame to show them.
    Stage& Spread(const Spots& spots)
    {
        U16 depth = 0;
        for (const auto& [x, y, size] : spots)
            Place(2, ++depth, At(x, y, size == 0 ? 20 : size));
        return static_cast<Stage&>(Show());
    }
};

struct InputShell : PlayingShell {
    explicit InputShell(const MovieWriter& movie) : PlayingShell(movie.Bytes(), 200, 200)
    {
        ControlHighQuality();
    }
    // The depth of the focused button, negative when the highlight is not where it is.
    int Focus() const
    {
        const SObject* obj = buttonFocus.object.Get();
        const bool shown = RectEqual(&scene.tabFocusRect, &buttonFocus.bounds, 0);
        return !obj ? 0 : shown ? obj->depth : -obj->depth;
    }
    // Where each key leads.
    std::string Keys(std::initializer_list<int> keys, int modifiers = 0)
    {
        std::string visited;
        for (const int key : keys)
            HandleKeyDown(key, modifiers), visited += std::to_string(Focus());
        return visited;
    }
    // All that buttons have said.
    std::string Log()
    {
        const SVariable* var = FindVariable("log");
        return var ? var->value : "";
    }
    void Press(S32 x, S32 y) { MouseMove(x, y, 0), MouseDown(x, y); }
};

// Weights by depth: 23, 40, 40, 90, -1, -9 and, out of view, none. Forwards the second of equals is
// passed over, and negative ones are reached by going round only; backwards -1 is like no focus.
TEST(Input, TabOrder)
{
    Stage movie;
    movie.Button(2).Spread({{9, 10}, {60, 10}, {0, 20}, {30, 40}, {3, -1}, {-9, -3}, {300, 20}});
    InputShell player(movie), none(Stage().Spread({}));
    EXPECT_EQ("1246512", player.Keys({kTab, kTab, kTab, kTab, kTab, kTab, kTab}));
    EXPECT_EQ("1543154", player.Keys({kTab, kTab, kTab, kTab, kTab, kTab, kTab}, kShift));
    EXPECT_EQ(1, player.HandleKeyDown(kTab, 0));
    player.ButtonFocusRemove();
    EXPECT_EQ("6", player.Keys({kTab})); // on from where it last was
    EXPECT_EQ(0, none.HandleKeyDown(kTab, 0) + none.HandleKeyDown(kEnter, 0) + none.Focus());
}

TEST(Input, ArrowsFindTheBestButton)
{
    const std::pair<Spots, std::string> cases[] = {
        // up, down, right, left of the first
        {{{100, 100}, {105, 105, 10}}, "2111"},         // inside
        {{{100, 100}, {90, 90, 40}}, "1222"},           // around
        {{{100, 100}, {125, 130}, {170, 100}}, "1231"}, // right: aligned, though far
        {{{100, 100}, {130, 124}, {170, 110}}, "1331"}, // down: not wholly below, though far
        {{{100, 100}, {130, 76}, {170, 90}}, "2131"},   // up has no such rule
        {{{100, 100}, {140, 100}, {140, 110}}, "1321"}, // as near: the first in tab order
        {{{100, 100}, {10, 10}, {10, 100}}, "2113"},
    };
    for (const auto& [spots, expected] : cases) {
        InputShell player(Stage().Button(2).Spread(spots));
        std::string found;
        for (const int key : {kUp, kDown, kRight, kLeft}) {
            player.ButtonFocusSet(player.rootObject->bottomChild);
            found += player.Keys({key});
        }
        EXPECT_EQ(expected, found);
    }
}

// Like a click, after the button under the pointer was left; that one is entered again by the next
// tick, and the highlight goes with it.
TEST(Input, EnterPressesTheFocusedButton)
{
    Stage movie;
    movie.Teller(2, "a").Teller(3, "b").Place(3, 9, At(60, 10));
    InputShell player(movie.Spread({{10, 10}}));
    player.MouseMove(70, 20, 0);
    EXPECT_EQ("111", player.Keys({kTab, kEnter, ' '}));
    EXPECT_EQ("b0b1a0a2a3a2a3", player.Log());
    player.DoPlay(0);
    EXPECT_EQ(-1, player.Focus());
    player.MouseDown(70, 20);
    EXPECT_EQ("911", player.Keys({kTab, kTab, kEnter}));
    EXPECT_EQ("b0b1a0a2a3a2a3a1b0b2b4b6a0a2a3", player.Log());
}

// The first block for a key, of every button that is not hidden, before the focus sees the key.
TEST(Input, KeysThatButtonsWaitFor)
{
    Stage movie;
    movie.Button(2, {{kOnK, Say("1")}, {kOnK | 1, Say("2")}, {0x1FF, Say("o")}});
    movie.Button(3, {{kOnTab, Say("t")}, {kOnK, Say("3")}}).Place(3, 9, At(60, 10));
    InputShell player(movie.Spread({{10, 10}, {300, 10}}));
    player.rootObject->bottomChild->visible = 0;
    EXPECT_EQ("00", player.Keys({'k', kTab}));
    EXPECT_EQ("13t", player.Log());
    EXPECT_TRUE(player.HandleKeyDown('k', 0) && !player.HandleKeyDown('q', 0));
    player.actionDepth = 1; // nothing from within an action
    EXPECT_EQ(0, player.HandleKeyDown('k', 0));
}

// And a button that moves under a pointer that stays notices, unless that is held or gone.
TEST(Input, TheMouseHidesTheHighlight)
{
    Stage movie;
    movie.Teller(2, "").Spread({{10, 10}, {60, 10}}).Move(1, At(100, 100)).Show();
    InputShell player(movie);
    Shot(&player), player.Keys({kTab});
    EXPECT_TRUE(player.HandleKeyDown(5, 0) && !player.HandleKeyDown('x', 0));
    EXPECT_EQ(0xFFFFFF00, Shot(&player).At(11, 25));
    player.Press(70, 20), player.MouseUp(70, 20);
    EXPECT_EQ(0xFF090909, Shot(&player).At(11, 25));
    const int taken = player.HandleKeyDown(kRight, 0) + player.HandleKeyDown(kEnter, 0);
    EXPECT_TRUE(taken == 0 && player.GetCursorType() == 2);
    EXPECT_EQ("2", player.Keys({kTab}));
    player.MouseMove(110, 110, 0);
    EXPECT_EQ(0, player.GetCursorType() + player.mouseState);
    const auto goTo = [&](int frame) { player.GotoFrame(frame), player.DoPlay(0); };
    goTo(1);
    EXPECT_EQ("02310", player.Log());
    player.panning = 1, goTo(0);
    EXPECT_EQ("02310", player.Log());
    player.panning = 0, goTo(0);
    player.MouseMove(110, 201, 1), goTo(1);
    EXPECT_TRUE(player.Log() == "023101" && player.mouseState == -1);
}

// Within the movie's frame. A button that was pressed when the mouse was lost is released outside,
// and no click comes later.
TEST(Input, PanningFollowsTheHandUntilItLetsGo)
{
    InputShell player(Stage().Teller(2, "").Spread({{0, 0}}));
    player.SetZoomRect(0, 0, 1600, 1600); // twice as large
    player.MouseDown(150, 150);
    const S32 steps[][4] = {
        {120, 140, 240, 1680}, {500, 450, 0, 1600}, {-900, -900, 1600, 3200}, {5, 5, 0, 1600}};
    for (const auto& [x, y, xmin, ymax] : steps) {
        player.MouseMove(x, y, 1);
        EXPECT_TRUE(player.zoomRect.xmin == xmin && player.zoomRect.ymax == ymax) << x;
    }
    player.MouseUp(5, 5); // on the button
    EXPECT_TRUE(player.Log().empty() && player.GetCursorType() == 1);
    player.MouseDown(150, 150);
    EXPECT_EQ(1, player.panning);
    player.CancelCapture(0);
    EXPECT_EQ(0, player.panning + player.mouseState);
    player.Press(5, 5);
    player.CancelCapture(1);
    EXPECT_EQ(-1, player.mouseState);
    player.MouseMove(5, 5, 0), player.Press(5, 5);
    EXPECT_EQ("024602", player.Log());
    player.Keys({kTab, kTab});
    player.ControlClose();
    EXPECT_TRUE(RectIsEmpty(&player.scene.tabFocusRect));
    StreamData in; // the next movie comes up under a pointer at rest
    const std::vector<U8> next = Stage().Button(2).Spread({{0, 0}}).Bytes();
    player.StreamInNew(&in, "next", nullptr);
    player.StreamInWrite(&in, next.data(), S32(next.size()));
    player.mouseState = 0;
    player.DoPlay(0);
    EXPECT_EQ(2, player.GetCursorType());
    player.StreamInDestroy(&in);
}

// The focus stays with what stands in the place of the button that had it, and its highlight, if it
// was shown; another character there does not get it.
TEST(Input, FocusOutlastsARebuild)
{
    Stage movie;
    movie.Button(2).Button(4).DefineSprite(5, TagWriter().Place(2, 3).Show());
    movie.Place2(7, {.character = 5, .matrix = At(10, 10)}).Place(2, 8, At(10, 90)).Show();
    movie.RemoveDepth(7).Place2(7, {.character = 5, .matrix = At(50, 10), .ratio = 1});
    movie.Move(8, At(50, 90)).Show().RemoveDepth(8).Place(4, 8, At(90, 90)).Show();
    InputShell player(movie);
    EXPECT_EQ("3", player.Keys({kTab}));
    for (const int frame : {1, 0, 1}) {
        const U32 old = player.buttonFocus.object.Get()->serial;
        player.GotoFrame(frame);
        EXPECT_TRUE(player.Focus() == 3 && player.buttonFocus.object.Get()->serial != old);
        EXPECT_EQ(frame ? 50 : 10, player.buttonFocus.bounds.xmin);
    }
    RectSetEmpty(&player.scene.tabFocusRect), player.GotoFrame(0);
    EXPECT_EQ(-3, player.Focus());
    EXPECT_EQ("8", player.Keys({kTab}));
    player.GotoFrame(1), player.DoPlay(0); // the same button, moved
    EXPECT_EQ(50, player.scene.tabFocusRect.xmin);
    player.SetZoomRect(0, 0, 6400, 6400);
    EXPECT_EQ(25, player.scene.tabFocusRect.xmin);
    player.GotoFrame(2);
    EXPECT_TRUE(player.Focus() == 0 && RectIsEmpty(&player.scene.tabFocusRect));
}

// By going to the second frame, in the middle of its own press by key and by mouse.
TEST(Input, AButtonRemovesItself)
{
    for (const U32 when : {1, 4, 8}) {
        Stage movie;
        movie.Button(2, {{when, {0x81, 2, 0, 1, 0, 0}}, {8, Say("late")}}).Button(3);
        movie.Place(3, 9, At(60, 10)).Place(2, 1, At(10, 10)).Show().RemoveDepth(1).Show();
        InputShell keys(movie), mouse(movie);
        EXPECT_EQ("19", keys.Keys({kTab, kEnter}));
        EXPECT_EQ(when == 8 ? "late" : "", keys.Log());
        mouse.Press(20, 20), mouse.MouseUp(20, 20);
        EXPECT_EQ(0, mouse.GetCursorType());
    }
}

} // namespace
