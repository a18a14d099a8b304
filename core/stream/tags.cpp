#include "core/stream/tags.h"

#include <iterator>

namespace {
// By code; the holes are codes that the player skips.
const char* const kTagNames[] = {
    "End",                 // 0
    "ShowFrame",           // 1
    "DefineShape",         // 2
    "FreeCharacter",       // 3
    "PlaceObject",         // 4
    "RemoveObject",        // 5
    "DefineBits",          // 6
    "DefineButton",        // 7
    "DefineJPEGTables",    // 8
    "SetBackgroundColor",  // 9
    "DefineFont",          // 10
    "DefineText",          // 11
    "DoAction",            // 12
    "DefineFontInfo",      // 13
    "DefineSound",         // 14
    "StartSound",          // 15
    nullptr,               // 16
    "DefineButtonSound",   // 17
    "SoundStreamHead",     // 18
    "SoundStreamBlock",    // 19
    "DefineBitsLossless",  // 20
    "DefineBitsJPEG2",     // 21
    "DefineShape2",        // 22
    "DefineButtonCxform",  // 23
    nullptr,               // 24
    nullptr,               // 25
    "PlaceObject2",        // 26
    nullptr,               // 27
    "RemoveObject2",       // 28
    nullptr,               // 29
    nullptr,               // 30
    nullptr,               // 31
    "DefineShape3",        // 32
    "DefineText2",         // 33
    "DefineButton2",       // 34
    "DefineBitsJPEG3",     // 35
    "DefineBitsLossless2", // 36
    "DefineEditText",      // 37
    nullptr,               // 38
    "DefineSprite",        // 39
    nullptr,               // 40
    nullptr,               // 41
    nullptr,               // 42
    "FrameLabel",          // 43
    nullptr,               // 44
    "SoundStreamHead2",    // 45
    "DefineMorphShape",    // 46
    nullptr,               // 47
    "DefineFont2",         // 48
};
static_assert(std::size(kTagNames) == kTagDefineFont2 + 1);
} // namespace

const char* TagName(S32 code)
{
    return code >= 0 && code < static_cast<S32>(std::size(kTagNames)) ? kTagNames[code] : nullptr;
}
