// Variables and frames by the paths that scripts write: "target:name".
#include "core/player/player.h"

#include <cstring>

#include "core/stream/str.h"

namespace {

// "field.scroll" and "field.maxscroll" mean a text field, and no name with a dot is ever that of a
// plain variable. No text field scrolls yet: such names read as absent and are not written.
bool IsFieldName(const char* name)
{
    return std::strchr(name, '.') != nullptr;
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

const char* SPlayer::FindValue(ScriptThread* thread, const char* path)
{
    const char* name;
    ScriptThread* target = ResolveVariable(path, thread, &name);
    if (!target || IsFieldName(name))
        return nullptr;
    const SVariable* var = target->FindVariable(name);
    return var ? var->value : nullptr;
}

char* SPlayer::GetVariable(ScriptThread* thread, const char* path)
{
    return CreateStr(FindValue(thread, path));
}

bool SPlayer::GetVariable(ScriptThread* thread, const char* path, ScriptValue* value)
{
    const char* text = FindValue(thread, path);
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
    if (target && !IsFieldName(name))
        target->SetVariable(name, value, updateFields);
}
