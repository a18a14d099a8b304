#include <algorithm>
#include <complex>
#include <fstream>
#include <gtest/gtest.h>
#include <memory>
#include <random>

#include "core/sound/mp3_decomp.h"
#include "tests/support/byte_writer.h"

using Bytes = std::vector<U8>;
using Samples = std::vector<S16>;

// All that comes out, asked for in pieces, after passing over some; of a new decoder unless one is
// given.
static Samples Decode(const Bytes& data, U8 format, S32 passed = 0, S32 start = 0,
                      CSoundDecomp* decoder = nullptr, bool reset = true)
{
    std::unique_ptr<CSoundDecomp> own(decoder ? nullptr : CreateDecompressor(format));
    decoder = decoder ? decoder : own.get();
    const CSound sound = {format, 1, data.data(), S32(data.size()), start};
    Samples out(50000);
    decoder->Setup(&sound, reset);
    size_t at = 0;
    EXPECT_EQ(decoder->Decompress(nullptr, passed), passed);
    while (S32 got = decoder->Decompress(&out[at], 333))
        at += size_t(got * SoundChannels(format));
    return {out.begin(), out.begin() + S32(at)};
}

TEST(Decoder, PlainSamplesAreLittleEndianAndWhole)
{
    EXPECT_EQ(Decode({0x34, 0x12, 0xFF, 0x7F, 0, 0x80, 9}, 2), (Samples{0x1234, 32767, -32768}));
    EXPECT_EQ(Decode({1, 0, 2, 0, 3, 0, 4, 0, 5, 0}, 0x33, 1), (Samples{3, 4}));
    EXPECT_EQ(Decode({1, 2, 3, 4, 5}, 0x31), (Samples{0x0201, 0x0403, 0, 0})); // 4 bytes
    EXPECT_TRUE(!CreateDecompressor(0x40) && !CreateDecompressor(0xFF));
}

// Random codes, and what they come to by quotients instead of shifts. The published table of steps
// grows by a tenth from one to the next, but for its ends.
static Bytes WriteAdpcm(int size, int channels, int frames, Samples* samples)
{
    const int upper[4][8] = {{2}, {2, 4}, {2, 4, 6, 8}, {1, 2, 4, 6, 8, 10, 13, 16}};
    int value[2] = {}, index[2] = {}, half = 1 << (size - 1);
    std::mt19937 random;
    ByteWriter bits = ByteWriter().UB(2, U32(size - 2));
    for (int i = 0; i < frames * channels; ++i) {
        int &v = value[i % channels], &at = index[i % channels];
        const int frame = i / channels, minus = frame / 40 % 2, m = int(random() % unsigned(half));
        const int step = at < 5 ? 7 + at : at == 88 ? 32767 : int(7.464129 * std::pow(1.1, at));
        int delta = step / half;
        for (int part = 1, bit = half / 2; bit; part *= 2, bit /= 2)
            delta += m / bit % 2 * (step / part);
        v = std::clamp(v + (minus ? -delta : delta), -32768, 32767);
        at = std::clamp(at + (m < half / 2 ? -1 : upper[size - 2][m - half / 2]), 0, 88);
        if (frame % 4096 == 0)
            bits.UB(16, U16(v = S16(random()))).UB(6, U32(at = m * 4));
        bits.UB(frame % 4096 ? size : 0, U32(minus * half + m));
        samples->push_back(S16(v));
    }
    return bits.Bytes();
}

