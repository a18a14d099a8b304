#include "core/sound/sound_channel.h"

#include <algorithm>
#include <cstring>

#include "core/sound/sound_mix.h"

namespace {

constexpr U64 kClockBits = 27;
constexpr U64 kClockMask = (U64(1) << kClockBits) - 1;

// What decoding a frame and starting anew cost beside copying samples, against the budget that all
// sounds share in a buffer: a decoder reaches an in point only by decoding up to it.
S32 FrameCost(U8 format)
{
    switch (format & kSoundCompression) {
    case kSoundAdpcm:
        return 1;
    case kSoundMpeg:
        return 4;
    default:
        return 0;
    }
}

// What a start may spend on the way to its in point, in the same units; some 15 ms. The rest is
// passed over by the audio thread, a share in each buffer.
constexpr S32 kPrepareBudget = 3 << 20;
constexpr S32 kUnitsPerTag = 16;

S32 RestartCost(const CSound& sound)
{
    return 1 + FrameCost(sound.format) * (4096 + std::clamp(sound.start, 0, 32767));
}

// No more frames than the data can hold: a declared number can be anything. An MPEG frame
// packs at most 24 into a byte; a few more do no harm. A number that is too high all the same, as
// that of MPEG data mostly can be, is played out in silence: each loop lasts as long as declared.
S64 FramesInData(const CSound& sound)
{
    const S64 bits = sound.data && sound.dataLen > 0 ? S64(sound.dataLen) * 8 : 0;
    const S32 channels = SoundChannels(sound.format);
    switch (sound.format & kSoundCompression) {
    case kSoundAdpcm:
        return bits ? bits / (((sound.data[0] >> 6) + 2) * channels) : 0;
    case kSoundMpeg:
        return bits * 4;
    default:
        return bits / 8 / SoundFrameBytes(sound.format);
    }
}

} // namespace

CSoundChannel::~CSoundChannel()
{
    decomp.reset();
    if (owner)
        owner->Release();
}

void CSoundChannel::SetHolder(CSoundHolder* holder)
{
    owner = holder;
    if (owner)
        owner->AddRef();
}

bool CSoundChannel::MakeDecomp()
{
    if (!decomp)
        decomp.reset(CreateDecompressor(sound.format));
    return decomp != nullptr;
}

// A decoder reaches an in point only by decoding up to it: done here, it delays no buffer.
bool CSoundChannel::Prepare()
{
    if (prepared)
        return true;
    if (!Start() || !MakeDecomp())
        return false;
    S32 budget = kPrepareBudget;
    if (!refill) {
        decomp->Setup(&sound, true);
        PassOver(&budget);
    }
    const S32 work = kPrepareBudget - budget + RestartCost(sound);
    startCost += U32(work / kUnitsPerTag);
    prepared = true;
    return true;
}

void CSoundChannel::Release()
{
    if (references.fetch_sub(1, std::memory_order_acq_rel) == 1)
        delete this;
}

// A stream without samples per picture could neither pace one nor be as long as one: it does not
// play, and the clock rules.
bool CSoundChannel::Start()
{
    if (refill)
        return sound.numSamples > 0;
    const int shift = SoundRateShift(sound.format);
    const S64 frames = std::min<S64>(sound.numSamples, FramesInData(sound));
    const S64 last = std::min<S64>(frames, outPoint >> shift);
    if (S64(inPoint >> shift) >= last)
        return false;
    start = position = passLeft = S32(inPoint >> shift);
    end = S32(last);
    loopsLeft = loops;
    return true;
}

void CSoundChannel::StartCounting(S32 milliseconds)
{
    std::memset(counts, 0, sizeof counts);
    Publish(S64(published.load(std::memory_order_relaxed) >> kClockBits), milliseconds);
}

void CSoundChannel::Publish(S64 samples, S32 milliseconds)
{
    const U64 pair = U64(samples) << kClockBits | (U64(milliseconds) & kClockMask);
    published.store(pair, std::memory_order_release);
}

void CSoundChannel::Complete(S32 index, S32 milliseconds)
{
    const U64 pair = published.load(std::memory_order_relaxed);
    Publish(S64(pair >> kClockBits) + counts[index], milliseconds);
    counts[index] = 0;
}

S32 CSoundChannel::ElapsedFrames() const
{
    constexpr S32 kLongest = 63;      // ms
    constexpr S32 kSamplesPerMs = 44; // at 44100 Hz
    const S64 frame = sound.numSamples;
    if (frame <= 0)
        return 0;
    const U64 pair = published.load(std::memory_order_acquire);
    S64 samples = S64(pair >> kClockBits);
    if (!doNotCount && !Waiting() && mixer) {
        const U64 since = (U64(mixer->Clock()) - pair) & kClockMask;
        samples +=
            (std::min<S64>(S64(since), kLongest) * kSamplesPerMs) >> SoundRateShift(sound.format);
    }
    return S32(std::min<S64>((samples + frame / 2) / frame, kS32Max));
}

