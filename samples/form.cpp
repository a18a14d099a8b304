#include "samples/form.h"
#include "tests/support/script_writer.h"

// The page with its fields, the page that says thanks, and the frames that hear of typing.

namespace form {

constexpr double kBarLeft = kInnerRight - 16, kThumbHeight = 16;
const double kMiddle = (kInnerLeft + kInnerRight) / 2;

// Black and white of a field become ink and paper.
static const Cx kOnPaper = {{217, 205, 154, 256}, {38, 48, 92, 0}};

static std::string AllLetters()
{
    std::string letters;
    for (U16 code : AlphabetCodes()) {
        if (code < 0x80)
            letters += char(code);
        else if (code < 0x100)
            letters += {char(0xC0 | code >> 6), char(0x80 | (code & 0x3F))};
    }
    return letters;
}

static void DefineWords(TagWriter& movie, const Font& font, const Font& head)
{
    DefineText(movie, kHead, head, {{"Visitors’ Book", kMiddle, 49, 25, kInk, 0.5, 0.5}});
    DefineText(movie, kPlaceName, font,
               {{"HERON HILL OBSERVATORY", kMiddle, 66, 9.5, kFaded, 0.5, 1.6}});
    auto label = [](std::string_view text, double x, double y) {
        return TextLine{text, x, y, 11.5, kFaded};
    };
    DefineText(movie, kLabels, font,
               {label("Your name", kInnerLeft, 90),
                label("Guests", kInnerRight - 50, 90),
                label("Password", kInnerLeft, 133),
                {"with which you may change the page", kInnerLeft + 122, 151, 8.8, kFaded},
                label("What did you see tonight?", kInnerLeft, kMessageTop - 5)});
    DefineText(movie, kThanks, head, {{"Thank you,", kMiddle, 182, 19, kInk, 0.5, 0.4}});
}

// To be filled in.
static void DefineInputs(TagWriter& movie)
{
    DefineField(movie, kNameField,
                {.width = kInnerRight - kInnerLeft - 62,
                 .height = 20,
                 .font = kSans,
                 .flags = kFieldBorder | kFieldText,
                 .mostLetters = 24,
                 .variable = "/entry:name"});
    DefineField(movie, kGuestsField,
                {.width = 50,
                 .height = 20,
                 .font = kTypewriter,
                 .flags = kFieldBorder,
                 .mostLetters = 3,
                 .align = kTextRight,
                 .variable = "/entry:guests",
                 .text = "1"});
    DefineField(movie, kPasswordField,
                {.width = 112,
                 .height = 20,
                 .font = kSans,
                 .flags = kFieldBorder | kFieldPassword | kFieldText,
                 .mostLetters = 12,
                 .variable = "/entry:password"});
    DefineField(movie, kMessageField,
                {.width = kBarLeft - kInnerLeft - 4,
                 .height = kMessageHeight,
                 .font = kSerif,
                 .flags = kFieldBorder | kFieldMultiline | kFieldWrap | kFieldText,
                 .mostLetters = kMostLetters,
                 .leading = 1,
                 .variable = "/entry:message"});
}

// To be read.
static void DefineOutputs(TagWriter& movie)
{
    constexpr U32 kShown = kFieldReadOnly | kFieldNoSelect;
    DefineField(movie, kCountField,
                {.width = 130,
                 .height = 17,
                 .font = kSans,
                 .size = 10.5,
                 .flags = kShown,
                 .color = kFaded,
                 .align = kTextRight,
                 .variable = "/desk:count",
                 .text = "0" + kOfMost});
    DefineField(movie, kNoteField,
                {.width = 196,
                 .height = 19,
                 .font = kSerif,
                 .size = 12.5,
                 .flags = kShown,
                 .color = Hex(0xa03a2a),
                 .variable = "/desk:note"});
    DefineField(movie, kThanksField,
                {.width = kInnerRight - kInnerLeft + 16,
                 .height = 36,
                 .font = kFont,
                 .size = 22.5,
                 .flags = kShown | kFieldOwnGlyphs,
                 .color = Hex(0xa03a2a),
                 .align = kTextCenter,
                 .variable = "/entry:name"});
    DefineField(movie, kReplyField,
                {.width = kInnerRight - kInnerLeft - 40,
                 .height = 56,
                 .font = kSerif,
                 .size = 14,
                 .flags = kShown | kFieldMultiline | kFieldWrap,
                 .color = kInk,
                 .align = kTextCenter,
                 .leading = 2,
                 .variable = "/desk:reply"});
}

// A plate and what is on it. Lighter under the pointer, pressed in when it is held.
static void DefineButton(TagWriter& movie, U16 id, U16 plate, U16 sign, const Mat& turned,
                         const std::string& actions)
{
    const Cx light = Cx::Add(28, 28, 34), dark = Cx::Multiply(200, 200, 216);
    const Mat pressed = At(0, 1);
    movie.DefineButton(id, kTagDefineButton2,
                       {{1 | 8, plate, 1},
                        {2, plate, 1, {}, light},
                        {4, plate, 1, pressed, dark},
                        {1 | 2, sign, 2, turned},
                        {4, sign, 2, turned.Then(pressed)}},
                       {{1u << 3, AssembleScript(actions)}});
}

static void DefineButtons(TagWriter& movie, const Font& font)
{
    Drawing plate, knob, arrow, bar, thumb;
    plate.Paint(Hex(0x3a2a18, 80)).RoundRect(-38, -11.5, 39, 15.5, 6);
    plate.Paint(Down(-14, 14, {{0, Hex(0x4a5aa0)}, {255, Hex(0x26305c)}}))
        .RoundRect(-39, -14, 39, 14, 6);
    plate.Paint(Hex(0xffffff, 50)).RoundRect(-37, -12.6, 37, -11.2, 0.6);
    movie.DefineShape(kPlate, plate.Shape());
    auto word = [&](U16 id, std::string_view text, double size) {
        DefineText(movie, id, font, {{text, 0, size * 0.35, size, Hex(0xfff4da), 0.5, 0.6}});
    };
    word(kSendWord, "Send", 14.5);
    word(kAgainWord, "New page", 13);
    DefineButton(movie, kSend, kPlate, kSendWord, {}, SendScript());
    DefineButton(movie, kAgain, kPlate, kAgainWord, {}, AgainScript());

    knob.Paint(Down(-8, 8, {{0, Hex(0x4a5aa0)}, {255, Hex(0x303c70)}}));
    movie.DefineShape(kKnob, knob.RoundRect(-8, -8, 8, 8, 3).Shape());
    arrow.Paint(Hex(0xfff4da)).Polygon({{-4.4, 2.6}, {0, -3.4}, {4.4, 2.6}});
    movie.DefineShape(kArrow, arrow.Shape());
    DefineButton(movie, kUp, kKnob, kArrow, {}, ScrollScript(-1));
    DefineButton(movie, kDown, kKnob, kArrow, Mat::Scale(1, -1), ScrollScript(1));

    bar.Paint(Hex(0x26305c, 36)).RoundRect(0, 2, 16, kMessageHeight - 2, 3);
    movie.DefineShape(kBar, bar.Shape());
    thumb.Paint(Across(-6, 6, {{0, Hex(0xc8a868)}, {255, Hex(0x9a7838)}}));
    thumb.RoundRect(-6, 0, 6, kThumbHeight, 3);
    thumb.Paint(Hex(0x5a4018, 150)).Rect(-3, 6, 3, 7).Rect(-3, 9, 3, 10);
    movie.DefineShape(kThumbShape, thumb.Shape());
    movie.DefineSprite(kThumb, TagWriter().Place(kThumbShape, 1).Show().End());
}

// Two timelines for variables: what is posted, and what the movie writes for itself.
static void DefineTables(TagWriter& movie)
{
    TagWriter entry;
    entry.DoAction(AssembleScript("Stop")).Show();
    entry.Label("name_changed").DoAction(AssembleScript(NameChangedScript())).Show();
    entry.Label("message_changed").DoAction(AssembleScript(MessageChangedScript())).Show();
    movie.DefineSprite(kEntry, entry.End());

    constexpr double kTop = kMessageTop + 17, kWay = kMessageHeight - 34 - kThumbHeight;
    const std::vector<U8> script = AssembleScript(DeskScript(kTop, kWay));
    movie.DefineSprite(kDesk, TagWriter().DoAction(script).Show().DoAction(script).Show().End());
}

enum Depth : U16 {
    kPageDepth = 10,
    kHeadDepth,
    kPlaceDepth,
    kEntryDepth,
    kDeskDepth,
    kFirstOfPage
};

// The depth after the last.
static U16 PlaceForm(TagWriter& movie)
{
    U16 depth = kFirstOfPage;
    movie.Place(kLabels, depth++);
    movie.Place(kNameField, depth++, At(kInnerLeft, 95), kOnPaper);
    movie.Place(kGuestsField, depth++, At(kInnerRight - 50, 95), kOnPaper);
    movie.Place(kPasswordField, depth++, At(kInnerLeft, 138), kOnPaper);
    movie.Place(kMessageField, depth++, At(kInnerLeft, kMessageTop), kOnPaper);
    movie.Place(kBar, depth++, At(kBarLeft, kMessageTop));
    movie.Place2(
        depth++,
        {.character = kThumb, .matrix = At(kBarLeft + 8, kMessageTop + 17), .name = "thumb"});
    movie.Place(kUp, depth++, At(kBarLeft + 8, kMessageTop + 8));
    movie.Place(kDown, depth++, At(kBarLeft + 8, kMessageTop + kMessageHeight - 8));
    movie.Place(kCountField, depth++, At(kBarLeft - 134, kMessageTop + kMessageHeight + 2));
    movie.Place(kNoteField, depth++, At(kInnerLeft - 2, 301));
    movie.Place(kSend, depth++, At(kInnerRight - 39, 310));
    return depth;
}

static void PlaceThanks(TagWriter& movie)
{
    U16 depth = kFirstOfPage;
    movie.Place(kSaturn, depth++, Pose(kMiddle, 118, 0.85, 0.85, -17));
    movie.Place(kThanks, depth++);
    movie.Place(kThanksField, depth++, At(kInnerLeft - 8, 191));
    movie.Place(kReplyField, depth++, At(kInnerLeft + 20, 234));
    movie.Place(kAgain, depth++, At(kMiddle, 308));
}

} // namespace form

