#include "tools/vexel/tidy_up.h"

#include <csignal>
#include <cstring>
#include <limits.h>
#include <unistd.h>

namespace {

// Read by a signal handler: plain memory, valid whenever `armed` says so.
char doomedFile[PATH_MAX];
volatile std::sig_atomic_t armed = 0;
volatile std::sig_atomic_t doomedProcess = 0;

void TidyUp(int signal)
{
    if (doomedProcess > 0)
        kill(doomedProcess, SIGKILL);
    if (armed)
        unlink(doomedFile);
    raise(signal); // the handler is gone by now, so that this ends the program
}

// A signal that the caller has told us to ignore stays ignored.
void Watch(int signal)
{
    struct sigaction action = {};
    if (sigaction(signal, nullptr, &action) != 0 || action.sa_handler != SIG_DFL)
        return;
    action.sa_handler = TidyUp;
    action.sa_flags = SA_RESETHAND;
    sigaction(signal, &action, nullptr);
}

} // namespace

void SetDoomedFile(const std::string& path)
{
    armed = 0;
    if (path.empty() || path.size() >= sizeof doomedFile)
        return;
    std::memcpy(doomedFile, path.c_str(), path.size() + 1);
    armed = 1;
    for (const int signal : {SIGINT, SIGTERM, SIGHUP, SIGQUIT})
        Watch(signal);
}

void SetDoomedProcess(int id)
{
    doomedProcess = id;
}
