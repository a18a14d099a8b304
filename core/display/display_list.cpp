#include "core/display/display_list.h"

#include <algorithm>

#include "core/player/limits.h"
#include "core/shape/character_parser.h"
#include "core/sound/sound_mix.h"
#include "core/stream/script_player.h"

namespace {
constexpr int kEdgesPerBlock = 600;
constexpr int kObjectsPerBlock = 32;
constexpr int kColorsPerBlock = 64;
constexpr SRGB kWhite = {255, 255, 255, 255};

// Blocks that hold `items` records.
size_t Blocks(U32 items, int perBlock)
{
    return (static_cast<size_t>(items) + static_cast<size_t>(perBlock) - 1) /
           static_cast<size_t>(perBlock);
}
} // namespace

DisplayList::DisplayList()
    : root{}, backgroundColor(kWhite), dirtyArea{}, dirtyList{}, soundTag(NewSoundTag()),
      edgeAlloc(sizeof(REdge), kEdgesPerBlock, 1, 0x22222222),
      objectAlloc(sizeof(SObject), kObjectsPerBlock, 1, 0x55555555),
      colorAlloc(sizeof(RColor), kColorsPerBlock, 1, 0x44444444),
      threadAlloc(sizeof(ScriptThread), 16, 1, 0x66666666)
{
    MatrixIdentity(&camera);
    cameraCxform.Clear();
    root.display = this;
    MatrixIdentity(&root.xform.mat);
    root.xform.cxform.Clear();
    RectSetEmpty(&root.devBounds);
    RectSetEmpty(&root.reservedRect);
    root.visible = 1;
    RectSetEmpty(&bitsDirty);
    RectSetEmpty(&devDirtyRgn);
    RectSetEmpty(&tabFocusRect);
    UpdateDevViewRect();
    ResetBudget();
}

DisplayList::~DisplayList()
{
    DropHeld();
    root.FreeChildren();
    ForgetIdentity();
    if (soundMix)
        soundMix->RemoveTagged(soundTag);
    while (threads) {
        ScriptThread* thread = threads;
        RemoveThread(thread);
        thread->display = nullptr;
    }
}

void DisplayList::ResetBudget()
{
    tagsLeft = gLimits.tagsPerDraw;
    recordsLeft = gLimits.shapeRecords;
    pixelsLeft = gLimits.decodedPixels;
    edgeAlloc.SetBudget(Blocks(gLimits.liveEdges, kEdgesPerBlock));
    objectAlloc.SetBudget(Blocks(gLimits.liveObjects, kObjectsPerBlock));
    colorAlloc.SetBudget(Blocks(gLimits.liveColors, kColorsPerBlock));
    raster.SetRampBudget(gLimits.liveRamps);
}

void DisplayList::UpdateDevViewRect()
{
    const bool valid = bits && bits->HasBits();
    const S32 scale = antialias ? 4 : 1;
    devViewRect = {0, (valid ? bits->Width() : 2000) * scale, 0,
                   (valid ? bits->Height() : 2000) * scale};
}

// Colours are built for an output: those built for another one, or for none, go.
void DisplayList::SetBits(CBitBuffer* buffer)
{
    bits = buffer;
    root.FreeCacheTree();
    UpdateDevViewRect();
    InvalidateRect(&devViewRect);
}

void DisplayList::SetBackgroundColor(SRGB color, int priority)
{
    if (priority <= backgroundPriority)
        return;
    backgroundPriority = priority;
    if (color == backgroundColor)
        return;
    backgroundColor = color;
    InvalidateRect(&devViewRect);
}

void DisplayList::Reset()
{
    if (backgroundPriority >= 2)
        return;
    backgroundColor = kWhite;
    backgroundPriority = 0;
    InvalidateRect(&devViewRect);
}

void DisplayList::CalcUpdate()
{
    if (!needCalcUpdate)
        return;
    root.CalcUpdate(&camera, false);
    needCalcUpdate = 0;
}

// A thread that is on the list already moves to the head.
void DisplayList::AddThread(ScriptThread* thread)
{
    UnlinkThread(thread);
    thread->nextThread = threads;
    if (threads)
        threads->prevThread = thread;
    threads = thread;
}

void DisplayList::RemoveThread(ScriptThread* thread)
{
    DropActions(thread);
    UnlinkThread(thread);
}

// A block that is running goes on without its timeline; a target that goes is one never chosen.
void DisplayList::DropActions(ScriptThread* thread)
{
    constexpr U32 kBlocksPerUnit = 8;
    U32 looked = actions.RemoveThread(thread);
    for (int i = 1; i <= calls.level; i++) {
        SCallLevel& level = calls.levels[i];
        if (level.target == thread) {
            level.target = nullptr;
            level.targetSet = false;
        }
        if (level.list)
            looked += level.list->RemoveThread(thread);
    }
    work += looked / kBlocksPerUnit;
}

void DisplayList::UnlinkThread(ScriptThread* thread)
{
    if (threads != thread && !thread->prevThread)
        return;
    if (threadCursor == thread)
        threadCursor = thread->nextThread;
    (thread->prevThread ? thread->prevThread->nextThread : threads) = thread->nextThread;
    if (thread->nextThread)
        thread->nextThread->prevThread = thread->prevThread;
    thread->nextThread = nullptr;
    thread->prevThread = nullptr;
}

void DisplayList::FreeEdges(REdge* edges)
{
    while (edges) {
        REdge* next = edges->next;
        edgeAlloc.Free(edges);
        edges = next;
    }
}

void DisplayList::FreeColors(RColor* colors)
{
    while (colors) {
        RColor* next = colors->nextColor;
        colors->FreeCache();
        ReleaseCharacter(colors->bitmapCharacter);
        colorAlloc.Free(colors);
        colors = next;
    }
}

void DisplayList::FreeCache()
{
    root.FreeCacheTree();
    edgeAlloc.FreeEmpties();
    objectAlloc.FreeEmpties();
    colorAlloc.FreeEmpties();
    threadAlloc.FreeEmpties();
    fields.FreeSpares();
    raster.FreeEmpties();
}

void DisplayList::ChargeTags(U32 tags)
{
    tagsLeft -= std::min(tagsLeft, tags);
}

// Lines of few bytes cost more than those bytes.
void DisplayList::ChargeText(U32 bytes, U32 lines)
{
    constexpr U32 kBytesPerUnit = 32, kLinesPerUnit = 4, kUnitsPerTag = 8;
    const U32 units = bytes / kBytesPerUnit + lines / kLinesPerUnit;
    work += units;
    ChargeTags(units / kUnitsPerTag);
}

// Allows a hit test its budgets.
void DisplayList::BeginHitTest()
{
    recordsLeft = gLimits.shapeRecords;
    pixelsLeft = gLimits.decodedPixels;
}

SPOINT DisplayList::ToDevice(const SPOINT& pixels) const
{
    const S64 scale = antialias ? 4 : 1;
    return {Saturate32(pixels.x * scale), Saturate32(pixels.y * scale)};
}

SObject* DisplayList::HitTest(const SPOINT* pt)
{
    const SPOINT device = ToDevice(*pt);
    BeginHitTest();
    SObject* hit = nullptr;
    root.HitTest(hit, {camera, cameraCxform}, &device);
    work += gLimits.shapeRecords - recordsLeft;
    return hit;
}

SObject* DisplayList::HitButton(const SPOINT* pt)
{
    const SPOINT device = ToDevice(*pt);
    BeginHitTest();
    SObject* hit = nullptr;
    if (RectPointIn(&devViewRect, &device))
        root.HitButton(hit, {camera, cameraCxform}, &device);
    return hit;
}
