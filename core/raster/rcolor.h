// RColor: a paint source, and the procedures that turn it into pixels.
#pragma once

#include "core/geom/matrix.h"
#include "core/raster/bitmap_core.h"
#include "core/raster/color.h"

class CRaster;
struct RChannelMaps;
struct RColor;
struct SCharacter;

enum RColorType : U8 { kColorSolid = 0, kColorBitmap = 1, kColorGradient = 2, kColorClip = 3 };

// Fill type bytes as they stand in a movie.
enum RFillType : U8 {
    kFillLinear = 0x10,
    kFillRadial = 0x12,
    kFillTiled = 0x40,
    kFillClipped = 0x41,
};

// Paints the span x0..x1 (x1 exclusive, pixels of the raster's current row, inside its area).
using RDrawSlabProc = void (*)(RColor* color, S32 x0, S32 x1);
// Computes the span into dst[0 .. x1-x0), or blends it over what is there: see RColor.
using RBuildSlabProc = void (*)(RColor* color, S32 x0, S32 x1, RGBI* dst);

// Samples n pixels of a bitmap colour from x in the raster's current row, untransformed but for a
// palette.
using RBitmapRowProc = void (*)(const RColor* color, S32 x, S32 n, RGBI* dst);
using RBitmapWordsProc = void (*)(const RColor* color, S32 x, S32 n, U32* dst);

// A place in an image, 16.16 pixels, that may be far outside.
struct RWidePoint {
    S64 x;
    S64 y;
};

constexpr int kRampEntries = 257;

// A colour of one object's style table. Objects keep theirs on a list through nextColor and
// allocate them from the display list's colour pool; the raster keeps those that are on at the
// current x on its active stack through nextActive. A zeroed record needs SetUp before any other
// use.
struct RColor {
    CRaster* raster;    // where it draws
    RColor* nextActive; // link of the raster's colour stack
    RColor* nextColor;  // link of the owner's list
    U32 order;          // layering: object layer in the high 16 bits, style number in the low 16
    RColor* clipColor;  // it shows only where this clip colour is on; null when unclipped
    U8 transparent;     // it may let what lies below show through
    U8 visible;         // on flag, or the winding count modulo 256; non-zero means on the stack
    U8 colorType;       // RColorType
    U8 cached;          // BuildCache has run
    U8 skipped;         // nothing to draw: a clip colour, or a cache that could not be built

    RDrawSlabProc drawSlabProc;   // writes an opaque span to the output; never null after SetUp
    RBuildSlabProc buildSlabProc; // fills a buffer (opaque), or blends over it (transparent)

    RGBI rgb;     // the solid value, premultiplied
    U32 rgbPixel; // the same packed for the output, set when the colour joins a paint

    U32 pixKey;      // y << 16 | (x & 0xFFFF) of the last pixel computed singly for anti-aliasing
    U8 pixValid;     // pixKey and pixValue hold something
    RGBI pixValue;   // that pixel's colour
    U32 spanRow;     // the raster's row serial that the following three belong to
    U32 rowNumber;   // how many colours the raster had met in that row before this one
    U32 lastBelow;   // the stack that this colour was last seen on, in that row ...
    U32 lastStack;   // ... and the two together; 0: none yet
    U8 flatRow;      // every pixel of the row's painted part has one colour ...
    Lanes flatValue; // ... this one

    U8 gradientType;    // kFillRadial, or anything else with 0x10 for linear
    MATRIX gradientMat; // gradient square to shape
    GradColorRamp ramp; // stops, colour transform applied
    MATRIX gradientInv; // device point << 8 to gradient square << 8
    U32* builtRamp; // kRampEntries premultiplied pixels a << 24 | r << 16 | g << 8 | b; null: draws
                    // nothing. A bitmap colour with a transform keeps its palette or maps here

    SBitmapCore* bitmap;          // pixels of a bitmap fill; their useCount counts bitmapHeld
    SCharacter* bitmapCharacter;  // whose pixels they are; counted as a user of the record
    U8 bitmapType;                // kFillTiled, kFillClipped
    U8 bitmapHeld;                // the pixels count this colour as a user
    U8 bitmapUnscaled;            // drawn at its own size: pixels are copied ...
    SPOINT bitmapOrigin;          // ... the image's first one to this pixel of the output
    ColorTransform cxform;        // the instance's transform, for a bitmap fill
    MATRIX bitmapMat;             // bitmap pixels to shape
    MATRIX bitmapInv;             // device point << 16 to bitmap pixels << 16: a to d ...
    RWidePoint bitmapStart;       // ... and the translation, which needs more than 32 bits far out
    const U32* bitmapPalette;     // 256 premultiplied words of a colour-mapped image, transformed
    RChannelMaps* maps;           // the transform for other images; null: none
    RBitmapRowProc bitmapRow;     // the loop that samples; null: there is nothing to sample
    RBitmapWordsProc bitmapWords; // the same for words a << 24 | r << 16 | g << 8 | b

    // Attaches the raster (may be null: such a colour is never drawn) and clears the links, the
    // flags and the cache; the kind becomes solid and the procedures do nothing.
    void SetUp(CRaster* r);
    // Builds what the kind needs and chooses the procedures. Without memory the colour draws
    // nothing.
    void BuildCache();
    // Gives back what BuildCache took. Safe to call on a colour that is not cached.
    void FreeCache();
};

// A clip colour that is always on: it marks a mask that has no enclosing mask.
RColor* ClipMarker();

// One pixel of a colour at x and the raster's current row. The table is indexed by RColorType.
using RPixelProc = void (*)(RColor* color, S32 x, RGBI* dst);
void CalcSolidPixel(RColor* color, S32 x, RGBI* dst);
void CalcBitmapPixel(RColor* color, S32 x, RGBI* dst);
void CalcGradientPixel(RColor* color, S32 x, RGBI* dst);

// Premultiplied rows: src over dst, n pixels.
void CompositeRGB(const RGBI* src, RGBI* dst, int n);
// One premultiplied colour over a row of n pixels.
void CompositeRGBSolid(const RGBI* c, RGBI* dst, int n);

// Builds the tables shared by all colours. Every CRaster calls it; later calls do nothing.
void BuildRenderTables();
// Its part for bitmaps.
void BuildBitmapTables();
