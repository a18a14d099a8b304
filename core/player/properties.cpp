// The properties of timelines and their objects, by index, as scripts read and write them.
#include "core/player/player.h"

#include <algorithm>

#include "core/player/numbers.h"
#include "core/player/object_matrix.h"
#include "core/stream/str.h"

namespace {

enum Property {
    kPropX,
    kPropY,
    kPropXScale, // percent
    kPropYScale,
    kPropFrame, // from 1
    kPropFrames,
    kPropAlpha, // percent
    kPropVisible,
    kPropWidth,
    kPropHeight,
    kPropRotation, // degrees
    kPropTarget,
    kPropFramesLoaded,
    kPropName,
    kPropDropTarget,
    kPropURL,
    kPropQuality,
    kPropFocusRect,
    kPropSoundBufferTime, // seconds
    kProperties
};

constexpr double kTwips = 20; // in a pixel

double Side(S32 min, S32 max)
{
    return static_cast<double>(static_cast<S64>(max) - min) / kTwips;
}

// A movie's frames count as they arrive, a sprite's are all there.
S32 FramesLoaded(const ScriptThread* thread)
{
    if (!thread->IsRoot() || thread->player->Complete())
        return thread->numFrames;
    return std::max(0, std::min(thread->player->numFramesComplete, thread->numFrames));
}

void SetAlpha(ColorTransform* cxform, double percent)
{
    cxform->alphaMul = static_cast<S16>(std::clamp(TruncateToInt(percent * 2.56), -0x8000, 0x7FFF));
    cxform->CalcFlags();
}

bool TakesOver(int index)
{
    return index == kPropX || index == kPropY || index == kPropXScale || index == kPropYScale ||
           index == kPropAlpha || index == kPropRotation;
}

} // namespace

double SPlayer::ObjectProperty(SObject* obj, int index)
{
    const MATRIX* mat = &obj->xform.mat;
    switch (index) {
    case kPropX:
        return mat->tx / kTwips;
    case kPropY:
        return mat->ty / kTwips;
    case kPropXScale:
        return MatrixScalePercent(mat, kAxisX);
    case kPropYScale:
        return MatrixScalePercent(mat, kAxisY);
    case kPropAlpha:
        return obj->xform.cxform.alphaMul * 100 / 256.0;
    case kPropVisible:
        return obj->visible;
    case kPropRotation:
        return MatrixRotation(mat);
    case kPropWidth:
    case kPropHeight: {
        SRECT box;
        GetBoundingBox(obj, &box);
        if (RectIsEmpty(&box))
            return 0;
        return index == kPropWidth ? Side(box.xmin, box.xmax) : Side(box.ymin, box.ymax);
    }
    default:
        return 0;
    }
}

double SPlayer::GetProperty(ScriptThread* thread, int index)
{
    if (!thread)
        return 0;
    switch (index) {
    case kPropFrame:
        return thread->curFrame + 1.0;
    case kPropFrames:
        return thread->numFrames;
    case kPropFramesLoaded:
        return FramesLoaded(thread);
    case kPropQuality:
        return !highQuality ? 0 : bestQuality ? 2 : 1;
    case kPropFocusRect:
        return scene.useFocusRect ? 1 : 0;
    case kPropSoundBufferTime:
        return soundBufferTime;
    default:
        return thread->rootObject ? ObjectProperty(thread->rootObject, index) : 0;
    }
}

void SPlayer::SetObjectProperty(SObject* obj, int index, double value)
{
    MATRIX* mat = &obj->xform.mat;
    obj->Modify();
    if (TakesOver(index))
        obj->puppet = 1;
    switch (index) {
    case kPropX:
        mat->tx = TruncateToInt(value * kTwips);
        break;
    case kPropY:
        mat->ty = TruncateToInt(value * kTwips);
        break;
    case kPropXScale:
        MatrixSetScalePercent(mat, kAxisX, value);
        break;
    case kPropYScale:
        MatrixSetScalePercent(mat, kAxisY, value);
        break;
    case kPropRotation:
        MatrixSetRotation(mat, value);
        break;
    case kPropAlpha:
        SetAlpha(&obj->xform.cxform, value);
        break;
    default:
        obj->visible = value != 0;
        break;
    }
}

void SPlayer::SetProperty(ScriptThread* thread, int index, double value)
{
    if (!thread)
        return;
    if (index == kPropQuality) {
        SetQuality(value == 0 ? 0 : value >= 1.5 ? 2 : 1);
    } else if (index == kPropFocusRect) {
        scene.useFocusRect = value != 0;
        scene.InvalidateRect(&scene.tabFocusRect);
    } else if (index == kPropSoundBufferTime) {
        soundBufferTime = TruncateToInt(value);
    } else if (thread->rootObject && (TakesOver(index) || index == kPropVisible)) {
        SetObjectProperty(thread->rootObject, index, value);
    }
}

static const char* OrEmpty(const char* text)
{
    return text ? text : "";
}

char* SPlayer::GetPropertyStr(ScriptThread* thread, int index)
{
    if (!thread || index < 0 || index >= kProperties)
        return CreateStr("");
    SObject* obj = thread->rootObject;
    switch (index) {
    case kPropTarget:
        return obj ? GetTargetPath(obj) : CreateStr("");
    case kPropName:
        return CreateStr(OrEmpty(obj ? obj->name : nullptr));
    case kPropDropTarget:
        return CreateStr(OrEmpty(obj ? obj->dropTarget : nullptr));
    case kPropURL:
        return CreateStr(OrEmpty(thread->player ? thread->player->sourceName : nullptr));
    default:
        return ConvertDoubleToString(GetProperty(thread, index));
    }
}

void SPlayer::SetPropertyStr(ScriptThread* thread, int index, const char* value)
{
    SObject* obj = thread ? thread->rootObject : nullptr;
    double number;
    if (index == kPropName && obj) {
        obj->SetName(value);
        obj->Modify();
    } else if (index != kPropName && ConvertStringToDouble(value, &number)) {
        SetProperty(thread, index, number);
    }
}
