// `vexel render`: pictures of a movie, each written as soon as its data is there.
#include "platform/headless/native_player.h"
#include "tools/vexel/commands.h"
#include "tools/vexel/message.h"
#include "tools/vexel/movie_input.h"
#include "tools/vexel/progress.h"
#include "tools/vexel/render_options.h"

#include <csignal>
#include <new>

namespace {

class Renderer {
public:
    explicit Renderer(const RenderOptions& renderOptions);
    // The exit code, after complaining when it is not 0.
    int Run();

private:
    bool FeedBlock();
    void FeedAll();
    bool Reach(int picture);
    bool PassHolds(int picture);
    bool IsLast(int picture);
    int CheckArea();
    int Begin();
    int WritePicture(int picture);
    int FailWriting();
    int Finish();
    int Missing(int picture);

    const RenderOptions& options;
    MovieInput input;
    NativePlayerWnd player;
    int failure = kExitDone; // of the input
    S32 framesOfWhole = -1;  // once all is there
    std::unique_ptr<PictureSink> sink;
    int last = 0; // picture, unless there is to be one pass
    Progress progress;
    U8 block[64 * 1024];
};

Renderer::Renderer(const RenderOptions& renderOptions)
    : options(renderOptions), player(renderOptions.width, renderOptions.height),
      sink(renderOptions.format->make(renderOptions.output)),
      progress(renderOptions.progress,
               renderOptions.output.Numbered() || renderOptions.format->several)
{
    player.SetQuality(options.quality);
    player.SetScreenFormat(options.Screen());
    if (options.setBackground)
        player.OverrideBackground(options.background);
}

// False at the end of the input and on a failure.
bool Renderer::FeedBlock()
{
    if (input.Ended() || failure != kExitDone)
        return false;
    const S64 n = input.Read(block, sizeof block);
    if (n < 0) {
        failure = kExitUnreadable;
        return false;
    }
    if (n == 0)
        player.EndOfData();
    player.Feed(block, static_cast<size_t>(n));
    failure = input.CheckMovie(player);
    return failure == kExitDone;
}

void Renderer::FeedAll()
{
    while (FeedBlock()) {
    }
}

// Brings the player from the picture before to this one, with as much data as that takes.
bool Renderer::Reach(int picture)
{
    if (picture == 1) {
        while (!player.Started() && FeedBlock()) {
        }
        return player.Started() && failure == kExitDone;
    }
    while (!player.CanTick() && FeedBlock()) {
    }
    if (!player.CanTick() || failure != kExitDone)
        return false;
    player.Tick();
    return true;
}

// One pass of the main timeline has that picture. Frames that are there are counted; how many a
// header promises is not relied on.
bool Renderer::PassHolds(int picture)
{
    while (!player.Complete() && player.numFramesComplete < picture - 1 && FeedBlock()) {
    }
    if (!player.Complete())
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
    const int code = CheckArea();
    if (code != kExitDone)
        return code;
    last = options.LastFor(player.frameDelay);
    const PictureForm form = {player.Width(), player.Height(), player.frameDelay,
                              options.Transparent()};
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
    if (!sink->Finish())
        return FailWriting();
    progress.End();
    if (input.Size() >= 0 && input.Size() < player.scriptLen)
        FeedAll();
    if (input.Ended() && !player.Complete())
        input.ComplainTruncated(player);
    return kExitDone;
}

int Renderer::Missing(int picture)
{
    progress.End();
    if (failure != kExitDone)
        return failure;
    if (!player.Complete())
        input.ComplainTruncated(player);
    else
        Complain(input.Name(), Format("there is no picture %d", picture));
    return kExitFailed;
}

int Renderer::Run()
{
    if (!input.Open(options.movie))
        return kExitUnreadable;
    for (int picture = 1;; picture++) {
        if (!Reach(picture))
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

} // namespace

int RenderCommand(std::span<char* const> words)
{
    RenderOptions options;
    if (!options.Parse(words))
        return kExitUsage;
    // A reader of our output that goes away shows as a failed write.
    std::signal(SIGPIPE, SIG_IGN);
    try {
        const auto renderer = std::make_unique<Renderer>(options);
        return renderer->Run();
    } catch (const std::bad_alloc&) {
        Complain(options.movie, "no memory for its pictures");
        return kExitLimit;
    }
}
