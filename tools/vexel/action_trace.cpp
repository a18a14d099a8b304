#include "tools/vexel/action_trace.h"

#include "core/player/player.h"
#include "tools/vexel/action_text.h"
#include "tools/vexel/message.h"
#include "tools/vexel/object_path.h"

#include <cstdio>

namespace {

constexpr size_t kMostBytes = 60; // shown of a string

std::string StackText(ValueStack& stack)
{
    std::string text = Format(" stack=%u", stack.Count());
    ScriptValue* top = stack.Peek(0);
    if (top != nullptr)
        text += " top=" + QuoteUpTo(top->Text(), static_cast<size_t>(top->Length()), kMostBytes);
    return text;
}

// The bytes that a timeline's movie consists of, if the record lies there: with another target its
// actions may come from another movie.
const U8* MovieAround(const ScriptThread* thread, const SActionRecord& action)
{
    const ScriptPlayer* movie = thread != nullptr ? thread->player : nullptr;
    return movie != nullptr && movie->BytesFrom(action.next - 1) > 0 ? movie->script : nullptr;
}

S32 RecordLength(const SActionRecord& action)
{
    constexpr S32 kHead = 3; // opcode and length
    return action.payload != nullptr ? action.length + kHead : 1;
}

} // namespace

struct ActionTracer {
    static void Record(void* context, ScriptThread* thread, const SActionRecord& action,
                       ValueStack& stack)
    {
        const U8* movie = MovieAround(thread, action);
        std::string line = Format("trace: %d ", static_cast<ActionTrace*>(context)->picture);
        line += thread != nullptr ? TimelinePath(thread->rootObject) : "?";
        if (movie != nullptr)
            line += Format(" %d", static_cast<S32>(action.next - movie) - RecordLength(action));
        line += " " + ActionText(action, movie, kMostBytes) + StackText(stack) + "\n";
        std::fwrite(line.data(), 1, line.size(), stderr);
    }
};

void ActionTrace::Watch(SPlayer* player)
{
    player->tracer = {ActionTracer::Record, this};
}
