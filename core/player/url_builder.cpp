#include "core/player/url_builder.h"

#include <cstdio>

#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/stream/script_thread.h"

namespace {

constexpr size_t kGrowth = 256;

bool IsPlain(U8 c)
{
    return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z');
}

// -1 for what is no hexadecimal digit.
int HexValue(char c)
{
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    return -1;
}

// Decodes up to one of two characters or the end; returns where it stopped. An end mark right after
// a broken "%" is skipped with it and does not count.
const char* DecodeUpTo(const char* p, char stop, char otherStop, URLBuilder* text)
{
    text->Clear();
    while (*p != 0 && *p != stop && *p != otherStop)
        p = ExtractCharacter(p, text);
    return p;
}

} // namespace

void URLBuilder::AppendChar(char c)
{
    const size_t used = static_cast<size_t>(length);
    if (used >= gLimits.variablesBytes)
        return;
    if (used + 2 > bytes.size() && !bytes.Resize(used + kGrowth))
        return;
    bytes[used] = c;
    bytes[used + 1] = 0;
    length++;
}

void URLBuilder::AppendString(const char* s)
{
    for (; s != nullptr && *s != 0; s++)
        AppendChar(*s);
}

void URLBuilder::AppendBytes(const char* s, int n)
{
    for (int i = 0; i < n; i++)
        AppendChar(s[i]);
}

void URLBuilder::AppendInt(int n)
{
    char digits[16];
    std::snprintf(digits, sizeof digits, "%d", n);
    AppendString(digits);
}

void URLBuilder::EncodeString(const char* s)
{
    static const char kDigits[] = "0123456789ABCDEF";
    for (; s != nullptr && *s != 0; s++) {
        const U8 byte = static_cast<U8>(*s);
        if (IsPlain(byte)) {
            AppendChar(*s);
        } else if (byte == ' ') {
            AppendChar('+');
        } else {
            AppendChar('%');
            AppendChar(kDigits[byte >> 4]);
            AppendChar(kDigits[byte & 15]);
        }
    }
}

void URLBuilder::EncodeVariables(const SVariable* first)
{
    bool more = false;
    const auto full = [this] { return static_cast<U32>(length) >= gLimits.variablesBytes; };
    for (const SVariable* var = first; var != nullptr && !full(); var = var->next) {
        if (var->name == nullptr || var->value == nullptr)
            continue;
        if (more)
            AppendChar('&');
        more = true;
        EncodeString(var->name);
        AppendChar('=');
        EncodeString(var->value);
    }
}

void URLBuilder::Truncate(int n)
{
    if (n >= length)
        return;
    length = n;
    bytes[static_cast<size_t>(n)] = 0;
}

// A broken code yields nothing and takes along the character that breaks it, unless that is the end
// of the text.
const char* ExtractCharacter(const char* p, URLBuilder* text)
{
    if (*p != '%') {
        text->AppendChar(*p == '+' ? ' ' : *p);
        return p + 1;
    }
    const int high = HexValue(p[1]);
    if (high < 0)
        return p + (p[1] != 0 ? 2 : 1);
    const int low = HexValue(p[2]);
    if (low < 0)
        return p + (p[2] != 0 ? 3 : 2);
    text->AppendChar(static_cast<char>(high << 4 | low));
    return p + 3;
}

void DecodeQueryString(ScriptThread* thread, const char* text)
{
    URLBuilder name, value;
    const char* p = text;
    const DisplayList* scene = thread->display;
    const U64 most = (scene ? scene->work : 0) + gLimits.workPerRun;
    while (*p != 0 && static_cast<size_t>(p - text) < gLimits.variablesBytes) {
        if (scene && scene->work > most)
            return; // names made to be looked up slowly
        p = DecodeUpTo(p, '=', '&', &name);
        value.Clear();
        if (*p == '=')
            p = DecodeUpTo(p + 1, '&', '&', &value);
        if (*p == '&')
            p++;
        thread->SetVariable(name.Text(), value.Text(), 1);
    }
}
