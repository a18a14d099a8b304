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
    {"wav", true, false, MakeWavSink, kPixel32, SoundUse::kAlone},
    {"mp4", true, false, MakeMp4Sink, kPixel32, SoundUse::kBeside},
    {"webm", true, true, MakeWebmSink, kPixel32, SoundUse::kBeside},
    {"mkv", true, true, MakeMkvSink, kPixel32, SoundUse::kBeside},
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
