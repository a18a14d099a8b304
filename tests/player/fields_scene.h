// Movies with text fields, for the tests of the player.
#pragma once

#include "core/display/edit_text.h"
#include "core/stream/str.h"
#include "core/text/field_record.h"
#include "tests/player/player_scene.h"
#include "tests/support/glyph_writer.h"
#include "tests/support/script_writer.h"

constexpr U32 kUsual = kFieldFont | kFieldColor | kFieldOwnGlyphs | kFieldText;
constexpr U32 kLines = kUsual | kFieldMultiline | kFieldWrap;

// 200 x 200 pixels with font 1: "a" is a box half as wide as its advance of half the height, which
// is 20 pixels; it stands on the baseline 16 pixels below the line's top.
inline MovieWriter Begin()
{
    MovieWriter movie(4000, 4000, Fps(10));
    ShapeBuilder box;
    box.AddFill(Rgba{});
    box.Fill1(1).Rect(0, -512, 256, 0);
    const FontText text = {"Boxes", 0x80, {'a', ' '}, {819, 205, 0, 512, 512}};
    return movie.Raw(kTagDefineFont2, Font2Body(1, {box, ShapeBuilder()}, text)), movie;
}

struct Stage : PlayingShell {
    explicit Stage(TagWriter& movie)
        : PlayingShell((movie.Show(4).End(), static_cast<MovieWriter&>(movie).Bytes()))
    {
    }
    EditText* Field(U16 depth) { return scene.FindChild(rootObject, depth)->editText; }
    std::string Text(U16 depth) { return Field(depth)->Text(); }
    std::string Value(const char* path)
    {
        char* text = GetVariable(this, path);
        const std::string copy = text ? text : "none";
        FreeStr(text);
        return copy;
    }
    void Set(const char* path, const char* value) { SPlayer::SetVariable(this, path, value, 1); }
};
