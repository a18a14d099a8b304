// Image tags: their pixels are decoded when something is to be painted with them.
#include "core/stream/images.h"

#include <algorithm>
#include <bit>
#include <cstring>

#include <zlib.h>

#include "core/stream/script_player.h"
#include "core/stream/tags.h"

namespace {
constexpr S32 kMaxTagBytes = 0x20000000; // no image tag is that long, header included
constexpr size_t kAlphaPiece = 0x800;    // bytes of an alpha plane inflated at once

// A reader of its own over the tag of an image, from its header on.
struct ImageTag : SParser {
    explicit ImageTag(const SCharacter& ch) { Attach(ch.data, ch.DataLen()); }

    // Takes n bytes, or as many as the tag still has.
    SByteBlock Take(U32 n)
    {
        const SByteBlock block = {script + pos, S32(std::min(n, U32(tagEnd - pos)))};
        pos += block.size;
        return block;
    }
    SByteBlock TakeRest() { return Take(U32(tagEnd - pos)); }
};

// Inflates a block piece by piece.
class Inflater {
public:
    explicit Inflater(SByteBlock block)
    {
        stream.next_in = const_cast<U8*>(block.data);
        stream.avail_in = static_cast<uInt>(block.size);
        good = inflateInit(&stream) == Z_OK;
    }
    ~Inflater() { inflateEnd(&stream); }
    Inflater(const Inflater&) = delete;
    Inflater& operator=(const Inflater&) = delete;

