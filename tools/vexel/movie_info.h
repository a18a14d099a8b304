// What `vexel info` tells about a movie.
#pragma once

#include "core/sound/sound.h"
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
    bool hasSound = false;
    U8 format = 0; // SSoundFormat bits
    U32 samples = 0;
};

// What the head of a streaming sound says.
struct InfoStream {
    int sprite; // whose timeline it is in; -1: the main one
    U8 format;  // SSoundFormat bits
    U32 samplesPerFrame;
    int blocks = 0; // up to the timeline's next head
};

// Tags and characters of sprites are counted with the others; labels are the main timeline's.
struct MovieInfo {
    std::map<S32, U32> tags; // code to count
    std::vector<InfoLabel> labels;
    std::vector<InfoCharacter> characters; // in the order of their definition
    std::vector<InfoStream> streams;       // in the order of their heads
    int frames = 0;                        // of the main timeline, as found

    // `sprite`: whose timeline it is, or -1.
    void Collect(TagReader reader, int depth, int sprite = -1);

private:
    void CollectTag(TagReader* reader, int depth);
    void Define(TagReader* reader, const char* type);
    void CollectStream(TagReader* reader, int sprite, size_t* head);

    std::bitset<65536> defined;
};

// The word for a sound's compression; what its bits and rate are once decoded.
const char* CompressionName(U8 format);
int SoundBits(U8 format);
double SoundSeconds(U8 format, U32 samples);
