#include "tools/vexel/png.h"

#include "tools/vexel/pixel_bytes.h"

#include <png.h>

namespace {

// Everything that must live across libpng's jump back on an error; plain data only.
struct Encoder {
    png_structp png = nullptr;
    png_infop info = nullptr;
    GrowBuffer<U8>* out;
    GrowBuffer<U8> row;
};

void Append(png_structp png, png_bytep data, size_t n)
{
    GrowBuffer<U8>* out = static_cast<GrowBuffer<U8>*>(png_get_io_ptr(png));
    const size_t size = out->size();
    if (!out->Reserve(size + n) || !out->Resize(size + n))
        png_error(png, "memory");
    std::memcpy(out->data() + size, data, n);
}

void Nothing(png_structp) {}

// Its message is of no use here: the only failure is a full heap.
[[noreturn]] void Fail(png_structp png, png_const_charp)
{
    png_longjmp(png, 1);
}

void Ignore(png_structp, png_const_charp) {}

void WriteRows(Encoder* e, const CBitBuffer& picture, bool alpha)
{
    for (S32 y = 0; y < picture.Height(); y++) {
        (alpha ? PutRgba : PutRgb)(picture.Row32(y), picture.Width(), e->row.data());
        png_write_row(e->png, e->row.data());
    }
}

bool Encode(Encoder* e, const CBitBuffer& picture, bool alpha)
{
    if (setjmp(png_jmpbuf(e->png)) != 0)
        return false;
    png_set_write_fn(e->png, e->out, Append, Nothing);
    // Flat areas and runs are what these pictures are made of: the row filters and the thorough
    // levels cost more time and mostly make larger files.
    png_set_filter(e->png, PNG_FILTER_TYPE_BASE, PNG_FILTER_NONE);
    png_set_compression_level(e->png, 2);
    png_set_IHDR(e->png, e->info, static_cast<png_uint_32>(picture.Width()),
                 static_cast<png_uint_32>(picture.Height()), 8,
                 alpha ? PNG_COLOR_TYPE_RGB_ALPHA : PNG_COLOR_TYPE_RGB, PNG_INTERLACE_NONE,
                 PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
    png_write_info(e->png, e->info);
    WriteRows(e, picture, alpha);
    png_write_end(e->png, nullptr);
    return true;
}

} // namespace

bool EncodePng(const CBitBuffer& picture, bool alpha, GrowBuffer<U8>* png)
{
    Encoder e;
    e.out = png;
    png->Clear();
    if (!e.row.Resize(static_cast<size_t>(picture.Width()) * (alpha ? 4 : 3)))
        return false;
    e.png = png_create_write_struct(PNG_LIBPNG_VER_STRING, nullptr, Fail, Ignore);
    e.info = e.png != nullptr ? png_create_info_struct(e.png) : nullptr;
    const bool done = e.info != nullptr && Encode(&e, picture, alpha);
    png_destroy_write_struct(&e.png, &e.info);
    return done;
}
