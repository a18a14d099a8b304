#include "tests/support/movie_writer.h"

TagWriter& TagWriter::Raw(int code, const std::vector<U8>& body, bool forceLong)
{
    bool isLong = forceLong || body.size() > 62;
    tags.PutU16(U32(code) << 6 | (isLong ? 63 : U32(body.size())));
    if (isLong)
        tags.PutU32(U32(body.size()));
    tags.PutBytes(body);
    frames += code == kTagShowFrame;
    return *this;
}

TagWriter& TagWriter::DefineShape(U16 id, int code, const Box& bounds, const ShapeBuilder& shape)
{
    ByteWriter body = Numbers(id).PutRect(bounds);
    shape.Write(body, code == kTagDefineShape3);
    return Raw(code, body);
}

TagWriter& TagWriter::DefineSprite(U16 id, U16 frameCount, const TagWriter& nested)
{
    return Raw(kTagDefineSprite, Numbers(id, frameCount).PutBytes(nested.Tags()));
}

TagWriter& TagWriter::Place(U16 id, U16 depth, const Mat& mat, const std::optional<Cx>& cx)
{
    ByteWriter body = Numbers(id, depth).PutMatrix(mat);
    return Raw(kTagPlaceObject, cx ? body.PutCx(*cx, false) : body);
}

TagWriter& TagWriter::Place2(U16 depth, const PlaceOptions& options)
{
    const auto& [move, character, matrix, cx, ratio, name, clipDepth] = options;
    ByteWriter body;
    body.PutU8(U32(move) | U32(character.has_value()) << 1 | U32(matrix.has_value()) << 2 |
               U32(cx.has_value()) << 3 | U32(ratio.has_value()) << 4 | U32(name.has_value()) << 5 |
               U32(clipDepth.has_value()) << 6);
    body.PutU16(depth);
    if (character)
        body.PutU16(*character);
    if (matrix)
        body.PutMatrix(*matrix);
    if (cx)
        body.PutCx(*cx, true);
    if (ratio)
        body.PutU16(*ratio);
    if (name)
        body.PutString(*name);
    if (clipDepth)
        body.PutU16(*clipDepth);
    return Raw(kTagPlaceObject2, body);
}

TagWriter& TagWriter::Show(int times)
{
    for (int i = 0; i < times; i++)
        Raw(kTagShowFrame, ByteWriter());
    return *this;
}

std::vector<U8> MovieWriter::Bytes() const
{
    ByteWriter rest, file;
    rest.PutRect(frameBox).PutU16(frameRate).PutU16(count ? *count : U32(Frames()));
    rest.PutBytes(Tags());
    file.PutU8('M').PutU8('V').PutU8('X').PutU8(version);
    return file.PutU32(U32(rest.Size()) + 8).PutBytes(rest.Bytes()).Bytes();
}
