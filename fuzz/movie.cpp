// A whole movie from any bytes, at 64 x 64: fed in pieces, played with mouse and keys, then back.
#include "core/display/edit_text.h"
#include "core/player/limits.h"
#include "core/stream/str.h"
#include "platform/headless/native_player.h"

#include <algorithm>
#include <string>

namespace {

// What the user and the host do with text fields. Every other byte of the events is a key.
enum Event : U8 {
    kTick = 0x80,
    kModifiers, // those of the keys from now on, in the next byte
    kPress,     // at a point, as the next three: two bytes from -32 to 95
    kDrag,
    kRelease,
    kMove,
    kPaste,     // the text up to the next event of these, or what was copied
    kPasteMuch, // the same text again and again
    kCopy,
    kSelectAll,
    kDelete,
    kAssign, // name=value, for a variable of the root
    kSeek,   // a frame
    kCancel,
    kZoom,
    kPicture,
    kBlink,
    kAfterLast = 0xA0,
};
// Events are played until they have cost this, with a part for each byte that fields then hold.
constexpr U32 kMostWork = 600000, kEventWork = 4000;
constexpr size_t kMuch = 3000;
constexpr U32 kFewFields = 3, kFewBytes = 50;

void Holds(bool condition)
{
    if (!condition)
        __builtin_trap();
}

// What is true of all fields between two events.
void CheckFields(const SPlayer& player)
{
    const EditText::List& list = player.scene.fields;
    U32 count = 0, bytes = 0;
    for (const EditText* field = list.first; field != nullptr; field = field->next) {
        ++count;
        bytes += field->Room();
        Holds(field->Length() <= field->Room());
        Holds(field->Anchor() <= field->Length() && field->Caret() <= field->Length());
        Holds(field->Scroll() >= 1 && field->Scroll() <= field->MaxScroll());
        Holds(std::char_traits<char>::length(field->Text()) == field->Length());
    }
    Holds(count == list.count && bytes == list.bytes && bytes <= gLimits.textFieldBytes);
}

class EventPlayer {
public:
    EventPlayer(const U8* from, const U8* to) : at(from), end(to) {}

    void Play(NativePlayerWnd* wnd)
    {
        player = wnd;
        player->Tick();
        for (U32 work = 0; work < kMostWork && at < end; work += player->scene.fields.bytes) {
            Step(Byte());
            CheckFields(*player);
            work += kEventWork;
        }
        player->Tick();
    }

private:
    U8 Byte() { return at < end ? *at++ : 0; }
    S32 Coordinate() { return (Byte() & 127) - 32; }

    std::string Text()
    {
        std::string text;
        while (at < end && (*at < kTick || *at >= kAfterLast))
            text += static_cast<char>(*at++);
        return text;
    }

    void Step(U8 event)
    {
        if (event < kTick || event >= kAfterLast)
            player->HandleKeyDown(event, modifiers);
        else if (event >= kPress && event <= kMove)
            MouseStep(event);
        else if (event >= kPaste && event <= kAssign)
            TextStep(event);
        else
            PlayerStep(event);
    }

    void MouseStep(U8 event)
    {
        const S32 x = Coordinate(), y = Coordinate();
        if (event == kPress)
            player->MouseDown(x, y);
        else if (event == kRelease)
            player->MouseUp(x, y);
        else
            player->MouseMove(x, y, event == kDrag);
        player->GetCursorType();
    }

    void TextStep(U8 event)
    {
        MenuStatus status;
        player->GetEditMenuState(&status);
        if (event == kCopy) {
            Copy();
        } else if (event == kSelectAll || event == kDelete) {
            player->EditCommand(event == kDelete);
        } else if (event == kAssign) {
            Assign(Text());
        } else {
            Paste(Text(), event == kPasteMuch);
        }
    }

    void Copy()
    {
        char* text = nullptr;
        player->EditCopy(&text);
        copied = text != nullptr ? text : "";
        FreeStr(text);
    }

    void Paste(std::string text, bool much)
    {
        if (text.empty())
            text = copied.empty() ? "a" : copied;
        while (much && text.size() < kMuch)
            text += text;
        player->EditPaste(text.c_str());
    }

    void Assign(const std::string& text)
    {
        const size_t equals = text.find('=');
        const std::string value = equals < text.size() ? text.substr(equals + 1) : "";
        player->SPlayer::SetVariable(player, text.substr(0, equals).c_str(), value.c_str(), 1);
    }

    void PlayerStep(U8 event)
    {
        if (event == kModifiers)
            modifiers = Byte() & 7;
        else if (event == kSeek)
            player->GotoFrame(Byte() & 7);
        else if (event == kCancel)
            player->CancelCapture(Byte() & 1);
        else if (event == kZoom)
            player->ZoomF(Byte() & 1 ? SPlayer::kZoomIn : SPlayer::kZoomOut, nullptr);
        else if (event == kPicture)
            player->Picture();
        else if (event == kBlink)
            player->CursorTick();
        else
            player->Tick();
    }

    NativePlayerWnd* player = nullptr;
    const U8* at;
    const U8* end;
    int modifiers = 0;
    std::string copied;
};

void Feed(NativePlayerWnd* player, const U8* data, size_t size, size_t block)
{
    for (size_t at = 0; at < size; at += block)
        player->Feed(data + at, block < size - at ? block : size - at);
    player->EndOfData();
}

// The same for every movie: 8 ticks, keys and clicks along the diagonal or the middle.
void PlayUsual(NativePlayerWnd* player, U8 mode)
{
    for (int tick = 0; tick < 8; ++tick) {
        player->Tick();
        const S32 x = 8 + tick * 6, y = mode & 16 ? 32 : x;
        const SPOINT pt = {x, y};
        player->scene.HitTest(&pt);
        player->MouseMove(x, y, 0);
        player->MouseDown(x, y);
        player->HandleKeyDown(mode & 32 ? 18 : 13 + tick, mode >> 7);
        tick & 1 ? player->MouseMove(64 - x, y, 1) : player->MouseUp(x, y);
        CheckFields(*player);
    }
}

} // namespace

// The first byte chooses how the rest is cut and drawn, so that one input is always one run. Where
// an E stands in place of the movie's first letter, what follows it up to a zero byte is events for
// the movie behind it, and little room for fields can be chosen too.
extern "C" int LLVMFuzzerTestOneInput(const U8* data, size_t size)
{
    if (size < 1)
        return 0;
    const U8 mode = data[0];
    const bool hasEvents = size > 1 && data[1] == 'E';
    const U8 *end = data + size, *events = data + 1 + hasEvents;
    const U8* movie = hasEvents ? std::find(events, end, 0) : events;
    EventPlayer eventPlayer(events, movie);
    movie += hasEvents && movie < end;
    gLimits = SLimits();
    if (hasEvents && (mode & 32))
        gLimits.textFields = kFewFields, gLimits.textFieldBytes = kFewBytes;
    SetHeadlessClock(0);
    NativePlayerWnd player(64, 64);
    player.SetQuality(mode & 3);
    if (mode & 4)
        player.OverrideBackground({0, 0, 0, 0});
    const size_t rest = static_cast<size_t>(end - movie);
    Feed(&player, movie, rest, mode & 8 ? 7 : rest);
    if (hasEvents)
        eventPlayer.Play(&player);
    else
        PlayUsual(&player, mode);
    player.CancelCapture(mode & 64);
    player.GotoFrame(3);
    player.Tick();
    player.GotoFrame(0);
    player.Picture();
    CheckFields(player);
    return 0;
}
