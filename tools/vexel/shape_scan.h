// Counting what a shape record holds, without drawing it.
#pragma once

#include "tools/vexel/tag_reader.h"

struct ShapeCounts {
    U32 fills = 0; // of all style blocks
    U32 lines = 0;
    U32 edges = 0;
};

enum class ShapeKind {
    kPlain, // colours without alpha
    kAlpha, // colours with alpha
    kMorph, // each style twice, with alpha
};

// Reads the style block and the records at the reader's place. Stops at the end of the tag.
ShapeCounts ScanShape(SParser* reader, ShapeKind kind);