S32 CSoundChannel::SinceHeard() const
{
    const U64 pair = published.load(std::memory_order_acquire);
    return mixer ? S32((U64(mixer->Clock()) - pair) & kClockMask) : 0;
}

void CSoundChannel::Render(S16* out, U8 outFormat, S32 index, S32* budget)
{
    const S32 frames = kSoundBufferFrames >> SoundRateShift(sound.format);
    U8* bytes = reinterpret_cast<U8*>(out);
    if (refill)
        FillStream(bytes, frames, index);
    else
        FillEvent(bytes, frames, budget);
    if (out)
        Output(out, outFormat, frames);
    else
        havePrevious = false; // heard again later, it has no block before
    envelopePosition += kSoundBufferFrames;
}

void CSoundChannel::FillStream(U8* out, S32 frames, S32 index)
{
    const S32 whole = frames;
    U8* to = out;
    counts[index] = 0;
    while (frames > 0) {
        if (blockLeft <= 0)
            NextBlock();
        const S32 n = std::min(frames, blockLeft);
        if (silent)
            Silence(to, n);
        else
            Decode(to, n);
        to = to ? to + n * SoundFrameBytes(sound.format) : nullptr;
        blockLeft -= n;
        frames -= n;
        if (!doNotCount && !(silent && Waiting()))
            counts[index] += n;
    }
    FadeIn(out, whole);
}

void CSoundChannel::NextBlock()
{
    blockLeft = 0;
    if (!refill(this, refillContext))
        ended.store(true, std::memory_order_release);
    silent = blockLeft <= 0;
    if (!silent)
        return;
    blockLeft = silenceCount == 0  ? sound.numSamples
                : silenceCount < 0 ? -silenceCount
                                   : silenceCount;
    silenceCount = 0;
}

void CSoundChannel::FadeIn(U8* out, S32 frames)
{
    static constexpr SEnvelopePoint kRise[] = {{0, 0, 0},
                                               {kSoundBufferFrames, kFullLevel, kFullLevel}};
    if (fadeIn && out)
        ApplyEnvelope(out, DecodedFormat(sound.format), frames, kRise, 2, 0);
    fadeIn = false;
}

// The end is noticed when more is wanted, so a sound that ends with a buffer is silent through one
// more.
void CSoundChannel::FillEvent(U8* out, S32 frames, S32* budget)
{
    while (frames > 0) {
        if (position >= end && loopsLeft <= 1) {
            Stop();
            break;
        }
        if ((position >= end && !Restart(budget)) || !PassOver(budget))
            break;
        const S32 n = std::min(frames, end - position);
        Decode(out, n);
        out = out ? out + n * SoundFrameBytes(sound.format) : nullptr;
        position += n;
        frames -= n;
    }
    Silence(out, frames);
}

// False: too much has been decoded for this buffer already; the next one goes on from here.
bool CSoundChannel::Restart(S32* budget)
{
    const S32 cost = RestartCost(sound);
    if (*budget < cost)
        return false;
    *budget -= cost;
    loopsLeft--;
    decomp->Setup(&sound, true);
    position = passLeft = start;
    return true;
}

bool CSoundChannel::PassOver(S32* budget)
{
    if (passLeft == 0)
        return true;
    const S32 cost = FrameCost(sound.format);
    const S32 n = cost ? std::min(passLeft, *budget / cost) : passLeft;
    decomp->Decompress(nullptr, n);
    *budget -= n * cost;
    passLeft -= n;
    return passLeft == 0;
}

void CSoundChannel::Decode(U8* out, S32 frames)
{
    const S32 got = std::clamp(decomp->Decompress(out, frames), 0, frames);
    if (out)
        Silence(out + got * SoundFrameBytes(sound.format), frames - got);
}

void CSoundChannel::Silence(U8* out, S32 frames) const
{
    const int value = DecodedFormat(sound.format) & kSound16Bit ? 0 : 128;
    if (out)
        std::memset(out, value, size_t(frames) * size_t(SoundFrameBytes(sound.format)));
}

void CSoundChannel::Output(S16* out, U8 outFormat, S32 frames)
{
    const size_t frameBytes = size_t(SoundFrameBytes(sound.format));
    const U8* bytes = reinterpret_cast<const U8*>(out);
    S16 before[2];
    std::memcpy(before, previous, sizeof before);
    if (!havePrevious)
        std::memcpy(before, bytes, frameBytes);
    std::memcpy(previous, bytes + size_t(frames - 1) * frameBytes, frameBytes);
    havePrevious = true;
    frames = ConvertSound(out, DecodedFormat(sound.format), outFormat, frames, before);
    ApplyEnvelope(out, outFormat, frames, points, numPoints, envelopePosition);
}
