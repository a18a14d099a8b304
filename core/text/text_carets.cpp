// Where the bytes of a line stand, what is at a point, how carets move, and what is in view.
#include <algorithm>

#include "core/text/text_layout.h"

namespace {
constexpr S64 kFar = 0x3FFFFFFF; // no coordinate lies farther out

S32 Near(S64 v)
{
    return S32(std::clamp(v, -kFar, kFar));
}

S64 FloorDiv(S64 a, S64 b)
{
    return a >= 0 ? a / b : -((b - 1 - a) / b);
}
} // namespace

LineWalk::LineWalk(const TextLayout& layout, U32 line)
    : text(layout), next(layout.Line(line).start), end(layout.Line(line).end)
{
    x = layout.LineX(line) - layout.HScroll();
    if (layout.align == kTextJustify && layout.EndsByRoom(line) && !layout.Password())
        FindGaps(layout.Line(line), layout.Room(layout.Opens(line)));
}

void LineWalk::FindGaps(const STextLine& line, S64 room)
{
    gapsEnd = end;
    while (gapsEnd > next && text.Byte(gapsEnd - 1) == ' ')
        --gapsEnd;
    gaps = U32(std::count(text.Text() + next, text.Text() + gapsEnd, ' '));
    spare = std::max<S64>(room - line.width, 0);
}

// What the spaces behind this one do not get, so that they add up to all there is to spare.
S32 LineWalk::Gap()
{
    if (offset >= gapsEnd || code != ' ')
        return 0;
    const S64 before = spare * gapsDone / gaps;
    return S32(spare * ++gapsDone / gaps - before);
}

// The breaks that a line holds are those of a field of one line.
bool LineWalk::Next()
{
    x += advance;
    advance = 0;
    if (next >= end)
        return false;
    offset = next++;
    code = text.Byte(offset);
    if (code == '\r' || code == '\n')
        code = 0;
    else if (text.Password())
        code = '*';
    if (code != 0)
        advance = text.font->Advance(code) + Gap();
    return true;
}

// Left edge of a line before scrolling. One that is wider than the room begins at its left.
S64 TextLayout::LineX(U32 line) const
{
    const bool opens = Opens(line);
    const S64 spare = std::max<S64>(Room(opens) - Line(line).width, 0);
    const S64 x = S64(box.xmin) + left + (opens ? indent : 0);
    return align == kTextRight ? x + spare : align == kTextCenter ? x + (spare >> 1) : x;
}

S32 TextLayout::LineTop(U32 line) const
{
    return Near(box.ymin + (S64(line) - firstLine) * lineHeight);
}

U32 TextLayout::LineAt(S32 y) const
{
    const S64 line = firstLine + FloorDiv(S64(y) - box.ymin, lineHeight);
    return U32(std::clamp<S64>(line, 0, LineCount() - 1));
}

S32 TextLayout::XOf(U32 line, U32 offset) const
{
    LineWalk walk(*this, line);
    const S64 limit = std::max(S64(box.xmax) - right, walk.x + Line(line).width);
    while (walk.Next() && walk.offset < offset) {
    }
    return Near(Wraps() ? std::min(walk.x, limit) : walk.x);
}

U32 TextLayout::LastCaret(U32 line) const
{
    const STextLine& l = Line(line);
    return EndsByRoom(line) && l.end > l.start ? l.end - 1 : l.end;
}

U32 TextLayout::OffsetAt(U32 line, S32 x) const
{
    const U32 last = LastCaret(line);
    U32 found = last;
    LineWalk walk(*this, line);
    while (walk.Next() && walk.offset < last) {
        if (x < walk.x + walk.advance / 2) {
            found = walk.offset;
            break;
        }
    }
    return InsideBreak(found) ? found + 1 : found;
}

