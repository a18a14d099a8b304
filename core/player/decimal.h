// Between binary and decimal, exactly: what is nearest to the true value, on every machine.
#pragma once

#include "core/geom/types.h"

// A decimal number that is not negative, as read from a text: lead * 10^exponent, and a little more
// when digits follow that `lead` has no room for.
struct SDecimal {
    static constexpr int kLeadDigits = 19;

    U64 lead = 0;               // the first digits that count, up to kLeadDigits of them
    int count = 0;              // how many these are, without zeros in front
    S64 exponent = 0;           // of the last digit in lead
    bool dropped = false;       // digits other than 0 follow
    const char* tail = nullptr; // when dropped: the text after lead, digits and points only,
    const char* end = nullptr;  // up to here
};

// The double nearest to the decimal, the even one of two equally near; infinity or 0 out of range.
double DecimalToDouble(const SDecimal& decimal);

// The digits of a number to be written.
constexpr int kDigits = 15;
constexpr U64 kDigitsEnd = 1000000000000000; // 10^kDigits

// The first kDigits digits of a positive finite value as one number, rounded by the digit after
// them, half a unit upwards: from kDigitsEnd / 10 up to kDigitsEnd, which it is when rounding
// carries out of the first digit. The power of ten that the value's own first digit counts in
// *exponent.
U64 DoubleToDigits(double value, int* exponent);
