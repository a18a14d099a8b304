// SShapeParser: shape records into raster colours and device-space curves, one record at a time.
#pragma once

#include "core/geom/curve.h"
#include "core/geom/grow_buffer.h"
#include "core/geom/matrix.h"
#include "core/raster/raster.h"
#include "core/stream/parser.h"

class DisplayList;
class ScriptPlayer;

struct SLineStyle {
    RColor* color; // null: not stroked
    S32 thickness; // device units
};

// Reads the style block and the edge records of a shape, a morph shape's start list or a glyph. The
// caller asks for the styles once and then for records until the end, and looks colours up in
// `fillIndex` and `lineIndex` by the current selectors with Fill and LineStyle, which answer none
// for a selector beyond the table. Colours belong to `colorList`, not to the parser.
class SShapeParser : public SParser {
public:
    static constexpr int kEndOfShape = 0x80;
    enum RecordFlags : int {
        kMoveTo = 0x01,
        kFill0 = 0x02,
        kFill1 = 0x04,
        kLineStyle = 0x08,
        kNewStyles = 0x10,
    };

    ScriptPlayer* player;      // resolves bitmap ids; may be null
    CRaster* raster = nullptr; // the raster that colours are built for; null leaves them unbuilt
    DisplayList* display;      // owner of the colour pool
    RColor** colorList;        // every colour made is pushed on the front of this list
    MATRIX mat;                // shape to device
    ColorTransform cxform;     // of the instance; identity at first
    U16 ratio = 0;             // morph ratio, 0 = start shape
    U32 layer = 0;             // style numbers of the current block start after this
    U32 nLines = 0;
    U32 nFills = 0;
    RColor** fillIndex;    // nFills + 1 entries, the first null
    SLineStyle* lineIndex; // nLines + 1 entries, the first empty
    S32 nFillBits = 0;
    S32 nLineBits = 0;
    U32 line = 0; // current selectors
    U32 fill0 = 0;
    U32 fill1 = 0;
    bool getAlpha = false; // colours carry an alpha byte
    SPOINT curPt = {0, 0}; // pen, shape coordinates
    SPOINT curPtX;         // pen, device coordinates

    // Reads `dataLen` bytes at `data` from `start`. `list` is the head that colours are pushed on.
    // `player` may be null: bitmap ids then resolve to nothing.
    SShapeParser(ScriptPlayer* player, DisplayList* display, RColor** list, const U8* data,
                 S32 dataLen, S32 start, const MATRIX* mat);
    SShapeParser(const SShapeParser&) = delete;
    SShapeParser& operator=(const SShapeParser&) = delete;

    // Reads a style block, replacing the tables. False when memory or the data ran out: the shape
    // is given up.
    bool GetStyles();
    // The same for a morph style block, each pair interpolated at `ratio`.
    bool GetMorphStyles();
    // Begins a list without styles of its own, a glyph or a morph's end list: reads the two
    // selector widths alone. New styles in such a list end it.
    void GetSelectorWidths();
    // Reads one record: 0 for an edge, which fills `c`; kEndOfShape at the end; else the flags of a
    // style change, already applied.
    int GetEdge(CURVE* c);
    // The same with the edge in shape coordinates, as a straight one's control point the middle of
    // its anchors. `curPtX` does not follow it.
    int GetShapeEdge(CURVE* c);

    // The colour of a fill selector; null for 0 and for a selector beyond the table.
    RColor* Fill(U32 selector) const { return selector <= nFills ? fillIndex[selector] : nullptr; }
    SLineStyle LineStyle(U32 selector) const;
    // Makes a glyph's colour the only fill.
    void SetOnlyFill(RColor* color);

    // Finishes a colour whose kind and parameters are filled in: its inverse matrices and its
    // cache. Without a raster the colour stays as it is and is never drawn.
    void SetupColor(RColor* color);

protected:
    // Takes one record or style from the display list's budget; false when it is spent.
    bool SpendRecord();

private:
    static constexpr U32 kInlineStyles = 256;

    // shape_styles.cpp
    bool ReadStyleBlock();
    bool ReadFills();
    bool ReadLines();
    U32 ReadCount();
    bool CanHold(U32 styles) const;
    bool SizeFills(U32 count);
    bool SizeLines(U32 count);
    RColor* NewColor(U32 number);
    void ReadFill(RColor* color);
    void ReadGradient(RColor* color, U8 type);
    void ReadRamp(RColor* color);
    void ReadStop(U8* stopRatio, SRGB* stopColor);
    void ReadBitmapFill(RColor* color, U8 type);
    void ReadSolid(RColor* color);
    U16 ReadWidth();
    void ReadFillMatrix(MATRIX* m);

    // shape_parser.cpp
    template <typename Bits> void ReadEdge(Bits& bits, CURVE* c);
    int ReadRecord(CURVE* c);
    void ReadSelectorWidths();
    void SetPen(const SPOINT& pen);
    int ReadStyleChange();

    RWidePoint InvertFill(const MATRIX* fillMat, int shift, MATRIX* inverse) const;

    bool morphStyles = false; // styles are pairs, also where they are renewed inside the records
    bool styleless = false;   // a list that cannot renew its styles
    // The tables stay as they are until a count sizes them: clearing them would cost more than
    // reading a small shape.
    RColor* inlineFills[kInlineStyles];
    SLineStyle inlineLines[kInlineStyles];
    GrowBuffer<RColor*> heapFills; // in place of the inline tables when they are too small
    GrowBuffer<SLineStyle> heapLines;
};

// Makes a solid colour of a value from a movie, under the instance's transform, for objects whose
// colours stand in no style block, and pushes it on `list`. Null when the colour pool is exhausted.
RColor* CreateSolidColor(DisplayList* display, RColor** list, SRGB value,
                         const ColorTransform& cxform, U32 order);
