#include "samples/scene.h"

#include <cstdio>
#include <fstream>
#include <iterator>
#include <string>

// Writes every sample movie into the folder given: make_samples FOLDER. The images of album.vxm are
// kept when it is there already; delete it to pack them anew.

static bool Save(const std::string& path, const std::vector<U8>& bytes)
{
    FILE* file = std::fopen(path.c_str(), "wb");
    if (!file)
        return false;
    bool whole = std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
    return (std::fclose(file) == 0) && whole;
}

// Nothing when there is no such file.
static std::vector<U8> Load(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

int main(int argc, char** argv)
{
    if (argc != 2) {
        std::fprintf(stderr, "usage: make_samples FOLDER\n");
        return 2;
    }
    const std::string folder = argv[1] + std::string("/");
    const struct {
        const char* name;
        std::vector<U8> bytes;
    } movies[] = {
        {"viaduct.vxm", MakeViaduct()},
        {"clockwork.vxm", MakeClockwork()},
        {"shapes.vxm", MakeShapes()},
        {"poster.vxm", MakePoster()},
        {"gallery.vxm", MakeGallery()},
        {"metamorphosis.vxm", MakeMetamorphosis()},
        {"orchard.vxm", MakeOrchard()},
        {"orchard_end.vxm", MakeOrchardEnd()},
        {"form.vxm", MakeForm()},
        {"album.vxm", MakeAlbum(Load(folder + "album.vxm"))},
    };
    for (const auto& movie : movies) {
        if (!Save(folder + movie.name, movie.bytes)) {
            std::fprintf(stderr, "make_samples: cannot write %s%s\n", folder.c_str(), movie.name);
            return 1;
        }
    }
    return 0;
}
