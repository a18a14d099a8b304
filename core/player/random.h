// The random numbers of scripts: one generator for all players of the process.
#pragma once

#include "core/geom/types.h"

// 0 to n - 1, or 0 when n is not positive. Seeded from the clock on first use.
S32 Random(S32 n);
// For results that repeat; only the low 27 bits count.
void SeedRandom(U32 seed);
