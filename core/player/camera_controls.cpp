// The view: camera, zoom and quality.
#include "core/player/player.h"

// A zoom does not show at the fixed scale; it waits until the mode is another.
void SPlayer::ChooseCamera()
{
    SRECT client;
    ClientRect(&client);
    scene.animatedMovie = numFrames > 1 && !bestQuality;
    const bool fits = static_cast<S64>(client.xmax) - client.xmin <= CRaster::kMaxAntialiasSide &&
                      static_cast<S64>(client.ymax) - client.ymin <= CRaster::kMaxAntialiasSide;
    const bool zoomed = !RectIsEmpty(&zoomRect) && scaleMode != kScaleFixed;
    scene.SetCamera(zoomed ? &zoomRect : &frame, &client, highQuality && fits, scaleMode);
}

void SPlayer::SetCamera(int update)
{
    ChooseCamera();
    if (update == 1)
        UpdateScreen();
    else if (update == 2)
        CheckUpdate();
}

void SPlayer::Home()
{
    RectSetEmpty(&zoomRect);
    SetCamera(2);
}

void SPlayer::SetZoomRect(S32 xmin, S32 ymin, S32 xmax, S32 ymax)
{
    if (xmin >= xmax || ymin >= ymax) {
        if (scaleMode == kScaleFixed)
            scaleMode = kScaleShowAll;
        Home();
        return;
    }
    zoomRect = {xmin, xmax, ymin, ymax};
    SetCamera(2);
}

void SPlayer::SetQuality(int level)
{
    highQuality = level > 0;
    bestQuality = level >= 2;
    autoQuality = 0;
    SetCamera(2);
}
