#include "samples/lettering.h"

// A poster and the page behind it: text in many sizes and colours, in both forms of fonts, along a
// circle, and as a window. The landscape outside passes behind the letters of the title.

namespace {

constexpr int kFrames = 120;

enum Id : U16 {
    kTitleFont = 1,
    kTextFont,
    kPaper,
    kTitle,
    kTitleShade,
    kHead,
    kFoot,
    kSky,
    kMountains,
    kWoods,
    kTrain,
    kOutside,
    kPostmark,
    kPageText,
    kPageHeads,
    kDropCap,
    kRules,
    kFront,
    kBack,
    kTable,
    kShadow,
    kRing = 40, // and one for each of its letters
};

const Rgba kInk = Hex(0x1d2440), kRed = Hex(0xb3322b), kGold = Hex(0xb07a1e),
           kGrey = Hex(0x1d2440, 150);

const std::string_view kRingText = "VIADUCT RAILWAY · NIGHT MAIL · 21:47 · ";
const std::string_view kStory =
    "he night train leaves when the last of the sun has gone from the water. It has three coaches "
    "and a dining car, and a stove in each of them; the lamps are lit at the tunnel, and after "
    "that there is nothing to be seen but the sparks and, far below, the windows of the town. The "
    "conductor knows the valley by its sounds. A hollow ring: that is the viaduct, twenty-two "
    "arches of grey stone. A softer note: the woods. Then for a long while only the rails, click "
    "and click, eleven to the minute uphill. Whoever is still awake at four sees the lake again, "
    "from the other side, with the mountains standing in it upside down. At six there is coffee; "
    "at seven the sea.";

struct Halt {
    std::string_view time, town, note;
};
const Halt kTimetable[] = {
    {"21:47", "Sankt Märgen", "platform 2"}, {"22:30", "Brücke am See", "on request"},
    {"23:58", "Château-d’Août", "mail"},     {"01:16", "Peñalba", "water"},
    {"02:40", "Åsele Øst", "on request"},    {"04:05", "Lac d’Étain", "view"},
    {"06:10", "São Brás", "coffee"},         {"07:02", "Zeehaven", "the sea"},
};

void DefineLandscape(TagWriter& movie)
{
    Drawing sky, mountains, woods;
    Dice dice(7);
    sky.Paint(Down(50, 372,
                   {{0, Hex(0x0a1030)},
                    {80, Hex(0x2a2a72)},
                    {135, Hex(0x8a4a9a)},
                    {180, Hex(0xf0786a)},
                    {220, Hex(0xffc878)},
                    {255, Hex(0xfff0b0)}}));
    sky.Rect(0, 40, 640, 380);
    for (int i = 0; i < 90; i++) {
        double x = dice.Between(30, 610), y = dice.Between(56, 190);
        sky.Paint(Hex(0xffffff, int(dice.Between(120, 255)))).Circle(x, y, dice.Between(0.5, 1.5));
    }
    sky.Paint(Glow(456, 112, 90, {{0, Hex(0xfff6d8, 150)}, {255, Hex(0xfff6d8, 0)}}));
    sky.Circle(456, 112, 90);
    sky.Paint(Glow(446, 104, 40, {{0, Hex(0xfffdf0)}, {255, Hex(0xf0dca0)}}));
    sky.Circle(456, 112, 25);
    movie.DefineShape(kSky, sky.Shape());

    // Both ranges repeat after 320 pixels, so that they may pass for ever.
    mountains.Paint(
        Down(210, 372, {{0, Hex(0x4a3a86)}, {140, Hex(0xa0507e)}, {255, Hex(0xe88a70)}}));
    std::vector<Spot> peaks;
    const double heights[] = {330, 272, 334, 256, 336, 296, 318, 284};
    for (int i = 0; i <= 24; i++)
        peaks.push_back({i * 40.0, heights[i % 8]});
    mountains.Ridge(peaks, 380);
    movie.DefineShape(kMountains, mountains.Shape());

    woods.Paint(Down(318, 372, {{0, Hex(0x241a48)}, {255, Hex(0x100c26)}}))
        .Rect(0, 351.5, 1280, 380);
    for (int i = 0; i < 80; i++) {
        Dice tree(U32(i % 20 + 3));
        double x = i * 16 + tree.Between(-5, 5), top = 352 - tree.Between(4, 30);
        woods.Polygon({{x - 8, 352.5}, {x, top}, {x + 8, 352.5}});
    }
    movie.DefineShape(kWoods, woods.Shape());
}

void DefineTrain(TagWriter& movie)
{
    Drawing train;
    train.Paint(Hex(0x160f2a)).Rect(-520, 349, 1200, 352);
    for (int i = 0; i < 5; i++) {
        double x = i * 74;
        train.Paint(Hex(0x2a1530)).RoundRect(x, 324, x + 71, 346, 3);
        train.Paint(Hex(0x160f2a)).Circle(x + 14, 347, 3.4).Circle(x + 57, 347, 3.4);
        train.Paint(Down(328, 338, {{0, Hex(0xfff8d0)}, {255, Hex(0xffb648)}}));
        for (int n = 0; n < 5; n++)
            train.Rect(x + 6 + n * 12.4, 328, x + 15 + n * 12.4, 337);
    }
    train.Paint(Hex(0x1a1230)).RoundRect(-70, 326, -4, 346, 4).Rect(-52, 316, -44, 328);
    train.Paint(Hex(0x1a1230)).RoundRect(-22, 318, -2, 340, 2);
    train.Paint(Glow(-72, 332, 40, {{0, Hex(0xffffff, 240)}, {255, Hex(0xffe9a0, 0)}}));
    train.Circle(-72, 332, 40);
    movie.DefineShape(kTrain, train.Shape());
}

// The title is a mask over all of it. The shade under the letters makes them look cut out.
void DefineOutside(TagWriter& movie)
{
    TagWriter outside;
    Stage stage(outside);
    for (int frame = 0; frame < kFrames; frame++) {
        double t = frame / double(kFrames);
        stage.Put(1, kTitleShade, At(2, 3));
        stage.Put(2, kTitle, {}, {}, 6);
        stage.Put(3, kSky, {});
        stage.Put(4, kMountains, At(-320 * t, 0));
        stage.Put(5, kTrain, At(700 - 1200 * t, 0));
        stage.Put(6, kWoods, At(-640 * t, 0));
        stage.Next();
    }
    movie.DefineSprite(kOutside, outside.End());
}

void DefineTitle(TagWriter& movie)
{
    Font font(kTitleFont, "NIGHTRAIN", 30);
    font.Define(movie, Font::kPlain);
    auto lines = [](Rgba color) {
        return std::vector<TextLine>{{"NIGHT", 320, 198, 184, color, 0.5},
                                     {"TRAIN", 320, 361, 196, color, 0.5}};
    };
    DefineText(movie, kTitle, font, lines(kInk), false);
    DefineText(movie, kTitleShade, font, lines(Hex(0x1d2440, 90)));
}

// One static text for each letter of the circle: they are placed by matrices alone.
void DefinePostmark(TagWriter& movie, const Font& font)
{
    Drawing rings;
    rings.Paint(Hex(0xb3322b, 190)).Circle(0, 0, 46).Circle(0, 0, 44.4);
    rings.Circle(0, 0, 31).Circle(0, 0, 30);
    for (int i = -2; i <= 2; i++) { // the waves across
        double y = i * 7.0 - 1, thick = 1.5;
        rings.Move(-22, y).Curve(-11, y - 6, 0, y).Curve(11, y + 6, 22, y).Line(22, y + thick);
        rings.Curve(11, y + 6 + thick, 0, y + thick).Curve(-11, y - 6 + thick, -22, y + thick);
        rings.Close();
    }
    movie.DefineShape(kRing, rings.Shape());
    TagWriter postmark;
    postmark.Place(kRing, 1);
    const double size = 10.5, whole = font.Width(kRingText, size);
    double along = 0;
    U16 next = kRing + 1;
    for (size_t i = 0; i < kRingText.size(); i++) {
        size_t length = U8(kRingText[i]) < 0x80 ? 1 : 2;
        std::string_view letter = kRingText.substr(i, length);
        double width = font.Width(letter, size), middle = along + width / 2;
        along += width, i += length - 1;
        if (letter == " ")
            continue;
        DefineText(movie, next, font, {{letter, 0, -34, size, Hex(0xb3322b, 210), 0.5}});
        postmark.Place(next, U16(next - kRing + 1), Mat::Rotate(360 * middle / whole));
        next++;
    }
    movie.DefineSprite(kPostmark, postmark.Show().End());
}

void DefineFront(TagWriter& movie, const Font& font)
{
    DefineText(movie, kHead, font,
               {{"THE VIADUCT RAILWAY PRESENTS", 320, 44, 14, kRed, 0.5, 6.2},
                {"every", 34, 408, 19, kInk},
                {"evening", 34, 429, 19, kInk},
                {"21:47", 116, 430, 43, kRed}});
    DefineText(
        movie, kFoot, font,
        {{"Sankt Märgen – Brücke am See – Château-d’Août", 232, 404, 13.5, kInk},
         {"Peñalba – Åsele Øst – Lac d’Étain – São Brás", 232, 421, 13.5, kInk},
         {"Sleeping cars and dining car · 2nd class from 12.40", 232, 438, 10.5, kGold},
         {"Printed at the station press. The company is not liable for snow, bears or missed "
          "dreams.",
          320, 457, 7.5, kGrey, 0.5}});
    TagWriter front;
    front.Place(kPaper, 1).Place(kOutside, 2).Place(kHead, 3).Place(kFoot, 4);
    front.Place(kPostmark, 5, Pose(566, 414, 0.95, 0.95, -14)).Show().End();
    movie.DefineSprite(kFront, front);
}

void DefineBack(TagWriter& movie, const Font& font)
{
    std::vector<TextLine> story, heads;
    for (std::string_view line : BreakLines(font, kStory, 13, 320, 3, 48)) {
        double y = 128 + double(story.size()) * 20.5;
        story.push_back({line, story.size() < 3 ? 88.0 : 40.0, y, 13, kInk});
    }
    for (size_t i = 0; i < std::size(kTimetable); i++) {
        double y = 144 + double(i) * 27;
        story.push_back({kTimetable[i].time, 430, y, 15, kRed, 1});
        story.push_back({kTimetable[i].town, 442, y, 15, kInk});
        story.push_back({kTimetable[i].note, 600, y, 10, kGold, 1});
    }
    DefineText(movie, kPageText, font, story);
    heads = {{"Notes for Travellers", 40, 70, 34, kInk},
             {"and for those who only listen to it pass", 40, 90, 13, kGold},
             {"Stops", 388, 112, 20, kInk},
             {"THE NIGHT TRAIN", 320, 456, 9, kGrey, 0.5, 4},
             {"12", 600, 456, 11, kGrey, 1},
             {"ABCDEFGHIJKLMNOPQRSTUVWXYZ & abcdefghijklmnopqrstuvwxyz", 40, 394, 13, kRed, 0, 0.6},
             {"0123456789 ÄÖÜ äöüß éèêëàâçñåøæ ÅØÆ (!?) “quoted” «guillemets»", 40, 414, 13, kRed,
              0, 0.6}};
    DefineText(movie, kPageHeads, font, heads, false);
    DefineText(movie, kDropCap, font, {{"T", 38, 167, 74, kRed}});
    Drawing rules;
    rules.Paint(kInk).Rect(388, 118, 600, 119.2);
    for (size_t i = 0; i < std::size(kTimetable); i++)
        rules.Paint(Hex(0x1d2440, 60)).Rect(388, 151 + double(i) * 27, 600, 151.6 + double(i) * 27);
    rules.Paint(kInk).Rect(40, 434, 600, 435);
    movie.DefineShape(kRules, rules.Shape());
    TagWriter back;
    back.Place(kPaper, 1).Place(kRules, 2).Place(kPageText, 3).Place(kPageHeads, 4);
    movie.DefineSprite(kBack, back.Place(kDropCap, 5).Show().End());
}

void DefinePaper(TagWriter& movie)
{
    Drawing paper, table, shadow;
    paper.Paint(Down(0, 480, {{0, Hex(0xfbf5e6)}, {255, Hex(0xf0e4ca)}})).Rect(12, 12, 628, 472);
    paper.Paint(Hex(0x1d2440)).Rect(19, 19, 621, 465).Rect(20, 20, 620, 464);
    movie.DefineShape(kPaper, paper.Shape());
    table.Paint(Glow(320, 200, 460, {{0, Hex(0x566a74)}, {255, Hex(0x1c262e)}}));
    movie.DefineShape(kTable, table.Rect(kLeft, kTop, kRight, kBottom).Shape());
    for (int i = 0; i < 4; i++)
        shadow.Paint(Hex(0x000000, 34)).RoundRect(10 - i * 2, 14, 634 + i * 2, 476 + i * 2, 5);
    movie.DefineShape(kShadow, shadow.Shape());
}

// The sheet turns about its upright middle line and darkens while it stands edge on.
void TurnPages(TagWriter& movie)
{
    Stage stage(movie);
    for (int frame = 0; frame < kFrames; frame++) {
        double t = frame / double(kFrames);
        double turn = 0.5 * Ease(0.46, 0.6, t) + 0.5 * Ease(0.86, 1, t);
        double width = Turns(turn + 0.25), light = 0.4 + 0.6 * width * width;
        S32 mul = RoundSteadily(256 * light);
        double across = width < 0 ? -width : width;
        across = across < 0.004 ? 0.004 : across;
        Mat pose = Pose(320 - 320 * across, 0, across, 1);
        stage.Put(1, kTable, {});
        stage.Put(2, kShadow, pose);
        stage.Put(3, width >= 0 ? kFront : kBack, pose, Cx::Multiply(mul, mul, mul));
        stage.Next();
    }
}

} // namespace

std::vector<U8> MakePoster()
{
    MovieWriter movie(640 * 20, 480 * 20, Fps(24));
    movie.Background(Hex(0x1c262e));
    std::string letters = " ";
    for (char c = '!'; c <= 'z'; c++)
        letters += c;
    letters += "ÄÖÜäöüßéèêëàâçñåøæÅØÆÉãáâû“”«»–’·";
    Font font(kTextFont, letters);
    font.Define(movie, Font::kWithLayout);
    DefinePaper(movie);
    DefineTitle(movie);
    DefineLandscape(movie);
    DefineTrain(movie);
    DefineOutside(movie);
    DefinePostmark(movie, font);
    DefineFront(movie, font);
    DefineBack(movie, font);
    TurnPages(movie);
    movie.End();
    return movie.Bytes();
}
