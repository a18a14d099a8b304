#include "tools/vexel/picture_spool.h"

#include <algorithm>
#include <cerrno>
#include <zlib.h>

namespace {

// The first and the end of the columns from `low` to `high` that must be looked at in one row.
template <typename T> void Widen(const T* a, const T* b, S32 width, S32* low, S32* high)
{
    S32 x = 0;
    while (x < *low && a[x] == b[x])
        x++;
    *low = x;
    x = width;
    while (x > *high && a[x - 1] == b[x - 1])
        x--;
    *high = x;
}

// A block of bytes with its length before it.
bool WriteBlock(std::FILE* file, const U8* bytes, uLongf size)
{
    return std::fwrite(&size, sizeof size, 1, file) == 1 &&
           std::fwrite(bytes, 1, size, file) == size;
}

bool ReadBlock(std::FILE* file, std::vector<U8>* bytes)
{
    uLongf size = 0;
    if (std::fread(&size, sizeof size, 1, file) != 1)
        return false;
    bytes->resize(size);
    return std::fread(bytes->data(), 1, size, file) == size;
}

} // namespace

template <typename T>
SRECT ChangedRect(const std::vector<T>& before, const std::vector<T>& after, S32 width)
{
    const S32 height = static_cast<S32>(after.size()) / width;
    SRECT r = {width, 0, height, 0};
    for (S32 y = 0; y < height; y++) {
        const size_t row = static_cast<size_t>(y) * static_cast<size_t>(width);
        const T* a = before.data() + row;
        const T* b = after.data() + row;
        if (std::equal(a, a + width, b))
            continue;
        Widen(a, b, width, &r.xmin, &r.xmax);
        r.ymin = std::min(r.ymin, y);
        r.ymax = y + 1;
    }
    return r.ymax > 0 ? r : SRECT{0, 0, 0, 0};
}
template SRECT ChangedRect(const std::vector<U8>&, const std::vector<U8>&, S32);
template SRECT ChangedRect(const std::vector<U32>&, const std::vector<U32>&, S32);

PictureSpool::~PictureSpool()
{
    if (file != nullptr)
        std::fclose(file);
}

bool PictureSpool::Open(S32 pictureWidth, S32 pictureHeight)
{
    width = pictureWidth;
    height = pictureHeight;
    canvas.resize(static_cast<size_t>(width) * static_cast<size_t>(height));
    next.resize(canvas.size());
    file = std::tmpfile();
    return file != nullptr;
}

// These blocks live for seconds: the fastest packing is right.
bool PictureSpool::Pack(const SRECT& r)
{
    std::vector<U32> part;
    for (S32 y = r.ymin; y < r.ymax; y++)
        part.insert(part.end(), RowOf(y) + r.xmin, RowOf(y) + r.xmax);
    const uLong bytes = static_cast<uLong>(part.size() * sizeof(U32));
    uLongf size = compressBound(bytes);
    packed.resize(size);
    if (compress2(packed.data(), &size, reinterpret_cast<const U8*>(part.data()), bytes,
                  Z_BEST_SPEED) != Z_OK) {
        errno = ENOMEM;
        return false;
    }
    return WriteBlock(file, packed.data(), size);
}

bool PictureSpool::Add(const CBitBuffer& picture)
{
    for (S32 y = 0; y < height; y++)
        std::copy_n(picture.Row32(y), width, next.data() + static_cast<size_t>(y) * width);
    SRECT r = {0, width, 0, height};
    if (!shots.empty())
        r = ChangedRect(canvas, next, width);
    if (r.xmin == r.xmax) {
        shots.back().pictures++;
        return true;
    }
    canvas.swap(next);
    shots.push_back({r, 1});
    return Pack(r);
}

bool PictureSpool::Rewind()
{
    return std::fflush(file) == 0 && std::fseek(file, 0, SEEK_SET) == 0;
}

bool PictureSpool::Next()
{
    const SRECT& r = shots[read++].changed;
    const size_t w = static_cast<size_t>(r.xmax - r.xmin);
    next.resize(w * static_cast<size_t>(r.ymax - r.ymin));
    uLongf size = static_cast<uLongf>(next.size() * sizeof(U32));
    if (!ReadBlock(file, &packed) ||
        uncompress(reinterpret_cast<U8*>(next.data()), &size, packed.data(),
                   static_cast<uLong>(packed.size())) != Z_OK) {
        errno = EIO;
        return false;
    }
    for (S32 y = r.ymin; y < r.ymax; y++)
        std::copy_n(next.data() + static_cast<size_t>(y - r.ymin) * w, w, RowOf(y) + r.xmin);
    return true;
}
