// The camera: which part of the movie is shown where.
#include <algorithm>

#include "core/display/display_list.h"

namespace {
constexpr S64 kMinSide = 16;
constexpr S32 kFixedScale = 3276;    // one pixel per 20 twips, cut off
constexpr S32 kFixedScaleAA = 13107; // the same in quarter pixels, cut off by itself

// One axis of a rectangle.
struct Range {
    S64 min;
    S64 max;

    S64 Side() const { return std::max(max - min, kMinSide); }
    // The point that the alignment bits ask for.
    S64 Reference(S32 mode, S32 atMin, S32 atMax) const
    {
        return (mode & atMin) ? min : (mode & atMax) ? max : (min + max) >> 1;
    }
};

S32 ScaleFor(const Range& frame, const Range& client)
{
    return Saturate32(client.Side() * 65536 / frame.Side());
}

// The two scales, changed as the mode wants them.
void ApplyScaleMode(S32 mode, int antialias, S32* sx, S32* sy)
{
    switch (mode & kScaleMask) {
    case kScaleShowAll:
        *sx = *sy = std::min(*sx, *sy);
        break;
    case kScaleFill:
        *sx = *sy = std::max(*sx, *sy);
        break;
    case kScaleFixed:
        *sx = *sy = antialias ? kFixedScaleAA : kFixedScale;
        break;
    default:
        break;
    }
}

S32 Translation(S64 clientRef, S64 frameRef, S32 scale)
{
    return static_cast<S32>(clientRef - ((frameRef * scale) >> 16));
}
} // namespace

bool DisplayList::SetCamera(const SRECT* frame, const SRECT* client, int aa, S32 scaleMode)
{
    aa = aa ? 1 : 0;
    const S64 unit = aa ? 4 : 1;
    const Range clientX = {client->xmin * unit, client->xmax * unit};
    const Range clientY = {client->ymin * unit, client->ymax * unit};
    const Range frameX = {frame->xmin, frame->xmax}, frameY = {frame->ymin, frame->ymax};
    S32 sx = ScaleFor(frameX, clientX), sy = ScaleFor(frameY, clientY);
    ApplyScaleMode(scaleMode, aa, &sx, &sy);
    const S32 tx = Translation(clientX.Reference(scaleMode, kAlignLeft, kAlignRight),
                               frameX.Reference(scaleMode, kAlignLeft, kAlignRight), sx);
    const S32 ty = Translation(clientY.Reference(scaleMode, kAlignTop, kAlignBottom),
                               frameY.Reference(scaleMode, kAlignTop, kAlignBottom), sy);
    const MATRIX mat = {sx, 0, 0, sy, tx, ty};
    const int smooth = aa && !animatedMovie;
    if (MatrixEqual(&mat, &camera, 0) && aa == antialias && smooth == smoothing)
        return false;
    camera = mat;
    antialias = aa;
    smoothing = smooth;
    supersampling = aa ? 2 : 1;
    raster.SetSmoothing(smooth);
    raster.SetAntialias(aa); // hit tests may build edges before the first paint
    ModifyCamera();
    return true;
}

void DisplayList::ModifyCamera()
{
    UpdateDevViewRect();
    InvalidateRect(&devViewRect);
    root.Modify();
}
