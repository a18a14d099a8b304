// A movie that is read whole and not played: for the commands that look at its bytes.
#pragma once

#include "core/stream/script_player.h"
#include "tools/vexel/movie_input.h"

class MovieFile {
public:
    // Reads everything. The exit code, after complaining when it is not 0; an input that ends
    // early is no failure.
    int Load(const std::string& name);

    bool Truncated() const { return !movie.Complete(); }

    MovieInput input;
    ScriptPlayer movie;
};
