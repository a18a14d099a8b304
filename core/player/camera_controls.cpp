// The camera: what of the movie the client area shows.
#include "core/player/player.h"

#include <algorithm>

namespace {

S32 Side(S32 min, S32 max)
{
    return static_cast<S32>(std::clamp<S64>(static_cast<S64>(max) - min, 0, kS32Max));
}

} // namespace

// What the shell says, put right: pixels are counted from the bitmap's corner.
SRECT SPlayer::ClientArea()
{
    SRECT r = {};
    ClientRect(&r);
    return {0, Side(r.xmin, r.xmax), 0, Side(r.ymin, r.ymax)};
}

// A zoom does not show at the fixed scale; it waits until the mode is another.
void SPlayer::ChooseCamera()
{
    const SRECT client = ClientArea();
    scene.animatedMovie = numFrames > 1 && !bestQuality;
    const bool fits =
        client.xmax <= CRaster::kMaxAntialiasSide && client.ymax <= CRaster::kMaxAntialiasSide;
    const bool zoomed = IsZoomed() && scaleMode != kScaleFixed;
    if (scene.SetCamera(zoomed ? &zoomRect : &frame, &client, highQuality && fits, scaleMode))
        FollowFocus();
}

void SPlayer::SetCamera(int update)
{
    ChooseCamera();
    if (update == 1)
        UpdateScreen();
    else if (update == 2)
        CheckUpdate();
}
