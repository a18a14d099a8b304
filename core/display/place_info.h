// PlaceInfo: what a timeline asks of the display list.
#pragma once

#include "core/geom/matrix.h"
#include "core/raster/color.h"

struct SCharacter;

struct PlaceInfo {
    enum Flags : U32 {
        kMove = 0x01,
        kCharacter = 0x02,
        kMatrix = 0x04,
        kCxform = 0x08,
        kRatio = 0x10,
        kName = 0x20,
        kClipDepth = 0x40,
        kPrivateCopy = 0x80, // the character was copied for this object; never set by a tag
    };

    MATRIX mat;
    ColorTransform cxform;
    U32 flags; // which of the other fields mean something
    SCharacter* character;
    U16 depth;
    U16 ratio;
    U16 clipDepth;    // the highest depth that the object masks; with kClipDepth only
    U8 puppet;        // the object starts under script control
    const char* name; // copied; null when there is none

    // Identity, no flags, nothing else.
    void Clear();
};
