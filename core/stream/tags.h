// Tag codes that the player acts on; every other code is skipped. One line a code: the name, what
// its body starts with, what is done with it.
#pragma once

#include "core/geom/types.h"

enum STagCode : S32 {
    kTagEnd = 0,                  // no body; the timeline has ended
    kTagShowFrame = 1,            // no body; the current frame is complete
    kTagDefineShape = 2,          // id, bounds, shape record with RGB colours
    kTagFreeCharacter = 3,        // id; the character leaves the dictionary
    kTagPlaceObject = 4,          // id, depth, MATRIX, optional CXFORM without alpha
    kTagRemoveObject = 5,         // id (ignored), depth
    kTagDefineBits = 6,           // id, JPEG image that needs the shared tables
    kTagDefineButton = 7,         // id, button records, actions
    kTagDefineJPEGTables = 8,     // tables of the movie's shared JPEG decoder
    kTagSetBackgroundColor = 9,   // RGB
    kTagDefineFont = 10,          // id, glyph offsets, glyphs
    kTagDefineText = 11,          // id, bounds, text records with RGB colours
    kTagDoAction = 12,            // action records, queued for the timeline
    kTagDefineFontInfo = 13,      // font id, name and codes
    kTagDefineSound = 14,         // id, format, sample count, samples
    kTagStartSound = 15,          // sound id, sound info
    kTagDefineButtonSound = 17,   // button id, sounds of its transitions
    kTagSoundStreamHead = 18,     // format of the timeline's streaming sound
    kTagSoundStreamBlock = 19,    // one frame of streaming sound
    kTagDefineBitsLossless = 20,  // id, format, size, compressed pixels
    kTagDefineBitsJPEG2 = 21,     // id, JPEG image with its own tables
    kTagDefineShape2 = 22,        // as 2
    kTagDefineButtonCxform = 23,  // button id, CXFORM without alpha
    kTagPlaceObject2 = 26,        // flags, depth, then what the flags announce
    kTagRemoveObject2 = 28,       // depth
    kTagDefineShape3 = 32,        // as 2 with RGBA colours
    kTagDefineText2 = 33,         // as 11 with RGBA colours
    kTagDefineButton2 = 34,       // id, menu flag, records with transforms, conditional actions
    kTagDefineBitsJPEG3 = 35,     // id, JPEG length, JPEG image, compressed alpha plane
    kTagDefineBitsLossless2 = 36, // as 20 with alpha
    kTagDefineEditText = 37,      // id, bounds, flags, what the flags announce
    kTagDefineSprite = 39,        // id, frame count, nested tags
    kTagFrameLabel = 43,          // string
    kTagSoundStreamHead2 = 45,    // as 18
    kTagDefineMorphShape = 46,    // id, start bounds, end bounds, morph record
    kTagDefineFont2 = 48,         // id, flags, name, glyphs, codes, layout
};

// The code's name for listings, for example "PlaceObject2"; null for a code that is skipped.
const char* TagName(S32 code);
