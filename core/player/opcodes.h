// The action records' opcodes: number, name for people, and what each takes from the stack.
#pragma once

#include "core/geom/types.h"

enum SOpcode : U8 {
    kOpEnd = 0x00,
    kOpNextFrame = 0x04,
    kOpPrevFrame = 0x05,
    kOpPlay = 0x06,
    kOpStop = 0x07,
    kOpToggleQuality = 0x08,
    kOpStopSounds = 0x09,
    kOpAdd = 0x0A, // pop a, b (b was pushed last); push a + b, and so on
    kOpSubtract = 0x0B,
    kOpMultiply = 0x0C,
    kOpDivide = 0x0D,
    kOpEquals = 0x0E,
    kOpLess = 0x0F,
    kOpAnd = 0x10,
    kOpOr = 0x11,
    kOpNot = 0x12,
    kOpStringEquals = 0x13,
    kOpStringLength = 0x14,
    kOpStringExtract = 0x15,
    kOpPop = 0x17,
    kOpToInteger = 0x18,
    kOpGetVariable = 0x1C,
    kOpSetVariable = 0x1D,
    kOpSetTargetExpr = 0x20,
    kOpStringAdd = 0x21,
    kOpGetProperty = 0x22,
    kOpSetProperty = 0x23,
    kOpCloneSprite = 0x24,
    kOpRemoveSprite = 0x25,
    kOpTrace = 0x26,
    kOpStartDrag = 0x27,
    kOpEndDrag = 0x28,
    kOpStringLess = 0x29,
    kOpRandomNumber = 0x30,
    kOpMBStringLength = 0x31,
    kOpCharToAscii = 0x32,
    kOpAsciiToChar = 0x33,
    kOpGetTime = 0x34,
    kOpMBStringExtract = 0x35,
    kOpMBCharToAscii = 0x36,
    kOpMBAsciiToChar = 0x37,
    kOpGotoFrame = 0x81,        // u16 frame
    kOpGetURL = 0x83,           // string URL, string window
    kOpWaitForFrame = 0x8A,     // u16 frame, u8 records to skip
    kOpSetTarget = 0x8B,        // string path
    kOpGotoLabel = 0x8C,        // string label
    kOpWaitForFrameExpr = 0x8D, // u8 records to skip
    kOpPush = 0x96,             // u8 type, value
    kOpJump = 0x99,             // s16 offset from the end of the record
    kOpGetURLExpr = 0x9A,       // u8 flags
    kOpIf = 0x9D,               // s16 offset
    kOpCallFrame = 0x9E,
    kOpGotoFrameExpr = 0x9F, // u8 play
};

// From this one on a record has a payload and its length.
constexpr U8 kFirstOpWithPayload = 0x80;

// The name, or null for an opcode that does nothing.
const char* OpcodeName(U8 opcode);

// One record as it lies in the movie.
struct SActionRecord {
    U8 opcode;
    const U8* payload; // null for an opcode without one
    S32 length;        // of the payload, as much of it as is there
    const U8* next;    // first byte after the record

    // Fields of the payload; bytes that are not there read as 0.
    U8 Byte(S32 at) const;
    U16 Word(S32 at) const;
    U32 DWord(S32 at) const;
    // The string at that byte and its length, ended by a zero byte or by the payload's end; *after,
    // if not null, is where the next field begins.
    const char* String(S32 at, S32* size, S32* after = nullptr) const;
};

// Decodes the record at `pc`; false when it crosses `end`.
bool ReadActionRecord(const U8* pc, const U8* end, SActionRecord* record);
