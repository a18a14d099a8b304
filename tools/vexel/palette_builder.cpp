#include "tools/vexel/palette_builder.h"

#include <algorithm>

namespace {

constexpr size_t kFew = 256; // more exact colours than a palette can hold are not remembered
constexpr int kHashBits = 18;

S32 Red(U32 color)
{
    return static_cast<S32>(color >> 16 & 255);
}

S32 Green(U32 color)
{
    return static_cast<S32>(color >> 8 & 255);
}

S32 Blue(U32 color)
{
    return static_cast<S32>(color & 255);
}

S32 Light(U32 color)
{
    return 3 * Red(color) + 6 * Green(color) + 2 * Blue(color);
}

// Colours that lie close together, as one.
struct Cell {
    U8 channel[3];
    U64 weight;
};

constexpr U64 kImportance[3] = {3, 6, 2};

U64 Root(U64 n)
{
    U64 root = 0;
    for (U64 bit = U64(1) << 31; bit != 0; bit >>= 1) {
        if ((root + bit) * (root + bit) <= n)
            root += bit;
    }
    return root;
}

// Weight and weighted sum of one channel over cells.
struct Mass {
    U64 weight = 0;
    U64 sum = 0;

    void Add(const Cell& cell, int axis, U64 sign)
    {
        weight += sign * cell.weight;
        sum += sign * cell.weight * cell.channel[axis];
    }
    // Sum times mean, the mean with 8 bits of fraction: what a cut makes larger is what it takes
    // away from the squared error.
    U64 Score() const { return weight == 0 ? 0 : sum * ((sum << 8) / weight); }
};

// A run of cells and the cut that takes most away from its error.
struct Box {
    std::vector<Cell>::iterator begin, end;
    int axis = 0;
    ptrdiff_t cut = 0; // cells before it
    U64 gain = 0;

    void Sort(int by)
    {
        std::sort(begin, end, [by](const Cell& a, const Cell& b) {
            return a.channel[by] != b.channel[by]
                       ? a.channel[by] < b.channel[by]
                       : std::lexicographical_compare(a.channel, a.channel + 3, b.channel,
                                                      b.channel + 3);
        });
    }
    void FindCut();
    U32 Mean() const;
};

void Box::FindCut()
{
    for (int by = 0; by < 3; by++) {
        Sort(by);
        Mass low, high;
        for (auto cell = begin; cell != end; ++cell)
            high.Add(*cell, by, 1);
        const U64 whole = high.Score();
        for (auto cell = begin; cell + 1 < end; ++cell) {
            low.Add(*cell, by, 1);
            high.Add(*cell, by, ~U64(0));
            const U64 parts = low.Score() + high.Score();
            const U64 won = parts > whole ? (parts - whole) / 8 * kImportance[by] : 0;
            if (won <= gain)
                continue;
            gain = won;
            axis = by;
            cut = cell - begin + 1;
        }
    }
}

U32 Box::Mean() const
{
    U32 color = 0;
    for (int by = 0; by < 3; by++) {
        Mass mass;
        for (auto cell = begin; cell != end; ++cell)
            mass.Add(*cell, by, 1);
        color = color << 8 | static_cast<U32>((mass.sum + mass.weight / 2) / mass.weight);
    }
    return color;
}

std::vector<U32> CutBoxes(std::vector<Cell>* cells, size_t most)
{
    std::vector<Box> boxes = {{cells->begin(), cells->end()}};
    boxes[0].FindCut();
    while (boxes.size() < most) {
        const auto box = std::max_element(
            boxes.begin(), boxes.end(), [](const Box& a, const Box& b) { return a.gain < b.gain; });
        if (box->gain == 0)
            break;
        box->Sort(box->axis);
        Box low = {box->begin, box->begin + box->cut};
        Box high = {low.end, box->end};
        low.FindCut();
        high.FindCut();
        *box = low;
        boxes.push_back(high);
    }
    std::vector<U32> colors;
    for (const Box& box : boxes)
        colors.push_back(box.Mean());
    return colors;
}

// Moves each colour into the middle of the cells that are nearest to it.
void Settle(const std::vector<Cell>& cells, std::vector<U32>* colors)
{
    const ColorTable table(*colors);
    std::vector<Mass> masses(colors->size() * 3);
    for (const Cell& cell : cells) {
        Mass* near = &masses[3 * table.Nearest(cell.channel[0], cell.channel[1], cell.channel[2])];
        for (int by = 0; by < 3; by++)
            near[by].Add(cell, by, 1);
    }
    for (size_t i = 0; i < colors->size(); i++) {
        const Mass* mass = &masses[3 * i];
        if (mass->weight == 0)
            continue;
        (*colors)[i] = 0;
        for (int by = 0; by < 3; by++)
            (*colors)[i] = (*colors)[i] << 8 |
                           static_cast<U32>((mass[by].sum + mass[by].weight / 2) / mass[by].weight);
    }
}

} // namespace

