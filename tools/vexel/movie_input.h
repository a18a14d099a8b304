// The bytes of a movie as they arrive, from a file or from standard input.
#pragma once

#include "core/geom/types.h"
#include "core/stream/script_player.h"

#include <cstdio>
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
    // Makes sure that it can be read again, and in blocks of the same size each time: what comes
    // through a pipe is read to the movie's end into a file without a name. The exit code, after
    // complaining when it is not 0.
    int MakeRepeatable();
    // Back to the beginning of what can be read again.
    void Rewind();
    // The next block as soon as there is one; 0 at the end, -1 after complaining about a failure.
    S64 Read(U8* buffer, size_t size);

    // Read has something to say without waiting.
    bool HasMore() const;

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
    int CopyTo(std::FILE* copy);

    std::string name;
    int fd = -1;
    S64 size = -1;
    S64 start = 0; // where in the file it begins
    bool ended = false;
};
