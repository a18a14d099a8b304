// Text between the host, which writes UTF-8, and movies, which know Latin-1.
#pragma once

#include <string>
#include <string_view>

// One byte a character, "?" for those that Latin-1 has not. Bytes that are no UTF-8 stay as they
// are, so that a text in Latin-1 comes through.
std::string Latin1FromUtf8(std::string_view text);
