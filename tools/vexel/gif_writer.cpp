// Animated GIF. One palette serves all pictures, so they are kept until the last one is known. Of
// each picture the rectangle that changed is written, and what did not change in it is transparent.
#include "tools/vexel/output_file.h"
#include "tools/vexel/palette_builder.h"
#include "tools/vexel/picture_sink.h"
#include "tools/vexel/picture_spool.h"
#include "tools/vexel/pixel_bytes.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <gif_lib.h>

namespace {

constexpr S64 kLongest = 65535; // hundredths of a second that one image can stand
// Viewers take a shorter time for a mistake and stand still for ten times as long.
constexpr S64 kShortest = 2;

using Indices = std::vector<U8>;

class GifSink : public PictureSink {
public:
    explicit GifSink(const OutputName& name) : path(name.For(0)) {}
    ~GifSink() override { Close(); }

    bool Begin(const PictureForm& pictureForm) override;
    bool Add(const CBitBuffer& picture, int) override;
    bool Finish() override;

private:
    // One picture as it will show, and when.
    struct Frame {
        Indices pixels;
        S64 begin = 0; // hundredths of a second
    };

    bool FailWriting() { return Fail(path, file.error.empty() ? "no memory" : file.error); }
    bool FailSpool();
    bool Close();
    void CountColors();
    bool WriteHeader(const std::vector<U32>& colors);
    bool WriteLoop();
    bool WriteFrames(PaletteMap* map);
    S64 TimeOf(S64 pictures) const { return (pictures * form.delay + 5) / 10; }
    void MapCanvas(PaletteMap* map, Indices* pixels) const;
    SRECT CoverCleared(const Indices& before, const Indices& after) const;
    bool ShowUntil(S64 end, const Indices* next);
    bool WriteImage(const SRECT& r, S64 delay, bool clear);
    bool WriteRows(const SRECT& r);

