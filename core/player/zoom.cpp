// Zooming and panning: the part of the movie that is shown. Pixels here are those of ClientRect.
#include "core/player/player.h"

#include <algorithm>

namespace {

constexpr S32 kQuarter = 0x4000;
constexpr S64 kTwips = 20;   // in a pixel at 100%
constexpr S64 kRounding = 4; // twips by which an inverted camera may fall short

// One axis of a rectangle.
struct Span {
    S64 min;
    S64 max;
};

S64 Width(const SRECT& r)
{
    return static_cast<S64>(r.xmax) - r.xmin;
}

S64 Height(const SRECT& r)
{
    return static_cast<S64>(r.ymax) - r.ymin;
}

void Shift(Span* span, S64 by)
{
    span->min += by;
    span->max += by;
}

// `size` around `centre`, moved into the frame and cut to it. What is larger than the frame comes
// to rest against the frame's far side before the cut.
Span SpanWithin(S32 size, S32 centre, const Span& frame)
{
    const S64 low = static_cast<S64>(centre) - size / 2;
    Span span = {low, low + size};
    if (span.min < frame.min)
        Shift(&span, frame.min - span.min);
    if (span.max > frame.max)
        Shift(&span, frame.max - span.max);
    return {std::max(span.min, frame.min), std::min(span.max, frame.max)};
}

// How far an axis of the view may move, and still show the frame only; a view that shows more
// already may go back.
S32 CutOffset(S32 offset, const Span& frame, const Span& client)
{
    const S64 least = std::min<S64>(frame.min - client.min, 0);
    const S64 most = std::max<S64>(frame.max - client.max, 0);
    return static_cast<S32>(std::clamp<S64>(offset, least, most));
}

// Half of the sum, toward zero.
S32 Middle(S32 a, S32 b)
{
    return static_cast<S32>((static_cast<S64>(a) + b) / 2);
}

S32 Scaled(S64 size, S32 factor)
{
    return Saturate32((Saturate32(size) * static_cast<S64>(factor)) >> 16);
}

// Moves one axis of a zoom, whose size stays, so that no number of small moves wears it down. Of
// the zoom and what the scale mode makes visible of it or around it, the shorter is kept in the
// frame to the twip.
void MoveAxis(S32 offset, const Span& frame, const Span& visible, S32* min, S32* max)
{
    const Span zoom = {*min, *max};
    const bool inside = zoom.max - zoom.min <= visible.max - visible.min + kRounding;
    const S64 by = CutOffset(offset, frame, inside ? zoom : visible);
    *min = std::max(Saturate32(zoom.min + by), kRectEmpty + 1);
    *max = Saturate32(zoom.max + by);
}

} // namespace

// The camera from twips to whole pixels.
void SPlayer::PixelCamera(MATRIX* mat) const
{
    *mat = scene.camera;
    if (!scene.antialias)
        return;
    MATRIX quarter;
    MatrixScale(kQuarter, kQuarter, &quarter);
    MatrixConcat(mat, &quarter, mat);
}

void SPlayer::ZoomF(S32 factor, const SPOINT* devicePoint)
{
    MATRIX toMovie;
    PixelCamera(&toMovie);
    MatrixInvert(&toMovie, &toMovie);
    const SRECT client = ClientArea();
    MatrixTransformRect(&toMovie, &client, &zoomRect);
    SPOINT centre = {Middle(zoomRect.xmin, zoomRect.xmax), Middle(zoomRect.ymin, zoomRect.ymax)};
    if (devicePoint != nullptr)
        MatrixTransformPoint(&toMovie, devicePoint, &centre);
    Zoom({Scaled(Width(zoomRect), factor), Scaled(Height(zoomRect), factor)}, centre);
}

void SPlayer::Zoom(SPOINT size, SPOINT centre)
{
    LeaveFixedScale();
    const SRECT client = ClientArea();
    // As many twips as there are pixels: no closer than one twip a pixel.
    size.x = std::max(size.x, client.xmax);
    size.y = std::max(size.y, client.ymax);
    const Span x = SpanWithin(size.x, centre.x, {frame.xmin, frame.xmax});
    const Span y = SpanWithin(size.y, centre.y, {frame.ymin, frame.ymax});
    const bool nothing = x.min >= x.max || y.min >= y.max;
    if (nothing || (size.x >= Width(frame) && size.y >= Height(frame))) {
        Home();
        return;
    }
    zoomRect = {static_cast<S32>(x.min), static_cast<S32>(x.max), static_cast<S32>(y.min),
                static_cast<S32>(y.max)};
    SetCamera(2);
}

void SPlayer::ZoomScale(S32 percent)
{
    if (percent <= 0 || percent == 100)
        Home();
    else
        ZoomF(FixedDiv(100, percent), nullptr);
}

// The zoom is moved by twips that come from the exact camera; the one in pixels is cut off and says
// only what may be moved.
void SPlayer::Pan(S32 dx, S32 dy)
{
    if (!IsZoomed() || scaleMode == kScaleFixed)
        return; // the view shows no zoom
    MATRIX camera;
    PixelCamera(&camera);
    const SRECT client = ClientArea();
    SRECT shown, view;
    MatrixTransformRect(&camera, &frame, &shown);
    dx = CutOffset(dx, {shown.xmin, shown.xmax}, {client.xmin, client.xmax});
    dy = CutOffset(dy, {shown.ymin, shown.ymax}, {client.ymin, client.ymax});
    if (dx == 0 && dy == 0)
        return;
    MatrixInvert(&camera, &camera);
    MatrixTransformRect(&camera, &client, &view);
    const S64 unit = scene.antialias ? 4 * 0x10000 : 0x10000;
    MoveAxis(ScaleByRatio(dx, unit, scene.camera.a), {frame.xmin, frame.xmax},
             {view.xmin, view.xmax}, &zoomRect.xmin, &zoomRect.xmax);
    MoveAxis(ScaleByRatio(dy, unit, scene.camera.d), {frame.ymin, frame.ymax},
             {view.ymin, view.ymax}, &zoomRect.ymin, &zoomRect.ymax);
    SetCamera(1);
}

void SPlayer::Home()
{
    RectSetEmpty(&zoomRect);
    SetCamera(2);
}

void SPlayer::SetZoomRect(S32 xmin, S32 ymin, S32 xmax, S32 ymax)
{
    if (xmin >= xmax || ymin >= ymax) {
        LeaveFixedScale();
        Home();
        return;
    }
    // The least number there is would say that the rectangle is empty.
    zoomRect = {std::max(xmin, kRectEmpty + 1), xmax, ymin, ymax};
    SetCamera(2);
}

void SPlayer::LeaveFixedScale()
{
    if (scaleMode == kScaleFixed)
        scaleMode = kScaleShowAll;
}

void SPlayer::TopLeftView(SRECT* r)
{
    const SRECT client = ClientArea();
    *r = {0, Saturate32(client.xmax * kTwips), 0, Saturate32(client.ymax * kTwips)};
    if (r->xmax == 0 || r->ymax == 0)
        RectSetEmpty(r);
}

bool SPlayer::ShowsAt100()
{
    if (!(scaleMode & kScaleTopLeft100))
        return scaleMode == kScaleFixed;
    SRECT view;
    TopLeftView(&view);
    return IsZoomed() && RectEqual(&zoomRect, &view, 0);
}
