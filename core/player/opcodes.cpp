#include "core/player/opcodes.h"

namespace {
constexpr S32 kHeaderBytes = 3; // opcode and payload length

struct SOpcodeName {
    U8 opcode;
    const char* name;
};

constexpr SOpcodeName kNames[] = {
    {kOpEnd, "End"},
    {kOpNextFrame, "NextFrame"},
    {kOpPrevFrame, "PrevFrame"},
    {kOpPlay, "Play"},
    {kOpStop, "Stop"},
    {kOpToggleQuality, "ToggleQuality"},
    {kOpStopSounds, "StopSounds"},
    {kOpAdd, "Add"},
    {kOpSubtract, "Subtract"},
    {kOpMultiply, "Multiply"},
    {kOpDivide, "Divide"},
    {kOpEquals, "Equals"},
    {kOpLess, "Less"},
    {kOpAnd, "And"},
    {kOpOr, "Or"},
    {kOpNot, "Not"},
    {kOpStringEquals, "StringEquals"},
    {kOpStringLength, "StringLength"},
    {kOpStringExtract, "StringExtract"},
    {kOpPop, "Pop"},
    {kOpToInteger, "ToInteger"},
    {kOpGetVariable, "GetVariable"},
    {kOpSetVariable, "SetVariable"},
    {kOpSetTargetExpr, "SetTargetExpr"},
    {kOpStringAdd, "StringAdd"},
    {kOpGetProperty, "GetProperty"},
    {kOpSetProperty, "SetProperty"},
    {kOpCloneSprite, "CloneSprite"},
    {kOpRemoveSprite, "RemoveSprite"},
    {kOpTrace, "Trace"},
    {kOpStartDrag, "StartDrag"},
    {kOpEndDrag, "EndDrag"},
    {kOpStringLess, "StringLess"},
    {kOpRandomNumber, "RandomNumber"},
    {kOpMBStringLength, "MBStringLength"},
    {kOpCharToAscii, "CharToAscii"},
    {kOpAsciiToChar, "AsciiToChar"},
    {kOpGetTime, "GetTime"},
    {kOpMBStringExtract, "MBStringExtract"},
    {kOpMBCharToAscii, "MBCharToAscii"},
    {kOpMBAsciiToChar, "MBAsciiToChar"},
    {kOpGotoFrame, "GotoFrame"},
    {kOpGetURL, "GetURL"},
    {kOpWaitForFrame, "WaitForFrame"},
    {kOpSetTarget, "SetTarget"},
    {kOpGotoLabel, "GotoLabel"},
    {kOpWaitForFrameExpr, "WaitForFrameExpr"},
    {kOpPush, "Push"},
    {kOpJump, "Jump"},
    {kOpGetURLExpr, "GetURLExpr"},
    {kOpIf, "If"},
    {kOpCallFrame, "CallFrame"},
    {kOpGotoFrameExpr, "GotoFrameExpr"},
};
} // namespace

const char* OpcodeName(U8 opcode)
{
    for (const SOpcodeName& entry : kNames) {
        if (entry.opcode == opcode)
            return entry.name;
    }
    return nullptr;
}

U8 SActionRecord::Byte(S32 at) const
{
    return at < length ? payload[at] : U8(0);
}

U16 SActionRecord::Word(S32 at) const
{
    return static_cast<U16>(Byte(at) | Byte(at + 1) << 8);
}

U32 SActionRecord::DWord(S32 at) const
{
    return Word(at) | static_cast<U32>(Word(at + 2)) << 16;
}

const char* SActionRecord::String(S32 at, S32* size, S32* after) const
{
    const S32 start = at < length ? at : length;
    S32 stop = start;
    while (stop < length && payload[stop] != 0)
        stop++;
    *size = stop - start;
    if (after)
        *after = stop < length ? stop + 1 : length;
    return *size > 0 ? reinterpret_cast<const char*>(payload + start) : "";
}

bool ReadActionRecord(const U8* pc, const U8* end, SActionRecord* record)
{
    if (pc >= end)
        return false;
    record->opcode = *pc;
    record->payload = nullptr;
    record->length = 0;
    record->next = pc + 1;
    if (record->opcode < kFirstOpWithPayload)
        return true;
    if (end - pc < kHeaderBytes)
        return false;
    record->length = pc[1] | pc[2] << 8;
    record->payload = pc + kHeaderBytes;
    if (record->length > end - record->payload)
        return false;
    record->next = record->payload + record->length;
    return true;
}
