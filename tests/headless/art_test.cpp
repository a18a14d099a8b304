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

// Another renderer drew the references, with strokes. Where art has none or thin ones the limit
// leaves only other anti-aliasing and gradient arithmetic; thick outlines are still missing from
// the rest.
TEST(Art, LooksLikeTheReferences)
{
    struct Row {
        const char* name;
        int limit;
    };
    const Row rows[] = {{"bouquet", 90},   {"circles", 85},       {"gradients", 150},
                        {"pumpkin", 100},  {"strawberries", 190}, {"tiger", 280},
                        {"scorpion", 330}, {"home", 620},         {"horse", 720},
                        {"showers", 840},  {"navyflag", 850},     {"calendar", 1050},
                        {"help", 1900}};
    for (const Row& row : rows) {
        std::string base = std::string(VEXEL_SOURCE_DIR "/tests/data/art/") + row.name;
        Picture want;
        ASSERT_TRUE(LoadPng(base + ".png", &want)) << base;
        NativePlayerWnd player(want.width, want.height);
        std::vector<U8> bytes = FileBytes(base + ".vxm");
        player.Feed(bytes.data(), bytes.size());
        player.EndOfData();
        EXPECT_LE(MeanDistance(Shot(&player), want), row.limit) << row.name;
    }
}

} // namespace
