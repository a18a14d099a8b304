// The commands of the program. Each takes the words after its name and returns an exit code.
#pragma once

#include <span>

int RenderCommand(std::span<char* const> words);
int StateCommand(std::span<char* const> words);
int InfoCommand(std::span<char* const> words);
int DumpCommand(std::span<char* const> words);
