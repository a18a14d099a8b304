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
constexpr U32 kMostSpares = 16;
constexpr U32 kSpareRoom = 4096;   // bytes of text
constexpr U32 kNameCost = 256;     // bytes of text that a font's name is worth
constexpr U32 kFontCost = 1 << 16; // bytes of text that measuring a font is worth

// A name with a dot is that of no plain variable.
bool IsPlainName(const char* name)
{
    return *name != 0 && std::strchr(name, '.') == nullptr;
}

// As much of a variable's value as a field can show.
std::string_view Value(const char* value)
{
    if (!value)
        return {};
    const void* end = std::memchr(value, 0, TextLayout::kMaxText);
    return {value, end ? size_t(static_cast<const char*>(end) - value) : TextLayout::kMaxText};
}

const char* NameIn(const char* path)
{
    const char* colon = std::strchr(path, ':');
    return colon ? colon + 1 : path;
}
} // namespace

// Movies that place and remove a field in every frame find it again with its memory.
EditText* EditText::Create(SObject* obj)
{
    List& list = obj->display->fields;
    if (list.count >= gLimits.textFields)
        return nullptr;
    EditText* field = list.spare;
    if (field &&
        field->room <= gLimits.textFieldBytes - std::min(list.bytes, gLimits.textFieldBytes)) {
        list.spare = field->next;
        list.spares--;
    } else {
        field = new (std::nothrow) EditText();
    }
    if (field && !field->Prepare(obj)) {
        Destroy(field);
        return nullptr;
    }
    return field;
}

void EditText::Destroy(EditText* field)
{
    List& list = field->obj->display->fields;
    field->FreeCache();
    field->Unlink();
    if (list.spares >= kMostSpares || field->room > kSpareRoom) {
        delete field;
        return;
    }
    field->next = list.spare;
    list.spare = field;
    list.spares++;
}

void EditText::List::FreeSpares()
{
    while (EditText* field = spare) {
        spare = field->next;
        delete field;
    }
    spares = 0;
}

bool EditText::Prepare(SObject* object)
{
    obj = object;
    edits = anchor = caret = 0;
    goal = TextLayout::kNoGoal;
    selecting = false;
    caretOn = true;
    Link();
    layout.Reset();
    record = SFieldRecord(obj->character);
    SPlayer* player = obj->display->splayer;
    obj->display->ChargeText(U32(record.variable.size() + record.text.size()) + kNameCost);
    if (font.Resolve(record, obj->character->player, player ? &player->fontPlayer : nullptr))
        obj->display->ChargeText(kFontCost);
    layout.SetFormat(record, &font);
    if (!TakePath())
        return false;
    SetText(record.text);
    return true;
}

bool EditText::TakePath()
{
    const size_t length = record.variable.size();
    path.Clear();
    if (length == 0)
        return true;
    if (!path.Resize(length + 1))
        return false;
    std::memcpy(path.data(), record.variable.data(), length);
    nameHash = StrHash(NameIn(path.data()));
    return true;
}

void EditText::Link()
{
    List& list = obj->display->fields;
    next = nullptr;
    previous = list.last;
    (previous ? previous->next : list.first) = this;
    list.last = this;
    list.count++;
    list.bytes += room;
}

void EditText::Unlink()
{
    List& list = obj->display->fields;
    (previous ? previous->next : list.first) = next;
    (next ? next->previous : list.last) = previous;
    list.count--;
    list.bytes -= room;
}

// The greatest length that the limit for all fields leaves to this one. What counts is the room
// that they keep, for lines take many times the memory of their bytes; spares, which are few and
// small, count when they are used again.
U32 EditText::Allowed() const
{
    const U32 others = obj->display->fields.bytes - room;
    const U32 left = gLimits.textFieldBytes - std::min(others, gLimits.textFieldBytes);
    return std::min(std::max(left, room), TextLayout::kMaxText);
}

void EditText::TakeRoom()
{
    const U32 more = std::max(Length(), room) - room;
    room += more;
    obj->display->fields.bytes += more;
}

void EditText::SetText(std::string_view text)
{
    const std::string_view shown = text.substr(0, Allowed());
    obj->display->ChargeText(U32(shown.size()));
    if (shown == std::string_view(Text(), Length()))
        return;
    NoteSelection();
    layout.SetText(shown);
    NoteEdit();
    anchor = std::min(anchor, Length());
    caret = std::min(caret, Length());
    goal = TextLayout::kNoGoal;
    NoteSelection();
}

