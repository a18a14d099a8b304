#include "tools/vexel/action_text.h"

#include "core/player/numbers.h"
#include "tools/vexel/message.h"
#include "tools/vexel/text_form.h"

#include <algorithm>
#include <cstring>

namespace {

// Takes a record's operands in order and keeps count of what they use.
class Operands {
public:
    Operands(const SActionRecord& actionRecord, size_t longest)
        : record(actionRecord), most(longest)
    {
    }

    void Byte(const char* form) { text += Format(form, record.Byte(Take(1))); }
    void Word(const char* form) { text += Format(form, record.Word(Take(2))); }
    void String();
    void Pushed();
    void RequestFlags();
    void Jump(const U8* base);
    // The operands, and whether that is all there is and all there should be.
    std::string Finish();

private:
    S32 Take(S32 n);
    void Number();

    const SActionRecord& record;
    const size_t most; // bytes of a string
    S32 used = 0;      // bytes of the payload, with those that it lacks
    std::string text;
};

S32 Operands::Take(S32 n)
{
    const S32 at = used;
    used += n;
    return at;
}

// A string may end with the payload, without a zero byte.
void Operands::String()
{
    S32 size = 0;
    const char* bytes = record.String(used, &size, &used);
    text += ' ' + QuoteUpTo(bytes, static_cast<size_t>(size), most);
}

void Operands::Number()
{
    const U32 bits = record.DWord(Take(4));
    float number = 0;
    std::memcpy(&number, &bits, sizeof number);
    char digits[kNumberChars];
    const int length = FormatDouble(static_cast<double>(number), digits);
    text.append(" ").append(digits, static_cast<size_t>(length));
}

void Operands::Pushed()
{
    const U8 type = record.Byte(Take(1));
    if (type == 0)
        String();
    else if (type == 1)
        Number();
    else
        text += Format(" type=%u", type);
}

void Operands::RequestFlags()
{
    constexpr const char* kMethods[] = {"", " get", " post", ""};
    const U8 flags = record.Byte(Take(1));
    text += Format(" flags=0x%02x%s", flags, kMethods[flags & 3]);
    if (flags & 0x40)
        text += " target";
    if (flags & 0x80)
        text += " variables";
}

void Operands::Jump(const U8* base)
{
    const S16 distance = static_cast<S16>(record.Word(Take(2)));
    text += base != nullptr ? Format(" -> %lld", (record.next - base) + 0LL + distance)
                            : Format(" %+d", distance);
}

std::string Operands::Finish()
{
    if (used < record.length)
        text += Format(" unused=%d", record.length - used);
    else if (used > record.length)
        text += Format(" missing=%d", used - record.length);
    return text;
}

std::string OperandText(const SActionRecord& record, const U8* base, size_t most)
{
    Operands operands(record, most);
    switch (record.opcode) {
    case kOpGotoFrame:
        operands.Word(" frame=%u");
        break;
    case kOpGetURL:
        operands.String();
        operands.String();
        break;
    case kOpWaitForFrame:
        operands.Word(" frame=%u");
        operands.Byte(" skip=%u");
        break;
    case kOpSetTarget:
    case kOpGotoLabel:
        operands.String();
        break;
    case kOpWaitForFrameExpr:
        operands.Byte(" skip=%u");
        break;
    case kOpPush:
        operands.Pushed();
        break;
    case kOpJump:
    case kOpIf:
        operands.Jump(base);
        break;
    case kOpGetURLExpr:
        operands.RequestFlags();
        break;
    case kOpGotoFrameExpr:
        operands.Byte(" play=%u");
        break;
    }
    return operands.Finish();
}

} // namespace

std::string QuoteUpTo(const char* bytes, size_t size, size_t most)
{
    const std::string quoted = Quote(std::string(bytes, std::min(size, most)));
    return size > most ? quoted + "..." : quoted;
}

std::string ActionText(const SActionRecord& record, const U8* base, size_t most)
{
    const char* name = OpcodeName(record.opcode);
    const std::string title = name != nullptr ? name : Format("Action0x%02x", record.opcode);
    return title + OperandText(record, base, most);
}

S64 JumpTarget(const SActionRecord& record, const U8* base)
{
    if (record.opcode != kOpJump && record.opcode != kOpIf)
        return -1;
    const S64 target = record.next - base + static_cast<S16>(record.Word(0));
    return target < 0 ? -1 : target;
}
