#include "tools/vexel/commands.h"
#include "tools/vexel/message.h"

#include <cstdio>
#include <string>

namespace {

constexpr char kHelp[] =
    "usage: vexel render MOVIE -o OUT [options]    pictures or sound of a movie\n"
    "       vexel state MOVIE [options]            what the player holds at a picture\n"
    "       vexel info MOVIE [--json]              header, tags, labels, characters, sounds\n"
    "       vexel dump MOVIE                       every tag and action, one a line\n"
    "       vexel --help | --version\n"
    "\n"
    "MOVIE is a file, or - for standard input.\n"
    "\n"
    "render:\n"
    "  -o OUT                       .png, NAME%04d.png for a sequence, .gif .apng .y4m .rgba, "
    ".mp4\n"
    "                               .webm .mkv (through ffmpeg), .wav, or - for standard output\n"
    "  --format NAME                png, gif, apng, ...: whatever the name of OUT\n"
    "  --frame N                    picture N, counted from 1\n"
    "  --frames A-B                 pictures A to B\n"
    "  --duration S                 the first S seconds\n"
    "                               (none of these: picture 1 as PNG, otherwise one pass of the\n"
    "                               main timeline)\n"
    "  --quality low|high|best      (default: high)\n"
    "  --background COLOR           #RRGGBB or transparent (default: the movie's own)\n"
    "  --progress                   count the pictures on stderr\n"
    "\n"
    "state:\n"
    "  --frame N                    at picture N (default: 1)\n"
    "  --json                       one JSON object\n"
    "\n"
    "render and state:\n"
    "  --size WxH                   pixels (default: the movie's own)\n"
    "  --input EVENTS               a file with an event a line, done to the movie at picture N:\n"
    "                               N move|down|up X Y, N key CODE [shift] [ctrl] [alt],\n"
    "                               N text STRING\n"
    "  --allow-net                  the movie may read from the network, and send what it reads\n"
    "  --allow-dir DIR              it may read files in DIR too\n"
    "  --trace                      each action on stderr, as it is executed\n"
    "\n"
    "exit codes: 0 done, 1 failed while running, 2 wrong command line, 3 not a movie or\n"
    "unreadable, 5 stopped by a limit\n";

struct Command {
    const char* name;
    int (*run)(std::span<char* const> words);
};

constexpr Command kCommands[] = {
    {"render", RenderCommand},
    {"state", StateCommand},
    {"info", InfoCommand},
    {"dump", DumpCommand},
};

int Run(std::span<char* const> words)
{
    if (words.empty())
        return ComplainUsage("a command is missing");
    const std::string first = words[0];
    if (first == "--help" || first == "-h" || first == "help") {
        std::fputs(kHelp, stdout);
        return kExitDone;
    }
    if (first == "--version") {
        std::puts("vexel " VEXEL_VERSION);
        return kExitDone;
    }
    for (const Command& command : kCommands) {
        if (first == command.name)
            return command.run(words.subspan(1));
    }
    return ComplainUsage("unknown command " + first);
}

} // namespace

int main(int argc, char** argv)
{
    const std::span<char* const> words(argv, static_cast<size_t>(argc));
    const int code = Run(argc > 0 ? words.subspan(1) : words);
    if (std::fflush(stdout) != 0 || std::ferror(stdout)) {
        Complain("standard output", "cannot write");
        return code == kExitDone ? kExitFailed : code;
    }
    return code;
}
