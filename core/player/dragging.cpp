// Dragging: the object that a script lets the pointer move, and what it is dropped over.
#include "core/player/player.h"

#include <algorithm>

#include "core/geom/fixed.h"
#include "core/stream/str.h"

namespace {

// Pixels; a pointer farther out counts as being there. No picture reaches so far, and what scripts
// are likely to scale it by does not overflow.
constexpr S32 kFarthest = 1 << 15;

// The transform from the coordinates in which `obj` is placed to those of the scene.
void ParentToScene(const SObject* obj, MATRIX* mat)
{
    MatrixIdentity(mat);
    for (const SObject* p = obj->parent; p; p = p->parent)
        MatrixConcat(mat, &p->xform.mat, mat);
}

} // namespace

void SPlayer::StartDrag(ScriptThread* thread, bool lockCenter, const SRECT* bounds)
{
    SObject* obj = thread ? thread->rootObject : nullptr;
    if (!obj)
        return;
    drag.object.Set(obj);
    drag.lockCenter = lockCenter;
    drag.start = mousePt;
    drag.origin = {obj->xform.mat.tx, obj->xform.mat.ty};
    RectSetEmpty(&drag.bounds);
    if (!bounds || RectIsEmpty(bounds))
        return;
    RectSet(bounds->xmin, bounds->ymin, bounds->xmax, bounds->ymax, &drag.bounds);
    drag.bounds.xmin = std::max(drag.bounds.xmin, kRectEmpty + 1);
}

void SPlayer::EndDrag()
{
    UpdateDropTarget();
    drag.object.Set(nullptr);
    RectSetEmpty(&drag.bounds);
}

// From pixels to the coordinates in which the dragged object is placed.
SPOINT SPlayer::DragPoint(const SPOINT* pt) const
{
    const S32 unit = scene.antialias ? 4 : 1;
    SPOINT p = {std::clamp(pt->x, -kFarthest, kFarthest) * unit,
                std::clamp(pt->y, -kFarthest, kFarthest) * unit};
    MATRIX mat;
    MatrixInvert(&scene.camera, &mat);
    MatrixTransformPoint(&mat, &p, &p);
    ParentToScene(drag.object.Get(), &mat);
    MatrixInvert(&mat, &mat);
    MatrixTransformPoint(&mat, &p, &p);
    return p;
}

// Always from where the drag began: what leaves its bounds and comes back is held where it was.
void SPlayer::UpdateDragObject(const SPOINT* pt)
{
    SObject* obj = drag.object.Get();
    if (!obj)
        return;
    SPOINT p = DragPoint(pt);
    if (!drag.lockCenter) {
        const SPOINT start = DragPoint(&drag.start);
        p = {Saturate32(static_cast<S64>(drag.origin.x) + p.x - start.x),
             Saturate32(static_cast<S64>(drag.origin.y) + p.y - start.y)};
    }
    if (!RectIsEmpty(&drag.bounds)) {
        p.x = std::clamp(p.x, drag.bounds.xmin, drag.bounds.xmax);
        p.y = std::clamp(p.y, drag.bounds.ymin, drag.bounds.ymax);
    }
    obj->Modify();
    obj->puppet = 1;
    obj->xform.mat.tx = p.x;
    obj->xform.mat.ty = p.y;
    mousePt = *pt;
    UpdateDropTarget();
    CheckUpdate(); // no tick needs to come: the object follows the pointer at once
}

// The object must not be found under itself, so it is hidden for the test.
void SPlayer::UpdateDropTarget()
{
    SObject* obj = drag.object.Get();
    if (!obj)
        return;
    const U8 visible = obj->visible;
    obj->visible = 0;
    scene.CalcUpdate(); // what has moved since the last repaint is hit where it is now
    SObject* hit = scene.HitTest(&mousePt);
    obj->visible = visible;
    FreeStr(obj->dropTarget);
    obj->dropTarget = hit ? GetTargetPath(hit) : nullptr;
}
