// MenuStatus: what a shell's menus show.
#pragma once

#include "core/geom/types.h"

// Each entry is 0 or 1. An edit menu takes the same record: there the first five say whether cut,
// copy, paste, delete and select all are possible, and the others are 0.
struct MenuStatus {
    S32 canViewAll, canZoomIn, canZoomOut; // a movie is loaded
    S32 zoomed;
    S32 canPlay;    // more than one frame
    S32 canRewind;  // beyond the first frame
    S32 canForward; // the root timeline can advance
    S32 canBack;    // beyond the first frame
    S32 canLoop;    // more than one frame
    S32 view100;
    S32 viewAll;
    S32 highQuality;
    S32 looping;
    S32 playing;
};

constexpr MenuStatus kAllMenus = {1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1};
