// One shape, morph shape or static text from any bytes, built, painted and hit under several
// matrices.
#include <algorithm>

#include "core/display/display_list.h"
#include "core/shape/font.h"
#include "core/stream/character.h"
#include "platform/headless/native_player.h"
#include "tests/support/movie_writer.h"

// What the first byte chooses: 0x60 to 0x67 a morph shape, 0x68 to 0x6F a text, else a shape.
static SCharType KindOf(U8 mode)
{
    const SCharType kKinds[] = {kCharMorphShape, kCharText};
    return mode >> 4 == 6 ? kKinds[mode >> 3 & 1] : kCharShape;
}

// The id, as many bounds of no bits, and the bytes from `at` to `end` that follow.
static std::vector<U8> Body(U8 id, size_t bounds, const U8* at, const U8* end)
{
    std::vector<U8> body(2 + bounds);
    body[0] = id;
    body.insert(body.end(), at, end);
    return body;
}

// Two bytes say how many of the others belong to the font, which is character 2.
static void AddText(MovieWriter* movie, U8 mode, const U8* at, const U8* end)
{
    const size_t head = std::min<size_t>(2, size_t(end - at));
    const size_t size = head < 2 ? 0 : at[0] | size_t(at[1]) << 8;
    const U8* text = at + head + std::min(size, size_t(end - at) - head);
    movie->Raw(mode & 1 ? kTagDefineFont2 : kTagDefineFont, Body(2, 0, at + head, text));
    movie->Raw(mode & 2 ? kTagDefineText2 : kTagDefineText, Body(1, 1, text, end));
}

// A movie of one frame that places a character of those bytes.
static std::vector<U8> MovieAround(U8 mode, const U8* at, const U8* end)
{
    static const int kCodes[] = {2, 22, 32, 32};
    MovieWriter movie(2000, 2000);
    if (KindOf(mode) == kCharText)
        AddText(&movie, mode, at, end);
    else if (KindOf(mode) == kCharMorphShape)
        movie.Raw(kTagDefineMorphShape, Body(1, 2, at, end));
    else
        movie.Raw(kCodes[mode & 3], Body(1, 1, at, end));
    movie.Place(1, 1).Show().End();
    return movie.Bytes();
}

// What text fields ask of a font.
static void AskFont(const SCharacter* character)
{
    const SFont font(character);
    U32 sum = font.Name().empty() ? 0 : U8(font.Name().back());
    sum += U32(font.Ascent() + font.Descent() + font.Leading() + font.FindGlyph(65));
    for (U32 glyph = 0; glyph <= font.GlyphCount(); glyph += 1 + glyph / 8)
        sum += font.Code(glyph) + U32(font.Advance(glyph)) + font.Glyph(glyph).len;
    volatile U32 used = sum;
    (void)used;
}

// The bounds in the movie are empty; these make the object meet the painted area.
static void Show(NativePlayerWnd* player, SObject* obj, const MATRIX& view, U16 ratio)
{
    RectSetHuge(&obj->character->bounds);
    if (obj->character->type == kCharMorphShape)
        RectSetHuge(&obj->character->endBounds);
    obj->Modify();
    obj->xform.mat = view;
    obj->ratio = ratio;
    if (obj->character->type != kCharShape)
        obj->clipDepth = ratio & 1;
    player->UpdateScreen();
    const SPOINT middle = {24, 24};
    player->scene.HitTest(&middle);
}

extern "C" int LLVMFuzzerTestOneInput(const U8* data, size_t size)
{
    if (size < 1 || size > 1u << 20)
        return 0;
    const std::vector<U8> movie = MovieAround(data[0], data + 1, data + size);
    SetHeadlessClock(0);
    NativePlayerWnd player(48, 48);
    player.SetQuality(data[0] >> 2 & 1);
    player.Feed(movie.data(), movie.size());
    player.EndOfData();
    AskFont(player.FindCharacter(2));
    SObject* obj =
        player.scene.root.bottomChild ? player.scene.root.bottomChild->bottomChild : nullptr;
    const MATRIX views[] = {{0x10000, 0, 0, 0x10000, 0, 0},
                            {0x7FFFFFFF, 77, -9, 0x100, 4000, -4000},
                            {-0x3000, 0x8000, 0x8000, 0x3000, 0x7FFFFFF, 5}};
    const U16 ratios[] = {0x7654, 0, 0xFFFF};
    for (int i = 0; i < 3 && obj; ++i)
        Show(&player, obj, views[i], ratios[i]);
    return 0;
}
