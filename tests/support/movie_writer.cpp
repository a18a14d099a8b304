#include "tests/support/movie_writer.h"

namespace {

enum : int {
    kEnd = 0,
    kShowFrame = 1,
    kFreeCharacter = 3,
    kPlaceObject = 4,
    kRemoveObject = 5,
    kBackground = 9,
    kDoAction = 12,
    kPlaceObject2 = 26,
    kRemoveDepth = 28,
    kThirdShape = 32,
    kDefineSprite = 39,
    kFrameLabel = 43,
};

} // namespace

TagWriter& TagWriter::Raw(int code, const std::vector<U8>& body, bool forceLong)
{
    bool isLong = forceLong || body.size() > 62;
    tags.PutU16(U32(code) << 6 | (isLong ? 63 : U32(body.size())));
    if (isLong)
        tags.PutU32(U32(body.size()));
    tags.PutBytes(body);
    if (code == kShowFrame)
        frames++;
    return *this;
}

TagWriter& TagWriter::DefineShape(U16 id, int code, const Box& bounds, const ShapeBuilder& shape)
{
    ByteWriter body;
    body.PutU16(id).PutRect(bounds);
    shape.Write(body, code == kThirdShape);
    return Raw(code, body.Bytes());
}

TagWriter& TagWriter::DefineShape(U16 id, const ShapeBuilder& shape, int code)
{
    return DefineShape(id, code, shape.Bounds(), shape);
}

TagWriter& TagWriter::DefineSprite(U16 id, U16 frameCount, const TagWriter& nested)
{
    ByteWriter body;
    body.PutU16(id).PutU16(frameCount).PutBytes(nested.Tags());
    return Raw(kDefineSprite, body.Bytes());
}

TagWriter& TagWriter::DefineSprite(U16 id, const TagWriter& nested)
{
    return DefineSprite(id, U16(nested.Frames()), nested);
}

TagWriter& TagWriter::FreeCharacter(U16 id)
{
    return Raw(kFreeCharacter, ByteWriter().PutU16(id).Bytes());
}

TagWriter& TagWriter::Place(U16 id, U16 depth, const Mat& mat)
{
    return Raw(kPlaceObject, ByteWriter().PutU16(id).PutU16(depth).PutMatrix(mat).Bytes());
}

TagWriter& TagWriter::Place(U16 id, U16 depth, const Mat& mat, const Cx& cx)
{
    ByteWriter body;
    body.PutU16(id).PutU16(depth).PutMatrix(mat).PutCx(cx, false);
    return Raw(kPlaceObject, body.Bytes());
}

TagWriter& TagWriter::Place2(U16 depth, const PlaceOptions& options)
{
    ByteWriter body;
    body.PutU8(U32(options.move) | U32(options.character.has_value()) << 1 |
               U32(options.matrix.has_value()) << 2 | U32(options.cx.has_value()) << 3 |
               U32(options.ratio.has_value()) << 4 | U32(options.name.has_value()) << 5 |
               U32(options.clipDepth.has_value()) << 6);
    body.PutU16(depth);
    if (options.character)
        body.PutU16(*options.character);
    if (options.matrix)
        body.PutMatrix(*options.matrix);
    if (options.cx)
        body.PutCx(*options.cx, true);
    if (options.ratio)
        body.PutU16(*options.ratio);
    if (options.name)
        body.PutString(*options.name);
    if (options.clipDepth)
        body.PutU16(*options.clipDepth);
    return Raw(kPlaceObject2, body.Bytes());
}

TagWriter& TagWriter::Move(U16 depth, const Mat& mat)
{
    return Place2(depth, {.move = true, .matrix = mat});
}

TagWriter& TagWriter::Move(U16 depth, const Mat& mat, const Cx& cx)
{
    return Place2(depth, {.move = true, .matrix = mat, .cx = cx});
}

TagWriter& TagWriter::Remove(U16 id, U16 depth)
{
    return Raw(kRemoveObject, ByteWriter().PutU16(id).PutU16(depth).Bytes());
}

TagWriter& TagWriter::RemoveDepth(U16 depth)
{
    return Raw(kRemoveDepth, ByteWriter().PutU16(depth).Bytes());
}

TagWriter& TagWriter::Background(Rgba color)
{
    return Raw(kBackground, ByteWriter().PutColor(color, false).Bytes());
}

TagWriter& TagWriter::Label(const std::string& name)
{
    return Raw(kFrameLabel, ByteWriter().PutString(name).Bytes());
}

TagWriter& TagWriter::DoAction(const std::vector<U8>& actions)
{
    return Raw(kDoAction, actions);
}

TagWriter& TagWriter::Show(int times)
{
    for (int i = 0; i < times; i++)
        Raw(kShowFrame, {});
    return *this;
}

TagWriter& TagWriter::End()
{
    return Raw(kEnd, {});
}

MovieWriter::MovieWriter(S32 width, S32 height, U16 rate, std::optional<U16> frameCount)
    : MovieWriter(Box{0, width, 0, height}, rate, frameCount)
{
}

MovieWriter::MovieWriter(const Box& frame, U16 rate, std::optional<U16> frameCount)
    : frameBox(frame), frameRate(rate), count(frameCount)
{
}

std::vector<U8> MovieWriter::Bytes() const
{
    ByteWriter rest;
    rest.PutRect(frameBox).PutU16(frameRate).PutU16(count ? *count : U32(Frames()));
    rest.PutBytes(Tags());
    ByteWriter file;
    file.PutU8('M').PutU8('V').PutU8('X').PutU8(version);
    file.PutU32(U32(rest.Size()) + 8).PutBytes(rest.Bytes());
    return file.Bytes();
}
