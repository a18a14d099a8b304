#include <cstdlib>
#include <cstring>
#include <new>

#include "core/player/limits.h"
#include "core/player/values.h"
#include "core/stream/str.h"

namespace {
constexpr U32 kFirstValues = 128;
}

ScriptValue::ScriptValue(ScriptValue&& other)
{
    TakeFrom(other);
}

ScriptValue& ScriptValue::operator=(ScriptValue&& other)
{
    if (this != &other) {
        Clear();
        TakeFrom(other);
    }
    return *this;
}

// All bytes, whichever of its forms the value has.
void ScriptValue::TakeFrom(ScriptValue& other)
{
    kind = other.kind;
    length = other.length;
    std::memcpy(small, other.small, sizeof small);
    other.kind = kInlineText;
    other.length = 0;
    other.small[0] = 0;
}

void ScriptValue::Clear()
{
    if (kind == kHeapText)
        FreeStr(large);
    kind = kInlineText;
    length = 0;
    small[0] = 0;
}

ValueStack::~ValueStack()
{
    Clear();
    std::free(values);
}

// The empty string is all zeros, and a value is moved by its bytes.
bool ValueStack::Grow()
{
    const U32 doubled = capacity ? capacity * 2 : kFirstValues;
    void* grown = std::realloc(static_cast<void*>(values), doubled * sizeof(ScriptValue));
    if (!grown)
        return false;
    values = static_cast<ScriptValue*>(grown);
    capacity = doubled;
    return true;
}

ScriptValue* ValueStack::Push()
{
    if (count >= gLimits.stackValues || (count >= capacity && !Grow())) {
        overflowed = true;
        return nullptr;
    }
    return new (&values[count++]) ScriptValue;
}

ScriptValue ValueStack::Pop()
{
    ScriptValue top;
    if (count > 0)
        top = static_cast<ScriptValue&&>(values[--count]);
    return top;
}

ScriptValue* ValueStack::Peek(U32 i)
{
    return i < count ? &values[count - 1 - i] : nullptr;
}

void ValueStack::Clear()
{
    while (count > 0)
        values[--count].Clear();
    overflowed = false;
}
