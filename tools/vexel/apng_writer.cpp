// Animated PNG. Of each picture the rectangle that changed is written. The number of images stands
// before the first, and whether alpha is needed shows at the last, so all are kept until then.
#include "tools/vexel/output_file.h"
#include "tools/vexel/picture_sink.h"
#include "tools/vexel/picture_spool.h"
#include "tools/vexel/pixel_bytes.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <zlib.h>

namespace {

constexpr S64 kLongest = 65535; // milliseconds that one image can stand

// A chunk being made; numbers have their highest byte first.
class Chunk {
public:
    // Four letters.
    explicit Chunk(const char* name) : bytes(4) { Put({reinterpret_cast<const U8*>(name), 4}); }

    Chunk& Put(U32 value, int size)
    {
        while (size-- > 0)
            bytes.push_back(static_cast<U8>(value >> 8 * size));
        return *this;
    }
    Chunk& Put(std::span<const U8> data)
    {
        bytes.insert(bytes.end(), data.begin(), data.end());
        return *this;
    }
    bool Write(OutputFile* file);

private:
    std::vector<U8> bytes; // length, name, data
};

bool Chunk::Write(OutputFile* file)
{
    const U32 length = static_cast<U32>(bytes.size() - 8);
    for (int i = 0; i < 4; i++)
        bytes[i] = static_cast<U8>(length >> (24 - 8 * i));
    Put(static_cast<U32>(crc32(0, bytes.data() + 4, static_cast<uInt>(length + 4))), 4);
    return file->Write(bytes);
}

class ApngSink : public PictureSink {
public:
    explicit ApngSink(const OutputName& name) : path(name.For(0)) {}

    bool Begin(const PictureForm& pictureForm) override;
    bool Add(const CBitBuffer& picture, int) override;
    bool Finish() override;

private:
    bool FailSpool();
    bool WriteHeader();
    bool WriteShot(const PictureSpool::Shot& shot, const std::vector<U32>& before);
    bool WriteImage(const SRECT& r, S64 milliseconds, bool over);
    bool LaysOver(const SRECT& r, const std::vector<U32>& before) const;
    bool PackPixels(const SRECT& r, const std::vector<U32>* before);

