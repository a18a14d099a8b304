// Every limit that keeps a hostile movie from taking the machine, with its reason and what is seen
// when it strikes. A shell may lower them before it opens a movie. This header stands alone, so
// that the lower areas can read the table too.
#pragma once

#include "core/geom/types.h"

struct SLimits {
    // Declared movie length. A longer one is an out-of-memory error of the loader: nothing plays.
    U32 movieBytes = 256u << 20;
    // Bytes of all movies of the process, as declared. One that would exceed it does not play, as
    // if it were too long itself.
    U32 allMovieBytes = 512u << 20;
    // Pixels of a drawing surface. A larger one is not created.
    U32 surfacePixels = 64u << 20;
    // Pixels of one image, which take up to 4 bytes each. A larger one is not decoded: fills with
    // it show its fallback colour.
    U32 bitmapPixels = 64u << 20;
    // Decoded pixels of one movie, and of all movies of the process. When an image would exceed
    // either, its movie's unused pixels are dropped; then it is refused as if it were too large.
    U32 movieBitmapPixels = 64u << 20;
    U32 allBitmapPixels = 128u << 20;
    // Bytes that one JPEG image may take while it is decoded. An image in several scans, whose
    // coefficients are all kept until the last, may need more than that and is then not decoded.
    U32 jpegBytes = 192u << 20;
    // Pixels of a JPEG image times its scans: as many of the scans are decoded as this allows.
    U32 jpegScanPixels = 512u << 20;
    // Pixels of images that are decoded for one repaint or hit test. Further
    // ones are drawn like broken ones until their shape is built anew.
    U32 decodedPixels = 128u << 20;
    // Display objects inside one another. A deeper one is not placed.
    S32 nesting = 128;
    // Display objects alive in one display list. Further ones are not placed.
    U32 liveObjects = 65536;
    // Edges alive in one display list: all that is cached for drawing. Further ones are dropped.
    U32 liveEdges = 4u << 20;
    // Fill and line colours alive in one display list. A shape that needs more is not drawn.
    U32 liveColors = 1u << 18;
    // Built gradient ramps alive in one display list. A gradient without one shows what lies below
    // it.
    U32 liveRamps = 65536;
    // Records and styles that shapes may read for one repaint or hit test; where curves are cut and
    // halved, each piece counts too. A shape that comes later is not drawn this time.
    U32 shapeRecords = 8u << 20;
    // Records of one button. Further ones, and with them the actions of the older form of button,
    // are not there.
    U32 buttonRecords = 4096;
    // Characters of one movie. Further definitions are ignored.
    U32 characters = 65536;
    // Bytes of one script string; a longer one is cut.
    U32 stringBytes = 1u << 20;
    // Bytes of all names and values alive in the process, what the heap takes for them and for the
    // variables' records included. Further ones are null: unnamed, unset.
    U32 allStringBytes = 64u << 20;
    // Variables of one timeline. Further names are dropped.
    U32 variables = 16384;
    // Of these, names that share a place in the index, which only chosen ones do. Further ones are
    // dropped.
    U32 variablesAlike = 32;
    // Text fields alive in one display list, and the bytes of the longest texts that they have had.
    // Further fields show nothing, longer texts are cut.
    U32 textFields = 4096;
    U32 textFieldBytes = 4u << 20;
    // Bytes of a stream of variables; the rest is dropped.
    U32 variablesBytes = 4u << 20;
    // Tags that all timelines together execute in one tick, with whatever is charged like tags
    // (long names, crowded depths, searches for labels). Then every timeline waits, as if its data
    // ended there, and goes on from the same tag in the next tick.
    U32 tagsPerDraw = 4u << 20;
    // Tags of one frame that a timeline executes in one go; it goes on in the next tick. As much of
    // tagsPerDraw is kept for the oldest timeline, the player's own movie, whose turn comes last:
    // it gets ahead in every tick, whatever its sprites do.
    U32 tagsPerTimeline = 256u << 10;
    // Frames that one tick plays to catch up with a streaming sound, at least 1; the rest come in
    // the next.
    S32 framesPerTick = 256;
    // Levels and movies loaded beside the root.
    U32 loadedMovies = 256;
    // Sounds that play at once, of which the oldest 8 are heard. Further ones do not start.
    U32 soundChannels = 64;
    // Values on the stack of a player's scripts. One more counts as a script that ran away.
    U32 stackValues = 65536;
    // Records that the scripts of one player execute in one go (skipped ones count), and the work
    // that these may cause. A unit is what takes a slow machine no more than 100 ns: a record, a
    // tag, an object passed in a search, 32 bytes of text handled, 4 pixels decoded, 8 edges tried;
    // an object that is transformed is 4 to 8. Beyond either no script runs until the movie is
    // unloaded. When the frames of one tick have used up as much together, the rest of them wait.
    U32 actionsPerRun = 200000;
    U32 workPerRun = 1u << 25;
    // Streams that feed one player at once, and requests that it may make in a second. Further
    // requests are refused.
    U32 openStreams = 16;
    U32 requestsPerSecond = 64;
    // Bytes of the data of one POST request; a longer one is refused.
    U32 postBytes = 1u << 20;
};

// The table in force.
extern SLimits gLimits;