TEST(Decoder, AdpcmOfEveryCodeSize)
{
    // By hand: sample 100, step 7; +111b adds 7 + 3 + 1 + 0, then step 16; -100b takes 16 + 2.
    EXPECT_EQ(Decode({0x80, 0x19, 0x00, 0x7C}, 0x10), (Samples{100, 111, 93}));
    for (int kind = 0; kind < 8; ++kind) {
        const int size = 2 + kind / 2, channels = 1 + kind % 2;
        Samples all;
        Bytes data = WriteAdpcm(size, channels, 2 * 4096 + 77, &all);
        for (S32 passed : {0, 1, 4095, 4096, 4097, 8200}) {
            Samples got = Decode(data, U8(0x0F + channels), passed);
            got.resize(all.size() - size_t(passed * channels)); // the last byte may hold more
            EXPECT_EQ(got, Samples(all.begin() + passed * channels, all.end())) << kind << passed;
        }
        // Cut just within the header of the second block, the first is what there is.
        data.resize(size_t(channels * (22 + 4095 * size + 22) + 1) / 8);
        EXPECT_EQ(Decode(data, U8(0x0F + channels)).size(), size_t(4096 * channels));
    }
}

// The amplitude of a frequency (cycles a frame) in one channel, over whole cycles of all the tones
// here.
static double Level(const Samples& samples, double frequency, int channels, int channel)
{
    std::complex<double> sum;
    for (int i = 2000 * channels + channel; i < 6410 * channels; i += channels)
        sum += double(samples.at(size_t(i))) * std::polar(1.0, 2 * M_PI * frequency * i / channels);
    return std::abs(sum) / 2205;
}

TEST(Decoder, Mpeg)
{
    if (!mp3decPresent())
        GTEST_SKIP();
    const auto load = [](const std::string& name) {
        std::ifstream file(VEXEL_SOURCE_DIR "/tests/data/sound/" + name, std::ios::binary);
        return Bytes(std::istreambuf_iterator<char>(file), {});
    };
    // Tones of amplitude 3891: 1000 Hz, and in the second file 3000 Hz at the right.
    const Bytes tone = load("tone.mp3"), two = load("two_tones.mp3");
    const Samples all = Decode(tone, 0x28), pair = Decode(two, 0x2D);
    EXPECT_NEAR(Level(all, 1000 / 22050.0, 1, 0), 3891, 10);
    EXPECT_NEAR(Level(pair, 1000 / 44100.0, 2, 0), 3891, 10);
    EXPECT_NEAR(Level(pair, 3000 / 44100.0, 2, 1), 3891, 10);
    EXPECT_EQ(Decode(tone, 0x29).size(), all.size() * 2); // the sound's channels hold

    EXPECT_EQ(Decode(tone, 0x28, 100, 1105), Samples(all.begin() + 1205, all.end()));
    for (int size : {1, 100, 104, 1500}) {
        CMp3Decomp decoder(0x28);
        Samples blocks;
        for (auto at = tone.begin(); at < tone.end(); at += std::min<S64>(size, tone.end() - at)) {
            const Bytes block(at, at + std::min<S64>(size, tone.end() - at));
            for (S16 sample : Decode(block, 0x28, 0, 0, &decoder, false))
                blocks.push_back(sample);
        }
        EXPECT_EQ(blocks, all) << size;
        EXPECT_EQ(Decode(tone, 0x28, 0, 0, &decoder), all) << "after a reset";
    }

    EXPECT_EQ(Decode({tone.begin(), tone.end() - 100}, 0x28).size(), all.size() - 576);
    Bytes noise(50000);
    std::generate(noise.begin(), noise.end(), std::minstd_rand());
    EXPECT_EQ(Decode(noise, 0x2D).size() + Decode(Bytes(1 << 20), 0x2D).size(), 0u);
    // Junk before and frames of another kind are as if they were not there.
    noise.insert(noise.end(), tone.begin(), tone.end());
    noise.insert(noise.end(), two.begin(), two.end());
    EXPECT_EQ(Decode(noise, 0x28), all);
    EXPECT_EQ(Decode(two, 0x29).size(), 0u) << "frames of twice the samples";
    // Between frames 4 bytes of junk a byte are borne, and 128 KiB of it more in all.
    Bytes thin;
    for (int i = 0; i < 5; ++i, thin.resize(thin.size() + 60000))
        thin.insert(thin.end(), tone.begin(), tone.end());
    EXPECT_EQ(Decode(thin, 0x28).size(), all.size() * (1 + 131072 / (60000 - 4 * tone.size())));
}
