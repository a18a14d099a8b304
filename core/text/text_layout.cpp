// Lines: how a text breaks into them, anew or from an edit on.
#include "core/text/text_layout.h"

#include <algorithm>
#include <cstring>

namespace {
bool IsBreak(U8 c)
{
    return c == '\r' || c == '\n';
}

// How many bytes two texts share at their beginnings; at their ends. Scripts mostly append.
U32 SharedStart(const char* a, const char* b, U32 most)
{
    constexpr U32 kBlock = 64; // bytes
    U32 n = 0;
    while (most - n >= kBlock && std::memcmp(a + n, b + n, kBlock) == 0)
        n += kBlock;
    while (n < most && a[n] == b[n])
        ++n;
    return n;
}

U32 SharedEnd(const char* aEnd, const char* bEnd, U32 most)
{
    U32 n = 0;
    while (n < most && aEnd[-1 - S32(n)] == bEnd[-1 - S32(n)])
        ++n;
    return n;
}
} // namespace

void TextLayout::Reset()
{
    text.Clear();
    lines.Clear();
    font = nullptr;
    firstLine = 0;
    hScroll = 0;
}

void TextLayout::SetFormat(const SFieldRecord& field, const FieldFont* fieldFont)
{
    const SRECT& b = field.bounds;
    font = fieldFont;
    box = RectIsEmpty(&b)
              ? SRECT{0, 0, 0, 0}
              : SRECT{b.xmin + kInset, b.xmax - kInset, b.ymin + kInset, b.ymax - kInset};
    flags = field.flags;
    align = field.align;
    left = field.leftMargin;
    right = field.rightMargin;
    indent = field.indent;
    const S32 height = font->Ascent() + font->Descent() + font->Leading() + field.leading;
    lineHeight = std::max(height, kLeastLineHeight);
    whole = false;
    LayOut(0, 0, 0);
}

bool TextLayout::Replace(U32 at, U32 removed, std::string_view s)
{
    const U32 len = Length();
    at = std::min(at, len);
    removed = std::min(removed, len - at);
    const U32 added = U32(std::min<size_t>(s.size(), kMaxText - (len - removed)));
    if (!text.Reserve(size_t(len) - removed + added + 1))
        return false;
    if (text.size() == 0)
        text.Push(0);
    const U32 tail = len - at - removed + 1;
    if (added > removed)
        text.Resize(text.size() + (added - removed));
    std::memmove(text.data() + at + added, text.data() + at + removed, tail);
    text.Truncate(size_t(at) + added + tail);
    if (added > 0)
        std::memcpy(text.data() + at, s.data(), added);
    LayOut(at, removed, added);
    return true;
}

bool TextLayout::SetText(std::string_view s)
{
    const U32 len = Length();
    s = s.substr(0, kMaxText);
    const U32 least = std::min(len, U32(s.size()));
    const U32 head = SharedStart(Text(), s.data(), least);
    const U32 tail = SharedEnd(Text() + len, s.data() + s.size(), least - head);
    return Replace(head, len - head - tail, s.substr(head, s.size() - head - tail));
}

const STextLine& TextLayout::Line(U32 line) const
{
    static constexpr STextLine kNone = {0, 0, 0, 0, false};
    return lines.size() > 0 ? lines[std::min(line, U32(lines.size()) - 1)] : kNone;
}

U32 TextLayout::LineOf(U32 offset) const
{
    const STextLine* after =
        std::upper_bound(lines.begin(), lines.end(), offset,
                         [](U32 at, const STextLine& line) { return at < line.start; });
    const U32 count = U32(after - lines.begin());
    return count > 0 ? count - 1 : 0;
}

// Between the bytes of one break.
bool TextLayout::InsideBreak(U32 offset) const
{
    return offset > 0 && offset < Length() && Byte(offset - 1) == '\r' && Byte(offset) == '\n';
}

// What the bytes of a line may take; negative in a box that is too small.
S64 TextLayout::Room(bool opens) const
{
    return S64(box.xmax) - box.xmin - left - right - (opens ? indent : 0);
}

// A line never saw less than the lines before it, since a paragraph's first line has the least
// room: what stood behind the last chance to break fits into the next line, and was seen there too.
U32 TextLayout::FirstThatSaw(U32 at) const
{
    const STextLine* line = std::upper_bound(
        lines.begin(), lines.end(), at, [](U32 edit, const STextLine& l) { return edit < l.seen; });
    return U32(line - lines.begin());
}

