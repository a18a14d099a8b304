// What mixing costs, in percent of the time that the sound lasts: 8 channels of each kind. Nothing
// here passes or fails.
#include <benchmark/benchmark.h>

#include <ctime>
#include <fstream>
#include <iterator>
#include <vector>

#include "platform/headless/headless_sound.h"

namespace {

constexpr int kMpegRepeats = 20;
constexpr int kMpegFrames = 9; // of 1152 samples in the tests' file

// The data over and over; enough points that every buffer is scaled.
void AddChannel(CSoundMix* mix, U8 format, const std::vector<U8>& data, bool envelope)
{
    const bool mpeg = (format & kSoundCompression) == kSoundMpeg;
    const S32 frames = mpeg ? kMpegRepeats * kMpegFrames * 1152 : kS32Max;
    CSoundChannel* channel = new CSoundChannel;
    channel->sound = {format, frames, data.data(), S32(data.size()), 0};
    channel->loops = kS32Max;
    channel->numPoints = envelope ? kMostEnvelopePoints : 0;
    for (S32 i = 0; i < channel->numPoints; i++)
        channel->points[i] = {U32(i) << 24, U16(i * 30), U16(32768 - i * 30)};
    if (!mix->AddSound(channel))
        abort();
    channel->Release();
}

// A second of noise; as MPEG audio what the tests have.
std::vector<U8> Data(U8 format)
{
    if ((format & kSoundCompression) == kSoundMpeg) {
        std::ifstream file(VEXEL_SOURCE_DIR "/tests/data/sound/two_tones.mp3", std::ios::binary);
        const std::vector<U8> once(std::istreambuf_iterator<char>(file), {});
        std::vector<U8> data;
        for (int i = 0; i < kMpegRepeats; i++)
            data.insert(data.end(), once.begin(), once.end());
        return data;
    }
    std::vector<U8> data(size_t(SoundRate(format) * SoundFrameBytes(format)));
    U32 noise = 1;
    for (U8& byte : data)
        byte = U8((noise = noise * 1664525 + 1013904223) >> 24);
    return data;
}

void Mix(benchmark::State& state, U8 format, bool envelope)
{
    const std::vector<U8> data = Data(format);
    NativeSoundMix mix;
    for (int i = 0; i < 8; i++)
        AddChannel(&mix, format, data, envelope);
    const std::clock_t start = std::clock();
    for (auto _ : state)
        benchmark::DoNotOptimize(mix.PlayBuffer(0));
    const double cost = double(std::clock() - start) / CLOCKS_PER_SEC;
    state.counters["percent_of_real_time"] =
        cost * 100 / (double(state.iterations()) * kSoundBufferFrames / 44100);
}

} // namespace

int main(int argc, char** argv)
{
    const struct {
        const char* name;
        U8 format;
        bool envelope;
    } scenes[] = {{"mix/8_stereo_pcm", 15, false},
                  {"mix/8_stereo_pcm_envelope", 15, true},
                  {"mix/8_mono_pcm_22050_8bit", 8, false},
                  {"mix/8_stereo_adpcm", 15 | kSoundAdpcm, false},
                  {"mix/8_stereo_mpeg", 15 | kSoundMpeg, false}};
    for (const auto& s : scenes)
        benchmark::RegisterBenchmark(s.name, Mix, s.format, s.envelope);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
