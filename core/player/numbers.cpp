#include "core/player/numbers.h"

#include <cstring>

#include "core/player/decimal.h"
#include "core/stream/str.h"

namespace {
// Whole numbers below this are written plainly, all digits exact.
constexpr double kPlainEnd = 1e15;
constexpr char kNoNumber[] = "#ERROR#";

// False for what is not finite, too.
bool IsShortWhole(double value, S64* whole)
{
    if (!(value > -kPlainEnd && value < kPlainEnd))
        return false;
    *whole = static_cast<S64>(value);
    return static_cast<double>(*whole) == value;
}

bool IsFinite(double value)
{
    return value - value == 0;
}

bool IsDigit(char c)
{
    return c >= '0' && c <= '9';
}

int WriteWhole(U64 value, char* text)
{
    char digits[20];
    int n = 0;
    do {
        digits[n++] = static_cast<char>('0' + value % 10);
        value /= 10;
    } while (value);
    for (int i = 0; i < n; i++)
        text[i] = digits[n - 1 - i];
    return n;
}

int WriteSigned(S64 value, char* text)
{
    const int sign = value < 0;
    text[0] = '-';
    const int n = sign + WriteWhole(static_cast<U64>(sign ? -value : value), text + sign);
    text[n] = 0;
    return n;
}

// The digits without zeros at the end, and where they stand.
struct SWritten {
    char digits[kDigits + 1]; // zero-terminated
    int count;
    int exponent; // of the first digit
};

// "0.", zeros, digits.
char* WriteFraction(const SWritten& number, char* to)
{
    *to++ = '0';
    *to++ = '.';
    for (int i = -1; i > number.exponent; i--)
        *to++ = '0';
    std::memcpy(to, number.digits, static_cast<size_t>(number.count));
    return to + number.count;
}

// Digits, with a point after `before` of them unless no more follow; zeros up to there.
char* WriteDigits(const SWritten& number, int before, char* to)
{
    for (int i = 0; i < before; i++)
        *to++ = i < number.count ? number.digits[i] : '0';
    if (number.count <= before)
        return to;
    *to++ = '.';
    std::memcpy(to, number.digits + before, static_cast<size_t>(number.count - before));
    return to + (number.count - before);
}

char* WriteScientific(const SWritten& number, char* to)
{
    to = WriteDigits(number, 1, to);
    *to++ = 'e';
    return to + WriteSigned(number.exponent, to);
}

// The form follows the exponent before rounding: what rounding carries up to 1e15 is still written
// plainly, and what it carries up to 1e-5 is not.
char* WriteMagnitude(double value, char* to)
{
    SWritten number;
    int form;
    U64 digits = DoubleToDigits(value, &form);
    number.exponent = form;
    if (digits == kDigitsEnd) {
        digits /= 10;
        number.exponent++;
    }
    number.count = WriteWhole(digits, number.digits);
    while (number.count > 1 && number.digits[number.count - 1] == '0')
        number.count--;
    if (form < -5 || form >= kDigits)
        return WriteScientific(number, to);
    return number.exponent < 0 ? WriteFraction(number, to)
                               : WriteDigits(number, number.exponent + 1, to);
}

// Reads digits from text[i] on; those after the point lower the exponent.
int ReadDigits(const char* text, int i, int n, bool fraction, SDecimal* decimal)
{
    for (; i < n && IsDigit(text[i]); i++) {
        const U32 digit = static_cast<U32>(text[i] - '0');
        if (decimal->count < SDecimal::kLeadDigits) {
            decimal->lead = decimal->lead * 10 + digit;
            decimal->count += decimal->lead != 0;
            decimal->exponent -= fraction;
            decimal->tail = text + i + 1;
        } else {
            decimal->exponent += !fraction;
            decimal->dropped |= digit != 0;
        }
    }
    return i;
}

// Sign and digits up to the end; false without digits.
bool ReadExponent(const char* text, int i, int n, S64* exponent)
{
    // No text is long enough to bring a number with such an exponent back into range.
    constexpr S64 kGreatest = S64{1} << 40;
    const bool negative = i < n && text[i] == '-';
    if (i < n && (text[i] == '-' || text[i] == '+'))
        i++;
    if (i == n)
        return false;
    S64 value = 0;
    for (; i < n && IsDigit(text[i]); i++)
        value = value < kGreatest ? value * 10 + (text[i] - '0') : value;
    *exponent += negative ? -value : value;
    return i == n;
}

// What comes after the sign.
bool ReadDecimal(const char* text, int i, int n, SDecimal* decimal)
{
    i = ReadDigits(text, i, n, false, decimal);
    if (i < n && text[i] == '.')
        i = ReadDigits(text, i + 1, n, true, decimal);
    decimal->end = text + i;
    if (i < n && (text[i] == 'e' || text[i] == 'E'))
        return ReadExponent(text, i + 1, n, &decimal->exponent);
    return i == n;
}
} // namespace

