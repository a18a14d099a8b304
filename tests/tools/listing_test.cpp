#include "tests/tools/tool_runner.h"

namespace {

// One of each tag that is listed with fields of its own.
std::vector<U8> Sampler()
{
    TagWriter sprite;
    sprite.Place(1, 1).Show().Label("inner").Show().End();
    ShapeBuilder shape;
    shape.Styles(shape.AddFill(Rgba{1, 2, 3, 255}), 0, shape.AddLine({40, {4, 5, 6, 255}}));
    shape.MoveTo(0, 0).LineTo(200, 0).CurveTo(300, 100, 200, 200).NewStyles();
    shape.Styles(shape.AddFill(Rgba{9, 9, 9, 255}), 0).LineTo(0, 0);
    MovieWriter movie(550 * 20, 400 * 20, Fps(12.5));
    movie.Background({255, 0, 16, 255}).DefineShape(1, 22, {-20, 320, -20, 220}, shape);
    movie.DefineSprite(2, sprite).Label("st\"art").Show();
    movie.Place(1, 3, Mat::Translate(40, -60)).DoAction({7, 0}).FreeCharacter(9).Show();
    movie.Place2(4, {.character = U16(2),
                     .cx = Cx::Alpha(0.5),
                     .ratio = U16(5),
                     .name = "caf\xe9",
                     .clipDepth = U16(9)});
    movie.Place2(3, {.move = true, .matrix = Mat{0x18000, 0, 0, 0x8000, 1, 2}});
    movie.Remove(1, 3).RemoveDepth(4).Raw(500, {1, 2, 3}).Show().End();
    return movie.Bytes();
}

class Listing : public ToolTest {
protected:
    void Has(const std::string& text, const std::string& part)
    {
        EXPECT_NE(std::string::npos, text.find(part)) << part << "\nis not in\n" << text;
    }
};

TEST_F(Listing, DumpShowsEveryTag)
{
    Write("m.vxm", Sampler());
    const Outcome outcome = Run({"dump", "m.vxm"});
    EXPECT_EQ(0, outcome.code);
    EXPECT_EQ("", outcome.err);
    for (const char* part :
         {"       0  header version=5", "frame=0,11000,0,8000 rate=12.5 frames=3\n",
          "      21  SetBackgroundColor code=9 length=3 color=#ff0010\n", "DefineShape2 code=22",
          "id=1 bounds=-20,320,-20,220 fills=2 lines=1 edges=3\n", "  DefineSprite code=39",
          "id=2 frames=2\n", "    PlaceObject code=4 length=5 id=1 depth=1 matrix=identity\n",
          "    FrameLabel code=43 length=6 label=\"inner\"\n", "label=\"st\\\"art\"\n",
          "id=1 depth=3 matrix=1,0,0,1,40,-60\n", "DoAction code=12 length=2\n",
          "FreeCharacter code=3 length=2 id=9\n",
          "flags=0x7a depth=4 id=2 cxform=r*256+0,g*256+0,b*256+0,a*128+0 ratio=5 "
          "name=\"caf\\xe9\" clip=24931\n",
          "flags=0x05 depth=3 move matrix=1.5,0,0,0.5,1,2\n",
          "RemoveObject code=5 length=4 id=1 depth=3\n", "RemoveObject2 code=28 length=2 depth=4\n",
          "Tag500 code=500 length=3\n", "  End code=0 length=0\n"})
        Has(outcome.out, part);
}

TEST_F(Listing, DumpSaysWhereTheDataEnds)
{
    std::vector<U8> bytes = Sampler();
    const std::string declared = std::to_string(bytes.size());
    bytes.resize(40);
    const Outcome outcome = Run({"dump", "-"}, bytes);
    EXPECT_EQ(0, outcome.code);
    Has(outcome.out, "      26  incomplete: 14 bytes\n");
    EXPECT_EQ("vexel: -: truncated: 0 of 3 frames are complete (40 of " + declared + " bytes)\n",
              outcome.err);
}

TEST_F(Listing, InfoAsText)
{
    Write("m.vxm", Sampler());
    const std::string text = Run({"info", "m.vxm"}).out;
    for (const char* part :
         {"version   5\n", "size      550x400 pixels (0,11000,0,8000 twips)\n",
          "rate      12.5 frames a second\n", "frames    3\n", "      5  ShowFrame\n",
          "      1  Tag500\n", "      1  \"st\\\"art\"\n",
          "      1  shape   DefineShape2  -20,320,-20,220 twips\n",
          "      2  sprite  DefineSprite  2 frames\n"})
        Has(text, part);
    EXPECT_EQ(std::string::npos, text.find("inner")) << "labels are the main timeline's";
}

TEST_F(Listing, InfoAsJson)
{
    const std::vector<U8> bytes = Sampler();
    const std::string length = std::to_string(bytes.size());
    Write("m\"\xe9.vxm", bytes);
    EXPECT_EQ(
        "{\"schema\":1,\"file\":\"m\\\"\\u00e9.vxm\",\"version\":5,\"length\":" + length +
            ",\"bytes\":" + length +
            ",\"truncated\":false,\"size\":[550,400],\"frame\":[0,11000,0,8000],\"rate\":12.5,"
            "\"frames\":3,\"framesFound\":3,\"tags\":{\"End\":2,\"ShowFrame\":5,"
            "\"FreeCharacter\":1,\"PlaceObject\":2,\"RemoveObject\":1,\"SetBackgroundColor\":1,"
            "\"DoAction\":1,\"DefineShape2\":1,\"PlaceObject2\":2,\"RemoveObject2\":1,"
            "\"DefineSprite\":1,\"FrameLabel\":2,\"Tag500\":1},"
            "\"labels\":[{\"frame\":1,\"name\":\"st\\\"art\"}],\"characters\":["
            "{\"id\":1,\"type\":\"shape\",\"tag\":\"DefineShape2\",\"code\":22,"
            "\"bounds\":[-20,320,-20,220]},"
            "{\"id\":2,\"type\":\"sprite\",\"tag\":\"DefineSprite\",\"code\":39,\"frames\":2}]}\n",
        Run({"info", "--json", "m\"\xe9.vxm"}).out);
    Write("short.vxm", {bytes.begin(), bytes.begin() + 40});
    Has(Run({"info", "short.vxm", "--json"}).out, "\"bytes\":40,\"truncated\":true,");
}

TEST_F(Listing, HelpAndVersion)
{
    const Outcome version = Run({"--version"});
    EXPECT_EQ(0u, version.out.find("vexel "));
    EXPECT_EQ(0, version.code);
    for (const char* word : {"--help", "-h"}) {
        const Outcome help = Run({word});
        EXPECT_EQ(0, help.code);
        for (const char* part : {"vexel render", "vexel info", "vexel dump", "--background"})
            Has(help.out, part);
    }
}

} // namespace
