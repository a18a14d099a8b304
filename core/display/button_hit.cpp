// Where buttons are: the hit areas that their records describe.
#include "core/display/button_records.h"
#include "core/display/display_list.h"
#include "core/player/limits.h"
#include "core/stream/script_player.h"

namespace {
// Only what has a shape of its own makes a hit area.
SCharacter* HitArea(const SCharacter* button, const SButtonRecord& record)
{
    if (!(record.flags & SButtonRecord::kHit) || record.id >= kIdFirstReserved)
        return nullptr;
    SCharacter* ch = button->player->FindCharacter(record.id);
    const bool hasShape =
        ch && (ch->type == kCharShape || ch->type == kCharText || ch->type == kCharMorphShape);
    return hasShape ? ch : nullptr;
}

// Walks the records of a button while the budget lasts.
bool NextWithin(U32* budget, ButtonRecords* records, SButtonRecord* record)
{
    if (*budget == 0)
        return false;
    --*budget;
    return records->Next(record);
}
} // namespace

void GetDeviceMatrix(const SObject* obj, MATRIX* mat)
{
    if (obj->parent)
        GetDeviceMatrix(obj->parent, mat);
    else
        *mat = obj->display->camera;
    MatrixConcat(&obj->xform.mat, mat, mat);
}

void SObject::HitButton(SObject*& hit, STransform placed, const SPOINT* pt)
{
    if (!visible)
        return;
    placed.Concat(&xform);
    const U8 type = character ? character->type : U8(kCharNone);
    if ((type == kCharEditText && FieldContains(&placed.mat, pt)) ||
        (type == kCharButton && ButtonContains(&placed, pt)))
        hit = this;
    for (SObject* child = bottomChild; child;) {
        if (child->IsClip()) {
            child = child->HitClipper(&placed, pt);
            continue;
        }
        child->HitButton(hit, placed, pt);
        child = child->above;
    }
}

bool SObject::ButtonContains(const STransform* placed, const SPOINT* pt)
{
    ButtonRecords records(character);
    SButtonRecord record;
    while (NextWithin(&display->recordsLeft, &records, &record)) {
        STransform areaPlaced = *placed;
        MatrixConcat(&record.mat, &placed->mat, &areaPlaced.mat);
        SCharacter* area = HitArea(character, record);
        if (area && AreaContains(area, &areaPlaced, pt))
            return true;
    }
    return false;
}

// Asks an object that is nowhere in the tree, so that nothing of the picture notices. Its colours
// are there to be switched on and off only.
bool SObject::AreaContains(SCharacter* area, const STransform* placed, const SPOINT* pt)
{
    SObject standIn = {};
    standIn.display = display;
    standIn.character = area;
    standIn.CalcDevBounds(&placed->mat);
    if (RectIsEmpty(&standIn.devBounds) || !RectPointIn(&standIn.devBounds, pt))
        return false;
    display->hitOnly = true;
    standIn.BuildEdges(placed);
    display->hitOnly = false;
    const bool inside = standIn.EdgesContain(pt);
    standIn.FreeCache();
    return inside;
}

void SObject::CalcButtonBounds(SRECT* r, U32* budget)
{
    RectSetEmpty(r);
    if (!character || character->type != kCharButton)
        return;
    MATRIX toDevice;
    GetDeviceMatrix(this, &toDevice);
    U32 all = gLimits.buttonRecords;
    ButtonRecords records(character);
    SButtonRecord record;
    while (NextWithin(budget ? budget : &all, &records, &record)) {
        const SCharacter* area = HitArea(character, record);
        if (!area)
            continue;
        MATRIX mat;
        SRECT box;
        MatrixConcat(&record.mat, &toDevice, &mat);
        MatrixTransformRect(&mat, &area->bounds, &box);
        RectUnion(r, &box, r);
    }
}
