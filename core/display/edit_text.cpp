// Text fields: their life, their variables and their scrolling.
#include "core/display/edit_text.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/player/player.h"
#include "core/stream/str.h"

namespace {
constexpr U32 kBytesPerUnit = 32; // of text laid out, in a unit of work

// A name with a dot is that of no plain variable.
bool IsPlainName(const char* name)
{
    return *name != 0 && std::strchr(name, '.') == nullptr;
}

const char* NameIn(const char* path)
{
    const char* colon = std::strchr(path, ':');
    return colon ? colon + 1 : path;
}
} // namespace

EditText* EditText::Create(SObject* obj)
{
    if (obj->display->fields.count >= gLimits.textFields)
        return nullptr;
    auto* field = new (std::nothrow) EditText(obj);
    if (field && !field->Prepare()) {
        delete field;
        return nullptr;
    }
    return field;
}

EditText::EditText(SObject* object) : obj(object), record(object->character)
{
    Link();
}

EditText::~EditText()
{
    FreeCache();
    obj->display->fields.bytes -= Length();
    Unlink();
    FreeStr(variable);
}

bool EditText::Prepare()
{
    SPlayer* player = obj->display->splayer;
    font.Resolve(record, obj->character->player, player ? &player->fontPlayer : nullptr);
    layout.SetFormat(record, &font);
    if (!record.variable.empty()) {
        variable = CreateStr(record.variable.data(), int(record.variable.size()));
        if (!variable)
            return false;
        nameHash = StrHash(NameIn(variable));
    }
    SetText(record.text);
    return true;
}

void EditText::Link()
{
    List& list = obj->display->fields;
    previous = list.last;
    (previous ? previous->next : list.first) = this;
    list.last = this;
    list.count++;
}

void EditText::Unlink()
{
    List& list = obj->display->fields;
    (previous ? previous->next : list.first) = next;
    (next ? next->previous : list.last) = previous;
    list.count--;
}

// What all the fields hold is limited: lines take many times the memory of their bytes.
void EditText::SetText(std::string_view text)
{
    List& list = obj->display->fields;
    const size_t room = gLimits.textFieldBytes - (list.bytes - Length());
    const std::string_view shown = text.substr(0, std::min(room, size_t(layout.kMaxText)));
    if (shown == std::string_view(Text(), Length()))
        return;
    obj->Modify();
    list.bytes -= Length();
    layout.SetText(shown);
    list.bytes += Length();
    obj->display->work += Length() / kBytesPerUnit;
    anchor = std::min(anchor, Length());
    caret = std::min(caret, Length());
    goal = TextLayout::kNoGoal;
}

ScriptThread* EditText::Bound(const char** name) const
{
    SPlayer* player = obj->display->splayer;
    if (!variable || !player)
        return nullptr;
    ScriptThread* thread = player->ResolveVariable(variable, obj->thread, name);
    return thread && IsPlainName(*name) ? thread : nullptr;
}

void EditText::UpdateFromVariable()
{
    const char* name;
    ScriptThread* thread = Bound(&name);
    if (!thread)
        return;
    const SVariable* var = thread->FindVariable(name);
    if (var) {
        SetText(var->value ? var->value : "");
        return;
    }
    SetText(record.text);
    if (record.Has(kFieldText))
        thread->SetVariable(name, Text(), 1);
}

// Most fields are told apart by the hash alone, before their paths are followed.
bool EditText::IsBoundTo(const ScriptThread* thread, const char* name, U32 hash) const
{
    obj->display->work++;
    const char* ownName;
    return variable && hash == nameHash && Bound(&ownName) == thread && StrEqual(ownName, name);
}

void EditText::SetScroll(S32 scroll)
{
    if (std::clamp(scroll, 1, MaxScroll()) == Scroll())
        return;
    obj->Modify();
    layout.SetScroll(scroll);
}

void SObject::SetCharacter(SCharacter* ch)
{
    SCharacter* old = character;
    character = ch;
    RetainCharacter(character);
    MakeEditText();
    ReleaseCharacter(old);
}

// A field that an open hold has made keeps its initial text until the hold's end.
void SObject::MakeEditText()
{
    FreeEditText();
    editText = character->type == kCharEditText ? EditText::Create(this) : nullptr;
    if (editText && parent != display->holdParent)
        editText->UpdateFromVariable();
}

// The edges go with the field that clips them.
void SObject::FreeEditText()
{
    if (!editText)
        return;
    FreeCache();
    SPlayer* player = display->splayer;
    if (player && player->focusText.Get() == this)
        player->focusText.Set(nullptr);
    delete editText;
    editText = nullptr;
}

void SObject::UpdateEditText(const ScriptThread* timeline, const char* varName, const char* value,
                             int flag)
{
    if (!display->fields.first)
        return;
    const U32 hash = StrHash(varName);
    const SPlayer* player = display->splayer;
    for (EditText* f = display->fields.first; f; f = f->next) {
        const bool typedInto = flag == 0 && player && player->focusText.Get() &&
                               player->focusText.Get()->editText == f;
        if (!typedInto && f->IsBoundTo(timeline, varName, hash))
            f->SetText(value ? value : "");
    }
}

bool SObject::ScrollEditText(const ScriptThread* timeline, const char* varName, int what,
                             S32* scroll)
{
    const U32 hash = StrHash(varName);
    bool found = false;
    for (EditText* f = display->fields.first; f; f = f->next) {
        if (!f->IsBoundTo(timeline, varName, hash))
            continue;
        found = true;
        if (what == kSetScroll) {
            f->SetScroll(*scroll);
            continue;
        }
        *scroll = what == kGetScroll ? f->Scroll() : f->MaxScroll();
        break;
    }
    return found;
}
