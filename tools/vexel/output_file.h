// Files that appear whole or not at all.
#pragma once

#include "core/geom/types.h"

#include <span>
#include <string>

// A name that may hold one %d or %0Nd for the number of a picture; %% stands for a percent sign.
class OutputName {
public:
    // False when the name holds more than one number.
    bool Parse(const std::string& text);

    bool Numbered() const { return numbered; }
    bool ToStdout() const { return !numbered && before == "-"; }
    std::string For(int number) const;
    // The extension in lower case with its dot; empty when there is none.
    std::string Extension() const;

private:
    std::string before;
    std::string after;
    int digits = 0;
    bool numbered = false;
};

// Writes all bytes to the file, or to standard output for "-". A regular file is written under
// another name first and then takes the place of the old one; a device or pipe is written to as it
// is. On failure nothing is left behind and false is returned with `error` set.
bool WriteWhole(const std::string& path, std::span<const U8> bytes, std::string* error);
