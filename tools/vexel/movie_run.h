// One playing of a movie from its beginning, whatever is made of it.
#pragma once

#include "platform/headless/headless_sound.h"
#include "platform/headless/native_player.h"
#include "tools/vexel/action_trace.h"
#include "tools/vexel/message.h"
#include "tools/vexel/movie_input.h"
#include "tools/vexel/play_options.h"

// Feeds the player with the movie and its input, picture by picture, and ticks it: what a picture
// shows and what the player holds then is the same for every command. The options and the input
// must outlive it.
class MovieRun {
public:
    MovieRun(const PlayOptions& options, MovieInput* movie);
    ~MovieRun();
    MovieRun(const MovieRun&) = delete;
    MovieRun& operator=(const MovieRun&) = delete;

    // Of a pipe, too, all is to be read before picture 2; otherwise only what a picture takes and
    // what has come.
    void ReadAhead() { readsAhead = true; }
    // Brings the player from the picture before to this one, counted from 1, with as much data as
    // that takes, and does to it what the events say of that picture. False when it cannot be had.
    bool Reach(int picture);
    // Says why Reach failed; the exit code.
    int Missing(int picture) const;
    // One block of data; false at the end of the input and on a failure.
    bool FeedBlock();
    void FeedAll();
    // The exit code of an input that cannot be read or is no movie.
    int Failure() const { return failure; }
    // The movie has unloaded itself, or another has taken its place: its data is not wanted any
    // more.
    bool Gone() const
    {
        return player.FedMovieLeft() || (own != nullptr && player.sharedScript != own);
    }
    // A movie that ended too early is worth a word, even when all could be had from it.
    void ComplainTruncated() const;

    NativeSoundMix mixer; // outlives the player
    NativePlayerWnd player;

private:
    bool Start();
    void FeedForTick();

    MovieInput& input;
    InputHand hand;
    ActionTrace trace;
    bool readsAhead; // so that the answers of scripts do not depend on when the data comes
    int failure = kExitDone;
    MovieData* own = nullptr; // counted: the bytes of the movie that is being fed
    U8 block[64 * 1024];
};
