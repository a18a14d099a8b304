// A player whose movie only defines characters, for tests that arrange the display list themselves.
#pragma once

#include "platform/headless/native_player.h"
#include "tests/support/movie_writer.h"
#include "tests/support/picture.h"

#include <gtest/gtest.h>

inline MATRIX ToMatrix(const Mat& m)
{
    return {m.a, m.b, m.c, m.d, m.tx, m.ty};
}

inline ColorTransform ToTransform(const Cx& cx)
{
    ColorTransform t;
    t.redMul = S16(cx.mul[0]), t.greenMul = S16(cx.mul[1]), t.blueMul = S16(cx.mul[2]);
    t.alphaMul = S16(cx.mul[3]);
    t.redAdd = S16(cx.add[0]), t.greenAdd = S16(cx.add[1]), t.blueAdd = S16(cx.add[2]);
    t.alphaAdd = S16(cx.add[3]);
    t.CalcFlags();
    return t;
}

struct Scene {
    NativePlayerWnd player;
    DisplayList& list = player.scene;

    Scene(const MovieWriter& movie, S32 width, S32 height, bool smooth = false)
        : player(width, height)
    {
        player.SetQuality(smooth ? 1 : 0);
        const std::vector<U8> bytes = movie.Bytes();
        player.Feed(bytes.data(), bytes.size());
        player.EndOfData();
        Shown();
    }

    SObject* Root() { return player.rootObject; }
    SObject* At(U16 depth) { return list.FindChild(Root(), depth); }

    PlaceInfo Info(U16 depth, U16 id, const Mat& mat = {}, U16 clipDepth = 0)
    {
        PlaceInfo info;
        info.Clear();
        info.flags = PlaceInfo::kCharacter | PlaceInfo::kMatrix;
        info.depth = depth;
        info.character = player.FindCharacter(id);
        info.mat = ToMatrix(mat);
        info.clipDepth = clipDepth;
        if (clipDepth != 0)
            info.flags |= PlaceInfo::kClipDepth;
        return info;
    }
    SObject* Place(U16 depth, U16 id, const Mat& mat = {}, U16 clipDepth = 0)
    {
        const PlaceInfo info = Info(depth, id, mat, clipDepth);
        return list.PlaceObject(Root(), &info);
    }
    SObject* Move(U16 depth, const Mat& mat)
    {
        PlaceInfo info = Info(depth, 0, mat);
        info.flags = PlaceInfo::kMove | PlaceInfo::kMatrix;
        return list.MoveObject(Root(), &info);
    }
    void Remove(U16 depth) { list.RemoveObject(Root(), depth); }

    // The pixels after painting what is dirty; after painting everything.
    Picture Shown()
    {
        player.UpdateBuffer(1);
        const CBitBuffer& bits = player.bits;
        Picture p(bits.Width(), bits.Height());
        for (int y = 0; y < p.height; y++)
            for (int x = 0; x < p.width; x++)
                p.At(x, y) = bits.Row32(y)[x];
        return p;
    }
    Picture Repainted()
    {
        list.InvalidateRect(&list.devViewRect);
        return Shown();
    }
    U32 Pixel(int x, int y) { return Shown().At(x, y); }
    SObject* Hit(int x, int y)
    {
        list.CalcUpdate();
        const S32 unit = list.antialias ? 4 : 1;
        const SPOINT pt = {x * unit + unit / 2, y * unit + unit / 2};
        return list.HitTest(&pt);
    }
};

// A solid square of `side` pixels whose upper left corner is the origin.
inline ShapeBuilder Square(Rgba color, S32 side)
{
    ShapeBuilder shape;
    shape.Styles(shape.AddFill(color), 0);
    shape.Rect(0, 0, side * 20, side * 20);
    return shape;
}

inline Mat AtPixel(S32 x, S32 y)
{
    return Mat::Translate(x * 20, y * 20);
}

constexpr Rgba kRed = {255, 0, 0, 255}, kGreen = {0, 255, 0, 255}, kBlue = {0, 0, 255, 255};
constexpr U32 kRedPixel = 0xFFFF0000, kGreenPixel = 0xFF00FF00, kBluePixel = 0xFF0000FF,
              kWhitePixel = 0xFFFFFFFF;

// Characters 1, 2, 3: red, green and blue squares of 20 pixels; 4: an empty shape; 10: a sprite
// that holds the red square at depth 5; 11: one that holds the green one; 12: a sprite that
// holds 10.
inline MovieWriter Cast()
{
    MovieWriter movie(100 * 20, 100 * 20);
    movie.DefineShape(1, Square(kRed, 20)).DefineShape(2, Square(kGreen, 20));
    movie.DefineShape(3, Square(kBlue, 20)).DefineShape(4, ShapeBuilder());
    movie.DefineSprite(10, TagWriter().Place(1, 5).Show().End());
    movie.DefineSprite(11, TagWriter().Place(2, 5).Show().End());
    movie.DefineSprite(12, TagWriter().Place(10, 5).Show().End());
    movie.Show();
    return movie;
}
