// The screen: from the dirty areas of the scene to the pixels of the shell.
#include "core/player/limits.h"
#include "core/player/player.h"

bool SPlayer::UpdateBuffer(int paint)
{
    if (!bits.HasBits()) {
        const SRECT client = ClientArea();
        if (client.xmax == 0 || client.ymax == 0)
            return true;
        if (!CreateBits(client.xmax, client.ymax))
            return false;
    }
    if (paint) {
        painting = true;
        scene.Update();
        painting = false;
    }
    return true;
}

// What cannot be had is not asked for in every tick, at the cost of all that is cached.
bool SPlayer::CreateBits(S32 width, S32 height)
{
    if (width == refusedSize.x && height == refusedSize.y)
        return false;
    if (!AllocateBits(width, height)) {
        refusedSize = {width, height};
        return false;
    }
    const SRECT whole = {0, width, 0, height};
    ChooseCamera();
    scene.ModifyCamera();
    InvalidateScreenArea(&whole);
    return true;
}

bool SPlayer::AllocateBits(S32 width, S32 height)
{
    if (width > CBitBuffer::kMaxSide || height > CBitBuffer::kMaxSide ||
        static_cast<S64>(width) * height > gLimits.surfacePixels)
        return false;
    if (bits.CreateScreenBits(width, height, screenFormat))
        return true;
    // Memory is short: what can be made again goes before the screen does.
    scene.FreeCache();
    FreeCache();
    return bits.CreateScreenBits(width, height, screenFormat);
}

// Adds what is waiting to be painted and what has been painted to what the screen still lacks.
void SPlayer::TakeDirty()
{
    SRECT waiting;
    scene.CalcBitsDirty(&scene.devDirtyRgn, &waiting);
    RectUnion(&screenDirty, &waiting, &screenDirty);
    RectUnion(&screenDirty, &scene.bitsDirty, &screenDirty);
    RectSetEmpty(&scene.bitsDirty);
}

// Painting may have touched more than was waiting (a buffer that had to be made anew), so the dirt
// is taken once more here.
void SPlayer::BlitPending()
{
    TakeDirty();
    if (!bits.HasBits()) {
        ClearScreen();
    } else {
        const SRECT whole = {0, bits.Width(), 0, bits.Height()};
        SRECT shown;
        RectIntersect(&screenDirty, &whole, &shown);
        if (!RectIsEmpty(&shown))
            BltToScreen(&shown);
    }
    RectSetEmpty(&screenDirty);
}

void SPlayer::UpdateScreen()
{
    scene.CalcUpdate();
    TakeDirty();
    if (RectIsEmpty(&screenDirty))
        return;
    UpdateBuffer(1);
    BlitPending();
}

void SPlayer::CheckUpdate()
{
    scene.CalcUpdate();
    TakeDirty();
    if (!RectIsEmpty(&screenDirty))
        InvalidateScreenArea(&screenDirty);
    RectSetEmpty(&screenDirty);
}

void SPlayer::Repaint(const SRECT* r)
{
    constexpr SRECT kAnyBits = {0, CBitBuffer::kMaxSide, 0, CBitBuffer::kMaxSide};
    SRECT area;
    RectIntersect(r, &kAnyBits, &area);
    if (scene.antialias)
        RectShift(&area, 2, &area);
    scene.InvalidateRect(&area);
    UpdateBuffer(1);
    BlitPending();
}

// The pixels of the exposed area are right as they are; only the screen has lost them.
void SPlayer::OnDraw(const SRECT* exposed)
{
    UpdateBuffer(1);
    if (exposed != nullptr)
        RectUnion(&screenDirty, exposed, &screenDirty);
    BlitPending();
}

void SPlayer::FreeBuffer()
{
    bits.FreeBits();
    refusedSize = {};
    scene.InvalidateRect(&scene.devViewRect);
}

void SPlayer::SetScreenFormat(const CScreenFormat& format)
{
    screenFormat = format;
    FreeBuffer();
}
