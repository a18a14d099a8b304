// The bytes of a movie as they arrive, from a file or from standard input.
#pragma once

#include "core/geom/types.h"
#include "core/stream/script_player.h"

#include <string>

// Complaints about the movie are made here, under the name it was given on the command line.
class MovieInput {
public:
    MovieInput() = default;
    ~MovieInput();
    MovieInput(const MovieInput&) = delete;
    MovieInput& operator=(const MovieInput&) = delete;

    // "-" is standard input. False after complaining.
    bool Open(const std::string& name);
    // The next block as soon as there is one; 0 at the end, -1 after complaining about a failure.
    S64 Read(U8* buffer, size_t size);

    const std::string& Name() const { return name; }
    bool Ended() const { return ended; }
    // Bytes of the whole input; -1 when that is known at its end only.
    S64 Size() const { return size; }

    // Complains about what makes `movie` unplayable, if anything does, and returns the exit code
    // for it; kExitDone otherwise. A header that is not all there counts once the input has ended.
    int CheckMovie(const ScriptPlayer& movie) const;
    // Says how far a movie got whose input ended early.
    void ComplainTruncated(const ScriptPlayer& movie) const;

private:
    std::string name;
    int fd = -1;
    S64 size = -1;
    bool ended = false;
};