// Bytes before `at` and, but for their offsets, those behind what was added are as they were. Lines
// are laid out from the first that can be another until one begins where an old one did; from there
// on the old ones hold.
void TextLayout::LayOut(U32 at, U32 removed, U32 added)
{
    if (!font)
        return;
    if (!whole)
        lines.Clear();
    const U32 delta = added - removed; // modulo 2^32, as all offsets that it is added to
    const U32 first = FirstThatSaw(at);
    U32 keep = first;
    U32 start = first < lines.size() ? lines[first].start : 0;
    bool opens = Opens(first);
    fresh.Clear();
    for (whole = true; whole && start != kNoOffset;) {
        STextLine line;
        start = LayOutLine(start, opens, &line);
        opens = line.hard;
        whole = fresh.Push(line);
        while (keep < lines.size() &&
               (lines[keep].start < at + removed || lines[keep].start + delta < start))
            ++keep;
        if (keep < lines.size() && lines[keep].start + delta == start && Opens(keep) == opens)
            break;
    }
    Splice(first, whole ? keep : U32(lines.size()), delta);
    NoteChange(first, keep);
    if (ClampScroll())
        changedFrom = 0, changedTo = kLastLine;
    if (fresh.size() > kKeptFresh)
        fresh.Release();
}

// The fresh lines stand in for those from `first` to before `keep`.
void TextLayout::NoteChange(U32 first, U32 keep)
{
    const bool sameCount = whole && keep - first == fresh.size();
    changedFrom = first;
    changedTo = sameCount ? keep - 1 : kLastLine;
}

// Puts the fresh lines in the place of old ones from `first` to before `keep`, and moves the
// offsets of those behind. Without memory the lines end early, until all are laid out anew.
void TextLayout::Splice(U32 first, U32 keep, U32 delta)
{
    const size_t tail = lines.size() - keep;
    const size_t count = first + fresh.size() + tail;
    if (count > lines.size() && !lines.Resize(count)) {
        lines.Truncate(first);
        whole = false;
        return;
    }
    STextLine* behind = lines.data() + first + fresh.size();
    if (tail > 0)
        std::memmove(behind, lines.data() + keep, tail * sizeof(STextLine));
    if (fresh.size() > 0)
        std::memcpy(lines.data() + first, fresh.data(), fresh.size() * sizeof(STextLine));
    lines.Truncate(count);
    for (size_t i = 0; delta != 0 && i < tail; ++i) {
        behind[i].start += delta;
        behind[i].end += delta;
        behind[i].seen += delta;
    }
}

// Fills in the line that begins at `start` and gives the start of the next, kNoOffset when the text
// ends. A space that does not fit hangs; any other byte that does not fit ends the line behind the
// last space or hyphen, or else before itself. Stars have no such places: how long the words of a
// password are is nobody's business.
U32 TextLayout::LayOutLine(U32 start, bool opens, STextLine* line) const
{
    const U32 len = Length();
    const S64 room = Wraps() ? Room(opens) : INT64_MAX;
    S64 x = 0, widthBefore = 0; // of all so far; of what stands before the place to break
    U32 place = start;          // where the line can be broken; none yet
    U32 i = start;
    const auto finish = [&](U32 end, S64 width) {
        *line = {start, end, i + 1, S32(std::min<S64>(width, kS32Max)), false};
    };
    for (; i < len; ++i) {
        const U8 c = Byte(i);
        if (IsBreak(c)) {
            if (!SeveralLines())
                continue;
            break;
        }
        const bool space = c == ' ' && !Password(), hyphen = c == '-' && !Password();
        const S32 advance = font->Advance(Password() ? U8('*') : c);
        if (!space && x + advance > room && i > start) {
            place > start ? finish(place, widthBefore) : finish(i, x);
            return line->end;
        }
        if (space && (i == start || Byte(i - 1) != ' '))
            widthBefore = x;
        x += advance;
        if (hyphen)
            widthBefore = x;
        if (space || hyphen)
            place = i + 1;
    }
    const bool hangs = x > room && place == i && i > start && Byte(i - 1) == ' ';
    finish(i, hangs ? widthBefore : x);
    return i < len ? EndAtBreak(i, line) : kNoOffset;
}

// The line ends with the break at `at`, and saw what follows a carriage return.
U32 TextLayout::EndAtBreak(U32 at, STextLine* line) const
{
    const bool pair = Byte(at) == '\r' && at + 1 < Length() && Byte(at + 1) == '\n';
    line->hard = true;
    line->seen = at + (Byte(at) == '\r' ? 2 : 1);
    return at + (pair ? 2 : 1);
}
