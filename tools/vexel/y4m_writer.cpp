// Uncompressed video with a line of text before it and before each picture: 4:2:0, the colour of
// four pixels in their middle, BT.601 in the limited range that this format means when it says
// nothing else.
#include "tools/vexel/output_file.h"
#include "tools/vexel/picture_sink.h"

#include <vector>

namespace {

// 16.16 weights of red, green and blue for 219 steps of light and 224 of colour.
struct Weights {
    S32 red, green, blue, base;
};
constexpr Weights kLight = {16829, 33039, 6416, 16};
constexpr Weights kBlueness = {-9714, -19070, 28784, 128};
constexpr Weights kRedness = {28784, -24103, -4681, 128};

struct Sum {
    S32 red = 0, green = 0, blue = 0;

    void Add(U32 pixel)
    {
        red += static_cast<S32>(pixel >> 16 & 255);
        green += static_cast<S32>(pixel >> 8 & 255);
        blue += static_cast<S32>(pixel & 255);
    }
};

// The value for the mean of 1 << shift pixels.
U8 Weigh(const Weights& w, const Sum& s, int shift)
{
    const S32 half = 1 << (15 + shift);
    const S32 value = w.red * s.red + w.green * s.green + w.blue * s.blue;
    return static_cast<U8>(w.base + ((value + half) >> (16 + shift)));
}

class Y4mSink : public PictureSink {
public:
    explicit Y4mSink(const OutputName& name) : path(name.For(0)) {}

    bool Begin(const PictureForm& form) override;
    bool Add(const CBitBuffer& picture, int) override;
    bool Finish() override { return file.Commit() || Fail(path, file.error); }

private:
    bool WriteText(const std::string& text);
    void PutColors(const CBitBuffer& picture);

    std::string path;
    OutputFile file;
    std::vector<U8> planes;
};

bool Y4mSink::WriteText(const std::string& text)
{
    return file.Write({reinterpret_cast<const U8*>(text.data()), text.size()});
}

bool Y4mSink::Begin(const PictureForm& form)
{
    const size_t w = static_cast<size_t>(form.width);
    const size_t h = static_cast<size_t>(form.height);
    planes.resize(w * h + 2 * ((w + 1) / 2) * ((h + 1) / 2));
    return (file.Open(path) &&
            WriteText(Format("YUV4MPEG2 W%d H%d F1000:%d Ip A1:1 C420jpeg XCOLORRANGE=LIMITED\n",
                             form.width, form.height, form.delay)) &&
            file.Flush()) ||
           Fail(path, file.error);
}

// At an odd edge the last pixels count twice.
void Y4mSink::PutColors(const CBitBuffer& picture)
{
    const S32 w = picture.Width();
    const S32 h = picture.Height();
    U8* blueness = planes.data() + static_cast<size_t>(w) * static_cast<size_t>(h);
    U8* redness = blueness + (planes.data() + planes.size() - blueness) / 2;
    for (S32 y = 0; y < h; y += 2) {
        const U32* upper = picture.Row32(y);
        const U32* lower = picture.Row32(y + 1 < h ? y + 1 : y);
        for (S32 x = 0; x < w; x += 2) {
            const S32 right = x + 1 < w ? x + 1 : x;
            Sum sum;
            for (const U32 pixel : {upper[x], upper[right], lower[x], lower[right]})
                sum.Add(pixel);
            *blueness++ = Weigh(kBlueness, sum, 2);
            *redness++ = Weigh(kRedness, sum, 2);
        }
    }
}

bool Y4mSink::Add(const CBitBuffer& picture, int)
{
    U8* light = planes.data();
    for (S32 y = 0; y < picture.Height(); y++) {
        for (S32 x = 0; x < picture.Width(); x++) {
            Sum sum;
            sum.Add(picture.Row32(y)[x]);
            *light++ = Weigh(kLight, sum, 0);
        }
    }
    PutColors(picture);
    return (WriteText("FRAME\n") && file.Write(planes) && file.Flush()) || Fail(path, file.error);
}

} // namespace

std::unique_ptr<PictureSink> MakeY4mSink(const OutputName& output)
{
    return std::make_unique<Y4mSink>(output);
}
