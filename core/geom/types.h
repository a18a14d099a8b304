// The integer types of the whole core. Sizes are those of the file format and of the fixed-point
// arithmetic, so they are spelled out everywhere and `long` and plain `int` fields are avoided
// where a width matters.
#pragma once

#include <cstddef>
#include <cstdint>

using U8 = std::uint8_t;
using S8 = std::int8_t;
using U16 = std::uint16_t;
using S16 = std::int16_t;
using U32 = std::uint32_t;
using S32 = std::int32_t;
using U64 = std::uint64_t;
using S64 = std::int64_t;

constexpr S32 kS32Max = 0x7FFFFFFF;
constexpr S32 kS32Min = -0x7FFFFFFF - 1;

// The tracing hook: printf-style arguments, an empty body. Calls stay in the code as documentation
// of what is worth watching and cost nothing.
inline void VEXELOUTPUT(const char*, ...) {}
