#include "core/player/save_focus.h"

#include "core/display/edit_text.h"
#include "core/player/player.h"

// Only what had the focus before the outermost frame counts: objects come and go in those inside.
void SaveFocus::Save()
{
    if (nesting++ > 0)
        return;
    Remember(splayer->buttonFocus.object.Get(), &button);
    RememberText(splayer->focusText.Get());
    shown = !RectIsEmpty(&splayer->scene.tabFocusRect);
}

void SaveFocus::Clear()
{
    if (nesting == 0 || --nesting > 0)
        return;
    if (button.levels > 0 && !splayer->buttonFocus.object)
        RestoreButton(Follow(button));
    if (text.levels > 0 && !splayer->focusText)
        RestoreText(Follow(text));
    Forget();
}

void SaveFocus::Forget()
{
    button.levels = 0;
    text.levels = 0;
}

// The highlight comes back only where there was one.
void SaveFocus::RestoreButton(SObject* obj)
{
    if (obj == nullptr)
        return;
    if (shown) {
        splayer->ButtonFocusSet(obj);
        return;
    }
    splayer->buttonFocus.object.Set(obj);
    obj->CalcButtonBounds(&splayer->buttonFocus.bounds);
}

void SaveFocus::RememberText(const SObject* obj)
{
    Remember(obj, &text);
    if (obj == nullptr || obj->editText == nullptr)
        return;
    anchor = obj->editText->Anchor();
    caret = obj->editText->Caret();
    scroll = obj->editText->Scroll();
    selecting = obj->editText->Selecting();
}

void SaveFocus::RestoreText(SObject* obj)
{
    splayer->focusText.Set(obj);
    if (obj == nullptr || obj->editText == nullptr)
        return;
    obj->editText->Resume(anchor, caret, selecting);
    obj->editText->SetScroll(scroll);
}

void SaveFocus::Remember(const SObject* obj, SPath* path) const
{
    path->levels = 0;
    if (obj == nullptr || obj->nesting > kMaxDepth)
        return;
    path->id = obj->character->tag;
    path->type = obj->character->type;
    path->levels = obj->nesting;
    for (int i = path->levels - 1; i >= 0; i--, obj = obj->parent)
        path->depth[i] = obj->depth;
}

SObject* SaveFocus::Follow(const SPath& path) const
{
    SObject* obj = &splayer->scene.root;
    for (int i = 0; i < path.levels && obj != nullptr; i++)
        obj = splayer->scene.FindChild(obj, path.depth[i]);
    if (obj == nullptr || obj->character->tag != path.id || obj->character->type != path.type)
        return nullptr;
    return obj;
}
