// `vexel render`: pictures of a movie, each written as soon as its data is there, and its sound.
#include "tools/vexel/commands.h"
#include "tools/vexel/movie_run.h"
#include "tools/vexel/progress.h"
#include "tools/vexel/render_options.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <new>
#include <unistd.h>
#include <utility>

namespace {

// Frames of sound in so many milliseconds, rounded down.
S64 SoundFrames(S64 milliseconds)
{
    return milliseconds * 441 / 10;
}

// One playing of the movie from its beginning into a sink.
class Renderer {
public:
    Renderer(const RenderOptions& renderOptions, MovieInput* movie,
             std::unique_ptr<PictureSink> pictureSink);
    // Plays for the sound alone, and leaves it to a second playing to say how the movie ends.
    void Rehearse();
    // The sound that goes with the pictures, as a WAV file of the rehearsal.
    void AddSoundTrack(int descriptor) { soundTrack = descriptor; }
    // The exit code, after complaining when it is not 0.
    int Run();
    // Some sound was started.
    bool Heard() const { return heard; }

private:
    static void TakeSound(void* renderer, const S16* samples, S32 frames);
    bool WantsSound() const { return options.format->sound != SoundUse::kNone; }
    bool WantsPictures() const { return options.format->sound != SoundUse::kAlone && !rehearsal; }
    void Listen();
    void SetSoundSpan();
    int PlayOut();
    bool PassHolds(int picture);
    bool IsLast(int picture);
    int CheckArea();
    int Begin();
    int WritePicture(int picture);
    int FailWriting();
    int Finish();
    int Missing(int picture);

    const RenderOptions& options;
    MovieInput& input;
    MovieRun run;
    NativePlayerWnd& player;
    NativeSoundMix& mixer;
    S32 framesOfWhole = -1; // once all is there
    std::unique_ptr<PictureSink> sink;
    int last = 0; // picture, unless there is to be one pass
    bool rehearsal = false;
    int soundTrack = -1;
    S64 mixed = 0; // frames of sound so far; what lies from soundStart to soundEnd is written
    S64 soundStart = 0;
    S64 soundEnd = 0;
    bool soundWritten = true; // no failure so far
    bool heard = false;
    Progress progress;
};

Renderer::Renderer(const RenderOptions& renderOptions, MovieInput* movie,
                   std::unique_ptr<PictureSink> pictureSink)
    : options(renderOptions), input(*movie), run(renderOptions, movie), player(run.player),
      mixer(run.mixer), sink(std::move(pictureSink)),
      progress(renderOptions.progress,
               renderOptions.output.Numbered() || renderOptions.format->several)
{
    player.SetQuality(options.quality);
    player.SetScreenFormat(options.Screen());
    if (options.setBackground)
        player.OverrideBackground(options.background);
}

void Renderer::Rehearse()
{
    rehearsal = true;
    player.tracer = {};
}

// A pointer finds only what is there to be seen.
void Renderer::Listen()
{
    if (WantsPictures())
        return;
    if (options.input.All().empty())
        player.StopPainting();
    mixer.Listen(TakeSound, this);
}

// Of a buffer that reaches beyond the span the part inside is written.
void Renderer::TakeSound(void* renderer, const S16* samples, S32 frames)
{
    Renderer* self = static_cast<Renderer*>(renderer);
    const S64 from = std::max(self->soundStart - self->mixed, S64(0));
    const S64 to = std::min(self->soundEnd - self->mixed, S64(frames));
    self->mixed += frames;
    self->heard |= self->mixer.IsDeviceOpen();
    if (from < to && self->soundWritten)
        self->soundWritten = self->sink->AddSound(samples + 2 * from, static_cast<S32>(to - from));
}

// From the first picture to the end of the last, or of the duration that was asked for.
void Renderer::SetSoundSpan()
{
    const S64 delay = player.frameDelay;
    soundStart = SoundFrames((options.first - 1) * delay);
    soundEnd = SoundFrames(options.duration > 0 ? options.duration : last * delay);
}

// The sound goes on for as long as the last picture shows.
int Renderer::PlayOut()
{
    if (WantsPictures())
        return kExitDone;
    constexpr S64 kBuffer = 46440; // microseconds
    while (soundWritten && mixed < soundEnd) {
        AdvanceHeadlessClock(kBuffer);
        mixer.Pump();
    }
    return soundWritten ? kExitDone : FailWriting();
}

// One pass of the main timeline has that picture. Frames that are there are counted; how many a
// header promises is not relied on. A movie that went before it was there has no more of them.
bool Renderer::PassHolds(int picture)
{
    while (!player.Complete() && player.numFramesComplete < picture - 1 && run.FeedBlock()) {
    }
    if (framesOfWhole < 0 && run.Gone())
        return false;
    if (framesOfWhole < 0 && !player.Complete())
        return true;
    if (framesOfWhole < 0)
        framesOfWhole = player.CountFrames();
    return picture <= framesOfWhole;
}

bool Renderer::IsLast(int picture)
{
    return options.wholePass ? !PassHolds(picture + 1) : picture >= last;
}

int Renderer::CheckArea()
{
    const S32 w = player.Width();
    const S32 h = player.Height();
    if (w <= 0 || h <= 0) {
        Complain(input.Name(), "its area is empty: give a --size");
        return kExitFailed;
    }
    if (w > CBitBuffer::kMaxSide || h > CBitBuffer::kMaxSide) {
        Complain(input.Name(), Format("its area of %dx%d pixels is beyond the limit of %dx%d: "
                                      "give a --size",
                                      w, h, CBitBuffer::kMaxSide, CBitBuffer::kMaxSide));
        return kExitLimit;
    }
    return kExitDone;
}

// With the first picture at hand: what the movie says of itself is known.
int Renderer::Begin()
{
    const int code = WantsPictures() ? CheckArea() : kExitDone;
    if (code != kExitDone)
        return code;
    last = options.LastFor(player.frameDelay);
    if (WantsSound())
        run.FeedAll();
    if (WantsSound() && options.wholePass && (run.Failure() != kExitDone || !player.Complete()))
        return Missing(0);
    if (WantsSound() && options.wholePass)
        last = std::max(player.CountFrames(), 1);
    SetSoundSpan();
    const PictureForm form = {player.Width(),        player.Height(),       player.frameDelay,
                              options.Transparent(), soundEnd - soundStart, soundTrack};
    return sink->Begin(form) ? kExitDone : FailWriting();
}

int Renderer::FailWriting()
{
    progress.End();
    Complain(sink->fault.file, sink->fault.what);
    return sink->fault.code;
}

int Renderer::WritePicture(int picture)
{
    if (!WantsPictures())
        return kExitDone;
    const CBitBuffer* pixels = player.Picture();
    if (pixels == nullptr) {
        progress.End();
        Complain(input.Name(), Format("no memory for a picture of %dx%d pixels", player.Width(),
                                      player.Height()));
        return kExitLimit;
    }
    if (!sink->Add(*pixels, picture))
        return FailWriting();
    progress.Show("picture", picture);
    return kExitDone;
}

// Everything asked for is written; a file that is too short is worth a word all the same.
int Renderer::Finish()
{
    const int code = PlayOut();
    if (code != kExitDone || !sink->Finish())
        return code != kExitDone ? code : FailWriting();
    progress.End();
    if (rehearsal)
        return kExitDone;
    run.ComplainTruncated();
    return kExitDone;
}

int Renderer::Missing(int picture)
{
    progress.End();
    return soundWritten ? run.Missing(picture) : FailWriting();
}

int Renderer::Run()
{
    Listen();
    for (int picture = 1;; picture++) {
        if (!run.Reach(picture) || !soundWritten)
            return Missing(picture);
        int code = picture == 1 ? Begin() : kExitDone;
        if (code == kExitDone && picture >= options.first)
            code = WritePicture(picture);
        if (code != kExitDone)
            return code;
        if (IsLast(picture))
            return Finish();
    }
}

// The sound of a video comes first, from a playing of its own: an encoder that is fed both at a
// time can wait for the one while we write the other.
class SoundTrack {
public:
    SoundTrack() : file(std::tmpfile()) {}
    ~SoundTrack()
    {
        if (file != nullptr)
            std::fclose(file);
    }
    SoundTrack(const SoundTrack&) = delete;
    SoundTrack& operator=(const SoundTrack&) = delete;

