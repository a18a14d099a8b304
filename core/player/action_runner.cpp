// What records do with the value stack.
#include "core/player/action_runner.h"

#include <algorithm>
#include <cstring>

#include "core/geom/fixed.h"
#include "core/player/multibyte.h"
#include "core/player/numbers.h"
#include "core/stream/str.h"

namespace {

constexpr U8 kPushString = 0;
constexpr U8 kPushFloat = 1;
constexpr S64 kBytesPerUnit = 32; // of text handled, in a unit of work
constexpr U32 kMostDigits = 800;  // of a number, that count for its value
constexpr U32 kWorkPerDigit = 2;
constexpr char kDivisionByZero[] = "#ERROR#";

} // namespace

void SPlayer::Push(const char* text)
{
    if (ScriptValue* top = stack.Push())
        top->SetText(text, StrLength(text));
}

void SPlayer::PushNum(double value)
{
    if (ScriptValue* top = stack.Push())
        top->SetNumber(value);
}

char* SPlayer::Pop()
{
    ScriptValue top = stack.Pop();
    const char* text = top.Text();
    return CreateStr(text, top.Length());
}

double SPlayer::PopNum()
{
    return stack.PopNum();
}

ActionRunner::Operands ActionRunner::PopOperands()
{
    const double b = PopNumber();
    const double a = PopNumber();
    return {a, b};
}

S32 ActionRunner::PopInt()
{
    return TruncateToInt(PopNumber());
}

void ActionRunner::PushNumber(double value)
{
    if (ScriptValue* top = stack.Push())
        top->SetNumber(value);
}

void ActionRunner::PushBool(bool value)
{
    if (ScriptValue* top = stack.Push())
        top->SetBool(value);
}

void ActionRunner::PushText(const char* text, int n)
{
    ChargeText(n);
    if (ScriptValue* top = stack.Push())
        top->SetText(text, n);
}

void ActionRunner::ChargeText(S64 bytes)
{
    player->scene.work += static_cast<U64>(bytes / kBytesPerUnit);
}

// Short numbers are no more work than their record.
void ActionRunner::ChargeNumber(const ScriptValue& value)
{
    const U32 length = value.HeapLength();
    if (length == 0)
        return;
    ChargeText(length);
    player->scene.work += std::min(length, kMostDigits) * kWorkPerDigit;
}

double ActionRunner::PopNumber()
{
    if (const ScriptValue* top = stack.Peek(0))
        ChargeNumber(*top);
    return stack.PopNum();
}

// One value a record, whatever else its payload holds.
void ActionRunner::PushRecord(const SActionRecord& record)
{
    const U8 type = record.Byte(0);
    if (type == kPushString) {
        S32 size = 0;
        const char* text = record.String(1, &size);
        PushText(text, size);
    } else if (type == kPushFloat) {
        const U32 bits = record.DWord(1);
        float value;
        std::memcpy(&value, &bits, sizeof value);
        PushNumber(value);
    }
}

void ActionRunner::Divide()
{
    const Operands n = PopOperands();
    if (n.b == 0)
        PushText(kDivisionByZero, sizeof kDivisionByZero - 1);
    else
        PushNumber(n.a / n.b);
}

// Bytes without sign: below 0, 0 or above 0.
int ActionRunner::CompareStrings()
{
    ScriptValue b = stack.Pop();
    ScriptValue a = stack.Pop();
    const char* left = a.Text();
    ChargeText(a.Length());
    return std::strcmp(left, b.Text());
}

// The lower value stays where it is: a long text that grows is not copied for each piece.
void ActionRunner::AppendString()
{
    ScriptValue tail = stack.Pop();
    ScriptValue* head = stack.Count() > 0 ? stack.Peek(0) : stack.Push();
    if (!head)
        return;
    head->Append(tail);
    ChargeText(head->Length());
}

void ActionRunner::PushLength()
{
    PushNumber(stack.Pop().Length());
}

void ActionRunner::Extract(int multibyte)
{
    const S32 count = PopInt();
    const S32 first = Saturate32(static_cast<S64>(PopInt()) - 1);
    ScriptValue whole = stack.Pop();
    const char* text = whole.Text();
    ChargeText(whole.Length());
    int from = 0;
    const int length = PlayerStringExtract(text, first, count, multibyte, &from);
    PushText(text + from, length);
}

void ActionRunner::FirstByte()
{
    PushNumber(static_cast<U8>(stack.Pop().Text()[0]));
}

// A zero byte ends the string, so it cannot be in it.
void ActionRunner::Character(bool twoBytes)
{
    const S32 code = PopInt();
    char text[3] = {};
    if (twoBytes && code > 0xFF) {
        text[0] = static_cast<char>(code >> 8);
        text[1] = static_cast<char>(code);
    } else {
        text[0] = static_cast<char>(code);
    }
    PushText(text, static_cast<int>(std::strlen(text)));
}
