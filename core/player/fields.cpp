// Text fields and the player: the keyboard focus, what is typed and pasted, and who hears of it.
#include "core/player/player.h"

#include <cstring>

#include "core/display/edit_text.h"
#include "core/stream/str.h"

namespace {

EditText* Focused(const SPlayer& player)
{
    const SObject* obj = player.focusText.Get();
    return obj != nullptr ? obj->editText : nullptr;
}

// The frame of a field's timeline that hears of what is typed, or -1.
S32 FrameForChange(ScriptThread* thread, const char* name)
{
    constexpr char kSuffix[] = "_changed";
    char* label = JoinStr(name, StrLength(name), kSuffix, sizeof kSuffix - 1);
    const S32 frame = label != nullptr ? thread->FindLabel(label) : -1;
    FreeStr(label);
    return frame;
}

// Leaves what a field may hold: breaks as carriage returns, or nothing from the first on where
// there is one line.
void CleanPasted(char* text, bool severalLines)
{
    char* to = text;
    char before = 0; // as it was: the text is changed in place
    for (const char* from = text; *from != 0; from++) {
        const char c = *from;
        const bool isBreak = c == '\r' || c == '\n';
        if (isBreak && !severalLines)
            break;
        if (isBreak && !(c == '\n' && before == '\r'))
            *to++ = '\r';
        else if (!isBreak && static_cast<U8>(c) >= 0x20)
            *to++ = c;
        before = c;
    }
    *to = 0;
}

} // namespace

void SPlayer::SetFocusText(SObject* obj)
{
    if (obj == focusText.Get())
        return;
    if (EditText* old = Focused(*this))
        old->LoseFocus();
    focusText.Set(obj);
    if (obj == nullptr)
        return;
    ButtonFocusRemove();
    obj->Modify();
}

int SPlayer::TextKeyDown(int key, int modifiers)
{
    EditText* field = Focused(*this);
    if (field == nullptr)
        return 0;
    const U32 edits = field->Edits();
    const bool used = field->HandleKeyDown(key, modifiers);
    FinishEdit(edits);
    return used;
}

// The variable takes the text even when it is not of this edit. The frame that hears of it may
// remove the field.
void SPlayer::FinishEdit(U32 editsBefore)
{
    const char* name;
    const EditText* field = Focused(*this);
    const bool changed = field->Edits() != editsBefore;
    ScriptThread* thread = field->Bound(&name);
    const SVariable* var = thread != nullptr ? thread->FindVariable(name) : nullptr;
    const char* known = var != nullptr && var->value != nullptr ? var->value : "";
    if (thread != nullptr && std::strcmp(known, field->Text()) != 0) {
        thread->SetVariable(name, field->Text(), 0);
        const S32 hears = changed ? FrameForChange(thread, name) : -1;
        if (hears >= 0)
            CallFrame(thread, hears);
    }
    UpdateScreen();
}

void SPlayer::EditCommand(int command)
{
    EditText* field = Focused(*this);
    if (field == nullptr || !BeginInput())
        return;
    const U32 edits = field->Edits();
    if (command == 0)
        field->Select(0, field->Length());
    else if (command == 1)
        field->DeleteSelection();
    FinishEdit(edits);
}

void SPlayer::EditCopy(char** text)
{
    const EditText* field = Focused(*this);
    *text = nullptr;
    if (field != nullptr && field->HasSelection() && !field->Record().Has(kFieldPassword))
        *text = CreateStr(field->Text() + field->SelectionStart(),
                          static_cast<int>(field->SelectionEnd() - field->SelectionStart()));
}

void SPlayer::EditPaste(const char* text)
{
    EditText* field = Focused(*this);
    if (field == nullptr || !BeginInput())
        return;
    char* clean = CreateStr(text);
    if (clean == nullptr)
        return;
    CleanPasted(clean, field->Record().Has(kFieldMultiline));
    const U32 edits = field->Edits();
    field->Insert(clean);
    FreeStr(clean);
    FinishEdit(edits);
}

void SPlayer::CursorTick()
{
    UpdateCursor();
    EditText* field = Focused(*this);
    if (field == nullptr || !field->ShowsCaret() || !BeginInput())
        return;
    field->BlinkCaret();
    CheckUpdate();
}

void SPlayer::GetEditMenuState(MenuStatus* status)
{
    *status = {};
    const EditText* field = Focused(*this);
    if (field == nullptr)
        return;
    const bool selected = field->HasSelection(), plain = !field->Record().Has(kFieldPassword);
    status->canViewAll = selected && plain && field->MayType(); // cut
    status->canZoomIn = selected && plain;                      // copy
    status->canZoomOut = field->MayType();                      // paste
    status->zoomed = selected && field->MayType();              // delete
    status->canPlay = field->Length() > 0;                      // select all
}
