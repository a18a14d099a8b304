#include "samples/orchard.h"
#include "tests/support/script_writer.h"

// Apples, the basket, and what is made of wood.

namespace orchard {

static void DrawApple(Drawing& d, U32 light, U32 body, U32 dark)
{
    d.Paint(Hex(0x5a3a22)).Move(-1, -9).Curve(0, -16, 4, -19).Line(6, -18).Curve(2, -14, 1.6, -9);
    d.Close();
    d.Paint(Across(2, 18, {{0, Hex(0x5f9a3a)}, {255, Hex(0xa9cc58)}}));
    d.Move(2, -13).Curve(8, -22, 18, -18).Curve(13, -9, 2, -13);
    d.Paint(Glow(-5, -5, 23, {{0, Hex(light)}, {110, Hex(body)}, {255, Hex(dark)}}));
    d.Blob({{0, -7},
            {6, -14},
            {17, -11},
            {16, 6},
            {7, 16},
            {0, 12},
            {-7, 16},
            {-16, 6},
            {-17, -11},
            {-6, -14}});
    d.Paint(OvalGlow(-6, -6, 5.5, 4, {{0, Hex(0xffffff, 210)}, {255, Hex(0xffffff, 0)}}));
    d.Ellipse(-6, -6, 5.5, 4);
    d.Paint(Hex(dark, 150)).Move(-4, -9.6).Curve(0, -6.4, 4, -9.6).Curve(0, -8.6, -4, -9.6);
}

static void DefinePop(TagWriter& movie, U16 text, U16 pop, const Font& font, std::string_view worth,
                      double size, Rgba color)
{
    DefineText(movie, text, font,
               {{worth, 1.6, size * 0.36 + 1.6, size, Hex(0x2a1608, 170), 0.5},
                {worth, 0, size * 0.36, size, color, 0.5}});
    TagWriter tags;
    if (pop == kPopFive)
        tags.Place(kGlitter, 1);
    movie.DefineSprite(pop, tags.Place(text, 2).Show().End());
}

void DefineApples(TagWriter& movie)
{
    Drawing red, blush, gold, glitter;
    DrawApple(red, 0xff9a80, 0xdd2f2a, 0x7c0c1c);
    movie.DefineShape(kRedApple, red.Shape());
    DrawApple(blush, 0xfff0a0, 0xe8923a, 0xa8282a);
    movie.DefineShape(kBlushApple, blush.Shape());
    gold.Paint(Glow(0, 0, 32,
                    {{0, Hex(0xfff2a0, 230)}, {110, Hex(0xffdc60, 110)}, {255, Hex(0xffc840, 0)}}));
    gold.Circle(0, 0, 32);
    DrawApple(gold, 0xfffbe0, 0xffcc38, 0xb8720c);
    movie.DefineShape(kGoldApple, gold.Shape());
    TagWriter skins;
    skins.Place(kRedApple, 1).DoAction(AssembleScript("Stop")).Show();
    skins.RemoveDepth(1).Place(kBlushApple, 1).Show();
    skins.RemoveDepth(1).Place(kGoldApple, 1).Show();
    movie.DefineSprite(kSkins, skins.End());

    glitter.Paint(Hex(0xfff0a0));
    for (int i = 0; i < 10; i++) {
        double c = Turns(i / 10.0 + 0.25), s = Turns(i / 10.0), r = i % 2 ? 30 : 40;
        glitter.Polygon(
            {{c * 20 - s * 2, s * 20 + c * 2}, {c * r, s * r}, {c * 20 + s * 2, s * 20 - c * 2}});
    }
    movie.DefineShape(kGlitter, glitter.Shape());
    movie.DefineSprite(kSmallApple, TagWriter().Place(kRedApple, 1, Mat::Scale(0.8)).Show().End());
}

void DefinePops(TagWriter& movie, const Font& font)
{
    DefinePop(movie, kPlusOne, kPopOne, font, "+1", 34, Hex(0xfff4da));
    DefinePop(movie, kPlusFive, kPopFive, font, "+5", 46, Hex(0xffe070));
}

static double Half(double t) // of the basket's width, from the rim to its foot
{
    return 46 - 12 * t * t;
}

// Canes: rows of short bulges, every other row set off by half of one.
static void DrawWeave(Drawing& d)
{
    constexpr int kRows = 6, kCanes = 10;
    for (int row = 0; row < kRows; row++) {
        double t = row / double(kRows), y = 4 + 40 * t, half = Half(t + 0.08), bow = 5 * (1 - t);
        for (int i = 0; i < kCanes; i++) {
            double u0 = -1 + 2.0 * i / kCanes, u1 = u0 + 2.0 / kCanes, u = (u0 + u1) / 2;
            double dip = bow * (1 - u * u), light = 0.5 - 0.42 * u;
            U32 tone = (i + row) % 2 ? 0xd9a45c : 0xb07838;
            d.Paint(Down(
                y + dip, y + dip + 7,
                {{0, Hex(tone, RoundSteadily(150 + 100 * light))}, {255, Hex(0x6a4220, 220)}}));
            d.RoundRect(u0 * half, y + dip, u1 * half - 0.6, y + dip + 6.4, 2.4);
        }
    }
}

void DefineBasket(TagWriter& movie)
{
    Drawing back, front;
    back.Paint(Down(-52, 0, {{0, Hex(0xc08a4a)}, {255, Hex(0x7c4f26)}})); // the handle
    back.Move(-43, 0).Curve(-44, -52, 0, -54).Curve(44, -52, 43, 0).Line(38, 0);
    back.Curve(38, -46, 0, -48).Curve(-38, -46, -38, 0).Close();
    back.Paint(Down(-9, 9, {{0, Hex(0x5a3818)}, {255, Hex(0x2e1a0c)}})).Ellipse(0, 0, 46, 9);
    movie.DefineShape(kBasketBack, back.Shape());
    front.Paint(Across(-46, 46, {{0, Hex(0xa06c34)}, {90, Hex(0x8a5a2a)}, {255, Hex(0x4e3018)}}));
    front.Move(-46, 0).Curve(-45, 30, -34, 46).Curve(0, 54, 34, 46).Curve(45, 30, 46, 0);
    front.Curve(0, 18, -46, 0);
    DrawWeave(front);
    front.Paint(Down(-2, 14, {{0, Hex(0xe8bc78)}, {255, Hex(0x94642e)}})); // the rim
    front.Move(-48, -1).Curve(0, 18, 48, -1).Line(48, 5).Curve(0, 25, -48, 5).Close();
    movie.DefineShape(kBasketFront, front.Shape());

    TagWriter heap;
    const Spot places[] = {{-22, 2}, {20, 3}, {0, 4}, {-10, -7}, {11, -7}, {-28, -4}, {28, -4}};
    heap.DoAction(AssembleScript("Stop")).Show();
    for (U16 i = 0; i < 7; i++) {
        U16 skin = i % 3 == 1 ? kBlushApple : kRedApple;
        heap.Place(skin, U16(10 - i), Pose(places[i].x, places[i].y, 0.85, 0.85, 40 * i)).Show();
    }
    movie.DefineSprite(kHeap, heap.End());

    TagWriter body;
    body.Place(kBasketBack, 1).Place2(2, {.character = kHeap, .name = "heap"});
    body.Place(kBasketFront, 3).DoAction(AssembleScript("Stop")).Show().Label("bump");
    for (double squash : {0.9, 0.86, 0.94, 1.05, 1.02}) {
        Mat mat = Pose(0, 48 * (1 - squash), 2 - squash, squash);
        body.Move(1, mat).Move(2, mat).Move(3, mat).Show();
    }
    body.DoAction(AssembleScript("GotoFrame 0")).Show();
    movie.DefineSprite(kBasketBody, body.End());
    movie.DefineSprite(
        kBasket, TagWriter().Place2(1, {.character = kBasketBody, .name = "body"}).Show().End());
}

void DrawPlate(Drawing& d, double width, double height)
{
    double w = width / 2, h = height / 2;
    d.Paint(Hex(0x140a06, 110)).RoundRect(-w + 2, -h + 4, w + 2, h + 5, 8);
    d.Paint(Down(-h, h, {{0, Hex(0xb98250)}, {120, Hex(0x9a6638)}, {255, Hex(0x744522)}}));
    d.RoundRect(-w, -h, w, h, 8);
    d.Paint(Hex(0xe6b880, 130)).RoundRect(-w + 2, -h + 1.5, w - 2, -h + 4, 1.2);
    d.Paint(Hex(0x4a2a14, 120));
    int grains = int(height / 9);
    for (int i = 1; i < grains; i++) {
        double y = -h + i * height / grains, bend = i % 2 ? 3 : -3, end = w - 6 - 7 * (i % 3);
        d.Move(-end, y).Curve(-w * 0.3, y + bend, end - 8, y + 1);
        d.Curve(-w * 0.3, y + bend + 1.6, -end, y);
    }
    d.Paint(Hex(0x3c2416)).Circle(-w + 9, -h + 9, 2.2).Circle(w - 9, -h + 9, 2.2);
}

void DefineNumbers(TagWriter& movie, const Font& font, Rgba color)
{
    TagWriter digit;
    for (U16 i = 0; i < 10; i++) {
        const std::string numeral(1, char('0' + i));
        DefineText(movie, U16(kDigitText + i), font,
                   {{numeral, 0.9, 11.2, 30, Hex(0xf0c890, 120), 0.5},
                    {numeral, 0, 10.4, 30, color, 0.5}});
    }
    for (U16 i = 0; i < 10; i++) {
        if (i == 0)
            digit.DoAction(AssembleScript("Stop"));
        else
            digit.RemoveDepth(1);
        digit.Place(U16(kDigitText + i), 1).Show();
    }
    movie.DefineSprite(kDigit, digit.End());
    TagWriter number;
    number.Place2(1, {.character = kDigit, .matrix = At(-9, 0), .name = "tens"});
    number.Place2(2, {.character = kDigit, .matrix = At(9, 0), .name = "ones"});
    movie.DefineSprite(kNumber, number.Show().End());
}

// Brighter and a little larger under the pointer, pressed in when it is held; a click or the key
// runs the actions.
void DefineButton(TagWriter& movie, U16 id, const Font& font, std::string_view words, U16 wood,
                  U16 text, const std::string& actions, int key)
{
    DefineText(movie, text, font,
               {{words, 0.9, 9.6, 25, Hex(0x2a1408, 150), 0.5, 1},
                {words, 0, 8.6, 25, Hex(0xfff0cc), 0.5, 1}});
    const Mat large = Mat::Scale(1.05), pressed = Pose(0, 2, 0.98, 0.98);
    const Cx bright = Cx::Add(26, 20, 6), dim = Cx::Multiply(224, 216, 208);
    movie.DefineButton(id, kTagDefineButton2,
                       {{1 | 8, wood, 1},
                        {2, wood, 1, large, bright},
                        {4, wood, 1, pressed, dim},
                        {1, text, 2},
                        {2, text, 2, large},
                        {4, text, 2, pressed}},
                       {{1u << 3 | U32(key) << 9, AssembleScript(actions + " <00>")}});
    movie.Raw(kTagDefineButtonSound,
              ByteWriter().PutU16(id).PutU16(0).PutU16(0).PutU16(kClickSound).PutU8(0).PutU16(0));
}

} // namespace orchard
