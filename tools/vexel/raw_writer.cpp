// Plain bytes without any frame around them, for pipes.
#include "tools/vexel/output_file.h"
#include "tools/vexel/picture_sink.h"
#include "tools/vexel/pixel_bytes.h"

#include <vector>

namespace {

// R, G, B, A; rows from the top, without padding.
class RgbaSink : public PictureSink {
public:
    explicit RgbaSink(const OutputName& name) : path(name.For(0)) {}

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

bool RgbaSink::Add(const CBitBuffer& picture, int)
{
    bool good = true;
    for (S32 y = 0; y < picture.Height() && good; y++) {
        PutRgba(picture.Row32(y), picture.Width(), row.data());
        good = file.Write(row);
    }
    return (good && file.Flush()) || Fail(path, file.error);
}

} // namespace

std::unique_ptr<PictureSink> MakeRgbaSink(const OutputName& output)
{
    return std::make_unique<RgbaSink>(output);
}
