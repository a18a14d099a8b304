#include "tools/vexel/child_process.h"

#include "tools/vexel/message.h"
#include "tools/vexel/output_file.h"
#include "tools/vexel/tidy_up.h"

#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

extern char** environ;

namespace {

// The signals that we ignore the child gets back.
int Spawn(const std::vector<std::string>& words, int input, int messages, int output, int extra,
          pid_t* id)
{
    std::vector<char*> arguments;
    for (const std::string& word : words)
        arguments.push_back(const_cast<char*>(word.c_str()));
    arguments.push_back(nullptr);
    posix_spawn_file_actions_t files;
    posix_spawn_file_actions_init(&files);
    posix_spawn_file_actions_adddup2(&files, input, STDIN_FILENO);
    posix_spawn_file_actions_adddup2(&files, messages, STDERR_FILENO);
    if (output >= 0)
        posix_spawn_file_actions_adddup2(&files, output, STDOUT_FILENO);
    else
        posix_spawn_file_actions_addopen(&files, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
    // Last, since any of the others may be the third. The same number on both sides stays open.
    if (extra >= 0)
        posix_spawn_file_actions_adddup2(&files, extra, 3);
    posix_spawnattr_t how;
    posix_spawnattr_init(&how);
    sigset_t usual;
    sigemptyset(&usual);
    sigaddset(&usual, SIGPIPE);
    sigaddset(&usual, SIGXFSZ);
    posix_spawnattr_setsigdefault(&how, &usual);
    posix_spawnattr_setflags(&how, POSIX_SPAWN_SETSIGDEF);
    const int error = posix_spawnp(id, arguments[0], &files, &how, arguments.data(), environ);
    posix_spawnattr_destroy(&how);
    posix_spawn_file_actions_destroy(&files);
    return error;
}

} // namespace

ChildProcess::~ChildProcess()
{
    Kill();
    if (said != nullptr)
        std::fclose(said);
}

void ChildProcess::Kill()
{
    if (id <= 0)
        return;
    kill(id, SIGKILL);
    Wait();
}

// While SIGCHLD is ignored, as a caller can have left it, nobody is told how a child ended.
int ChildProcess::Start(const std::vector<std::string>& words, int output, int extra)
{
    std::signal(SIGCHLD, SIG_DFL);
    int ends[2];
    said = std::tmpfile();
    if (said == nullptr || pipe2(ends, O_CLOEXEC) != 0)
        return errno;
    const int error = Spawn(words, ends[0], fileno(said), output, extra, &id);
    close(ends[0]);
    if (error != 0) {
        close(ends[1]);
        id = 0;
        return error;
    }
    input = ends[1];
    SetDoomedProcess(id);
    return 0;
}

bool ChildProcess::Write(std::span<const U8> bytes)
{
    return WriteAll(input, bytes);
}

// Without the "[name @ address] " that says which part of the program speaks.
std::string ChildProcess::FirstLine()
{
    char text[400] = "";
    std::rewind(said);
    std::string line = std::fgets(text, sizeof text, said) != nullptr ? text : "";
    line = line.substr(0, line.find('\n'));
    const size_t bracket = line.compare(0, 1, "[") == 0 ? line.find("] ") : std::string::npos;
    return bracket == std::string::npos ? line : line.substr(bracket + 2);
}

std::string ChildProcess::Wait()
{
    int status = 0;
    close(input);
    while (waitpid(id, &status, 0) < 0 && errno == EINTR) {
    }
    id = 0;
    SetDoomedProcess(0);
    if (WIFEXITED(status) && WEXITSTATUS(status) == 0)
        return "";
    const std::string line = FirstLine();
    if (!line.empty())
        return line;
    return WIFSIGNALED(status) ? Format("it was ended by signal %d", WTERMSIG(status))
                               : Format("it failed with code %d", WEXITSTATUS(status));
}
