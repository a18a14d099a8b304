// The camera: what of the movie the client area shows.
#include "core/player/player.h"

// A zoom does not show at the fixed scale; it waits until the mode is another.
void SPlayer::ChooseCamera()
{
    SRECT client;
    ClientRect(&client);
    scene.animatedMovie = numFrames > 1 && !bestQuality;
    const bool fits = static_cast<S64>(client.xmax) - client.xmin <= CRaster::kMaxAntialiasSide &&
                      static_cast<S64>(client.ymax) - client.ymin <= CRaster::kMaxAntialiasSide;
    const bool zoomed = IsZoomed() && scaleMode != kScaleFixed;
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
