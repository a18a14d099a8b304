// The movie that defines the built-in fonts, for shells that hand it to the core.
#pragma once

#include <cstddef>

// Three fonts, "_sans", "_serif" and "_typewriter", characters 1 to 3, with the printable codes of
// Latin-1. The bytes are in the program and stay; null and a size of 0 when it was built without.
const unsigned char* BuiltInFonts(size_t* size);
