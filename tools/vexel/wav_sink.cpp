// Sound: WAV, 44100 Hz, 16-bit, stereo. Its length is known from the start, so that pipes get a
// right header too.
#include "tools/vexel/output_file.h"
#include "tools/vexel/picture_sink.h"

#include <vector>

namespace {

constexpr U32 kRate = 44100;
constexpr U32 kFrameBytes = 4;
constexpr U32 kHeaderRest = 36; // bytes of the header behind the file's length
constexpr S64 kMostFrames = (0xFFFFFFFF - kHeaderRest) / kFrameBytes;

void Put(std::vector<U8>* out, U32 value, int bytes)
{
    for (int i = 0; i < bytes; i++)
        out->push_back(static_cast<U8>(value >> (8 * i)));
}

void Put(std::vector<U8>* out, const char* name)
{
    out->insert(out->end(), name, name + 4);
}

std::vector<U8> Header(U32 dataBytes)
{
    std::vector<U8> out;
    Put(&out, "RIFF");
    Put(&out, kHeaderRest + dataBytes, 4);
    Put(&out, "WAVE");
    Put(&out, "fmt ");
    Put(&out, 16, 4); // bytes of the part
    Put(&out, 1, 2);  // plain samples
    Put(&out, 2, 2);  // channels
    Put(&out, kRate, 4);
    Put(&out, kRate * kFrameBytes, 4);
    Put(&out, kFrameBytes, 2);
    Put(&out, 16, 2); // bits of a sample
    Put(&out, "data");
    Put(&out, dataBytes, 4);
    return out;
}

class WavSink : public PictureSink {
public:
    explicit WavSink(const OutputName& name) : path(name.For(0)) {}
    explicit WavSink(int descriptor) : path("temporary file"), spool(descriptor) {}

    bool Begin(const PictureForm& form) override;
    bool Add(const CBitBuffer&, int) override { return true; }
    bool AddSound(const S16* samples, S32 frames) override;
    bool Finish() override { return file.Commit() || Fail(path, file.error); }

private:
    std::string path;
    int spool = -1; // where to instead of `path`, unless -1
    OutputFile file;
    std::vector<U8> bytes;
};

bool WavSink::Begin(const PictureForm& form)
{
    if (form.soundFrames > kMostFrames)
        return Fail(path, "the sound is longer than a WAV file can be", kExitLimit);
    const std::vector<U8> header = Header(static_cast<U32>(form.soundFrames) * kFrameBytes);
    if (spool >= 0)
        file.Borrow(spool);
    else if (!file.Open(path))
        return Fail(path, file.error);
    return file.Write(header) || Fail(path, file.error);
}

bool WavSink::AddSound(const S16* samples, S32 frames)
{
    bytes.clear();
    for (S32 i = 0; i < 2 * frames; i++)
        Put(&bytes, static_cast<U16>(samples[i]), 2);
    return file.Write(bytes) || Fail(path, file.error);
}

} // namespace

std::unique_ptr<PictureSink> MakeWavSink(const OutputName& output)
{
    return std::make_unique<WavSink>(output);
}

std::unique_ptr<PictureSink> MakeWavSpool(int descriptor)
{
    return std::make_unique<WavSink>(descriptor);
}
