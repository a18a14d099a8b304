#include "bench/scene.h"

#include <cstdio>
#include <cstdlib>

#include "bench/movies.h"
#include "tests/support/movie_writer.h"

const std::vector<BenchMovie>& BenchMovies()
{
    static const std::vector<BenchMovie> kMovies = [] {
        std::vector<BenchMovie> all;
        for (const char* name :
             {"tiger", "bouquet", "calendar", "circles", "gradients", "help", "home", "horse",
              "navyflag", "pumpkin", "scorpion", "showers", "strawberries"})
            all.push_back(
                {name, std::string(VEXEL_SOURCE_DIR "/tests/data/art/") + name + ".vxm", 0});
        for (const char* name : {"viaduct", "clockwork", "shapes"})
            all.push_back({name, std::string(VEXEL_SOURCE_DIR "/samples/") + name + ".vxm", 20});
        all.push_back({"page", "", 0, PageMovie});
        all.push_back({"photo", "", 0, PhotoMovie});
        all.push_back({"enlarged", "", 0, EnlargedMovie});
        all.push_back({"turned", "", 0, TurnedMovie});
        all.push_back({"morphs", "", 0, MorphMovie, false});
        return all;
    }();
    return kMovies;
}

static std::vector<U8> ReadFile(const std::string& path)
{
    std::vector<U8> bytes;
    std::FILE* f = std::fopen(path.c_str(), "rb");
    if (!f) {
        std::fprintf(stderr, "bench: cannot read %s\n", path.c_str());
        std::exit(1);
    }
    U8 buffer[65536];
    while (size_t n = std::fread(buffer, 1, sizeof buffer, f))
        bytes.insert(bytes.end(), buffer, buffer + n);
    std::fclose(f);
    return bytes;
}

BenchScene::BenchScene(const BenchMovie& movie, S32 width, S32 height, int quality)
    : player(width, height)
{
    player.SetQuality(quality);
    std::vector<U8> bytes = movie.make ? movie.make() : ReadFile(movie.path);
    player.Feed(bytes.data(), bytes.size());
    player.EndOfData();
    for (int i = 0; i < movie.stillFrame; ++i)
        player.Tick();
    player.Picture();
}

BenchScene::~BenchScene()
{
    player.scene.RemoveThisObject(small);
}

void BenchScene::Repaint()
{
    player.scene.InvalidateRect(&player.scene.devViewRect);
    player.scene.Update();
}

void BenchScene::Rebuild()
{
    player.scene.root.FreeCacheTree();
    player.scene.ModifyCamera();
    player.scene.Update();
}

void BenchScene::MoveSmallObject()
{
    if (!small) {
        ShapeBuilder dot;
        int fill = dot.AddFill(Rgba{255, 64, 32, 200});
        dot.Styles(0, fill).Circle(0, 0, 200);
        ByteWriter body;
        dot.Write(body, true);
        smallShape = body.Bytes();
        smallShape.resize(smallShape.size() + 1);
        smallCharacter = player.NewPrivateCharacter();
        smallCharacter->type = kCharShape;
        smallCharacter->tagCode = 32;
        smallCharacter->data = smallShape.data();
        smallCharacter->dataLen = S32(smallShape.size() - 1);
        smallCharacter->bounds = {-200, 200, -200, 200};
        PlaceInfo info;
        info.Clear();
        info.character = smallCharacter;
        info.depth = 60000;
        small = player.scene.PlaceObject(&player.scene.root, &info);
    }
    small->Modify();
    small->xform.mat.tx = player.frame.xmin + 2000 + step % 64 * 120;
    small->xform.mat.ty = player.frame.ymin + 2500 + step % 37 * 100;
    ++step;
    player.scene.Update();
}
