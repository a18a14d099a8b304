// Text fields under the keyboard and the mouse.
#include <algorithm>

#include "core/display/display_list.h"
#include "core/display/edit_text.h"
#include "core/player/limits.h"
#include "core/player/player.h"

namespace {
constexpr int kShift = 0x01;
constexpr int kCommand = 0x06; // Ctrl or Alt

enum Key { kKeyBackspace = 8, kKeyEnter = 13, kKeyEscape = 27, kKeyDelete = 127 };

// -1: the key does not move the caret.
int MoveOf(int key)
{
    switch (key) {
    case 1:
        return kCaretLeft;
    case 2:
        return kCaretRight;
    case 3:
        return kCaretLineStart;
    case 4:
        return kCaretLineEnd;
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
    const int move = MoveOf(key);
    if (move >= 0) {
        MoveCaret(ECaretMove(move), modifiers & kShift);
        return true;
    }
    const char typed = char(key);
    if (key == kKeyEscape)
        Select(caret, caret);
    else if (key == kKeyBackspace || key == kKeyDelete)
        DeleteBy(key == kKeyBackspace ? kCaretLeft : kCaretRight);
    else if (key == kKeyEnter)
        Insert(record.Has(kFieldMultiline) ? "\r" : "");
    else if (IsCharacter(key) && !(modifiers & kCommand))
        Insert({&typed, 1});
    else
        return false;
    return true;
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
    if (MayType() && to != caret) {
        anchor = to;
        ReplaceSelection("");
    }
}

void EditText::Insert(std::string_view s)
{
    if (!MayType() || s.empty())
        return;
    const EditText::List& list = obj->display->fields;
    const U32 kept = Length() - (SelectionEnd() - SelectionStart());
    const U32 others = list.bytes - Length();
    const U32 most = std::min({record.maxLen, TextLayout::kMaxText,
                               gLimits.textFieldBytes - std::min(others, gLimits.textFieldBytes)});
    s = s.substr(0, most - std::min(most, kept));
    if (!s.empty())
        ReplaceSelection(s);
}

void EditText::ReplaceSelection(std::string_view s)
{
    const U32 at = SelectionStart(), before = Length();
    obj->Modify();
    if (!layout.Replace(at, SelectionEnd() - at, s))
        return;
    obj->display->fields.bytes += Length() - before;
    Select(at + U32(s.size()), at + U32(s.size()));
}

void EditText::Select(U32 from, U32 to)
{
    obj->Modify();
    anchor = std::min(from, Length());
    caret = std::min(to, Length());
    goal = TextLayout::kNoGoal;
    caretOn = true;
    layout.Show(caret);
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
    return focused && MayType() && !HasSelection() && !obj->IsClip();
}

void EditText::BlinkCaret()
{
    obj->Modify();
    caretOn = !caretOn;
}

// `pt` in the field's own space.
void EditText::Mouse(const SPOINT& pt, bool down)
{
    const U32 at = layout.OffsetAt(pt);
    Select(selecting ? anchor : at, at);
    selecting = down;
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
