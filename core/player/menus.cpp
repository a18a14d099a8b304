// What the shell's menus show.
#include "core/player/player.h"
#include "core/stream/movie_data.h"
#include "core/stream/tags.h"

#include <cstring>

namespace {

constexpr size_t kEntries = sizeof(MenuStatus) / sizeof(S32);

void Mask(const MenuStatus& mask, MenuStatus* status)
{
    S32 entries[kEntries], allowed[kEntries];
    std::memcpy(entries, status, sizeof entries);
    std::memcpy(allowed, &mask, sizeof allowed);
    for (size_t i = 0; i < kEntries; i++)
        entries[i] &= allowed[i];
    std::memcpy(status, entries, sizeof entries);
}

// By the header's count of frames, unless all data is there and nothing more to run in it: that
// count may be wrong.
bool CanAdvance(const ScriptPlayer& movie)
{
    if (movie.atEnd || movie.curFrame >= movie.numFrames - 1)
        return false;
    STagWalker next(movie, movie.pos);
    const S32 code = next.GetTag(movie.len);
    const bool loading = movie.sharedScript && !movie.sharedScript->NothingMore();
    return code > kTagEnd || (code < 0 && loading);
}

} // namespace

void SPlayer::GetMenuState(MenuStatus* status)
{
    const S32 movieLoaded = gotHeader && scriptErr == kErrNone;
    const S32 several = numFrames > 1;
    const S32 beyondFirst = curFrame > 0;
    const S32 isZoomed = IsZoomed();
    *status = {};
    status->canViewAll = status->canZoomIn = status->canZoomOut = movieLoaded;
    status->zoomed = isZoomed;
    status->canPlay = status->canLoop = several;
    status->canRewind = status->canBack = beyondFirst;
    status->canForward = CanAdvance(*this);
    status->view100 = ShowsAt100();
    status->viewAll = !isZoomed && scaleMode != kScaleFixed;
    status->highQuality = highQuality;
    status->looping = loop;
    status->playing = playing;
    Mask(menuMask, status);
}

void SPlayer::GetPopupMenuState(MenuStatus* status)
{
    GetMenuState(status);
}

void SPlayer::SetMenuState(const MenuStatus& mask)
{
    menuMask = mask;
}

void SPlayer::RefreshMenus()
{
    MenuStatus status;
    GetMenuState(&status);
    EnableMenus(status);
}
