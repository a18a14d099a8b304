// Stands in for the movie where it could not be made.
#include "tools/fonts/built_in_fonts.h"

const unsigned char* BuiltInFonts(size_t* size)
{
    *size = 0;
    return nullptr;
}
