// JSON, written piece by piece.
#pragma once

#include "core/geom/types.h"

#include <string>
#include <string_view>

// Commas are put in where they belong. Strings are taken byte for byte: each byte above 127 stands
// for the Latin-1 character of that number.
class JsonWriter {
public:
    JsonWriter& BeginObject() { return Open('{'); }
    JsonWriter& EndObject() { return Close('}'); }
    JsonWriter& BeginArray() { return Open('['); }
    JsonWriter& EndArray() { return Close(']'); }
    // Names the next value of an object.
    JsonWriter& Key(std::string_view name);
    JsonWriter& String(std::string_view bytes);
    JsonWriter& Int(S64 value);
    JsonWriter& Number(double value);
    JsonWriter& Bool(bool value);
    JsonWriter& Null();

    const std::string& Text() const { return text; }

private:
    void Separate();
    void Escape(std::string_view bytes);
    JsonWriter& Open(char bracket);
    JsonWriter& Close(char bracket);

    std::string text;
    bool first = true; // no comma before the next value
};
