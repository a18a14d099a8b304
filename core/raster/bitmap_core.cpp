#include "core/raster/bitmap_core.h"

#include <cstdlib>

void SBitmapCore::PIInit()
{
    baseAddr = nullptr;
    cTab = nullptr;
    useCount = 0;
    transparent = 0;
}

void SBitmapCore::PIFree()
{
    std::free(baseAddr);
    std::free(cTab);
    baseAddr = nullptr;
    cTab = nullptr;
}
