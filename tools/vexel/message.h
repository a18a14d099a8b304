// What the program says on stderr, and what it returns.
#pragma once

#include <string>

enum ExitCode : int {
    kExitDone = 0,
    kExitFailed = 1,     // failed while running: cannot write, or data is missing
    kExitUsage = 2,      // the command line is wrong
    kExitUnreadable = 3, // not a movie, or it cannot be read
    kExitLimit = 5,      // a limit stopped it
};

// printf into a string.
[[gnu::format(printf, 1, 2)]] std::string Format(const char* format, ...);

// One line on stderr, "vexel: SUBJECT: what", control characters shown as '?'.
void Complain(const std::string& subject, const std::string& what);

// The same for a wrong command line, with a hint at the help. Returns kExitUsage.
int ComplainUsage(const std::string& what);
