#include "core/text/field_record.h"

#include "core/stream/character.h"
#include "core/stream/parser.h"

namespace {
class SFieldReader : public SParser {
public:
    explicit SFieldReader(const SCharacter* ch) { Attach(ch->data, ch->DataLen()); }

    void Read(SFieldRecord* r);

private:
    void ReadLayout(SFieldRecord* r);
    std::string_view View();
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
    r->variable = View();
    if (r->Has(kFieldText))
        r->text = View();
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

// A string that the tag cuts short ends with the tag, not at a zero byte further on.
std::string_view SFieldReader::View()
{
    const S32 start = pos;
    while (pos < limit && script[pos] != 0)
        ++pos;
    const S32 len = pos - start;
    Skip(1);
    return len > 0 ? std::string_view(reinterpret_cast<const char*>(script + start), size_t(len))
                   : std::string_view();
}
} // namespace

SFieldRecord::SFieldRecord(const SCharacter* ch)
{
    if (!ch || ch->type != kCharEditText)
        return;
    bounds = ch->bounds;
    SFieldReader(ch).Read(this);
}
