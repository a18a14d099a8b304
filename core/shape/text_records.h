// STextRecords: the records of a static text, one glyph at a time.
#pragma once

#include "core/shape/font.h"
#include "core/stream/parser.h"

class ScriptPlayer;
struct SObject;
struct STransform;

// Walks the body of a static text from its matrix to its last record. The caller asks for records
// until the end and finds in the fields what holds for the glyph just read. Every record costs a
// byte or a glyph, so that a caller who counts them knows how long a walk can get.
class STextRecords : public SParser {
public:
    enum ERecord { kEnd, kStyle, kGlyph };

    MATRIX mat;                  // text space to character space
    SFont font;                  // none at first, and after an id that is no font
    SRGB color = {0, 0, 0, 255}; // as in the movie
    S32 height = 0;              // of the em, text space
    SPOINT pen = {0, 0};         // where the glyph stands, text space
    U32 glyph = 0;               // index into the font, which may not have it

    // `text` is a character of type kCharText; fonts are looked up in its movie.
    explicit STextRecords(const SCharacter* text);

    // Reads a style, which is applied, or a glyph. kEnd at the end of the text or of its data.
    ERecord Next();
    // Text height and pen: the em square of 1024 units to text space.
    MATRIX GlyphMatrix() const;

private:
    ERecord ReadStyle(U32 flags);
    ERecord ReadGlyph();

    ScriptPlayer* player;
    bool alpha; // colours carry an alpha byte
    S32 glyphBits;
    S32 advanceBits;
    U32 glyphsLeft = 0; // of the run that is being read
    S32 advance = 0;    // moves the pen before the next record
};

// Builds the edges and colours of a static text, each glyph by the winding rule. `placed` includes
// the object's own transform. Ends early when the display list's budget of records or its pool of
// colours is exhausted.
void BuildTextEdges(SObject* obj, const STransform* placed);
