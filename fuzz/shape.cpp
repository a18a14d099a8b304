// One shape record from any bytes, built and painted under several matrices.
#include <algorithm>

#include "core/display/display_list.h"
#include "core/stream/character.h"
#include "platform/headless/native_player.h"
#include "tests/support/movie_writer.h"

// A movie of one frame whose only shape has the given body.
static std::vector<U8> MovieAround(const U8* body, size_t size, int tagCode)
{
    std::vector<U8> definition(3 + size); // the id, bounds of no bits, the body
    definition[0] = 1;
    std::copy(body, body + size, definition.data() + 3);
    MovieWriter movie(2000, 2000);
    movie.Raw(tagCode, definition).Place(1, 1).Show().End();
    return movie.Bytes();
}

extern "C" int LLVMFuzzerTestOneInput(const U8* data, size_t size)
{
    if (size < 1 || size > 1u << 20)
        return 0;
    static const int kCodes[] = {2, 22, 32, 32};
    std::vector<U8> movie = MovieAround(data + 1, size - 1, kCodes[data[0] & 3]);
    SetHeadlessClock(0);
    NativePlayerWnd player(48, 48);
    player.SetQuality(data[0] >> 2 & 1);
    player.Feed(movie.data(), movie.size());
    player.EndOfData();
    SObject* shape =
        player.scene.root.bottomChild ? player.scene.root.bottomChild->bottomChild : nullptr;
    const MATRIX views[] = {{0x10000, 0, 0, 0x10000, 0, 0},
                            {0x7FFFFFFF, 77, -9, 0x100, 4000, -4000},
                            {-0x3000, 0x8000, 0x8000, 0x3000, 0x7FFFFFF, 5}};
    for (const MATRIX& view : views) {
        if (!shape)
            break;
        // The bounds in the movie are empty; these make the shape meet the painted area.
        RectSetHuge(&shape->character->bounds);
        shape->Modify();
        shape->xform.mat = view;
        player.UpdateScreen();
    }
    return 0;
}
