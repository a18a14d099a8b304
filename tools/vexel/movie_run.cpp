#include "tools/vexel/movie_run.h"

#include "core/player/random.h"
#include "core/stream/movie_data.h"

#include <csignal>

// The same dice for every playing: the sound of a video comes from one of its own.
MovieRun::MovieRun(const PlayOptions& options, MovieInput* movie)
    : player(options.width, options.height), input(*movie), hand(options.input),
      readsAhead(movie->Size() >= 0)
{
    SeedRandom(1);
    player.PlayThrough(&mixer);
    if (options.movie != "-")
        player.SetMovieFile(options.movie);
    if (options.allowNet) {
        std::signal(SIGPIPE, SIG_IGN); // a server that hangs up is no reason to end
        player.AllowNet();
    }
    if (!options.allowDir.empty())
        player.AllowDir(options.allowDir);
    if (options.trace)
        trace.Watch(&player);
}

MovieRun::~MovieRun()
{
    if (own != nullptr)
        own->Release();
}

bool MovieRun::FeedBlock()
{
    if (input.Ended() || failure != kExitDone || Gone())
        return false;
    const S64 n = input.Read(block, sizeof block);
    if (n < 0) {
        failure = kExitUnreadable;
        return false;
    }
    if (n == 0)
        player.EndOfData();
    player.Feed(block, static_cast<size_t>(n));
    if (own == nullptr && player.sharedScript != nullptr) {
        own = player.sharedScript;
        own->AddRef();
    }
    if (!Gone())
        failure = input.CheckMovie(player);
    return failure == kExitDone;
}

// What follows the movie may have no end.
void MovieRun::FeedAll()
{
    while (!player.Complete() && FeedBlock()) {
    }
}

// How much of a file a script finds loaded must not depend on the pictures that are asked for, so
// it is read at once.
bool MovieRun::Start()
{
    while (!player.Started() && !Gone() && FeedBlock()) {
    }
    while (readsAhead && !player.Complete() && FeedBlock()) {
    }
    return (player.Started() || Gone()) && failure == kExitDone;
}

// A stream reads ahead of the picture: what it finds must not depend on how the data arrives. A
// movie that waits for itself to arrive gets what a pipe has to offer.
void MovieRun::FeedForTick()
{
    if (player.HasStream())
        FeedAll();
    while (!player.CanTick() && FeedBlock()) {
    }
    if (!player.Complete() && input.HasMore())
        FeedBlock();
}

bool MovieRun::Reach(int picture)
{
    trace.SetPicture(picture);
    if (picture == 1) {
        if (!Start())
            return false;
    } else {
        FeedForTick();
        if (failure != kExitDone || !player.CanTick())
            return false;
        player.Tick();
    }
    hand.Deliver(picture, &player);
    return true;
}

int MovieRun::Missing(int picture) const
{
    if (failure != kExitDone)
        return failure;
    if (!player.Complete())
        input.ComplainTruncated(player);
    else
        Complain(input.Name(), Format("there is no picture %d", picture));
    return kExitFailed;
}

void MovieRun::ComplainTruncated() const
{
    if (input.Ended() && !Gone() && !player.Complete())
        input.ComplainTruncated(player);
}
