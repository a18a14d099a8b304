#include "tools/vexel/progress.h"

#include <cstdio>
#include <unistd.h>

Progress::Progress(bool wanted, bool several)
    : terminal(isatty(STDERR_FILENO)), shown(wanted || (several && terminal))
{
}

void Progress::Show(const char* what, int number)
{
    if (!shown)
        return;
    std::fprintf(stderr, terminal ? "\r%s %d" : "%s %d\n", what, number);
    lineOpen = terminal;
}

void Progress::End()
{
    if (lineOpen)
        std::fputc('\n', stderr);
    lineOpen = false;
}
