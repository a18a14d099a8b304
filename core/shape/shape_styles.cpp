// Style blocks: counts, tables, fills and lines, plain or as pairs of a morph.
#include <algorithm>

#include "core/display/display_list.h"
#include "core/shape/shape_parser.h"
#include "core/stream/script_player.h"

namespace {
constexpr U8 kGradientBit = 0x10;
constexpr U8 kBitmapBit = 0x40;
constexpr U32 kEscape = 0xFF; // a count byte: the count is the word that follows

S32 Between(S32 start, S32 end, U16 ratio)
{
    return S32(start + ((S64(end) - start) * ratio >> 16));
}

// The transform works on what the file says, so premultiplying comes after it.
void FinishSolid(RColor* color, const ColorTransform& cxform)
{
    if (cxform.flags != 0)
        cxform.Apply(&color->rgb, 1);
    color->transparent = color->rgb.alpha < 255;
    Premultiply(&color->rgb);
}
} // namespace

bool SShapeParser::GetStyles()
{
    morphStyles = false;
    return ReadStyleBlock();
}

bool SShapeParser::GetMorphStyles()
{
    morphStyles = true;
    return ReadStyleBlock();
}

bool SShapeParser::ReadStyleBlock()
{
    nFills = 0;
    nLines = 0;
    if (!ReadFills() || !ReadLines())
        return false;
    // The widths end every block, so that one without them is cut short.
    if (pos >= limit)
        return false;
    ReadSelectorWidths();
    return true;
}

U32 SShapeParser::ReadCount()
{
    const U32 count = GetByte();
    return count == kEscape ? GetWord() : count;
}

// A count that lies costs nothing: no style is shorter than a byte.
bool SShapeParser::CanHold(U32 styles) const
{
    return styles <= U32(limit - pos);
}

bool SShapeParser::SizeFills(U32 count)
{
    heapFills.Clear();
    fillIndex = inlineFills;
    if (count >= kInlineStyles) {
        if (!heapFills.Resize(size_t(count) + 1))
            return false;
        fillIndex = heapFills.data();
    }
    fillIndex[0] = nullptr;
    return true;
}

bool SShapeParser::SizeLines(U32 count)
{
    heapLines.Clear();
    lineIndex = inlineLines;
    if (count >= kInlineStyles) {
        if (!heapLines.Resize(size_t(count) + 1))
            return false;
        lineIndex = heapLines.data();
    }
    lineIndex[0] = {nullptr, 0};
    return true;
}

RColor* SShapeParser::NewColor(U32 number)
{
    RColor* color = display->NewColor();
    if (!color)
        return nullptr;
    color->SetUp(raster);
    // Numbers beyond 16 bits would reach into the object's layer.
    color->order = std::min(number + layer, 0xFFFFu);
    color->nextColor = *colorList;
    *colorList = color;
    return color;
}

bool SShapeParser::SpendRecord()
{
    if (display->recordsLeft == 0)
        return false;
    --display->recordsLeft;
    return true;
}

// nFills grows with the table, so that a selector never meets an entry that is not there yet.
bool SShapeParser::ReadFills()
{
    const U32 count = ReadCount();
    if (!CanHold(count) || !SizeFills(count))
        return false;
    for (U32 i = 1; i <= count; ++i) {
        RColor* color = pos < limit && SpendRecord() ? NewColor(i) : nullptr;
        if (!color)
            return false;
        fillIndex[i] = color;
        nFills = i;
        ReadFill(color);
        SetupColor(color);
    }
    return true;
}

bool SShapeParser::ReadLines()
{
    const U32 count = ReadCount();
    if (!CanHold(count) || !SizeLines(count))
        return false;
    for (U32 i = 1; i <= count; ++i) {
        RColor* color = pos < limit && SpendRecord() ? NewColor(i + nFills) : nullptr;
        if (!color)
            return false;
        lineIndex[i] = {color, MatrixTransformThickness(&mat, ReadWidth())};
        nLines = i;
        ReadSolid(color);
        SetupColor(color);
    }
    return true;
}

