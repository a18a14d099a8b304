// The pictures of an animation, kept until all of them are known.
#pragma once

#include "core/geom/rect.h"
#include "core/raster/bit_buffer.h"

#include <cstdio>
#include <vector>

// The smallest rectangle around the places where two pictures of that width differ; empty when they
// are equal. Sizes are equal and not 0.
template <typename T>
SRECT ChangedRect(const std::vector<T>& before, const std::vector<T>& after, S32 width);

// Of each picture the rectangle that differs from the one before is packed into a temporary file
// without a name; a picture that differs nowhere makes the one before last longer. Then they can be
// gone through again, once. False means that the temporary file failed; errno says why.
class PictureSpool {
public:
    struct Shot {
        SRECT changed; // pixels; all of the first picture
        S32 pictures;  // how many it stands for
    };

    PictureSpool() = default;
    ~PictureSpool();
    PictureSpool(const PictureSpool&) = delete;
    PictureSpool& operator=(const PictureSpool&) = delete;

    bool Open(S32 width, S32 height);
    bool Add(const CBitBuffer& picture);
    // Back to the start: from here on pictures are read.
    bool Rewind();
    // Brings `canvas` to the next shot.
    bool Next();

    std::vector<Shot> shots;
    std::vector<U32> canvas; // the last picture added or read: rows from the top, as the player's

private:
    U32* RowOf(S32 y) { return canvas.data() + static_cast<size_t>(y) * width; }
    bool Pack(const SRECT& r);

    S32 width = 0;
    S32 height = 0;
    std::FILE* file = nullptr;
    size_t read = 0; // shots since Rewind
    std::vector<U32> next;
    std::vector<U8> packed;
};
