// Plain bytes without any frame around them, for pipes.
#include "tools/vexel/output_file.h"
#include "tools/vexel/picture_sink.h"
#include "tools/vexel/pixel_bytes.h"

#include <algorithm>
#include <vector>

namespace {

// One row as it is written; returns the end of it. What is no word of 32 bits is written as it is
// stored, words with the low byte first.
U8* PutRow(const CBitBuffer& picture, S32 y, U8* to)
{
    const U8* row = picture.RowAddr(y);
    if (picture.Format() == kPixel32)
        return PutRgba(picture.Row32(y), picture.Width(), to);
    if (picture.Format() == kPixel8)
        return std::copy_n(row, picture.Width(), to);
    const U16* words = reinterpret_cast<const U16*>(row);
    for (S32 i = 0; i < picture.Width(); i++) {
        *to++ = static_cast<U8>(words[i]);
        *to++ = static_cast<U8>(words[i] >> 8);
    }
    return to;
}

// Rows from the top, without padding; 32-bit pixels as R, G, B, A.
class RawSink : public PictureSink {
public:
    explicit RawSink(const OutputName& name) : path(name.For(0)) {}

    bool Begin(const PictureForm& form) override
    {
        row.resize(static_cast<size_t>(form.width) * 4);
        return file.Open(path) || Fail(path, file.error);
    }
    bool Add(const CBitBuffer& picture, int) override;
    bool Finish() override { return file.Commit() || Fail(path, file.error); }

private:
    std::string path;
    OutputFile file;
    std::vector<U8> row;
};

bool RawSink::Add(const CBitBuffer& picture, int)
{
    bool good = true;
    for (S32 y = 0; y < picture.Height() && good; y++) {
        const U8* end = PutRow(picture, y, row.data());
        good = file.Write({row.data(), static_cast<size_t>(end - row.data())});
    }
    return (good && file.Flush()) || Fail(path, file.error);
}

} // namespace

std::unique_ptr<PictureSink> MakeRawSink(const OutputName& output)
{
    return std::make_unique<RawSink>(output);
}
