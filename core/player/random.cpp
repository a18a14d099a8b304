#include "core/player/random.h"

#include "core/player/player.h"

namespace {
constexpr U32 kSeedMask = 0x7FFFFFF;
// Taps of a shift register of 32 bits that runs through all states but 0.
constexpr U32 kTaps = 0xA3000000;

// 0 while there is no seed: the register never gets there.
U32 state = 0;

// The polynomial is odd for every x; folding the upper half in makes the low bits vary.
U32 Hash(U32 s)
{
    const U32 x = (s << 13) ^ s;
    const U32 h = x * (x * x * 15731 + 789221) + 1376312589;
    return (h ^ (h >> 15)) & 0x7FFFFFFF;
}
} // namespace

void SeedRandom(U32 seed)
{
    state = seed & kSeedMask ? seed & kSeedMask : 1;
}

S32 Random(S32 n)
{
    if (n <= 0)
        return 0;
    if (state == 0)
        SeedRandom(static_cast<U32>(PlayerClock()));
    const bool low = state & 1;
    state >>= 1;
    if (low)
        state ^= kTaps;
    return static_cast<S32>(Hash(state) % static_cast<U32>(n));
}
