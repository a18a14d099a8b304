// A player whose movie defines characters, for tests that arrange the display list themselves.
#pragma once

#include "platform/headless/native_player.h"
#include "tests/support/movie_writer.h"
#include "tests/support/picture.h"

#include <gtest/gtest.h>

// A solid square of `side` pixels whose upper left corner is the origin.
inline ShapeBuilder Square(Rgba color, S32 side)
{
    ShapeBuilder shape;
    return shape.Styles(shape.AddFill(color), 0).Rect(0, 0, side * 20, side * 20);
}

// The characters that tests place. 1, 2, 3: a red, a green and a blue square of 20, 40 and 60
// pixels; 4: an empty shape; 10, 11, 12: sprites that hold 1, 2 and 10 at depth 5; 30: a button
// without records.
struct Cast : MovieWriter {
    explicit Cast(S32 side = 60) : MovieWriter(side * 20, side * 20)
    {
        DefineShape(1, Square({255, 0, 0}, 20)).DefineShape(2, Square({0, 255, 0}, 40));
        DefineShape(3, Square({0, 0, 255}, 60)).DefineShape(4, ShapeBuilder());
        DefineSprite(10, TagWriter().Place(1, 5).Show(3).End());
        DefineSprite(11, TagWriter().Place(2, 5).Show(3).End());
        DefineSprite(12, TagWriter().Place(10, 5).Show(3).End()).Raw(7, {30, 0, 0});
    }
};
constexpr U32 kRed = 0xFFFF0000, kGreen = 0xFF00FF00, kBlue = 0xFF0000FF, kWhite = 0xFFFFFFFF;

inline Mat AtPixel(S32 x, S32 y)
{
    return Mat::Translate(x * 20, y * 20);
}

struct Scene {
    NativePlayerWnd player;
    DisplayList& list = player.scene;

    // A frame ends after the movie's last tag, and the given frame is shown.
    explicit Scene(MovieWriter movie, S32 side = 60, bool smooth = false, S32 frame = 0)
        : player(side, side)
    {
        movie.Show().End();
        const std::vector<U8> bytes = movie.Bytes();
        player.SetQuality(smooth ? 1 : 0);
        player.Feed(bytes.data(), bytes.size());
        player.EndOfData();
        player.Seek(frame);
        Shown();
    }

    SObject* Root() { return player.rootObject; }
    SObject* At(U16 depth) { return list.FindChild(Root(), depth); }

    PlaceInfo Info(U16 depth, U16 id, const Mat& m = {}, U16 clipDepth = 0)
    {
        PlaceInfo info;
        info.Clear();
        info.flags = PlaceInfo::kCharacter | PlaceInfo::kMatrix | PlaceInfo::kClipDepth;
        info.depth = depth;
        info.character = player.FindCharacter(id);
        info.mat = {m.a, m.b, m.c, m.d, m.tx, m.ty};
        info.clipDepth = clipDepth;
        return info;
    }
    SObject* Place(U16 depth, U16 id, const Mat& mat = {}, U16 clipDepth = 0)
    {
        const PlaceInfo info = Info(depth, id, mat, clipDepth);
        return list.PlaceObject(Root(), &info);
    }

    // The pixels after painting what is dirty; after making everything anew.
    Picture Shown()
    {
        player.UpdateBuffer(1);
        return PictureOf(player.bits);
    }
    Picture Repainted()
    {
        list.FreeCache();
        list.ModifyCamera();
        return Shown();
    }
};
