#include "samples/orchard.h"

#include <algorithm>
#include <cmath>

// The sounds, all of them plucked from the same string, and packed here.

namespace orchard {

constexpr int kRate = 11025;

// A piece of sound that notes are added to; 1 is full.
struct Tape {
    explicit Tape(double seconds) : samples(size_t(seconds * kRate)) {}

    // A pluck: the overtones die away first. `slide` is what the pitch is multiplied by in the end.
    void Pluck(double start, double hertz, double loudness, double life, double slide = 1)
    {
        double phase = 0;
        for (size_t i = size_t(start * kRate); i < samples.size(); i++) {
            double t = double(i) / kRate - start, decay = std::exp(-t / life);
            if (decay < 0.001)
                break;
            phase += hertz * std::pow(slide, t / life) / kRate;
            samples[i] += loudness * std::min(1.0, t * 400) * decay *
                          (Turns(phase) + 0.35 * decay * Turns(2 * phase) +
                           0.2 * decay * decay * Turns(4 * phase));
        }
    }

    S32 Sample(size_t i) const
    {
        double end = std::min(1.0, double(samples.size() - i) / 200); // no click at the cut
        return RoundSteadily(std::clamp(samples[i] * end, -1.0, 1.0) * 32000);
    }

    std::vector<double> samples;
};

// ADPCM of 4 bits: for every sample the code whose result comes nearest.
class Packer {
public:
    std::vector<U8> Pack(const Tape& tape)
    {
        ByteWriter bits = ByteWriter().UB(2, 4 - 2);
        for (size_t i = 0; i < tape.samples.size(); i++) {
            if (i % 4096 == 0)
                bits.SB(16, value = tape.Sample(i)).UB(6, U32(index));
            else
                bits.UB(4, Code(tape.Sample(i)));
        }
        return bits.Bytes();
    }

private:
    S32 Step() const // grows by a tenth from one to the next
    {
        return index < 5 ? 7 + index : index == 88 ? 32767 : S32(7.464129 * std::pow(1.1, index));
    }

    U32 Code(S32 wanted)
    {
        const S32 step = Step();
        const bool minus = wanted < value;
        const S32 size = std::min(7, std::abs(wanted - value) * 4 / step);
        const S32 delta = (size & 4 ? step : 0) + (size & 2 ? step >> 1 : 0) +
                          (size & 1 ? step >> 2 : 0) + (step >> 3);
        value = std::clamp(minus ? value - delta : value + delta, -32768, 32767);
        index = std::clamp(index + (size < 4 ? -1 : (size - 3) * 2), 0, 88);
        return U32(size | (minus ? 8 : 0));
    }

    S32 value = 0, index = 0;
};

static void Define(TagWriter& movie, U16 id, const Tape& tape)
{
    constexpr U8 kAdpcmMono11 = 0x16;
    ByteWriter body = ByteWriter().PutU16(id).PutU8(kAdpcmMono11);
    body.PutU32(U32(tape.samples.size())).PutBytes(Packer().Pack(tape));
    movie.Raw(kTagDefineSound, body);
}

// Plain bytes.
static void DefinePlain(TagWriter& movie, U16 id, const Tape& tape)
{
    constexpr U8 kPlainMono11 = 0x04;
    ByteWriter body = ByteWriter().PutU16(id).PutU8(kPlainMono11);
    body.PutU32(U32(tape.samples.size()));
    for (size_t i = 0; i < tape.samples.size(); i++)
        body.PutU8(U32(128 + RoundSteadily(tape.Sample(i) / 256.0)));
    movie.Raw(kTagDefineSound, body);
}

static double Pitch(int note) // half tones above the middle C
{
    return 261.63 * std::pow(2, note / 12.0);
}

// Eight bars of three that go round and round; a dot is a rest.
static Tape Tune()
{
    constexpr double kEighth = 0.156;
    const std::string_view melody = "e.ged.c.deg.a.gec.d.e...e.ged.c.dega..gedc.d.c..";
    const int bass[] = {0, -3, -7, -5, 0, -3, -7, -5};
    Tape tape(kEighth * double(melody.size()));
    const std::string_view names = "c d ef g a b";
    for (size_t i = 0; i < melody.size(); i++) {
        double at = double(i) * kEighth;
        if (melody[i] != '.')
            tape.Pluck(at, Pitch(12 + int(names.find(melody[i]))), 0.3, 0.34);
        int root = bass[i / 6];
        if (i % 6 == 0)
            tape.Pluck(at, Pitch(root - 12), 0.3, 0.55);
        else if (i % 2 == 0)
            tape.Pluck(at, Pitch(root + (i % 6 == 2 ? 0 : root == -3 ? 3 : 4)), 0.11, 0.3);
    }
    return tape;
}

void DefineClick(TagWriter& movie)
{
    Tape click(0.07);
    click.Pluck(0, Pitch(4), 0.4, 0.02, 0.6);
    DefinePlain(movie, kClickSound, click);
}

void DefineSounds(TagWriter& movie)
{
    Tape caught(0.4), gold(0.7), miss(0.22);
    caught.Pluck(0, Pitch(12), 0.3, 0.12);
    caught.Pluck(0.06, Pitch(19), 0.3, 0.14);
    const int chime[] = {12, 16, 19, 24, 28};
    for (int i = 0; i < 5; i++)
        gold.Pluck(0.06 * i, Pitch(chime[i]), 0.22, 0.2);
    miss.Pluck(0, Pitch(-14), 0.5, 0.06, 0.5);
    Define(movie, kCatchSound, caught);
    Define(movie, kGoldSound, gold);
    DefinePlain(movie, kMissSound, miss);
    Define(movie, kTune, Tune());
    DefineClick(movie);
}

} // namespace orchard
