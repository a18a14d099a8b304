// EditText: the text field of one display object.
#pragma once

#include "core/geom/grow_buffer.h"
#include "core/text/field_font.h"
#include "core/text/field_record.h"
#include "core/text/text_layout.h"

class CRaster;
class ScriptThread;
struct RColor;
struct REdge;
struct SObject;
struct STransform;

// Text, its layout, what of it is selected, and how it is drawn. Made for an object that shows a
// text field, and owned by it; made anew when another field takes its place. Reads the field's
// record and outlines in the buffer of the movies that they are from, so it must be gone before the
// field's movie is. All fields of a display list are linked there in the order they were made in.
class EditText {
public:
    // The fields of one display list, and some that are out of use and keep their memory.
    struct List {
        EditText* first = nullptr;
        EditText* last = nullptr;
        EditText* spare = nullptr;
        U32 count = 0; // at most SLimits::textFields
        U32 spares = 0;
        U32 bytes = 0; // that they have room for, at most SLimits::textFieldBytes

        ~List() { FreeSpares(); }
        void FreeSpares();
    };

    // The field that `obj` shows, with its initial text. Null when memory or a limit forbids it;
    // the object then shows nothing.
    static EditText* Create(SObject* obj);
    // With its edges and colours; the object that it is of lets go of it.
    static void Destroy(EditText* field);
    EditText(const EditText&) = delete;
    EditText& operator=(const EditText&) = delete;

    const SFieldRecord& Record() const { return record; }
    const char* Text() const { return layout.Text(); }
    U32 Length() const { return layout.Length(); }
    // The greatest length that it has had, which counts for the limit.
    U32 Room() const { return room; }
    // Replaces the text as scripts do, whatever the field's greatest length: selection and
    // scrolling stay as far as the new text allows.
    void SetText(std::string_view text);
    // Byte offsets; what lies between them is selected.
    U32 Anchor() const { return anchor; }
    U32 Caret() const { return caret; }
    bool HasSelection() const { return anchor != caret; }
    U32 SelectionStart() const { return anchor < caret ? anchor : caret; }
    U32 SelectionEnd() const { return anchor < caret ? caret : anchor; }

    // --- keyboard, mouse and clipboard; the bound variable is left to the caller ---
    // False when the field has no use for the key. Codes and modifiers as in SPlayer.
    bool HandleKeyDown(int key, int modifiers);
    // `pt` in twips of the field: a press, the moves after it, and with `down` off the release.
    void Mouse(const SPOINT& pt, bool down);
    bool Selecting() const { return selecting; } // between these two
    // Offsets beyond the text count as its end. Scrolls the caret, which is at `to`, into view.
    void Select(U32 from, U32 to);
    // The same for a field in the place of one that was selected in, with the mouse down or not.
    void Resume(U32 from, U32 to, bool mouseDown);
    // In place of what is selected, as much as the greatest length allows. Nothing where nothing
    // may be typed.
    void Insert(std::string_view s);
    void DeleteSelection(); // nothing either where nothing may be typed
    bool MayType() const { return !record.Has(kFieldReadOnly); }
    // How often keys, clipboard and mouse have changed the text.
    U32 Edits() const { return edits; }
    // Nothing is selected any more.
    void LoseFocus();
    // There is one to be seen, now or when it has blinked.
    bool ShowsCaret() const;
    // Hides the caret, or shows it again; whatever moves it shows it too.
    void BlinkCaret();

    // --- the bound variable ---
    // Takes the variable's text, or, if there is none, makes it from the initial text.
    void UpdateFromVariable();
    // The timeline of the bound variable and its name there; null when there is none now.
    ScriptThread* Bound(const char** name) const;
    // The variable is that of a timeline.
    bool IsBoundTo(const ScriptThread* thread, const char* name, U32 nameHash) const;

    // --- scrolling, in lines from 1 ---
    S32 Scroll() const { return layout.Scroll(); }
    S32 MaxScroll() const { return layout.MaxScroll(); }
    void SetScroll(S32 scroll); // clamped

    // --- drawing ---
    // Where what has changed since the last call lies, in the field's own space; empty for nothing
    // in view. Its edges are built anew then.
    SRECT TakeDirt();
    // Builds what is missing of box, selection and the lines in view. The glyphs' colours are the
    // object's.
    void Build(const STransform* placed);
    // Hands all to the raster, the text inside the field's bounds only.
    void Draw(CRaster* raster, RColor* clip);
    // The same for a field that is a mask: its glyphs.
    void DrawMask(CRaster* raster, RColor* clip);
    void FreeCache();

    EditText* next = nullptr; // link of the list

private:
    friend class FieldPainter;

    EditText() = default;
    ~EditText() = default;
    bool Prepare(SObject* object);
    void TakeVariable();
    bool TakePath();
    void Link();
    void Unlink();
    U32 Allowed() const;
    void TakeRoom();
    void NoteLines(U32 from, U32 to);
    void NoteSelection();
    void NoteEdit();
    SRECT StripOf(U32 from, U32 to) const;
    void FreeLines(U32 from, U32 to);
    void FreeSelection();
    void MoveCaret(ECaretMove move, bool extend);
    bool ScrollBy(ECaretMove move);
    void DeleteBy(ECaretMove move);
    bool ReplaceSelection(std::string_view s);
    void SetSelection(U32 from, U32 to);
    void ShowCaret();

    static constexpr U32 kLastLine = TextLayout::kLastLine;

    SObject* obj = nullptr;
    EditText* previous = nullptr;
    SFieldRecord record;
    FieldFont font;
    TextLayout layout;
    GrowBuffer<char> path; // of the bound variable, with its zero byte; empty: not bound
    U32 nameHash = 0;      // of the name at the path's end
    U32 room = 0;
    U32 anchor = 0;
    U32 caret = 0;
    S32 goal = TextLayout::kNoGoal; // of caret moves, see TextLayout::Move
    U32 edits = 0;
    U32 dirtyFrom = kLastLine; // lines that have changed
    U32 dirtyTo = 0;
    bool selecting = false;     // the mouse is down in it
    bool caretOn = true;        // blinks
    REdge* backEdges = nullptr; // border, background and selection
    RColor* backColors = nullptr;
    GrowBuffer<REdge*> lineEdges; // glyphs of the lines in view; null: none, or to be built
    REdge* caretEdges = nullptr;
    RColor* glyphColors[2] = {}; // plain, selected; of the object's, null: not there yet
    RColor* caretColor = nullptr;
    REdge* maskEdges = nullptr; // the bounds, which the text stays in
    RColor* maskColors = nullptr;
};
