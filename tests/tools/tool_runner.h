// Runs the built program in a folder of its own.
#pragma once

#include "tests/support/movie_writer.h"
#include "tests/support/picture.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

struct Outcome {
    int code = -1; // exit code; -1 when a signal ended it
    std::string out;
    std::string err;
};

class ToolTest : public testing::Test {
protected:
    ToolTest();
    ~ToolTest() override;

    // Runs vexel with these words in the folder; `input` is its standard input.
    Outcome Run(const std::vector<std::string>& words, const std::vector<U8>& input = {}) const;
    // Runs a line of shell in the folder with $vexel set.
    Outcome RunShell(const std::string& line) const;

    void Write(const std::string& name, const std::vector<U8>& bytes) const;
    std::string Read(const std::string& name) const;
    Picture Load(const std::string& name) const;
    std::string PathOf(const std::string& name) const { return folder + "/" + name; }
    bool Exists(const std::string& name) const;
    // The names in the folder, sorted.
    std::vector<std::string> Files() const;

    std::string folder;
};

// 60 x 40 pixels, 10 frames a second, white: a red square of 10 pixels that begins in the corner
// and goes 4 to the right with every frame.
std::vector<U8> StripMovie(int frames);