int FormatDouble(double value, char* text)
{
    S64 whole;
    if (IsShortWhole(value, &whole))
        return WriteSigned(whole, text);
    if (!IsFinite(value)) {
        std::memcpy(text, kNoNumber, sizeof kNoNumber);
        return sizeof kNoNumber - 1;
    }
    char* to = text;
    if (value < 0)
        *to++ = '-';
    to = WriteMagnitude(value < 0 ? -value : value, to);
    *to = 0;
    return static_cast<int>(to - text);
}

int FormatInteger(S32 value, char* text)
{
    return WriteSigned(value, text);
}

bool ParseDouble(const char* text, int n, double* value)
{
    const bool negative = n > 0 && text[0] == '-';
    const int start = n > 0 && (text[0] == '-' || text[0] == '+');
    SDecimal decimal;
    if (start >= n || !ReadDecimal(text, start, n, &decimal))
        return false;
    const double magnitude = DecimalToDouble(decimal);
    *value = negative ? -magnitude : magnitude;
    return true;
}

char* ConvertDoubleToString(double value)
{
    char text[kNumberChars];
    const int n = FormatDouble(value, text);
    return CreateStr(text, n);
}

char* ConvertIntegerToString(S32 value)
{
    char text[kNumberChars];
    const int n = FormatInteger(value, text);
    return CreateStr(text, n);
}

int ConvertStringToDouble(const char* text, double* value)
{
    return ParseDouble(text, StrLength(text), value);
}

int ConvertStringToInteger(const char* text, S32* value)
{
    const bool negative = *text == '-';
    if (*text == '-' || *text == '+')
        text++;
    if (!IsDigit(*text))
        return 0;
    const char* end = text;
    while (IsDigit(*end))
        end++;
    if (*end)
        return 0;
    const S32 magnitude = ToInt(text);
    *value = negative ? -magnitude : magnitude;
    return 1;
}

bool IsTrue(const char* text)
{
    double value;
    if (ConvertStringToDouble(text, &value))
        return value != 0;
    return std::strcmp(text, "true") == 0 || std::strcmp(text, "yes") == 0;
}

double PowerOfTen(int n)
{
    double base = n < 0 ? 0.1 : 10;
    double power = 1;
    for (U32 left = n < 0 ? 0u - static_cast<U32>(n) : static_cast<U32>(n); left; left >>= 1) {
        if (left & 1)
            power *= base;
        base *= base;
    }
    return power;
}

double RoundThroughText(double value)
{
    S64 whole;
    if (IsShortWhole(value, &whole))
        return static_cast<double>(whole);
    if (!IsFinite(value))
        return 0;
    int exponent;
    SDecimal decimal;
    decimal.lead = DoubleToDigits(value < 0 ? -value : value, &exponent);
    decimal.count = kDigits + (decimal.lead == kDigitsEnd);
    decimal.exponent = exponent - (kDigits - 1);
    const double rounded = DecimalToDouble(decimal);
    return value < 0 ? -rounded : rounded;
}

S32 TruncateToInt(double value)
{
    if (value != value)
        return 0;
    if (value >= kS32Max)
        return kS32Max;
    return value <= kS32Min ? kS32Min : static_cast<S32>(value);
}
