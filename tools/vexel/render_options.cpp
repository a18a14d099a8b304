#include "tools/vexel/render_options.h"

#include "tools/vexel/message.h"

namespace {

constexpr OptionForm kOptions[] = {
    {"-o", true},         {"--format", true},  {"--frame", true},      {"--frames", true},
    {"--duration", true}, {"--quality", true}, {"--background", true}, {"--progress", false},
    PlayOptions::kSize,   PlayOptions::kInput, PlayOptions::kAllowNet, PlayOptions::kAllowDir,
    PlayOptions::kTrace,
};

// Seconds with up to three decimals, as milliseconds.
bool ParseSeconds(const std::string& text, int* milliseconds)
{
    constexpr int kMost = 24 * 60 * 60;
    const size_t point = text.find('.');
    const std::string whole = point == 0 ? "0" : text.substr(0, point);
    std::string decimals = point == std::string::npos ? "0" : text.substr(point + 1);
    int seconds = 0;
    int rest = 0;
    if (decimals.empty() || decimals.size() > 3)
        return false;
    decimals.resize(3, '0');
    if (!ParseNumber(whole, 0, kMost, &seconds) || !ParseNumber(decimals, 0, 999, &rest))
        return false;
    *milliseconds = seconds * 1000 + rest;
    return *milliseconds > 0;
}

bool ParseFrames(const Arguments& args, RenderOptions* options)
{
    const std::string* frame = args.Find("--frame");
    const std::string* frames = args.Find("--frames");
    const std::string* duration = args.Find("--duration");
    if ((frame != nullptr) + (frames != nullptr) + (duration != nullptr) > 1)
        return false;
    if (duration != nullptr)
        return ParseSeconds(*duration, &options->duration);
    if (frame != nullptr) {
        options->last = 0;
        const bool good = ParseNumber(*frame, 1, kLastPicture, &options->first);
        options->last = options->first;
        return good;
    }
    if (frames != nullptr)
        return ParsePair(*frames, '-', kLastPicture, &options->first, &options->last) &&
               options->first <= options->last;
    options->wholePass = options->output.Numbered() || options->format->several;
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
        return "pictures are chosen by --frame N or --frames A-B, counted from 1, or --duration S";
    const std::string* quality = args.Find("--quality");
    if (quality != nullptr && !ParseQuality(*quality, &options->quality))
        return "--quality takes low, high or best";
    const std::string* background = args.Find("--background");
    options->setBackground = background != nullptr;
    if (background != nullptr && !ParseColor(*background, &options->background))
        return "--background takes #RRGGBB or transparent";
    options->progress = args.Has("--progress");
    return options->ParsePlay(args);
}

// By the word for it, by the name's extension, or PNG on standard output.
std::string ChooseFormat(const Arguments& args, RenderOptions* options)
{
    const OutputName& output = options->output;
    const std::string extension = output.Extension();
    const std::string* word = args.Find("--format");
    if (word != nullptr)
        options->format = FindFormat(*word);
    else if (output.ToStdout())
        options->format = FindFormat("png");
    else if (!extension.empty())
        options->format = FindFormat(extension.substr(1));
    if (options->format != nullptr)
        return "";
    if (word != nullptr)
        return "--format takes one of " + FormatNames();
    return (extension.empty() ? "an output without extension needs a --format"
                              : "no format goes by the extension " + extension) +
           ": " + FormatNames();
}

std::string CheckOutput(const RenderOptions& options)
{
    const OutputFormat& format = *options.format;
    const bool several = options.wholePass || options.duration > 0 || options.first != options.last;
    if (format.several && options.output.Numbered())
        return std::string(format.name) + " holds all pictures: its name takes no number";
    if (!format.several && several && !options.output.Numbered())
        return "several pictures need a number in the name of the output, such as %04d";
    if (options.Transparent() && !format.alpha)
        return std::string(format.name) + " cannot be transparent";
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
        fault = ChooseFormat(args, this);
    if (fault.empty())
        fault = ParseValues(args, this);
    if (fault.empty())
        fault = CheckOutput(*this);
    if (!fault.empty()) {
        ComplainUsage(fault);
        return false;
    }
    return true;
}

// Palettes need dithering more than words of 16 bits do.
CScreenFormat RenderOptions::Screen() const
{
    CScreenFormat screen;
    screen.pixels = format->pixels;
    screen.dither = quality >= (screen.pixels == kPixel8 ? 1 : 2);
    return screen;
}

int RenderOptions::LastFor(S32 delay) const
{
    if (duration == 0)
        return last;
    const bool alone = format->sound == SoundUse::kAlone;
    const int pictures = (duration + (alone ? delay - 1 : delay / 2)) / delay;
    return pictures > 0 ? pictures : 1;
}
