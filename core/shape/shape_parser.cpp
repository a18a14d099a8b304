// The pen: edge records, style changes and the selectors.
#include "core/shape/shape_parser.h"

namespace {
// No edge record and no load of the quick reader reaches farther than this from `pos`.
constexpr S32 kEdgeBytes = 16;

// The bits of one edge record, taken from a 64-bit window over the data. It needs kEdgeBytes
// readable bytes from the parser's position on, and leaves the parser as if GetBits had been used.
class QuickBits {
public:
    explicit QuickBits(const SParser& p) : data(p.script), at(S64(p.pos) * 8 - p.bitPos)
    {
        Refill();
    }

    // n = 1 to 17.
    U32 Take(S32 n)
    {
        const U64 bits = Shift(n);
        return U32(bits >> (64 - n));
    }
    S32 TakeSigned(S32 n)
    {
        const U64 bits = Shift(n);
        return S32(S64(bits) >> (64 - n));
    }

    void Store(SParser* p) const
    {
        p->pos = S32((at + 7) >> 3);
        p->bitPos = S32(-at & 7);
        p->bitBuf = p->bitPos == 0 ? 0 : data[p->pos - 1] & (0xFFu >> (8 - p->bitPos));
    }

private:
    U64 Shift(S32 n)
    {
        if (left < n)
            Refill();
        const U64 bits = window;
        window <<= n;
        left -= n;
        at += n;
        return bits;
    }
    void Refill()
    {
        const U8* p = data + (at >> 3);
        const U32 high = U32(p[0]) << 24 | U32(p[1]) << 16 | U32(p[2]) << 8 | p[3];
        const U32 low = U32(p[4]) << 24 | U32(p[5]) << 16 | U32(p[6]) << 8 | p[7];
        window = (U64(high) << 32 | low) << (at & 7);
        left = S32(64 - (at & 7));
    }

    const U8* data;
    S64 at;     // next bit, from the start of the data
    U64 window; // the next bits, the first one on top
    S32 left;   // valid bits of the window
};

// The same through the reader itself, which knows where the data ends.
class PlainBits {
public:
    explicit PlainBits(SParser* p) : parser(p) {}
    U32 Take(S32 n) { return parser->GetBits(n); }
    S32 TakeSigned(S32 n) { return parser->GetSBits(n); }

private:
    SParser* parser;
};

} // namespace

SShapeParser::SShapeParser(ScriptPlayer* dictionary, DisplayList* list, RColor** colors,
                           const U8* data, S32 dataLen, S32 start, const MATRIX* matrix)
    : player(dictionary), display(list), colorList(colors), mat(*matrix), fillIndex(inlineFills),
      lineIndex(inlineLines)
{
    Attach(data, dataLen, start);
    inlineFills[0] = nullptr;
    inlineLines[0] = {nullptr, 0};
    SetPen({0, 0});
}

void SShapeParser::SetPen(const SPOINT& pen)
{
    curPt = pen;
    MatrixTransformPoint(&mat, &curPt, &curPtX);
}

SLineStyle SShapeParser::LineStyle(U32 selector) const
{
    return selector <= nLines ? lineIndex[selector] : SLineStyle{nullptr, 0};
}

void SShapeParser::SetOnlyFill(RColor* color)
{
    fillIndex = inlineFills;
    inlineFills[0] = nullptr;
    inlineFills[1] = color;
    nFills = 1;
}

void SShapeParser::GetSelectorWidths()
{
    styleless = true;
    ReadSelectorWidths();
}

void SShapeParser::ReadSelectorWidths()
{
    InitBits();
    nFillBits = S32(GetBits(4));
    nLineBits = S32(GetBits(4));
}

// What follows the edge flag. The control point of a straight edge is left to the caller.
template <typename Bits> void SShapeParser::ReadEdge(Bits& bits, CURVE* c)
{
    const bool straight = bits.Take(1) != 0;
    const S32 n = S32(bits.Take(4)) + 2;
    c->anchor1 = curPt;
    if (!straight) {
        curPt.x += bits.TakeSigned(n);
        curPt.y += bits.TakeSigned(n);
        c->control = curPt;
    }
    const bool general = !straight || bits.Take(1) != 0;
    const bool vertical = !general && bits.Take(1) != 0;
    if (!vertical)
        curPt.x += bits.TakeSigned(n);
    if (general || vertical)
        curPt.y += bits.TakeSigned(n);
    c->anchor2 = curPt;
    c->isLine = straight;
}

int SShapeParser::ReadRecord(CURVE* c)
{
    if (limit - pos >= kEdgeBytes) {
        QuickBits bits(*this);
        if (bits.Take(1) != 0) {
            ReadEdge(bits, c);
            bits.Store(this);
            return 0;
        }
    }
    if (GetBits(1) == 0)
        return ReadStyleChange();
    PlainBits bits(this);
    ReadEdge(bits, c);
    return 0;
}

int SShapeParser::GetEdge(CURVE* c)
{
    const int flags = ReadRecord(c);
    if (flags != 0)
        return flags;
    c->anchor1 = curPtX;
    if (!c->isLine)
        MatrixTransformPoint(&mat, &c->control, &c->control);
    MatrixTransformPoint(&mat, &curPt, &curPtX);
    c->anchor2 = curPtX;
    if (c->isLine)
        PointMiddle(&c->anchor1, &c->anchor2, &c->control);
    return 0;
}

int SShapeParser::GetShapeEdge(CURVE* c)
{
    const int flags = ReadRecord(c);
    if (flags == 0 && c->isLine)
        PointMiddle(&c->anchor1, &c->anchor2, &c->control);
    return flags;
}

// The selectors have the widths of the old style block even where a new one follows.
int SShapeParser::ReadStyleChange()
{
    const int flags = int(GetBits(5));
    if (flags == 0)
        return kEndOfShape;
    if (flags & kMoveTo) {
        const S32 n = S32(GetBits(5));
        const S32 x = GetSBits(n);
        const S32 y = GetSBits(n);
        SetPen({x, y});
    }
    if (flags & kFill0)
        fill0 = GetBits(nFillBits);
    if (flags & kFill1)
        fill1 = GetBits(nFillBits);
    if (flags & kLineStyle)
        line = GetBits(nLineBits);
    if (flags & kNewStyles) {
        layer += nLines + nFills;
        if (styleless || !ReadStyleBlock())
            return kEndOfShape;
    }
    return flags;
}
