// C strings on the heap, and the comparisons that movies expect: only the ASCII letters fold, bytes
// above 0x7F match exactly.
#pragma once

#include <cstddef>

#include "core/geom/types.h"

// The length of s, or the limit on one string when s is longer: movie data may go on without a zero
// byte for as long as the movie does. s is not null.
int StrLength(const char* s);
// A copy made on the heap, cut at the limit on one string, freed with FreeStr; null for null, and
// when memory or the limit on the bytes of all strings alive is exhausted.
char* CreateStr(const char* s);
// A copy of exactly n bytes with a terminating zero added.
char* CreateStr(const char* s, int n);
// The same of n bytes of s followed by m bytes of t.
char* JoinStr(const char* s, int n, const char* t, int m);
// Only for what CreateStr made; null-safe.
void FreeStr(char* s);

// Counts bytes of the records that hold strings under the same limit; false, and nothing counted,
// when it is exhausted.
bool ReserveStrBytes(size_t bytes);
void ReturnStrBytes(size_t bytes);

// Equal under ASCII case folding; false if either is null.
bool StrEqual(const char* a, const char* b);
// How many characters a and b have in common at their beginnings under the same folding; counts no
// further than the limit on one string. Neither is null.
int StrCommon(const char* a, const char* b);
// The same for all strings that StrEqual calls equal. s is not null.
U32 StrHash(const char* s);
// If s begins with prefix under the same folding, the place in s just after it, else null.
const char* SkipPrefix(const char* s, const char* prefix);
// The leading decimal digits as a number: no sign, no blanks, wraps on overflow, 0 without digits.
S32 ToInt(const char* s);
