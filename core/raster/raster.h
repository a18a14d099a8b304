// CRaster: edges in, pixels out, one scanline at a time.
//
// A paint is: Attach (buffer and area), BeginPaint, AddEdges for each object from the lowest up,
// PaintBits, Flush. Edges and colours stay their owners' and must live until PaintBits returns.
// With anti-aliasing all edge coordinates are quarter pixels; the area is in pixels always. One
// thread at a time; no operation fails loudly: what cannot be allocated is not painted.
#pragma once

#include "core/geom/chunk_alloc.h"
#include "core/geom/grow_buffer.h"
#include "core/geom/rect.h"
#include "core/raster/bit_buffer.h"
#include "core/raster/edge.h"
#include "core/raster/rcolor.h"

struct RActiveEdge;

// An entry of the active list: the edge, and its x beside it for sorting.
struct RActiveRef {
    S32 x;
    U32 place; // in the list, while it is being sorted as a whole
    RActiveEdge* edge;
};

// A piece of one sub-scanline: everything from where the last piece ended up to xmax shows one
// stack.
struct RSpan {
    S32 xmax;  // exclusive, quarter pixels
    U32 stack; // index of an RStack of the row; 0: nothing
};

// The colours that count in a span, as a top colour over another stack of the same pixel row. Equal
// stacks are one entry, and stacks with the same lower part share it.
struct RStack {
    RColor* color; // the top
    Lanes solid;   // their blend, when isSolid
    Lanes pixel;   // the last pixel computed singly, at pixelX
    U32 below;     // index of the stack under it; 0: nothing
    S32 pixelX;    // -1: none yet
    U16 count;     // colours in all
    bool isSolid;  // all of them have one colour in the whole row
    bool covers;   // the lowest is opaque
};

// A place of the table in which a row's stacks are found by top colour and stack below.
struct RStackSlot {
    U32 row;   // the row serial that it was filled in; another one: free
    U32 stack; // index of the RStack
};

// One horizontal run of a pixel row: where its four sub-scanlines show the same four stacks.
struct RRun {
    S32 xmin; // quarter pixels, half-open
    S32 xmax;
    int kinds;      // different stacks among the four, 1 to 4
    U32 stacks[4];  // `kinds` of them ...
    U32 weights[4]; // ... and in how many sub-scanlines each is seen
    bool isSolid;   // every stack is solid, so that the run has one colour
    Lanes sum;      // the sum over the four sub-scanlines, when isSolid
};

class CRaster {
public:
    // Anti-aliased coordinates of a larger area would leave the 16 bits of an edge.
    static constexpr S32 kMaxAntialiasSide = 8000;

    CRaster();
    ~CRaster();
    CRaster(const CRaster&) = delete;
    CRaster& operator=(const CRaster&) = delete;

    // Binds the output and the pixels to paint: `r` half-open (xmax, ymax exclusive) and clipped to
    // the buffer. `antialias` says in which units the edges come.
    void Attach(CBitBuffer* output, const SRECT* r, int antialias);
    // Pixels that shine through where nothing opaque is painted; null (the start): white. Not
    // owned: they must outlive the paints or be taken away.
    void SetBackgroundBits(CBitBuffer* background);
    // The output keeps alpha for this paint: it begins cleared, and what is not covered stays
    // transparent.
    void UseAlphaChannel();
    // The attached output has pixels.
    bool BitsValid() const;

    // The area being painted, device units (quarter pixels when anti-aliased), half-open.
    const SRECT* AreaDev() const { return &areaDev; }
    int Antialias() const { return antialias; }
    S32 CurrentRow() const { return rowY; }

    void BeginPaint();
    // Adds an object above all that was added before. Colours get their layer and `clip` as their
    // clip colour; ClipMarker() marks an outermost mask.
    void AddEdges(REdge* edges, RColor* colors, RColor* clip);
    // The edges alone: colours and layer stay as they are.
    void AddEdges(REdge* edges);
    void PaintBits();
    void Flush();

    // Fills the area with a colour at once, under everything that is painted later.
    void FillBackground(SRGB color);

    // Makes pixel row y the current one. With error diffusion it takes over what the row made
    // current before it left for it.
    void SetYCoord(S32 y);

    // Returns empty blocks of the pools, and what a crowded row took, to the system.
    void FreeEmpties();

    // At most about so many ramps from now on.
    void SetRampBudget(U32 ramps);
    // Memory for one built ramp (kRampEntries words); null when exhausted.
    U32* AllocRamp();
    void FreeRamp(U32* ramp);

    // Tells the units of edges that are built before any paint; Attach sets them as well.
    void SetAntialias(int on) { antialias = on; }
    // Images that are not drawn at their own size are smoothed, in colours built from now on.
    void SetSmoothing(int on) { smoothing = on; }
    int Smoothing() const { return smoothing; }

    // --- for the paint procedures of the colours ---
    const CRow& Row() const { return outRow; }
    const CPixelOps* Ops() const { return ops; }

private:
    static constexpr S32 kPiece = 256;        // pixels that a span buffer holds
    static constexpr int kMaxCollected = 255; // colours that one span can blend
    // Stacks of one pixel row; a row with more stays unpainted.
    static constexpr size_t kMaxStacks = 1u << 19;

    void PrepareErrors();
    size_t ErrorRowLength() const;

