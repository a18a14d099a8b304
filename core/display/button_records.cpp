#include "core/display/button_records.h"

#include "core/player/limits.h"
#include "core/stream/character.h"
#include "core/stream/tags.h"

namespace {
bool IsSecondForm(const SCharacter* button)
{
    return button->tagCode == kTagDefineButton2;
}

// In the second form the offset of the condition blocks stands before the records.
constexpr S32 kOffsetBytes = 2;
} // namespace

ButtonRecords::ButtonRecords(const SCharacter* button) : secondForm(IsSecondForm(button))
{
    Attach(button->data, button->DataLen());
    if (secondForm)
        Skip(kOffsetBytes);
    colors.Attach(button->button.cxform, button->button.cxformLen);
}

bool ButtonRecords::Next(SButtonRecord* record)
{
    record->flags = GetByte();
    cut = record->flags != 0 && count >= gLimits.buttonRecords;
    if (record->flags == 0 || cut)
        return false;
    count++;
    record->id = GetWord();
    record->layer = GetWord();
    GetMatrix(&record->mat);
    ReadColors(record);
    return true;
}

void ButtonRecords::ReadColors(SButtonRecord* record)
{
    if (secondForm)
        GetColorTransform(&color, 1);
    else if (colors.pos < colors.limit)
        colors.GetColorTransform(&color, 0);
    record->cxform = color;
}

const U8* ButtonRecords::Actions() const
{
    return cut ? nullptr : script + pos;
}

ButtonConditions::ButtonConditions(const SCharacter* button) : next(0)
{
    if (!IsSecondForm(button))
        return;
    Attach(button->data, button->DataLen());
    next = GetWord();
}

// Offsets count from the field they stand in, and are 0 in the last block.
bool ButtonConditions::Next(SButtonCondition* condition)
{
    if (next == 0 || next >= limit)
        return false;
    pos = next;
    const S32 offset = GetWord();
    next = offset == 0 ? 0 : next + offset;
    condition->word = GetWord();
    condition->actions = script + pos;
    return true;
}
