// Strings of one- and two-byte characters: a lead byte and the byte after it are one character.
#pragma once

#include "core/geom/types.h"

// The byte begins a character of two bytes (0x81 to 0x9F, 0xE0 to 0xFC).
bool PlayerIsLeadByte(U8 c);
// Some character of the string takes two bytes.
bool PlayerIsMultiByte(const char* s);
// Length in characters with `multibyte`, else in bytes.
int PlayerStringLength(const char* s, int multibyte);
// The byte offset of a character counted from 0; the length when there are fewer.
int PlayerStringIndex(const char* s, int index, int multibyte);
// The part of s from character `start` (from 0, clamped) on, `count` characters long or up to the
// end when count is negative: its first byte in *from, its length in bytes as the result.
int PlayerStringExtract(const char* s, int start, int count, int multibyte, int* from);
