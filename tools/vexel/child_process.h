// Another program that is fed through a pipe.
#pragma once

#include "core/geom/types.h"

#include <cstdio>
#include <span>
#include <string>
#include <sys/types.h>
#include <vector>

// Started without a shell. What it says on stderr is kept in a file without a name, so that it
// never waits for us. A child that was not waited for is killed when the object ends.
class ChildProcess {
public:
    ChildProcess() = default;
    ~ChildProcess();
    ChildProcess(const ChildProcess&) = delete;
    ChildProcess& operator=(const ChildProcess&) = delete;

    // words[0] is looked for on the PATH. Its standard output is our descriptor `output`, or
    // nowhere for -1; its descriptor 3 is our `extra`, unless that is -1. 0, or the number of the
    // error.
    int Start(const std::vector<std::string>& words, int output, int extra = -1);
    // To its standard input. False once it has stopped reading.
    bool Write(std::span<const U8> bytes);
    // Ends its input and waits for it. Empty when it did well; otherwise the first line it said, or
    // how it ended.
    std::string Wait();
    // Ends it at once, if it is running.
    void Kill();

private:
    std::string FirstLine();

    pid_t id = 0; // 0: none is running
    int input = -1;
    std::FILE* said = nullptr;
};