    // The next n bytes; returns how many there were, fewer where the data ends or breaks.
    size_t Read(U8* dst, size_t n)
    {
        if (!good || n == 0)
            return 0;
        stream.next_out = dst;
        stream.avail_out = static_cast<uInt>(n);
        good = inflate(&stream, Z_SYNC_FLUSH) == Z_OK;
        return n - stream.avail_out;
    }

private:
    z_stream stream = {};
    bool good;
};

// The colour with no channel above the given alpha, and that alpha.
U32 LowerToAlpha(U32 color, U32 alpha)
{
    return alpha << 24 | std::min(color >> 16 & 0xFF, alpha) << 16 |
           std::min(color >> 8 & 0xFF, alpha) << 8 | std::min(color & 0xFF, alpha);
}

U32* Words(const SBitmapCore& bitmap)
{
    return reinterpret_cast<U32*>(bitmap.baseAddr);
}

size_t ByteCount(const SBitmapCore& bitmap)
{
    return static_cast<size_t>(bitmap.rowBytes) * static_cast<size_t>(bitmap.height);
}

// Entries that the data does not reach stay zero.
void ReadColorTable(Inflater& data, bool alpha, SColorTable* table)
{
    const size_t entryBytes = alpha ? 4 : 3;
    U8 bytes[256 * 4];
    const size_t entries = data.Read(bytes, table->count * entryBytes) / entryBytes;
    for (size_t i = 0; i < entries; ++i) {
        const U8* c = bytes + i * entryBytes;
        const U32 rgb = U32(c[0]) << 16 | U32(c[1]) << 8 | c[2];
        table->colors[i] = LowerToAlpha(rgb, alpha ? c[3] : 255);
    }
}

// Some byte of the rows holds an index beyond the table, which is transparent black.
bool LeavesTable(const SBitmapCore& bitmap)
{
    const U32 bits = U32(SBitmapBitsPerPixel(bitmap.bmFormat)), mask = (1u << bits) - 1;
    if (bitmap.cTab->count > mask)
        return false;
    bool beyond[256] = {};
    for (U32 byte = 0; byte < 256; ++byte) {
        for (U32 shift = 0; shift < 8; shift += bits)
            beyond[byte] = beyond[byte] || (byte >> shift & mask) >= bitmap.cTab->count;
    }
    const U32 used = (U32(bitmap.width) * bits + 7) / 8;
    for (S32 y = 0; y < bitmap.height; ++y) {
        const U8* row = bitmap.baseAddr + ptrdiff_t(y) * bitmap.rowBytes;
        if (std::any_of(row, row + used, [&](U8 byte) { return beyond[byte]; }))
            return true;
    }
    return false;
}

// Words as they stand in movies have their high byte first.
void MakeNative(SBitmapCore& bitmap, size_t bytes)
{
    if (std::endian::native == std::endian::little)
        SBitmapSwapBits(bitmap.baseAddr, bytes, bitmap.bmFormat);
}

// Without alpha the first byte of a pixel is filling.
void FinishWords(SBitmapCore& bitmap, size_t words, bool alpha)
{
    U32* word = Words(bitmap);
    for (U32* end = word + words; word < end; ++word) {
        if (!alpha)
            *word |= 0xFF000000u;
        else if (*word >> 24 != 255)
            *word = LowerToAlpha(*word, *word >> 24);
    }
}

// `got` bytes of the rows have come from the tag, the others are zero.
void FinishLossless(SBitmapCore& bitmap, size_t got, bool alpha)
{
    if (bitmap.bmFormat >= 4) {
        const size_t torn = got % (bitmap.bmFormat == 4 ? 2 : 4);
        got -= torn;
        std::memset(bitmap.baseAddr + got, 0, torn);
        MakeNative(bitmap, (got + 3) & ~size_t{3});
    }
    if (bitmap.bmFormat == 5)
        FinishWords(bitmap, got / 4, alpha);
    const bool holes =
        bitmap.cTab ? LeavesTable(bitmap) : bitmap.bmFormat == 5 && got < ByteCount(bitmap);
    bitmap.transparent = alpha || bitmap.transparent || holes;
}

void DecodeLossless(ImageTag& tag, SCharacter* ch)
{
    const bool alpha = tag.tagCode == kTagDefineBitsLossless2;
    const int format = tag.GetByte();
    const S32 width = tag.GetWord();
    const S32 height = tag.GetWord();
    const bool mapped = format < 4;
    SColorTable table = {};
    table.count = mapped ? tag.GetByte() + 1u : 0;
    Inflater data(tag.TakeRest());
    if (mapped)
        ReadColorTable(data, alpha, &table);
    if (!ch->player->CreatePixels(ch, format, width, height, mapped ? &table : nullptr))
        return;
    const size_t got = data.Read(ch->bitmap.baseAddr, ByteCount(ch->bitmap));
    FinishLossless(ch->bitmap, got, alpha);
}

// One byte a pixel, whatever the padding of the store; pixels that it does not reach stay opaque.
void ReadAlphaPlane(SByteBlock block, SBitmapCore& bitmap, S32 rows)
{
    Inflater data(block);
    U8 piece[kAlphaPiece];
    U32* word = Words(bitmap);
    size_t left = static_cast<size_t>(rows) * static_cast<size_t>(bitmap.width);
    while (size_t n = data.Read(piece, std::min(left, kAlphaPiece))) {
        for (size_t i = 0; i < n; ++i) {
            if (piece[i] != 255)
                word[i] = LowerToAlpha(word[i], piece[i]);
        }
        word += n;
        left -= n;
    }
}

void DecodeJPEG(ImageTag& tag, SByteBlock tables, SCharacter* ch)
{
    const bool alpha = tag.tagCode == kTagDefineBitsJPEG3;
    const SByteBlock image = alpha ? tag.Take(tag.GetDWord()) : tag.TakeRest();
    const S32 rows = ReadJPEGImage(tables, image, ch);
    if (rows == 0)
        return ch->player->DropPixels(ch);
    if (alpha)
        ReadAlphaPlane(tag.TakeRest(), ch->bitmap, rows);
    ch->bitmap.transparent = alpha || rows < ch->bitmap.height;
}

void DecodeImage(SCharacter* ch)
{
    ImageTag tag(*ch);
    const S32 code = tag.GetTag(tag.limit);
    if (code < 0 || tag.tagEnd >= kMaxTagBytes)
        return;
    tag.GetWord(); // the id
    ScriptPlayer* movie = ch->player;
    switch (code) {
    case kTagDefineBits:
        movie->retryImage = !movie->jpegInfo;
        if (movie->jpegInfo)
            DecodeJPEG(tag, {movie->jpegInfo, movie->jpegInfoLen}, ch);
        return;
    case kTagDefineBitsJPEG2:
    case kTagDefineBitsJPEG3:
        return DecodeJPEG(tag, {nullptr, 0}, ch);
    case kTagDefineBitsLossless:
    case kTagDefineBitsLossless2:
        return DecodeLossless(tag, ch);
    }
}
} // namespace

bool ScriptThread::BuildBits(SCharacter* ch)
{
    if (!ch || ch->type != kCharBitmap)
        return false;
    if (!ch->bitmap.baseAddr && !ch->bitmap.buildFailed) {
        ch->player->retryImage = false;
        DecodeImage(ch);
        ch->bitmap.buildFailed = !ch->bitmap.baseAddr && !ch->player->retryImage;
    }
    return ch->bitmap.baseAddr != nullptr;
}
