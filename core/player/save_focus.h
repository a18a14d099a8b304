// SaveFocus: keeps the keyboard focus across a frame that rebuilds the objects.
#pragma once

#include "core/geom/types.h"

struct SObject;
class SPlayer;

// Save before a frame is drawn, Clear after it, nested as frames are. What has the focus at the
// outermost Save is remembered by its way down the tree, never by a pointer; if it is gone at the
// outermost Clear and an object with the same character stands where it was, that one gets the
// focus; a text field, what was selected and in view, too.
class SaveFocus {
public:
    explicit SaveFocus(SPlayer* player) : splayer(player) {}

    void Save();
    void Clear();
    // Nothing is remembered.
    void Forget();

private:
    static constexpr int kMaxDepth = 128;

    // Depths from the display root down; no levels: nothing is remembered.
    struct SPath {
        int levels = 0;
        U16 depth[kMaxDepth];
        U16 id;  // of the character
        U8 type; // of the character
    };

    void RestoreButton(SObject* obj);
    void RememberText(const SObject* obj);
    void RestoreText(SObject* obj);
    void Remember(const SObject* obj, SPath* path) const;
    SObject* Follow(const SPath& path) const;

    SPlayer* splayer;
    int nesting = 0;
    bool shown = false; // the button's focus, by its highlight
    SPath button;
    SPath text;
    U32 anchor = 0; // of the text field's selection
    U32 caret = 0;
    S32 scroll = 1;
    bool selecting = false; // the mouse is down in it
};
