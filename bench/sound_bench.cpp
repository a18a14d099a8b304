// What mixing costs, in percent of the time that the sound lasts: 8 channels of each kind. Nothing
// here passes or fails.
#include <benchmark/benchmark.h>

#include <vector>

#include "platform/headless/headless_sound.h"

namespace {

// A second of noise, for ever; enough points that every buffer is scaled.
void AddChannel(CSoundMix* mix, U8 format, const std::vector<U8>& data, bool envelope)
{
    CSoundChannel* channel = new CSoundChannel;
    channel->sound = {format, kS32Max, data.data(), S32(data.size()), 0};
    channel->loops = kS32Max;
    channel->numPoints = envelope ? kMostEnvelopePoints : 0;
    for (S32 i = 0; i < channel->numPoints; i++)
        channel->points[i] = {U32(i) << 24, U16(i * 30), U16(32768 - i * 30)};
    if (!mix->AddSound(channel))
        abort();
    channel->Release();
}

void Mix(benchmark::State& state, U8 format, bool envelope)
{
    std::vector<U8> data(size_t(SoundRate(format) * SoundFrameBytes(format)));
    U32 noise = 1;
    for (U8& byte : data)
        byte = U8((noise = noise * 1664525 + 1013904223) >> 24);
    NativeSoundMix mix;
    for (int i = 0; i < 8; i++)
        AddChannel(&mix, format, data, envelope);
    for (auto _ : state)
        benchmark::DoNotOptimize(mix.PlayBuffer(0));
    const double seconds = double(state.iterations()) * kSoundBufferFrames / 44100;
    state.counters["percent_of_real_time"] = benchmark::Counter(
        seconds / 100, benchmark::Counter::kIsRate | benchmark::Counter::kInvert);
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
                  {"mix/8_stereo_adpcm", 15 | kSoundAdpcm, false}};
    for (const auto& s : scenes)
        benchmark::RegisterBenchmark(s.name, Mix, s.format, s.envelope);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
