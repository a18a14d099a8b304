// PNG: a file for each picture.
#include "tools/vexel/output_file.h"
#include "tools/vexel/picture_sink.h"
#include "tools/vexel/png.h"

namespace {

class PngSink : public PictureSink {
public:
    explicit PngSink(const OutputName& name) : output(name) {}

    bool Begin(const PictureForm& form) override
    {
        alpha = form.alpha;
        return true;
    }
    bool Add(const CBitBuffer& picture, int number) override;
    bool Finish() override { return true; }

private:
    OutputName output;
    bool alpha = false;
    GrowBuffer<U8> png;
};

bool PngSink::Add(const CBitBuffer& picture, int number)
{
    const std::string path = output.For(number);
    if (!EncodePng(picture, alpha, &png))
        return Fail(path, "no memory for the picture", kExitLimit);
    std::string error;
    return WriteWhole(path, {png.data(), png.size()}, &error) || Fail(path, error);
}

} // namespace

std::unique_ptr<PictureSink> MakePngSink(const OutputName& output)
{
    return std::make_unique<PngSink>(output);
}
