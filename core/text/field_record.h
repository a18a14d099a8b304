// SFieldRecord: what the definition of a text field says.
#pragma once

#include <string_view>

#include "core/geom/rect.h"
#include "core/raster/color.h"

struct SCharacter;

// The field's word of flags. The others say nothing.
enum EFieldFlag : U16 {
    kFieldFont = 0x0001,      // font id and height follow
    kFieldMaxLen = 0x0002,    // greatest length follows
    kFieldColor = 0x0004,     // colour follows
    kFieldReadOnly = 0x0008,  // not to be typed into
    kFieldPassword = 0x0010,  // every byte is shown as a star
    kFieldMultiline = 0x0020, // breaks in the text begin lines
    kFieldWrap = 0x0040,      // so does the end of the room, with kFieldMultiline
    kFieldText = 0x0080,      // initial text follows
    kFieldOwnGlyphs = 0x0100, // the movie's font, not a device font
    kFieldKeepFocus = 0x0400, // stays focused when the mouse goes down elsewhere
    kFieldBorder = 0x0800,    // black hairline round a white field
    kFieldNoSelect = 0x1000,  // the mouse passes through
    kFieldLayout = 0x2000,    // alignment, margins, indent and leading follow
};

enum EFieldAlign : U8 { kTextLeft, kTextRight, kTextCenter, kTextJustify };

// A copy of the numbers, and views of the strings, which stand in the movie's buffer and last as
// long as the movie. Whatever the flags do not announce, or the tag is too short for, has the value
// given here. Lengths are in twips.
struct SFieldRecord {
    // Bytes. A longer path is no path, and what follows it is not read; of a text no more counts.
    static constexpr S32 kMaxPath = 1024;
    static constexpr S32 kMaxText = 65535;

    SRECT bounds = {kRectEmpty, kRectEmpty, kRectEmpty, kRectEmpty};
    U16 flags = 0;               // EFieldFlag bits
    U16 fontId = 0;              // with kFieldFont
    S32 height = 240;            // of the em
    SRGB color = {0, 0, 0, 255}; // of the text, as in the movie
    U32 maxLen = 65535;          // bytes that typing and pasting may reach
    EFieldAlign align = kTextLeft;
    S32 leftMargin = 0;
    S32 rightMargin = 0;
    S32 indent = 0;            // of a paragraph's first line, beside the margin
    S32 leading = 0;           // between lines, beside the font's; may be negative
    std::string_view variable; // path of the bound variable, not zero-terminated; empty: none
    bool longPath = false;     // the path was too long to be one
    std::string_view text;     // initial text, not zero-terminated

    // A field that nothing describes.
    SFieldRecord() = default;
    // The definition's; nothing when `ch` is null or no text field.
    explicit SFieldRecord(const SCharacter* ch);

    bool Has(EFieldFlag flag) const { return flags & flag; }
};
