// Natural numbers far beyond 64 bits, for conversions between binary and decimal that must be
// exact.
#pragma once

#include "core/geom/types.h"

// A natural number below 2^3072: enough for every double as a decimal, and for the 800 digits that
// decide how a decimal is rounded. The caller stays within that; what does not fit is lost. Usable
// in constant expressions, so that tables can be computed by the compiler.
class BigNumber {
public:
    constexpr explicit BigNumber(U64 value)
    {
        for (; value; value >>= 32)
            words[used++] = static_cast<U32>(value);
    }

    constexpr void MultiplyAdd(U32 factor, U32 addend)
    {
        U64 carry = addend;
        for (int i = 0; i < used; i++) {
            carry += static_cast<U64>(words[i]) * factor;
            words[i] = static_cast<U32>(carry);
            carry >>= 32;
        }
        if (carry && used < kWords)
            words[used++] = static_cast<U32>(carry);
    }

    // The quotient, the remainder dropped. Several in a row give the quotient by the product.
    constexpr void Divide(U32 divisor)
    {
        U64 rest = 0;
        for (int i = used - 1; i >= 0; i--) {
            rest = rest << 32 | words[i];
            words[i] = static_cast<U32>(rest / divisor);
            rest %= divisor;
        }
        Trim();
    }

    constexpr void MultiplyByPowerOfFive(int n)
    {
        for (; n >= kFiveStep; n -= kFiveStep)
            MultiplyAdd(kFiveStepPower, 0);
        for (; n > 0; n--)
            MultiplyAdd(5, 0);
    }

    constexpr void DivideByPowerOfFive(int n)
    {
        for (; n >= kFiveStep; n -= kFiveStep)
            Divide(kFiveStepPower);
        for (; n > 0; n--)
            Divide(5);
    }

    constexpr void ShiftLeft(int bits)
    {
        const int whole = bits / 32;
        if (whole) {
            for (int i = kWords - 1; i >= 0; i--)
                words[i] = i >= whole ? words[i - whole] : 0;
            used = used + whole < kWords ? used + whole : kWords;
        }
        MultiplyAdd(1u << (bits % 32), 0);
        Trim();
    }

    // How many bits it has: 0 for 0.
    constexpr int Bits() const
    {
        int n = used * 32;
        for (U32 top = used ? words[used - 1] : 0; used && !(top & 0x80000000u); top <<= 1)
            n--;
        return n;
    }

    // The 64 bits from bit `low` on; bits below 0 are zeros.
    constexpr U64 Extract(int low) const
    {
        U64 value = 0;
        for (int i = 63; i >= 0; i--)
            value = value << 1 | Bit(low + i);
        return value;
    }

    // Below 0, 0 or above 0, as this number is smaller than, equal to or greater than the other.
    constexpr int Compare(const BigNumber& other) const
    {
        for (int i = kWords - 1; i >= 0; i--) {
            if (words[i] != other.words[i])
                return words[i] < other.words[i] ? -1 : 1;
        }
        return 0;
    }

private:
    static constexpr int kWords = 96;
    // The greatest power of five that a word holds.
    static constexpr int kFiveStep = 13;
    static constexpr U32 kFiveStepPower = 1220703125;

    constexpr U32 Bit(int i) const
    {
        return i >= 0 && i < kWords * 32 ? words[i / 32] >> (i % 32) & 1 : 0;
    }

    constexpr void Trim()
    {
        while (used > 0 && words[used - 1] == 0)
            used--;
    }

    U32 words[kWords] = {}; // the lowest first; zeros from `used` on
    int used = 0;
};
