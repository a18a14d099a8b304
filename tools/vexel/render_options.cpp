#include "tools/vexel/render_options.h"

#include "core/raster/bit_buffer.h"
#include "tools/vexel/arguments.h"
#include "tools/vexel/message.h"

namespace {

constexpr OptionForm kOptions[] = {
    {"-o", true},        {"--frame", true},      {"--frames", true},    {"--size", true},
    {"--quality", true}, {"--background", true}, {"--progress", false},
};

constexpr int kLastPicture = 0x7FFFFFFE;

// Two numbers with a mark between them.
bool ParsePair(const std::string& text, char mark, int high, int* a, int* b)
{
    const size_t at = text.find(mark);
    return at != std::string::npos && ParseNumber(text.substr(0, at), 1, high, a) &&
           ParseNumber(text.substr(at + 1), 1, high, b);
}

bool ParseFrames(const Arguments& args, RenderOptions* options)
{
    const std::string* frame = args.Find("--frame");
    const std::string* frames = args.Find("--frames");
    if (frame != nullptr && frames != nullptr)
        return false;
    if (frame != nullptr) {
        options->last = 0;
        const bool good = ParseNumber(*frame, 1, kLastPicture, &options->first);
        options->last = options->first;
        return good;
    }
    if (frames != nullptr)
        return ParsePair(*frames, '-', kLastPicture, &options->first, &options->last) &&
               options->first <= options->last;
    options->wholePass = options->output.Numbered();
    return true;
}

bool ParseQuality(const std::string& text, int* quality)
{
    constexpr const char* kNames[] = {"low", "high", "best"};
    for (int i = 0; i < 3; i++) {
        if (text != kNames[i])
            continue;
        *quality = i;
        return true;
    }
    return false;
}

int HexDigit(char c)
{
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    return c >= 'A' && c <= 'F' ? c - 'A' + 10 : -1;
}

bool ParseColor(const std::string& text, SRGB* color)
{
    *color = {};
    if (text == "transparent")
        return true;
    if (text.size() != 7 || text[0] != '#')
        return false;
    U8* channels[] = {&color->red, &color->green, &color->blue};
    for (size_t i = 0; i < 3; i++) {
        const int high = HexDigit(text[1 + 2 * i]);
        const int low = HexDigit(text[2 + 2 * i]);
        if (high < 0 || low < 0)
            return false;
        *channels[i] = static_cast<U8>(high * 16 + low);
    }
    color->alpha = 255;
    return true;
}

// What is wrong with the values, or nothing.
std::string ParseValues(const Arguments& args, RenderOptions* options)
{
    if (!ParseFrames(args, options))
        return "pictures are chosen by --frame N or --frames A-B, counted from 1";
    const std::string* size = args.Find("--size");
    if (size != nullptr &&
        !ParsePair(*size, 'x', CBitBuffer::kMaxSide, &options->width, &options->height))
        return Format("--size takes WxH, each from 1 to %d", CBitBuffer::kMaxSide);
    const std::string* quality = args.Find("--quality");
    if (quality != nullptr && !ParseQuality(*quality, &options->quality))
        return "--quality takes low, high or best";
    const std::string* background = args.Find("--background");
    options->setBackground = background != nullptr;
    if (background != nullptr && !ParseColor(*background, &options->background))
        return "--background takes #RRGGBB or transparent";
    options->progress = args.Has("--progress");
    return "";
}

std::string CheckOutput(const RenderOptions& options)
{
    const OutputName& output = options.output;
    const std::string extension = output.Extension();
    if (!output.ToStdout() && extension != ".png")
        return (extension.empty() ? "an output without extension" : extension + " output") +
               " is not supported yet: use .png";
    if (!output.Numbered() && options.first != options.last)
        return "several pictures need a number in the name of the output, such as %04d";
    return "";
}

} // namespace

bool RenderOptions::Parse(std::span<char* const> words)
{
    Arguments args;
    std::string fault;
    if (!args.Parse(words, kOptions))
        fault = args.error;
    else if (args.Rest().size() != 1)
        fault = "render takes one movie";
    else if (!args.Has("-o"))
        fault = "render needs an output: -o OUT";
    else if (!output.Parse(*args.Find("-o")))
        fault = "the name of the output may hold one number, %d or %0Nd";
    else
        fault = ParseValues(args, this);
    if (fault.empty())
        fault = CheckOutput(*this);
    if (!fault.empty()) {
        ComplainUsage(fault);
        return false;
    }
    movie = args.Rest()[0];
    return true;
}