    // The exit code, after complaining when it is not 0.
    int Make(const RenderOptions& options, MovieInput* input);
    // At its beginning; -1 when the movie is silent.
    int Descriptor() const { return heard ? fileno(file) : -1; }

private:
    std::FILE* file; // without a name; null: there is none to be had
    bool heard = false;
};

int SoundTrack::Make(const RenderOptions& options, MovieInput* input)
{
    if (file == nullptr) {
        Complain(options.movie,
                 Format("no temporary file for its sound: %s", std::strerror(errno)));
        return kExitFailed;
    }
    const auto renderer = std::make_unique<Renderer>(options, input, MakeWavSpool(fileno(file)));
    renderer->Rehearse();
    const int code = renderer->Run();
    heard = renderer->Heard();
    lseek(fileno(file), 0, SEEK_SET);
    input->Rewind();
    SetHeadlessClock(0);
    return code;
}

int Render(const RenderOptions& options)
{
    MovieInput input;
    if (!input.Open(options.movie))
        return kExitUnreadable;
    const SoundUse sound = options.format->sound;
    int code = sound != SoundUse::kNone ? input.MakeRepeatable() : kExitDone;
    SoundTrack track;
    if (code == kExitDone && sound == SoundUse::kBeside)
        code = track.Make(options, &input);
    if (code != kExitDone)
        return code;
    const auto renderer =
        std::make_unique<Renderer>(options, &input, options.format->make(options.output));
    renderer->AddSoundTrack(track.Descriptor());
    return renderer->Run();
}

} // namespace

int RenderCommand(std::span<char* const> words)
{
    RenderOptions options;
    if (!options.Parse(words))
        return kExitUsage;
    const int code = options.Prepare();
    if (code != kExitDone)
        return code;
    // A reader of our output that goes away, or a file that may not grow, shows as a failed write.
    std::signal(SIGPIPE, SIG_IGN);
    std::signal(SIGXFSZ, SIG_IGN);
    try {
        return Render(options);
    } catch (const std::bad_alloc&) {
        Complain(options.movie, "no memory for its pictures");
        return kExitLimit;
    }
}
