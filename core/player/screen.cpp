// The screen: from the dirty areas of the scene to the pixels of the shell.
#include "core/player/limits.h"
#include "core/player/player.h"

bool SPlayer::UpdateBuffer(int paint)
{
    if (!bits.HasBits()) {
        SRECT client;
        ClientRect(&client);
        if (client.xmin >= client.xmax || client.ymin >= client.ymax)
            return true;
        if (!CreateBits(&client))
            return false;
    }
    if (paint)
        scene.Update();
    return true;
}

bool SPlayer::CreateBits(const SRECT* client)
{
    const S64 width = static_cast<S64>(client->xmax) - client->xmin;
    const S64 height = static_cast<S64>(client->ymax) - client->ymin;
    if (width > CBitBuffer::kMaxSide || height > CBitBuffer::kMaxSide ||
        width * height > gLimits.surfacePixels)
        return false;
    const S32 w = static_cast<S32>(width), h = static_cast<S32>(height);
    if (!bits.CreateScreenBits(w, h, screenFormat)) {
        // Memory is short: what can be made again goes before the screen does.
        scene.FreeCache();
        FreeCache();
        if (!bits.CreateScreenBits(w, h, screenFormat))
            return false;
    }
    ChooseCamera();
    scene.ModifyCamera();
    InvalidateScreenArea(client);
    return true;
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
    scene.InvalidateRect(&scene.devViewRect);
}

void SPlayer::SetScreenFormat(const CScreenFormat& format)
{
    screenFormat = format;
    FreeBuffer();
}