    std::string path;
    OutputFile file;
    PictureForm form = {};
    PictureSpool spool;
    S64 shown = 0; // pictures
    PaletteBuilder builder;
    GifFileType* gif = nullptr;
    U8 transparent = 0; // the index that leaves alone what is there
    Indices screen;     // what a viewer shows before `frame` comes
    Frame frame;
    Indices row;
};

int Put(GifFileType* gif, const GifByteType* bytes, int n)
{
    OutputFile* file = static_cast<OutputFile*>(gif->UserData);
    return file->Write({bytes, static_cast<size_t>(n)}) ? n : 0;
}

bool GifSink::FailSpool()
{
    return Fail(path, Format("cannot keep its pictures: %s", std::strerror(errno)));
}

bool GifSink::Close()
{
    int error = 0;
    const bool closed = gif == nullptr || EGifCloseFile(gif, &error) == GIF_OK;
    gif = nullptr;
    return closed;
}

bool GifSink::Begin(const PictureForm& pictureForm)
{
    form = pictureForm;
    if (!file.Open(path))
        return FailWriting();
    return spool.Open(form.width, form.height) || FailSpool();
}

bool GifSink::Add(const CBitBuffer& picture, int)
{
    const size_t shots = spool.shots.size();
    if (!spool.Add(picture))
        return FailSpool();
    shown++;
    if (spool.shots.size() > shots)
        CountColors();
    return true;
}

// What changed counts, run by run; what is more transparent than not has no colour.
void GifSink::CountColors()
{
    const SRECT& r = spool.shots.back().changed;
    for (S32 y = r.ymin; y < r.ymax; y++) {
        const U32* pixels = spool.canvas.data() + static_cast<size_t>(y) * form.width;
        for (S32 x = r.xmin, end; x < r.xmax; x = end) {
            for (end = x + 1; end < r.xmax && pixels[end] == pixels[x]; end++) {
            }
            if (pixels[x] >> 31)
                builder.Count(StraightPixel(pixels[x]) & 0xFFFFFF, static_cast<U32>(end - x));
        }
    }
}

bool GifSink::WriteHeader(const std::vector<U32>& colors)
{
    int error = 0;
    const int bits = GifBitSize(static_cast<int>(colors.size()) + 1);
    ColorMapObject* map = GifMakeMapObject(1 << bits, nullptr);
    gif = EGifOpen(&file, Put, &error);
    bool good = map != nullptr && gif != nullptr;
    for (size_t i = 0; i < colors.size() && good; i++)
        map->Colors[i] = {static_cast<U8>(colors[i] >> 16), static_cast<U8>(colors[i] >> 8),
                          static_cast<U8>(colors[i])};
    if (good) {
        EGifSetGifVersion(gif, true);
        good = EGifPutScreenDesc(gif, form.width, form.height, bits, 0, map) == GIF_OK;
    }
    GifFreeMapObject(map);
    return good && WriteLoop();
}

// The way to say "for ever" that every viewer knows.
bool GifSink::WriteLoop()
{
    constexpr U8 kForEver[] = {1, 0, 0};
    return EGifPutExtensionLeader(gif, APPLICATION_EXT_FUNC_CODE) == GIF_OK &&
           EGifPutExtensionBlock(gif, 11, "NETSCAPE2.0") == GIF_OK &&
           EGifPutExtensionBlock(gif, sizeof kForEver, kForEver) == GIF_OK &&
           EGifPutExtensionTrailer(gif) == GIF_OK;
}

void GifSink::MapCanvas(PaletteMap* map, Indices* pixels) const
{
    pixels->resize(spool.canvas.size());
    for (S32 y = 0; y < form.height; y++) {
        const size_t start = static_cast<size_t>(y) * form.width;
        for (S32 x = 0; x < form.width; x++) {
            const U32 pixel = spool.canvas[start + x];
            (*pixels)[start + x] =
                pixel >> 31 ? map->Index(StraightPixel(pixel), x, y) : transparent;
        }
    }
}

// The rectangle around what shows in one picture and not in the next: an image can only draw, so
// the one before it has to take these away when its time is over.
SRECT GifSink::CoverCleared(const Indices& before, const Indices& after) const
{
    Indices kept = before;
    for (size_t i = 0; i < kept.size(); i++) {
        if (after[i] == transparent)
            kept[i] = transparent;
    }
    return ChangedRect(before, kept, form.width);
}

bool GifSink::WriteRows(const SRECT& r)
{
    row.resize(static_cast<size_t>(r.xmax - r.xmin));
    for (S32 y = r.ymin; y < r.ymax; y++) {
        const size_t start = static_cast<size_t>(y) * form.width;
        for (S32 x = r.xmin; x < r.xmax; x++) {
            const U8 pixel = frame.pixels[start + x];
            row[static_cast<size_t>(x - r.xmin)] = pixel == screen[start + x] ? transparent : pixel;
            screen[start + x] = pixel;
        }
        if (EGifPutLine(gif, row.data(), static_cast<int>(row.size())) != GIF_OK)
            return false;
    }
    return true;
}

bool GifSink::WriteImage(const SRECT& r, S64 delay, bool clear)
{
    const GraphicsControlBlock control = {clear ? DISPOSE_BACKGROUND : DISPOSE_DO_NOT, false,
                                          static_cast<int>(delay), transparent};
    GifByteType bytes[4];
    EGifGCBToExtension(&control, bytes);
    return EGifPutExtension(gif, GRAPHICS_EXT_FUNC_CODE, sizeof bytes, bytes) == GIF_OK &&
           EGifPutImageDesc(gif, r.xmin, r.ymin, r.xmax - r.xmin, r.ymax - r.ymin, false,
                            nullptr) == GIF_OK &&
           WriteRows(r);
}

// Writes `frame`, which shows until `end`, when `next` follows if there is one. A time that is too
// long for one image is made up by images that change nothing.
bool GifSink::ShowUntil(S64 end, const Indices* next)
{
    SRECT r = ChangedRect(screen, frame.pixels, form.width);
    if (frame.begin == 0)
        r = {0, form.width, 0, form.height};
    SRECT cleared = {0, 0, 0, 0};
    if (next != nullptr && form.alpha)
        cleared = CoverCleared(frame.pixels, *next);
    const bool clear = cleared.xmax > 0;
    if (r.xmax == 0)
        r = clear ? cleared : SRECT{0, 1, 0, 1};
    else if (clear)
        r = {std::min(r.xmin, cleared.xmin), std::max(r.xmax, cleared.xmax),
             std::min(r.ymin, cleared.ymin), std::max(r.ymax, cleared.ymax)};
    S64 left = end - frame.begin;
    for (; left > kLongest; left -= kLongest) {
        if (!WriteImage(r, kLongest, false))
            return false;
    }
    if (!WriteImage(r, left, clear))
        return false;
    for (S32 y = r.ymin; y < r.ymax && clear; y++)
        std::fill_n(screen.begin() + y * form.width + r.xmin, r.xmax - r.xmin, transparent);
    return true;
}

// A picture whose time would be too short to be shown gives it to the next one, and so does one
// that would leave too little for the last.
bool GifSink::WriteFrames(PaletteMap* map)
{
    Frame incoming;
    S64 pictures = 0;
    for (size_t i = 0; i < spool.shots.size(); i++) {
        if (!spool.Next())
            return FailSpool();
        pictures += spool.shots[i].pictures;
        const S64 end = TimeOf(pictures);
        const bool last = i + 1 == spool.shots.size();
        if (!last && (end - incoming.begin < kShortest || TimeOf(shown) - end < kShortest))
            continue;
        MapCanvas(map, &incoming.pixels);
        if (!frame.pixels.empty() && !ShowUntil(incoming.begin, &incoming.pixels))
            return FailWriting();
        std::swap(frame, incoming);
        incoming.begin = end;
    }
    return ShowUntil(incoming.begin, nullptr) || FailWriting();
}

bool GifSink::Finish()
{
    const std::vector<U32> colors = builder.Choose(255);
    transparent = static_cast<U8>(colors.size());
    screen.assign(spool.canvas.size(), transparent);
    if (!spool.Rewind())
        return FailSpool();
    PaletteMap map(colors);
    if (!WriteHeader(colors))
        return FailWriting();
    if (!WriteFrames(&map))
        return false;
    return (Close() && file.Commit()) || FailWriting();
}

} // namespace

std::unique_ptr<PictureSink> MakeGifSink(const OutputName& output)
{
    return std::make_unique<GifSink>(output);
}
