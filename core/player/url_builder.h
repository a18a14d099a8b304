// URLBuilder: text that grows, for URLs and what goes with them, and the encoding of variables in
// it.
#pragma once

#include "core/geom/grow_buffer.h"

class ScriptThread;
struct SVariable;

// A zero-terminated byte string. A character for which no memory can be had, or that would make the
// text longer than a stream of variables may be, is dropped, and building goes on.
class URLBuilder {
public:
    void AppendChar(char c);
    // Null is the empty string.
    void AppendString(const char* s);
    void AppendBytes(const char* s, int n);
    // In decimal.
    void AppendInt(int n);
    // Letters and digits of ASCII as they are, a space as "+", every other byte as "%" and two
    // hexadecimal digits.
    void EncodeString(const char* s);
    // "name=value" of each variable with both, from the first one on, with "&" between them.
    void EncodeVariables(const SVariable* first);
    // Drops all characters past the first n.
    void Truncate(int n);
    void Clear() { Truncate(0); }

    // Valid until the next change; never null.
    const char* Text() const { return bytes.size() > 0 ? bytes.data() : ""; }
    int Length() const { return length; }

private:
    GrowBuffer<char> bytes; // the text and its zero byte; nothing before the first character
    int length = 0;
};

// Appends the character that stands encoded at `p`, if it is a right one, and returns the position
// after it. `p` is not at the end of its text, and the result is never beyond it.
const char* ExtractCharacter(const char* p, URLBuilder* text);
// Sets variables from "name=value" pairs with "&" between them; text beyond the limit on a stream
// of variables is ignored.
void DecodeQueryString(ScriptThread* thread, const char* text);
