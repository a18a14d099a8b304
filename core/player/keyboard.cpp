// The keyboard: keys that buttons wait for, then the keyboard focus.
#include "core/display/button_records.h"
#include "core/player/player.h"

namespace {

enum Key {
    kKeyLeft = 1,
    kKeyRight = 2,
    kKeyEnter = 13,
    kKeyUp = 14,
    kKeyDown = 15,
    kKeyTab = 18,
    kKeySpace = 32,
};
constexpr int kShift = 0x01;

void CopyFocus(const SButton& from, SButton* to)
{
    to->object.Set(from.object.Get());
    to->bounds = from.bounds;
}

// Queues what the button does at a key: its first block for it, no other.
bool QueueKeyOf(SObject* button, int key)
{
    DisplayList* scene = button->display;
    ButtonConditions conditions(button->character);
    SButtonCondition condition;
    while (scene->tagsLeft > 0 && conditions.Next(&condition)) {
        scene->tagsLeft--;
        if (condition.Key() != key)
            continue;
        scene->QueueButtonBlock(button, condition.actions);
        return true;
    }
    return false;
}

// The same for every button below `parent`, from the lowest up; one that is merely out of view
// hears its key, one that is hidden does not.
bool QueueKeyBelow(SObject* parent, int key)
{
    bool queued = false;
    for (SObject* obj = parent->bottomChild; obj != nullptr; obj = obj->above) {
        if (!obj->visible)
            continue;
        if (obj->character->type == kCharButton)
            queued = QueueKeyOf(obj, key) || queued;
        queued = QueueKeyBelow(obj, key) || queued;
    }
    return queued;
}

// Presses the button; if that makes it go, the focus goes on.
void EnterFocus(SPlayer* player)
{
    SRECT bounds;
    player->ButtonEnter();
    if (!player->ButtonFind(player->buttonFocus.object.Get(), &bounds))
        player->ButtonTabNext();
}

// What the arrows, Enter and Space do while the highlight shows where they act, and all keys below
// the characters are taken then.
int FocusKeyDown(SPlayer* player, int key)
{
    if (!player->buttonFocus.object || player->focusText ||
        RectIsEmpty(&player->scene.tabFocusRect) || key < kKeyLeft || key > kKeySpace)
        return 0;
    CopyFocus(player->buttonFocus, &player->savedFocus);
    switch (key) {
    case kKeyLeft:
        player->ButtonGoDirection(kDirLeft);
        break;
    case kKeyRight:
        player->ButtonGoDirection(kDirRight);
        break;
    case kKeyUp:
        player->ButtonGoDirection(kDirUp);
        break;
    case kKeyDown:
        player->ButtonGoDirection(kDirDown);
        break;
    case kKeyEnter:
    case kKeySpace:
        EnterFocus(player);
        break;
    default:
        break;
    }
    return 1;
}

} // namespace

// All blocks are queued before the first runs, for a block may remove buttons, or move the one that
// has the focus.
int SPlayer::HandleKeyDown(int key, int modifiers)
{
    if (!BeginInput())
        return 0;
    if (key > 0 && QueueKeyBelow(&scene.root, key)) {
        DoActions();
        FollowFocus();
        UpdateScreen();
        return 1;
    }
    if (TabKeyDown(key, modifiers)) {
        FollowFocus();
        UpdateScreen();
        return 1;
    }
    return TextKeyDown(key, modifiers);
}

// No key does anything when it is let go.
int SPlayer::HandleKeyUp(int, int)
{
    return 0;
}

int SPlayer::TabKeyDown(int key, int modifiers)
{
    if (key != kKeyTab)
        return FocusKeyDown(this, key);
    if (!buttonFocus.object && !focusText)
        CopyFocus(savedFocus, &buttonFocus);
    CopyFocus(buttonFocus, &savedFocus);
    if (modifiers & kShift)
        ButtonTabPrevious();
    else
        ButtonTabNext();
    return buttonFocus.object ? 1 : 0;
}
