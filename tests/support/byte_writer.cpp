#include "tests/support/byte_writer.h"

#include <algorithm>
#include <cmath>

S32 RoundSteadily(double value)
{
    return S32(std::floor(value + 0.501));
}

Mat Mat::Rotate(double degrees)
{
    double angle = degrees * 3.14159265358979323846 / 180;
    S32 sine = Fixed(std::sin(angle)), cosine = Fixed(std::cos(angle));
    return {cosine, sine, -sine, cosine, 0, 0};
}

Mat Mat::Then(const Mat& n) const
{
    auto mul = [](S32 x, S32 y) { return S32((S64(x) * y + 0x8000) >> 16); };
    return {mul(n.a, a) + mul(n.c, b),          mul(n.b, a) + mul(n.d, b),
            mul(n.a, c) + mul(n.c, d),          mul(n.b, c) + mul(n.d, d),
            mul(n.a, tx) + mul(n.c, ty) + n.tx, mul(n.b, tx) + mul(n.d, ty) + n.ty};
}

Cx Cx::Tint(Rgba towards, double amount)
{
    S32 keep = RoundSteadily(256 * (1 - amount));
    auto part = [amount](U8 channel) { return RoundSteadily(channel * amount); };
    return {{keep, keep, keep, 256}, {part(towards.r), part(towards.g), part(towards.b), 0}};
}

int UnsignedBits(U32 value)
{
    return value == 0 ? 0 : 1 + UnsignedBits(value >> 1);
}

int SignedBits(const std::vector<S32>& values)
{
    int bits = 0;
    for (S32 value : values)
        bits = std::max(bits, value == 0 ? 0 : 1 + UnsignedBits(U32(value < 0 ? ~value : value)));
    return bits;
}

ByteWriter& ByteWriter::PutBytes(const std::vector<U8>& more)
{
    bytes.insert(bytes.end(), more.begin(), more.end());
    return Align();
}

ByteWriter& ByteWriter::UB(int bits, U32 value)
{
    for (int bit = bits - 1; bit >= 0; bit--) {
        if (freeBits == 0)
            bytes.push_back(0);
        freeBits = (freeBits + 7) % 8;
        bytes.back() |= U8(((value >> bit) & 1) << freeBits);
    }
    return *this;
}

ByteWriter& ByteWriter::Fields(int widthBits, const std::vector<S32>& values)
{
    const int bits = SignedBits(values);
    UB(widthBits, U32(bits));
    for (S32 value : values)
        SB(bits, value);
    return *this;
}

ByteWriter& ByteWriter::Align()
{
    freeBits = 0;
    return *this;
}

ByteWriter& ByteWriter::PutMatrix(const Mat& mat)
{
    bool scaled = mat.a != 0x10000 || mat.d != 0x10000;
    bool turned = mat.b != 0 || mat.c != 0;
    Align().UB(1, scaled);
    if (scaled)
        Fields(5, {mat.a, mat.d});
    UB(1, turned);
    if (turned)
        Fields(5, {mat.b, mat.c});
    return Fields(5, {mat.tx, mat.ty}).Align();
}

ByteWriter& ByteWriter::PutCx(const Cx& cx, bool alpha)
{
    const Cx none;
    const int channels = alpha ? 4 : 3;
    std::vector<S32> values;
    bool multiplies = !std::equal(cx.mul, cx.mul + channels, none.mul);
    bool adds = !std::equal(cx.add, cx.add + channels, none.add);
    if (multiplies)
        values.assign(cx.mul, cx.mul + channels);
    if (adds)
        values.insert(values.end(), cx.add, cx.add + channels);
    return Align().UB(2, U32(multiplies) | U32(adds) << 1).Fields(4, values).Align();
}

ByteWriter& ByteWriter::PutColor(Rgba color, bool alpha)
{
    PutU8(color.r).PutU8(color.g).PutU8(color.b);
    return alpha ? PutU8(color.a) : *this;
}
