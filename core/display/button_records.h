// Readers over the body of a button character: its records and its condition blocks.
#pragma once

#include "core/stream/parser.h"

struct SCharacter;

// One record of a button: which states show what, and where.
struct SButtonRecord {
    enum Flags : U8 { kUp = 0x01, kOver = 0x02, kDown = 0x04, kHit = 0x08 };

    U8 flags;
    U16 id;
    U16 layer;
    MATRIX mat;
    ColorTransform cxform; // of the record, or of the button's own colour transform tag
};

// Walks the records of a button in order, as many as the limits allow. Owns nothing; the character
// must stay.
class ButtonRecords : private SParser {
public:
    explicit ButtonRecords(const SCharacter* button);
    // The next record; false at the zero byte or at the end of the data. The data of the character
    // is all that is read.
    bool Next(SButtonRecord* record);
    // After the last record, in the first form of button: where the actions start; null when the
    // limit cut the records off.
    const U8* Actions() const;

private:
    void ReadColors(SButtonRecord* record);

    const bool secondForm;
    U32 count = 0;    // of the records read
    bool cut = false; // there are more than the limit allows
    struct CxformReader : SParser {
    } colors;             // the separate colour transforms of the first form: one for each record,
    ColorTransform color; // and the last one for all that are left
};

// One condition block of the second form.
struct SButtonCondition {
    U16 word; // bit of each transition; from bit 9 on a key code, 0 for none
    const U8* actions;

    bool On(int transition) const { return word >> transition & 1; }
    int Key() const { return word >> 9; }
};

// Walks the chain of condition blocks of a button of the second form; empty for the first form.
// Positions only increase, so the walk ends.
class ButtonConditions : private SParser {
public:
    explicit ButtonConditions(const SCharacter* button);
    bool Next(SButtonCondition* condition);

private:
    S32 next; // position of the next block; 0 when there is none
};
