// Two RGBI pixels at a time, for the rows that blending spends its time on. The vector form is the
// compiler's own and compiles everywhere, to plain code where the machine has no vectors.
#pragma once

#include <cstring>

#include "core/raster/color.h"

using Lanes8 = U16 __attribute__((vector_size(16)));

inline Lanes8 LoadPair(const RGBI* p)
{
    Lanes8 v;
    std::memcpy(&v, p, sizeof v);
    return v;
}

inline void StorePair(RGBI* p, Lanes8 v)
{
    std::memcpy(static_cast<void*>(p), &v, sizeof v);
}

// BlendLanes on both pixels: no product leaves its 16 bits, because 255 * 256 fits.
inline Lanes8 BlendPair(Lanes8 dst, Lanes8 src)
{
    Lanes8 alpha = __builtin_shufflevector(src, src, 3, 3, 3, 3, 7, 7, 7, 7);
    return (dst * (256 - alpha) >> 8) + src;
}
