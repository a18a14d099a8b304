#include "tools/vexel/json_writer.h"

#include "tools/vexel/message.h"

void JsonWriter::Separate()
{
    if (!first)
        text += ',';
    first = false;
}

void JsonWriter::Escape(std::string_view bytes)
{
    text += '"';
    for (const char c : bytes) {
        const unsigned char byte = static_cast<unsigned char>(c);
        if (c == '"' || c == '\\')
            (text += '\\') += c;
        else if (byte < 32 || byte > 126)
            text += Format("\\u%04x", byte);
        else
            text += c;
    }
    text += '"';
}

JsonWriter& JsonWriter::Open(char bracket)
{
    Separate();
    text += bracket;
    first = true;
    return *this;
}

JsonWriter& JsonWriter::Close(char bracket)
{
    text += bracket;
    first = false;
    return *this;
}

JsonWriter& JsonWriter::Key(std::string_view name)
{
    Separate();
    Escape(name);
    text += ':';
    first = true;
    return *this;
}

JsonWriter& JsonWriter::String(std::string_view bytes)
{
    Separate();
    Escape(bytes);
    return *this;
}

JsonWriter& JsonWriter::Int(S64 value)
{
    Separate();
    text += std::to_string(value);
    return *this;
}

JsonWriter& JsonWriter::Number(double value)
{
    Separate();
    text += Format("%.11g", value);
    return *this;
}

JsonWriter& JsonWriter::Bool(bool value)
{
    Separate();
    text += value ? "true" : "false";
    return *this;
}

JsonWriter& JsonWriter::Null()
{
    Separate();
    text += "null";
    return *this;
}
