#pragma once

#include "core/geom/types.h"

#include <string>
#include <vector>

// Action records from text, as tests and samples write them: "text" (\x41 is a byte) and numbers
// (32-bit floats) are pushed; a name is that record with its operands after it; "label:" is a place
// that Jump and If may name, or they take a number; <96 00> are bytes as they stand; # begins a
// comment, which ends with its line.
struct ScriptWord {
    char kind; // " text, < bytes in hexadecimal; anything else is a word
    std::string text;
};
using ScriptWords = std::vector<ScriptWord>;

ScriptWords SplitScript(const std::string& text);
// The records, without an end mark. A word that is no record's name ends the program.
std::vector<U8> AssembleScript(const ScriptWords& words);
inline std::vector<U8> AssembleScript(const std::string& text)
{
    return AssembleScript(SplitScript(text));
}
