// The order in which Tab visits the buttons.
#include <algorithm>

#include "core/player/limits.h"
#include "core/player/player.h"

namespace {

constexpr S32 kNoFocus = -1; // weight of the current focus when there is none

// Whether a button can be seen at all, by its bounds.
bool MeetsView(const SRECT& bounds, const DisplayList& scene)
{
    return !RectIsEmpty(&bounds) && RectTestIntersect(&bounds, &scene.devViewRect);
}

void CollectButtons(SPlayer* player, SObject* parent)
{
    for (SObject* obj = parent->bottomChild; obj != nullptr; obj = obj->above) {
        if (!obj->visible)
            continue;
        SRECT bounds;
        RectSetEmpty(&bounds);
        if (obj->character->type == kCharButton)
            obj->CalcButtonBounds(&bounds, &player->scene.recordsLeft);
        if (MeetsView(bounds, player->scene))
            player->AddButton(obj, &bounds);
        CollectButtons(player, obj);
    }
}

const ButtonWeight* FindEntry(const GrowBuffer<ButtonWeight>& map, const SObject* obj)
{
    for (size_t i = 0; i < map.size(); i++) {
        if (map[i].object == obj)
            return &map[i];
    }
    return nullptr;
}

// Where Tab goes on from. The weight of a button may be -1 as well, and then it counts as none.
S32 WeightOfFocus(SPlayer* player)
{
    if (player->focusText)
        return CalcButtonWeight(&player->focusText.Get()->devBounds);
    if (!player->buttonFocus.object)
        return kNoFocus;
    const ButtonWeight* entry = FindEntry(player->tabMap, player->buttonFocus.object.Get());
    return entry != nullptr ? entry->weight : CalcButtonWeight(&player->buttonFocus.bounds);
}

} // namespace

S32 CalcButtonWeight(const SRECT* r)
{
    return 2 * r->ymin + r->xmin / 3;
}

void ButtonSort(ButtonWeight* list, int last)
{
    std::stable_sort(list, list + (last + 1), [](const ButtonWeight& a, const ButtonWeight& b) {
        return a.weight < b.weight;
    });
}

// Depth first and from the lowest up, then by weight: the lower one of equals comes first. All the
// buttons share the records that a hit test may read.
void SPlayer::BuildButtonTabMap()
{
    RemoveAllButtons();
    scene.recordsLeft = gLimits.shapeRecords;
    CollectButtons(this, &scene.root);
    ButtonSort(tabMap.data(), NumButtons() - 1);
}

int SPlayer::NumButtons() const
{
    return static_cast<int>(tabMap.size());
}

// Without memory it is not reached by keys.
void SPlayer::AddButton(SObject* obj, const SRECT* bounds)
{
    tabMap.Push({obj, *bounds, CalcButtonWeight(bounds)});
}

void SPlayer::RemoveAllButtons()
{
    tabMap.Release();
}

bool SPlayer::ButtonFind(SObject* obj, SRECT* bounds)
{
    if (obj == nullptr)
        return false;
    BuildButtonTabMap();
    const ButtonWeight* entry = FindEntry(tabMap, obj);
    if (entry != nullptr)
        *bounds = entry->bounds;
    RemoveAllButtons();
    return entry != nullptr;
}

// The first one beyond the focus; after the last comes the first.
void SPlayer::ButtonTabNext()
{
    BuildButtonTabMap();
    const S32 weight = WeightOfFocus(this);
    const ButtonWeight* next = std::find_if(
        tabMap.begin(), tabMap.end(), [&](const ButtonWeight& b) { return b.weight > weight; });
    if (next == tabMap.end())
        next = tabMap.begin();
    ButtonFocusSet(NumButtons() > 0 ? next->object : nullptr);
    RemoveAllButtons();
}

// The last one before the focus; before the first comes the last.
void SPlayer::ButtonTabPrevious()
{
    BuildButtonTabMap();
    const S32 weight = WeightOfFocus(this);
    const int count = NumButtons();
    int i = count - 1;
    while (i >= 0 && tabMap[size_t(i)].weight >= weight)
        i--;
    if (i < 0 || weight == kNoFocus)
        i = count - 1;
    ButtonFocusSet(count > 0 ? tabMap[size_t(i)].object : nullptr);
    RemoveAllButtons();
}
