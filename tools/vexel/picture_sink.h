// Where the pictures of a movie and its sound go: one interface for every format, so that one loop
// serves all.
#pragma once

#include "core/raster/bit_buffer.h"
#include "tools/vexel/message.h"

#include <memory>
#include <string>

class OutputName;

// What all pictures of an output have in common.
struct PictureForm {
    S32 width;           // pixels
    S32 height;          // pixels
    S32 delay;           // milliseconds that a picture shows
    bool alpha;          // what lies behind the movie is transparent
    S64 soundFrames = 0; // how long the sound is, at 44100 Hz
    int sound = -1;      // for video: a descriptor at the start of a WAV file; -1: no sound
};

// Begin, then Add for each picture (of a sink for sound AddSound, as it is mixed), then Finish.
// Each returns false on failure, with `fault` set; nothing may follow then but the end of the sink.
// A sink that ends without a good Finish leaves no file of its own behind.
class PictureSink {
public:
    PictureSink() = default;
    virtual ~PictureSink() = default;
    PictureSink(const PictureSink&) = delete;
    PictureSink& operator=(const PictureSink&) = delete;

    virtual bool Begin(const PictureForm& form) = 0;
    virtual bool Add(const CBitBuffer& picture, int number) = 0;
    // Frames of two samples, 44100 a second.
    virtual bool AddSound(const S16*, S32) { return true; }
    virtual bool Finish() = 0;

    struct {
        std::string file; // what the complaint is about
        std::string what;
        int code = kExitFailed;
    } fault;

protected:
    bool Fail(const std::string& file, const std::string& what, int code = kExitFailed)
    {
        fault = {file, what, code};
        return false;
    }
};

using SinkMaker = std::unique_ptr<PictureSink> (*)(const OutputName& output);

// A file a picture; every other sink writes one file.
std::unique_ptr<PictureSink> MakePngSink(const OutputName& output);
std::unique_ptr<PictureSink> MakeGifSink(const OutputName& output);
std::unique_ptr<PictureSink> MakeApngSink(const OutputName& output);
std::unique_ptr<PictureSink> MakeY4mSink(const OutputName& output);
std::unique_ptr<PictureSink> MakeRawSink(const OutputName& output);
std::unique_ptr<PictureSink> MakeMp4Sink(const OutputName& output);
std::unique_ptr<PictureSink> MakeWebmSink(const OutputName& output);
std::unique_ptr<PictureSink> MakeMkvSink(const OutputName& output);
// Sound alone: it asks for no pictures.
std::unique_ptr<PictureSink> MakeWavSink(const OutputName& output);
// The same to a descriptor, which stays open.
std::unique_ptr<PictureSink> MakeWavSpool(int descriptor);
