// Boxes of objects that are no shapes: the sides of a rectangle as edges and as strokes.
#include "core/shape/character_parser.h"
#include "core/shape/stroker.h"

void AddRectEdge(const SPOINT* p1, const SPOINT* p2, RColor* color, DisplayList* display,
                 REdge** list, SStroker* stroker)
{
    CURVE line;
    CurveSetLine(p1, p2, &line);
    if (color) {
        CEdgeCutter cutter(display, list);
        cutter.fillRule = kRuleEvenOdd;
        cutter.color1 = color;
        cutter.AddCurve(&line);
    }
    if (stroker)
        stroker->AddStrokeCurve(&line);
}

void AddRect(const SRECT* r, const MATRIX* mat, RColor* color, DisplayList* display, REdge** list,
             SStroker* stroker)
{
    if (RectIsEmpty(r))
        return;
    SPOINT corners[4] = {
        {r->xmin, r->ymin}, {r->xmax, r->ymin}, {r->xmax, r->ymax}, {r->xmin, r->ymax}};
    for (SPOINT& p : corners)
        MatrixTransformPoint(mat, &p, &p);
    for (int i = 0; i < 4; ++i)
        AddRectEdge(&corners[i], &corners[(i + 1) & 3], color, display, list, stroker);
}
