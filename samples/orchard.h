#pragma once

#include "samples/lettering.h"

#include <string>

// A game: an evening under an apple tree. Apples let go of their branches while the sun sets, and
// the pointer (or the arrow keys) moves a basket under them; golden ones count five. When the light
// is gone a second movie comes down in level 1 and tells the score. Pixels of the 640 by 480 stage.
namespace orchard {

constexpr double kRim = 414; // of the basket: apples are caught about there

enum Id : U16 {
    kFont = 1,
    kDigitText, // and the nine after it
    kDigit = kDigitText + 10,
    kNumber,
    kWood,
    kTag,
    kSky,
    kDuskSky,
    kNightSky,
    kStar,
    kTwinkle,
    kStarlight,
    kSun,
    kMoon,
    kCloud,
    kHills,
    kLamps,
    kMeadow,
    kShade,
    kSprig,
    kBoughs,
    kCanopy,
    kLantern,
    kLanternGlow,
    kFirefly,
    kFireflies,
    kTuft,
    kTufts,
    kRedApple,
    kBlushApple,
    kGoldApple,
    kSkins,
    kGlitter,
    kPlusOne,
    kPlusFive,
    kPopOne,
    kPopFive,
    kApple,
    kBasketBack,
    kBasketFront,
    kHeap,
    kBasketBody,
    kBasket,
    kSmallApple,
    kHourglass,
    kTitle,
    kBegin,
    kBeginText,
    kKeys,
    kGame,
    kClickSound,
    kCatchSound,
    kGoldSound,
    kMissSound,
    kTune,
    kVeil,
    kBoard,
    kBoardText,
    kVerdict,
    kVerdictText, // and the three after it
    kAgainText = kVerdictText + 4,
    kAgain,
    kFallingBoard,
};

void DefineEvening(TagWriter& movie); // sky, hills, meadow
void DefineTree(TagWriter& movie);    // boughs, leaves, lantern, fireflies, grass in front
void DefineSounds(TagWriter& movie);  // all but the click, and the click
void DefineClick(TagWriter& movie);
void DefineApples(TagWriter& movie);                 // the skins, of 28 pixels, and the small one
void DefinePops(TagWriter& movie, const Font& font); // what a caught apple is worth
void DefineBasket(TagWriter& movie);                 // origin: the middle of its rim

// For both movies: the numerals, a plate of wood of so many pixels round its origin, and a button
// made of one with words on it.
void DefineNumbers(TagWriter& movie, const Font& font, Rgba color);
void DrawPlate(Drawing& d, double width, double height);
void DefineButton(TagWriter& movie, U16 id, const Font& font, std::string_view words, U16 wood,
                  U16 text, const std::string& actions, int key);

// The scripts. Two digits of `count` go to the number sprite whose path is `where`.
extern const char* const kShowDigits;
TagWriter GameTimeline();  // its frames beyond the third are called
TagWriter AppleTimeline(); // of one apple, from its swelling to its end
const char* TitleScript();
const char* OverScript();
const char* BeginScript();
const char* AgainScript();
const char* EndScript();
std::string KeyScript(int step);

} // namespace orchard
