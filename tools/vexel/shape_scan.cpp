#include "tools/vexel/shape_scan.h"

namespace {

class ShapeScanner {
public:
    ShapeScanner(SParser* parser, ShapeKind kind)
        : reader(*parser), values(kind == ShapeKind::kMorph ? 2 : 1),
          colorBytes(kind == ShapeKind::kPlain ? 3 : 4)
    {
    }

    void ReadStyles();
    void ReadRecords();

    ShapeCounts counts;

private:
    U32 ReadCount();
    void SkipFill();
    bool ReadStyleChange();
    void ReadEdge();

    SParser& reader;
    S32 values; // of each style: two in a morph shape
    S32 colorBytes;
    S32 fillBits = 0;
    S32 lineBits = 0;
};

U32 ShapeScanner::ReadCount()
{
    const U32 count = reader.GetByte();
    return count == 0xFF ? reader.GetWord() : count;
}

void ShapeScanner::SkipFill()
{
    const U8 type = reader.GetByte();
    const bool gradient = type & 0x10;
    const bool bitmap = !gradient && (type & 0x40);
    if (bitmap)
        reader.GetWord();
    MATRIX m;
    for (S32 i = 0; i < values && (gradient || bitmap); i++)
        reader.GetMatrix(&m);
    if (gradient)
        reader.Skip(reader.GetByte() * values * (1 + colorBytes));
    else if (!bitmap)
        reader.Skip(values * colorBytes);
}

// A count that the data does not hold ends with the data.
void ShapeScanner::ReadStyles()
{
    for (U32 n = ReadCount(); n > 0 && reader.pos < reader.limit; n--) {
        SkipFill();
        counts.fills++;
    }
    for (U32 n = ReadCount(); n > 0 && reader.pos < reader.limit; n--) {
        reader.Skip(values * (2 + colorBytes));
        counts.lines++;
    }
    reader.InitBits();
    fillBits = static_cast<S32>(reader.GetBits(4));
    lineBits = static_cast<S32>(reader.GetBits(4));
}

// False at the end of the shape. Beyond the data zeros are read, which is that end.
bool ShapeScanner::ReadStyleChange()
{
    const U32 flags = reader.GetBits(5);
    if (flags & 0x01) {
        const S32 width = static_cast<S32>(reader.GetBits(5));
        reader.GetBits(width);
        reader.GetBits(width);
    }
    if (flags & 0x02)
        reader.GetBits(fillBits);
    if (flags & 0x04)
        reader.GetBits(fillBits);
    if (flags & 0x08)
        reader.GetBits(lineBits);
    if (flags & 0x10)
        ReadStyles();
    return flags != 0;
}

void ShapeScanner::ReadEdge()
{
    counts.edges++;
    const bool straight = reader.GetBits(1);
    const S32 width = static_cast<S32>(reader.GetBits(4)) + 2;
    int numbers = 4;
    if (straight) {
        const bool general = reader.GetBits(1);
        numbers = general ? 2 : 1;
        if (!general)
            reader.GetBits(1); // vertical or horizontal
    }
    while (numbers-- > 0)
        reader.GetBits(width);
}

void ShapeScanner::ReadRecords()
{
    for (;;) {
        if (reader.GetBits(1))
            ReadEdge();
        else if (!ReadStyleChange())
            return;
    }
}

} // namespace

ShapeCounts ScanShape(SParser* reader, ShapeKind kind)
{
    ShapeScanner scanner(reader, kind);
    scanner.ReadStyles();
    scanner.ReadRecords();
    return scanner.counts;
}
