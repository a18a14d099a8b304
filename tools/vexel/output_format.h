// The formats that pictures can be written in.
#pragma once

#include "tools/vexel/picture_sink.h"

enum class SoundUse { kNone, kBeside, kAlone };

struct OutputFormat {
    const char* name; // the word for --format; with a dot before it, the extension
    bool several;     // one file holds all pictures
    bool alpha;       // it can be transparent
    SinkMaker make;
    CPixelFormat pixels = kPixel32; // what the player has to paint
    SoundUse sound = SoundUse::kNone;
};

// The format of that name; null when there is none.
const OutputFormat* FindFormat(const std::string& name);
// All names, with a comma and a blank between two.
std::string FormatNames();
