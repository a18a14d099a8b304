// The keyboard focus on a button, and its highlight.
#include "core/player/player.h"

namespace {

bool CanBeSeen(const SObject* obj)
{
    while (obj != nullptr && obj->visible)
        obj = obj->parent;
    return obj == nullptr;
}

void ForgetButton(SButton* button)
{
    button->object.Set(nullptr);
    RectSetEmpty(&button->bounds);
}

} // namespace

// A highlight that stays where it is is not painted again.
void SPlayer::ShowFocus(const SRECT* r)
{
    if (RectEqual(r, &scene.tabFocusRect, 0))
        return;
    scene.InvalidateRect(&scene.tabFocusRect);
    scene.tabFocusRect = *r;
    scene.InvalidateRect(r);
}

void SPlayer::HideFocus()
{
    SRECT none;
    RectSetEmpty(&none);
    ShowFocus(&none);
}

void SPlayer::ButtonFocusSet(SObject* obj)
{
    if (obj == nullptr) {
        ButtonFocusRemove();
        return;
    }
    SetFocusText(nullptr);
    buttonFocus.object.Set(obj);
    obj->CalcButtonBounds(&buttonFocus.bounds);
    ShowFocus(&buttonFocus.bounds);
}

void SPlayer::ButtonFocusRemove()
{
    ForgetButton(&buttonFocus);
    HideFocus();
}

// The highlight goes where its button went, under whatever camera, and out with a button that is
// hidden; that one keeps the focus, so that Tab goes on from it.
void SPlayer::FollowFocus()
{
    SObject* obj = buttonFocus.object.Get();
    if (obj == nullptr || RectIsEmpty(&scene.tabFocusRect))
        return;
    obj->CalcButtonBounds(&buttonFocus.bounds);
    if (CanBeSeen(obj))
        ShowFocus(&buttonFocus.bounds);
    else
        HideFocus();
}

// References to the object end by themselves; what is left is what can be seen of the focus.
void SPlayer::BeforeRemoval(SObject* obj)
{
    if (obj != nullptr && obj == buttonFocus.object.Get())
        ButtonFocusRemove();
}

// Not where the pointer is: the next movie may come up under it.
void SPlayer::ForgetInput()
{
    drag.object.Set(nullptr);
    focusText.Set(nullptr);
    ButtonFocusRemove();
    ForgetButton(&savedFocus);
    focus.Forget();
    RemoveAllButtons();
    scene.textUnderMouse = 0;
    panning = 0;
}
