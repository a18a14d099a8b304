// TextLayout: the bytes of a text field, broken into lines, and where each byte stands.
#pragma once

#include <string_view>

#include "core/geom/grow_buffer.h"
#include "core/text/field_font.h"
#include "core/text/field_record.h"

// A line: bytes [start, end), spaces that hang beyond the room included, its break excluded.
struct STextLine {
    U32 start;
    U32 end;
    U32 seen;  // what the line is depends on no byte from here on
    S32 width; // twips, hanging spaces excluded
    bool hard; // a break ends it; else the room does, or the text
};

enum ECaretMove : U8 {
    kCaretLeft,
    kCaretRight,
    kCaretUp,
    kCaretDown,
    kCaretLineStart,
    kCaretLineEnd,
    kCaretPageUp,
    kCaretPageDown,
    kCaretWordLeft, // to the start of a word
    kCaretWordRight,
    kCaretTextStart,
    kCaretTextEnd,
};

// Holds the text, lays it out in the field's box and keeps what of it is scrolled into view. All
// points are twips in the field's own space, scrolling included; no camera comes into it. Carets
// are byte offsets from 0 to Length(), a greater one counts as Length(); where two lines of a
// paragraph meet the caret belongs to the second. There is always at least one line, and a line
// index beyond the last is answered with the last line's bytes. Needs a format before the rest.
//
// An edit lays out only lines that it can change, so that its cost does not grow with the text. No
// memory is taken once the buffers have grown to the text.
class TextLayout {
public:
    static constexpr U32 kMaxText = SFieldRecord::kMaxText; // bytes
    static constexpr U32 kLastLine = 0xFFFFFFFF;            // or any beyond the text's
    static constexpr S32 kNoGoal = kS32Min;                 // see Move
    static constexpr S32 kInset = 40;                       // of the box from the bounds
    static constexpr S32 kLeastLineHeight = 20;

    // Drops text, format and scrolling and keeps the memory.
    void Reset();
    // Lays all out anew for a field; to be repeated when the font has changed. `fieldFont` outlives
    // this.
    void SetFormat(const SFieldRecord& field, const FieldFont* fieldFont);

    // Replaces `removed` bytes from `at` on; what goes beyond the text is cut, and so are bytes
    // beyond kMaxText. False, with nothing changed, when the heap is exhausted. `s` is not part of
    // this text.
    bool Replace(U32 at, U32 removed, std::string_view s);
    // Replaces the part in which the text and `s` differ.
    bool SetText(std::string_view s);
    // Zero-terminated; valid until the next change.
    const char* Text() const { return text.size() > 0 ? text.data() : ""; }
    U32 Length() const { return text.size() > 0 ? U32(text.size() - 1) : 0; }

    // Lines that the last change of the text moved or laid out anew: all that can look different.
    // The last is kLastLine when there may be more or fewer behind the first.
    U32 ChangedFrom() const { return changedFrom; }
    U32 ChangedTo() const { return changedTo; }

    // --- lines ---
    U32 LineCount() const { return lines.size() > 0 ? U32(lines.size()) : 1; }
    const STextLine& Line(U32 line) const;
    U32 LineOf(U32 offset) const;
    // The line at a height, whether it is in view or not; the first or last when there is none.
    U32 LineAt(S32 y) const;
    const SRECT& Box() const { return box; } // the bounds less kInset; inverted when they are small
    S32 LineHeight() const { return lineHeight; } // from top to top
    S32 LineTop(U32 line) const;
    S32 Baseline(U32 line) const { return LineTop(line) + font->Ascent(); }

    // --- carets ---
    // The left edge of a byte that stands on the line, or the line's right end. Hanging spaces
    // reach no farther than the room.
    S32 XOf(U32 line, U32 offset) const;
    // The caret of a line that is nearest to x: glyphs are divided in their middle. Never between
    // the bytes of a break, nor at the end of a line that the room ends, which is the next one's.
    U32 OffsetAt(U32 line, S32 x) const;
    U32 OffsetAt(const SPOINT& pt) const { return OffsetAt(LineAt(pt.y), pt.x); }
    // Where a key moves the caret. `goal` is kept from move to move, so that moves over short lines
    // come back to their column; kNoGoal at first and after whatever else changes the caret.
    U32 Move(U32 offset, ECaretMove move, S32* goal) const;

