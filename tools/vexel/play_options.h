// What the commands that play a movie have in common.
#pragma once

#include "tools/vexel/arguments.h"
#include "tools/vexel/input_events.h"

#include <string>

struct PlayOptions {
    // The options, for the list of a command.
    static constexpr OptionForm kSize = {"--size", true};
    static constexpr OptionForm kInput = {"--input", true};
    static constexpr OptionForm kAllowNet = {"--allow-net", false};
    static constexpr OptionForm kAllowDir = {"--allow-dir", true};
    static constexpr OptionForm kTrace = {"--trace", false};

    std::string movie;
    int width = 0; // pixels; 0 x 0 is the movie's own size
    int height = 0;
    InputEvents input;
    bool allowNet = false;
    std::string allowDir; // empty: none
    bool trace = false;

    // What is wrong with the values, or nothing.
    std::string ParsePlay(const Arguments& args);
    // Reads the events and looks at the folder. The exit code, after complaining when it is not 0.
    int Prepare();

private:
    std::string inputFile; // empty: none
};

// Two numbers from 1 to `high` with a mark between them.
bool ParsePair(const std::string& text, char mark, int high, int* a, int* b);
