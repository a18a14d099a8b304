// Video, encoded by the program ffmpeg when there is one: it gets R, G, B, A through a pipe, and
// the sound as a WAV file that is there already.
#include "tools/vexel/child_process.h"
#include "tools/vexel/output_file.h"
#include "tools/vexel/picture_sink.h"
#include "tools/vexel/pixel_bytes.h"

#include <cerrno>
#include <cstring>
#include <unistd.h>
#include <utility>

namespace {

using Words = std::vector<std::string>;

struct VideoForm {
    const char* muxer;
    bool evenSides; // colours are kept for blocks of 2x2 pixels
    Words (*encoder)(bool alpha, bool seekable);
    Words sound; // how that is encoded
};

void Append(Words* words, const Words& more)
{
    words->insert(words->end(), more.begin(), more.end());
}

// BT.709 in its limited range, and a note that says so.
Words ColorWords(const std::string& pixelFormat)
{
    return {"-vf",
            "scale=out_color_matrix=bt709:out_range=tv,format=" + pixelFormat,
            "-colorspace",
            "bt709",
            "-color_primaries",
            "bt709",
            "-color_trc",
            "bt709",
            "-color_range",
            "tv"};
}

// Plays everywhere. The index comes first; where there is no going back, it comes in pieces.
Words Mp4Encoder(bool, bool seekable)
{
    Words words = {"-c:v", "libx264", "-preset", "medium", "-crf", "18", "-movflags"};
    words.push_back(seekable ? "+faststart" : "+frag_keyframe+empty_moov");
    Append(&words, ColorWords("yuv420p"));
    return words;
}

Words WebmEncoder(bool alpha, bool)
{
    Words words = {"-c:v",    "libvpx-vp9", "-crf",      "24",   "-b:v",      "0",
                   "-row-mt", "1",          "-deadline", "good", "-cpu-used", "4"};
    Append(&words, ColorWords(alpha ? "yuva420p" : "yuv420p"));
    return words;
}

// Without loss.
Words MkvEncoder(bool alpha, bool)
{
    return {"-c:v", "ffv1", "-level", "3", "-g", "24", "-pix_fmt", alpha ? "bgra" : "bgr0"};
}

const VideoForm kMp4 = {"mp4", true, Mp4Encoder, {"-c:a", "aac", "-b:a", "192k"}};
const VideoForm kWebm = {"webm", true, WebmEncoder, {"-c:a", "libopus", "-b:a", "160k"}};
const VideoForm kMkv = {"matroska", false, MkvEncoder, {"-c:a", "flac"}};

class FfmpegSink : public PictureSink {
public:
    FfmpegSink(const OutputName& name, const VideoForm& form) : path(name.For(0)), video(form) {}
    ~FfmpegSink() override;

    bool Begin(const PictureForm& form) override;
    bool Add(const CBitBuffer& picture, int) override;
    bool Finish() override;

private:
    Words CommandLine(const PictureForm& form) const;
    bool OpenOutput();
    int StartEncoder(const PictureForm& form);
    bool FailEncoding(const std::string& said);

    std::string path;
    const VideoForm& video;
    OutputPlace place;
    ChildProcess child;
    int stream = -1;     // where the encoder writes to, unless it makes a part of the file
    bool making = false; // there may be such a part
    S32 width = 0;       // as the encoder gets them
    S32 height = 0;
    std::vector<U8> row;
};

FfmpegSink::~FfmpegSink()
{
    if (!making)
        return;
    child.Kill();
    place.Drop();
}

// The name follows "file:", so that none is taken for an option or an address.
Words FfmpegSink::CommandLine(const PictureForm& form) const
{
    Words words = {"ffmpeg",
                   "-hide_banner",
                   "-nostdin",
                   "-loglevel",
                   "error",
                   "-y",
                   "-f",
                   "rawvideo",
                   "-pixel_format",
                   "rgba",
                   "-video_size",
                   Format("%dx%d", width, height),
                   "-framerate",
                   Format("1000/%d", form.delay),
                   "-i",
                   "pipe:0"};
    if (form.sound >= 0) {
        Append(&words, {"-f", "wav", "-i", "pipe:3"});
        Append(&words, video.sound);
    }
    Append(&words, video.encoder(form.alpha, stream < 0));
    Append(&words, {"-f", video.muxer, stream < 0 ? "file:" + place.part : "pipe:1"});
    return words;
}

bool FfmpegSink::Begin(const PictureForm& form)
{
    width = video.evenSides ? (form.width + 1) & ~1 : form.width;
    height = video.evenSides ? (form.height + 1) & ~1 : form.height;
    row.resize(static_cast<size_t>(width) * 4);
    making = true;
    if (!OpenOutput())
        return Fail(path, Format("cannot write: %s", std::strerror(errno)));
    const int error = StartEncoder(form);
    if (error == ENOENT)
        return Fail(path, "writing it takes ffmpeg, which is not on the PATH");
    return error == 0 || Fail(path, Format("cannot start ffmpeg: %s", std::strerror(error)));
}

// What we cannot write ourselves the encoder need not try. Pipes and devices it gets open: their
// names can mean something else to it, and a pipe that closes is at its end.
bool FfmpegSink::OpenOutput()
{
    stream = STDOUT_FILENO;
    if (path == "-")
        return true;
    place = OutputPlace(path);
    stream = place.Open();
    if (stream < 0 || !place.Beside())
        return stream >= 0;
    return close(std::exchange(stream, -1)) == 0;
}

int FfmpegSink::StartEncoder(const PictureForm& form)
{
    const int error = child.Start(CommandLine(form), stream, form.sound);
    if (stream > STDOUT_FILENO)
        close(stream);
    return error;
}

bool FfmpegSink::FailEncoding(const std::string& said)
{
    return Fail(path, "ffmpeg: " + (said.empty() ? "it stopped reading" : said));
}

// The last column and row are doubled where sides must be even.
bool FfmpegSink::Add(const CBitBuffer& picture, int)
{
    for (S32 y = 0; y < height; y++) {
        const S32 from = y < picture.Height() ? y : y - 1;
        U8* end = PutRgba(picture.Row32(from), picture.Width(), row.data());
        if (picture.Width() < width)
            std::memcpy(end, end - 4, 4);
        if (!child.Write(row))
            return FailEncoding(child.Wait());
    }
    return true;
}

bool FfmpegSink::Finish()
{
    const std::string said = child.Wait();
    if (!said.empty())
        return FailEncoding(said);
    making = false;
    return place.Keep() || Fail(path, Format("cannot write: %s", std::strerror(errno)));
}

} // namespace

std::unique_ptr<PictureSink> MakeMp4Sink(const OutputName& output)
{
    return std::make_unique<FfmpegSink>(output, kMp4);
}

std::unique_ptr<PictureSink> MakeWebmSink(const OutputName& output)
{
    return std::make_unique<FfmpegSink>(output, kWebm);
}

std::unique_ptr<PictureSink> MakeMkvSink(const OutputName& output)
{
    return std::make_unique<FfmpegSink>(output, kMkv);
}
