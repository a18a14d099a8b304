#include "platform/headless/native_player.h"

#include "platform/headless/headless_sound.h"
#include "tools/fonts/built_in_fonts.h"

#include <cstdlib>
#include <cstring>

namespace {

S64 gClock = 0; // microseconds

constexpr size_t kLargestBlock = size_t(1) << 30;

// Twips to whole pixels toward zero; nothing below zero, and no wider than a picture could be asked
// for by number.
S32 PixelsOf(S32 low, S32 high)
{
    const S64 pixels = (static_cast<S64>(high) - low) / 20;
    return pixels < 0 ? 0 : static_cast<S32>(pixels);
}

} // namespace

S64 real_time_clock_usecs()
{
    return gClock;
}

void SetHeadlessClock(S64 usecs)
{
    gClock = usecs;
}

void AdvanceHeadlessClock(S64 usecs)
{
    gClock += usecs;
}

NativePlayerWnd::NativePlayerWnd(S32 pixelWidth, S32 pixelHeight)
    : width(pixelWidth < 0 ? 0 : pixelWidth), height(pixelHeight < 0 ? 0 : pixelHeight),
      ownSize(pixelWidth == 0 && pixelHeight == 0)
{
    RectSetEmpty(&blitted);
    RectSetEmpty(&invalidated);
}

NativePlayerWnd::~NativePlayerWnd()
{
    ClearScript();
    requests.Shutdown();
    StreamInDestroy(&fed);
}

void NativePlayerWnd::SetMovieFile(const std::string& path)
{
    movieURL = FileURL(path);
}

// The movie that is fed comes in like any first movie, but for its size: that is known here before
// its first frame is shown.
void NativePlayerWnd::StartFeeding()
{
    feeding = true;
    sizeReported = false;
    startedOnce = false;
    fedLeft = false;
    firstLoad = 1;
    requests.ForgetRoot();
    requests.policy.SetOrigin(movieURL);
    StreamInNew(&fed, movieURL.c_str(), nullptr);
    fed.reportSize = 0;
}

void NativePlayerWnd::Feed(const U8* data, size_t n)
{
    if (n > 0 && !feeding)
        StartFeeding();
    while (n > 0 && fed.player == this) {
        const size_t block = n < kLargestBlock ? n : kLargestBlock;
        PushDataBuf(data, static_cast<S32>(block));
        if (gotHeader && !sizeReported) {
            sizeReported = true;
            AdjustWindow(PixelsOf(frame.xmin, frame.xmax), PixelsOf(frame.ymin, frame.ymax));
        }
        PushDataComplete();
        fedLeft = fed.player != this; // by actions of its first frame, which has been
        startedOnce = startedOnce || Started() || fedLeft;
        data += block;
        n -= block;
    }
}

void NativePlayerWnd::EndOfData()
{
    feeding = false;
    StreamInDestroy(&fed);
}

void NativePlayerWnd::Deliver()
{
    requests.Deliver();
    startedOnce = startedOnce || Started();
}

bool NativePlayerWnd::CanTick() const
{
    if (!Started() || requests.LoadedRoot())
        return startedOnce;
    return !playing || Complete() || FrameAvailable(curFrame + 1);
}

void NativePlayerWnd::Tick()
{
    Deliver();
    AdvanceHeadlessClock(static_cast<S64>(frameDelay) * 1000);
    if (mixer)
        mixer->Pump();
    DoPlay(1);
}

void NativePlayerWnd::PlayThrough(NativeSoundMix* mix)
{
    mixer = mix;
    scene.soundMix = mix;
}

bool NativePlayerWnd::HasStream() const
{
    for (const ScriptThread* thread = scene.threads; thread; thread = thread->nextThread)
        if (thread->streamChannel)
            return true;
    return false;
}

void NativePlayerWnd::StopPainting()
{
    paints = false;
    FreeBuffer();
}

const CBitBuffer* NativePlayerWnd::Picture()
{
    OnDraw();
    return bits.HasBits() ? &bits : nullptr;
}

void NativePlayerWnd::OverrideBackground(SRGB color)
{
    constexpr int kShellPriority = 2; // above what a movie can ask for; survives a reset
    const int current = scene.backgroundPriority;
    const int priority = current < kShellPriority ? kShellPriority : current + 1;
    scene.SetBackgroundColor(color.alpha == 0 ? SRGB{} : color, priority);
}

bool NativePlayerWnd::StartTimer(S32 interval, S32)
{
    timerRuns = true;
    timerInterval = interval;
    return true;
}

void NativePlayerWnd::StopTimer()
{
    timerRuns = false;
}

void NativePlayerWnd::InvalidateScreenArea(const SRECT* r)
{
    RectUnion(&invalidated, r, &invalidated);
}

void NativePlayerWnd::ClientRect(SRECT* r)
{
    *r = paints ? SRECT{0, width, 0, height} : SRECT{};
}

void NativePlayerWnd::AdjustWindow(S32 pixelWidth, S32 pixelHeight)
{
    if (!ownSize)
        return;
    width = pixelWidth < 0 ? 0 : pixelWidth;
    height = pixelHeight < 0 ? 0 : pixelHeight;
    FreeBuffer();
}

void NativePlayerWnd::BltToScreen(const SRECT* r)
{
    RectUnion(&blitted, r, &blitted);
}

void NativePlayerWnd::ClearScreen() {}

void NativePlayerWnd::StreamPostURLNotify(const char* url, const char* target, U32 length,
                                          const char* data, void* notifyData)
{
    requests.Ask(url, target, data, length, notifyData);
}

void NativePlayerWnd::StreamGetURLNotify(const char* url, const char* target, void* notifyData)
{
    requests.Ask(url, target, nullptr, 0, notifyData);
}

void NativePlayerWnd::CloseStream(StreamData* closed)
{
    requests.Close(closed);
}

void NativePlayerWnd::ProcessFSCommand(const char* command, const char* args)
{
    requests.Command(command, args);
}

void NativePlayerWnd::EnableMenus(const MenuStatus&) {}

void NativePlayerWnd::UpdateCursor() {}

void NativePlayerWnd::GetUnixFontData(U8** data, S32* size)
{
    size_t length = 0;
    const unsigned char* movie = BuiltInFonts(&length);
    *data = length > 0 ? static_cast<U8*>(std::malloc(length)) : nullptr;
    *size = *data ? static_cast<S32>(length) : 0;
    if (*data)
        std::memcpy(*data, movie, length);
}