    // --- scrolling ---
    U32 VisibleLines() const; // that fit whole, at least 1
    U32 FirstLine() const { return firstLine; }
    // Counted from 1, as movies know them.
    S32 Scroll() const { return S32(firstLine) + 1; }
    S32 MaxScroll() const;
    void SetScroll(S32 scroll); // clamped
    // How far lines are shifted to the left; 0 where the room ends lines.
    S32 HScroll() const { return hScroll; }
    // Scrolls the least that brings the caret into view. True when something moved.
    bool Show(U32 offset);

private:
    friend class LineWalk;
    static constexpr U32 kNoOffset = 0xFFFFFFFF;
    static constexpr size_t kKeptFresh = 1024; // lines; room for more is given back

    bool SeveralLines() const { return flags & kFieldMultiline; }
    bool Wraps() const { return (flags & kFieldWrap) && SeveralLines(); }
    bool Password() const { return flags & kFieldPassword; }
    U8 Byte(U32 offset) const { return U8(text[offset]); }
    bool InsideBreak(U32 offset) const;
    S64 Room(bool opens) const;
    bool Opens(U32 line) const { return line == 0 || Line(line - 1).hard; }
    bool EndsByRoom(U32 line) const { return size_t(line) + 1 < lines.size() && !lines[line].hard; }
    S64 LineX(U32 line) const;
    U32 LastCaret(U32 line) const;
    U32 Step(U32 offset, bool forth) const;
    U32 StepWord(U32 offset, bool forth) const;
    U32 MoveLines(U32 offset, S64 by, S32* goal) const;
    void ShowAcross(S64 x);

    void LayOut(U32 at, U32 removed, U32 added);
    U32 LayOutLine(U32 start, bool opens, STextLine* line) const;
    U32 EndAtBreak(U32 at, STextLine* line) const;
    U32 FirstThatSaw(U32 at) const;
    void Splice(U32 first, U32 keep, U32 delta);
    void NoteChange(U32 first, U32 keep);
    bool ClampScroll();

    const FieldFont* font = nullptr;
    GrowBuffer<char> text;       // and its zero byte; empty before the first
    GrowBuffer<STextLine> lines; // empty when there was no memory for one
    GrowBuffer<STextLine> fresh; // lines just laid out
    bool whole = false;          // `lines` covers the text
    SRECT box = {0, 0, 0, 0};
    U16 flags = 0;
    EFieldAlign align = kTextLeft;
    S32 left = 0;
    S32 right = 0;
    S32 indent = 0;
    S32 lineHeight = kLeastLineHeight;
    U32 changedFrom = 0;
    U32 changedTo = 0;
    U32 firstLine = 0; // of those in view
    S32 hScroll = 0;
};

// Goes over the bytes of a line from left to right. A layout that changes ends the walk.
class LineWalk {
public:
    LineWalk(const TextLayout& layout, U32 line);

    U32 offset = 0;  // of the byte
    U8 code = 0;     // it shows as this; 0: as nothing
    S64 x = 0;       // left edge, twips in the field's space
    S32 advance = 0; // to the next byte

    // Goes on to the next byte. False after the last one, when `x` is the line's right end.
    bool Next();

private:
    void FindGaps(const STextLine& line, S64 room);
    S32 Gap();

    const TextLayout& text;
    U32 next;         // offset of the byte that follows
    U32 end;          // of the line
    U32 gapsEnd = 0;  // spaces before here are widened
    U32 gaps = 0;     // how many they are
    U32 gapsDone = 0; // of these, behind
    S64 spare = 0;    // twips to be spread over them
};
