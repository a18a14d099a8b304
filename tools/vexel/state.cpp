// `vexel state`: what the player holds at a picture.
#include "tools/vexel/commands.h"
#include "tools/vexel/movie_run.h"
#include "tools/vexel/player_state.h"

#include <cstdio>
#include <memory>
#include <new>

namespace {

struct StateOptions : PlayOptions {
    int picture = 1;
    bool json = false;

    // False after complaining about the command line.
    bool Parse(std::span<char* const> words);
};

bool StateOptions::Parse(std::span<char* const> words)
{
    constexpr OptionForm kOptions[] = {{"--frame", true}, {"--json", false}, kSize, kInput,
                                       kAllowNet,         kAllowDir,         kTrace};
    Arguments args;
    std::string fault;
    if (!args.Parse(words, kOptions))
        fault = args.error;
    else if (args.Rest().size() != 1)
        fault = "state takes one movie";
    else if (args.Has("--frame") && !ParseNumber(*args.Find("--frame"), 1, kLastPicture, &picture))
        fault = "--frame takes N, the number of a picture, counted from 1";
    else
        fault = ParsePlay(args);
    json = args.Has("--json");
    if (!fault.empty())
        ComplainUsage(fault);
    return fault.empty();
}

int ShowState(const StateOptions& options)
{
    MovieInput input;
    if (!input.Open(options.movie))
        return kExitUnreadable;
    const auto run = std::make_unique<MovieRun>(options, &input);
    run->ReadAhead();
    for (int picture = 1; picture <= options.picture; picture++) {
        if (!run->Reach(picture))
            return run->Missing(picture);
    }
    run->player.Picture(); // so that all is where it shows
    const std::string text = options.json ? StateJson(&run->player, options.picture) + '\n'
                                          : StateText(&run->player, options.picture);
    std::fwrite(text.data(), 1, text.size(), stdout);
    run->ComplainTruncated();
    return kExitDone;
}

} // namespace

int StateCommand(std::span<char* const> words)
{
    StateOptions options;
    if (!options.Parse(words))
        return kExitUsage;
    const int code = options.Prepare();
    if (code != kExitDone)
        return code;
    try {
        return ShowState(options);
    } catch (const std::bad_alloc&) {
        Complain(options.movie, "no memory for its state");
        return kExitLimit;
    }
}
