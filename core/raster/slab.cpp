// Spans of whole pixels in the output.
#include <algorithm>

#include "core/raster/raster.h"

void CRaster::DrawCollected(S32 x0, S32 x1, RColor* const* colors, int count)
{
    if (colors[0]->transparent)
        CompositeSlab(x0, x1, colors, count);
    else
        colors[0]->drawSlabProc(colors[0], x0, x1);
}

// Blends the colours, given top first, over the background.
void CRaster::CompositeSlab(S32 x0, S32 x1, RColor* const* colors, int count)
{
    for (S32 x = x0; x < x1; x += kPiece) {
        S32 n = std::min(kPiece, x1 - x);
        if (colors[count - 1]->transparent)
            ReadBackground(x, n, piece);
        for (int i = count - 1; i >= 0; --i)
            colors[i]->buildSlabProc(colors[i], x, x + n, piece);
        ops->writeRow(outRow, x, piece, n);
    }
}

void CRaster::ReadBackground(S32 x, S32 n, RGBI* dst) const
{
    if (BackgroundCovers()) {
        S32 inside = std::clamp(backgroundBits->Width() - x, 0, n);
        backgroundBits->Ops()->readRow(backgroundBits->Row(rowY), x, dst, inside);
        dst += inside;
        n -= inside;
    }
    std::fill_n(dst, n, alphaOutput ? RGBI() : RGBI{255, 255, 255, 255});
}

bool CRaster::BackgroundCovers() const
{
    return backgroundBits && !alphaOutput && backgroundBits->HasBits() &&
           rowY < backgroundBits->Height();
}

// Blends n finished pixels over the background and writes them.
void CRaster::BlendToOutput(S32 x, const RGBI* src, S32 n)
{
    RGBI background[kPiece];
    for (S32 done = 0; done < n; done += kPiece) {
        S32 count = std::min(kPiece, n - done);
        ReadBackground(x + done, count, background);
        CompositeRGB(src + done, background, count);
        ops->writeRow(outRow, x + done, background, count);
    }
}
