// Static text: every glyph becomes edges of the one object that shows the text.
#include "core/display/display_list.h"
#include "core/shape/character_parser.h"
#include "core/shape/text_records.h"
#include "core/stream/character.h"

namespace {
constexpr U32 kGlyphCost = 8;     // records that setting up for an outline is worth
constexpr U32 kTopOrder = 0xFFFF; // the greatest number that tells colours of an object apart

class STextBuilder {
public:
    STextBuilder(SObject* object, const STransform* transform)
        : obj(object), placed(transform), records(object->character)
    {
        MatrixConcat(&records.mat, &placed->mat, &toDevice);
    }

    void Build();

private:
    bool AddGlyph();
    bool ChooseColor();

    SObject* obj;
    const STransform* placed;
    STextRecords records;
    MATRIX toDevice;         // text space to device
    RColor* color = nullptr; // of the glyphs being added
    SRGB value;              // that it was made of
    U32 runs = 0;            // colours made
};

// Records without a glyph are charged too: a byte can hold more than a hundred of them.
void STextBuilder::Build()
{
    for (auto what = records.Next(); what != STextRecords::kEnd; what = records.Next()) {
        if (obj->display->recordsLeft == 0)
            return;
        --obj->display->recordsLeft;
        if (what == STextRecords::kGlyph && !AddGlyph())
            return;
    }
}

// Later runs lie above earlier ones. A mask has one colour, whatever the text says.
bool STextBuilder::ChooseColor()
{
    if (color && (obj->IsClip() || value == records.color))
        return true;
    value = records.color;
    runs += runs < kTopOrder;
    color = obj->IsClip()
                ? CreateClipColor(obj->display, &obj->colors)
                : CreateSolidColor(obj->display, &obj->colors, value, placed->cxform, runs);
    return color != nullptr;
}

// False when there is no colour to be had.
bool STextBuilder::AddGlyph()
{
    const SBytes outline = records.font.Glyph(records.glyph);
    if (outline.len == 0)
        return true;
    if (!ChooseColor())
        return false;
    U32& left = obj->display->recordsLeft;
    left -= left < kGlyphCost ? left : kGlyphCost;
    MATRIX mat = records.GlyphMatrix();
    MatrixConcat(&mat, &toDevice, &mat);
    SCharacterParser parser(obj, obj->character->player, outline.at, S32(outline.len), 0, &mat);
    parser.SetOnlyFill(color);
    parser.useWinding = true;
    parser.BuildEdges(false, &obj->devBounds);
    return true;
}
} // namespace

void BuildTextEdges(SObject* obj, const STransform* placed)
{
    STextBuilder(obj, placed).Build();
}
