// Variables and frames by the paths that scripts write: "target:name".
#include "core/player/player.h"

#include <cstring>

#include "core/player/numbers.h"
#include "core/stream/str.h"

namespace {

// "field.scroll" and "field.maxscroll" mean the text fields that are bound to a variable, and no
// name with a dot is ever that of a plain variable.
bool IsFieldName(const char* name)
{
    return std::strchr(name, '.') != nullptr;
}

// The scroll position that such a name means, read or set; false when there is none, or when a
// script may not do that.
bool ScrollField(const ScriptThread* thread, const char* name, bool set, S32* scroll)
{
    const char* dot = std::strchr(name, '.');
    const bool most = StrEqual(dot, ".maxscroll");
    if (!thread->display || (!most && !StrEqual(dot, ".scroll")) || (most && set))
        return false;
    char* field = CreateStr(name, static_cast<int>(dot - name));
    const int what = set    ? SObject::kSetScroll
                     : most ? SObject::kGetMaxScroll
                            : SObject::kGetScroll;
    const bool done = field && thread->display->root.ScrollEditText(thread, field, what, scroll);
    FreeStr(field);
    return done;
}

void SetScroll(const ScriptThread* thread, const char* name, const char* value)
{
    double number = 0;
    if (!value || !ParseDouble(value, StrLength(value), &number))
        return;
    S32 scroll = TruncateToInt(number);
    ScrollField(thread, name, true, &scroll);
}

bool IsFrameNumber(const char* text)
{
    if (*text == 0)
        return false;
    while (*text >= '0' && *text <= '9')
        text++;
    return *text == 0;
}

// A frame from 0; negative when it is not there. A sign belongs to the number, or to the label.
S32 FrameOf(ScriptThread* thread, const char* frameName)
{
    const bool sign = *frameName == '+' || *frameName == '-';
    const char* digits = sign ? frameName + 1 : frameName;
    if (!IsFrameNumber(digits))
        return thread->FindLabel(frameName);
    const S32 number = ToInt(digits);
    return (*frameName == '-' ? -number : number) - 1;
}

} // namespace

ScriptThread* SPlayer::ResolveVariable(const char* path, ScriptThread* thread, const char** rest)
{
    if (!thread)
        thread = this;
    const char* colon = std::strchr(path, ':');
    *rest = colon ? colon + 1 : path;
    if (!colon || colon == path)
        return thread;
    return FindTarget(thread->rootObject, path, static_cast<int>(colon - path));
}

ScriptThread* SPlayer::ResolveFrameNum(const char* frameName, ScriptThread* thread, S32* index)
{
    const char* rest;
    ScriptThread* target = ResolveVariable(frameName, thread, &rest);
    const S32 found = target ? FrameOf(target, rest) : -1;
    if (found < 0)
        return nullptr;
    *index = found;
    return target;
}

const char* SPlayer::FindValue(ScriptThread* thread, const char* path, char* digits)
{
    const char* name;
    S32 scroll;
    ScriptThread* target = ResolveVariable(path, thread, &name);
    if (!target)
        return nullptr;
    if (IsFieldName(name)) {
        if (!ScrollField(target, name, false, &scroll))
            return nullptr;
        FormatInteger(scroll, digits);
        return digits;
    }
    const SVariable* var = target->FindVariable(name);
    return var ? var->value : nullptr;
}

char* SPlayer::GetVariable(ScriptThread* thread, const char* path)
{
    char digits[kNumberChars];
    return CreateStr(FindValue(thread, path, digits));
}

bool SPlayer::GetVariable(ScriptThread* thread, const char* path, ScriptValue* value)
{
    char digits[kNumberChars];
    const char* text = FindValue(thread, path, digits);
    value->Clear();
    if (text)
        value->SetText(text, StrLength(text));
    return text != nullptr;
}

void SPlayer::SetVariable(ScriptThread* thread, const char* path, const char* value,
                          int updateFields)
{
    const char* name;
    ScriptThread* target = ResolveVariable(path, thread, &name);
    if (target && IsFieldName(name))
        SetScroll(target, name, value);
    else if (target)
        target->SetVariable(name, value, updateFields);
}
