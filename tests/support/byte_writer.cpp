#include "tests/support/byte_writer.h"

#include <algorithm>
#include <cmath>

S32 RoundSteadily(double value)
{
    return S32(std::floor(value + 0.501));
}

static S32 Fixed(double value)
{
    return RoundSteadily(value * 65536);
}

static S32 Mul(S32 x, S32 y)
{
    return S32((S64(x) * y + 0x8000) >> 16);
}

Mat Mat::Scale(double sx, double sy)
{
    return {Fixed(sx), 0, 0, Fixed(sy), 0, 0};
}

Mat Mat::Rotate(double degrees)
{
    double angle = degrees * 3.14159265358979323846 / 180;
    S32 sine = Fixed(std::sin(angle)), cosine = Fixed(std::cos(angle));
    return {cosine, sine, -sine, cosine, 0, 0};
}

Mat Mat::Gradient(S32 x, S32 y, S32 w, S32 h, double degrees)
{
    Mat scale{w * 2, 0, 0, h * 2, 0, 0};
    return scale.Then(Rotate(degrees)).ThenTranslate(x, y);
}

Mat Mat::Then(const Mat& next) const
{
    return {Mul(next.a, a) + Mul(next.c, b),
            Mul(next.b, a) + Mul(next.d, b),
            Mul(next.a, c) + Mul(next.c, d),
            Mul(next.b, c) + Mul(next.d, d),
            Mul(next.a, tx) + Mul(next.c, ty) + next.tx,
            Mul(next.b, tx) + Mul(next.d, ty) + next.ty};
}

Cx Cx::Tint(Rgba towards, double amount)
{
    S32 keep = RoundSteadily(256 * (1 - amount));
    return {{keep, keep, keep, 256},
            {RoundSteadily(towards.r * amount), RoundSteadily(towards.g * amount),
             RoundSteadily(towards.b * amount), 0}};
}

int UnsignedBits(U32 value)
{
    int bits = 0;
    for (; value != 0; value >>= 1)
        bits++;
    return bits;
}

int SignedBits(S32 value)
{
    if (value == 0)
        return 0;
    return UnsignedBits(U32(value < 0 ? ~value : value)) + 1;
}

static int WidestOf(std::initializer_list<S32> values)
{
    int bits = 0;
    for (S32 value : values)
        bits = std::max(bits, SignedBits(value));
    return bits;
}

ByteWriter& ByteWriter::PutU8(U32 value)
{
    Align();
    bytes.push_back(U8(value));
    return *this;
}

ByteWriter& ByteWriter::PutU16(U32 value)
{
    return PutU8(value).PutU8(value >> 8);
}

ByteWriter& ByteWriter::PutU32(U32 value)
{
    return PutU16(value).PutU16(value >> 16);
}

ByteWriter& ByteWriter::PutString(std::string_view text)
{
    Align();
    bytes.insert(bytes.end(), text.begin(), text.end());
    return PutU8(0);
}

ByteWriter& ByteWriter::PutBytes(const std::vector<U8>& more)
{
    Align();
    bytes.insert(bytes.end(), more.begin(), more.end());
    return *this;
}

ByteWriter& ByteWriter::UB(int bits, U32 value)
{
    for (int bit = bits - 1; bit >= 0; bit--) {
        if (freeBits == 0) {
            bytes.push_back(0);
            freeBits = 8;
        }
        freeBits--;
        bytes.back() |= U8(((value >> bit) & 1) << freeBits);
    }
    return *this;
}

ByteWriter& ByteWriter::Align()
{
    freeBits = 0;
    return *this;
}

ByteWriter& ByteWriter::PutRect(const Box& box)
{
    int bits = WidestOf({box.xmin, box.xmax, box.ymin, box.ymax});
    Align().UB(5, U32(bits));
    SB(bits, box.xmin).SB(bits, box.xmax).SB(bits, box.ymin).SB(bits, box.ymax);
    return Align();
}

// One pair of a matrix's fields behind the width that both share.
static void PutPair(ByteWriter& out, S32 first, S32 second)
{
    int bits = WidestOf({first, second});
    out.UB(5, U32(bits)).SB(bits, first).SB(bits, second);
}

ByteWriter& ByteWriter::PutMatrix(const Mat& mat)
{
    bool scaled = mat.a != 0x10000 || mat.d != 0x10000;
    bool turned = mat.b != 0 || mat.c != 0;
    Align().UB(1, scaled);
    if (scaled)
        PutPair(*this, mat.a, mat.d);
    UB(1, turned);
    if (turned)
        PutPair(*this, mat.b, mat.c);
    PutPair(*this, mat.tx, mat.ty);
    return Align();
}

ByteWriter& ByteWriter::PutCx(const Cx& cx, bool alpha)
{
    int channels = alpha ? 4 : 3, bits = 0;
    bool multiplies = false, adds = false;
    for (int i = 0; i < channels; i++) {
        multiplies |= cx.mul[i] != 256;
        adds |= cx.add[i] != 0;
    }
    for (int i = 0; i < channels; i++)
        bits = std::max({bits, multiplies ? SignedBits(cx.mul[i]) : 0, SignedBits(cx.add[i])});
    Align().UB(2, U32(multiplies) | U32(adds) << 1).UB(4, U32(bits));
    for (int i = 0; multiplies && i < channels; i++)
        SB(bits, cx.mul[i]);
    for (int i = 0; adds && i < channels; i++)
        SB(bits, cx.add[i]);
    return Align();
}

ByteWriter& ByteWriter::PutColor(Rgba color, bool alpha)
{
    PutU8(color.r).PutU8(color.g).PutU8(color.b);
    return alpha ? PutU8(color.a) : *this;
}
