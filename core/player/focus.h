// The keyboard focus on buttons.
#pragma once

#include "core/display/object_ref.h"
#include "core/geom/rect.h"
#include "core/geom/types.h"

// A button and where it is.
struct SButton {
    explicit SButton(DisplayList* list) : object(list) { RectSetEmpty(&bounds); }

    ObjectRef object; // null: none
    SRECT bounds;     // device units
};

enum SDirection { kDirUp = 0, kDirDown = 1, kDirRight = 2, kDirLeft = 3 };

// The nearest button in each direction.
struct ButtonOrder {
    explicit ButtonOrder(DisplayList* list)
        : candidates{ObjectRef(list), ObjectRef(list), ObjectRef(list), ObjectRef(list)}
    {
    }

    ObjectRef candidates[4]; // by SDirection
    SRECT bounds[4] = {};    // device units
};

// An entry of the tab map; no actions run while one exists.
struct ButtonWeight {
    SObject* object;
    SRECT bounds; // device units
    S32 weight;   // ascending in tab order
};

// Tab order by rows: 2 * ymin + xmin / 3, toward zero.
S32 CalcButtonWeight(const SRECT* r);
// Sorts entries 0 to `last` by ascending weight; equal ones keep their order.
void ButtonSort(ButtonWeight* list, int last);
