// Boxes of objects that are no shapes: the sides of a rectangle as edges.
#include "core/shape/character_parser.h"
#include "core/shape/edge_piece.h"

namespace {
constexpr int kMaxHalvings = 16;

struct SSide {
    RColor* color;
    DisplayList* display;
    REdge** list;
};

void AddSide(const SSide& side, CURVE line, int halvings)
{
    if (line.anchor1.y == line.anchor2.y)
        return;
    const bool mayHalve = halvings < kMaxHalvings;
    const EPieceFate fate = PieceFits(line) ? kPieceKeep : GuardPiece(&line, mayHalve);
    if (fate == kPieceSplit) {
        CURVE first, second;
        CurveDivide(&line, &first, &second);
        AddSide(side, first, halvings + 1);
        AddSide(side, second, halvings + 1);
    } else if (fate == kPieceKeep) {
        if (REdge* e = PushEdge(side.display, side.list, line)) {
            e->fillRule = kRuleEvenOdd;
            e->color1 = side.color;
        }
    }
}
} // namespace

void AddRectEdge(const SPOINT* p1, const SPOINT* p2, RColor* color, DisplayList* display,
                 REdge** list)
{
    CURVE line;
    CurveSetLine(p1, p2, &line);
    AddSide({color, display, list}, line, 0);
}

void AddRect(const SRECT* r, const MATRIX* mat, RColor* color, DisplayList* display, REdge** list)
{
    if (RectIsEmpty(r))
        return;
    SPOINT corners[4] = {
        {r->xmin, r->ymin}, {r->xmax, r->ymin}, {r->xmax, r->ymax}, {r->xmin, r->ymax}};
    for (SPOINT& p : corners)
        MatrixTransformPoint(mat, &p, &p);
    for (int i = 0; i < 4; ++i)
        AddRectEdge(&corners[i], &corners[(i + 1) & 3], color, display, list);
}
