// Numbers as scripts write them: values are strings, and arithmetic goes through these conversions.
// The same on every machine: no locale, no extended precision, no C library formatting.
#pragma once

#include <string>

#include "core/geom/types.h"

// Room for any number as text, the terminating zero included.
constexpr int kNumberChars = 40;

// Writes `value` with up to 15 significant digits, correctly rounded from the exact value, ties
// away from zero: plain from 1e-5 up to below 1e15, else with an exponent. "#ERROR#" for what is
// not finite. Returns the length; `text` has room for kNumberChars.
int FormatDouble(double value, char* text);
int FormatInteger(S32 value, char* text);

// Parses exactly `n` characters: sign, digits, ".", digits, "e" with sign and digits; nothing else,
// no blanks; at least one character after the sign. The correctly rounded double (infinity or 0 out
// of range); false, and nothing stored, when it is not a number.
bool ParseDouble(const char* text, int n, double* value);

// The same by the names and ownership of the script functions: a new string, to be freed with
// FreeStr, or null when memory is exhausted; 1 on success.
char* ConvertDoubleToString(double value);
char* ConvertIntegerToString(S32 value);
int ConvertStringToDouble(const char* text, double* value);
// Sign and digits only; wraps.
int ConvertStringToInteger(const char* text, S32* value);
// A number that is not 0, or "true" or "yes".
bool IsTrue(const char* text);
// 10 to the power n, by squaring, over 0.1 when n is negative.
double PowerOfTen(int n);

// What a number becomes when only its text passes it on: rounded to 15 digits. Exact and cheap for
// whole numbers below 1e15, never -0.
double RoundThroughText(double value);

// Truncated toward zero and clamped; 0 for what is not a number.
S32 TruncateToInt(double value);
