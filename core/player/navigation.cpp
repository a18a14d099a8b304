// Arrow keys: from the focused button to the best one in a direction.
#include "core/player/player.h"

namespace {

bool IsButtonUp(const SRECT* cur, const SRECT* cand)
{
    return cand->ymax < cur->ymax || cand->ymax < cur->ymin;
}

bool IsButtonDown(const SRECT* cur, const SRECT* cand)
{
    return cand->ymin > cur->ymax || cand->ymax > cur->ymax;
}

bool IsButtonRight(const SRECT* cur, const SRECT* cand)
{
    return cand->xmin > cur->xmax || cand->xmax > cur->xmax;
}

bool IsButtonLeft(const SRECT* cur, const SRECT* cand)
{
    return cand->xmax < cur->xmin || cand->xmin < cur->xmin;
}

// By SDirection. They are no mirror images of each other: a button that lies inside the current one
// is above it and nothing else, one around it below, right and left of it.
constexpr bool (*kLiesIn[])(const SRECT*, const SRECT*) = {IsButtonUp, IsButtonDown, IsButtonRight,
                                                           IsButtonLeft};

// The two overlap in the axis across the movement.
bool IsButtonAligned(const SRECT* cur, int dir, const SRECT* cand)
{
    if (dir == kDirUp || dir == kDirDown)
        return cur->xmax >= cand->xmin && cur->xmin <= cand->xmax;
    return cur->ymax >= cand->ymin && cur->ymin <= cand->ymax;
}

// Not wholly beyond the current one. Only the way down makes a difference there.
bool IsButtonOverlapped(const SRECT* cur, int dir, const SRECT* cand)
{
    return dir != kDirDown || cand->ymin <= cur->ymax;
}

bool ButtonCloser(const SRECT* cur, const SRECT* a, const SRECT* b)
{
    return RectDistance(cur, a) < RectDistance(cur, b);
}

// Whether candidate `a` is better than the best so far.
bool ButtonChoose(const SRECT* cur, int dir, const SRECT* a, const SRECT* best)
{
    const bool alignedA = IsButtonAligned(cur, dir, a);
    const bool alignedBest = IsButtonAligned(cur, dir, best);
    if (alignedA != alignedBest)
        return alignedA;
    const bool overlappedA = IsButtonOverlapped(cur, dir, a);
    if (!alignedA && overlappedA != IsButtonOverlapped(cur, dir, best))
        return overlappedA;
    return ButtonCloser(cur, a, best);
}

void ClearOrder(ButtonOrder* order)
{
    for (ObjectRef& candidate : order->candidates)
        candidate.Set(nullptr);
}

// A button may be a candidate for several directions.
void Consider(const SRECT* cur, const ButtonWeight& button, ButtonOrder* order)
{
    for (int dir = kDirUp; dir <= kDirLeft; dir++) {
        if (!kLiesIn[dir](cur, &button.bounds))
            continue;
        ObjectRef& best = order->candidates[dir];
        if (best && !ButtonChoose(cur, dir, &button.bounds, &order->bounds[dir]))
            continue;
        best.Set(button.object);
        order->bounds[dir] = button.bounds;
    }
}

} // namespace

void SPlayer::ButtonGoDirection(int direction)
{
    SObject* current = buttonFocus.object.Get();
    if (current == nullptr || direction < kDirUp || direction > kDirLeft)
        return;
    SRECT bounds;
    current->CalcButtonBounds(&bounds);
    ButtonFocusRemove();
    ClearOrder(&buttonOrder);
    BuildButtonTabMap();
    for (const ButtonWeight& button : tabMap) {
        if (button.object != current)
            Consider(&bounds, button, &buttonOrder);
    }
    RemoveAllButtons();
    SObject* next = buttonOrder.candidates[direction].Get();
    ButtonFocusSet(next != nullptr ? next : current);
}
