// SDrag: the object that a script lets the pointer drag.
#pragma once

#include "core/display/object_ref.h"
#include "core/geom/rect.h"

struct SDrag {
    explicit SDrag(DisplayList* list) : object(list) { RectSetEmpty(&bounds); }

    ObjectRef object;        // null: nothing is dragged
    bool lockCenter = false; // its origin stays under the pointer
    SRECT bounds;            // where its origin may be, twips of its parent; empty: anywhere
    SPOINT start = {};       // the pointer when the drag began, pixels
    SPOINT origin = {};      // its translation then, twips
};
