#include "tests/player/player_scene.h"

namespace {

// A sprite, a mask and a label among the frames, so that every kind of state takes part.
std::vector<U8> BusyMovie()
{
    TagWriter sprite;
    sprite.Place(1, 1).Show().Move(1, Mat::Translate(300, 100)).Show(2).End();
    MovieWriter movie(100 * 20, 80 * 20, Fps(10));
    movie.Background({10, 60, 40, 255}).DefineShape(1, Square()).DefineSprite(2, sprite);
    movie.DefineShape(3, Square({0, 0, 0, 255}));
    movie.Place2(1, {.character = U16(3), .matrix = Mat::Scale(4), .clipDepth = U16(5)});
    movie.Place2(2, {.character = U16(2), .matrix = Mat::Translate(300, 300)}).Show(2);
    movie.Label("later").Place(1, 9, Mat::Translate(900, 800)).Show(2).RemoveDepth(1).Show(2);
    movie.End();
    return movie.Bytes();
}

std::vector<Picture> Pictures(const std::vector<U8>& movie, size_t block, int count)
{
    NativePlayerWnd player(0, 0);
    std::vector<Picture> pictures;
    size_t at = 0;
    const auto feed = [&] {
        const size_t n = std::min(block, movie.size() - at);
        player.Feed(movie.data() + at, n);
        at += n;
    };
    while (static_cast<int>(pictures.size()) < count) {
        while (!(pictures.empty() ? player.Started() : player.CanTick()) && at < movie.size())
            feed();
        if (!pictures.empty())
            player.Tick();
        pictures.push_back(Shot(&player));
    }
    return pictures;
}

TEST(Headless, PicturesDoNotDependOnHowDataCame)
{
    const std::vector<U8> movie = BusyMovie();
    const std::vector<Picture> whole = Pictures(movie, movie.size(), 14);
    for (size_t block : {1, 2, 7, 50}) {
        const std::vector<Picture> pieces = Pictures(movie, block, 14);
        for (size_t i = 0; i < whole.size(); i++)
            ASSERT_EQ("", ExpectSame(pieces[i], whole[i], "blocks")) << block << " " << i;
    }
    EXPECT_NE(0, Compare(whole[0], whole[3]).count);
}

TEST(Headless, TicksWaitForTheirData)
{
    const std::vector<U8> movie = MovingSquare(4);
    NativePlayerWnd player(0, 0);
    std::vector<S32> shown;
    for (U8 byte : movie) {
        player.Feed(&byte, 1);
        if (player.CanTick() && !player.Complete())
            player.Tick(), shown.push_back(player.curFrame);
    }
    EXPECT_EQ((std::vector<S32>{1, 2, 3}), shown);
    EXPECT_TRUE(player.CanTick());
}

TEST(Headless, TakesTheMoviesSizeUnlessGivenOne)
{
    const std::vector<U8> movie = MovingSquare(2);
    NativePlayerWnd own(0, 0), given(50, 40);
    own.Feed(movie.data(), movie.size());
    given.Feed(movie.data(), movie.size());
    EXPECT_EQ(100, own.Picture()->Width());
    EXPECT_EQ(80, own.Picture()->Height());
    EXPECT_EQ(50, given.Picture()->Width());
    EXPECT_EQ(0xFFC81E1Eu, Shot(&own).At(15, 15));
    EXPECT_EQ(0xFFC81E1Eu, Shot(&given).At(7, 7));
    EXPECT_EQ(0xFFF0FAFFu, Shot(&given).At(12, 12));
}

TEST(Headless, BackgroundIsTheShells)
{
    const std::vector<U8> movie = MovingSquare(2);
    const struct {
        SRGB color;
        U32 pixel;
    } cases[] = {{{1, 2, 3, 255}, 0xFF010203u}, {{9, 9, 9, 0}, 0}};
    for (const auto& c : cases) {
        NativePlayerWnd player(0, 0);
        player.OverrideBackground(c.color);
        player.Feed(movie.data(), movie.size());
        const Picture picture = Shot(&player);
        EXPECT_EQ(c.pixel, picture.At(50, 50));
        EXPECT_EQ(0xFFC81E1Eu, picture.At(15, 15));
        player.Tick();
        EXPECT_EQ(c.pixel, Shot(&player).At(11, 11)) << "what the square left behind";
    }
}

TEST(Headless, BrokenMoviesPlayNothing)
{
    std::vector<U8> movie = MovingSquare(2);
    movie[0] = 'X';
    NativePlayerWnd player(20, 20);
    player.Feed(movie.data(), movie.size());
    player.EndOfData();
    EXPECT_FALSE(player.Started());
    EXPECT_FALSE(player.CanTick());
    player.Tick();
    EXPECT_EQ(0xFFFFFFFFu, Shot(&player).At(5, 5));
}

} // namespace
