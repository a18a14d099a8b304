// C strings on the heap, and the comparisons that movies expect: only the ASCII letters fold, bytes
// above 0x7F match exactly.
#pragma once

#include "core/geom/types.h"

// A copy made on the heap, freed with FreeStr; null for null, and when memory or the limit on the
// bytes of all strings alive is exhausted.
char* CreateStr(const char* s);
// A copy of exactly n bytes with a terminating zero added.
char* CreateStr(const char* s, int n);
// Only for what CreateStr made; null-safe.
void FreeStr(char* s);

// Equal under ASCII case folding; false if either is null.
bool StrEqual(const char* a, const char* b);
// The same for all strings that StrEqual calls equal. s is not null.
U32 StrHash(const char* s);
// If s begins with prefix under the same folding, the place in s just after it, else null.
const char* SkipPrefix(const char* s, const char* prefix);
// The leading decimal digits as a number: no sign, no blanks, wraps on overflow, 0 without digits.
S32 ToInt(const char* s);