    std::string path;
    OutputFile file;
    PictureForm form = {};
    PictureSpool spool;
    bool opaque = true; // so far
    U32 sequence = 0;   // of the next chunk that is counted
    std::vector<U8> pixels;
    std::vector<U8> packed;
};

bool ApngSink::FailSpool()
{
    return Fail(path, Format("cannot keep its pictures: %s", std::strerror(errno)));
}

bool ApngSink::Begin(const PictureForm& pictureForm)
{
    form = pictureForm;
    if (!file.Open(path))
        return Fail(path, file.error);
    return spool.Open(form.width, form.height) || FailSpool();
}

bool ApngSink::Add(const CBitBuffer& picture, int)
{
    if (!spool.Add(picture))
        return FailSpool();
    const auto seen = [](U32 pixel) { return pixel >> 24 == 255; };
    opaque = opaque && (!form.alpha || std::all_of(spool.canvas.begin(), spool.canvas.end(), seen));
    return true;
}

S64 Images(S64 milliseconds)
{
    return (milliseconds + kLongest - 1) / kLongest;
}

bool ApngSink::WriteHeader()
{
    constexpr U8 kSignature[] = {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'};
    S64 images = 0;
    for (const PictureSpool::Shot& shot : spool.shots)
        images += Images(S64(shot.pictures) * form.delay);
    Chunk header("IHDR");
    header.Put(static_cast<U32>(form.width), 4).Put(static_cast<U32>(form.height), 4);
    header.Put(8, 1).Put(opaque ? 2 : 6, 1).Put(0, 3);
    Chunk animation("acTL");
    animation.Put(static_cast<U32>(images), 4).Put(0, 4); // for ever
    return file.Write(kSignature) && header.Write(&file) && animation.Write(&file);
}

// What changed is opaque now, so that the rest of the rectangle can be left out.
bool ApngSink::LaysOver(const SRECT& r, const std::vector<U32>& before) const
{
    if (opaque || sequence == 0)
        return false;
    for (S32 y = r.ymin; y < r.ymax; y++) {
        const size_t start = static_cast<size_t>(y) * form.width;
        for (size_t i = start + r.xmin; i < start + r.xmax; i++) {
            if (spool.canvas[i] != before[i] && spool.canvas[i] >> 24 != 255)
                return false;
        }
    }
    return true;
}

// Puts the rectangle into `packed`; where a picture before is given, what it shows already is left
// transparent. False when there is no memory.
bool ApngSink::PackPixels(const SRECT& r, const std::vector<U32>* before)
{
    const size_t w = static_cast<size_t>(r.xmax - r.xmin);
    std::vector<U32> row(w);
    pixels.resize((w * (opaque ? 3 : 4) + 1) * static_cast<size_t>(r.ymax - r.ymin));
    U8* to = pixels.data();
    for (S32 y = r.ymin; y < r.ymax; y++) {
        const size_t start = static_cast<size_t>(y) * form.width + r.xmin;
        for (size_t x = 0; x < w; x++) {
            const U32 pixel = spool.canvas[start + x];
            row[x] = before != nullptr && pixel == (*before)[start + x] ? 0 : pixel;
        }
        *to++ = 0; // flat areas and runs pack best without a filter
        to = (opaque ? PutRgb : PutRgba)(row.data(), static_cast<S32>(w), to);
    }
    uLongf size = compressBound(static_cast<uLong>(pixels.size()));
    packed.resize(size);
    const int status =
        compress(packed.data(), &size, pixels.data(), static_cast<uLong>(pixels.size()));
    packed.resize(status == Z_OK ? size : 0);
    return status == Z_OK;
}

bool ApngSink::WriteImage(const SRECT& r, S64 milliseconds, bool over)
{
    const bool first = sequence == 0;
    Chunk control("fcTL");
    control.Put(sequence++, 4).Put(static_cast<U32>(r.xmax - r.xmin), 4);
    control.Put(static_cast<U32>(r.ymax - r.ymin), 4).Put(static_cast<U32>(r.xmin), 4);
    control.Put(static_cast<U32>(r.ymin), 4).Put(static_cast<U32>(milliseconds), 2).Put(1000, 2);
    control.Put(0, 1).Put(over, 1); // stays when its time is over
    Chunk data(first ? "IDAT" : "fdAT");
    if (!first)
        data.Put(sequence++, 4);
    return control.Write(&file) && data.Put(packed).Write(&file);
}

// A time that is too long for one image is made up by images that change nothing.
bool ApngSink::WriteShot(const PictureSpool::Shot& shot, const std::vector<U32>& before)
{
    SRECT r = shot.changed;
    bool over = LaysOver(r, before);
    S64 left = S64(shot.pictures) * form.delay;
    bool good = PackPixels(r, over ? &before : nullptr);
    for (; left > kLongest && good; left -= kLongest) {
        good = WriteImage(r, kLongest, over) && PackPixels({0, 1, 0, 1}, nullptr);
        r = {0, 1, 0, 1};
        over = false;
    }
    return good && WriteImage(r, left, over);
}

bool ApngSink::Finish()
{
    if (!spool.Rewind())
        return FailSpool();
    bool good = WriteHeader();
    std::vector<U32> before;
    for (size_t i = 0; i < spool.shots.size() && good; i++) {
        before = spool.canvas;
        if (!spool.Next())
            return FailSpool();
        good = WriteShot(spool.shots[i], before);
    }
    if (good && Chunk("IEND").Write(&file) && file.Commit())
        return true;
    return Fail(path, file.error.empty() ? "no memory" : file.error);
}

} // namespace

std::unique_ptr<PictureSink> MakeApngSink(const OutputName& output)
{
    return std::make_unique<ApngSink>(output);
}
