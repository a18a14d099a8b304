// CPalette: up to 256 colours, and the tables that find the one to show for any other.
#pragma once

#include "core/raster/bitmap_core.h"
#include "core/raster/color.h"

struct CChannels {
    S32 red, green, blue;
};

// Plain memory; Build makes it valid. Colours are words r << 16 | g << 8 | b; what a colour that is
// asked for holds above that is ignored. A colour of the palette is found exactly, any other
// through a grid of 16 levels a channel, level v standing for the channel value 17 * v.
struct CPalette {
    static constexpr U32 kColors = 256;
    static constexpr U32 kCells = 16 * 16 * 16;
    static constexpr U32 kExactSlots = 1024;

    U32 colors[kColors];
    U32 count;                    // valid ones
    S32 transparent;              // index that stands for "no colour", or -1
    U8 inverse[kCells];           // the nearest colour, by red's level, then green's and blue's
    U32 patterns[kCells];         // see Pattern
    U32 exactColors[kExactSlots]; // a hash table of the colours ...
    U8 exactIndex[kExactSlots];   // ... and where they stand

    // Takes the table's first 256 valid colours, or the default palette without a table or with an
    // empty one, less the transparent one. Less than a millisecond.
    void Build(const SColorTable* table, S32 transparentIndex);

    // Index of the colour itself, or of the nearest to its cell (r & 0xF0) << 4 | (g & 0xF0) |
    // b >> 4; the lowest of several.
    U32 Nearest(U32 rgb) const;
    // What to show for the colour in the pixels of a square of two by two, so that their average is
    // near it. Byte 2 * (y & 1) + (x & 1) is the index at (x, y); all are equal for a colour of the
    // palette.
    U32 Pattern(U32 rgb) const;

private:
    void TakeColors(const SColorTable* table);
    void HashColors();
    void BuildInverse();
    void BuildPatterns();
    U32 PatternOf(const CChannels& want) const;
    // The place of exactly this colour in the hash table, or the empty one where it would go.
    U32 ExactSlot(U32 rgb) const;
};

// The cube and the greys, without a transparent index; made when first asked for.
const CPalette& DefaultPalette();

constexpr U32 kNoExactColor = 0xFFFFFFFF; // an empty place of exactColors

inline U32 CPalette::ExactSlot(U32 rgb) const
{
    U32 at = rgb * 0x9E3779B1u >> 22;
    while (exactColors[at] != rgb && exactColors[at] != kNoExactColor)
        at = (at + 1) % kExactSlots;
    return at;
}

inline U32 CPalette::Nearest(U32 rgb) const
{
    rgb &= 0xFFFFFF;
    U32 slot = ExactSlot(rgb);
    if (exactColors[slot] == rgb)
        return exactIndex[slot];
    return inverse[(rgb >> 12 & 0xF00) | (rgb >> 8 & 0xF0) | (rgb >> 4 & 0xF)];
}

inline U32 CPalette::Pattern(U32 rgb) const
{
    rgb &= 0xFFFFFF;
    U32 slot = ExactSlot(rgb);
    if (exactColors[slot] == rgb)
        return exactIndex[slot] * 0x01010101u;
    auto level = [](U32 v) { return (v + 8) / 17; };
    return patterns[level(rgb >> 16) << 8 | level(rgb >> 8 & 255) << 4 | level(rgb & 255)];
}
