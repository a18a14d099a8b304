// JPEG images: libjpeg over a block of memory.
#include <algorithm>
#include <bit>
#include <cstring>

#include "core/player/limits.h"
#include "core/stream/images.h"
#include "core/stream/jpeg_guard.h"
#include "core/stream/script_player.h"

namespace {
constexpr int kMaxScans = 100;
constexpr int kMaxStreams = 16; // table streams before the image

// One image being decoded. On the stack of ReadJPEGImage, out of reach of the guard's jump.
struct JpegDecoder {
    jpeg_decompress_struct info;
    jpeg_source_mgr source;
    JpegGuard guard;
    SByteBlock tables;
    SByteBlock image;
    SCharacter* ch;
    S32 rows;     // decoded so far
    int scans;    // taken in so far, of an image in several
    int maxScans; // that are wanted
};

// The whole block is in the buffer from the start. Behind it comes an end-of-image marker, as often
// as it is wanted, so that an image that stops early ends cleanly.
boolean FillWithEnd(j_decompress_ptr info)
{
    static const JOCTET kEnd[2] = {0xFF, JPEG_EOI};
    info->src->next_input_byte = kEnd;
    info->src->bytes_in_buffer = sizeof kEnd;
    return TRUE;
}

void SkipInput(j_decompress_ptr info, long n)
{
    if (n <= 0)
        return;
    const size_t count = std::min(static_cast<size_t>(n), info->src->bytes_in_buffer);
    info->src->next_input_byte += count;
    info->src->bytes_in_buffer -= count;
}

void DoNothing(j_decompress_ptr) {}

void SetSource(JpegDecoder* d, SByteBlock block)
{
    d->source.init_source = DoNothing;
    d->source.fill_input_buffer = FillWithEnd;
    d->source.skip_input_data = SkipInput;
    d->source.resync_to_restart = jpeg_resync_to_restart;
    d->source.term_source = DoNothing;
    d->source.next_input_byte = block.data;
    d->source.bytes_in_buffer = static_cast<size_t>(std::max(block.size, 0));
    d->info.src = &d->source;
}

// Moves the source to its next start-of-image marker: movies have end markers and other bytes
// before it.
bool FindStart(jpeg_source_mgr* source)
{
    static const JOCTET kStart[2] = {0xFF, 0xD8};
    const JOCTET* end = source->next_input_byte + source->bytes_in_buffer;
    source->next_input_byte = std::search(source->next_input_byte, end, kStart, kStart + 2);
    while (end - source->next_input_byte >= 4 &&
           std::equal(kStart, kStart + 2, source->next_input_byte + 2))
        source->next_input_byte += 2; // doubled, which would be a fatal error
    source->bytes_in_buffer = static_cast<size_t>(end - source->next_input_byte);
    return source->bytes_in_buffer > 0;
}

void Create(void* decoder)
{
    auto* d = static_cast<JpegDecoder*>(decoder);
    jpeg_create_decompress(&d->info);
    d->info.mem->max_memory_to_use = static_cast<long>(std::min<U32>(gLimits.jpegBytes, kS32Max));
}

void ReadTables(void* decoder)
{
    auto* d = static_cast<JpegDecoder*>(decoder);
    SetSource(d, d->tables);
    if (FindStart(&d->source))
        jpeg_read_header(&d->info, FALSE);
}

// The tables may be a stream of their own before the image, or stand in the image's: only after
// tables alone is there another header to read.
bool ReadHeader(JpegDecoder* d)
{
    SetSource(d, d->image);
    for (int i = 0; i < kMaxStreams && FindStart(&d->source); ++i) {
        if (jpeg_read_header(&d->info, FALSE) == JPEG_HEADER_OK)
            return d->info.num_components == 1 || d->info.num_components == 3;
    }
    return false;
}

// An image in several scans is taken in as a whole first, up to the scans that it is worth; then
// the output is what those scans have made of it.
void AbsorbScans(JpegDecoder* d)
{
    jpeg_decompress_struct* info = &d->info;
    const U64 pixels = U64(info->image_width) * info->image_height;
    const U64 worth = std::clamp<U64>(gLimits.jpegScanPixels / pixels, 1, kMaxScans);
    const int wanted = std::min(d->maxScans, static_cast<int>(worth));
    d->scans = 0;
    while (d->scans < wanted && !jpeg_input_complete(info)) {
        if (jpeg_consume_input(info) != JPEG_SCAN_COMPLETED)
            continue;
        d->scans++;
        d->ch->player->ChargePixels(pixels);
    }
    jpeg_start_output(info, d->scans);
}

// Reads each pixel as one word, a byte more than it has: the line is that much longer.
void StoreLine(const JSAMPLE* line, U8* row, S32 width)
{
    for (S32 x = 0; x < width; ++x, line += 3, row += 4) {
        U32 v;
        std::memcpy(&v, line, sizeof v);
        if (std::endian::native == std::endian::little)
            v = (v & 0xFF) << 16 | (v & 0xFF00) | (v >> 16 & 0xFF);
        else
            v >>= 8;
        v |= 0xFF000000u;
        std::memcpy(row, &v, sizeof v);
    }
}

// The line is misaligned on purpose: an aligned one the library may write past the cache, and
// reading it back takes longer than all the decoding.
void ReadLines(JpegDecoder* d)
{
    jpeg_decompress_struct* info = &d->info;
    const SBitmapCore& bitmap = d->ch->bitmap;
    JSAMPARRAY lines = info->mem->alloc_sarray(reinterpret_cast<j_common_ptr>(info), JPOOL_IMAGE,
                                               info->output_width * 3 + 2, 1);
    JSAMPROW line = lines[0] + 1;
    while (d->rows < bitmap.height && jpeg_read_scanlines(info, &line, 1) == 1) {
        StoreLine(line, bitmap.baseAddr + ptrdiff_t(d->rows) * bitmap.rowBytes, bitmap.width);
        d->rows++;
    }
}

// What is left to choice is pinned, so that the same movie gives the same pixels everywhere.
void SetParameters(jpeg_decompress_struct* info)
{
    info->out_color_space = JCS_RGB;
    info->dct_method = JDCT_ISLOW;
    info->do_fancy_upsampling = TRUE;
    info->do_block_smoothing = FALSE;
    info->buffered_image = jpeg_has_multiple_scans(info);
}

void Decode(void* decoder)
{
    auto* d = static_cast<JpegDecoder*>(decoder);
    jpeg_decompress_struct* info = &d->info;
    if (!ReadHeader(d))
        return;
    const auto width = static_cast<S32>(info->image_width);
    const auto height = static_cast<S32>(info->image_height);
    if (!d->ch->bitmap.baseAddr && !d->ch->player->CreatePixels(d->ch, 5, width, height, nullptr))
        return;
    SetParameters(info);
    jpeg_start_decompress(info);
    if (info->buffered_image)
        AbsorbScans(d);
    ReadLines(d);
}

// Broken tables leave those that were read before the break. An aborted decoder keeps its tables.
void Run(JpegDecoder* d)
{
    d->info = {};
    d->info.err = JpegGuardInit(&d->guard);
    if (JpegGuardRun(&d->guard, Create, d)) {
        JpegGuardRun(&d->guard, ReadTables, d);
        jpeg_abort_decompress(&d->info);
        JpegGuardRun(&d->guard, Decode, d);
    }
    jpeg_destroy_decompress(&d->info);
}
} // namespace

S32 ReadJPEGImage(SByteBlock tables, SByteBlock image, SCharacter* ch)
{
    JpegDecoder d = {};
    d.tables = tables;
    d.image = image;
    d.ch = ch;
    d.maxScans = kMaxScans;
    Run(&d);
    // A break between two scans: those before it are whole, and make a coarser picture.
    if (d.rows == 0 && d.scans > 0) {
        d.maxScans = d.scans;
        Run(&d);
    }
    return d.rows;
}
