// A palette for a whole animation, and the pixels' way into it.
#pragma once

#include "core/geom/types.h"

#include <vector>

// Counts the colours of pictures and chooses those that stand for them best. Colours are words
// r << 16 | g << 8 | b.
class PaletteBuilder {
public:
    PaletteBuilder();

    void Count(U32 color, U32 times);
    // At most `most` colours: all that were counted if they are no more, otherwise the best found.
    // At least one.
    std::vector<U32> Choose(size_t most) const;

private:
    struct Tally {
        U64 count = 0;
        U64 red = 0, green = 0, blue = 0; // sums over the count
    };
    void CountExactly(U32 color);

    std::vector<Tally> tallies; // by the six high bits of each channel
    std::vector<U32> exact;     // each colour once, while they are few
    bool few = true;
};

// Finds the entry nearest to a colour. There must be an entry, and at most 256.
class ColorTable {
public:
    explicit ColorTable(const std::vector<U32>& colors);
    // Each channel from -255 to 510; of two entries equally near, the first.
    U8 Nearest(S32 r, S32 g, S32 b) const;

private:
    static constexpr S32 kMost = 256;
    S32 red[kMost], green[kMost], blue[kMost]; // beyond the last entry the first one again
};

// Finds palette entries for colours. A colour between two entries is dithered with a pattern of 4x4
// pixels that depends on the colour and the place alone, so that nothing shimmers; a colour that
// the palette holds is never dithered.
class PaletteMap {
public:
    explicit PaletteMap(const std::vector<U32>& palette);

    // The entry for a colour at a place.
    U8 Index(U32 color, S32 x, S32 y);

private:
    struct Mix {
        U32 key = 0;   // colour with bit 24 set; 0: nothing is kept here
        U8 dark = 0;   // the two entries, ordered by their light,
        U8 bright = 0; // and how many sixteenths
        U8 share = 0;  // are the bright one's
    };
    Mix MixFor(U32 color) const;

    std::vector<U32> colors;
    ColorTable table;
    std::vector<Mix> kept; // by a hash of the colour; the last one stays
};
