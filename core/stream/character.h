// SCharacter: one entry of a movie's dictionary.
#pragma once

#include "core/geom/rect.h"
#include "core/geom/types.h"
#include "core/raster/bitmap_core.h"

class ScriptPlayer;

enum SCharType : U8 {
    kCharShape = 0,
    kCharBitmap = 1,
    kCharButton = 2,
    kCharFont = 3,
    kCharText = 4,
    kCharSound = 5,
    kCharSprite = 6,
    kCharMorphShape = 7,
    kCharEditText = 9,
    kCharLoadedMovie = 97, // a movie shown in a sprite's place
    kCharMovieRoot = 98,   // what the root object of a movie instantiates
    kCharNone = 0xFF,      // not set yet: owns nothing
};

// Ids that no tag may define or free.
enum SReservedId : U16 {
    kIdEmptySprite = 0xFFFC, // the empty sprite that replaces an unloaded movie
    kIdLoadedMovie = 0xFFFD, // a private kCharLoadedMovie record
    kIdMovieRoot = 0xFFFE,
    kIdFirstReserved = 0xFFFC,
};

struct SButtonPart {
    const U8* sounds; // body of the button's sound record, null when none
    const U8* cxform; // body of the button's colour transform record, null when none
    S32 soundsLen;    // bytes from there to the end of the tag
    S32 cxformLen;
    U8 trackAsMenu; // not 0: reacts to a pressed pointer that comes and goes
};

struct SFontPart {
    const U8* info; // body of the font information record, null when none
    S32 infoLen;    // bytes from `info` to the end of its tag
    void* cache;    // from malloc, freed with the record; for whoever shows text
    U16 glyphCount; // with-layout form only, else 0
    U16 flags;      // the with-layout form's first word, else 0
    U16 distance;   // bytes from after the flags word to after the glyph count
};

struct SSoundPart {
    U8 format;       // SSoundFormat bits
    U32 sampleCount; // as declared, up to 2^31 - 1: never trusted for memory
    S16 start;       // MPEG: lead-in samples to pass over
    S32 dataLen;     // bytes of sound data at `data`
};

struct SSpritePart {
    U16 numFrames;
    S32 dataLen; // bytes of nested tags at `data`
};

// What a definition tag entered. Little is decoded when it is entered: `data` points at the rest of
// the body inside the movie buffer. Records come zeroed from the dictionary's pool. One that leaves
// the dictionary while something still shows it lives on until the last user lets go;
// with the movie every record dies, and objects that show one change to GoneCharacter.
struct SCharacter {
    SCharacter* next;     // same chain of the dictionary
    SCharacter** link;    // what points at this record in its chain
    ScriptPlayer* player; // the movie that owns the entry
    U16 tag;              // the id
    U8 type;              // SCharType
    U8 tagCode;           // the code of the defining tag; 0 where the handler does not set it
    const U8* data;       // where the body continues in the movie buffer; null when none
    S32 dataLen;          // bytes from `data` to the end of the tag: readers stop there or earlier
    SRECT bounds;         // twips; empty until a definition sets it
    union {               // by type; check `type` first
        SBitmapCore bitmap;
        SButtonPart button;
        SFontPart font;
        SSoundPart sound;
        SSpritePart sprite;
        SRECT endBounds; // morph shape: bounds at ratio 0xFFFF
    };
    U32 users;        // display objects and others that hold a pointer to this record
    bool orphan;      // out of the dictionary: freed with the last user
    bool privateCopy; // made for one object, never in the dictionary

    // End of the readable bytes for a parser over `data`.
    S32 DataLen() const { return data ? dataLen : 0; }
};

// What an object shows once the movie of its character is gone: nothing. Of type kCharNone and of
// no movie; there is one for all, and it is never freed.
SCharacter* GoneCharacter();
