// SParser: the byte and bit reader over movie data that every other reader of the stream builds on.
#pragma once

#include "core/geom/matrix.h"
#include "core/geom/rect.h"
#include "core/geom/types.h"
#include "core/raster/color.h"

// Reads little-endian integers and most-significant-first bit fields. A reader is attached by
// setting `script`, `pos` and `limit`; it owns nothing. Lengths written in tags are trusted for the
// result, never for memory: a byte at or beyond `limit` reads as 0 and `pos` does not move past it,
// and the data behind a reader always carries one zero byte at `limit`, so that strings end.
class SParser {
public:
    const U8* script = nullptr; // start of the data
    S32 pos = 0;                // next byte to read, relative to script; 0 <= pos <= limit
    U32 bitBuf = 0;             // unread low bits of the last byte that the bit reader fetched
    S32 bitPos = 0;             // how many bits of bitBuf are unread, 0..8
    S32 tagStart = 0;           // header of the current tag
    S32 tagEnd = 0;             // first byte after the current tag's body
    S32 tagCode = 0;            // code of the current tag
    S32 limit = 0;              // first byte that must not be read: end of the block of memory

    // Attaches to `size` bytes at `data`, from `start`.
    void Attach(const U8* data, S32 size, S32 start = 0);

    // The next bit read starts at byte `pos`.
    void InitBits()
    {
        bitPos = 0;
        bitBuf = 0;
    }
    // An unsigned field of n bits, n = 0..32; other n count as 0 or 32. 0 bits read nothing.
    U32 GetBits(S32 n);
    // The same bits, sign-extended.
    S32 GetSBits(S32 n);

    // Whole bytes at `pos`; they ignore the bit reader's state.
    U8 GetByte() { return pos < limit ? script[pos++] : U8(0); }
    U16 GetWord();
    U32 GetDWord();

    void GetRect(SRECT* r);
    void GetMatrix(MATRIX* m);
    // `alpha`: the form that has alpha terms.
    void GetColorTransform(ColorTransform* cx, int alpha);
    // RGB, or RGBA when `alpha`; without it the alpha is 255.
    SRGB GetColor(int alpha);
    void GetColor(RGBI* c, int alpha);

    // The string at `pos`, owned by the data; `pos` moves past its zero byte.
    const char* GetStringP();
    // The string at `pos`, without moving.
    const char* PeekString() const;
    // GetStringP's as a heap copy, freed by the caller with FreeStr.
    char* GetString();

    // Copies min(n, bytes left in the tag) bytes to dst and returns how many.
    S32 GetData(void* dst, S32 n);

    // Reads the tag header at `pos`, with data present up to `len`. Returns the code and leaves
    // `pos` at the body; returns -1 with `pos` unmoved when the header or the body is not all
    // there.
    S32 GetTag(S32 len);

    // Moves forward by n bytes, not past the limit; a negative n does nothing.
    void Skip(S32 n);

protected:
    SParser() = default;
    ~SParser() = default;

private:
    S32 Incomplete();
};

// A reader of its own for looking through tags without disturbing the timeline that owns them.
struct STagWalker : SParser {
    STagWalker(const SParser& source, S32 start) { Attach(source.script, source.limit, start); }
};