U16 SShapeParser::ReadWidth()
{
    const U16 start = GetWord();
    return morphStyles ? U16(Between(start, GetWord(), ratio)) : start;
}

void SShapeParser::ReadFill(RColor* color)
{
    const U8 type = GetByte();
    if (type & kGradientBit)
        ReadGradient(color, type);
    else if (type & kBitmapBit)
        ReadBitmapFill(color, type);
    else
        ReadSolid(color);
}

void SShapeParser::ReadFillMatrix(MATRIX* m)
{
    GetMatrix(m);
    if (!morphStyles)
        return;
    MATRIX end;
    GetMatrix(&end);
    Interpolate(m, &end, ratio, m);
}

void SShapeParser::ReadGradient(RColor* color, U8 type)
{
    color->colorType = kColorGradient;
    color->gradientType = type;
    ReadFillMatrix(&color->gradientMat);
    ReadRamp(color);
    if (cxform.flags == 0)
        return;
    cxform.Apply(&color->ramp);
    if (cxform.LowersAlpha())
        color->transparent = 1;
}

// Stops beyond the ramp's room are read past; ratios that go back are held.
void SShapeParser::ReadRamp(RColor* color)
{
    GradColorRamp& ramp = color->ramp;
    ramp.count = 0;
    U8 last = 0;
    for (U32 n = GetByte(); n > 0 && pos < limit; --n) {
        U8 stopRatio;
        SRGB stopColor;
        ReadStop(&stopRatio, &stopColor);
        if (ramp.count == GradColorRamp::kMaxStops)
            continue;
        last = stopRatio < last ? last : stopRatio;
        ramp.ratios[ramp.count] = last;
        ramp.colors[ramp.count++] = stopColor;
        if (stopColor.alpha < 255)
            color->transparent = 1;
    }
}

void SShapeParser::ReadStop(U8* stopRatio, SRGB* stopColor)
{
    *stopRatio = GetByte();
    *stopColor = GetColor(getAlpha);
    if (!morphStyles)
        return;
    *stopRatio = U8(Between(*stopRatio, GetByte(), ratio));
    const SRGB end = GetColor(getAlpha);
    Interpolate(stopColor, &end, ratio, stopColor);
}

void SShapeParser::ReadBitmapFill(RColor* color, U8 type)
{
    const U16 id = GetWord();
    ReadFillMatrix(&color->bitmapMat);
    // Opaque red on purpose: it shows where an id does not resolve.
    color->rgb = {0, 0, 255, 255};
    SCharacter* ch = player ? player->FindCharacter(id) : nullptr;
    if (!ch || ch->type != kCharBitmap)
        return;
    if (raster)
        player->BuildBits(ch);
    RetainCharacter(ch);
    color->bitmapCharacter = ch;
    color->colorType = kColorBitmap;
    color->bitmap = &ch->bitmap;
    color->bitmapType = type;
    color->cxform = cxform;
}

void SShapeParser::ReadSolid(RColor* color)
{
    GetColor(&color->rgb, getAlpha);
    if (morphStyles) {
        RGBI end;
        GetColor(&end, getAlpha);
        Interpolate(&color->rgb, &end, ratio, &color->rgb);
    }
    FinishSolid(color, cxform);
}

RColor* CreateSolidColor(DisplayList* display, RColor** list, SRGB value,
                         const ColorTransform& cxform, U32 order)
{
    RColor* color = display->NewColor();
    if (!color)
        return nullptr;
    CRaster* raster = display->PaintedRaster();
    color->SetUp(raster);
    color->order = order;
    color->nextColor = *list;
    *list = color;
    color->rgb = {value.blue, value.green, value.red, value.alpha};
    FinishSolid(color, cxform);
    if (raster)
        color->BuildCache();
    return color;
}