U32 TextLayout::Move(U32 offset, ECaretMove move, S32* goal) const
{
    offset = std::min(offset, Length());
    const U32 line = LineOf(offset);
    switch (move) {
    case kCaretLeft:
    case kCaretRight:
        *goal = kNoGoal;
        return Step(offset, move == kCaretRight);
    case kCaretLineStart:
    case kCaretLineEnd:
        *goal = kNoGoal;
        return move == kCaretLineStart ? Line(line).start : LastCaret(line);
    case kCaretUp:
        return MoveLines(offset, -1, goal);
    case kCaretDown:
        return MoveLines(offset, 1, goal);
    case kCaretPageUp:
        return MoveLines(offset, -S64(VisibleLines()), goal);
    case kCaretPageDown:
        return MoveLines(offset, VisibleLines(), goal);
    case kCaretWordLeft:
    case kCaretWordRight:
        *goal = kNoGoal;
        return StepWord(offset, move == kCaretWordRight);
    case kCaretTextStart:
    case kCaretTextEnd:
        *goal = kNoGoal;
        return move == kCaretTextEnd ? Length() : 0;
    }
    return offset;
}

// Over one byte, or over a break of two.
U32 TextLayout::Step(U32 offset, bool forth) const
{
    if (offset == (forth ? Length() : 0))
        return offset;
    offset += forth ? 1 : -1;
    return InsideBreak(offset) ? offset + (forth ? 1 : -1) : offset;
}

// Where the words of a password begin is nobody's business.
U32 TextLayout::StepWord(U32 offset, bool forth) const
{
    const auto between = [this](U32 at) { return Byte(at) <= ' '; };
    if (Password())
        return forth ? Length() : 0;
    while (forth && offset < Length() && !between(offset))
        ++offset;
    while (forth && offset < Length() && between(offset))
        ++offset;
    while (!forth && offset > 0 && between(offset - 1))
        --offset;
    while (!forth && offset > 0 && !between(offset - 1))
        --offset;
    return offset;
}

// The goal is kept as it would be without scrolling to the side, which may change meanwhile.
U32 TextLayout::MoveLines(U32 offset, S64 by, S32* goal) const
{
    const U32 from = LineOf(offset);
    const U32 to = U32(std::clamp<S64>(from + by, 0, LineCount() - 1));
    if (*goal == kNoGoal)
        *goal = Near(S64(XOf(from, offset)) + hScroll);
    return to == from ? offset : OffsetAt(to, Near(S64(*goal) - hScroll));
}

// The room between lines need not fit below the last one.
U32 TextLayout::VisibleLines() const
{
    const S64 height = S64(box.ymax) - box.ymin;
    const S64 last = font ? font->Ascent() + font->Descent() : 0;
    return height > last ? U32(1 + (height - last) / lineHeight) : 1;
}

S32 TextLayout::MaxScroll() const
{
    const U32 count = LineCount(), visible = VisibleLines();
    return count > visible ? S32(count - visible) + 1 : 1;
}

void TextLayout::SetScroll(S32 scroll)
{
    firstLine = U32(std::clamp(scroll, 1, MaxScroll()) - 1);
}

bool TextLayout::Show(U32 offset)
{
    const U32 oldFirst = firstLine;
    const S32 oldShift = hScroll;
    const U32 line = LineOf(offset), visible = VisibleLines();
    if (line < firstLine)
        firstLine = line;
    else if (line - firstLine >= visible)
        firstLine = line - visible + 1;
    if (!Wraps())
        ShowAcross(S64(XOf(line, offset)) + hScroll);
    return firstLine != oldFirst || hScroll != oldShift;
}

// `x` as it would be without scrolling.
void TextLayout::ShowAcross(S64 x)
{
    const S64 from = S64(box.xmin) + left;
    const S64 to = std::max(S64(box.xmax) - right, from);
    const S64 shift = std::clamp<S64>(hScroll, x - to, x - from);
    hScroll = S32(std::clamp<S64>(shift, 0, kFar));
}

// After a change: no farther than to the last line, nor than to the end of the longest. True when
// that moved something.
bool TextLayout::ClampScroll()
{
    const U32 oldFirst = firstLine;
    const S32 oldShift = hScroll;
    SetScroll(Scroll());
    S64 most = 0;
    for (U32 line = 0; hScroll != 0 && line < LineCount() && !Wraps(); ++line)
        most = std::max(most, LineX(line) + Line(line).width + right - box.xmax);
    hScroll = S32(std::min<S64>(hScroll, most));
    return firstLine != oldFirst || hScroll != oldShift;
}
