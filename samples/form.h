#pragma once

#include "core/text/field_record.h"
#include "samples/lettering.h"

#include <string>

// A page of the visitors' book of a small observatory: name, guests, password and a message that
// scrolls. They are the variables of /entry, whose frames hear of typing. Sending posts these to
// "guestbook" beside the movie; what comes back is variables for /desk, where the movie keeps what
// else it shows, and `reply` of them is shown. Pixels of the 480 by 360 stage.
namespace form {

constexpr double kPageLeft = 152, kPageRight = 466, kPageTop = 14, kPageBottom = 342;
constexpr double kInnerLeft = 172, kInnerRight = 446;    // of what is written on it
constexpr double kMessageTop = 182, kMessageHeight = 91; // the scroll bar's as well
constexpr U16 kMostLetters = 400;                        // of a message
const std::string kOfMost = " of " + std::to_string(kMostLetters) + " letters";

enum Id : U16 {
    kFont = 1,
    kHeadFont,
    kSans, // fonts of the player, by name
    kSerif,
    kTypewriter,
    kNight,
    kMilkyWay,
    kStar,
    kTwinkle,
    kStars,
    kPlanet,
    kRing,
    kSaturn,
    kMeteor,
    kMeteors,
    kHill,
    kDome,
    kPage,
    kHead,
    kPlaceName,
    kLabels,
    kNameField,
    kGuestsField,
    kPasswordField,
    kMessageField,
    kCountField,
    kNoteField,
    kBar,
    kThumbShape,
    kThumb,
    kKnob,
    kArrow,
    kUp,
    kDown,
    kPlate,
    kSendWord,
    kSend,
    kThanks,
    kThanksField,
    kReplyField,
    kAgainWord,
    kAgain,
    kEntry,
    kDesk,
};

const Rgba kInk = Hex(0x26305c), kFaded = Hex(0x86765a);

void DefineNight(TagWriter& movie); // sky, Saturn, meteors, the hill with its dome
void PlaceNight(TagWriter& movie);  // depths 1 to 9
void DefinePage(TagWriter& movie);  // the empty page

// A text field in pixels; its origin is the top left corner. What stays at zero or empty is left
// out of the record.
struct TextField {
    double width, height;
    U16 font;
    double size = 14;
    U32 flags = 0; // EFieldFlag bits for what the others do not say; a border keeps its distance
    Rgba color = {0, 0, 0, 255};
    U16 mostLetters = 0;
    EFieldAlign align = kTextLeft;
    double leading = 0;
    std::string variable = "", text = "";
};
void DefineField(TagWriter& movie, U16 id, const TextField& field);
// A font of the player's own, for fields: a name and no glyphs.
void DefineDeviceFont(TagWriter& movie, U16 id, const std::string& name);

// The scripts.
std::string ScrollScript(int step);
const char* NameChangedScript();
std::string MessageChangedScript();
const char* SendScript();
const char* AgainScript();
std::string DeskScript(double thumbTop, double thumbWay);

} // namespace form
