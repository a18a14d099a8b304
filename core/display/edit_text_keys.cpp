// Text fields under the keyboard and the mouse.
#include <algorithm>

#include "core/display/display_list.h"
#include "core/display/edit_text.h"
#include "core/player/player.h"

namespace {
constexpr int kShift = 0x01;
constexpr int kFar = 0x02;     // moves go by words, or to the ends of the text
constexpr int kCommand = 0x06; // what is typed is a command

enum Key { kKeyBackspace = 8, kKeyEnter = 13, kKeyEscape = 27, kKeyDelete = 127 };

// -1: the key does not move the caret.
int MoveOf(int key, bool far)
{
    switch (key) {
    case 1:
        return far ? kCaretWordLeft : kCaretLeft;
    case 2:
        return far ? kCaretWordRight : kCaretRight;
    case 3:
        return far ? kCaretTextStart : kCaretLineStart;
    case 4:
        return far ? kCaretTextEnd : kCaretLineEnd;
    case 6:
        return kCaretPageUp;
    case 7:
        return kCaretPageDown;
    case 14:
        return kCaretUp;
    case 15:
        return kCaretDown;
    default:
        return -1;
    }
}

bool IsCharacter(int key)
{
    return (key >= 32 && key <= 126) || (key >= 160 && key <= 255);
}
} // namespace

bool EditText::HandleKeyDown(int key, int modifiers)
{
    const int move = MoveOf(key, modifiers & kFar);
    if (move >= 0) {
        if (MayType() || (modifiers & kShift) || !ScrollBy(ECaretMove(move)))
            MoveCaret(ECaretMove(move), modifiers & kShift);
        return true;
    }
    const char typed = char(key);
    if (key == kKeyEscape)
        Select(caret, caret);
    else if (key == kKeyBackspace || key == kKeyDelete)
        DeleteBy(ECaretMove(MoveOf(key == kKeyBackspace ? 1 : 2, modifiers & kFar)));
    else if (key == kKeyEnter)
        Insert(record.Has(kFieldMultiline) ? "\r" : "");
    else if (IsCharacter(key) && !(modifiers & kCommand))
        Insert({&typed, 1});
    else
        return false;
    return true;
}

// A field without a caret is moved itself. False for moves to the side.
bool EditText::ScrollBy(ECaretMove move)
{
    const S32 page = S32(layout.VisibleLines());
    switch (move) {
    case kCaretUp:
    case kCaretDown:
        SetScroll(Scroll() + (move == kCaretUp ? -1 : 1));
        return true;
    case kCaretPageUp:
    case kCaretPageDown:
        SetScroll(Scroll() + (move == kCaretPageUp ? -page : page));
        return true;
    case kCaretTextStart:
    case kCaretTextEnd:
        SetScroll(move == kCaretTextStart ? 1 : MaxScroll());
        return true;
    default:
        return false;
    }
}

// Without Shift, a selection is left at the side that the arrow points to.
void EditText::MoveCaret(ECaretMove move, bool extend)
{
    U32 to;
    if (!extend && HasSelection() && (move == kCaretLeft || move == kCaretRight))
        to = move == kCaretLeft ? SelectionStart() : SelectionEnd();
    else
        to = layout.Move(caret, move, &goal);
    const S32 keptGoal = goal;
    Select(extend ? anchor : to, to);
    goal = keptGoal;
}

void EditText::DeleteBy(ECaretMove move)
{
    S32 none = TextLayout::kNoGoal;
    const U32 to = HasSelection() ? anchor : layout.Move(caret, move, &none);
    if (!MayType() || to == caret)
        return;
    anchor = to;
    if (!ReplaceSelection(""))
        anchor = caret;
}

void EditText::Insert(std::string_view s)
{
    if (!MayType() || s.empty())
        return;
    const U32 kept = Length() - (SelectionEnd() - SelectionStart());
    const U32 most = std::min(record.maxLen, Allowed());
    s = s.substr(0, most - std::min(most, kept));
    if (!s.empty())
        ReplaceSelection(s);
}

void EditText::DeleteSelection()
{
    if (HasSelection() && MayType())
        ReplaceSelection("");
}

bool EditText::ReplaceSelection(std::string_view s)
{
    const U32 at = SelectionStart();
    NoteSelection();
    if (!layout.Replace(at, SelectionEnd() - at, s))
        return false;
    NoteEdit();
    edits++;
    Select(at + U32(s.size()), at + U32(s.size()));
    return true;
}

void EditText::Select(U32 from, U32 to)
{
    SetSelection(from, to);
    ShowCaret();
}

void EditText::Resume(U32 from, U32 to, bool mouseDown)
{
    Select(from, to);
    selecting = mouseDown;
}

void EditText::ShowCaret()
{
    if (layout.Show(caret))
        NoteLines(0, kLastLine);
}

// While one end stays, what lies between the old other end and the new one changes.
void EditText::SetSelection(U32 from, U32 to)
{
    const U32 oldCaret = std::min(caret, Length());
    const bool moves = HasSelection() && from == anchor && from != to;
    if (!moves)
        NoteSelection();
    anchor = std::min(from, Length());
    caret = std::min(to, Length());
    goal = TextLayout::kNoGoal;
    caretOn = true;
    if (moves)
        NoteLines(layout.LineOf(std::min(oldCaret, caret)),
                  layout.LineOf(std::max(oldCaret, caret)));
    else
        NoteSelection();
}

void EditText::LoseFocus()
{
    obj->Modify();
    selecting = false;
    caretOn = true;
    anchor = caret;
}

bool EditText::ShowsCaret() const
{
    const SPlayer* player = obj->display->splayer;
    const bool focused = player && player->focusText.Get() == obj;
    return focused && MayType() && !record.Has(kFieldNoSelect) && !HasSelection() && !obj->IsClip();
}

void EditText::BlinkCaret()
{
    NoteSelection();
    caretOn = !caretOn;
}

// The text stays where it is under the pointer, and follows only one that has left the box; else a
// click on a line that is partly in view would select what comes up there.
void EditText::Mouse(const SPOINT& pt, bool down)
{
    if (!down) {
        selecting = false;
        return;
    }
    const U32 at = layout.OffsetAt(pt);
    SetSelection(selecting ? anchor : at, at);
    if (selecting && !RectPointIn(&layout.Box(), &pt))
        ShowCaret();
    selecting = true;
}

void SObject::EditTextMouse(const SPOINT* pt, int down)
{
    if (!editText)
        return;
    MATRIX toField;
    SPOINT inField;
    GetDeviceMatrix(this, &toField);
    MatrixInvert(&toField, &toField);
    MatrixTransformPoint(&toField, pt, &inField);
    editText->Mouse(inField, down != 0);
}