std::vector<U8> MakeForm()
{
    using namespace form;
    MovieWriter movie(480 * 20, 360 * 20, Fps(24));
    movie.Background(Hex(0x16255a));
    const Font font(kFont, AllLetters()), head(kHeadFont, "Visitors’ Book Thank you,", 30);
    font.Define(movie, Font::kWithLayout);
    head.Define(movie, Font::kWithLayout);
    DefineDeviceFont(movie, kSans, "_sans");
    DefineDeviceFont(movie, kSerif, "_serif");
    DefineDeviceFont(movie, kTypewriter, "_typewriter");
    DefineNight(movie);
    DefinePage(movie);
    DefineWords(movie, font, head);
    DefineInputs(movie);
    DefineOutputs(movie);
    DefineButtons(movie, font);
    DefineTables(movie);

    PlaceNight(movie);
    movie.Place(kPage, kPageDepth).Place(kHead, kHeadDepth).Place(kPlaceName, kPlaceDepth);
    movie.Place2(kEntryDepth, {.character = kEntry, .name = "entry"});
    movie.Place2(kDeskDepth, {.character = kDesk, .name = "desk"});
    const U16 end = PlaceForm(movie);
    movie.Label("form").DoAction(AssembleScript("Stop")).Show();

    for (U16 depth = kFirstOfPage; depth < end; depth++)
        movie.RemoveDepth(depth);
    PlaceThanks(movie);
    movie.Label("sent").DoAction(AssembleScript("Stop")).Show();
    movie.End();
    return movie.Bytes();
}
