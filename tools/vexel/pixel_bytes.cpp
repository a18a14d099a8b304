#include "tools/vexel/pixel_bytes.h"

static U32 Divide(U32 channel, U32 alpha)
{
    const U32 value = (channel * 255 + alpha / 2) / alpha;
    return value > 255 ? 255 : value;
}

U32 StraightPixel(U32 pixel)
{
    const U32 alpha = pixel >> 24;
    if (alpha == 255)
        return pixel;
    if (alpha == 0)
        return 0;
    return alpha << 24 | Divide(pixel >> 16 & 255, alpha) << 16 |
           Divide(pixel >> 8 & 255, alpha) << 8 | Divide(pixel & 255, alpha);
}

U8* PutRgb(const U32* from, S32 n, U8* to)
{
    for (S32 i = 0; i < n; i++) {
        *to++ = static_cast<U8>(from[i] >> 16);
        *to++ = static_cast<U8>(from[i] >> 8);
        *to++ = static_cast<U8>(from[i]);
    }
    return to;
}

U8* PutRgba(const U32* from, S32 n, U8* to)
{
    for (S32 i = 0; i < n; i++) {
        const U32 pixel = StraightPixel(from[i]);
        to = PutRgb(&pixel, 1, to);
        *to++ = static_cast<U8>(pixel >> 24);
    }
    return to;
}
