// The value stack of scripts.
#pragma once

#include "core/geom/types.h"

// A value of the stack: by definition a string, held as a number while nobody can tell. Short
// strings lie in the value itself; longer ones on the heap, counted under the limit on all script
// strings. Movable by copying the bytes, so that the stack can grow.
class ScriptValue {
public:
    ScriptValue() = default; // the empty string
    ~ScriptValue() { Clear(); }
    ScriptValue(const ScriptValue&) = delete;
    ScriptValue& operator=(const ScriptValue&) = delete;
    ScriptValue(ScriptValue&& other);
    ScriptValue& operator=(ScriptValue&& other);

    void Clear();
    // Cut at the limit on one string, and at a zero byte; empty when no memory or budget is left.
    void SetText(const char* text, int n);
    // As if formatted: rounded to 15 digits.
    void SetNumber(double value);
    void SetBool(bool value);
    // This becomes this text followed by `tail`'s.
    void Append(ScriptValue& tail);

    // The text, zero-terminated, valid until the value changes; formats a number in place.
    const char* Text();
    int Length();
    // The length of a text that lies on the heap; 0 for any other value.
    U32 HeapLength() const { return kind == kHeapText ? length : 0; }
    // The text as a number; false, and 0, when it is none.
    bool GetNumber(double* value) const;
    double Number() const;

private:
    static constexpr int kInline = 39;
    enum Kind : U8 { kInlineText, kHeapText, kNumber };

    void TakeFrom(ScriptValue& other);
    void SetLarge(char* text);

    Kind kind = kInlineText;
    U32 length = 0;
    union {
        char small[kInline + 1] = {};
        char* large; // owned, made by CreateStr
        double number;
    };
};

// Grows from 128 values by doubling, up to the limit on entries. Popping an empty stack gives the
// empty string. What is on it stays from run to run.
class ValueStack {
public:
    ValueStack() = default;
    ~ValueStack();
    ValueStack(const ValueStack&) = delete;
    ValueStack& operator=(const ValueStack&) = delete;

    // A new value on top, empty, to be set by the caller; null, and `overflowed` set, when the
    // limit or memory forbids it.
    ScriptValue* Push();
    ScriptValue Pop();
    // The top's number, taken off without a copy.
    double PopNum();
    // The i-th value from the top, for those who only look; null beyond the bottom.
    ScriptValue* Peek(U32 i);
    U32 Count() const { return count; }
    void Clear();

    bool overflowed = false;

private:
    bool Grow();

    ScriptValue* values = nullptr;
    U32 count = 0;
    U32 capacity = 0;
};
