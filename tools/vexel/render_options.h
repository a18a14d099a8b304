// What `vexel render` is asked to do.
#pragma once

#include "core/raster/color.h"
#include "tools/vexel/output_file.h"
#include "tools/vexel/output_format.h"
#include "tools/vexel/play_options.h"

#include <span>
#include <string>

struct RenderOptions : PlayOptions {
    OutputName output;
    const OutputFormat* format = nullptr;
    bool wholePass = false; // one pass of the main timeline, whatever first and last say
    int first = 1;          // pictures count from 1
    int last = 1;
    int duration = 0; // milliseconds; 0: `last` holds
    int quality = 1;  // 0 low, 1 high, 2 best
    bool setBackground = false;
    SRGB background; // alpha 0: transparent
    bool progress = false;

    // False after complaining about the command line.
    bool Parse(std::span<char* const> words);
    bool Transparent() const { return setBackground && background.alpha == 0; }
    // The pixels that the player has to paint.
    CScreenFormat Screen() const;
    // The last picture for a movie whose pictures show for `delay` milliseconds each. Of sound
    // alone it is the last that begins within the duration.
    int LastFor(S32 delay) const;
};
