#include "samples/orchard.h"
#include "tests/support/script_writer.h"

// The main timeline: the title, the game, and what is there when it is over. A script takes its
// things by these names.

namespace orchard {

static void DefineTags(TagWriter& movie)
{
    Drawing tag, glass;
    tag.Paint(Hex(0x4a3420)).Rect(-34, -40, -32.6, -14).Rect(32.6, -40, 34, -14);
    DrawPlate(tag, 104, 42);
    movie.DefineShape(kTag, tag.Shape());
    glass.Paint(Hex(0x4a2a14)).RoundRect(-9, -13, 9, -10, 1).RoundRect(-9, 10, 9, 13, 1);
    glass.Paint(Hex(0xfff6e0, 200)).Move(-7, -10).Curve(-7, -3, 0, 0).Curve(-7, 3, -7, 10);
    glass.Line(7, 10).Curve(7, 3, 0, 0).Curve(7, -3, 7, -10).Close();
    glass.Paint(Hex(0xf0a838)).Move(-5.4, -5).Curve(-4, -2, 0, 0).Curve(4, -2, 5.4, -5).Close();
    glass.Move(-6, 10).Curve(-4, 5, 0, 4).Curve(4, 5, 6, 10).Close();
    movie.DefineShape(kHourglass, glass.Shape());
}

static void DefineTitle(TagWriter& movie, const Font& font)
{
    DefineText(movie, kTitle, font,
               {{"An Orchard Evening", 1.5, 2.5, 41, Hex(0x3a1830, 150), 0.5, 1},
                {"An Orchard Evening", 0, 0, 41, Hex(0xfff4da), 0.5, 1},
                {"Catch what the tree lets go.", 0, 31, 18, Hex(0x3c2344), 0.5, 0.5},
                {"Golden apples count five.", 0, 53, 18, Hex(0x3c2344), 0.5, 0.5}});
    Drawing wood;
    DrawPlate(wood, 168, 48);
    movie.DefineShape(kWood, wood.Shape());
    DefineButton(movie, kBegin, font, "Begin", kWood, kBeginText, BeginScript(), 32);
    // Two keys, and nothing to be seen or hit.
    movie.DefineButton(
        kKeys, kTagDefineButton2, {},
        {{1u << 9, AssembleScript(KeyScript(-28))}, {2u << 9, AssembleScript(KeyScript(28))}});
}

static TagWriter& Named(TagWriter& movie, U16 depth, const char* name, U16 id, const Mat& mat = {},
                        const std::optional<Cx>& cx = {})
{
    return movie.Place2(depth, {.character = id, .matrix = mat, .cx = cx, .name = name});
}

// Only sprites have names that scripts can use.
static U16 AsSprite(TagWriter& movie, U16 id)
{
    const U16 sprite = U16(200 + id);
    movie.DefineSprite(sprite, TagWriter().Place(id, 1).Show().End());
    return sprite;
}

static void PlaceEvening(TagWriter& movie)
{
    const Cx hidden = Cx::Alpha(0);
    const U16 dusk = AsSprite(movie, kDuskSky), sun = AsSprite(movie, kSun),
              moon = AsSprite(movie, kMoon), shade = AsSprite(movie, kShade),
              lamps = AsSprite(movie, kLamps), glow = AsSprite(movie, kLanternGlow);
    movie.Place(kSky, 1);
    Named(movie, 2, "dusk", dusk, {}, hidden);
    Named(movie, 3, "night", kStarlight, {}, hidden);
    Named(movie, 4, "sun", sun, At(236, 186));
    Named(movie, 5, "moon", moon, At(404, 330));
    movie.Place(kCloud, 6, Pose(110, 176, 0.9, 0.8)).Place(kCloud, 7, Pose(398, 206, -0.7, 0.6));
    movie.Place(kHills, 10).Place(kMeadow, 11).Place(kBoughs, 12).Place(kCanopy, 13);
    Named(movie, 20, "shade", shade, {}, hidden);
    Named(movie, 21, "lamps", lamps, {}, hidden);
    movie.Place(kLantern, 22, At(474, 196));
    Named(movie, 23, "glow", glow, At(474, 196), hidden);
    Named(movie, 24, "fireflies", kFireflies, {}, hidden);
    movie.Place(kTufts, 41, {}, Cx::Multiply(190, 200, 190));
}

static void PlaceTags(TagWriter& movie)
{
    movie.Place(kTag, 30, At(82, 34)).Place(kSmallApple, 31, At(54, 35));
    Named(movie, 32, "score", kNumber, At(98, 34));
    movie.Place(kTag, 33, At(558, 34)).Place(kHourglass, 34, At(530, 34));
    Named(movie, 35, "clock", kNumber, At(574, 34));
}

static void DefineAll(TagWriter& movie)
{
    const Font font(kFont,
                    "An Orchard Evening Catch what the tree lets go. Golden apples count five. "
                    "Begin 0123456789+",
                    26);
    font.Define(movie, Font::kWithLayout);
    DefineEvening(movie);
    DefineApples(movie);
    DefinePops(movie, font);
    DefineTree(movie);
    DefineBasket(movie);
    DefineNumbers(movie, font, Hex(0x3a1e0c));
    DefineTags(movie);
    DefineSounds(movie);
    DefineTitle(movie, font);
    movie.DefineSprite(kApple, AppleTimeline()).DefineSprite(kGame, GameTimeline());
}

// Four times the tune's length is a little more than a game; it swells in the beginning and goes
// with the light.
static ByteWriter TuneStart()
{
    constexpr U32 kSecond = 44100;
    const std::pair<U32, U32> envelope[] = {
        {0, 0}, {kSecond, 15000}, {22 * kSecond, 15000}, {30 * kSecond, 3000}};
    ByteWriter start = ByteWriter().PutU16(kTune).PutU8(0x0C).PutU16(5).PutU8(4);
    for (auto [at, level] : envelope)
        start.PutU32(at).PutU16(level).PutU16(level);
    return start;
}

} // namespace orchard

std::vector<U8> MakeOrchard()
{
    using namespace orchard;
    MovieWriter movie(640 * 20, 480 * 20, Fps(24));
    movie.Background(Hex(0x2c5a2c));
    DefineAll(movie);
    PlaceEvening(movie);
    PlaceTags(movie);
    Named(movie, 40, "basket", kBasket, At(320, kRim));
    Named(movie, 50, "apple", kApple, At(320, -200)); // what the others are clones of
    movie.Place(kKeys, 51);
    movie.Place(kTitle, 52, At(252, 174)).Place(kBegin, 53, At(252, 288));
    movie.Label("title").DoAction(AssembleScript(TitleScript())).Show();

    movie.RemoveDepth(52).RemoveDepth(53);
    Named(movie, 60, "game", kGame).Raw(kTagStartSound, TuneStart());
    movie.Label("play").DoAction(AssembleScript("Stop")).Show();

    movie.RemoveDepth(60).Label("over").DoAction(AssembleScript(OverScript())).Show();
    movie.End();
    return movie.Bytes();
}
