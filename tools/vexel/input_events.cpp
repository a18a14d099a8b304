#include "tools/vexel/input_events.h"

#include "core/player/player.h"
#include "platform/headless/host_text.h"
#include "tools/vexel/arguments.h"
#include "tools/vexel/message.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <string_view>

namespace {

constexpr size_t kLargestFile = size_t(64) << 20;
constexpr int kFarthest = 1000000; // pixels from the corner

// One line on its way to events.
class EventLine {
public:
    EventLine(std::string_view words, std::vector<InputEvent>* list) : rest(words), events(list) {}
    // What is wrong with it, or nothing.
    std::string Parse();

private:
    std::string Word();
    std::string ParseMouse(InputEvent event);
    std::string ParseKey(InputEvent event);
    std::string ParseText(InputEvent event);
    std::string AtEnd();

    std::string_view rest;
    std::vector<InputEvent>* events;
};

// The next word; empty at the end of the line, where a comment begins.
std::string EventLine::Word()
{
    constexpr char kBlanks[] = " \t";
    const size_t from = std::min(rest.find_first_not_of(kBlanks), rest.size());
    const size_t to = std::min(rest.find_first_of(kBlanks, from), rest.size());
    const std::string word(rest.substr(from, to - from));
    if (!word.empty() && word[0] == '#') {
        rest = {};
        return "";
    }
    rest.remove_prefix(to);
    return word;
}

std::string EventLine::AtEnd()
{
    const std::string word = Word();
    return word.empty() ? "" : "nothing is expected before " + word;
}

std::string EventLine::ParseMouse(InputEvent event)
{
    const std::string across = Word();
    const std::string down = Word();
    if (!ParseNumber(across, -kFarthest, kFarthest, &event.x) ||
        !ParseNumber(down, -kFarthest, kFarthest, &event.y))
        return "the pointer needs X Y, in pixels";
    events->push_back(event);
    return AtEnd();
}

std::string EventLine::ParseKey(InputEvent event)
{
    constexpr const char* kModifiers[] = {"shift", "ctrl", "alt"}; // bits 0 to 2
    if (!ParseNumber(Word(), 1, 255, &event.key))
        return "a key is a CODE from 1 to 255";
    for (std::string word = Word(); !word.empty(); word = Word()) {
        int bit = 0;
        while (bit < 3 && word != kModifiers[bit])
            bit++;
        if (bit == 3)
            return "a key goes with shift, ctrl and alt, not with " + word;
        event.modifiers |= 1 << bit;
    }
    events->push_back(event);
    return "";
}

// All that follows the blank behind the word; a "#" in there is a character like others.
std::string EventLine::ParseText(InputEvent event)
{
    if (rest.size() < 2)
        return "text needs characters";
    for (const char c : Latin1FromUtf8(rest.substr(1))) {
        event.key = static_cast<U8>(c);
        if (event.key < 32 || (event.key > 126 && event.key < 160))
            return Format("no key is the character %d", event.key);
        events->push_back(event);
    }
    return "";
}

std::string EventLine::Parse()
{
    const std::string number = Word();
    if (number.empty())
        return "";
    InputEvent event = {0, InputEvent::kKey};
    if (!ParseNumber(number, 1, kLastPicture, &event.picture))
        return "an event begins with the number of a picture, counted from 1";
    const std::string what = Word();
    if (what == "key")
        return ParseKey(event);
    if (what == "text")
        return ParseText(event);
    constexpr const char* kMouse[] = {"move", "down", "up"};
    for (const InputEvent::Kind kind : {InputEvent::kMove, InputEvent::kDown, InputEvent::kUp}) {
        event.kind = kind;
        if (what == kMouse[kind])
            return ParseMouse(event);
    }
    return "an event is one of move, down, up, key, text";
}

// The exit code, after complaining when it is not 0.
int ReadFile(const std::string& name, std::string* content)
{
    std::FILE* file = std::fopen(name.c_str(), "rb");
    char block[16 * 1024];
    size_t n = file != nullptr ? std::fread(block, 1, sizeof block, file) : 0;
    while (n > 0 && content->size() <= kLargestFile) {
        content->append(block, n);
        n = std::fread(block, 1, sizeof block, file);
    }
    const bool failed = file == nullptr || std::ferror(file) != 0;
    if (failed)
        Complain(name, std::strerror(errno));
    if (file != nullptr)
        std::fclose(file);
    if (failed)
        return kExitUnreadable;
    if (content->size() <= kLargestFile)
        return kExitDone;
    Complain(name, Format("more than %zu bytes of events", kLargestFile));
    return kExitLimit;
}

} // namespace

int InputEvents::Load(const std::string& file)
{
    std::string content;
    const int code = ReadFile(file, &content);
    if (code != kExitDone)
        return code;
    std::string_view left = content;
    for (int line = 1; !left.empty(); line++) {
        const size_t length = std::min(left.find('\n'), left.size());
        std::string_view words = left.substr(0, length);
        left.remove_prefix(std::min(length + 1, left.size()));
        if (!words.empty() && words.back() == '\r')
            words.remove_suffix(1);
        const std::string fault = EventLine(words, &events).Parse();
        if (fault.empty())
            continue;
        Complain(file, Format("line %d: ", line) + fault);
        return kExitUsage;
    }
    std::stable_sort(events.begin(), events.end(), [](const InputEvent& a, const InputEvent& b) {
        return a.picture < b.picture;
    });
    return kExitDone;
}

void InputHand::Deliver(int picture, SPlayer* player)
{
    for (; next < events.size() && events[next].picture <= picture; next++)
        Do(events[next], player);
}

// A press where the pointer has not been comes with its way there, which a button wants to see.
void InputHand::Press(const InputEvent& event, SPlayer* player)
{
    if (!placed || event.x != x || event.y != y)
        player->MouseMove(event.x, event.y, 0);
    player->MouseDown(event.x, event.y);
}

void InputHand::Do(const InputEvent& event, SPlayer* player)
{
    switch (event.kind) {
    case InputEvent::kKey:
        player->HandleKeyDown(event.key, event.modifiers);
        player->HandleKeyUp(event.key, event.modifiers);
        return;
    case InputEvent::kMove:
        player->MouseMove(event.x, event.y, pressed);
        break;
    case InputEvent::kDown:
        Press(event, player);
        pressed = 1;
        break;
    case InputEvent::kUp:
        player->MouseUp(event.x, event.y);
        pressed = 0;
        break;
    }
    placed = true;
    x = event.x;
    y = event.y;
}
