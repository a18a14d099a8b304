#include <cstdlib>
#include <fstream>
#include <iterator>

#include "tests/player/player_scene.h"

namespace {

std::vector<U8> FileBytes(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

// Mean distance of a channel from the reference, in hundredths of a unit.
int MeanDistance(const Picture& got, const Picture& want)
{
    S64 sum = 0;
    for (size_t i = 0; i < got.pixels.size(); ++i)
        for (int shift : {0, 8, 16})
            sum += std::abs(int(got.pixels[i] >> shift & 255) - int(want.pixels[i] >> shift & 255));
    return int(sum * 100 / S64(got.pixels.size() * 3));
}

// Another renderer drew the references. The limits leave only other anti-aliasing and gradient
// arithmetic, and lines that are a little thinner.
TEST(Art, LooksLikeTheReferences)
{
    const std::pair<const char*, int> rows[] = {
        {"bouquet", 75},      {"circles", 75}, {"gradients", 135}, {"pumpkin", 45},
        {"strawberries", 60}, {"tiger", 180},  {"scorpion", 85},   {"home", 115},
        {"horse", 205},       {"showers", 65}, {"navyflag", 255},  {"calendar", 85},
        {"help", 85}};
    for (const auto& [name, limit] : rows) {
        std::string base = std::string(VEXEL_SOURCE_DIR "/tests/data/art/") + name;
        Picture want;
        ASSERT_TRUE(LoadPng(base + ".png", &want)) << base;
        NativePlayerWnd player(want.width, want.height);
        std::vector<U8> bytes = FileBytes(base + ".vxm");
        player.Feed(bytes.data(), bytes.size());
        player.EndOfData();
        EXPECT_LE(MeanDistance(Shot(&player), want), limit) << name;
    }
}

} // namespace
