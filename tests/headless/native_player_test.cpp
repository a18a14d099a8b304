#include "tests/player/player_scene.h"

namespace {

// A sprite, a mask and a label among the frames, so that every kind of state takes part.
std::vector<U8> BusyMovie()
{
    TagWriter sprite;
    sprite.Place(1, 1).Show().Move(1, Mat::Translate(300, 100)).Show(2).End();
    MovieWriter movie(100 * 20, 80 * 20, Fps(10));
    movie.Background({10, 60, 40, 255}).DefineShape(1, Square()).DefineSprite(2, sprite);
    movie.Place2(1, {.character = U16(1), .matrix = Mat::Scale(4), .clipDepth = U16(5)});
    movie.Place2(2, {.character = U16(2), .matrix = Mat::Translate(300, 300)}).Show(2);
    movie.Label("later").Place(1, 9, Mat::Translate(900, 800)).Show(2).RemoveDepth(1).Show(2);
    movie.End();
    return movie.Bytes();
}

// Each taken when the data of the one after it has come.
std::vector<Picture> Pictures(const std::vector<U8>& movie, size_t block)
{
    NativePlayerWnd player(0, 0);
    std::vector<Picture> pictures;
    for (size_t at = 0; at < movie.size(); at += block) {
        player.Feed(movie.data() + at, std::min(block, movie.size() - at));
        for (; player.CanTick() && pictures.size() < 14; player.Tick())
            pictures.push_back(Shot(&player));
    }
    return pictures;
}

TEST(Headless, PicturesDoNotDependOnHowDataCame)
{
    const std::vector<U8> movie = BusyMovie();
    const std::vector<Picture> whole = Pictures(movie, movie.size());
    for (size_t block : {1, 2, 7, 50}) {
        const std::vector<Picture> pieces = Pictures(movie, block);
        ASSERT_EQ(14u, pieces.size());
        for (size_t i = 0; i < whole.size(); i++)
            ASSERT_EQ("", ExpectSame(pieces[i], whole[i], "blocks")) << block << " " << i;
    }
    EXPECT_NE(0, Compare(whole[0], whole[3]).count);
}

TEST(Headless, BackgroundIsTheShells)
{
    for (const auto& [color, pixel] : {std::pair<SRGB, U32>{{1, 2, 3, 255}, 0xFF010203u},
                                       std::pair<SRGB, U32>{{9, 9, 9, 0}, 0u}}) {
        PlayingShell player(MovingSquare(2), 50, 40);
        player.OverrideBackground(color);
        EXPECT_EQ(0xFFC81E1Eu, Shot(&player).At(5, 5));
        player.Tick();
        EXPECT_EQ(pixel, Shot(&player).At(5, 5)) << "what the square left behind";
    }
}

TEST(Headless, BrokenMoviesPlayNothing)
{
    std::vector<U8> movie = MovingSquare(2);
    movie[0] = 'X';
    PlayingShell player(movie, 20, 20);
    EXPECT_FALSE(player.Started() || player.CanTick());
    player.Tick();
    EXPECT_EQ(0xFFFFFFFFu, Shot(&player).At(5, 5));
}

} // namespace
