#include "core/raster/palette.h"

#include <algorithm>

namespace {

constexpr S32 kLevels = 16;
constexpr S32 kLevelStep = 17; // 15 * 17 is 255

// How many of the four places are darker than a place: rows (0 2) and (3 1).
constexpr U32 kRanks[4] = {0, 2, 3, 1};

CChannels ChannelsOf(U32 rgb)
{
    return {S32(rgb >> 16 & 255), S32(rgb >> 8 & 255), S32(rgb & 255)};
}

// Equal brightness is settled by the channels, so that like colours come out in like places.
bool Darker(U32 a, U32 b)
{
    CChannels c = ChannelsOf(a), d = ChannelsOf(b);
    S32 more = 2 * (d.red - c.red) + 5 * (d.green - c.green) + (d.blue - c.blue);
    return more ? more > 0 : a < b;
}

U32 DefaultColor(U32 i)
{
    U32 grey = (i - 215) * 255 / 41;
    return i < 216 ? i / 36 * 51 << 16 | i / 6 % 6 * 51 << 8 | i % 6 * 51 : grey * 0x010101;
}

} // namespace

const CPalette& DefaultPalette()
{
    static const CPalette palette = [] {
        CPalette p;
        p.Build(nullptr, -1);
        return p;
    }();
    return palette;
}

void CPalette::Build(const SColorTable* table, S32 transparentIndex)
{
    transparent = U32(transparentIndex) < kColors ? transparentIndex : -1;
    TakeColors(table);
    HashColors();
    BuildInverse();
    BuildPatterns();
}

void CPalette::TakeColors(const SColorTable* table)
{
    count = table ? std::min(table->count, kColors) : 0;
    for (U32 i = 0; i < kColors; ++i)
        colors[i] = i < count ? table->colors[i] & 0xFFFFFF : count ? 0 : DefaultColor(i);
    count = count ? count : kColors;
}

// Of equal colours the first one stays.
void CPalette::HashColors()
{
    std::fill_n(exactColors, kExactSlots, kNoExactColor);
    for (U32 i = 0; i < count; ++i) {
        U32 slot = ExactSlot(colors[i]);
        if (S32(i) == transparent || exactColors[slot] == colors[i])
            continue;
        exactColors[slot] = colors[i];
        exactIndex[slot] = U8(i);
    }
}

// Distance and index are one number, so that the least of them is the nearest colour and the first
// of equals; all blues of a red and a green are done together.
void CPalette::BuildInverse()
{
    static constexpr S32 kNone = 0x7FFFFF00; // far away, and index 0
    S32 blueSquares[kColors][kLevels];
    for (U32 i = 0; i < count; ++i)
        for (S32 b = 0; b < kLevels; ++b) {
            S32 d = S32(colors[i] & 255) - b * kLevelStep;
            blueSquares[i][b] = d * d << 8;
        }
    for (S32 rg = 0; rg < kLevels * kLevels; ++rg) {
        S32 best[kLevels];
        std::fill_n(best, kLevels, kNone);
        for (U32 i = 0; i < count; ++i) {
            if (S32(i) == transparent)
                continue;
            CChannels c = ChannelsOf(colors[i]);
            S32 dr = c.red - rg / kLevels * kLevelStep, dg = c.green - rg % kLevels * kLevelStep;
            S32 rest = (dr * dr + dg * dg) << 8 | S32(i);
            for (S32 b = 0; b < kLevels; ++b)
                best[b] = std::min(best[b], rest + blueSquares[i][b]);
        }
        for (S32 b = 0; b < kLevels; ++b)
            inverse[rg * kLevels + b] = U8(best[b]);
    }
}

void CPalette::BuildPatterns()
{
    for (S32 cell = 0; cell < S32(kCells); ++cell)
        patterns[cell] = PatternOf(
            {(cell >> 8) * kLevelStep, (cell >> 4 & 15) * kLevelStep, (cell & 15) * kLevelStep});
}

// Four colours, each chosen for what the ones before it left undone, and placed by brightness.
U32 CPalette::PatternOf(const CChannels& want) const
{
    auto level = [](S32 v) { return U32(std::clamp(v + kLevelStep / 2, 0, 255) / kLevelStep); };
    CChannels left = {0, 0, 0};
    U8 sorted[4];
    for (S32 n = 0; n < 4; ++n) {
        left.red += want.red;
        left.green += want.green;
        left.blue += want.blue;
        U8 index = inverse[level(left.red) << 8 | level(left.green) << 4 | level(left.blue)];
        CChannels got = ChannelsOf(colors[index]);
        left.red -= got.red;
        left.green -= got.green;
        left.blue -= got.blue;
        S32 at = n;
        for (; at > 0 && Darker(colors[index], colors[sorted[at - 1]]); --at)
            sorted[at] = sorted[at - 1];
        sorted[at] = index;
    }
    U32 pattern = 0;
    for (U32 place = 0; place < 4; ++place)
        pattern |= U32(sorted[kRanks[place]]) << (8 * place);
    return pattern;
}
