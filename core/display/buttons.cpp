// Buttons: the images of their states, the transitions between these, and what a transition sets
// off.
#include "core/display/button_records.h"
#include "core/display/display_list.h"
#include "core/player/player.h"
#include "core/sound/sound_info.h"
#include "core/stream/sounds.h"
#include "core/stream/tags.h"

namespace {
enum SButtonState { kIdle = 1, kOver = 2, kDown = 3, kOutside = 4 };

// What a state shows. A pressed button that the pointer has left shows its over image.
constexpr U8 kShown[] = {0, SButtonRecord::kUp, SButtonRecord::kOver, SButtonRecord::kDown,
                         SButtonRecord::kOver};

enum STransition {
    kIdleToOver,
    kOverToIdle,
    kOverToDown,
    kClick,
    kDownToOutside,
    kOutsideToDown,
    kReleaseOutside,
    kIdleToDown, // these two in menus only
    kDownToIdle,
    kTransitions,
    kNoTransition = -1
};

// By transition: the state it leads to, and its place in the sound record (-1: silent).
constexpr U8 kTarget[] = {kOver, kIdle, kDown, kOver, kOutside, kDown, kIdle, kDown, kIdle};
constexpr int kSlot[] = {1, 0, 2, 3, -1, -1, 0, 1, 0};
static_assert(sizeof kTarget == kTransitions);

bool IsButton(const SObject* obj)
{
    return obj && obj->character && obj->character->type == kCharButton;
}

// A press must begin on a push button: under a pointer that was pressed elsewhere it idles.
STransition FromIdle(bool down, bool menu)
{
    if (!down)
        return kIdleToOver;
    return menu ? kIdleToDown : kNoTransition;
}

// What the pointer does to the tracked button, `inside` it or not.
STransition FromTracked(int state, bool inside, bool down, bool menu)
{
    switch (state) {
    case kOver:
        if (!inside)
            return kOverToIdle;
        return down ? kOverToDown : kNoTransition;
    case kDown:
        if (!inside)
            return menu ? kDownToIdle : kDownToOutside;
        return down ? kNoTransition : kClick;
    case kOutside:
        if (inside)
            return kOutsideToDown;
        return down ? kNoTransition : kReleaseOutside;
    default:
        return kNoTransition;
    }
}

struct SoundRecord : SParser {};
} // namespace

// What is shown before and after stays as it is. The rest goes before anything comes, so that no
// depth holds two images. Images go at any price; those that no tags are left for do not come until
// the next change of state.
void DisplayList::UpdateButton(SObject* obj, int newState)
{
    if (!IsButton(obj) || obj->state == newState || newState < 0 || newState > kOutside)
        return;
    const U8 before = kShown[obj->state], after = kShown[newState];
    SButtonRecord record;
    ButtonRecords old(obj->character), fresh(obj->character);
    while (before && old.Next(&record)) {
        ChargeTags(1);
        if ((record.flags & before) && !(record.flags & after))
            RemoveObject(obj, U16(record.layer + obj->depth));
    }
    while (tagsLeft > 0 && fresh.Next(&record)) {
        ChargeTags(1);
        if ((record.flags & after) && !(record.flags & before))
            PlaceButtonChild(obj, record);
    }
    obj->state = U8(newState);
}

void DisplayList::PlaceButtonChild(SObject* obj, const SButtonRecord& record)
{
    PlaceInfo info;
    info.Clear();
    info.flags = PlaceInfo::kCharacter | PlaceInfo::kMatrix | PlaceInfo::kCxform;
    info.character =
        record.id < kIdFirstReserved ? obj->character->player->FindCharacter(record.id) : nullptr;
    info.depth = U16(record.layer + obj->depth);
    info.mat = record.mat;
    info.cxform = record.cxform;
    if (info.character)
        PlaceObject(obj, &info);
}

// A button that the pointer leaves takes its images along, and perhaps `hit` with them.
bool DisplayList::SetButton(SObject* hit, int mouseDown)
{
    const ObjectRef under(this, IsButton(hit) ? hit : nullptr);
    if (!StepButton(under.Get(), mouseDown != 0))
        return false;
    if (!button && under)
        StepButton(under.Get(), mouseDown != 0);
    return true;
}

bool DisplayList::StepButton(SObject* under, bool down)
{
    if (!button)
        TrackButton(nullptr);
    SObject* obj = button ? button : under;
    if (!obj)
        return false;
    const bool menu = obj->character->button.trackAsMenu != 0;
    const STransition code =
        button ? FromTracked(buttonState, obj == under, down, menu) : FromIdle(down, menu);
    if (code != kNoTransition)
        ChangeButton(obj, code);
    return code != kNoTransition;
}

void DisplayList::DoButtonStateTransition(SObject* obj, int code)
{
    if (IsButton(obj) && code >= 0 && code < kTransitions)
        ChangeButton(obj, code);
}

void DisplayList::ChangeButton(SObject* obj, int code)
{
    buttonState = kTarget[code];
    UpdateButton(obj, buttonState);
    DoButtonAction(obj, code);
    TrackButton(buttonState == kIdle ? nullptr : obj);
}

void DisplayList::TrackButton(SObject* obj)
{
    ForgetIdentity();
    button = obj;
    if (!obj) {
        buttonState = kIdle;
        return;
    }
    RetainCharacter(obj->character);
    buttonIdentity = {obj->parent, obj->parent->serial, obj->character, obj->depth, obj->ratio};
}

void DisplayList::ForgetIdentity()
{
    ReleaseCharacter(buttonIdentity.character);
    buttonIdentity = {};
}

void DisplayList::DoButtonAction(SObject* obj, int code)
{
    if (!IsButton(obj) || code < 0 || code >= kTransitions)
        return;
    SButtonCondition block;
    ButtonConditions chain(obj->character);
    while (tagsLeft > 0 && chain.Next(&block)) {
        ChargeTags(1);
        if (block.On(code))
            QueueButtonBlock(obj, block.actions);
    }
    if (code == kClick && obj->character->tagCode == kTagDefineButton)
        QueueClick(obj);
    if (kSlot[code] >= 0)
        StartButtonSound(obj, kSlot[code]);
}

// A button of the first form has one block, behind its records.
void DisplayList::QueueClick(const SObject* obj)
{
    ButtonRecords records(obj->character);
    SButtonRecord passed;
    while (records.Next(&passed)) {
    }
    if (records.Actions())
        QueueButtonBlock(obj, records.Actions());
}

void DisplayList::QueueButtonBlock(const SObject* obj, const U8* block)
{
    const SCharacter* ch = obj->character;
    actions.PushAction(block, ch->data, ch->data + ch->dataLen, ch->player->sharedScript,
                       obj->thread);
}

void DisplayList::StartButtonSound(SObject* obj, int slot)
{
    const SButtonPart& sounds = obj->character->button;
    SoundRecord record;
    record.Attach(sounds.sounds, sounds.soundsLen);
    for (int i = 0; i < slot; i++) {
        if (record.GetWord() != 0)
            GetSoundInfo(&record, nullptr);
    }
    const U16 id = record.GetWord();
    if (id == 0)
        return;
    const bool silent = splayer && !splayer->soundOn;
    const SCharacter* sound = obj->character->player->FindCharacter(id);
    ChargeTags(StartEventSound(silent ? nullptr : soundMix, sound, soundTag, &record));
}
