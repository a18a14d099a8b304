// SObject: one instance of a character on the display list, and the walks over the object tree.
#pragma once

#include "core/geom/matrix.h"
#include "core/geom/rect.h"
#include "core/raster/color.h"

class CRaster;
class DisplayList;
class EditText;
class ScriptThread;
struct RColor;
struct REdge;
struct SCharacter;

// Placement of an object relative to its parent, or of a whole chain of parents.
struct STransform {
    MATRIX mat;
    ColorTransform cxform;

    // Becomes the transform that applies `inner` first and then what this was.
    void Concat(const STransform* inner);
};

// Objects come zeroed from the display list's pool and go back to it; they are placed, moved and
// removed through the DisplayList only. Siblings are linked from the lowest depth up.
struct SObject {
    DisplayList* display;  // the list that owns the object
    SObject* parent;       // null for the root
    SObject* above;        // next higher sibling
    SObject* bottomChild;  // lowest child
    SObject* passedChild;  // where a search of the children may start, for depths above its own
    SCharacter* character; // what is shown; null only for the root. Counted as a user of the record
    U16 depth;             // ordering key among siblings
    U16 ratio;             // morph ratio
    U32 nameHash;          // of the name, for those who look for one among many; 0 for none
    char* name;            // instance name, owned; null when there is none. Set by SetName only
    ScriptThread* thread;  // a sprite's or movie's own timeline, else that of the parent
    STransform xform;      // relative to the parent
    SRECT devBounds;       // device units, valid after CalcUpdate
    SRECT reach;           // of what is built: devBounds, and the edges where they lie far outside
    U8 puppet;             // scripts have taken over: timelines no longer move it
    U8 state;              // button state
    U8 drawn;              // its edges went to the raster since the last recalculation
    U8 dirty;              // to be recalculated, with all below it
    U8 visible;            // 0 hides it and all below it, also from hit tests
    U16 clipDepth;         // non-zero: masks the following siblings up to this depth
    S32 reservedWord;      // cleared
    SRECT reservedRect;    // emptied
    char* dropTarget;      // owned; path of the object that it was last dropped over
    REdge* edges;          // cached, device units
    RColor* colors;        // of those edges
    EditText* editText;    // of a text field, owned; null without memory for one
    U8 built;              // edges and colours are those of the shape, even when there are none
    U8 unbuiltBelow;       // some object below may not be built
    U32 serial;            // never the same for two objects of one list: tells a recycled record
    SObject* nextAlive;    // links of the display list's objects
    SObject** aliveLink;
    U16 nesting;    // number of parents
    U16 remaskFrom; // children of these depths were masked anew since the last recalculation: they
    U16 remaskTo;   // are to be repainted where they stand; none when remaskTo is 0

    // To be called before every change of matrix, colour transform, character or ratio.
    void Modify();
    // Takes a copy of a name, which may be its own; null for none.
    void SetName(const char* newName);
    // Recalculates device bounds of what changed, here and below, and invalidates old and new
    // places.
    void CalcUpdate(const MATRIX* parentMat, bool forced);
    // devBounds of the character through `mat`; empty without a character.
    void CalcDevBounds(const MATRIX* mat);

    // Hands the edges of this object and all below it to the raster. `xform` is the parent's.
    void Draw(CRaster* raster, STransform xform, RColor* clip);
    // Draws the mask that this object is, and what it masks; returns the first sibling after that.
    SObject* DrawClipBracket(CRaster* raster, const STransform* parentXform, RColor* clip);
    // Builds edges and colours under `xform` (this object's own included) unless they are cached.
    void BuildEdges(const STransform* xform);
    // Builds what is in view and not built yet, here and below, and has repainted what reaches out
    // of its bounds. `xform` is the parent's.
    void BuildNew(STransform xform);

    // `pt` (device units) lies on this object's own shape. `xform` includes this object's.
    bool HitTestOne(const STransform* xform, const SPOINT* pt);
    // Sets `hit` to the topmost object of this subtree under `pt`; leaves it alone when there is
    // none.
    void HitTest(SObject*& hit, STransform xform, const SPOINT* pt);
    // Sets `hit` to the topmost button or selectable text field of this subtree under `pt`.
    void HitButton(SObject*& hit, STransform xform, const SPOINT* pt);
    // Device bounds of a button's hit area; empty for what is no button or has none. With a budget,
    // no more records than that, which are taken off it.
    void CalcButtonBounds(SRECT* r, U32* budget = nullptr);
    // For a mask: the next sibling when `pt` is inside it, else the first sibling beyond its range.
    SObject* HitClipper(const STransform* parentXform, const SPOINT* pt);

    // Shows another character, whose text field is made if it is one.
    void SetCharacter(SCharacter* ch);
    // The character is new: makes its text field if it is one, which takes its variable's text,
    // unless an open hold has made the object.
    void MakeEditText();
    void FreeEditText();
    // For any object, of all text fields of its display list that are bound to a variable of the
    // timeline: they show its new value. With flag 0 the one that has the keyboard focus does not.
    void UpdateEditText(const ScriptThread* timeline, const char* varName, const char* value,
                        int flag);
    // The pointer at `pt` (device units) presses, or drags, in this object's text field; or lets
    // go.
    void EditTextMouse(const SPOINT* pt, int down);
    enum EScroll { kGetScroll, kGetMaxScroll, kSetScroll };
    // Reads a scroll position of the first of these fields, or sets those of all; false when there
    // is none.
    bool ScrollEditText(const ScriptThread* timeline, const char* varName, int what, S32* scroll);

    // Gives the cached edges and colours back to the pools.
    void FreeCache();
    // The same for this object and all below it.
    void FreeCacheTree();
    // Removes all children.
    void FreeChildren();
    // Releases all that the object owns, the record itself excepted.
    void Free();

    // The object has a timeline of its own.
    bool OwnsThread() const;
    // Where it was drawn, device units.
    const SRECT* DrawnPlace() const { return built ? &reach : &devBounds; }
    // This object is a mask for its siblings.
    bool IsClip() const { return clipDepth != 0; }

private:
    void BuildShapeEdges(const STransform* placed);
    void FindReach();
    void BuildNoted(const STransform* placed);
    bool MayShowIn(const SRECT* area) const;
    void Recalculate(const MATRIX* mat);
    void RecalculateText(const MATRIX* mat);
    void Unbuild();
    void InvalidateRemasked();
    void InvalidateDrawn();
    SObject* DrawInOrder(CRaster* raster, const STransform* parentXform, RColor* clip);
    void AddOwnEdges(CRaster* raster, RColor* clip);
    void DrawEditText(CRaster* raster, RColor* clip);
    RColor* MaskColor() const;
    bool EdgesContain(const SPOINT* pt);
    bool FieldContains(const MATRIX* placed, const SPOINT* pt) const;
    bool ButtonContains(const STransform* placed, const SPOINT* pt);
    bool AreaContains(SCharacter* area, const STransform* placed, const SPOINT* pt);
    bool TakeColorFlags();
    SObject* FirstBeyond(U16 maskDepth) const;
    void LeaveTimeline();
};

// The object's own coordinates to the device's, rounded as CalcUpdate rounds them.
void GetDeviceMatrix(const SObject* obj, MATRIX* mat);

// Union of the character's bounds and those of all children, in the coordinates of the object's
// parent, or through `mat` as well. Morphs count with their start bounds.
void GetBoundingBox(SObject* obj, SRECT* r);
void GetBoundingBox(SObject* obj, const MATRIX* mat, SRECT* r);
