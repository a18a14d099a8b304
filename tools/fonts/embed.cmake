# Writes a movie's bytes as a source file: cmake -DMOVIE=IN -DSOURCE=OUT -P embed.cmake
file(READ ${MOVIE} bytes HEX)
string(REGEX REPLACE "(..)" "0x\\1," bytes "${bytes}")
string(REPEAT "....." 18 row)
string(REGEX REPLACE "(${row})" "\\1\n" bytes "${bytes}")
file(WRITE ${SOURCE} "// Made from ${MOVIE}; do not edit.
#include \"tools/fonts/built_in_fonts.h\"

static const unsigned char movie[] = {
${bytes}
};

const unsigned char* BuiltInFonts(size_t* size)
{
    *size = sizeof(movie);
    return movie;
}
")
