#include "tests/support/image_writer.h"

#include <cstdio>
#include <cstdlib>

#include <jpeglib.h>
#include <zlib.h>

std::vector<U8> Deflated(const std::vector<U8>& bytes)
{
    uLongf size = compressBound(bytes.size());
    std::vector<U8> out(size);
    compress(out.data(), &size, bytes.data(), bytes.size());
    return {out.begin(), out.begin() + S64(size)};
}

// Words have their high byte first; rows are padded to 32 bits.
std::vector<U8> LosslessBody(const ImageSource& image, bool alpha)
{
    ByteWriter body, data, rows;
    body.PutU8(U32(image.format)).PutU16(U32(image.width)).PutU16(U32(image.height));
    if (image.format < 4)
        body.PutU8(U32(image.table.size()) - 1);
    for (Rgba color : image.table)
        data.PutColor(color, alpha);
    for (size_t i = 1; i <= image.pixels.size(); i++) {
        rows.UB(1 << image.format, image.pixels[i - 1]);
        while (i % size_t(image.width) == 0 && rows.Align().Size() % 4)
            rows.PutU8(0);
    }
    return body.PutBytes(Deflated(data.PutBytes(rows.Bytes()).Bytes())).Bytes();
}

// The words are handed over as the bytes they are on a little-endian machine. Both streams go to
// one block of memory, one after the other.
JpegStreams MakeJpeg(const ImageSource& image, bool progressive, bool inks)
{
    jpeg_compress_struct info = {};
    jpeg_error_mgr errors;
    U8* data = nullptr;
    unsigned long size = 0;
    info.err = jpeg_std_error(&errors);
    jpeg_create_compress(&info);
    jpeg_mem_dest(&info, &data, &size);
    info.image_width = unsigned(image.width);
    info.image_height = unsigned(image.height);
    info.input_components = 4;
    info.in_color_space = inks ? JCS_CMYK : JCS_EXT_BGRX;
    jpeg_set_defaults(&info);
    if (progressive)
        jpeg_simple_progression(&info);
    jpeg_write_tables(&info);
    const size_t split = size;
    jpeg_start_compress(&info, FALSE);
    for (size_t at = 0; at < image.pixels.size(); at += info.image_width) {
        JSAMPROW row = (JSAMPROW)&image.pixels[at];
        jpeg_write_scanlines(&info, &row, 1);
    }
    jpeg_finish_compress(&info);
    jpeg_destroy_compress(&info);
    JpegStreams made = {{data, data + split}, {data + split, data + size}, {data, data + size}};
    made.whole.erase(made.whole.begin() + S64(split) - 2, made.whole.begin() + S64(split) + 2);
    std::free(data);
    return made;
}
