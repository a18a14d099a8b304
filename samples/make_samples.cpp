#include "samples/scene.h"

#include <cstdio>
#include <string>

// Writes every sample movie into the folder given: make_samples FOLDER.

static bool Save(const std::string& path, const std::vector<U8>& bytes)
{
    FILE* file = std::fopen(path.c_str(), "wb");
    if (!file)
        return false;
    bool whole = std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
    return (std::fclose(file) == 0) && whole;
}

int main(int argc, char** argv)
{
    if (argc != 2) {
        std::fprintf(stderr, "usage: make_samples FOLDER\n");
        return 2;
    }
    const struct {
        const char* name;
        std::vector<U8> (*make)();
    } movies[] = {
        {"viaduct.vxm", MakeViaduct}, {"clockwork.vxm", MakeClockwork},
        {"shapes.vxm", MakeShapes},   {"poster.vxm", MakePoster},
        {"gallery.vxm", MakeGallery}, {"metamorphosis.vxm", MakeMetamorphosis},
    };
    for (const auto& movie : movies) {
        std::string path = std::string(argv[1]) + "/" + movie.name;
        if (!Save(path, movie.make())) {
            std::fprintf(stderr, "make_samples: cannot write %s\n", path.c_str());
            return 1;
        }
    }
    return 0;
}