PaletteBuilder::PaletteBuilder() : tallies(1 << 18) {}

void PaletteBuilder::CountExactly(U32 color)
{
    const auto place = std::lower_bound(exact.begin(), exact.end(), color);
    if (place != exact.end() && *place == color)
        return;
    few = exact.size() < kFew;
    if (few)
        exact.insert(place, color);
}

void PaletteBuilder::Count(U32 color, U32 times)
{
    Tally& tally = tallies[(color >> 18 & 63) << 12 | (color >> 10 & 63) << 6 | (color >> 2 & 63)];
    tally.count += times;
    tally.red += U64(times) * (color >> 16 & 255);
    tally.green += U64(times) * (color >> 8 & 255);
    tally.blue += U64(times) * (color & 255);
    if (few)
        CountExactly(color & 0xFFFFFF);
}

// Colours weigh less than by their area (by its power of 3/4): a small thing that stands out keeps
// its colour beside a wide sky.
std::vector<U32> PaletteBuilder::Choose(size_t most) const
{
    if (few && exact.size() <= most)
        return exact.empty() ? std::vector<U32>{0} : exact;
    std::vector<Cell> cells;
    for (const Tally& t : tallies) {
        if (t.count > 0)
            cells.push_back({{static_cast<U8>(t.red / t.count), static_cast<U8>(t.green / t.count),
                              static_cast<U8>(t.blue / t.count)},
                             Root(t.count * Root(t.count))});
    }
    std::vector<U32> colors = CutBoxes(&cells, most);
    for (int round = 0; round < 4; round++)
        Settle(cells, &colors);
    return colors;
}

ColorTable::ColorTable(const std::vector<U32>& colors)
{
    for (size_t i = 0; i < kMost; i++) {
        const U32 color = colors[i < colors.size() ? i : 0];
        red[i] = Red(color);
        green[i] = Green(color);
        blue[i] = Blue(color);
    }
}

// Distance and index in one number, and always all entries: the compiler makes parallel steps of
// this. Green counts most and blue least, as the eye has it.
U8 ColorTable::Nearest(S32 r, S32 g, S32 b) const
{
    S32 best = 0x7FFFFFFF;
    for (S32 i = 0; i < kMost; i++) {
        const S32 dr = red[i] - r;
        const S32 dg = green[i] - g;
        const S32 db = blue[i] - b;
        const S32 rank = (3 * dr * dr + 6 * dg * dg + 2 * db * db) * kMost + i;
        best = rank < best ? rank : best;
    }
    return static_cast<U8>(best % kMost);
}

PaletteMap::PaletteMap(const std::vector<U32>& palette)
    : colors(palette), table(palette), kept(1 << kHashBits)
{
}

// The second entry is the one nearest to the mirror image of the colour in the first: where the
// colour lies between the two says how much each has.
PaletteMap::Mix PaletteMap::MixFor(U32 color) const
{
    const S32 r = Red(color), g = Green(color), b = Blue(color);
    U8 dark = table.Nearest(r, g, b);
    const U32 near = colors[dark];
    U8 bright = table.Nearest(2 * r - Red(near), 2 * g - Green(near), 2 * b - Blue(near));
    if (Light(colors[bright]) < Light(colors[dark]))
        std::swap(dark, bright);
    const U32 from = colors[dark], to = colors[bright];
    const S32 dr = Red(to) - Red(from), dg = Green(to) - Green(from), db = Blue(to) - Blue(from);
    const S32 length = 3 * dr * dr + 6 * dg * dg + 2 * db * db;
    const S32 along =
        3 * dr * (r - Red(from)) + 6 * dg * (g - Green(from)) + 2 * db * (b - Blue(from));
    const S32 share = length == 0 ? 0 : (16 * along + length / 2) / length;
    return {color | 1 << 24, dark, bright, static_cast<U8>(std::clamp(share, 0, 16))};
}

U8 PaletteMap::Index(U32 color, S32 x, S32 y)
{
    constexpr U8 kPattern[4][4] = {{0, 8, 2, 10}, {12, 4, 14, 6}, {3, 11, 1, 9}, {15, 7, 13, 5}};
    color &= 0xFFFFFF;
    Mix& mix = kept[(color * 0x9E3779B1u) >> (32 - kHashBits)];
    if (mix.key != (color | 1 << 24))
        mix = MixFor(color);
    return mix.share > kPattern[y & 3][x & 3] ? mix.bright : mix.dark;
}
