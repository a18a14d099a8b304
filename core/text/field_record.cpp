#include "core/text/field_record.h"

#include <algorithm>
#include <cstring>

#include "core/stream/character.h"
#include "core/stream/parser.h"

namespace {
class SFieldReader : public SParser {
public:
    explicit SFieldReader(const SCharacter* ch) { Attach(ch->data, ch->DataLen()); }

    void Read(SFieldRecord* r);

private:
    void ReadLayout(SFieldRecord* r);
    std::string_view View(S32 most);
};

void SFieldReader::Read(SFieldRecord* r)
{
    r->flags = GetWord();
    if (r->Has(kFieldFont)) {
        r->fontId = GetWord();
        r->height = GetWord();
    }
    if (r->Has(kFieldColor))
        r->color = GetColor(1);
    if (r->Has(kFieldMaxLen))
        r->maxLen = GetWord();
    if (r->Has(kFieldLayout))
        ReadLayout(r);
    r->variable = View(SFieldRecord::kMaxPath);
    if (r->variable.size() > size_t(SFieldRecord::kMaxPath)) {
        r->variable = {};
        r->longPath = true;
        return;
    }
    if (r->Has(kFieldText))
        r->text = View(SFieldRecord::kMaxText);
}

void SFieldReader::ReadLayout(SFieldRecord* r)
{
    const U8 align = GetByte();
    r->align = align <= kTextJustify ? EFieldAlign(align) : kTextLeft;
    r->leftMargin = GetWord();
    r->rightMargin = GetWord();
    r->indent = GetWord();
    r->leading = S16(GetWord());
}

// A string that the tag cuts short ends with the tag, not at a zero byte further on. Of a longer
// one than asked for no more is looked at than the byte that shows it.
std::string_view SFieldReader::View(S32 most)
{
    const char* start = reinterpret_cast<const char*>(script) + pos;
    const size_t room = size_t(std::min(limit - pos, most + 1));
    const void* zero = room > 0 ? std::memchr(start, 0, room) : nullptr;
    const size_t len = zero ? size_t(static_cast<const char*>(zero) - start) : room;
    Skip(S32(len) + 1);
    return len > 0 ? std::string_view(start, len) : std::string_view();
}
} // namespace

SFieldRecord::SFieldRecord(const SCharacter* ch)
{
    if (!ch || ch->type != kCharEditText)
        return;
    bounds = ch->bounds;
    SFieldReader(ch).Read(this);
}
