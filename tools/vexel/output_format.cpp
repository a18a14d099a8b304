#include "tools/vexel/output_format.h"

static constexpr OutputFormat kFormats[] = {
    {"png", false, true, MakePngSink},
    {"gif", true, true, MakeGifSink},
    {"apng", true, true, MakeApngSink},
    {"y4m", true, false, MakeY4mSink},
    {"rgba", true, true, MakeRawSink},
    {"rgb565", true, false, MakeRawSink, kPixel16},
    {"rgb555", true, false, MakeRawSink, kPixel15},
    {"pal8", true, false, MakeRawSink, kPixel8},
    {"mp4", true, false, MakeMp4Sink},
    {"webm", true, true, MakeWebmSink},
    {"mkv", true, true, MakeMkvSink},
};

const OutputFormat* FindFormat(const std::string& name)
{
    for (const OutputFormat& format : kFormats) {
        if (name == format.name)
            return &format;
    }
    return nullptr;
}

std::string FormatNames()
{
    std::string names;
    for (const OutputFormat& format : kFormats)
        names += std::string(names.empty() ? "" : ", ") + format.name;
    return names;
}
