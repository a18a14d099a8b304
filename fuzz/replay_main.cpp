// A plain main() for the fuzz entries: runs each file named on the command line once. Folders are
// the caller's business.
#include <cstdio>
#include <vector>

#include "core/geom/types.h"

extern "C" int LLVMFuzzerTestOneInput(const U8* data, size_t size);

static bool Replay(const char* name)
{
    std::FILE* f = std::fopen(name, "rb");
    if (!f) {
        std::fprintf(stderr, "replay: cannot read %s\n", name);
        return false;
    }
    std::vector<U8> bytes;
    U8 buffer[65536];
    while (size_t n = std::fread(buffer, 1, sizeof buffer, f))
        bytes.insert(bytes.end(), buffer, buffer + n);
    std::fclose(f);
    LLVMFuzzerTestOneInput(bytes.data(), bytes.size());
    return true;
}

int main(int argc, char** argv)
{
    bool all = argc > 1;
    for (int i = 1; i < argc; ++i)
        all = Replay(argv[i]) && all;
    std::printf("%d inputs replayed\n", argc - 1);
    return all ? 0 : 1;
}
