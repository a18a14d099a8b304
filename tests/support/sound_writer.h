#pragma once

#include "tests/support/movie_writer.h"

// 16-bit samples as PCM data, and the shortest ADPCM data: its first sample alone.
std::vector<U8> Pcm(const std::vector<S16>& samples);
std::vector<U8> Adpcm(S16 first);
// Sound tags. Formats are the player's format bytes: 14 is 16-bit mono at 44100 Hz, + 16 ADPCM.
TagWriter& DefineSound(TagWriter& tags, U16 id, U8 format, U32 count, const std::vector<U8>& data);
TagWriter& StreamHead(TagWriter& tags, U8 format, U16 samplesPerFrame, U16 leadIn = 0);

// A movie of 10 frames a second with a stream, from words: "/" ends a frame, "." the movie; a
// number is a block that begins with that sample; "d3,50" defines sound 3 as that one sample,
// "s3,0" starts it, "s3,32" stops it, "f3" frees it; "m9,-5" is an MPEG block with that count and
// seek.
std::vector<U8> SoundMovie(const std::string& words, U16 samplesPerFrame, U8 format = 14);
