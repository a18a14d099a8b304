// What `vexel info` tells about a movie.
#pragma once

#include "tools/vexel/tag_reader.h"

#include <bitset>
#include <map>
#include <vector>

struct InfoLabel {
    int frame; // counts from 1
    std::string name;
};

struct InfoCharacter {
    U16 id;
    const char* type;
    S32 tagCode;
    bool hasBounds = false;
    SRECT bounds = {}; // twips
    bool hasSize = false;
    S32 width = 0; // pixels, of an image
    S32 height = 0;
    S32 frames = 0; // of a sprite
};

// Tags and characters of sprites are counted with the others; labels are the main timeline's.
struct MovieInfo {
    std::map<S32, U32> tags; // code to count
    std::vector<InfoLabel> labels;
    std::vector<InfoCharacter> characters; // in the order of their definition
    int frames = 0;                        // of the main timeline, as found

    void Collect(TagReader reader, int depth);

private:
    void CollectTag(TagReader* reader, int depth);
    void Define(TagReader* reader, const char* type);

    std::bitset<65536> defined;
};
