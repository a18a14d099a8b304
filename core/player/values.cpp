#include "core/player/values.h"

#include <cstring>

#include "core/player/limits.h"
#include "core/player/numbers.h"
#include "core/stream/str.h"

namespace {
// The length of a text of at most n bytes, cut at the limit and where it ends by itself.
U32 CutLength(const char* text, int n)
{
    size_t most = n > 0 ? static_cast<size_t>(n) : 0;
    if (most > gLimits.stringBytes)
        most = gLimits.stringBytes;
    const void* end = std::memchr(text, 0, most);
    return static_cast<U32>(end ? static_cast<const char*>(end) - text : most);
}

// The rounded number stands for the text, but for the few that would be written in another form
// than what they were rounded from.
bool KeepsForm(double value, double rounded)
{
    const double size = rounded < 0 ? -rounded : rounded;
    if (size == 1e15 || size == 1e-5)
        return value == rounded;
    return size - size == 0;
}
} // namespace

void ScriptValue::SetText(const char* text, int n)
{
    // The text may be this value's own, and goes last.
    char* old = kind == kHeapText ? large : nullptr;
    length = CutLength(text, n);
    kind = kInlineText;
    if (length <= kInline) {
        std::memmove(small, text, length);
        small[length] = 0;
    } else {
        SetLarge(CreateStr(text, static_cast<int>(length)));
    }
    FreeStr(old);
}

// Takes over what was allocated for `length` bytes; empty when nothing was.
void ScriptValue::SetLarge(char* text)
{
    if (text) {
        kind = kHeapText;
        large = text;
    } else {
        kind = kInlineText;
        length = 0;
        small[0] = 0;
    }
}

void ScriptValue::SetNumber(double value)
{
    const double rounded = RoundThroughText(value);
    if (rounded == value || (value - value == 0 && KeepsForm(value, rounded))) {
        Clear();
        kind = kNumber;
        number = rounded;
        return;
    }
    char text[kNumberChars];
    const int n = FormatDouble(value, text);
    SetText(text, n);
}

void ScriptValue::SetBool(bool value)
{
    Clear();
    kind = kNumber;
    number = value;
}

void ScriptValue::Append(ScriptValue& tail)
{
    const char* head = Text();
    const char* end = tail.Text();
    const U32 most =
        gLimits.stringBytes - (length < gLimits.stringBytes ? length : gLimits.stringBytes);
    const U32 more = tail.length < most ? tail.length : most;
    if (length + more <= kInline) {
        std::memmove(small + length, end, more);
        length += more;
        small[length] = 0;
        return;
    }
    if (more == 0)
        return;
    char* joined = JoinStr(head, static_cast<int>(length), end, static_cast<int>(more));
    const U32 sum = length + more;
    Clear();
    length = sum;
    SetLarge(joined);
}

const char* ScriptValue::Text()
{
    if (kind == kNumber) {
        const double value = number;
        kind = kInlineText;
        length = static_cast<U32>(FormatDouble(value, small));
    }
    return kind == kHeapText ? large : small;
}

int ScriptValue::Length()
{
    Text();
    return static_cast<int>(length);
}

bool ScriptValue::GetNumber(double* value) const
{
    if (kind == kNumber) {
        *value = number;
        return true;
    }
    *value = 0;
    return ParseDouble(kind == kHeapText ? large : small, static_cast<int>(length), value);
}

double ScriptValue::Number() const
{
    double value;
    GetNumber(&value);
    return value;
}

double ValueStack::PopNum()
{
    if (count == 0)
        return 0;
    ScriptValue& top = values[--count];
    const double value = top.Number();
    top.Clear();
    return value;
}
