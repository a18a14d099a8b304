// The mouse: from the shell's events to buttons, drags and panning.
#include "core/display/edit_text.h"
#include "core/player/player.h"

namespace {

bool IsTextField(const SObject* obj)
{
    return obj != nullptr && obj->character->type == kCharEditText;
}

// The tracked button goes idle; a pressed one is dragged off before it is released outside.
bool LetGoOfButton(DisplayList* scene)
{
    const bool handled = scene->SetButton(nullptr, 0);
    return (scene->button != nullptr && scene->SetButton(nullptr, 0)) || handled;
}

} // namespace

// A press that began in a text field selects there until it ends.
bool SPlayer::SelectsText() const
{
    const SObject* obj = focusText.Get();
    return obj != nullptr && obj->editText != nullptr && obj->editText->Selecting();
}

void SPlayer::DragSelection(const SPOINT* pt, int mouseDown)
{
    const SPOINT dev = scene.ToDevice(*pt);
    focusText.Get()->EditTextMouse(&dev, mouseDown);
    if (!mouseDown)
        NotePointer(pt, 0);
    UpdateScreen();
}

// Keeps text fields from the buttons' business: returns what is under the pointer for them. A press
// moves the keyboard focus, but not while it is that of a button, which is to hear of its end.
SObject* SPlayer::PointAtText(SObject* hit, const SPOINT* pt, int mouseDown, bool* changed)
{
    const SObject* focused = focusText.Get();
    const bool overText = scene.textUnderMouse;
    scene.textUnderMouse = IsTextField(hit);
    if (overText != IsTextField(hit))
        UpdateCursor();
    if (IsTextField(hit) && mouseDown && !SelectsText() && !PressesButton()) {
        const SPOINT dev = scene.ToDevice(*pt);
        SetFocusText(hit);
        hit->EditTextMouse(&dev, 1);
        *changed = true;
    } else if (!IsTextField(hit) && mouseDown && focused != nullptr &&
               (!focused->editText || !focused->editText->Record().Has(kFieldKeepFocus))) {
        SetFocusText(nullptr);
    }
    *changed = *changed || focused != focusText.Get();
    return IsTextField(hit) ? nullptr : hit;
}

// Every event has its own share of work, for its actions may go to other frames.
bool SPlayer::BeginInput()
{
    if (!loaded || actionDepth > 0)
        return false;
    scene.ResetBudget();
    return true;
}

void SPlayer::MouseDown(S32 x, S32 y)
{
    if (!BeginInput())
        return;
    const SPOINT pt = {x, y};
    DoButton(&pt, 1, 1);
    if (!loaded || scene.button != nullptr || SelectsText() || !IsZoomed())
        return;
    panning = 1;
    panStart = pt;
}

void SPlayer::MouseMove(S32 x, S32 y, int buttonDown)
{
    if (!BeginInput())
        return;
    const SPOINT pt = {x, y};
    if (drag.object)
        UpdateDragObject(&pt);
    if (SelectsText())
        DragSelection(&pt, 1);
    else if (panning)
        PanTo(&pt);
    else
        DoButton(&pt, buttonDown, 1);
}

// The release that ends panning is no click.
void SPlayer::MouseUp(S32 x, S32 y)
{
    if (!BeginInput())
        return;
    const SPOINT pt = {x, y};
    if (SelectsText())
        DragSelection(&pt, 0);
    else if (panning)
        panning = 0;
    else
        DoButton(&pt, 0, 1);
}

void SPlayer::CancelCapture(int release)
{
    panning = 0;
    if (!BeginInput())
        return;
    if (SelectsText())
        DragSelection(&mousePt, 0);
    mouseState = release ? -1 : 0;
    if (release && LetGoOfButton(&scene)) {
        DoActions();
        UpdateScreen();
    }
    UpdateCursor();
}

int SPlayer::GetCursorType() const
{
    if (scene.textUnderMouse)
        return 3;
    if (scene.button != nullptr)
        return 2;
    return IsZoomed() ? 1 : 0;
}

// The view follows the hand.
void SPlayer::PanTo(const SPOINT* pt)
{
    Pan(Saturate32(static_cast<S64>(panStart.x) - pt->x),
        Saturate32(static_cast<S64>(panStart.y) - pt->y));
    panStart = *pt;
}

bool SPlayer::MouseIsHeld() const
{
    return drag.object || panning || SelectsText() || PressesButton();
}

bool SPlayer::PressesButton() const
{
    return scene.button != nullptr && scene.buttonState >= 3;
}

// Buttons that move under a pointer at rest change their state.
void SPlayer::RetestButtons()
{
    if (mouseState < 0 || MouseIsHeld())
        return;
    const SPOINT pt = mousePt;
    DoButton(&pt, mouseState != 0, 0);
}

// What a button makes of the pointer hides the keyboard's highlight, even in a tick.
void SPlayer::DoButton(const SPOINT* pt, int mouseDown, int updateScreen)
{
    bool changed = false;
    SObject* hit = PointAtText(scene.HitButton(pt), pt, mouseDown, &changed);
    if (scene.SetButton(hit, mouseDown)) {
        HideFocus();
        FinishButton(updateScreen);
    } else if (changed && updateScreen) {
        UpdateScreen();
    }
    if (loaded)
        NotePointer(pt, mouseDown);
}

void SPlayer::DoButton(SObject* obj, int mouseDown, int updateScreen)
{
    if (scene.SetButton(obj, mouseDown))
        FinishButton(updateScreen);
}

void SPlayer::FinishButton(int updateScreen)
{
    DoActions();
    if (updateScreen)
        UpdateScreen();
    UpdateCursor();
}

void SPlayer::NotePointer(const SPOINT* pt, int mouseDown)
{
    const SPOINT dev = scene.ToDevice(*pt);
    if (!RectPointIn(&scene.devViewRect, &dev)) {
        mouseState = -1;
        return;
    }
    mouseState = mouseDown ? 1 : 0;
    mousePt = *pt;
}

// A button does not heed a press unless the pointer was over it, so that comes first. The actions
// of either half may remove the button.
void SPlayer::ButtonEnter()
{
    ObjectRef obj(&scene, buttonFocus.object.Get());
    if (!obj || obj.Get()->character->type != kCharButton)
        return;
    if (scene.button != obj.Get()) {
        LetGoOfButton(&scene);
        if (obj)
            scene.DoButtonStateTransition(obj.Get(), 0);
    }
    if (obj)
        DoButton(obj.Get(), 1, 1);
    if (obj)
        DoButton(obj.Get(), 0, 1);
}
