// The controls that a menu or a page drives. Each ends with a look at the menus.
#include "core/player/player.h"
#include "core/stream/str.h"

void SPlayer::ControlOpen(const char* url)
{
    if (url != nullptr && *url != 0) {
        scene.Reset();
        ClearScript();
        stack.Clear();
        ForgetRequests();
        FreeStr(baseURL);
        baseURL = nullptr;
        firstLoad = 1;
        GetURL(url, "_level0", nullptr, 0);
        if (gotHeader)
            OfferWindow();
    }
    RefreshMenus();
}

void SPlayer::ControlClose()
{
    ClearScript();
    stack.Clear();
    ForgetRequests();
    RefreshMenus();
}

// Twips to whole pixels, toward zero.
void SPlayer::OfferWindow()
{
    constexpr S64 kTwips = 20;
    const S64 width = static_cast<S64>(frame.xmax) - frame.xmin;
    const S64 height = static_cast<S64>(frame.ymax) - frame.ymin;
    AdjustWindow(static_cast<S32>(width / kTwips), static_cast<S32>(height / kTwips));
}

void SPlayer::GotoFrame(S32 target)
{
    if (actionDepth > 0) {
        Seek(target);
        return;
    }
    scene.ResetBudget();
    Seek(target);
    DoActions();
    CheckUpdate();
}

// Playing on from the last frame may mean a seek to the first.
void SPlayer::ControlPlay()
{
    if (actionDepth == 0)
        scene.ResetBudget();
    if (playing)
        StopPlay();
    else
        Play(true);
    RefreshMenus();
}

void SPlayer::ControlRewind()
{
    GotoFrame(0);
    RefreshMenus();
}

void SPlayer::ControlForward()
{
    GotoFrame(Saturate32(static_cast<S64>(curFrame) + 1));
    RefreshMenus();
}

void SPlayer::ControlBack()
{
    GotoFrame(curFrame - 1);
    RefreshMenus();
}

void SPlayer::ControlLoop()
{
    loop = !loop;
    RefreshMenus();
}

void SPlayer::ControlHighQuality()
{
    highQuality = !highQuality;
    autoQuality = 0;
    ShowQuality();
    if (actionDepth == 0)
        RefreshMenus();
}

void SPlayer::ControlViewAll()
{
    LeaveFixedScale();
    Home();
    RefreshMenus();
}

void SPlayer::Control100()
{
    if (scaleMode & kScaleTopLeft100) {
        TopLeftView(&zoomRect);
    } else {
        RectSetEmpty(&zoomRect);
        scaleMode = kScaleFixed; // the alignment goes too
    }
    SetCamera(2);
    RefreshMenus();
}

void SPlayer::ControlZoomIn()
{
    ZoomF(kZoomIn, nullptr);
    RefreshMenus();
}

void SPlayer::ControlZoomOut()
{
    ZoomF(kZoomOut, nullptr);
    RefreshMenus();
}

void SPlayer::ControlZoomContext(S32 x, S32 y)
{
    const SPOINT pt = {x, y};
    ZoomF(kZoomIn, &pt);
    RefreshMenus();
}
