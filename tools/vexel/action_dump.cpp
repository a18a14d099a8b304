#include "tools/vexel/action_dump.h"

#include "core/display/button_records.h"
#include "core/stream/character.h"
#include "core/stream/tags.h"
#include "tools/vexel/action_text.h"
#include "tools/vexel/message.h"
#include "tools/vexel/text_form.h"

#include <algorithm>
#include <cstdio>
#include <set>
#include <vector>

namespace {

// The button's transitions by their bit, and the states of its parts.
constexpr const char* kTransitions[] = {
    "idle-over",    "over-idle",       "over-down", "down-over", "down-outside",
    "outside-down", "release-outside", "idle-down", "down-idle",
};
constexpr const char* kParts[] = {"up", "over", "down", "hit"};

// The names whose bits are set, with commas between.
template <size_t n> std::string SetBits(const char* const (&names)[n], U32 bits)
{
    std::string text;
    for (size_t i = 0; i < n; i++) {
        if (bits >> i & 1)
            text += (text.empty() ? "" : ",") + std::string(names[i]);
    }
    return text;
}

// A run of records inside a tag; offsets count from the start of the movie.
class ActionLister {
public:
    ActionLister(const TagReader& tagReader, int blanks) : tag(tagReader), indent(blanks) {}
    // The records from one offset to another; a jump may lead anywhere in the tag.
    void List(S32 from, S32 to);

private:
    bool ReadAt(S32 at, SActionRecord* record) const;
    void Divide(S32 from);
    S32 NextTarget(S32 at) const;
    std::string Marks(const SActionRecord& record) const;
    std::string Describe(S32 at, S32 next) const;

    const TagReader& tag;
    const int indent;
    S32 end = 0;             // of the run
    std::vector<S32> pieces; // where a record, or a run of bytes that are none, starts; ascending
    std::set<S32> targets;   // of the jumps
};

bool ActionLister::ReadAt(S32 at, SActionRecord* record) const
{
    return ReadActionRecord(tag.script + at, tag.script + end, record);
}

// The first place behind `at` that a jump leads to, or the end.
S32 ActionLister::NextTarget(S32 at) const
{
    const auto next = targets.upper_bound(at);
    return next != targets.end() && *next < end ? *next : end;
}

// One record after the other. Bytes that nothing leads to, behind a jump or an end, need not be
// records: they must not hide the place where a jump goes on. No byte is in two pieces.
void ActionLister::Divide(S32 from)
{
    bool reached = true;
    for (S32 at = from; at < end;) {
        SActionRecord record;
        const bool whole = ReadAt(at, &record);
        const S32 after = whole ? static_cast<S32>(record.next - tag.script) : end;
        const S32 target = NextTarget(at);
        const bool hides = target < after && !(whole && (reached || targets.count(at) > 0));
        pieces.push_back(at);
        at = hides ? target : after;
        if (hides)
            continue;
        const S64 leads = whole ? JumpTarget(record, tag.script) : -1;
        if (leads >= 0 && leads < end)
            targets.insert(static_cast<S32>(leads));
        reached = record.opcode != kOpJump && record.opcode != kOpEnd;
    }
}

// What is odd about where a jump leads.
std::string ActionLister::Marks(const SActionRecord& record) const
{
    if (record.opcode != kOpJump && record.opcode != kOpIf)
        return "";
    const S64 target = JumpTarget(record, tag.script);
    if (target < tag.bodyStart || target > tag.tagEnd)
        return " (outside)";
    if (target == tag.tagEnd)
        return " (end)";
    const bool known = std::binary_search(pieces.begin(), pieces.end(), static_cast<S32>(target));
    return known ? "" : " (no record)";
}
// A piece up to the next one.
std::string ActionLister::Describe(S32 at, S32 next) const
{
    SActionRecord record;
    if (!ReadAt(at, &record) || record.next - tag.script > next)
        return Format(next < end ? "data: %d bytes" : "incomplete: %d bytes", next - at);
    return ActionText(record, tag.script) + Marks(record);
}

void ActionLister::List(S32 from, S32 to)
{
    end = to;
    Divide(from);
    for (size_t i = 0; i < pieces.size(); i++) {
        const S32 next = i + 1 < pieces.size() ? pieces[i + 1] : end;
        std::printf("%8d  %*s%s\n", pieces[i], indent, "", Describe(pieces[i], next).c_str());
    }
}

// The bits below are transitions, the upper seven a key code.
std::string ConditionText(U16 word)
{
    const std::string transitions = SetBits(kTransitions, word);
    std::string text = "on" + (transitions.empty() ? "" : " " + transitions);
    if (word >> 9 != 0)
        text += Format(" key=%d", word >> 9);
    return text;
}

void PrintParts(ButtonRecords* records, bool ownCxform, int indent)
{
    SButtonRecord part;
    while (records->Next(&part)) {
        std::printf("%8s  %*spart %s id=%u layer=%u matrix=%s%s\n", "", indent, "",
                    SetBits(kParts, part.flags).c_str(), part.id, part.layer,
                    MatrixText(part.mat).c_str(),
                    ownCxform ? (" cxform=" + CxformText(part.cxform)).c_str() : "");
    }
}

// Each block up to the next one: however they lie, no byte is listed twice.
void PrintConditions(const SCharacter& button, const TagReader& tag, int indent)
{
    constexpr S32 kHead = 4; // offset of the next block and the condition
    std::vector<SButtonCondition> conditions;
    ButtonConditions walk(&button);
    for (SButtonCondition condition; walk.Next(&condition);)
        conditions.push_back(condition);
    for (size_t i = 0; i < conditions.size(); i++) {
        const S32 at = static_cast<S32>(conditions[i].actions - tag.script);
        S32 end = tag.tagEnd;
        if (i + 1 < conditions.size())
            end = static_cast<S32>(conditions[i + 1].actions - tag.script) - kHead;
        std::printf("%8d  %*s%s\n", at - kHead, indent, "",
                    ConditionText(conditions[i].word).c_str());
        ActionLister(tag, indent + 2).List(at, std::max(at, end));
    }
}

void PrintButton(TagReader& tag, int indent)
{
    const bool second = tag.tagCode == kTagDefineButton2;
    SCharacter button = {};
    button.type = kCharButton;
    button.tag = tag.GetWord();
    button.tagCode = static_cast<U8>(tag.tagCode);
    if (second)
        button.button.trackAsMenu = tag.GetByte();
    button.data = tag.script + tag.pos;
    button.dataLen = tag.tagEnd - tag.pos;
    ButtonRecords records(&button);
    PrintParts(&records, second, indent);
    if (second)
        PrintConditions(button, tag, indent);
    else
        ActionLister(tag, indent)
            .List(static_cast<S32>(records.Actions() - tag.script), tag.tagEnd);
}

} // namespace

void PrintActions(TagReader* tag, int indent)
{
    tag->pos = tag->bodyStart;
    switch (tag->tagCode) {
    case kTagDoAction:
        return ActionLister(*tag, indent).List(tag->bodyStart, tag->tagEnd);
    case kTagDefineButton:
    case kTagDefineButton2:
        return PrintButton(*tag, indent);
    }
}
