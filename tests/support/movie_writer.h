#pragma once

#include "core/stream/tags.h"
#include "tests/support/shape_writer.h"

#include <optional>
#include <string>

// What a Place2 tag carries; only the parts that are set are written. The player takes the clip
// depth from the first two bytes of the name when both are given; both are written all the same.
struct PlaceOptions {
    bool move = false;
    std::optional<U16> character = {};
    std::optional<Mat> matrix = {};
    std::optional<Cx> cx = {};
    std::optional<U16> ratio = {};
    std::optional<std::string> name = {};
    std::optional<U16> clipDepth = {};
};

// An image of a button: when it shows, and whether it is part of the hit area (1 up, 2 over, 4
// down, 8 hit). Its colour is written by the second form of button only.
struct ButtonImage {
    U32 flags;
    U16 id, layer;
    Mat mat = {};
    Cx cx = {};
};

// Blocks of actions and what they are for: a bit for each transition, from bit 9 on a key code.
using ButtonBlocks = std::vector<std::pair<U32, std::vector<U8>>>;

// Grows a sequence of tags: a sprite's timeline, or (as MovieWriter) a whole movie's. Nothing is
// checked, so that tests can write broken movies too.
class TagWriter {
public:
    TagWriter& Raw(int code, const std::vector<U8>& body, bool forceLong = false);
    TagWriter& Raw(int code, const ByteWriter& body) { return Raw(code, body.Bytes()); }

    // Codes 2 and 22 have no alpha in their colours, 32 has.
    TagWriter& DefineShape(U16 id, int code, const Box& bounds, const ShapeBuilder& shape);
    TagWriter& DefineShape(U16 id, const ShapeBuilder& shape, int code = kTagDefineShape3)
    {
        return DefineShape(id, code, shape.Bounds(), shape);
    }
    TagWriter& DefineSprite(U16 id, U16 frameCount, const TagWriter& nested);
    TagWriter& DefineSprite(U16 id, const TagWriter& nested) // counts the frames itself
    {
        return DefineSprite(id, U16(nested.Frames()), nested);
    }
    // Code 7 has one block, whatever it is for; 34 has them all.
    TagWriter& DefineButton(U16 id, int code, const std::vector<ButtonImage>& images,
                            const ButtonBlocks& blocks = {}, bool menu = false);
    TagWriter& FreeCharacter(U16 id) { return Raw(kTagFreeCharacter, Numbers(id)); }

    // Code 4.
    TagWriter& Place(U16 id, U16 depth, const Mat& mat = {}, const std::optional<Cx>& cx = {});
    TagWriter& Place2(U16 depth, const PlaceOptions& options); // code 26
    // The commonest Place2: a new place for what stands at the depth.
    TagWriter& Move(U16 depth, const Mat& mat, const std::optional<Cx>& cx = {})
    {
        return Place2(depth, {.move = true, .matrix = mat, .cx = cx});
    }
    TagWriter& Remove(U16 id, U16 depth) { return Raw(kTagRemoveObject, Numbers(id, depth)); }
    TagWriter& RemoveDepth(U16 depth) { return Raw(kTagRemoveObject2, Numbers(depth)); }

    TagWriter& Background(Rgba color)
    {
        return Raw(kTagSetBackgroundColor, ByteWriter().PutColor(color, false));
    }
    TagWriter& Label(std::string_view s) { return Raw(kTagFrameLabel, ByteWriter().PutString(s)); }
    TagWriter& DoAction(const std::vector<U8>& actions) { return Raw(kTagDoAction, actions); }
    TagWriter& Show(int times = 1);
    TagWriter& End() { return Raw(kTagEnd, ByteWriter()); }

    int Frames() const { return frames; } // ShowFrame tags so far
    const std::vector<U8>& Tags() const { return tags.Bytes(); }

private:
    static ByteWriter Numbers(U16 first) { return ByteWriter().PutU16(first); }
    static ByteWriter Numbers(U16 first, U16 next) { return Numbers(first).PutU16(next); }

    ByteWriter tags;
    int frames = 0;
};

// A frame rate in the header's 8.8 form.
inline U16 Fps(double framesPerSecond)
{
    return U16(RoundSteadily(framesPerSecond * 256));
}

// A whole movie. The frame rectangle is in twips (20 a pixel); a frame count left out becomes the
// number of frames written.
class MovieWriter : public TagWriter {
public:
    explicit MovieWriter(S32 width = 640 * 20, S32 height = 480 * 20, U16 rate = 12 << 8,
                         std::optional<U16> frameCount = {})
        : MovieWriter(Box{0, width, 0, height}, rate, frameCount)
    {
    }
    MovieWriter(const Box& frame, U16 rate, std::optional<U16> frameCount = {})
        : frameBox(frame), frameRate(rate), count(frameCount)
    {
    }

    // The header, with the file's true length, and the tags so far.
    std::vector<U8> Bytes() const;

    U8 version = 5;

private:
    Box frameBox;
    U16 frameRate;
    std::optional<U16> count;
};
