#include "samples/orchard.h"
#include "tests/support/script_writer.h"

// The second movie: a board comes down on two ropes and tells what the evening has brought.

namespace orchard {

static const std::string_view kVerdicts[] = {"A bite on the way home", "Enough for a tart",
                                             "Enough for three pies", "Cider for the village"};

static void DefineBoard(TagWriter& movie)
{
    Drawing veil, board;
    veil.Paint(Glow(320, 200, 420, {{0, Hex(0x050818, 90)}, {255, Hex(0x050818, 190)}}));
    movie.DefineShape(kVeil, veil.Rect(kLeft, kTop, kRight, kBottom).Shape());
    board.Paint(Across(-104, -98, {{0, Hex(0xd8b078)}, {255, Hex(0x7a5430)}}));
    board.Rect(-104, -420, -99, -96);
    board.Paint(Across(99, 105, {{0, Hex(0xd8b078)}, {255, Hex(0x7a5430)}}));
    board.Rect(99, -420, 104, -96);
    DrawPlate(board, 316, 212);
    board.Paint(Hex(0x4a2a14, 120)).Rect(-120, -48, 120, -46.6);
    board.Paint(Hex(0xf0c890, 90)).Rect(-120, -46.6, 120, -45.6);
    movie.DefineShape(kBoard, board.Shape());
    Drawing wood;
    DrawPlate(wood, 190, 48);
    movie.DefineShape(kWood, wood.Paint(Hex(0xffe0a0, 36)).RoundRect(-95, -24, 95, 24, 8).Shape());
}

static void DefineWords(TagWriter& movie, const Font& font)
{
    const Rgba ink = Hex(0x3a1e0c), carved = Hex(0xf0c890, 110);
    auto line = [&](std::string_view text, double x, double y, double size) {
        return std::vector<TextLine>{{text, x + 0.8, y + 1, size, carved, 0.5, 0.5},
                                     {text, x, y, size, ink, 0.5, 0.5}};
    };
    std::vector<TextLine> words = line("The light is gone", 0, -62, 30);
    for (const TextLine& more : line("gathered", -72, -18, 17))
        words.push_back(more);
    for (const TextLine& more : line("best", 72, -18, 17))
        words.push_back(more);
    DefineText(movie, kBoardText, font, words);
    TagWriter verdict;
    for (U16 i = 0; i < 4; i++) {
        DefineText(movie, U16(kVerdictText + i), font, line(kVerdicts[i], 0, 62, 21));
        if (i > 0)
            verdict.RemoveDepth(1);
        else
            verdict.DoAction(AssembleScript("Stop"));
        verdict.Place(U16(kVerdictText + i), 1).Show();
    }
    movie.DefineSprite(kVerdict, verdict.End());
}

// The board falls, swings past its place and comes to rest.
static TagWriter FallingBoard()
{
    TagWriter board;
    const U16 depths[] = {1, 2, 3, 4, 5};
    const Spot places[] = {{0, 0}, {0, 0}, {-72, 16}, {72, 16}, {0, 0}};
    board.Place(kBoard, 1).Place(kBoardText, 2);
    board.Place2(3, {.character = kNumber, .matrix = At(-72, 14), .name = "score"});
    board.Place2(4, {.character = kNumber, .matrix = At(72, 14), .name = "best"});
    board.Place2(5, {.character = kVerdict, .name = "verdict"});
    constexpr int kFall = 20;
    for (int i = 0; i <= kFall; i++) {
        double t = i / double(kFall), y = -330 * (1 - t) * (1 - t) * (1 - 2.6 * t);
        for (int k = 0; k < 5; k++)
            board.Move(depths[k], At(places[k].x, places[k].y - (k == 2 || k == 3 ? 2 : 0) + y));
        board.Show();
    }
    board.Place(kAgain, 6, At(0, 150)).DoAction(AssembleScript("Stop")).Show();
    return board.End();
}

} // namespace orchard

std::vector<U8> MakeOrchardEnd()
{
    using namespace orchard;
    MovieWriter movie(640 * 20, 480 * 20, Fps(24));
    std::string letters = "The light is gone gathered best Play again 0123456789";
    for (std::string_view verdict : kVerdicts)
        letters += verdict;
    const Font font(kFont, letters, 26);
    font.Define(movie, Font::kWithLayout);
    DefineBoard(movie);
    DefineWords(movie, font);
    DefineNumbers(movie, font, Hex(0x3a1e0c));
    DefineClick(movie);
    DefineButton(movie, kAgain, font, "Play again", kWood, kAgainText, AgainScript(), 32);
    movie.DefineSprite(kFallingBoard, FallingBoard());
    movie.Place(kVeil, 1);
    movie.Place2(2, {.character = kFallingBoard, .matrix = At(320, 192), .name = "board"});
    movie.DoAction(AssembleScript(EndScript())).Show();
    movie.Label("digits").DoAction(AssembleScript(kShowDigits)).Show();
    movie.End();
    return movie.Bytes();
}