    // active.cpp: edges entering, moving and leaving
    void AddActive();
    bool SetUpActive(const REdge* edge);
    void SortActive();
    void SortAll();
    void FreeActive();

    // crossing.cpp: the colour stack
    void PaintActive();
    void CrossEdge(const RActiveEdge* edge);
    void DoEdgeEdgeRule(const RActiveEdge* edge);
    void DoEdgeEvenOddRule(RColor* c, S32 x);
    void DoEdgeWindingRule(RColor* c, S32 x, S8 dir);
    void SwitchOn(RColor* c, S32 x, U8 count);
    void SwitchOff(RColor* c, S32 x);
    RColor** FindPlace(RColor* c, S32 x);
    void ClearStack();
    bool ClipIsOn(const RColor* c);
    int Collect();
    void PaintSlab(S32 x);

    // slab.cpp: spans of whole pixels
    void DrawCollected(S32 x0, S32 x1, RColor* const* colors, int count);
    void CompositeSlab(S32 x0, S32 x1, RColor* const* colors, int count);
    void ReadBackground(S32 x, S32 n, RGBI* dst) const;
    bool BackgroundCovers() const;
    void BlendToOutput(S32 x, const RGBI* src, S32 n);

    // aa_spans.cpp: sub-scanlines as spans of stacks
    void BeginRow();
    void RecordSpan(S32 xmax);
    void PushSpan(S32 xmax, U32 stack);
    void EndSubline();
    U32 InternStack(int count);
    U32 FindStack(RColor* top, U32 below);
    U32 LookUpStack(RColor* top, U32 below);
    RStackSlot* FindSlot(const RColor* top, U32 below);
    bool GrowIndex();
    U32 NewStack(RColor* top, U32 below);
    void EnterRow(RColor* c);

    // aa_runs.cpp: spans merged into runs, runs into pixels
    void PaintAARuns();
    void MakeRun(RRun* run, const RSpan* const* at) const;
    void AddToRun(RRun* run, U32 stack) const;
    void PaintRun(const RRun& run);
    Lanes CalcColor(const RRun& run, S32 x);
    Lanes StackColor(U32 stack, S32 x);
    Lanes PixelColor(RColor* c, S32 x);
    void AddCoverage(S32 x, Lanes value);
    void EmitCoverage();
    void EmitPixel(S32 x, Lanes value);
    void EmitPixels(S32 x, const RGBI* src, S32 n, bool opaque);
    void FlushPixels();
    void PaintInterior(const RRun& run, S32 x0, S32 x1);
    void PaintFlat(Lanes value, S32 x0, S32 x1);
    void PaintMixed(const RRun& run, S32 x, S32 n);
    void BuildRunRows(const RRun& run, S32 x, S32 n);
    void BuildStackRow(U32 stack, S32 x, S32 n);
    void BuildPixelRow(RColor* c, S32 x, S32 n, RGBI* dst);
    void BlendPixelRow(RColor* c, RGBI* row, S32 n);
    void SumRows(const RRun& run, S32 n);

    CBitBuffer* output = nullptr;
    CBitBuffer* backgroundBits = nullptr;
    const CPixelOps* ops;
    CRow outRow;               // the current one
    GrowBuffer<S16> errorRows; // two of CRow::errors, in turns; empty: the output diffuses nothing
    bool oddErrors = false;    // the second one is the current row's
    S32 rowY = 0;              // current pixel row
    int antialias = 0;
    int smoothing = 0;
    bool alphaOutput = false;
    SRECT area = {};    // painted pixels, half-open
    SRECT areaDev = {}; // the same in device units

    U32 layer = 0;           // of the next object
    bool layersFull = false; // no further object fits above
    U64 work = 0;            // edge and stack steps of this paint ...
    U64 workLimit = 0;       // ... and where it ends: further rows stay unpainted
    S32 y = 0;               // current scanline, device units
    S32 paintX = 0;          // where the next span begins
    RColor* stackTop = nullptr;
    RColor* collected[kMaxCollected];

    GrowBuffer<REdge*> buckets;    // a list head per scanline of areaDev
    GrowBuffer<RActiveRef> active; // sorted by x once SortActive has run
    ChunkAlloc activeAlloc;
    ChunkAlloc rampAlloc;
    bool needsSort = false; // some edge entered, or crossed the one before it

    U32 rowSerial = 0; // of the pixel row whose spans are being recorded
    GrowBuffer<RSpan> sublines[4];
    GrowBuffer<RStack> stacks;         // entry 0 is the empty stack
    GrowBuffer<RStackSlot> stackIndex; // a power of two of places, at most half of them filled
    U32 rowColors = 0;                 // colours met in the row
    int lastCount = 0;                 // the span recorded last: its colours from the lowest up ...
    RColor* lastColors[kMaxCollected];
    U32 lastStacks[kMaxCollected]; // ... and the stacks that end with each
    bool rowLost = false;          // memory ran out: the row stays unpainted
    S32 coverX = 0;                // pixel being accumulated ...
    Lanes cover = 0;               // ... and its sum
    bool covering = false;
    S32 pendingX = 0; // finished pixels that wait to be written side by side
    S32 pendingCount = 0;
    bool pendingOpaque = true;
    RGBI pending[kPiece];
    RGBI piece[kPiece];
    RGBI rows[4][kPiece]; // of the stacks of a run whose sub-scanlines differ
};
