#pragma once

#include "core/geom/types.h"

#include <string_view>
#include <vector>

// An unpremultiplied colour as it stands in a movie, channels 0..255.
struct Rgba {
    U8 r = 0, g = 0, b = 0, a = 255;
};

// A rectangle in twips, in the order of the wire.
struct Box {
    S32 xmin = 0, xmax = 0, ymin = 0, ymax = 0;
};

// A place in twips.
struct Pt {
    S32 x = 0, y = 0;
};

// The nearest integer, the same on every machine: the halfway point is moved a little, so that a
// value that ought to be a half is never left to the last bit of a floating-point result.
S32 RoundSteadily(double value);

// A placement: x' = a x + c y + tx, y' = b x + d y + ty; a to d in 16.16, tx and ty in twips.
struct Mat {
    S32 a = 0x10000, b = 0, c = 0, d = 0x10000, tx = 0, ty = 0;

    static Mat Identity() { return {}; }
    static Mat Translate(S32 x, S32 y) { return {0x10000, 0, 0, 0x10000, x, y}; }
    static Mat Scale(double s) { return Scale(s, s); }
    static Mat Scale(double sx, double sy) { return {Fixed(sx), 0, 0, Fixed(sy), 0, 0}; }
    static Mat Rotate(double degrees); // clockwise, as y points down
    // Lays the gradient square (16384 units each way) over a box of w by h twips round (x, y),
    // turned by the angle; a linear gradient then runs from its left to its right edge.
    static Mat Gradient(S32 x, S32 y, S32 w, S32 h, double degrees = 0)
    {
        return Mat{w * 2, 0, 0, h * 2, 0, 0}.Then(Rotate(degrees)).ThenTranslate(x, y);
    }

    // This placement first, the other after it.
    Mat Then(const Mat& next) const;
    Mat ThenTranslate(S32 x, S32 y) const { return Then(Translate(x, y)); }

    static S32 Fixed(double value) { return RoundSteadily(value * 65536); } // to 16.16
};

// A colour transform: channel * mul / 256 + add, in the order red, green, blue, alpha.
struct Cx {
    S32 mul[4] = {256, 256, 256, 256};
    S32 add[4] = {0, 0, 0, 0};

    static Cx Multiply(S32 r, S32 g, S32 b, S32 a = 256) { return {{r, g, b, a}, {}}; }
    static Cx Add(S32 r, S32 g, S32 b, S32 a = 0) { return {{256, 256, 256, 256}, {r, g, b, a}}; }
    static Cx Alpha(double part) { return Multiply(256, 256, 256, RoundSteadily(part * 256)); }
    // Moves every colour towards the given one: amount 0 leaves it, 1 replaces it.
    static Cx Tint(Rgba towards, double amount);
};

// Grows a block of bytes in the order the player reads it: little-endian numbers, bit fields most
// significant bit first. Every byte-sized verb begins at a byte boundary, and pads with zeros
// to get there.
class ByteWriter {
public:
    ByteWriter& PutU8(U32 value) { return Align().UB(8, value); }
    ByteWriter& PutU16(U32 value) { return PutU8(value).PutU8(value >> 8); }
    ByteWriter& PutU32(U32 value) { return PutU16(value).PutU16(value >> 16); }
    ByteWriter& PutBytes(const std::vector<U8>& more);
    ByteWriter& PutString(std::string_view s) { return PutBytes({s.begin(), s.end()}).PutU8(0); }
    ByteWriter& UB(int bits, U32 value);
    ByteWriter& SB(int bits, S32 value) { return UB(bits, U32(value)); }
    // The width that the widest of some signed values needs, then the values in that width.
    ByteWriter& Fields(int widthBits, const std::vector<S32>& values);
    ByteWriter& Align();

    // Records, each aligned at both ends and as narrow as its values allow.
    ByteWriter& PutRect(const Box& box)
    {
        return Align().Fields(5, {box.xmin, box.xmax, box.ymin, box.ymax}).Align();
    }
    ByteWriter& PutMatrix(const Mat& mat);
    ByteWriter& PutCx(const Cx& cx, bool alpha);
    ByteWriter& PutColor(Rgba color, bool alpha);

    size_t Size() const { return bytes.size(); }
    const std::vector<U8>& Bytes() const { return bytes; }

private:
    std::vector<U8> bytes;
    int freeBits = 0; // unused low bits of the last byte
};

// The fewest bits that hold an unsigned value, or all of some signed ones; 0 needs none.
int UnsignedBits(U32 value);
int SignedBits(const std::vector<S32>& values);