void EditText::NoteLines(U32 from, U32 to)
{
    dirtyFrom = std::min(dirtyFrom, from);
    dirtyTo = std::max(dirtyTo, to);
    obj->display->needCalcUpdate = 1;
}

void EditText::NoteSelection()
{
    if (HasSelection() || ShowsCaret())
        NoteLines(layout.LineOf(SelectionStart()), layout.LineOf(SelectionEnd()));
}

SRECT EditText::TakeDirt()
{
    SRECT strip;
    RectSetEmpty(&strip);
    if (dirtyFrom <= dirtyTo)
        strip = StripOf(dirtyFrom, dirtyTo);
    if (!RectIsEmpty(&strip)) {
        const U32 first = layout.FirstLine();
        FreeLines(std::max(dirtyFrom, first) - first, dirtyTo - std::min(dirtyTo, first));
        FreeSelection();
    }
    dirtyFrom = kLastLine;
    dirtyTo = 0;
    return strip;
}

// Lines from top to bottom, with what outlines reach beyond them.
SRECT EditText::StripOf(U32 from, U32 to) const
{
    SRECT strip = record.bounds;
    if (RectIsEmpty(&strip))
        return strip;
    const S64 rise = std::max(font.Rise() - font.Ascent(), 0);
    const S64 fall = std::max(S64(font.Fall()) + font.Ascent(), S64(layout.LineHeight()));
    strip.ymin = S32(std::max(S64(strip.ymin), layout.LineTop(from) - rise));
    if (to != kLastLine)
        strip.ymax = S32(std::min(S64(strip.ymax), layout.LineTop(to) + fall));
    if (strip.ymin > strip.ymax)
        RectSetEmpty(&strip);
    return strip;
}

// The layout has taken a new text.
void EditText::NoteEdit()
{
    TakeRoom();
    obj->display->ChargeText(Length(), layout.LineCount());
    NoteLines(layout.ChangedFrom(), layout.ChangedTo());
}

ScriptThread* EditText::Bound(const char** name) const
{
    SPlayer* player = obj->display->splayer;
    if (path.size() == 0 || !player)
        return nullptr;
    ScriptThread* thread = player->ResolveVariable(path.data(), obj->thread, name);
    return thread && IsPlainName(*name) ? thread : nullptr;
}

// Long ways to variables are charged as tags, for frames place fields; without any left, nothing is
// looked for.
void EditText::UpdateFromVariable()
{
    constexpr U64 kWorkPerTag = 8;
    DisplayList* display = obj->display;
    if (display->tagsLeft == 0)
        return;
    const U64 before = display->work;
    TakeVariable();
    display->ChargeTags(U32((display->work - before) / kWorkPerTag));
}

void EditText::TakeVariable()
{
    const char* name;
    ScriptThread* thread = Bound(&name);
    if (!thread)
        return;
    const SVariable* var = thread->FindVariable(name);
    if (var) {
        const std::string_view value = Value(var->value);
        obj->display->ChargeText(U32(value.size()));
        SetText(value);
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
    return path.size() > 0 && hash == nameHash && Bound(&ownName) == thread &&
           StrEqual(ownName, name);
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
    EditText::Destroy(editText);
    editText = nullptr;
}

void SObject::UpdateEditText(const ScriptThread* timeline, const char* varName, const char* value,
                             int flag)
{
    if (!display->fields.first)
        return;
    const U32 hash = StrHash(varName);
    const std::string_view text = Value(value);
    const SPlayer* player = display->splayer;
    const U64 most = display->work + gLimits.workPerRun;
    for (EditText* f = display->fields.first; f && display->work < most; f = f->next) {
        const bool typedInto = flag == 0 && player && player->focusText.Get() &&
                               player->focusText.Get()->editText == f;
        if (!typedInto && f->IsBoundTo(timeline, varName, hash))
            f->SetText(text);
    }
}

bool SObject::ScrollEditText(const ScriptThread* timeline, const char* varName, int what,
                             S32* scroll)
{
    const U32 hash = StrHash(varName);
    bool found = false;
    const U64 most = display->work + gLimits.workPerRun;
    for (EditText* f = display->fields.first; f && display->work < most; f = f->next) {
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
